// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Makes void redo records, and tells those that stand beside a data file apart: void ones stay after a save, others are of
// a save that did not come to its end. Any thread may call.

#ifndef KAVELL_TESTS_SUPPORT_REDO_RECORDS_H
#define KAVELL_TESTS_SUPPORT_REDO_RECORDS_H

#include <cstdint>
#include <string>
#include <sys/stat.h>

#include "platform/sibling_path.h"

namespace kavell::test {

/// The void record of a data file with this inode, as a save leaves it.
[[nodiscard]] inline std::string voidRecordOf(uint64_t inode)
{
    std::string bytes = "KAVREDO1";
    for (int shift = 0; shift < 64; shift += 8)
        bytes += static_cast<char>(inode >> shift);
    return bytes;
}

[[nodiscard]] inline bool isVoidRecordAt(const std::string &path)
{
    struct stat status {};
    return lstat(path.c_str(), &status) == 0 && isVoidRecord(status);
}

/// Whether something stands there that is to be settled.
[[nodiscard]] inline bool isPendingRecordAt(const std::string &path)
{
    struct stat status {};
    return lstat(path.c_str(), &status) == 0 && !isVoidRecord(status);
}

}  // namespace kavell::test

#endif
