// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts show: one account, its attributes in the very words that set them, and the state of its password.

#include <vector>

#include "tools/account_json.h"
#include "tools/assignment.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "show", "PROVIDER LOGIN",
    "Show one account: its attributes, written as 'set' takes them, and whether its password is stored. The password "
    "itself is shown by 'password get'; nothing is unlocked for this.",
    "  kavell-accounts show google anna@gmail.com\n"
    "  kavell-accounts show google/anna@gmail.com --json"};

std::string attributeLines(CSKavellDictionaryRef attributes)
{
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(attributes));
    std::vector<CSKavellTypeRef> values(keys.size());
    CSKavellDictionaryGetKeysAndValues(attributes, keys.data(), values.data());
    std::string lines;
    for (size_t index = 0; index < keys.size(); ++index)
        lines += "  " + assignmentText(toStringView(static_cast<CSKavellStringRef>(keys[index])), values[index]) + "\n";
    return lines.empty() ? "  (none)\n" : lines;
}

void printAccount(const OpenedAccount &account, const std::string &passwordState)
{
    CSKavellAccountRef record = account.record.get();
    std::string text =
        alignedTable({{bold("Account"), account.address.text()},
                      {bold("Provider"), escaped(account.address.providerType)},
                      {bold("UUID"), escaped(toStringView(adopt(_CSKavellAccountCopyUUIDString(record)).get()))},
                      {bold("Password"), passwordState},
                      {bold("Data file"), escaped(dataFileOf(account.address))}});
    text += "\n" + bold("Attributes") + "\n" + attributeLines(ownAttributes(record).get());
    for (const std::string &identifier : serviceIdentifiers(account)) {
        const Ref<CSKavellDictionaryRef> attributes =
            adopt(_CSKavellAccountCopyServiceAttributes(record, makeString(identifier).get()));
        text += "\n" + bold(escaped(shortService(identifier))) + "\n" + attributeLines(attributes.get());
    }
    print(text);
}

}  // namespace

ExitCode runShow(const Words &words)
{
    CommandLine line(help);
    line.parse(words);
    const Address address = line.takeAccount();
    line.expectNoMore();
    const OpenedAccount account = openExisting(address);
    const std::string state = CSKavellCofferelStatusGetName(_CSKavellAccountGetPasswordStatus(account.record.get()));
    if (line.json) {
        Json json = accountJson(account);
        json["passwordState"] = state;
        print(textOf(json));
    } else {
        printAccount(account, state);
    }
    return ExitCode::Done;
}

}  // namespace kavell::tools
