// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Follows the log of what many processes did (load_log.h), and says where it breaks what the store promises them:
//
// - the holds of a file do not overlap, and the file changes only inside them;
// - a save leaves what the process knew, with its own value put in and nothing else changed; and it knew the latest save
//   there was when it asked for the file's status, or a later one;
// - a record that is loaded says what the file said in the process's latest hold;
// - a file is made only where there is none, and is gone only when somebody removed it;
// - what a killed process left is its file as before or as after its save, once a redo record is settled;
// - each save and each removal that came to its end is told to every watcher, once, and nothing else is.

#ifndef KAVELL_TESTS_LOAD_LOAD_JUDGE_H
#define KAVELL_TESTS_LOAD_LOAD_JUDGE_H

#include <map>
#include <optional>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "tests/load/load_log.h"

namespace kavell::test {

class LoadJudge {
public:
    /// Which processes were killed.
    explicit LoadJudge(std::set<int32_t> killed) : m_killed(std::move(killed)) {}

    /// With the accounts that another judge has been told to begin with.
    LoadJudge(std::set<int32_t> killed, const LoadJudge &beginning)
        : m_killed(std::move(killed)), m_accounts(beginning.m_accounts)
    {
    }

    /// An account that was there before the first event, without a worker's value.
    void begin(size_t account, uint64_t inode);

    /// The next event. What it breaks; empty when all is well. After a breach nothing more is worth judging.
    [[nodiscard]] std::string follow(const LoadEntry &entry);

    /// What the account's file may say in the end; an inode of 0 stands for no file.
    struct Outcome {
        uint64_t inode = 0;
        LoadValues values{};
    };
    [[nodiscard]] std::vector<Outcome> outcomes(size_t account);

    /// How many notifications of the account each watcher must have, and how many it may have at most: whether a process
    /// that was killed in the middle had told already, nobody knows.
    [[nodiscard]] uint32_t leastNotifications(size_t account) { return m_accounts[account].told; }
    [[nodiscard]] uint32_t mostNotifications(size_t account);

    /// How much was put to the test.
    struct Tally {
        int saves = 0, removals = 0, creations = 0, reads = 0;
        int overwritten = 0;    ///< values lost between another's reading and its writing
        int killedInHold = 0;   ///< holds that ended with their holder
        int settledBefore = 0;  ///< of these: the file was as before
        int settledAfter = 0;   ///< as after
        int recordsMet = 0;     ///< redo records that the next holder found
    };
    [[nodiscard]] const Tally &tally() const { return m_tally; }

private:
    /// What a process knows of an account: the version of the file, counted by its changes, and what that said.
    struct Knowledge {
        uint64_t version = 0;
        LoadValues values{};
    };

    struct Process {
        LoadEvent intention = LoadEvent::Unused;  ///< WillSave or WillRemove
        uint16_t worker = 0;
        uint32_t account = 0;
        uint32_t number = 0;
        int queries = 0;             ///< of the status, since the intention
        uint64_t askedVersion = 0;   ///< the file's version at the first of them
        uint64_t statusVersion = 0;  ///< at its latest query
        bool isCarriedOut = false;
        std::unordered_map<uint32_t, Knowledge> known;
    };

    struct Account {
        uint64_t version = 0;
        uint64_t inode = 0;  ///< 0: there is no file
        LoadValues values{};
        int32_t holder = 0;
        bool isUnsettled = false;               ///< a holder was killed, and what it left was not seen yet
        std::vector<LoadValues> afterKill;      ///< what the saves of killed holders would leave
        std::map<int32_t, LoadEntry> creating;  ///< files that are about to get the name, by process
        std::set<int32_t> removing;
        std::set<uint64_t> removedEarly;  ///< files whose removal was told before their maker came to tell of them
        uint64_t versionOfLatestFile = 0;
        uint64_t versionOfLatestRemoval = 0;
        std::unordered_map<uint64_t, Knowledge> deleted;  ///< what deleted files said, by inode
        uint32_t told = 0;
        std::set<int32_t> perhapsTold;  ///< processes in the middle of a save or a removal
    };

    void intend(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string done(Process &process, const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string seen(const LoadEntry &entry, Process &process);
    void status(Process &process, const LoadEntry &entry, const Account &account);
    [[nodiscard]] std::string missing(const LoadEntry &entry, Process &process, const Account &account);
    [[nodiscard]] std::string take(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string release(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string created(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string removed(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string judgeSave(const LoadEntry &entry, Process &process, Account &account);
    void removing(const LoadEntry &entry, Account &account);
    [[nodiscard]] static bool isBeingMade(uint64_t inode, const Account &account);
    [[nodiscard]] static uint64_t latestFile(const Account &account);
    void finishKilledCreation(const LoadEntry &entry, Account &account);
    void noteKilledHolder(Account &account, uint32_t number);
    [[nodiscard]] bool settle(const LoadEntry &entry, Account &account);
    void change(Account &account, uint64_t inode, const LoadValues &values);
    void removeFile(Account &account);

    std::set<int32_t> m_killed;
    std::unordered_map<int32_t, Process> m_processes;
    std::map<size_t, Account> m_accounts;
    Tally m_tally;
};

}  // namespace kavell::test

#endif
