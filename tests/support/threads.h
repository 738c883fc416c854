// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads that do something at once, for tests of what several of them may do with one object. GoogleTest's
// expectations may be made on all of them.

#ifndef KAVELL_TESTS_SUPPORT_THREADS_H
#define KAVELL_TESTS_SUPPORT_THREADS_H

#include <barrier>
#include <thread>
#include <vector>

namespace kavell::test {

/// Runs `body(index)` on so many threads, which start together, and waits for all of them.
template <typename Body> void onThreads(int count, Body body)
{
    std::barrier start(count);
    std::vector<std::jthread> threads;
    for (int index = 0; index < count; ++index)
        threads.emplace_back([&, index] {
            start.arrive_and_wait();
            body(index);
        });
}

}  // namespace kavell::test

#endif
