// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts remove: deletes an account and then its password. The password goes last, so that an account that
// could not be removed still has it.

#include <filesystem>
#include <unistd.h>

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/names.h"
#include "tools/store_wait.h"
#include "tools/terminal.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "remove", "PROVIDER LOGIN",
    "Remove an account with all its attributes and its password. Asks first on a terminal; elsewhere --yes is needed. "
    "An account whose data file is damaged can be removed too.",
    "  kavell-accounts remove google anna@gmail.com\n"
    "  kavell-accounts remove google anna@gmail.com --yes"};

void requireAgreement(const Address &address)
{
    if (!isatty(STDIN_FILENO))
        refuse("removing " + address.text() + " cannot be undone; say --yes to do it without being asked");
    if (!confirm("Remove " + address.text() + " with all its attributes and its password?"))
        throw Failure(ExitCode::Failed, "nothing was removed");
}

void removeDataFile(const OpenedAccount &account)
{
    const StoreWait waiting(account.address.text(), dataFileOf(account.address));
    _CSKavellAccountRemove(account.record.get());
    _CSKavellAccountCommitChanges(account.record.get());
}

/// Deletes the item that the account referred to; none is no failure.
void removePassword(const Address &address, CSKavellCofferelItemRef item, CSKavellCofferelStatus state)
{
    if (item)
        state = CSKavellCofferelItemDelete(item);
    if (state == kCSKavellCofferelStatusStored || state == kCSKavellCofferelStatusAbsent)
        return;
    throw Failure(ExitCode::CredentialStore,
                  address.text() + " was removed, but not its password: the credential store is " +
                      CSKavellCofferelStatusGetName(state) + "; try 'kavell-accounts password remove " +
                      address.text() + "' later");
}

/// The item of an account whose data file does not tell the reference: found by the account's names.
Ref<CSKavellCofferelItemRef> itemByNames(const Address &address)
{
    CSKavellCofferelItemRef item = nullptr;
    const CSKavellCofferelStatus status =
        CSKavellCofferelStoreFindItem(makeString(address.providerType).get(), makeString(address.login).get(), &item);
    if (status != kCSKavellCofferelStatusStored && status != kCSKavellCofferelStatusAbsent)
        complain("a password of " + address.text() + " could not be looked for: the credential store is " +
                 CSKavellCofferelStatusGetName(status));
    return adopt(item);
}

}  // namespace

ExitCode runRemove(const Words &words)
{
    CommandLine line(help);
    bool yes = false;
    bool keepPassword = false;
    line.addFlag("-y,--yes", yes, "Do not ask");
    line.addFlag("--keep-password", keepPassword, "Leave the password in the credential store");
    line.parse(words);
    const Address address = line.takeAccount();
    line.expectNoMore();
    if (!isOnDisk(address))
        (void)openExisting(address);  // fails with the sentence for a missing account
    if (std::filesystem::is_directory(dataFileOf(address)))
        throw Failure(ExitCode::Failed, escaped(dataFileOf(address)) + " is a directory and no account; move it away");
    if (!yes)
        requireAgreement(address);
    const OpenedAccount account = openAccount(address);
    Ref<CSKavellCofferelItemRef> item;
    CSKavellCofferelStatus state = kCSKavellCofferelStatusAbsent;
    const bool refersToPassword =
        adopt(_CSKavellAccountCopyProviderAttribute(account.record.get(), makeString(passwordReferenceKey).get()))
            .get() != nullptr;
    if (refersToPassword && !keepPassword) {
        item = adopt(_CSKavellAccountCopyCofferelItem(account.record.get()));
        if (!item)
            state = _CSKavellAccountGetPasswordStatus(account.record.get());
    } else if (!account.readable && !keepPassword) {
        item = itemByNames(address);
    }
    removeDataFile(account);
    if (isOnDisk(address))
        throw Failure(ExitCode::Failed, address.text() + " could not be removed; check the permissions of " +
                                            escaped(providerDirectory(address.providerType)));
    removePassword(address, item.get(), state);
    line.report("Removed " + address.text() + ".", [&] { return outcomeText(address, "removed"); });
    return ExitCode::Done;
}

}  // namespace kavell::tools
