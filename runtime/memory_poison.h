// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Tells the address sanitizer which bytes of a larger piece of memory may be used. Where a program is built without it,
// these do nothing. Any thread may call.

#ifndef KAVELL_RUNTIME_MEMORY_POISON_H
#define KAVELL_RUNTIME_MEMORY_POISON_H

#include <cstddef>

#if defined(__SANITIZE_ADDRESS__)
#define KAVELL_HAS_ADDRESS_SANITIZER
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define KAVELL_HAS_ADDRESS_SANITIZER
#endif
#endif

#ifdef KAVELL_HAS_ADDRESS_SANITIZER
#include <sanitizer/asan_interface.h>
#endif

namespace kavell {

#ifdef KAVELL_HAS_ADDRESS_SANITIZER

inline constexpr bool kCanPoison = true;

/// Forbids the use of these bytes.
inline void poison(void *memory, size_t size) noexcept
{
    __asan_poison_memory_region(memory, size);
}

/// Allows the use of these bytes.
inline void unpoison(void *memory, size_t size) noexcept
{
    __asan_unpoison_memory_region(memory, size);
}

/// Forbids the use of the bytes from there up to the next one that is forbidden already, of `most` at the most.
inline void poisonUpToPoison(void *memory, size_t most) noexcept
{
    const void *end = __asan_region_is_poisoned(memory, most);
    poison(memory, end ? static_cast<size_t>(static_cast<const char *>(end) - static_cast<char *>(memory)) : most);
}

#else

inline constexpr bool kCanPoison = false;

inline void poison(void *, size_t) noexcept
{
}

inline void unpoison(void *, size_t) noexcept
{
}

inline void poisonUpToPoison(void *, size_t) noexcept
{
}

#endif

}  // namespace kavell

#endif
