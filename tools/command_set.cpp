// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts add, set and unset: what changes attributes. Everything given is understood before the account is
// opened, so that a mistake in the last word leaves nothing half done.

#include "tools/account_json.h"
#include "tools/assignment.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp addHelp{
    "add", "PROVIDER LOGIN [KEY=VALUE...] [--service SERVICE KEY=VALUE...]",
    "Add an account, with attributes of its own and, behind --service, of its services. PROVIDER is a short word such "
    "as google, mail or exchange, or a full name. Store its password with 'password set'.",
    "  kavell-accounts add google anna@gmail.com fullname='Anna Example'\n"
    "  kavell-accounts add mail anna@example.org --service IMAPMail server=imap.example.org port:int=993"};

constexpr CommandHelp setHelp{
    "set", "PROVIDER LOGIN KEY=VALUE... [--service SERVICE KEY=VALUE...]",
    "Set attributes. A value is text, or what the type behind the key says: KEY:int=993, KEY:real=1.5, "
    "KEY:bool=true, KEY:date=2026-01-31T10:00:00Z, KEY:data=BASE64 or KEY:data=@FILE, KEY:json=JSON for arrays and "
    "dictionaries. Short keys are server, port, path, smtpServer, smtpPort, uid, fullname, nickname and picture; any "
    "other key is taken as it stands. Other programs' changes of other keys are kept.",
    "  kavell-accounts set google anna@gmail.com fullname='Anna B. Example'\n"
    "  kavell-accounts set google anna@gmail.com --service CalDAV server=cal.example.org port:int=8443\n"
    "  kavell-accounts set google anna@gmail.com picture:data=@anna.jpg inactive:bool=false\n"
    "  kavell-accounts set mail anna@example.org 'folders:json=[\"Inbox\", \"Sent\"]'"};

constexpr CommandHelp unsetHelp{
    "unset", "PROVIDER LOGIN KEY... [--service SERVICE KEY...]",
    "Remove attributes by their keys, or with --all every one of the account, or of the service behind --service. A "
    "service without attributes is gone. The password is not touched.",
    "  kavell-accounts unset google anna@gmail.com nickname\n"
    "  kavell-accounts unset google anna@gmail.com --service CalDAV port path\n"
    "  kavell-accounts unset google anna@gmail.com --all --service CalDAV"};

/// One attribute to set, or, with a none value, to remove.
struct Change {
    std::string service;  ///< empty for the account itself
    Assignment assignment;
};

std::vector<Change> assignmentsOf(CommandLine &line)
{
    line.refuseTrailingService();
    std::vector<Change> changes;
    for (size_t index = 0; index < line.positionals().size(); ++index)
        changes.push_back({line.servicesOfPositionals()[index], parseAssignment(line.positionals()[index])});
    return changes;
}

void applyChanges(CSKavellAccountRef account, const std::vector<Change> &changes)
{
    for (const Change &change : changes) {
        const Ref<CSKavellStringRef> service = change.service.empty() ? nullptr : makeString(change.service);
        _CSKavellAccountSetServiceAttribute(account, service.get(), makeString(change.assignment.key).get(),
                                            change.assignment.value.get());
    }
}

/// The number of changes, for the sentence that reports them.
std::string counted(size_t count)
{
    return std::to_string(count) + (count == 1 ? " attribute" : " attributes");
}

/// The keys of the account itself (for a none service, but for the password's reference) or of a service.
std::vector<Change> removalsOfAll(const OpenedAccount &account, const std::string &service)
{
    const Ref<CSKavellDictionaryRef> attributes =
        service.empty() ? ownAttributes(account.record.get())
                        : adopt(_CSKavellAccountCopyServiceAttributes(account.record.get(), makeString(service).get()));
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(attributes.get()));
    CSKavellDictionaryGetKeysAndValues(attributes.get(), keys.data(), nullptr);
    std::vector<Change> removals;
    for (CSKavellTypeRef key : keys)
        removals.push_back({service, {toStdString(static_cast<CSKavellStringRef>(key)), nullptr}});
    return removals;
}

bool hasAttribute(const OpenedAccount &account, const Change &change)
{
    const Ref<CSKavellStringRef> service = change.service.empty() ? nullptr : makeString(change.service);
    return static_cast<bool>(adopt(_CSKavellAccountCopyServiceAttribute(account.record.get(), service.get(),
                                                                        makeString(change.assignment.key).get())));
}

void refuseMissing(const OpenedAccount &account, const std::vector<Change> &removals)
{
    for (const Change &removal : removals)
        if (!hasAttribute(account, removal))
            refuse(account.address.text() + " has no attribute " + inQuotes(shortAttributeKey(removal.assignment.key)) +
                   (removal.service.empty() ? "" : " in " + escaped(shortService(removal.service))) +
                   "; 'kavell-accounts show " + account.address.text() + "' lists what it has");
}

}  // namespace

ExitCode runAdd(const Words &words)
{
    CommandLine line(addHelp);
    line.addServices();
    line.parse(words);
    const Address address = line.takeAccount();
    const std::vector<Change> changes = assignmentsOf(line);
    if (isOnDisk(address))
        refuse("the account " + address.text() + " exists already; change it with 'kavell-accounts set'");
    const OpenedAccount account = openAccount(address);
    applyChanges(account.record.get(), changes);
    save(account, "the new account " + address.text());
    line.report("Added " + address.text() + ".", [&] { return outcomeText(address, "added"); });
    return ExitCode::Done;
}

ExitCode runSet(const Words &words)
{
    CommandLine line(setHelp);
    line.addServices();
    line.parse(words);
    const Address address = line.takeAccount();
    const std::vector<Change> changes = assignmentsOf(line);
    if (changes.empty())
        refuse("there is nothing to set; write KEY=VALUE behind the account, such as server=imap.example.org");
    const OpenedAccount account = openExisting(address);
    applyChanges(account.record.get(), changes);
    save(account, "the change of " + address.text());
    line.report("Set " + counted(changes.size()) + " of " + address.text() + ".",
                [&] { return outcomeText(address, "changed"); });
    return ExitCode::Done;
}

ExitCode runUnset(const Words &words)
{
    CommandLine line(unsetHelp);
    bool all = false;
    line.addFlag("--all", all, "Remove every attribute");
    line.addServices();
    line.parse(words);
    if (!all)
        line.refuseTrailingService();
    const Address address = line.takeAccount();
    std::vector<Change> removals;
    for (size_t index = 0; index < line.positionals().size(); ++index)
        removals.push_back({line.servicesOfPositionals()[index], {parseKey(line.positionals()[index]), nullptr}});
    if (all != removals.empty())
        refuse(all ? "--all removes every attribute, so name no key with it"
                   : "there is nothing to remove; name keys behind the account, or say --all");
    const OpenedAccount account = openExisting(address);
    if (all)
        removals = removalsOfAll(account, line.lastService());
    refuseMissing(account, removals);
    applyChanges(account.record.get(), removals);
    save(account, "the change of " + address.text());
    line.report("Removed " + counted(removals.size()) + " of " + address.text() + ".",
                [&] { return outcomeText(address, "changed"); });
    return ExitCode::Done;
}

}  // namespace kavell::tools
