// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The checksum of redo records and of the names derived from file names. Not for secrets and not against an adversary.

#ifndef KAVELL_PLATFORM_CHECKSUM_H
#define KAVELL_PLATFORM_CHECKSUM_H

#include <cstdint>
#include <string_view>

namespace kavell {

/// FNV-1a of 64 bits (Fowler, Noll and Vo).
[[nodiscard]] constexpr uint64_t checksumOf(std::string_view bytes) noexcept
{
    uint64_t hash = 0xcbf29ce484222325;
    for (const char byte : bytes)
        hash = (hash ^ static_cast<unsigned char>(byte)) * 0x100000001b3;
    return hash;
}

}  // namespace kavell

#endif
