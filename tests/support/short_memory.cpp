// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/short_memory.h"

#include <cstdint>
#include <cstdlib>
#include <new>

namespace {

thread_local size_t mostAtOnce = SIZE_MAX;

}  // namespace

namespace kavell::test {

ShortMemory::ShortMemory(size_t mostBytes)
{
    mostAtOnce = mostBytes;
}

ShortMemory::~ShortMemory()
{
    mostAtOnce = SIZE_MAX;
}

}  // namespace kavell::test

void *operator new(size_t size, const std::nothrow_t &) noexcept
{
    return size <= mostAtOnce ? std::malloc(size) : nullptr;
}

void *operator new(size_t size)
{
    void *const memory = operator new(size, std::nothrow);
    if (!memory)
        throw std::bad_alloc();
    return memory;
}

void operator delete(void *memory) noexcept
{
    std::free(memory);
}

void operator delete(void *memory, size_t) noexcept
{
    std::free(memory);
}

// The forms for arrays are the sanitizer's own where there is one, which does not go through the forms above.

void *operator new[](size_t size)
{
    return operator new(size);
}

void operator delete[](void *memory) noexcept
{
    operator delete(memory);
}

void operator delete[](void *memory, size_t) noexcept
{
    operator delete(memory);
}
