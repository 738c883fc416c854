// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The life of an account, with a crash at every moment of it: each state that the disk may be left in is opened by the
// store and shows the account as before or as after (crash_scenario.h says what that covers and how to try more).

#include <filesystem>
#include <memory>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/crash/crash_scenario.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

constexpr std::string_view kNothing = "no account";

std::string foundAs(int64_t round)
{
    return "round " + std::to_string(round);
}

class AccountCrash : public testing::Test {
protected:
    AccountCrash()
    {
        unsetenv("DBUS_SESSION_BUS_ADDRESS");
        const std::string scratch = std::getenv("TMPDIR");
        std::filesystem::remove_all(scratch + "/home");
        m_watched = std::make_unique<WatchedDirectory>(scratch + "/home", scratch + "/anchors");
        setenv("HOME", m_watched->path().c_str(), 1);
        m_scenario = std::make_unique<CrashScenario>(
            *m_watched, [this] { return observe(); }, [this](const std::string &found) { return proceed(found); });
    }

    /// The text that fills a round's account: its length is the round's first digits, so that files of any size can be
    /// had, and no two rounds have bytes in common.
    static std::string textOf(int64_t round)
    {
        return std::string(static_cast<size_t>(round / 100), static_cast<char>('a' + round % 26));
    }

    /// Saves the account as it is in a round: a number whose hundreds are the length of its text. Whether that was done.
    static bool trySave(int64_t round)
    {
        const Account account = openAccount("ada");
        _CSKavellAccountSetUUIDString(account.get(), text(kUUID).get());
        setAttribute(account, "round", integer(round));
        setAttribute(account, "text", text(textOf(round)));
        _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("round").get(),
                                            integer(round).get());
        commit(account);
        return !hasPendingChanges(account);
    }

    static void save(int64_t round) { EXPECT_TRUE(trySave(round)); }

    static void remove()
    {
        const auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
        _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    }

    /// The account as this process finds it, if it is whole.
    static std::string describe(const Account &account)
    {
        const Value number = attribute(account, "round");
        if (!number)
            return "an account without a round";
        const int64_t round = CSKavellNumberGetInt64(cast<CSKavellNumberRef>(number.get(), CSKavellNumberGetTypeID()));
        const bool isWhole =
            same(attributes(account), dictionary({{"round", number}, {"text", text(textOf(round))}})) &&
            same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"round", number}})) &&
            uuidOf(account) == kUUID;
        return isWhole ? foundAs(round) : "an account that is not whole, of " + foundAs(round);
    }

    /// What this process finds, in one line.
    virtual std::string observe()
    {
        std::string found = describeAll();
        const std::string message = m_errors.take();
        if (!message.empty())
            found += ", saying " + message;
        return found + (found == kNothing ? "" : leftovers());
    }

    static std::string describeAll()
    {
        const auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
        const auto accounts = adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
        if (CSKavellArrayGetCount(accounts.get()) > 1)
            return "more than one account";
        if (const Account account =
                adopt(_CSKavellAccountProviderCopyAccount(provider.get(), text("ada").get(), false)))
            return describe(account) + (permissionsOf(fileOf()) == 0600 ? "" : ", open to others");
        return std::string(kNothing);
    }

    /// What stands beside an account that has been read, and should not.
    static std::string leftovers()
    {
        std::string names;
        std::error_code isMissing;
        for (const auto &entry :
             std::filesystem::directory_iterator(std::filesystem::path(fileOf()).parent_path(), isMissing)) {
            const std::string name = entry.path().filename();
            if ((name.starts_with(kRedoRecordPrefix) && isPendingRecordAt(entry.path())) ||
                name.starts_with(kDamagedCopyPrefix))
                names += ", beside " + name;
        }
        return names;
    }

    /// Saves a round that is longer than some and shorter than others.
    std::string proceed(const std::string &)
    {
        save(90017);
        return foundAs(90017);
    }

    static std::string fileOf() { return dataFilePath(kMail, "ada"); }

    /// Leaves an account whose replacement by a later round was cut off, with its redo record.
    static void putTornAccount(int64_t round, int64_t newRound)
    {
        save(round);
        const std::string old = readFile(fileOf());
        save(newRound);
        const std::string replacement = readFile(fileOf());
        const std::string recordPath = siblingPath(fileOf(), kRedoRecordPrefix);
        struct stat status {};
        ASSERT_EQ(stat(fileOf().c_str(), &status), 0);
        writeFile(fileOf(), replacement.substr(0, 1024) + old.substr(1024));
        writeFile(recordPath, encodeRedoRecord({status.st_ino, old, replacement}));
        ASSERT_EQ(chmod(recordPath.c_str(), 0600), 0);
    }

    /// A step that saves a round.
    void saveStep(const std::string &name, int64_t round, Refusal refusal = Refusal::Nothing)
    {
        m_scenario->step(
            name, [round] { save(round); }, foundAs(round), refusal);
    }

    StandardErrorCapture m_errors;
    std::unique_ptr<WatchedDirectory> m_watched;
    std::unique_ptr<CrashScenario> m_scenario;
};

/// A file that nobody can make sense of is replaced, but not lost: while it is not in its place, a copy stands beside.
class DamagedAccountCrash : public AccountCrash {
protected:
    static constexpr std::string_view kDamaged = "this is no account, but a user may want it back";

    DamagedAccountCrash()
    {
        writeFile(fileOf(), kDamaged);
        chmod(fileOf().c_str(), 0600);
    }

    std::string observe() override
    {
        std::string found = readFile(fileOf()) == kDamaged ? std::string(kDamaged) : describeAll();
        static_cast<void>(m_errors.take());
        return found + (isKept() ? "" : ", and what was damaged is lost");
    }

    static bool isKept()
    {
        for (const auto &entry : std::filesystem::directory_iterator(std::filesystem::path(fileOf()).parent_path())) {
            if (readFile(entry.path()) == kDamaged)
                return true;
        }
        return false;
    }
};

}  // namespace

TEST_F(AccountCrash, LeavesANewAccountWholeOrNotThere)
{
    m_scenario->start(std::string(kNothing));
    saveStep("create", 300001);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesANewAccountWholeOrNotThereBesideTheRecordOfOneThatIsGone)
{
    save(60001);
    save(180002);
    std::filesystem::remove(fileOf());
    m_scenario->start(std::string(kNothing));
    saveStep("create", 300003);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, KeepsASaveOverAFileThatAnotherProgramHasJustPutInPlace)
{
    save(180001);
    const std::string theirs = readFile(fileOf());
    save(60002);
    m_scenario->start(foundAs(60002));
    const auto put = [&] {
        const std::string path = fileOf() + ".theirs";
        const FileDescriptor file = openFile(path.c_str(), O_WRONLY | O_CREAT | O_EXCL, 0600);
        EXPECT_TRUE(writeWhole(file.get(), theirs) && fsync(file.get()) == 0);
        EXPECT_EQ(std::rename(path.c_str(), fileOf().c_str()), 0);
    };
    m_scenario->step("put in place, without a sync of the directory", put, foundAs(180001));
    m_scenario->checkPowerCutsAfterKills();
}

TEST_F(AccountCrash, LeavesAChangedAccountAsBeforeOrAsAfter)
{
    save(300001);
    m_scenario->start(foundAs(300001));
    saveStep("change", 300002);
    saveStep("change again", 300003);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesAGrowingAccountAsBeforeOrAsAfter)
{
    save(101);
    m_scenario->start(foundAs(101));
    saveStep("grow within a sector", 6002);
    saveStep("grow over sectors", 120003);
    saveStep("grow over pages", 900004);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesAShrinkingAccountAsBeforeOrAsAfter)
{
    save(900001);
    m_scenario->start(foundAs(900001));
    saveStep("shrink over pages", 420002);
    saveStep("shrink over sectors", 110003);
    saveStep("shrink within a sector", 104);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesARemovedAccountWholeOrGone)
{
    save(200001);
    m_scenario->start(foundAs(200001));
    m_scenario->step("remove", remove, std::string(kNothing));
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesARemovedAccountWholeOrGoneWhereAReplacementHadBeenCutOff)
{
    putTornAccount(200001, 160002);
    m_scenario->start(foundAs(160002));
    m_scenario->step("remove", remove, std::string(kNothing));
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesARemovedAccountWholeOrGoneWhereAReplacementCannotBeFinished)
{
    putTornAccount(200001, 160002);
    m_scenario->start(foundAs(160002));
    m_scenario->step("remove", remove, std::string(kNothing), Refusal::Writes);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, MakesAnAccountsPermissionsThoseOfItsOwnerAlone)
{
    save(30001);
    chmod(fileOf().c_str(), 0644);
    m_scenario->start(foundAs(30001) + ", open to others");
    saveStep("change", 30002);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesANewAccountWholeOrNotThereWhereItIsNamedByALink)
{
    m_scenario->start(std::string(kNothing));
    saveStep("create", 100001, Refusal::NewNames);
    saveStep("change", 90002);
    m_scenario->step("remove", remove, std::string(kNothing));
    m_scenario->checkEverything();
}

TEST_F(DamagedAccountCrash, KeepsWhatWasDamaged)
{
    m_scenario->start(std::string(kDamaged));
    saveStep("save over it", 20001);
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, TakesNothingOfAnEarlierLifeIntoALaterOne)
{
    m_scenario->start(std::string(kNothing));
    saveStep("create", 60001);
    saveStep("change", 180002);
    m_scenario->step("remove", remove, std::string(kNothing));
    saveStep("create anew", 60001);
    saveStep("shrink", 20003);
    m_scenario->step("remove again", remove, std::string(kNothing));
    m_scenario->checkEverything();
}

TEST_F(AccountCrash, LeavesAChangedAccountAsBeforeOrAsAfterWhereACallFailedToo)
{
    save(40001);
    m_scenario->start(foundAs(40001));
    m_scenario->checkPowerCutsAfterFaults([] { static_cast<void>(trySave(20002)); }, foundAs(20002));
    m_scenario->checkPowerCutsAfterFaults([] { static_cast<void>(trySave(90003)); }, foundAs(90003));
    m_scenario->checkSavesAfterFaults([] { static_cast<void>(trySave(20002)); });
}

TEST_F(AccountCrash, MakesAnAccountsPermissionsThoseOfItsOwnerAloneWhereACallFailedBefore)
{
    save(30001);
    chmod(fileOf().c_str(), 0644);
    m_scenario->start(foundAs(30001) + ", open to others");
    m_scenario->checkSavesAfterFaults([] { static_cast<void>(trySave(20002)); });
}

TEST_F(AccountCrash, LeavesACutOffReplacementWholeWhereACallFailedToo)
{
    putTornAccount(80001, 60002);
    m_scenario->start(foundAs(60002));
    m_scenario->checkPowerCutsAfterFaults([] { static_cast<void>(trySave(50003)); }, foundAs(50003));
    m_scenario->checkSavesAfterFaults([] { static_cast<void>(trySave(50003)); });
}

TEST_F(AccountCrash, LeavesARemovedAccountWholeOrGoneWhereACallFailedToo)
{
    putTornAccount(80001, 60002);
    m_scenario->start(foundAs(60002));
    m_scenario->checkPowerCutsAfterFaults(remove, std::string(kNothing));
    m_scenario->checkSavesAfterFaults(remove);
}

TEST_F(AccountCrash, LeavesANewAccountWholeOrNotThereWhereACallFailedToo)
{
    m_scenario->start(std::string(kNothing));
    m_scenario->checkPowerCutsAfterFaults([] { static_cast<void>(trySave(50003)); }, foundAs(50003));
    m_scenario->checkSavesAfterFaults([] { static_cast<void>(trySave(50003)); });
}
