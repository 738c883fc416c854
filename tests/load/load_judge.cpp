// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/load/load_judge.h"

#include <algorithm>

namespace kavell::test {

void LoadJudge::begin(size_t account, uint64_t inode)
{
    change(m_accounts[account], inode, {});
}

std::string LoadJudge::follow(const LoadEntry &entry)
{
    Process &process = m_processes[entry.process];
    Account &account = m_accounts[entry.account];
    switch (entry.event) {
    case LoadEvent::Unused:  // its process was killed before it could write it
        return {};
    case LoadEvent::Forgot:
        process.known.clear();
        return {};
    case LoadEvent::WillSave:
    case LoadEvent::WillRemove:
        intend(entry, process, account);
        return {};
    case LoadEvent::Done:
        return done(process, entry, account);
    case LoadEvent::Seen:
        return seen(entry, process);
    case LoadEvent::Status:
        status(process, entry, account);
        return {};
    case LoadEvent::Missing:
        return missing(entry, process, account);
    case LoadEvent::Take:
        return take(entry, account);
    case LoadEvent::Release:
        return release(entry, process, account);
    case LoadEvent::Creating:
        account.creating[entry.process] = entry;
        return {};
    case LoadEvent::Created:
        return created(entry, process, account);
    case LoadEvent::Removing:
        removing(entry, account);
        return {};
    case LoadEvent::Removed:
        return removed(entry, process, account);
    }
    return "an event that is none";
}

void LoadJudge::intend(const LoadEntry &entry, Process &process, Account &account)
{
    process.intention = entry.event;
    process.worker = entry.worker;
    process.account = entry.account;
    process.number = entry.number;
    process.queries = 0;
    process.isCarriedOut = false;
    account.perhapsTold.insert(entry.process);
}

std::string LoadJudge::done(Process &process, const LoadEntry &entry, Account &account)
{
    const bool wasSave = process.intention == LoadEvent::WillSave;
    process.intention = LoadEvent::Unused;
    account.perhapsTold.erase(entry.process);
    account.removing.erase(entry.process);
    // A save is told whatever came of it, a removal only when there was something to remove.
    account.told += wasSave || process.isCarriedOut;
    if (!wasSave)
        process.known.erase(entry.account);  // the worker lets go of the record
    if (wasSave && entry.flag != process.isCarriedOut)
        return entry.flag ? "a save came to its end that is in no file" : "a save is in the file and counts as pending";
    return {};
}

std::string LoadJudge::seen(const LoadEntry &entry, Process &process)
{
    ++m_tally.reads;
    if (!entry.flag)
        return "an account could not be loaded";
    return entry.values == process.known[entry.account].values ? "" : "a record says what its file did not say";
}

void LoadJudge::status(Process &process, const LoadEntry &entry, const Account &account)
{
    process.statusVersion = account.version;
    if (process.intention != LoadEvent::Unused && process.account == entry.account && process.queries++ == 0)
        process.askedVersion = account.version;
}

std::string LoadJudge::missing(const LoadEntry &entry, Process &process, const Account &account)
{
    // What the record holds is settled by a commit's first query; later ones ask whether directories are needed.
    const bool isInCommit = process.intention != LoadEvent::Unused && process.account == entry.account;
    if (!isInCommit || process.queries == 1)
        process.known[entry.account] = {process.statusVersion, {}};
    const bool wasThereAllTheTime =
        account.inode != 0 && account.versionOfLatestFile <= process.statusVersion && account.removing.empty();
    return wasThereAllTheTime ? "a file that is there was not found" : "";
}

void LoadJudge::noteKilledHolder(Account &account, uint32_t number)
{
    const Process &dead = m_processes[account.holder];
    ++m_tally.killedInHold;
    account.holder = 0;
    account.isUnsettled = true;
    if (dead.intention != LoadEvent::WillSave || dead.account != number || dead.isCarriedOut)
        return;
    const auto known = dead.known.find(number);
    LoadValues after = known == dead.known.end() ? LoadValues{} : known->second.values;
    after[dead.worker] = dead.number;
    account.afterKill.push_back(after);
}

/// What killed holders left has come to rest. Whether it is as before or as after a save of theirs.
bool LoadJudge::settle(const LoadEntry &entry, Account &account)
{
    if (entry.values == account.values) {
        m_tally.settledBefore += account.isUnsettled;
    } else {
        if (std::find(account.afterKill.begin(), account.afterKill.end(), entry.values) == account.afterKill.end())
            return false;
        ++m_tally.settledAfter;
        change(account, entry.inode, entry.values);
    }
    account.isUnsettled = false;
    account.afterKill.clear();
    return true;
}

void LoadJudge::removing(const LoadEntry &entry, Account &account)
{
    if (entry.inode != account.inode)
        finishKilledCreation(entry, account);
    account.removing.insert(entry.process);
}

/// A process was killed between giving a new file its name and saying so.
void LoadJudge::finishKilledCreation(const LoadEntry &entry, Account &account)
{
    const auto creation = std::find_if(account.creating.begin(), account.creating.end(), [&](const auto &each) {
        return m_killed.contains(each.first) && each.second.inode == entry.inode;
    });
    if (creation == account.creating.end())
        return;
    if (account.inode != 0)  // its remover was killed in the same way, or has not come to say so
        removeFile(account);
    change(account, entry.inode, creation->second.values);
    account.creating.erase(creation);
    ++m_tally.creations;
}

std::string LoadJudge::take(const LoadEntry &entry, Account &account)
{
    if (entry.inode != account.inode)
        finishKilledCreation(entry, account);
    if (entry.inode != account.inode) {
        const auto deleted = account.deleted.find(entry.inode);
        if (deleted == account.deleted.end())
            return "a file that nobody made was opened";
        return deleted->second.values == entry.values ? "" : "a deleted file changed";
    }
    if (account.holder != 0) {
        if (!m_killed.contains(account.holder))
            return "two processes hold a file at once";
        noteKilledHolder(account, entry.account);
    }
    account.holder = entry.process;
    if (entry.flag) {
        ++m_tally.recordsMet;
        return account.isUnsettled ? "" : "there is a redo record, and nobody was killed";
    }
    return settle(entry, account) ? "" : "a file changed while nobody held it";
}

std::string LoadJudge::judgeSave(const LoadEntry &entry, Process &process, Account &account)
{
    const Knowledge &base = process.known[entry.account];
    LoadValues expected = base.values;
    expected[entry.worker] = process.number;
    if (entry.values != expected)
        return "a change was lost or made up";
    // What was deleted before it could be read is not known either.
    const bool isLatest = base.version >= process.askedVersion || account.versionOfLatestRemoval > process.askedVersion;
    if (process.queries == 0 || !isLatest)
        return "a save was made without reading what another had saved";
    for (size_t worker = 0; worker < expected.size(); ++worker)
        m_tally.overwritten += worker != entry.worker && expected[worker] < account.values[worker];
    ++m_tally.saves;
    process.isCarriedOut = true;
    change(account, entry.inode, entry.values);
    process.known[entry.account] = {account.version, account.values};
    return {};
}

std::string LoadJudge::release(const LoadEntry &entry, Process &process, Account &account)
{
    if (entry.inode != account.inode) {
        // The moment before is as good for reading. Who wants to write lets go of it and looks anew.
        if (!entry.isForReading)
            return {};
        const auto deleted = account.deleted.find(entry.inode);
        if (deleted == account.deleted.end())
            return "a file that nobody made was released";
        process.known[entry.account] = deleted->second;
        return {};
    }
    if (account.holder != entry.process)
        return "a file was released by a process that did not hold it";
    account.holder = 0;
    const bool isOwnSave = process.intention == LoadEvent::WillSave && process.account == entry.account &&
                           entry.values[entry.worker] == process.number;
    if (isOwnSave) {
        // A killed remover's file would have no name by now, and nobody writes to such a one.
        std::erase_if(account.removing, [&](int32_t remover) { return m_killed.contains(remover); });
        return judgeSave(entry, process, account);
    }
    if (entry.flag)  // the record is settled in a hold of its own
        return account.isUnsettled ? "" : "a redo record was left by a process that lives";
    if (!settle(entry, account))
        return "a hold changed a file without a save";
    process.known[entry.account] = {account.version, account.values};
    return {};
}

std::string LoadJudge::created(const LoadEntry &entry, Process &process, Account &account)
{
    account.creating.erase(entry.process);
    std::erase_if(account.creating, [&](const auto &each) { return m_killed.contains(each.first); });
    // Whoever removed the last file has not come to say so.
    if (account.inode != 0 && !account.removing.empty())
        removeFile(account);
    if (account.inode != 0)
        return "a file was made where there is one";
    ++m_tally.creations;
    const std::string complaint = judgeSave(entry, process, account);
    if (account.removedEarly.erase(entry.inode) != 0)
        removeFile(account);
    return complaint;
}

std::string LoadJudge::removed(const LoadEntry &entry, Process &process, Account &account)
{
    account.removing.erase(entry.process);
    if (process.intention != LoadEvent::WillRemove)
        return "a file was removed by a process that did not want to";
    process.isCarriedOut = true;
    ++m_tally.removals;
    const uint64_t inode = entry.inode != 0 ? entry.inode : latestFile(account);
    if (account.inode != 0 && inode == account.inode)
        removeFile(account);
    else if (isBeingMade(inode, account))
        account.removedEarly.insert(inode);
    return {};
}

bool LoadJudge::isBeingMade(uint64_t inode, const Account &account)
{
    return std::any_of(account.creating.begin(), account.creating.end(),
                       [&](const auto &each) { return each.second.inode == inode; });
}

/// The file that a remover unlinked who had found none just before.
uint64_t LoadJudge::latestFile(const Account &account)
{
    if (account.inode != 0 || account.creating.empty())
        return account.inode;
    return account.creating.begin()->second.inode;
}

uint32_t LoadJudge::mostNotifications(size_t account)
{
    return m_accounts[account].told + static_cast<uint32_t>(m_accounts[account].perhapsTold.size());
}

std::vector<LoadJudge::Outcome> LoadJudge::outcomes(size_t number)
{
    Account &account = m_accounts[number];
    if (account.holder != 0)
        noteKilledHolder(account, static_cast<uint32_t>(number));
    std::vector<Outcome> all{{account.inode, account.values}};
    for (const LoadValues &values : account.afterKill)
        all.push_back({account.inode, values});
    for (const auto &[process, creation] : account.creating)
        all.push_back({creation.inode, creation.values});
    if (!account.removing.empty())
        all.emplace_back();
    return all;
}

void LoadJudge::change(Account &account, uint64_t inode, const LoadValues &values)
{
    ++account.version;
    if (account.inode != inode)
        account.versionOfLatestFile = account.version;
    account.inode = inode;
    account.values = values;
    account.isUnsettled = false;
    account.afterKill.clear();
}

void LoadJudge::removeFile(Account &account)
{
    account.deleted[account.inode] = {account.version, account.values};
    change(account, 0, {});
    account.versionOfLatestRemoval = account.version;
    account.holder = 0;
}

}  // namespace kavell::test
