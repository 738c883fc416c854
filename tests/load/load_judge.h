// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Follows the log of what many processes did (load_log.h), and says where it breaks what the store promises them:
//
// - the holds of a file do not overlap, and the file changes only inside them;
// - a save leaves what the process knew, with its own value put in and nothing else changed; and it knew the latest save
//   there was when it asked for the file's status, or a later one;
// - a record that is loaded says what the file said in the process's latest hold;
// - a file is made only where there is none, and is gone only when somebody removed it (load_names.h);
// - what a killed process left is its file as before or as after its save, once a redo record is settled;
// - a save goes into a file that has the name when its flock is taken, even if a remover without the flock comes then;
// - each save and each removal that came to its end is told to every watcher, once, and nothing else is.

#ifndef KAVELL_TESTS_LOAD_LOAD_JUDGE_H
#define KAVELL_TESTS_LOAD_LOAD_JUDGE_H

#include <map>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "tests/load/load_log.h"
#include "tests/load/load_names.h"

namespace kavell::test {

class LoadJudge {
public:
    /// An account that was there before the first event, without a worker's value.
    void begin(size_t account, uint64_t inode);

    /// The next event. What it breaks; empty when all is well. After a breach nothing more is worth judging.
    [[nodiscard]] std::string follow(const LoadEntry &entry);

    /// A process was killed, and wrote none of the events that follow. It may live on for a moment, and do what it began.
    void fellSilent(int32_t process) { m_silent.insert(process); }
    /// It was dead before the events that follow.
    void died(int32_t process);

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
        uint64_t askedAt = 0;        ///< when that was, as the account's names count it
        uint64_t statusVersion = 0;  ///< at its latest query
        uint64_t statusAt = 0;
        bool isCarriedOut = false;
        std::unordered_map<uint32_t, Knowledge> known;
        /// What it may know instead, where it perhaps read nothing of what it held.
        std::unordered_map<uint32_t, std::vector<Knowledge>> knownBefore;
    };

    struct DeletedFile {
        Knowledge knowledge;
        std::vector<LoadValues> afterKill;  ///< what the saves would leave that it was deleted under
    };

    struct Account {
        uint32_t number = 0;
        LoadNames names;
        uint64_t version = 0;
        uint64_t inode = 0;  ///< the latest file that was told of and may have the name; 0: there is none
        LoadValues values{};
        int32_t holder = 0;
        bool isUnsettled = false;               ///< a holder was killed, and what it left was not seen yet
        std::vector<LoadValues> afterKill;      ///< what the saves of killed holders would leave
        std::map<int32_t, LoadEntry> creating;  ///< files that are about to get the name, by process
        std::set<int32_t> strays;  ///< who saves into a deleted file; the redo record lies beside the next file
        std::unordered_map<uint64_t, DeletedFile> deleted;  ///< by inode
        uint64_t versionBeforeMistake = 0;  ///< the versions after it, up to the other, were of a file that was gone
        uint64_t versionAfterMistake = 0;
        uint32_t told = 0;
        std::set<int32_t> perhapsTold;  ///< processes in the middle of a save or a removal
    };

    [[nodiscard]] std::string judge(const LoadEntry &entry, Process &process, Account &account);
    void intend(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string done(Process &process, const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string seen(const LoadEntry &entry, Process &process);
    void status(Process &process, const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string missing(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string take(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string takeDeleted(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string release(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string releaseDeleted(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string creating(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string created(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string removing(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::string removed(const LoadEntry &entry, Process &process, Account &account);
    [[nodiscard]] std::string judgeSave(const LoadEntry &entry, Process &process, Account &account);
    static void learn(Process &process, uint32_t account, const Knowledge &knowledge, bool isPerhaps = false);
    [[nodiscard]] static std::vector<Knowledge> possibleKnowledge(Process &process, uint32_t account);
    static void noteMistake(Account &account, uint64_t inode);
    [[nodiscard]] std::string finishSilentCreation(const LoadEntry &entry, Account &account);
    [[nodiscard]] std::vector<LoadValues> unfinishedSave(const Account &account);
    void noteKilledHolder(Account &account);
    [[nodiscard]] bool settle(const LoadEntry &entry, Account &account);
    [[nodiscard]] Knowledge note(Account &account, uint64_t inode, const LoadValues &values);
    static void change(Account &account, uint64_t inode, const LoadValues &values);
    void removeFile(Account &account);

    std::set<int32_t> m_silent, m_dead;
    std::unordered_map<int32_t, Process> m_processes;
    std::map<size_t, Account> m_accounts;
    Tally m_tally;
};

}  // namespace kavell::test

#endif
