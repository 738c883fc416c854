// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts export: the accounts as one JSON document, which import reads.

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"
#include "tools/transfer_format.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "export", "[FILE]",
    "Write all accounts, or those of one provider, as JSON to FILE or to standard output. Passwords are not written, "
    "nor are references to them. FILE is replaced whole, and only its owner may read it.",
    "  kavell-accounts export accounts.json\n"
    "  kavell-accounts export --provider google | jq '.accounts[].login'"};

}  // namespace

ExitCode runExport(const Words &words)
{
    CommandLine line(help);
    std::string provider;
    line.addValue("-p,--provider", provider, "TYPE", "Only the accounts of this provider, such as google");
    line.parse(words);
    const std::string file = line.positionals().empty() ? "-" : line.takeWord("the file is missing");
    line.expectNoMore();
    const std::optional<std::string> type =
        provider.empty() ? std::nullopt : std::optional<std::string>(providerTypeOf(provider));
    Json document = Json::object();
    document[transferVersionKey] = transferVersion;
    Json accounts = Json::array();
    std::string unreadable;
    for (const Address &address : accountsOnDisk(type)) {
        const OpenedAccount account = openAccount(address);
        if (account.existed && !account.readable)
            unreadable += (unreadable.empty() ? "" : ", ") + address.text();
        else if (account.existed)
            accounts.push_back(accountJson(account));
    }
    const size_t count = accounts.size();
    document["accounts"] = std::move(accounts);
    if (file == "-") {
        print(textOf(document));
    } else {
        writeOutputFile(file, textOf(document));
        line.report("Exported " + std::to_string(count) + (count == 1 ? " account to " : " accounts to ") +
                        escaped(file) + ".",
                    [&] {
                        Json result = Json::object();
                        result["exported"] = count;
                        return textOf(result);
                    });
    }
    if (unreadable.empty())
        return ExitCode::Done;
    throw Failure(ExitCode::Failed, "left out, because their data files cannot be read: " + unreadable +
                                        "; 'kavell-accounts doctor' says why");
}

}  // namespace kavell::tools
