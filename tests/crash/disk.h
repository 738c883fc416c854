// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A disk as a power cut may leave it. Takes the operations of a program in their order and keeps, for everything that
// was not synced yet, all that may stand on the disk; then gives each state that follows from that.
//
//     a file's bytes      each sector of 512 bytes on its own: any of the versions that it had since the last fsync or
//                         fdatasync of the file; zeros where the file had no sector before
//     a file's size       any that it had since then, and between two sizes of a growing file every whole sector
//     a cut file's rest   as it was, or zeros: what lies behind the new end may be cleared before the size changes
//     permissions         any since the last fsync; fdatasync does not count
//     a directory         any subset of the names made, changed and removed since the last fsync of the directory, a
//                         rename as a whole; an fsync of a file is not taken to make its name durable
//
// That is more than any one file system does: a journal keeps most of these in order. Used by the crash tests.

#ifndef KAVELL_TESTS_CRASH_DISK_H
#define KAVELL_TESTS_CRASH_DISK_H

#include <cstdint>
#include <functional>
#include <map>
#include <random>
#include <set>
#include <string>
#include <sys/types.h>
#include <vector>

namespace kavell::test {

/// Names a file for as long as a test runs; never used for a second one.
using Node = unsigned;

struct FileState {
    Node node = 0;
    std::string contents;
    mode_t mode = 0;

    friend bool operator==(const FileState &, const FileState &) = default;
};

/// What stands below one directory, by paths relative to it ("" is the directory itself).
struct DiskState {
    std::set<std::string> directories{""};
    std::map<std::string, FileState> files;

    friend bool operator==(const DiskState &, const DiskState &) = default;
};

/// What a program did to the disk. Paths are relative, and a change of names is one within one directory.
struct DiskOperation {
    enum class Kind {
        MakeFile,
        MakeDirectory,
        AddName,
        RemoveName,
        Rename,
        Write,
        Resize,
        ChangeMode,
        SyncFile,
        SyncData,
        SyncDirectory,
    };
    Kind kind;
    Node node = 0;            ///< the file; of none for operations on directories
    std::string directory{};  ///< whose names change, or which is synced
    std::string name{};
    std::string newName{};  ///< of Rename
    size_t offset = 0;      ///< of Write; the size of Resize
    std::string bytes{};    ///< of Write
    mode_t mode = 0;        ///< of MakeFile and ChangeMode

    [[nodiscard]] bool isSync() const { return kind >= Kind::SyncFile; }
    /// For messages.
    [[nodiscard]] std::string description() const;
};

class Disk {
public:
    static constexpr size_t kSector = 512;

    /// A disk that certainly holds this.
    explicit Disk(const DiskState &state);

    void apply(const DiskOperation &operation);

    /// What programs see: everything has happened.
    [[nodiscard]] DiskState latest() const;

    /// Visits the states that a power cut may leave now: all where they are at most `most` for each outcome of the
    /// directories, else the extreme ones and `most` of the others, picked at random. Some may come more than once.
    void forEachState(size_t most, std::mt19937_64 &random, const std::function<void(const DiskState &)> &visit) const;

private:
    struct File {
        std::string contents;                                ///< as programs see it
        std::vector<size_t> sizes;                           ///< that the disk may have; the certain one first
        std::map<size_t, std::vector<std::string>> sectors;  ///< that are not certain, by number: their versions
        mode_t mode = 0;
        std::vector<mode_t> modes;
    };
    struct NameChange {
        std::string directory;
        std::string removed;  ///< empty for none
        std::string added;    ///< empty for none
        Node node = 0;        ///< 0 for a directory
    };
    /// Names and what they are for; 0 for a directory.
    using Names = std::map<std::string, Node>;
    using Tree = std::map<std::string, Names>;
    struct Choice;

    void write(File &file, size_t offset, const std::string &bytes);
    void resize(File &file, size_t size);
    void makeCertain(File &file, bool isWhole);
    [[nodiscard]] Tree treeWith(const std::vector<bool> &happened) const;
    [[nodiscard]] DiskState stateOf(const Tree &tree) const;
    void addDirectory(const Tree &tree, const std::string &path, DiskState &state) const;
    void forEachContents(DiskState state, size_t most, std::mt19937_64 &random,
                         const std::function<void(const DiskState &)> &visit) const;

    std::map<Node, File> m_files;
    Tree m_certain;  ///< the names of each directory that are certainly there
    std::vector<NameChange> m_changes;
};

/// Where a relative path's directory ends and its name begins.
[[nodiscard]] std::string directoryOf(const std::string &path);
[[nodiscard]] std::string nameOf(const std::string &path);
[[nodiscard]] std::string joined(const std::string &directory, const std::string &name);

}  // namespace kavell::test

#endif
