// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The one way in which the store reports a failure: a line on standard error, which belongs to the interface to the
// byte.

#ifndef KAVELL_STORE_ERROR_MESSAGE_H
#define KAVELL_STORE_ERROR_MESSAGE_H

namespace kavell {

/// Writes a formatted message to standard error, as it is.
[[gnu::format(printf, 1, 2)]] void writeError(const char *format, ...) noexcept;

}  // namespace kavell

#endif
