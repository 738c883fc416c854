// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Numbers for code that makes many of them.

#ifndef KAVELL_RUNTIME_NUMBER_P_H
#define KAVELL_RUNTIME_NUMBER_P_H

#include <cstdint>

#include <kavellaccounts/CSKavellNumber.h>

#include "runtime/object_block.h"

namespace kavell {

/// CSKavellNumberCreateWithInt64 in a block; none when there is no memory for it.
[[nodiscard]] CSKavellNumberRef makeInteger(ObjectBlock &block, int64_t value) noexcept;

}  // namespace kavell

#endif
