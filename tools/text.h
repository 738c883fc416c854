// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Text on its way to a terminal: stored values are foreign text, so control characters and the invisible ones that turn
// writing around are shown as escapes; tables are aligned by the width on the screen; colour is for terminals only.
// Any thread may call.

#ifndef KAVELL_TOOLS_TEXT_H
#define KAVELL_TOOLS_TEXT_H

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace kavell::tools {

[[nodiscard]] bool isUTF8(std::string_view text);

/// Whether the text has a C0 or C1 control character or DEL. The text is UTF-8.
[[nodiscard]] bool hasControlCharacter(std::string_view text);

/// Whether a property list can hold the text: UTF-8 without the characters that XML 1.0 has no place for.
[[nodiscard]] bool isStorableText(std::string_view text);

/// The text with everything that could steer a terminal written as \n, \t, \xNN or \u{N}, and a backslash doubled only
/// where it would read as one of these.
[[nodiscard]] std::string escaped(std::string_view text);

/// The escaped text in single quotes, for sentences.
[[nodiscard]] std::string inQuotes(std::string_view text);

[[nodiscard]] std::string joined(std::span<const std::string_view> words, std::string_view separator);

/// The number of columns that UTF-8 text takes on a terminal.
[[nodiscard]] size_t displayWidth(std::string_view text);

/// The rows as lines whose columns begin below each other, two blanks apart.
[[nodiscard]] std::string alignedTable(const std::vector<std::vector<std::string>> &rows, std::string_view indent = {});

/// The text in bold, when standard output is a terminal that wants colour (NO_COLOR is unset); else as it is.
[[nodiscard]] std::string bold(std::string_view text);

/// Writes all of the text to standard output at once; fails the command when it cannot be written.
void print(std::string_view text);

/// Writes one line to standard error, behind the program's name.
void complain(std::string_view sentence);

}  // namespace kavell::tools

#endif
