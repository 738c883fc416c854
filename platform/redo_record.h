// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The redo record: what lets a file be rewritten in place and yet survive a power cut. It is a small file beside the
// data file that holds both the old and the new contents, complete and on disk before the first byte of the data file
// changes, and is void when the new contents are on disk. Whoever finds one that is not void, holding the data file's
// flock, settles it:
//
//     record                                data file              is settled by
//     torn, or of another inode             anything               deleting the record: the data file was not touched
//     whole                                 a mix of old and new   writing the new contents, with permissions 0600,
//                                                                  then deleting the record
//     whole                                 anything else          deleting the record: another program wrote since
//
// "A mix" is decided byte by byte, so that no tear, at whatever place, is taken for another program's work, and the
// other way round. The zeros of a file that grew without its bytes count as torn, and so do those that a file system
// puts behind the new end of a file that becomes shorter, which may be on the disk before the new size is.
//
//     offset  bytes
//          0  8   "KAVREDO1"
//          8  8   inode of the data file                       (all integers little-endian)
//         16  8   length of the old contents; all ones: the old contents are unknown and anything counts as a mix
//         24  8   length of the new contents
//         32  …   old contents, new contents
//        end  8   checksum of everything before it (64-bit FNV-1a)
//
// A void record is cut off after its second field, and stays for the next replacement, which need not make its name
// durable again: a third of what a replacement takes. It says that its own name and that of the file with this inode are on
// the disk; where that is not certain, a record is deleted. Beside another file it says nothing: that one may have been
// named, by whatever program, a moment ago.
//
// Used by data_file.cpp only, by one process at a time (the flock).

#ifndef KAVELL_PLATFORM_REDO_RECORD_H
#define KAVELL_PLATFORM_REDO_RECORD_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <sys/types.h>

namespace kavell {

struct RedoRecord {
    ino_t inode = 0;
    std::optional<std::string_view> oldContents;
    std::string_view newContents;
};

/// What is to be done with a record.
enum class RedoVerdict { Discard, Finish };

/// The record as it stands in its file.
[[nodiscard]] std::string encodeRedoRecord(const RedoRecord &record);

/// The record in the bytes, with views into them; none when it is torn or no record.
[[nodiscard]] std::optional<RedoRecord> decodeRedoRecord(std::string_view bytes) noexcept;

/// The inode that a record is bound to, also a void one and one that is torn behind it; none when the bytes do not begin as
/// a record does.
[[nodiscard]] std::optional<ino_t> inodeOfRedoRecord(std::string_view bytes) noexcept;

/// What to do with a whole record when its data file has this inode and these contents.
[[nodiscard]] RedoVerdict judgeRedoRecord(const RedoRecord &record, ino_t inode, std::string_view contents) noexcept;

}  // namespace kavell

#endif
