// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/load/load_judge.h"

#include <algorithm>

namespace kavell::test {

void LoadJudge::begin(size_t account, uint64_t inode)
{
    m_accounts[account].names.begin(inode);
    change(m_accounts[account], inode, {});
}

std::string LoadJudge::follow(const LoadEntry &entry)
{
    if (entry.event == LoadEvent::Unused)  // its process was killed before it could write it
        return {};
    Account &account = m_accounts[entry.account];
    account.number = entry.account;
    const std::string complaint = judge(entry, m_processes[entry.process], account);
    if (account.inode != 0 && !account.names.mayBe(account.inode))
        removeFile(account);
    return complaint;
}

void LoadJudge::died(int32_t process)
{
    m_dead.insert(process);
    for (auto &[number, account] : m_accounts)
        account.names.died(process);
}

std::string LoadJudge::judge(const LoadEntry &entry, Process &process, Account &account)
{
    // Whatever comes next of a process whose creation or removal succeeded is its word for that.
    if (entry.event != LoadEvent::Created && entry.event != LoadEvent::Removed) {
        account.creating.erase(entry.process);
        if (!account.names.failed(entry.process))
            return "what failed was done all the same";
    }
    switch (entry.event) {
    case LoadEvent::Unused:
        return {};
    case LoadEvent::Forgot:
        process.known.clear();
        process.knownBefore.clear();
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
        return creating(entry, account);
    case LoadEvent::Created:
        return created(entry, process, account);
    case LoadEvent::Removing:
        return removing(entry, account);
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
    // A save is told whatever came of it, a removal only when there was something to remove.
    account.told += wasSave || process.isCarriedOut;
    if (!wasSave)
        learn(process, entry.account, {});  // the worker lets go of the record
    if (wasSave && entry.flag != process.isCarriedOut)
        return entry.flag ? "a save came to its end that is in no file" : "a save is in the file and counts as pending";
    return {};
}

std::string LoadJudge::seen(const LoadEntry &entry, Process &process)
{
    ++m_tally.reads;
    if (!entry.flag)
        return "an account could not be loaded";
    const std::vector<Knowledge> possible = possibleKnowledge(process, entry.account);
    const bool isPossible = std::any_of(possible.begin(), possible.end(),
                                        [&](const Knowledge &each) { return each.values == entry.values; });
    return isPossible ? "" : "a record says what its file did not say";
}

void LoadJudge::status(Process &process, const LoadEntry &entry, Account &account)
{
    process.statusVersion = account.version;
    process.statusAt = account.names.look();
    if (process.intention != LoadEvent::Unused && process.account == entry.account && process.queries++ == 0) {
        process.askedVersion = account.version;
        process.askedAt = process.statusAt;
    }
}

std::string LoadJudge::missing(const LoadEntry &entry, Process &process, Account &account)
{
    // What the record holds is settled by a commit's first query; later ones ask whether directories are needed.
    const bool isInCommit = process.intention != LoadEvent::Unused && process.account == entry.account;
    if (!isInCommit || process.queries == 1)
        learn(process, entry.account, {process.statusVersion, {}});
    return account.names.missed(process.statusAt) ? "" : "a file that is there was not found";
}

/// What the holder's save would leave, one of these; none when there is no holder, or it has no save under way.
std::vector<LoadValues> LoadJudge::unfinishedSave(const Account &account)
{
    std::vector<LoadValues> after;
    if (account.holder == 0)
        return after;
    Process &holder = m_processes[account.holder];
    if (holder.intention != LoadEvent::WillSave || holder.account != account.number || holder.isCarriedOut)
        return after;
    for (const Knowledge &base : possibleKnowledge(holder, account.number)) {
        after.push_back(base.values);
        after.back()[holder.worker] = holder.number;
    }
    return after;
}

void LoadJudge::noteKilledHolder(Account &account)
{
    const std::vector<LoadValues> after = unfinishedSave(account);
    account.afterKill.insert(account.afterKill.end(), after.begin(), after.end());
    ++m_tally.killedInHold;
    account.holder = 0;
    account.isUnsettled = true;
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

/// The file has been seen of a process that was killed between giving it its name and saying so.
std::string LoadJudge::finishSilentCreation(const LoadEntry &entry, Account &account)
{
    const auto creation = std::find_if(account.creating.begin(), account.creating.end(), [&](const auto &each) {
        return m_silent.contains(each.first) && each.second.inode == entry.inode;
    });
    if (creation == account.creating.end())
        return {};
    const auto [process, file] = *creation;
    account.creating.erase(creation);
    if (!m_dead.contains(process) && !account.names.succeeded(process))
        return "a file was made where there is one";
    ++m_tally.creations;
    (void)note(account, file.inode, file.values);
    return {};
}

std::string LoadJudge::take(const LoadEntry &entry, Account &account)
{
    if (entry.inode == account.inode && account.holder != 0) {
        if (!m_silent.contains(account.holder))
            return "two processes hold a file at once";
        account.names.died(account.holder);  // while it lived, nobody else could take the flock
        noteKilledHolder(account);
    }
    account.names.taken(entry.process, entry.inode);
    if (entry.inode != account.inode) {
        if (std::string complaint = finishSilentCreation(entry, account); !complaint.empty())
            return complaint;
    }
    if (entry.inode != account.inode)
        return takeDeleted(entry, account);
    account.holder = entry.process;
    if (entry.flag) {
        ++m_tally.recordsMet;
        return account.isUnsettled || !account.strays.empty() ? "" : "there is a redo record, and nobody was killed";
    }
    return settle(entry, account) ? "" : "a file changed while nobody held it";
}

std::string LoadJudge::takeDeleted(const LoadEntry &entry, Account &account)
{
    const auto deleted = account.deleted.find(entry.inode);
    if (deleted == account.deleted.end())
        return "a file that nobody made was opened";
    auto &[knowledge, afterKill] = deleted->second;
    if (entry.values == knowledge.values)
        return {};
    // Nobody finishes a save that was killed in it, so that it may be torn for those who waited for it.
    const bool mayChange = !afterKill.empty() || account.names.mayBe(entry.inode);
    if (std::find(afterKill.begin(), afterKill.end(), entry.values) != afterKill.end())
        afterKill.clear();
    knowledge.values = entry.values;
    return mayChange ? "" : "a deleted file changed";
}

/// Of two files that were told of late the other one was taken for the later. The file that is there has not changed since.
void LoadJudge::noteMistake(Account &account, uint64_t inode)
{
    const auto deleted = account.deleted.find(inode);
    if (deleted == account.deleted.end() || !account.names.mayBe(inode))
        return;
    account.versionBeforeMistake = deleted->second.knowledge.version;
    account.versionAfterMistake = account.version;
}

std::string LoadJudge::judgeSave(const LoadEntry &entry, Process &process, Account &account)
{
    const std::vector<Knowledge> possible = possibleKnowledge(process, entry.account);
    LoadValues expected{};
    const auto base = std::find_if(possible.begin(), possible.end(), [&](const Knowledge &each) {
        expected = each.values;
        expected[entry.worker] = process.number;
        return entry.values == expected;
    });
    if (base == possible.end())
        return "a change was lost or made up";
    uint64_t asked = process.askedVersion;
    if (account.versionBeforeMistake < asked && asked <= account.versionAfterMistake)
        asked = account.versionBeforeMistake;
    // What was deleted before it could be read is not known either.
    const bool isLatest = base->version >= asked || account.names.mayHaveBeenMissing(process.askedAt);
    if (process.queries == 0 || !isLatest)
        return "a save was made without reading what another had saved";
    if (entry.inode == account.inode) {
        for (size_t worker = 0; worker < expected.size(); ++worker)
            m_tally.overwritten += worker != entry.worker && expected[worker] < account.values[worker];
    }
    ++m_tally.saves;
    process.isCarriedOut = true;
    learn(process, entry.account, note(account, entry.inode, entry.values));
    return {};
}

std::string LoadJudge::release(const LoadEntry &entry, Process &process, Account &account)
{
    const bool isOwnSave = process.intention == LoadEvent::WillSave && process.account == entry.account &&
                           entry.values[entry.worker] == process.number;
    account.strays.erase(entry.process);
    if (!account.names.released(entry.process, isOwnSave))
        return "a save went into a file that had been deleted";
    if (entry.inode != account.inode) {
        if (!isOwnSave)
            return releaseDeleted(entry, process, account);
        noteMistake(account, entry.inode);
        return judgeSave(entry, process, account);
    }
    if (account.holder != entry.process)
        return "a file was released by a process that did not hold it";
    account.holder = 0;
    if (isOwnSave)
        return judgeSave(entry, process, account);
    if (entry.flag)  // the record is settled in a hold of its own
        return account.isUnsettled || !account.strays.empty() ? "" : "a redo record was left by a process that lives";
    if (!settle(entry, account))
        return "a hold changed a file without a save";
    std::erase_if(account.strays, [&](int32_t stray) { return m_dead.contains(stray); });
    // Who wants to write and finds that the file has no name looks anew, too.
    const bool mayLookAnew = !entry.isForReading && account.names.possible().size() > 1;
    learn(process, entry.account, {account.version, account.values}, mayLookAnew);
    return {};
}

/// The moment before is as good for reading. Who wants to write lets go of the file and looks anew.
std::string LoadJudge::releaseDeleted(const LoadEntry &entry, Process &process, Account &account)
{
    if (!entry.isForReading)
        return {};
    const auto deleted = account.deleted.find(entry.inode);
    if (deleted == account.deleted.end())
        return "a file that nobody made was released";
    // A redo record is of the file that came after it. Who comes upon it reads that one, which may be gone by then, too.
    learn(process, entry.account, deleted->second.knowledge, entry.flag);
    return {};
}

/// `isPerhaps`: or else it knows what it knew before.
void LoadJudge::learn(Process &process, uint32_t account, const Knowledge &knowledge, bool isPerhaps)
{
    if (isPerhaps)
        process.knownBefore[account].push_back(process.known[account]);
    else
        process.knownBefore.erase(account);
    process.known[account] = knowledge;
}

std::vector<LoadJudge::Knowledge> LoadJudge::possibleKnowledge(Process &process, uint32_t account)
{
    std::vector<Knowledge> possible{process.known[account]};
    if (const auto before = process.knownBefore.find(account); before != process.knownBefore.end())
        possible.insert(possible.end(), before->second.begin(), before->second.end());
    return possible;
}

std::string LoadJudge::creating(const LoadEntry &entry, Account &account)
{
    // Its number was free, so that a file which had it is gone.
    std::erase_if(account.creating, [&](const auto &each) { return each.second.inode == entry.inode; });
    account.deleted.erase(entry.inode);
    account.creating[entry.process] = entry;
    return account.names.creating(entry.process, entry.inode) ? "" : "a new file is the one that is there";
}

std::string LoadJudge::created(const LoadEntry &entry, Process &process, Account &account)
{
    account.creating.erase(entry.process);
    if (!account.names.succeeded(entry.process))
        return "a file was made where there is one";
    ++m_tally.creations;
    return judgeSave(entry, process, account);
}

std::string LoadJudge::removing(const LoadEntry &entry, Account &account)
{
    std::string complaint = entry.inode == account.inode ? "" : finishSilentCreation(entry, account);
    account.names.removing(entry.process);
    return complaint;
}

std::string LoadJudge::removed(const LoadEntry &entry, Process &process, Account &account)
{
    if (!account.names.succeeded(entry.process))
        return "a file was removed where there is none";
    if (process.intention != LoadEvent::WillRemove)
        return "a file was removed by a process that did not want to";
    process.isCarriedOut = true;
    ++m_tally.removals;
    return {};
}

uint32_t LoadJudge::mostNotifications(size_t account)
{
    return m_accounts[account].told + static_cast<uint32_t>(m_accounts[account].perhapsTold.size());
}

std::vector<LoadJudge::Outcome> LoadJudge::outcomes(size_t number)
{
    Account &account = m_accounts[number];
    if (account.holder != 0)
        noteKilledHolder(account);
    std::vector<Outcome> all;
    for (const uint64_t inode : account.names.possible()) {
        if (inode == 0 || inode == account.inode)
            all.push_back({inode, inode == 0 ? LoadValues{} : account.values});
        else if (const auto deleted = account.deleted.find(inode); deleted != account.deleted.end())
            all.push_back({inode, deleted->second.knowledge.values});
    }
    for (const LoadValues &values : account.afterKill)
        all.push_back({account.inode, values});
    for (const auto &[process, creation] : account.creating) {
        if (account.names.mayBe(creation.inode))
            all.push_back({creation.inode, creation.values});
    }
    return all;
}

/// A file has been given its contents. Where it may have the name it is the account's, else it is gone before it was told
/// of. What is known of it then.
LoadJudge::Knowledge LoadJudge::note(Account &account, uint64_t inode, const LoadValues &values)
{
    if (!account.names.mayBe(inode)) {
        DeletedFile &deleted = account.deleted[inode];
        deleted.knowledge.values = values;
        deleted.afterKill.clear();
        return deleted.knowledge;
    }
    if (account.inode != 0 && account.inode != inode)
        removeFile(account);
    change(account, inode, values);
    return {account.version, account.values};
}

void LoadJudge::change(Account &account, uint64_t inode, const LoadValues &values)
{
    ++account.version;
    account.inode = inode;
    account.values = values;
    account.isUnsettled = false;
    account.afterKill.clear();
}

void LoadJudge::removeFile(Account &account)
{
    DeletedFile &deleted = account.deleted[account.inode];
    deleted = {{account.version, account.values}, account.afterKill};
    // A remover that found no file has no flock, and may come upon one that is being saved.
    const std::vector<LoadValues> after = unfinishedSave(account);
    deleted.afterKill.insert(deleted.afterKill.end(), after.begin(), after.end());
    if (!after.empty())
        account.strays.insert(account.holder);
    change(account, 0, {});
    account.holder = 0;
}

}  // namespace kavell::test
