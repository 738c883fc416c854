// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What other programs do in a provider's directory while its accounts are being loaded. Loading is held up at the semaphore
// of the first account, so that the directory has been listed and the second one not been read.

#include <chrono>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <thread>

#include "platform/redo_record.h"
#include "platform/sibling_path.h"
#include "tests/store/store_test.h"
#include "tests/support/directory_time.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Provider = Ref<CSKavellAccountProviderRef>;

constexpr std::string_view kBefore = "<key>a</key><string>before</string>",
                           kAfter = "<key>a</key><string>and after it</string>";

class ProviderListing : public StoreTest {
protected:
    ProviderListing()
    {
        for (const std::string &name : {m_names[0], m_names[1]}) {
            writeFile(fileOf(name), accountFile(kBefore));
            // Makes the semaphore.
            EXPECT_TRUE(same(attribute(openAccount(name), "a"), text("before")));
        }
        letTimePass(directory());
    }

    [[nodiscard]] std::string directory() const { return fileOf("ada").substr(0, fileOf("ada").rfind('/')); }
    [[nodiscard]] int setOf(size_t index) const { return semget(ftok(fileOf(m_names[index]).c_str(), 0), 0, 0); }

    /// Calls `load` on another thread, and `meanwhile(name of an account that is not read yet)` once it has listed them.
    template <typename Load, typename Body> void whileLoading(Load load, Body meanwhile)
    {
        for (const size_t index : {0, 1})
            EXPECT_EQ(semctl(setOf(index), 0, SETVAL, 0), 0);
        const std::jthread loader(load);
        const auto isAwaited = [this](size_t index) {
            return semctl(setOf(index), 0, GETNCNT) == 1;
        };
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
        while (!isAwaited(0) && !isAwaited(1) && std::chrono::steady_clock::now() < deadline)
            std::this_thread::yield();
        EXPECT_NE(isAwaited(0), isAwaited(1));
        meanwhile(m_names[isAwaited(0) ? 1 : 0]);
        for (const size_t index : {0, 1})
            EXPECT_EQ(semctl(setOf(index), 0, SETVAL, 1), 0);
    }

    /// Makes the provider's record in the same way.
    template <typename Body> Provider loadWhile(Body meanwhile)
    {
        Provider provider;
        whileLoading([&] { provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get())); }, meanwhile);
        return provider;
    }

    /// What a program leaves that dies while it replaces the contents of an account's file.
    void dieReplacing(const std::string &name, const std::string &torn) const
    {
        struct stat status {};
        ASSERT_EQ(stat(fileOf(name).c_str(), &status), 0);
        writeFile(siblingPath(fileOf(name), kRedoRecordPrefix),
                  encodeRedoRecord({status.st_ino, accountFile(kBefore), accountFile(kAfter)}));
        writeFile(fileOf(name), torn);
    }

    static Value attributeOf(const Provider &provider, std::string_view name)
    {
        const auto account = adopt(_CSKavellAccountProviderCopyAccount(provider.get(), text(name).get(), false));
        return account ? attribute(account, "a") : Value();
    }

    const std::string m_names[2] = {"ada", "grace"};
};

}  // namespace

TEST_F(ProviderListing, AFileThatIsStillReadableWithoutItsNewRecordIsLoadedByIt)
{
    std::string victim;
    const Provider provider = loadWhile([&](const std::string &name) {
        victim = name;
        dieReplacing(name, accountFile(kBefore));
    });
    EXPECT_TRUE(same(attributeOf(provider, victim), text("and after it")));
    EXPECT_EQ(CSKavellArrayGetCount(adopt(_CSKavellAccountProviderCopyAccounts(provider.get())).get()), 2u);
}

TEST_F(ProviderListing, AFileThatIsTornMeanwhileIsLoadedWholeWithoutAWord)
{
    StandardErrorCapture capture;
    std::string victim;
    const Provider provider = loadWhile([&](const std::string &name) {
        victim = name;
        // It has grown, and the bytes that it grew by were not filled.
        const std::string before = accountFile(kBefore);
        dieReplacing(name, before + std::string(accountFile(kAfter).size() - before.size(), '\0'));
    });
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attributeOf(provider, victim), text("and after it")));
}

TEST_F(ProviderListing, ReloadingReadsAFileThatIsTornMeanwhileWhole)
{
    const Provider provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
    std::string victim;
    whileLoading([&] { _CSKavellAccountProviderReloadAccountData(provider.get()); },
                 [&](const std::string &name) {
                     victim = name;
                     dieReplacing(name, accountFile(kBefore));
                 });
    EXPECT_TRUE(same(attributeOf(provider, victim), text("and after it")));
}

TEST_F(ProviderListing, OneThatOthersWorkInMeanwhileHasTheAccountsThatWereListed)
{
    const Provider provider = loadWhile([&](const std::string &) { writeFile(fileOf("mary"), accountFile(kAfter)); });
    EXPECT_TRUE(same(attributeOf(provider, "ada"), text("before")));
    EXPECT_TRUE(same(attributeOf(provider, "grace"), text("before")));
    EXPECT_FALSE(attributeOf(provider, "mary"));
}

TEST_F(ProviderListing, ADamagedFileOfOneThatOthersWorkInMeanwhileIsToldOfOnce)
{
    StandardErrorCapture capture;
    loadWhile([&](const std::string &name) {
        writeFile(fileOf(name), "damaged");
        writeFile(fileOf("mary"), accountFile(kAfter));
    });
    EXPECT_EQ(capture.take(), kLoadMessage);
}
