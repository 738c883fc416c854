// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts words: the words of one kind for shell completion, from the very tables that the commands use.

#include "tools/commands.h"
#include "tools/names.h"
#include "tools/settings_words.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

std::string linesOf(std::span<const ShortName> table)
{
    std::string lines;
    for (const ShortName &entry : table)
        lines += std::string(entry.word) + "\n";
    return lines;
}

std::string linesOf(std::span<const std::string_view> words)
{
    std::string lines;
    for (const std::string_view word : words)
        lines.append(word).append("\n");
    return lines;
}

}  // namespace

ExitCode runWords(const Words &words)
{
    const std::string kind = words.empty() ? std::string() : words.front();
    if (kind == "providers")
        print(linesOf(providerTypes()));
    else if (kind == "services")
        print(linesOf(services()));
    else if (kind == "keys")
        print(linesOf(attributeKeys()));
    else if (kind == "settings")
        print(linesOf(settingKeys()));
    else
        refuse("the kinds of words are providers, services, keys and settings");
    return ExitCode::Done;
}

}  // namespace kavell::tools
