// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "store/error_message.h"

#include <cstdarg>
#include <cstdio>

namespace kavell {

void writeError(const char *format, ...) noexcept
{
    va_list arguments;
    va_start(arguments, format);
    std::vfprintf(stderr, format, arguments);
    va_end(arguments);
}

}  // namespace kavell
