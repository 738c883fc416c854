// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Counting up and down, without locked instructions where no other thread can be counting. Any thread may call.

#ifndef KAVELL_RUNTIME_REFERENCE_COUNT_H
#define KAVELL_RUNTIME_REFERENCE_COUNT_H

#include <atomic>
#include <cstdint>

#include "runtime/single_threaded.h"

namespace kavell {

/// Counts one more; `current` is what the caller has just read. Answers how many there were before.
inline uint32_t countUp(std::atomic<uint32_t> &count, uint32_t current) noexcept
{
    if (!isSingleThreaded())
        return count.fetch_add(1, std::memory_order_relaxed);
    count.store(current + 1, std::memory_order_relaxed);
    return current;
}

/// Counts one less, in the same way. Whoever takes the last one sees all that others did before they took theirs.
inline uint32_t countDown(std::atomic<uint32_t> &count, uint32_t current) noexcept
{
    if (!isSingleThreaded())
        return count.fetch_sub(1, std::memory_order_acq_rel);
    count.store(current - 1, std::memory_order_relaxed);
    return current;
}

}  // namespace kavell

#endif
