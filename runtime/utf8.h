// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether bytes are UTF-8 (RFC 3629). Any thread may call.

#ifndef KAVELL_RUNTIME_UTF8_H
#define KAVELL_RUNTIME_UTF8_H

#include <string_view>

namespace kavell {

/// Whether the bytes are UTF-8 without overlong forms, surrogates or values above U+10FFFF. Empty text is.
[[nodiscard]] bool isUTF8(std::string_view bytes) noexcept;

}  // namespace kavell

#endif
