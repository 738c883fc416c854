// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether locked instructions can be spared: a program that never started a thread, as many that read accounts, has
// nobody to be protected from, and they are most of what counting a reference or taking a free lock costs.

#ifndef KAVELL_RUNTIME_SINGLE_THREADED_H
#define KAVELL_RUNTIME_SINGLE_THREADED_H

#include <sys/single_threaded.h>

namespace kavell {

/// True only while no other thread can run code of this process. It may change between two calls of one thread, which
/// may itself start a thread; what it had done plainly until then, the new thread sees.
[[nodiscard]] inline bool isSingleThreaded() noexcept
{
    return __libc_single_threaded != 0;
}

}  // namespace kavell

#endif
