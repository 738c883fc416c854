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
#include <cstring>
#include <ctime>
#include <fcntl.h>
#include <string>
#include <string_view>

#include "platform/file_io.h"
#include "platform/property_list_guard.h"

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

/// Reads a whole regular file into `contents`, after finishing a replacement that somebody could not finish. Whoever has
/// the file's directory open gives its descriptor: from there, names are found faster than by a whole path.
[[nodiscard]] FileRead readDataFile(const char *path, FileContents &contents, int directory = AT_FDCWD) noexcept;

/// Says whether bytes are what this kind of file should hold.
using IntactCheck = bool (*)(std::string_view contents) noexcept;

/// Makes `contents` the file's whole contents, durably, with permissions 0600; creates the file if need be, but not its
/// directory. A file that `isIntact` does not accept is first kept beside it (damagedCopyPath); when that fails, or
/// anything else, the file is as before and the result is false.
[[nodiscard]] bool writeDataFile(const char *path, std::string_view contents, IntactCheck isIntact) noexcept;

/// Deletes the file, durably; false when it could not be deleted.
[[nodiscard]] bool removeDataFile(const char *path) noexcept;

/// What the names begin with that this code gives to files beside a data file; none of them ends in ".plist". Each is
/// followed by 16 hexadecimal digits, the hash of the data file's name.
inline constexpr std::string_view kRedoRecordPrefix = ".redo-";
inline constexpr std::string_view kNewFilePrefix = ".new-";
/// Followed by the hash, "-", and the time of keeping, as in damaged-0123456789abcdef-20260131T100000Z.
inline constexpr std::string_view kDamagedCopyPrefix = "damaged-";

/// What finds the file from its directory, when that is open, or else from anywhere.
[[nodiscard]] inline const char *nameIn(int directory, const char *path) noexcept
{
    const char *const slash = directory == AT_FDCWD ? nullptr : std::strrchr(path, '/');
    return slash ? slash + 1 : path;
}

/// The path beside a data file that consists of the prefix and the hash of the file's name.
[[nodiscard]] std::string siblingPath(std::string_view path, std::string_view prefix);

}  // namespace kavell

#endif
