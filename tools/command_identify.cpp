// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts identify and match: whose account is this, and why?

#include <array>

#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/object_layer.h"
#include "tools/settings_words.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp identifyHelp{
    "identify", "ADDRESS | SERVER | FILE | KEY=VALUE...",
    "Tell which account-list plug-in an account belongs to. A domain that no plug-in lists is looked up in the DNS, "
    "for at most half a second each time.",
    "  kavell-accounts identify anna@example.net\n"
    "  kavell-accounts identify mail.example.net --why\n"
    "  kavell-accounts identify emailAddress=anna@example.net KAAccountTypeKey=kKAServiceCardDAV\n"
    "  kavell-accounts identify settings.json"};

constexpr CommandHelp matchHelp{
    "match", "KIND FILE | KEY=VALUE...",
    "Find the account-list account that an application's account belongs to. KIND is mail, calendar, contacts or chat.",
    "  kavell-accounts match mail emailAddress=anna@example.net\n"
    "  kavell-accounts match calendar serverAddress=dav.example.net userName=anna --why\n"
    "  kavell-accounts match chat KAChatAccountType=aim KAChatLoginName=anna"};

/// The kinds of data and the plug-ins that serve them.
struct Kind {
    std::string_view word;
    std::string_view pluginID;
};

constexpr std::array<Kind, 4> kinds{{
    {"mail", "com.corvane.mail.kaplugin"},
    {"calendar", "com.corvane.calendar.kaplugin"},
    {"contacts", "com.corvane.contacts.kaplugin"},
    {"chat", "com.corvane.chat.kaplugin"},
}};

/// The plug-in of a kind's word, or of its whole identifier.
std::string pluginOfKind(const std::string &word)
{
    std::vector<std::string_view> known;
    for (const Kind &kind : kinds) {
        if (kind.word == word)
            return std::string(kind.pluginID);
        known.push_back(kind.word);
    }
    if (word.ends_with(".kaplugin"))
        return word;
    refuse("unknown kind of data " + inQuotes(word) + "; known are " + joined(known, ", "));
}

void printWhy(bool why, const Json &answer)
{
    if (why)
        print("\n" + stepsTable(answer.at("steps")));
}

}  // namespace

ExitCode runIdentify(const Words &words)
{
    CommandLine line(identifyHelp);
    bool why = false;
    line.addFlag("-w,--why", why, "Show each rule that was tried, what it answered and how long it took");
    line.parse(words);
    const Json answer = askObjectLayer("identify", {{"settings", settingsOf(line.positionals())}});
    const bool found = !answer.at("pluginID").is_null();
    if (line.json) {
        print(textOf(answer));
        return found ? ExitCode::Done : ExitCode::NoSuchAccount;
    }
    if (found) {
        const bool installed = answer.at("installed").get<bool>();
        print(alignedTable({
            {"Plug-in:", textMember(answer, "pluginID", "-") + (installed ? "" : " (not installed)")},
            {"Provider:", textMember(answer, "provider", "-")},
            {"Identifier:", textMember(answer, "identifier", "-")},
            {"Brand:", textMember(answer, "brand", "-")},
        }));
    }
    printWhy(why, answer);
    if (!found) {
        throw Failure(ExitCode::NoSuchAccount, why ? "no plug-in claims these settings"
                                                   : "no plug-in claims these settings; --why shows what was tried");
    }
    return ExitCode::Done;
}

ExitCode runMatch(const Words &words)
{
    CommandLine line(matchHelp);
    bool why = false;
    line.addFlag("-w,--why", why, "Show each rule and login name that was tried");
    line.parse(words);
    const std::string pluginID =
        pluginOfKind(line.takeWord("say what kind of account it is: mail, calendar, contacts or chat"));
    const Json answer = askObjectLayer("match", {{"settings", settingsOf(line.positionals())}, {"pluginID", pluginID}});
    const Json &account = answer.at("account");
    if (line.json) {
        print(textOf(answer));
        return account.is_null() ? ExitCode::NoSuchAccount : ExitCode::Done;
    }
    if (!account.is_null()) {
        print(alignedTable({
            {"Provider:", textMember(account, "provider", "-")},
            {"Login:", textMember(account, "login", "-")},
            {"UUID:", textMember(account, "uuid", "-")},
        }));
    }
    printWhy(why, answer);
    if (account.is_null()) {
        throw Failure(ExitCode::NoSuchAccount, why ? "no account of the account list matches"
                                                   : "no account of the account list matches; --why shows what was "
                                                     "tried");
    }
    return ExitCode::Done;
}

}  // namespace kavell::tools
