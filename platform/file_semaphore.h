// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The System V semaphore that orders the programs that read and write one file. Programs of any language that follow
// the same steps meet in the same semaphore, so the steps are fixed: the key is the file's, a new set has one semaphore
// of value 1, nothing is undone when a holder dies. Any thread may call.

#ifndef KAVELL_PLATFORM_FILE_SEMAPHORE_H
#define KAVELL_PLATFORM_FILE_SEMAPHORE_H

#include <cstdint>
#include <optional>
#include <sys/stat.h>

namespace kavell {

/// The identifier of the set of a file with this status, opened or created; none when neither could be done. A file
/// that is missing, whose status is null, has the key -1, which all such files share. The identifier may be 0, which
/// callers never use.
[[nodiscard]] std::optional<int32_t> obtainFileSemaphore(const struct stat *status) noexcept;

/// Waits for the semaphore without a bound and takes it. False when it was not taken: the set is gone, or a signal's
/// handler ran meanwhile.
[[nodiscard]] bool takeFileSemaphore(int32_t semaphoreID) noexcept;

/// Gives the semaphore back; false, with errno, when that fails.
[[nodiscard]] bool giveFileSemaphore(int32_t semaphoreID) noexcept;

}  // namespace kavell

#endif
