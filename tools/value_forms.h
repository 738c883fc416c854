// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The forms in which values are written as text: dates as RFC 3339 has them, data in base64 (RFC 4648, section 4),
// reals so that they read back as the same real. Any thread may call.

#ifndef KAVELL_TOOLS_VALUE_FORMS_H
#define KAVELL_TOOLS_VALUE_FORMS_H

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace kavell::tools {

/// Seconds since 1970 of "2026-01-31T10:00:00Z", of a date with an offset such as "+02:00", or of a day alone (its
/// first moment in UTC). None for anything else, for days that do not exist and for fractions of a second.
[[nodiscard]] std::optional<int64_t> parseDate(std::string_view text);

/// The date in UTC, such as "2026-01-31T10:00:00Z".
[[nodiscard]] std::string formatDate(int64_t secondsSince1970);

/// Whether a data file can hold the date; it has 32 bits of seconds around 2001.
[[nodiscard]] bool isStorableDate(int64_t secondsSince1970);

/// The bytes of base64 text; none when it is not well-formed. Blanks and line feeds are skipped.
[[nodiscard]] std::optional<std::vector<uint8_t>> parseBase64(std::string_view text);

[[nodiscard]] std::string formatBase64(std::span<const uint8_t> bytes);

/// The shortest text that reads back as the same real, always recognisable as a real ("1.0").
[[nodiscard]] std::string formatReal(double value);

/// The finite real that the whole text is; none for anything else.
[[nodiscard]] std::optional<double> parseReal(std::string_view text);

}  // namespace kavell::tools

#endif
