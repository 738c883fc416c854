// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with one provider and one account of the object layer.

#include <set>

#include <gmock/gmock.h>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/support/threads.h"

using kavell::test::onThreads;
using testing::IsEmpty;

namespace {

constexpr int kThreads = 8;

QString numbered(const char *name, int number)
{
    return QStringLiteral("%1 %2").arg(QLatin1String(name)).arg(number);
}

TEST(KAProviderThreads, AccountsThatAllCreateAreOfOneRecordEach)
{
    const auto provider = KAProvider::initWithProviderType("org.example.account.created");
    std::array<std::array<CSKavellAccountRef, 20>, kThreads> records;
    onThreads(kThreads, [&](int index) {
        for (int number = 0; number < 20; ++number) {
            const auto account = provider->accountForLoginName(numbered("user", number), true);
            records[static_cast<size_t>(index)][static_cast<size_t>(number)] = account->accountRef();
        }
    });
    EXPECT_THAT(records, testing::Each(records[0]));
    EXPECT_EQ(provider->accounts().size(), 20);
}

TEST(KAProviderThreads, AttributesOfOneRecordAreSetThroughManyObjects)
{
    const auto provider = KAProvider::initWithProviderType("org.example.account.attributes");
    onThreads(kThreads, [&](int index) {
        const auto account = provider->accountForLoginName("ada", true);
        const QString own = numbered("key", index);
        for (int round = 0; round < 200; ++round) {
            account->setProviderAttribute(round, own);
            EXPECT_EQ(account->providerAttributeForKey(own), QVariant(qlonglong{round}));
            account->setAttribute(QStringLiteral("imap.example.org"), own, kKAServiceIMAP);
            EXPECT_TRUE(account->attributesForService(kKAServiceIMAP).contains(own));
            account->removeAttributeForKey(own, kKAServiceIMAP);
        }
    });
    const auto account = provider->accountForLoginName("ada", false);
    ASSERT_TRUE(account);
    EXPECT_EQ(account->providerAttributes().size(), kThreads);
    for (int index = 0; index < kThreads; ++index)
        EXPECT_EQ(account->providerAttributeForKey(numbered("key", index)), QVariant(qlonglong{199}));
    EXPECT_THAT(account->attributesForService(kKAServiceIMAP), IsEmpty());
}

TEST(KAProviderThreads, AccountsThatOneHoldsStayUsableWhileOthersRemoveThem)
{
    const auto provider = KAProvider::initWithProviderType("org.example.account.removed");
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 20; ++round) {
            const QString name = numbered("user", round % 5);
            const auto account = provider->accountForLoginName(name, true);
            ASSERT_TRUE(account);
            if (index % 2 == 0)
                provider->removeAccount(account);
            EXPECT_EQ(account->loginName(), name);
            account->setFullName("Ada");
            EXPECT_EQ(account->fullName(), "Ada");
            for (const auto &listed : provider->accounts())
                EXPECT_TRUE(listed->loginName().startsWith("user "));
        }
    });
    for (const auto &account : provider->accounts())
        provider->removeAccount(account);
    EXPECT_THAT(provider->accounts(), IsEmpty());
    EXPECT_THAT(KAProvider::initWithProviderType("org.example.account.removed")->accounts(), IsEmpty());
}

}  // namespace
