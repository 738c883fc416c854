// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Keeps a file that nobody could make sense of before it is replaced. Used by data_file.cpp, with the file's flock
// held.

#ifndef KAVELL_PLATFORM_DAMAGED_COPY_H
#define KAVELL_PLATFORM_DAMAGED_COPY_H

namespace kavell {

/// Copies the open file, durably, to a name beside `path` that says that it is damaged and when it was kept
/// (data_file.h, kDamagedCopyPrefix). Holes stay holes, and a file system that can share the bytes does. False when
/// that fails.
[[nodiscard]] bool keepDamagedCopy(int file, const char *path);

}  // namespace kavell

#endif
