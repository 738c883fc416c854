// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The 32-bit lock of a record. It is usually held for nanoseconds, but across a commit's file work too; so a thread
// that finds it held spins briefly and then sleeps in the kernel until it is given back. Not recursive: code that holds
// the lock calls functions that expect it held.

#ifndef KAVELL_STORE_RECORD_LOCK_H
#define KAVELL_STORE_RECORD_LOCK_H

#include <atomic>
#include <cstdint>

#include "runtime/single_threaded.h"

namespace kavell {

class RecordLock {
public:
    void lock() noexcept
    {
        if (isSingleThreaded() && m_state.load(std::memory_order_relaxed) == kFree) {
            m_state.store(kHeld, std::memory_order_relaxed);
            return;
        }
        uint32_t state = kFree;
        if (!m_state.compare_exchange_strong(state, kHeld, std::memory_order_acquire, std::memory_order_relaxed))
            lockContended();
    }

    void unlock() noexcept
    {
        if (isSingleThreaded()) {
            m_state.store(kFree, std::memory_order_relaxed);
            return;
        }
        if (m_state.exchange(kFree, std::memory_order_release) == kAwaited)
            m_state.notify_one();
    }

private:
    static constexpr uint32_t kFree = 0, kHeld = 1, kAwaited = 2;
    // About a microsecond: longer than any hold without file work, much shorter than one with it.
    static constexpr int kSpins = 100;

    void lockContended() noexcept
    {
        for (int spin = 0; spin < kSpins; ++spin) {
            uint32_t state = kFree;
            if (m_state.load(std::memory_order_relaxed) == kFree &&
                m_state.compare_exchange_weak(state, kHeld, std::memory_order_acquire, std::memory_order_relaxed))
                return;
        }
        // Whoever takes the lock from here on marks it as awaited, since others may be asleep too.
        while (m_state.exchange(kAwaited, std::memory_order_acquire) != kFree)
            m_state.wait(kAwaited, std::memory_order_relaxed);
    }

    std::atomic<uint32_t> m_state{kFree};
};

static_assert(sizeof(RecordLock) == 4);

}  // namespace kavell

#endif
