// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Between a real directory and the model of a disk: what stands below it, what a program does to it, and the way back,
// a state of the model made real. Files keep their inodes through all of that, because redo records and semaphores are
// bound to them: each has a second name outside the directory for as long as the test runs, so that no inode is freed
// and its number used again. For one thread.

#ifndef KAVELL_TESTS_CRASH_RECORDER_H
#define KAVELL_TESTS_CRASH_RECORDER_H

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/file_io.h"
#include "tests/crash/disk.h"
#include "tests/faults/system_calls.h"

namespace kavell::test {

/// A directory whose files have numbers that stay.
class WatchedDirectory {
public:
    /// `path` is the directory; `anchors`, a directory on the same file system, is made for the second names.
    WatchedDirectory(std::string path, std::string anchors);

    [[nodiscard]] const std::string &path() const { return m_path; }

    /// What stands there.
    [[nodiscard]] DiskState look();

    /// Makes this stand there, and nothing else. Directories that stand already are kept.
    void make(const DiskState &state);

    /// The same in directories that nobody has seen before: a process remembers the ones that it made.
    void makeAnew(const DiskState &state);

    /// The path relative to the directory; none for one elsewhere.
    [[nodiscard]] std::optional<std::string> relative(std::string_view path) const;

    /// The number of a file that stands or stood there; 0 for any other.
    [[nodiscard]] Node nodeOf(ino_t inode) const;

    /// Gives a file that has just been made its number.
    Node adopt(const std::string &relativePath);

private:
    void removeOthers(const std::string &directory, const DiskState &wanted);

    std::string m_path;
    std::string m_anchors;
    std::map<ino_t, Node> m_nodes;
    std::vector<FileDescriptor> m_files;  ///< by node; the first is of none
    unsigned m_putAway = 0;               ///< how many directories were put out of sight
};

/// What the system does not do while it is recorded.
enum class Refusal {
    Nothing,
    NewNames,  ///< renaming a file unless the new name is taken, as some file systems do not know how to
    Writes,    ///< writing to any file, as a disk that is going
};

/// Writes down what the observed thread does to the files of a directory.
class Recorder : public SystemCallObserver {
public:
    explicit Recorder(WatchedDirectory &directory, Refusal refusal = Refusal::Nothing)
        : m_directory(directory), m_refusal(refusal)
    {
    }

    /// Has the calls made by another observer, who may let them fail.
    Recorder(WatchedDirectory &directory, SystemCallObserver &maker)
        : m_directory(directory), m_refusal(Refusal::Nothing), m_maker(&maker)
    {
    }

    long onCall(SystemCall &call, const std::function<long()> &make) override;

    [[nodiscard]] const std::vector<DiskOperation> &operations() const { return m_operations; }

private:
    [[nodiscard]] Node nodeAt(const char *path) const;
    void noteNames(const SystemCall &call, Node node, bool existed);
    void noteFile(const SystemCall &call, long result, off_t offset);

    WatchedDirectory &m_directory;
    const Refusal m_refusal;
    SystemCallObserver *const m_maker = nullptr;
    std::vector<DiskOperation> m_operations;
};

}  // namespace kavell::test

#endif
