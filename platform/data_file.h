// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Reading, replacing and deleting one small file so that a crash or a power cut at any moment leaves it as before or as
// after. Knows paths and bytes, not what they mean. Called by the store inside the file's semaphore; any thread may
// call.
//
// An existing file keeps its inode (its semaphore is found through it), so it is rewritten in place, under the
// protection of a redo record (redo_record.h). Every call takes a flock on the file, because two programs may come with
// different semaphores; that wait is bounded, and the call fails when the bound has passed.

#ifndef KAVELL_PLATFORM_DATA_FILE_H
#define KAVELL_PLATFORM_DATA_FILE_H

#include <cstdint>
#include <ctime>
#include <string>
#include <string_view>

#include "platform/data_directory.h"
#include "platform/file_io.h"
#include "platform/property_list_guard.h"
#include "platform/sibling_path.h"

namespace kavell {

/// A file's modification time.
struct FileTime {
    int64_t seconds = 0;
    int64_t nanoseconds = 0;

    friend bool operator==(const FileTime &, const FileTime &) = default;
};

/// The largest file that is read or written, in bytes. A larger one counts as damaged.
inline constexpr size_t kLargestDataFile = kLargestPropertyList;

enum class FileRead {
    Done,      ///< the contents are there
    Failed,    ///< it could not be opened, locked or read
    TooLarge,  ///< it is larger than kLargestDataFile and was not read
};

/// A file that was found in a listing of its directory, opened for reading. Without a file it is of no use and harms
/// nothing; the directory must stay as long. What is read of it is right if the directory is as listed after that.
struct FoundFile {
    const DataDirectory *directory = nullptr;
    FileDescriptor file{};

    [[nodiscard]] static FoundFile open(const DataDirectory &directory, const char *name) noexcept;
};

/// Reads a whole regular file into `contents`, after finishing a replacement that somebody could not finish. `size` is what
/// the file had just before, if that is known; it saves a system call.
[[nodiscard]] FileRead readDataFile(const char *path, FileContents &contents, off_t size = 0,
                                    FoundFile found = {}) noexcept;

/// Says whether bytes are what this kind of file should hold.
using IntactCheck = bool (*)(std::string_view contents) noexcept;

/// Makes `contents` the file's whole contents, durably, with permissions 0600; creates the file if need be, but not its
/// directory. A file that `isIntact` does not accept is first kept beside it (damagedCopyPath); when that fails, or
/// anything else, the file is as before and the result is false.
/// On success `*written`, unless null, is the modification time that this call gave the file; asked for later, it could be
/// that of another program's save.
[[nodiscard]] bool writeDataFile(const char *path, std::string_view contents, IntactCheck isIntact,
                                 FileTime *written = nullptr) noexcept;

/// Deletes the file, durably; false when it could not be deleted.
[[nodiscard]] bool removeDataFile(const char *path) noexcept;

}  // namespace kavell

#endif
