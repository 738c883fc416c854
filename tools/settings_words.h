// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The settings that identify and match are asked about, from the words of the command line. One thread.

#ifndef KAVELL_TOOLS_SETTINGS_WORDS_H
#define KAVELL_TOOLS_SETTINGS_WORDS_H

#include <span>
#include <string>
#include <string_view>

#include "tools/account_access.h"
#include "tools/json_value.h"

namespace kavell::tools {

/// The settings that the words mean: KEY=VALUE words (assignment.h, with keys as they stand), files of settings (property
/// lists or JSON objects; "-" is standard input), an e-mail address, or a server or domain. Later words win. Refuses
/// words that mean nothing, and none at all.
[[nodiscard]] Json settingsOf(const Words &words);

/// The keys that the rules look at.
[[nodiscard]] std::span<const std::string_view> settingKeys();

/// The steps of a decision as a table, or a sentence when there was none.
[[nodiscard]] std::string stepsTable(const Json &steps);

/// The text of a member for people, escaped; `missing` when it is null.
[[nodiscard]] std::string textMember(const Json &object, const char *key, std::string_view missing);

}  // namespace kavell::tools

#endif
