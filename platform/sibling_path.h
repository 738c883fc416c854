// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The names of the files that stand beside a data file: redo records, new files before they have their name, and kept
// damaged contents; and how a void redo record is told. None of the names ends in ".plist". Safe from any thread.

#ifndef KAVELL_PLATFORM_SIBLING_PATH_H
#define KAVELL_PLATFORM_SIBLING_PATH_H

#include <string>
#include <string_view>
#include <sys/stat.h>
#include <sys/types.h>

#include "platform/checksum.h"

namespace kavell {

/// What the names begin with. Each is followed by 16 hexadecimal digits, the hash of the data file's name.
inline constexpr std::string_view kRedoRecordPrefix = ".redo-";
inline constexpr std::string_view kNewFilePrefix = ".new-";
/// Followed by the hash, "-", and the time of keeping, as in damaged-0123456789abcdef-20260131T100000Z.
inline constexpr std::string_view kDamagedCopyPrefix = "damaged-";

/// The length of a void redo record, in bytes (redo_record.h).
inline constexpr off_t kVoidRecordLength = 16;

/// Whether this is the status of a void redo record, which stays after each replacement and says nothing.
[[nodiscard]] inline bool isVoidRecord(const struct stat &status) noexcept
{
    return S_ISREG(status.st_mode) && status.st_size == kVoidRecordLength;
}

/// The path beside a data file that consists of the prefix and the hash of the file's name.
[[nodiscard]] inline std::string siblingPath(std::string_view path, std::string_view prefix)
{
    constexpr char kDigits[] = "0123456789abcdef";
    const size_t nameStart = path.rfind('/') + 1;
    const uint64_t hash = checksumOf(path.substr(nameStart));
    std::string sibling;
    // Room for what callers append.
    sibling.reserve(nameStart + prefix.size() + 48);
    sibling.append(path.substr(0, nameStart)).append(prefix);
    for (int shift = 60; shift >= 0; shift -= 4)
        sibling += kDigits[(hash >> shift) & 15];
    return sibling;
}

}  // namespace kavell

#endif
