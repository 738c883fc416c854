// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KANimbrelAccount.h>

#include <kavellaccounts/KAFieldList.h>

#include "tests/model/account_fixture.h"
#include "tests/support/standard_error_capture.h"

using namespace kavell::test;

namespace {

class KANimbrelAccountTest : public AccountWithVaultTest {
protected:
    void TearDown() override
    {
        KANimbrelAccount::setMemberAccountFactory(nullptr);
        AccountWithVaultTest::TearDown();
    }
};

std::shared_ptr<KANimbrelAccount> newMember()
{
    return KANimbrelAccount::initWithProviderType(kKAProviderNimbrel, QStringLiteral("ada"));
}

}  // namespace

TEST_F(KANimbrelAccountTest, ItsInitialisersMakeItsClass)
{
    const std::shared_ptr<KAAccount> made = newMember();
    EXPECT_EQ(made->className(), QStringLiteral("KANimbrelAccount"));
    const std::shared_ptr<KAAccount> wrapped = KANimbrelAccount::initWithCSKavellAccount(made->accountRef());
    EXPECT_EQ(wrapped->className(), QStringLiteral("KANimbrelAccount"));
    EXPECT_EQ(wrapped->accountRef(), made->accountRef());
    StandardErrorCapture capture;
    EXPECT_FALSE(KANimbrelAccount::initWithProviderType(kKAProviderNimbrel, QString()));
}

TEST_F(KANimbrelAccountTest, WithoutTheSupportLibraryThereIsNoMemberAccount)
{
    EXPECT_FALSE(newMember()->nimbrelMemberAccount());
}

TEST_F(KANimbrelAccountTest, TheMemberAccountIsMadeOnceWithTheAccountsNames)
{
    QString name, applicationID;
    bool hasPassword = true;
    int calls = 0;
    KANimbrelAccount::setMemberAccountFactory([&](const QString &login, const QString &password, const QString &id) {
        ++calls;
        name = login;
        hasPassword = !password.isNull();
        applicationID = id;
        return std::make_shared<int>(7);
    });
    const auto account = newMember();
    EXPECT_EQ(calls, 0);
    const auto member = account->nimbrelMemberAccount();
    ASSERT_TRUE(member);
    EXPECT_EQ(account->nimbrelMemberAccount(), member);
    EXPECT_EQ(calls, 1);
    EXPECT_EQ(name, QStringLiteral("ada"));
    EXPECT_FALSE(hasPassword);
    EXPECT_EQ(applicationID, QStringLiteral("com.corvane.nimbrel.kaplugin"));
}

TEST_F(KANimbrelAccountTest, TheMemberAccountGetsTheStoredPassword)
{
    QString given;
    KANimbrelAccount::setMemberAccountFactory([&](const QString &, const QString &password, const QString &) {
        given = password;
        return std::make_shared<int>(7);
    });
    const auto account = newMember();
    ASSERT_TRUE(account->setPassword(QStringLiteral("secret")));
    EXPECT_TRUE(account->nimbrelMemberAccount());
    EXPECT_EQ(given, QStringLiteral("secret"));
}

TEST_F(KANimbrelAccountTest, AFailureIsNotRemembered)
{
    int calls = 0;
    KANimbrelAccount::setMemberAccountFactory([&](const QString &, const QString &, const QString &) {
        return ++calls == 1 ? nullptr : std::make_shared<int>(7);
    });
    const auto account = newMember();
    EXPECT_FALSE(account->nimbrelMemberAccount());
    EXPECT_TRUE(account->nimbrelMemberAccount());
    EXPECT_EQ(calls, 2);
}

TEST_F(KANimbrelAccountTest, TheMemberAccountLivesAsLongAsTheAccount)
{
    std::weak_ptr<int> member;
    KANimbrelAccount::setMemberAccountFactory([&](const QString &, const QString &, const QString &) {
        auto made = std::make_shared<int>(7);
        member = made;
        return made;
    });
    auto account = newMember();
    EXPECT_TRUE(account->nimbrelMemberAccount());
    EXPECT_FALSE(member.expired());
    account = nullptr;
    EXPECT_TRUE(member.expired());
}

TEST_F(KANimbrelAccountTest, ItsOwnFieldComesBeforeThoseOfTheAccount)
{
    KAFieldList fields;
    newMember()->describeFields(fields);
    ASSERT_EQ(fields.fields().size(), 3u);
    EXPECT_EQ(fields.fields()[0].name, QStringLiteral("_nbAccount"));
    EXPECT_EQ(fields.fields()[1].name, QStringLiteral("_accountRef"));
    EXPECT_EQ(fields.fields()[2].name, QStringLiteral("_private"));
}
