// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Every system call of a save, a removal, a reading and a scan fails in turn (fault_injector.h says in which ways).
// After each: the message that belongs to it and no other, the account on the disk as before or as after, no descriptor
// left open, no semaphore held, nothing left beside the file, and a next save that succeeds. Leaks of memory are the
// sanitizer's to find.

#include <filesystem>
#include <gmock/gmock.h>
#include <sys/ipc.h>
#include <sys/sem.h>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/faults/fault_injector.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

constexpr std::string_view kNothing = "no account";
constexpr size_t kKept = 900, kTorn = 1536;
constexpr int64_t kOld = 300001, kNew = 90002, kLonger = 900003, kNext = 40004;

char letterOf(int64_t round)
{
    return static_cast<char>('a' + round % 26);
}

/// How an account of a round is described that also has what another program put there in `keptFrom`.
std::string foundAs(int64_t round, int64_t keptFrom)
{
    return "round " + std::to_string(round) + " keeping " + letterOf(keptFrom);
}

/// The same of an account that has nothing of another program's.
std::string foundAlone(int64_t round)
{
    return "round " + std::to_string(round) + " alone";
}

/// What a description says behind the round.
std::string behindRound(const std::string &found)
{
    return found.substr(found.find(' ', found.find(' ') + 1));
}

std::string releaseMessage(int error)
{
    return "Error " + std::to_string(error) + ": failed to release Kavell Accounts data lock";
}

class AccountFaults : public StoreTest {
protected:
    AccountFaults() { unsetenv("DBUS_SESSION_BUS_ADDRESS"); }

    static std::string textOf(int64_t round) { return std::string(static_cast<size_t>(round / 100), letterOf(round)); }

    /// Sets what a round is known by; its hundreds are the length of its text.
    static void change(const Account &account, int64_t round)
    {
        setAttribute(account, "round", integer(round));
        setAttribute(account, "text", text(textOf(round)));
    }

    /// Puts an account on the disk, as another program that knows one thing more of it.
    static void putAccount(int64_t round)
    {
        std::filesystem::remove_all(providerDirectory());
        writeFile(fileOf("ada"), contentsOf(round));
        chmod(fileOf("ada").c_str(), 0600);
    }

    static std::string contentsOf(int64_t round)
    {
        return accountFile("<key>round</key><integer>" + std::to_string(round) + "</integer><key>text</key><string>" +
                           textOf(round) + "</string><key>kept</key><string>" + std::string(kKept, letterOf(round)) +
                           "</string>");
    }

    static ino_t inodeOfAccount()
    {
        struct stat status {};
        EXPECT_EQ(stat(fileOf("ada").c_str(), &status), 0);
        return status.st_ino;
    }

    /// The same beside the void record of an earlier save.
    static void putSavedAccount(int64_t round)
    {
        putAccount(round);
        putVoidRecord(inodeOfAccount());
    }

    static void putVoidRecord(ino_t inode)
    {
        const std::string recordPath = siblingPath(fileOf("ada"), kRedoRecordPrefix);
        writeFile(recordPath, voidRecordOf(inode));
        chmod(recordPath.c_str(), 0600);
    }

    /// An account whose replacement was cut off, with its redo record.
    static void putTornAccount(int64_t round, int64_t newRound)
    {
        const std::string oldContents = contentsOf(round), newContents = contentsOf(newRound);
        putAccount(round);
        writeFile(fileOf("ada"), newContents.substr(0, kTorn) + oldContents.substr(kTorn));
        writeFile(siblingPath(fileOf("ada"), kRedoRecordPrefix),
                  encodeRedoRecord({inodeOfAccount(), oldContents, newContents}));
    }

    static std::string describe(const Account &account)
    {
        const Value number = attribute(account, "round");
        if (!number)
            return "an account without a round";
        const int64_t round = CSKavellNumberGetInt64(cast<CSKavellNumberRef>(number.get(), CSKavellNumberGetTypeID()));
        const Value kept = attribute(account, "kept");
        const std::string keptText = kept ? toStdString(cast<CSKavellStringRef>(kept.get(), CSKavellStringGetTypeID()))
                                          : std::string(kKept, '-');
        if (!same(attribute(account, "text"), text(textOf(round))) || keptText != std::string(kKept, keptText[0]))
            return "an account that is not whole, of round " + std::to_string(round);
        return kept ? foundAs(round, keptText[0] - 'a') : foundAlone(round);
    }

    /// What another program finds, without a fault.
    static std::string find()
    {
        StandardErrorCapture errors;
        const std::string found =
            std::filesystem::exists(fileOf("ada")) ? describe(openAccount("ada")) : std::string(kNothing);
        return found + errors.take();
    }

    static void expectSemaphoreFree(key_t key)
    {
        const int set = semget(key, 0, 0);
        if (set < 0)
            return;
        EXPECT_EQ(semctl(set, 0, GETVAL), 1);
        semctl(set, 0, SETVAL, 1);
    }

    static void expectNothingHeld(size_t descriptors)
    {
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        expectSemaphoreFree(-1);
        expectSemaphoreFree(ftok(fileOf("ada").c_str(), 0));
    }

    /// Nothing but the file stands there, with its void record, and what could not be deleted because deleting failed too.
    static void expectNothingBeside(const FaultInjector &injector)
    {
        Names names = entriesBesideVoidRecords();
        const auto *failed = injector.failed();
        if (injector.fault().isLasting() || (failed && failed->kind == CallKind::Unlink))
            std::erase_if(names, [](const std::string &name) { return name.starts_with(kNewFilePrefix); });
        EXPECT_EQ(names, Names{"ada.plist"});
    }

    /// The next save, without a fault, keeps what is there and leaves nothing beside it.
    static void expectNextSave(const FaultInjector &injector, const Account &account, const std::string &found)
    {
        StandardErrorCapture errors;
        change(account, kNext);
        commit(account);
        EXPECT_EQ(errors.take(), "");
        EXPECT_FALSE(hasPendingChanges(account));
        EXPECT_EQ(find(),
                  found == kNothing ? foundAlone(kNext) : "round " + std::to_string(kNext) + behindRound(found));
        expectNothingBeside(injector);
    }

    /// What a run with a fault came to.
    struct Outcome {
        std::string message;
        std::string found;
        Names announced;
    };

    static Outcome run(FaultInjector &injector, const std::function<void()> &act)
    {
        Notifications notifications;
        Outcome outcome;
        {
            StandardErrorCapture errors;
            {
                const Observation observation(injector);
                act();
            }
            outcome.message = errors.take();
        }
        outcome.announced = notifications.takeLoginNames();
        outcome.found = find();
        return outcome;
    }

    /// Where a save that is said to have failed may have come to its end all the same.
    using MayBeDone = std::function<bool(const FaultInjector &)>;

    static void expectSave(const FaultInjector &injector, const Account &account, const Outcome &outcome,
                           const std::string &before, const std::string &after, const MayBeDone &mayBeDone)
    {
        const auto *failed = injector.failed();
        if (!isPosting(failed)) {
            EXPECT_EQ(outcome.announced, Names{"ada"});
        }
        if (failed && failed->change > 0) {
            EXPECT_EQ(outcome.message, releaseMessage(injector.fault().error));
            EXPECT_EQ(outcome.found, after);
        } else if (failed && failed->change < 0 && hasPendingChanges(account)) {
            EXPECT_EQ(outcome.message, "");
            EXPECT_EQ(outcome.found, before);
        } else if (hasPendingChanges(account)) {
            EXPECT_FALSE(injector.fault().isPassing(failed ? failed->kind : CallKind::Open));
            EXPECT_THAT(outcome.message,
                        testing::AnyOf(kSaveMessage, std::string(kStatMessage) + std::string(kSaveMessage)));
            if (outcome.found != before) {
                EXPECT_EQ(mayBeDone(injector) ? outcome.found : "(done too late)", after);
            }
        } else if (failed && failed->kind == CallKind::Status && outcome.message == kStatMessage) {
            // A status that cannot be had empties the record, deliberately, and what it saves is then all there is.
            EXPECT_EQ(behindRound(outcome.found), " alone");
            EXPECT_TRUE(after.starts_with(outcome.found.substr(0, outcome.found.rfind(' '))));
        } else {
            EXPECT_EQ(outcome.message, "");
            EXPECT_EQ(outcome.found, after);
        }
    }

    /// Runs a save of a round with each fault, over what `put` leaves on the disk.
    void checkSave(const FaultRuns &runs, const std::function<void()> &put, int64_t round, const std::string &before,
                   const std::string &after, const MayBeDone &mayBeDone)
    {
        forEachFault(runs, [&](FaultInjector &injector) {
            put();
            const size_t descriptors = countOpenDescriptors();
            const Account account = openAccount("ada");
            change(account, round);
            const Outcome outcome = run(injector, [&] { commit(account); });
            expectSave(injector, account, outcome, before, after, mayBeDone);
            expectNothingHeld(descriptors);
            expectNextSave(injector, account, outcome.found);
        });
    }

    /// Where the account's file is to be gone after a removal, or stand as before.
    void checkRemoval(const std::function<void()> &put, const std::string &before)
    {
        forEachFault({}, [&](FaultInjector &injector) {
            put();
            const size_t descriptors = countOpenDescriptors();
            const Account account = openAccount("ada");
            put();
            _CSKavellAccountRemove(account.get());
            const Outcome outcome = run(injector, [&] { commit(account); });
            const auto *failed = injector.failed();
            EXPECT_EQ(outcome.message, "");
            EXPECT_FALSE(hasPendingChanges(account));
            if (outcome.found != kNothing) {
                EXPECT_EQ(outcome.found, before);
                EXPECT_EQ(outcome.announced, Names{});
                // Only the deletion itself decides.
                EXPECT_TRUE(failed && (failed->kind == CallKind::Unlink || injector.fault().isLasting()));
            } else if (!isPosting(failed)) {
                EXPECT_EQ(outcome.announced, Names{"ada"});
            }
            expectNothingHeld(descriptors);
            expectNextSave(injector, account, outcome.found);
        });
    }

    /// Where reading finds what is on the disk, or leaves the record as it was without a word.
    void checkLoad(const std::function<void()> &put, const std::string &now)
    {
        forEachFault({}, [&](FaultInjector &injector) {
            putAccount(kOld);
            const size_t descriptors = countOpenDescriptors();
            const Account account = openAccount("ada");
            put();
            bool isLoaded = false;
            const Outcome outcome = run(injector, [&] { isLoaded = CSKavellAccountLoadData(account.get()); });
            const auto *failed = injector.failed();
            const std::string known = describe(account);
            EXPECT_EQ(outcome.found, now);
            EXPECT_EQ(outcome.announced, Names{});
            if (!isLoaded) {
                EXPECT_EQ(failed->kind, CallKind::Status);
                EXPECT_EQ(outcome.message, kStatMessage);
                EXPECT_EQ(known, "an account without a round");
            } else {
                EXPECT_EQ(outcome.message, failed && failed->change > 0 ? releaseMessage(injector.fault().error) : "");
                if (!failed || failed->change > 0 || injector.fault().isPassing(failed->kind)) {
                    EXPECT_EQ(known, now);
                }
                EXPECT_THAT(known, testing::AnyOf(foundAs(kOld, kOld), now));
            }
            expectNothingHeld(descriptors);
            EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
            EXPECT_EQ(describe(account), now);
            expectNextSave(injector, account, now);
        });
    }

    static bool isPosting(const FaultInjector::SeenCall *failed)
    {
        return failed && (failed->kind == CallKind::OpenDirectory || failed->kind == CallKind::ReadDirectory);
    }

    static bool isLate(const FaultInjector &injector)
    {
        return injector.fault().isLasting() || injector.failed()->kind == CallKind::Unlink;
    }

    static void removeAll() { std::filesystem::remove_all(home() + "/Library"); }

    static bool isNamed(const FaultInjector &injector) { return injector.cameAfter(CallKind::Rename); }
};

}  // namespace

TEST_F(AccountFaults, ASaveThatCreatesTheFileIsDoneOrSaysSo)
{
    checkSave({}, removeAll, kNew, std::string(kNothing), foundAlone(kNew), isNamed);
}

TEST_F(AccountFaults, ASaveThatCreatesTheFileWithALinkIsDoneOrSaysSo)
{
    checkSave({.canRenameWithoutReplacing = false}, removeAll, kNew, std::string(kNothing), foundAlone(kNew), isNamed);
}

TEST_F(AccountFaults, ASaveThatMakesTheFileShorterIsDoneOrSaysSo)
{
    checkSave(
        {}, [] { putAccount(kOld); }, kNew, foundAs(kOld, kOld), foundAs(kNew, kOld), isLate);
}

TEST_F(AccountFaults, ASaveThatMakesTheFileLongerIsDoneOrSaysSo)
{
    checkSave(
        {}, [] { putAccount(kOld); }, kLonger, foundAs(kOld, kOld), foundAs(kLonger, kOld), isLate);
}

TEST_F(AccountFaults, ASaveThatUsesTheRecordOfAnEarlierOneIsDoneOrSaysSo)
{
    checkSave(
        {}, [] { putSavedAccount(kOld); }, kLonger, foundAs(kOld, kOld), foundAs(kLonger, kOld), isLate);
}

TEST_F(AccountFaults, ASaveBesideTheRecordOfAnotherFileIsDoneOrSaysSo)
{
    const auto put = [] {
        putAccount(kOld);
        putVoidRecord(inodeOfAccount() + 1);
    };
    checkSave({}, put, kLonger, foundAs(kOld, kOld), foundAs(kLonger, kOld), isLate);
}

TEST_F(AccountFaults, ASaveThatCreatesTheFileBesideTheRecordOfOneThatIsGoneIsDoneOrSaysSo)
{
    const auto put = [] {
        putAccount(kOld);
        putVoidRecord(inodeOfAccount());
        std::filesystem::remove(fileOf("ada"));
    };
    checkSave({}, put, kNew, std::string(kNothing), foundAlone(kNew), isNamed);
}

TEST_F(AccountFaults, ASaveOverACutOffReplacementIsDoneOrSaysSo)
{
    forEachFault({}, [&](FaultInjector &injector) {
        putTornAccount(kOld, kNew);
        const size_t descriptors = countOpenDescriptors();
        const Account account = openAccount("ada");
        // Opening the account has settled the replacement; it is cut off anew behind the record's back.
        putTornAccount(kOld, kNew);
        change(account, kLonger);
        const Outcome outcome = run(injector, [&] { commit(account); });
        expectSave(injector, account, outcome, foundAs(kNew, kNew), foundAs(kLonger, kNew), isLate);
        expectNothingHeld(descriptors);
        expectNextSave(injector, account, outcome.found);
    });
}

TEST_F(AccountFaults, AReadingFindsWhatIsThereOrLeavesTheRecord)
{
    const auto put = [] {
        putAccount(kNew);
    };
    checkLoad(put, foundAs(kNew, kNew));
}

TEST_F(AccountFaults, AReadingOfALongFileFindsWhatIsThereOrLeavesTheRecord)
{
    const auto put = [] {
        putAccount(3000002);
    };
    checkLoad(put, foundAs(3000002, 3000002));
}

TEST_F(AccountFaults, AReadingOfACutOffReplacementFindsItWholeOrLeavesTheRecord)
{
    const auto put = [] {
        putTornAccount(kOld, kNew);
    };
    checkLoad(put, foundAs(kNew, kNew));
}

TEST_F(AccountFaults, ARemovalIsDoneOrLeavesTheAccount)
{
    const auto put = [] {
        putAccount(kOld);
    };
    checkRemoval(put, foundAs(kOld, kOld));
}

TEST_F(AccountFaults, ARemovalAfterASaveIsDoneOrLeavesTheAccount)
{
    const auto put = [] {
        putSavedAccount(kOld);
    };
    checkRemoval(put, foundAs(kOld, kOld));
}

TEST_F(AccountFaults, ARemovalOfACutOffReplacementIsDoneOrLeavesTheAccountWhole)
{
    const auto put = [] {
        putTornAccount(kOld, kNew);
    };
    checkRemoval(put, foundAs(kNew, kNew));
}

TEST_F(AccountFaults, ASaveOverADamagedFileKeepsWhatWasDamaged)
{
    constexpr std::string_view kDamaged = "this is no account, but a user may want it back";
    const auto isKept = [&] {
        const Names names = entriesBeginningWith("");
        return std::any_of(names.begin(), names.end(), [&](const std::string &name) {
            return readFile(providerDirectory() + "/" + name) == kDamaged;
        });
    };
    forEachFault({}, [&](FaultInjector &injector) {
        removeAll();
        const Account account = openAccount("ada");
        writeFile(fileOf("ada"), kDamaged);
        const size_t descriptors = countOpenDescriptors();
        change(account, kNew);
        const Outcome outcome = run(injector, [&] { commit(account); });
        EXPECT_TRUE(isKept());
        if (outcome.found != foundAlone(kNew)) {
            EXPECT_TRUE(hasPendingChanges(account));
            EXPECT_EQ(readFile(fileOf("ada")), kDamaged);
        }
        expectNothingHeld(descriptors);
        StandardErrorCapture errors;
        change(account, kNext);
        commit(account);
        static_cast<void>(errors.take());
        EXPECT_EQ(find(), foundAlone(kNext));
        EXPECT_TRUE(isKept());
    });
}

TEST_F(AccountFaults, AScanFindsAnAccountAsItIsOrNot)
{
    forEachFault({}, [&](FaultInjector &injector) {
        putAccount(kNew);
        const size_t descriptors = countOpenDescriptors();
        std::string found(kNothing);
        const Outcome outcome = run(injector, [&] {
            const auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
            const Account account =
                adopt(_CSKavellAccountProviderCopyAccount(provider.get(), text("ada").get(), false));
            if (account)
                found = describe(account);
        });
        const auto *failed = injector.failed();
        EXPECT_EQ(outcome.found, foundAs(kNew, kNew));
        if (!failed || injector.fault().isPassing(failed->kind)) {
            EXPECT_EQ(found, foundAs(kNew, kNew));
        } else {
            EXPECT_THAT(found, testing::AnyOf(kNothing, "an account without a round", foundAs(kNew, kNew)));
        }
        expectNothingHeld(descriptors);
    });
}
