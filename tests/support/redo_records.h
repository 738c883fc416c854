// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Tells the redo records that stand beside a data file apart: void ones stay after a save, others are of a save that did not
// come to its end. Any thread may call.

#ifndef KAVELL_TESTS_SUPPORT_REDO_RECORDS_H
#define KAVELL_TESTS_SUPPORT_REDO_RECORDS_H

#include <string>
#include <sys/stat.h>

#include "platform/sibling_path.h"

namespace kavell::test {

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
