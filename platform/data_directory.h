// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A directory of data files as it was when it was listed, for whoever opens all of them: they are looked up from the open
// directory and not from the root, and only those whose redo record stood there have it looked for. What came to stand
// there meanwhile shows in the directory's time, which is asked for once, at the end. One thread at a time.

#ifndef KAVELL_PLATFORM_DATA_DIRECTORY_H
#define KAVELL_PLATFORM_DATA_DIRECTORY_H

#include <cstdint>
#include <ctime>
#include <dirent.h>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_set>

namespace kavell {

/// The longest tick of the kernel's clock of files, in nanoseconds.
inline constexpr int64_t kLongestTick = 10'000'000;

/// What the name of a data file ends with; a login name stands before it.
inline constexpr std::string_view kDataFileSuffix = ".plist";

/// Whether the time of a directory would be another one after any change from now on: it is as coarse as the kernel's tick,
/// and on some file systems has whole seconds only.
[[nodiscard]] bool wouldChangeTell(const timespec &changed, const timespec &now) noexcept;

class DataDirectory {
public:
    /// Opens and lists a directory; there is nothing in it when that fails.
    explicit DataDirectory(const char *path);

    /// -1 when it could not be opened.
    [[nodiscard]] int descriptor() const noexcept { return m_directory ? dirfd(m_directory.get()) : -1; }

    /// Calls `body(name)` for each data file, in the directory's own order. The name ends with a NUL.
    template <typename Body> void forEachDataFile(Body &&body) const
    {
        for (size_t start = 0; start < m_names.size();) {
            const std::string_view name(m_names.c_str() + start);
            body(name);
            start += name.size() + 1;
        }
    }

    /// Whether a data file had no redo record when the directory was listed. Whoever goes by that asks isAsListed later.
    [[nodiscard]] bool hadNoRecordOf(const char *name) const;

    /// Whether every answer of hadNoRecordOf has been true until now, too. Where it was sure of nothing they have, whatever
    /// became of the directory.
    [[nodiscard]] bool isAsListed() const noexcept;

    /// From here on hadNoRecordOf is sure of nothing.
    void doubtListing() noexcept { m_isTelling = false; }

private:
    struct Closer {
        void operator()(DIR *directory) const noexcept { closedir(directory); }
    };

    void noteTime() noexcept;
    void add(const dirent &entry);

    std::unique_ptr<DIR, Closer> m_directory;
    /// Nothing came into the directory since this time if it is still the directory's.
    timespec m_changed{};
    /// Whether the directory's time would tell.
    bool m_isTelling = false;
    std::string m_names;  ///< of the data files, each with a NUL behind it
    std::unordered_set<std::string> m_records;
};

}  // namespace kavell

#endif
