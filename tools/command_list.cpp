// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts list: the accounts in a table. Touches no credentials, so that it starts as fast as a program can.

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/names.h"
#include "tools/text.h"
#include <array>

namespace kavell::tools {

namespace {

constexpr CommandHelp help{"list", "", "List the accounts with their names and services.",
                           "  kavell-accounts list\n"
                           "  kavell-accounts list --provider google\n"
                           "  kavell-accounts list --json | jq -r '.accounts[].login'"};

/// Where a name for people may stand, in the order of preference.
constexpr std::array<std::string_view, 4> nameKeys{"accountDescription", "com.corvane.provider.fullname", "fullName",
                                                   "com.corvane.provider.nickname"};

std::string nameOf(const OpenedAccount &account)
{
    for (const std::string_view key : nameKeys)
        if (std::string name = textAttribute(account.record.get(), key); !name.empty())
            return name;
    return {};
}

Json summaryJson(const OpenedAccount &account)
{
    Json json = addressJson(account.address);
    json["name"] = nameOf(account);
    json["uuid"] =
        account.readable ? toStdString(adopt(_CSKavellAccountCopyUUIDString(account.record.get())).get()) : "";
    json["services"] = serviceIdentifiers(account);
    json["readable"] = account.readable;
    return json;
}

std::vector<std::string> rowOf(const OpenedAccount &account)
{
    std::string serviceWords;
    for (const std::string &identifier : serviceIdentifiers(account))
        serviceWords += (serviceWords.empty() ? "" : " ") + escaped(shortService(identifier));
    return {escaped(shortProviderType(account.address.providerType)), escaped(account.address.login),
            account.readable ? escaped(nameOf(account)) : "(cannot be read)", serviceWords};
}

/// For completion: the addresses alone, without opening a file or waiting for one.
void printNames(const std::vector<Address> &addresses, bool loginsOnly)
{
    std::string text;
    for (const Address &address : addresses)
        if (nameProblem(address.login).empty())
            text +=
                (loginsOnly ? "" : std::string(shortProviderType(address.providerType)) + "/") + address.login + "\n";
    print(text);
}

void printAccounts(const std::vector<OpenedAccount> &accounts, bool asJson)
{
    if (asJson) {
        Json list = Json::array();
        for (const OpenedAccount &account : accounts)
            list.push_back(summaryJson(account));
        Json json = Json::object();
        json["accounts"] = std::move(list);
        print(textOf(json));
        return;
    }
    if (accounts.empty()) {
        complain("there are no accounts; add one with 'kavell-accounts add google anna@gmail.com'");
        return;
    }
    std::vector<std::vector<std::string>> rows{{"PROVIDER", "LOGIN", "NAME", "SERVICES"}};
    for (const OpenedAccount &account : accounts)
        rows.push_back(rowOf(account));
    const std::string table = alignedTable(rows);
    const size_t headEnd = table.find('\n');
    print(bold(table.substr(0, headEnd)) + table.substr(headEnd));
}

}  // namespace

ExitCode runList(const Words &words)
{
    CommandLine line(help);
    std::string provider;
    bool names = false;
    line.addValue("-p,--provider", provider, "TYPE", "Only the accounts of this provider, such as google");
    line.addFlag("--names", names, "Only the addresses, without opening any data file");
    line.parse(words);
    line.expectNoMore();
    const std::optional<std::string> type =
        provider.empty() ? std::nullopt : std::optional<std::string>(providerTypeOf(provider));
    const std::vector<Address> addresses = accountsOnDisk(type);
    if (names) {
        printNames(addresses, type.has_value());
        return ExitCode::Done;
    }
    std::vector<OpenedAccount> accounts;
    size_t unreadable = 0;
    for (const Address &address : addresses) {
        OpenedAccount account = openAccount(address);
        if (!account.existed)
            continue;  // removed by another program meanwhile
        unreadable += account.readable ? 0 : 1;
        accounts.push_back(std::move(account));
    }
    printAccounts(accounts, line.json);
    if (unreadable == 0)
        return ExitCode::Done;
    throw Failure(ExitCode::Failed, std::to_string(unreadable) + (unreadable == 1 ? " account" : " accounts") +
                                        " could not be read; 'kavell-accounts doctor' says why");
}

}  // namespace kavell::tools
