// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts words: the words of one kind for shell completion, from the very tables that the commands use.

#include "tools/commands.h"
#include "tools/names.h"
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
    else
        refuse("the kinds of words are providers, services and keys");
    return ExitCode::Done;
}

}  // namespace kavell::tools
