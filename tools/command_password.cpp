// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts password set, get and remove. A password is never a word of the command line, where every user of the
// machine could read it: it comes from standard input or from a prompt that does not echo.

#include <array>
#include <strings.h>
#include <unistd.h>

#include <kavellaccounts/CSKavellCofferel.h>

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/files.h"
#include "tools/terminal.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "password", "set|get|remove PROVIDER LOGIN",
    "Store, read or remove an account's password in the credential store. 'set' asks for it twice without showing it, "
    "or reads it from standard input (a line feed at the end is not part of it); it is never given on the command "
    "line. 'remove' also removes the password of an account that is gone.",
    "  kavell-accounts password set google anna@gmail.com\n"
    "  pass show gmail | kavell-accounts password set google anna@gmail.com\n"
    "  kavell-accounts password get google anna@gmail.com\n"
    "  kavell-accounts password remove google anna@gmail.com"};

/// The end of a sentence: what to do about each state of the credential store.
const char *wayOutOf(CSKavellCofferelStatus status)
{
    switch (status) {
    case kCSKavellCofferelStatusLocked:
        return std::string_view(CSKavellCofferelStoreGetName()) == "vault"
                   ? "; give its passphrase at a terminal, or in a file that KAVELL_VAULT_PASSPHRASE_FILE names"
                   : "; unlock it first";
    case kCSKavellCofferelStatusRefused:
        return "; unlock it, or check the passphrase, and try again";
    case kCSKavellCofferelStatusUnreachable:
        return "; start a Secret Service, or use the vault with KAVELL_CREDENTIAL_STORE=vault";
    default:
        return "";
    }
}

/// Fails for a state other than `stored`: `what` begins the sentence.
void requireStored(CSKavellCofferelStatus status, const std::string &what)
{
    if (status == kCSKavellCofferelStatusStored)
        return;
    const bool store = status == kCSKavellCofferelStatusLocked || status == kCSKavellCofferelStatusRefused ||
                       status == kCSKavellCofferelStatusUnreachable;
    throw Failure(store ? ExitCode::CredentialStore : ExitCode::Failed,
                  what + ": the credential store is " + CSKavellCofferelStatusGetName(status) + wayOutOf(status));
}

std::string passwordFromInput(const Address &address)
{
    std::string password = isatty(STDIN_FILENO) ? askForNewPassword(address.text()) : readInputFile("-");
    if (password.ends_with('\n'))
        password.pop_back();
    if (password.ends_with('\r'))
        password.pop_back();
    if (password.empty())
        refuse("the password is empty, so nothing was stored; 'kavell-accounts password remove' removes one");
    if (isUTF8(password) && password.find('\0') == password.npos)
        return password;
    wipe(password);
    refuse("the password is not valid UTF-8 text, so nothing was stored");
}

ExitCode setPassword(const CommandLine &line, const Address &address)
{
    if (!isOnDisk(address))
        (void)openExisting(address);
    std::string password = passwordFromInput(address);
    const OpenedAccount account = openExisting(address);
    const CSKavellCofferelStatus ready = CSKavellCofferelStoreUnlock();
    Ref<CSKavellCofferelItemRef> item;
    if (ready == kCSKavellCofferelStatusStored)
        item = adopt(_CSKavellAccountSetPassword(
            account.record.get(), adopt(CSKavellStringCreateSecret(password.data(), password.size())).get()));
    wipe(password);
    requireStored(ready, "the password of " + address.text() + " was not stored");
    if (!item)
        throw Failure(ExitCode::Failed, "the password of " + address.text() + " could not be stored in the " +
                                            CSKavellCofferelStoreGetName());
    save(account, "the reference to the password of " + address.text());
    line.report("Stored the password of " + address.text() + ".", [&] { return outcomeText(address, "stored"); });
    return ExitCode::Done;
}

ExitCode getPassword(const CommandLine &line, const Address &address)
{
    const OpenedAccount account = openExisting(address);
    const std::string what = "the password of " + address.text() + " cannot be read";
    CSKavellCofferelStatus status = _CSKavellAccountGetPasswordStatus(account.record.get());
    if (status == kCSKavellCofferelStatusAbsent)
        throw Failure(ExitCode::Failed, address.text() + " has no password stored; 'kavell-accounts password set " +
                                            address.text() + "' stores one");
    if (status == kCSKavellCofferelStatusLocked)
        status = CSKavellCofferelStoreUnlock();
    requireStored(status, what);
    const Ref<CSKavellStringRef> password = adopt(_CSKavellAccountCopyPassword(account.record.get()));
    if (!password)
        throw Failure(ExitCode::Failed, what + ", or is not text");
    std::string text;
    if (line.json) {
        Json json = addressJson(address);
        json["password"] = std::string(toStringView(password.get()));
        text = textOf(json);
    } else {
        text.reserve(CSKavellStringGetLength(password.get()) + 1);
        text.append(toStringView(password.get())).append("\n");
    }
    print(text);
    wipe(text);
    return ExitCode::Done;
}

/// The item stored for an account that has no data file any more.
void removeLeftOver(const Address &address)
{
    const Ref<CSKavellStringRef> service = makeString(address.providerType);
    const Ref<CSKavellStringRef> name = makeString(address.login);
    CSKavellCofferelItemRef found = nullptr;
    const CSKavellCofferelStatus status = CSKavellCofferelStoreFindItem(service.get(), name.get(), &found);
    const Ref<CSKavellCofferelItemRef> item = adopt(found);
    if (status == kCSKavellCofferelStatusAbsent)
        (void)openExisting(address);  // neither account nor password: fails with the sentence for that
    requireStored(status, "the password of " + address.text() + " cannot be looked for");
    requireStored(CSKavellCofferelItemDelete(item.get()), "the password of " + address.text() + " was not removed");
}

void removeFromAccount(const Address &address)
{
    const OpenedAccount account = openExisting(address);
    const std::string what = "the password of " + address.text() + " was not removed";
    CSKavellCofferelStatus status = _CSKavellAccountGetPasswordStatus(account.record.get());
    if (status == kCSKavellCofferelStatusLocked)
        status = CSKavellCofferelStoreUnlock();
    if (status != kCSKavellCofferelStatusAbsent)
        requireStored(status, what);
    const Ref<CSKavellCofferelItemRef> item = adopt(_CSKavellAccountCopyCofferelItem(account.record.get()));
    _CSKavellAccountRemovePassword(account.record.get());
    save(account, "the removal of the password of " + address.text());
    if (item && _CSKavellAccountGetPasswordStatus(account.record.get()) == kCSKavellCofferelStatusStored)
        throw Failure(ExitCode::Failed, what);
}

ExitCode removePassword(const CommandLine &line, const Address &address)
{
    if (isOnDisk(address))
        removeFromAccount(address);
    else
        removeLeftOver(address);
    line.report("Removed the password of " + address.text() + ".", [&] { return outcomeText(address, "removed"); });
    return ExitCode::Done;
}

}  // namespace

ExitCode runPassword(const Words &words)
{
    CommandLine line(help);
    line.parse(words);
    const std::string action = line.takeWord(
        "say what to do with the password: set, get or remove, such as 'kavell-accounts password set google "
        "anna@gmail.com'");
    constexpr std::array<std::pair<std::string_view, ExitCode (*)(const CommandLine &, const Address &)>, 3> actions{
        {{"set", setPassword}, {"get", getPassword}, {"remove", removePassword}}};
    for (const auto &[name, run] : actions)
        if (name == action) {
            const Address address = line.takeAccount();
            if (action == "set" && !line.positionals().empty())
                refuse("a password is not given on the command line, where other users can read it; leave the last "
                       "word out and type it when asked, or give it on standard input");
            line.expectNoMore();
            return run(line, address);
        }
    refuse("cannot " + inQuotes(action) + " a password; say set, get or remove");
}

}  // namespace kavell::tools
