// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts plugins, children and servers: what the object layer knows of the machine and of an account.

#include <algorithm>

#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/object_layer.h"
#include "tools/settings_words.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp pluginsHelp{
    "plugins", "",
    "List the plug-ins that are found, where, and why one was refused. They are looked for in the directories of "
    "VESK_FRAMEWORK_PATH and then in /System/Library/KavellAccounts.",
    "  kavell-accounts plugins\n"
    "  VESK_FRAMEWORK_PATH=$PWD/build kavell-accounts plugins"};

constexpr CommandHelp childrenHelp{
    "children", "PROVIDER LOGIN", "List the accounts that client applications hold for an account of the account list.",
    "  kavell-accounts children google anna@gmail.com"};

constexpr CommandHelp serversHelp{"servers", "[add SERVER [SERVICE...] | remove SERVER]",
                                  "List the organisation servers that are known, or add or remove one.",
                                  "  kavell-accounts servers\n"
                                  "  kavell-accounts servers add mail.example.net kKAServiceIMAP kKAServiceCalDAV\n"
                                  "  kavell-accounts servers remove mail.example.net"};

void printPlugins(const Json &bundles)
{
    std::vector<std::vector<std::string>> rows{{"IDENTIFIER", "KIND", "STATE", "PATH"}};
    std::vector<std::string> reasons;
    for (const Json &bundle : bundles) {
        rows.push_back({textMember(bundle, "identifier", "-"), textMember(bundle, "kind", "-"),
                        textMember(bundle, "state", ""), textMember(bundle, "path", "")});
        if (const std::string reason = textMember(bundle, "reason", ""); !reason.empty())
            reasons.push_back(textMember(bundle, "path", "") + ": " + reason);
    }
    std::string text = alignedTable(rows);
    const size_t headEnd = text.find('\n');
    text = bold(text.substr(0, headEnd)) + text.substr(headEnd);
    for (size_t index = 0; index < reasons.size(); ++index)
        text += (index == 0 ? "\n" : "") + reasons[index] + "\n";
    print(text);
}

std::string activity(const Json &child)
{
    const Json &active = child.at("active");
    return active.is_null() ? "unknown" : active.get<bool>() ? "active" : "inactive";
}

std::string serviceWords(const Json &services)
{
    std::string words;
    for (const Json &service : services) {
        if (service.is_string())
            words += (words.empty() ? "" : " ") + escaped(service.get<std::string>());
    }
    return words;
}

/// The question that the words of the servers command mean.
Json serversQuestion(CommandLine &line)
{
    Json question = Json::object();
    if (line.positionals().empty())
        return question;
    const std::string action = line.takeWord("say what to do: add or remove");
    if (action != "add" && action != "remove")
        refuse("unknown action " + inQuotes(action) + "; known are add and remove");
    question[action] = line.takeWord("the server is missing; name its host, such as mail.example.net");
    if (action == "add")
        question["services"] = line.positionals();
    else
        line.expectNoMore();
    return question;
}

}  // namespace

ExitCode runPlugins(const Words &words)
{
    CommandLine line(pluginsHelp);
    line.parse(words);
    line.expectNoMore();
    const Json answer = askObjectLayer("plugins");
    if (line.json)
        print(textOf(answer));
    else
        printPlugins(answer.at("bundles"));
    return ExitCode::Done;
}

ExitCode runChildren(const Words &words)
{
    CommandLine line(childrenHelp);
    line.parse(words);
    const Address address = line.takeAccount();
    line.expectNoMore();
    (void)openExisting(address);  // with the sentence that every command has for a missing account
    const Json answer = askObjectLayer("children", {{"provider", address.providerType}, {"login", address.login}});
    const Json &children = answer.at("children");
    if (line.json) {
        print(textOf(answer));
    } else if (children.empty()) {
        complain("no client application holds an account for " + inQuotes(address.text()));
    } else {
        std::vector<std::vector<std::string>> rows{{"UID", "APPLICATION", "STATE", "PLUG-IN"}};
        for (const Json &child : children) {
            rows.push_back({textMember(child, "uid", "-"), textMember(child, "application", "-"), activity(child),
                            textMember(child, "pluginID", "-")});
        }
        print(alignedTable(rows));
    }
    return ExitCode::Done;
}

ExitCode runServers(const Words &words)
{
    CommandLine line(serversHelp);
    bool namesOnly = false;
    line.addFlag("--names", namesOnly, "List only the servers' names, a line each");
    line.parse(words);
    const Json question = serversQuestion(line);
    if (question.contains("remove")) {
        const Json known = askObjectLayer("servers").at("servers");
        const bool isKnown = std::any_of(known.begin(), known.end(),
                                         [&](const Json &entry) { return entry.at("server") == question["remove"]; });
        if (!isKnown)
            throw Failure(ExitCode::NoSuchAccount,
                          "there is no server " + inQuotes(question["remove"].get<std::string>()));
    }
    const Json answer = askObjectLayer("servers", question);
    const Json &servers = answer.at("servers");
    if (namesOnly) {
        for (const Json &entry : servers)
            print(textMember(entry, "server", "") + "\n");
    } else if (line.json) {
        print(textOf(answer));
    } else if (!question.empty()) {
        const bool added = question.contains("add");
        line.report((added ? "Added " : "Removed ") + inQuotes(question[added ? "add" : "remove"].get<std::string>()) +
                        ".",
                    [&] { return textOf(answer); });
    } else if (servers.empty()) {
        complain("there are no servers; add one with 'kavell-accounts servers add mail.example.net'");
    } else {
        std::vector<std::vector<std::string>> rows{{"SERVER", "SERVICES"}};
        for (const Json &entry : servers)
            rows.push_back({textMember(entry, "server", "-"), serviceWords(entry.at("services"))});
        print(alignedTable(rows));
    }
    return ExitCode::Done;
}

}  // namespace kavell::tools
