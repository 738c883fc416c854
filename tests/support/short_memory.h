// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Memory that is short, for what happens when an exception ends an operation in its middle. What is taken by malloc, as
// the store and the toolkit's texts do, is never short.
//
// Brings an operator new and delete of its own: its source is listed by the programs that use it and is in no library,
// where each program would find them.

#ifndef KAVELL_TESTS_SUPPORT_SHORT_MEMORY_H
#define KAVELL_TESTS_SUPPORT_SHORT_MEMORY_H

#include <cstddef>

namespace kavell::test {

/// While it lives, operator new throws on this thread when asked for more bytes at once. One at a time on a thread.
class ShortMemory {
public:
    explicit ShortMemory(size_t mostBytes);
    ~ShortMemory();
    ShortMemory(const ShortMemory &) = delete;
    ShortMemory &operator=(const ShortMemory &) = delete;
};

}  // namespace kavell::test

#endif
