// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What is asked about accounts.

#include <kavellaccounts/CSKavellAccountConstants.h>

#include "tests/model/account_fixture.h"

using namespace kavell::test;

namespace {

using KAAccountQuestionsTest = AccountTest;

const QString kDisabled = QStringLiteral("com.corvane.KavellAccounts.disabled");

/// The description after the root class's own, "<KAAccount: 0x…>".
QString descriptionOf(const KAAccount &account)
{
    const QString address = QStringLiteral("0x") + QString::number(reinterpret_cast<quintptr>(&account), 16);
    const QString start = QStringLiteral("<") + account.className() + QStringLiteral(": ") + address + u'>';
    const QString description = account.description();
    EXPECT_TRUE(description.startsWith(start));
    return description.mid(start.size());
}

}  // namespace

TEST_F(KAAccountQuestionsTest, AnAccountIsEnabledUnlessItIsMarked)
{
    const auto account = newAccount();
    EXPECT_TRUE(account->accountIsEnabled());
    account->setAccountEnabled(false);
    EXPECT_FALSE(account->accountIsEnabled());
    EXPECT_EQ(account->providerAttributeForKey(kDisabled).metaType().id(), QMetaType::Bool);
    EXPECT_TRUE(account->providerAttributeForKey(kDisabled).toBool());
}

TEST_F(KAAccountQuestionsTest, EnablingAnAccountThatWasNeverDisabledLeavesNoAttribute)
{
    const auto account = newAccount();
    commit(account);
    account->setAccountEnabled(true);
    EXPECT_TRUE(account->providerAttributes().isEmpty());
}

TEST_F(KAAccountQuestionsTest, EnablingRemovesTheMark)
{
    const auto account = newAccount();
    account->setAccountEnabled(false);
    account->setAccountEnabled(true);
    EXPECT_TRUE(account->accountIsEnabled());
    EXPECT_TRUE(account->providerAttributes().isEmpty());
}

TEST_F(KAAccountQuestionsTest, DisablingIsNotCommitted)
{
    const auto account = newAccount();
    commit(account);
    account->setAccountEnabled(false);
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_TRUE(newAccount()->accountIsEnabled());
}

TEST_F(KAAccountQuestionsTest, OnlyATrueBooleanDisables)
{
    const auto account = newAccount();
    account->setProviderAttribute(false, kDisabled);
    EXPECT_TRUE(account->accountIsEnabled());
    account->setProviderAttribute(QStringLiteral("true"), kDisabled);
    EXPECT_TRUE(account->accountIsEnabled());
}

TEST_F(KAAccountQuestionsTest, TheProvidersOfTheAccountList)
{
    struct Row {
        const char *providerType;
        bool isAList;
    };
    // Yahoo stands here twice because it is asked for twice, harmlessly and deliberately.
    constexpr Row kRows[] = {
        {"com.corvane.account.yahoo", true},        {"com.corvane.account.google", true},
        {"com.corvane.account.nimbrel", true},      {"com.corvane.account.placeholder", true},
        {"com.corvane.account.facebook", true},     {"com.corvane.account.exchange", true},
        {"com.corvane.account.yahoo", true},        {"com.corvane.account.aol", true},
        {"com.corvane.account.haldenserver", true}, {"com.corvane.account.mail", false},
        {"com.corvane.account.cardell", false},     {"com.corvane.account.parlex", false},
        {"com.corvane.account.tidewell", false},    {"com.corvane.account.testing", false},
    };
    for (const Row &row : kRows)
        EXPECT_EQ(newAccount(QStringLiteral("ada"), QString::fromLatin1(row.providerType))->isAList(), row.isAList)
            << row.providerType;
}

TEST_F(KAAccountQuestionsTest, GroupwareServicesMakeAnExchangeAccount)
{
    for (const char *service : {"kKAServiceExchangeMail", "kKAServiceExchangeContacts", "kKAServiceExchangeCalendar"}) {
        const auto account = newAccount();
        account->setProviderAttribute(QString::fromLatin1(service), QStringLiteral("KAAccountTypeKey"));
        EXPECT_TRUE(account->isExchange()) << service;
    }
}

TEST_F(KAAccountQuestionsTest, ARootPathMakesAnExchangeAccount)
{
    const auto account = newAccount();
    account->setProviderAttribute(QStringLiteral("/EWS"), QStringLiteral("serverRootPath"));
    EXPECT_TRUE(account->isExchange());
}

TEST_F(KAAccountQuestionsTest, OtherAccountsAreNoExchangeAccounts)
{
    const auto account = newAccount(QStringLiteral("ada"), kKAProviderExchange);
    EXPECT_FALSE(account->isExchange());
    account->setProviderAttribute(QStringLiteral("kKAServiceIMAP"), QStringLiteral("KAAccountTypeKey"));
    account->setProviderAttribute(QStringLiteral(""), QStringLiteral("serverRootPath"));
    EXPECT_FALSE(account->isExchange());
    account->setProviderAttribute(1, QStringLiteral("serverRootPath"));
    EXPECT_FALSE(account->isExchange());
}

TEST_F(KAAccountQuestionsTest, AnAccountWithoutChildrenIsEnabledForNoApplication)
{
    EXPECT_FALSE(newAccount()->enabledForApplication(QStringLiteral("com.corvane.mail")));
}

TEST_F(KAAccountQuestionsTest, AnAccountEqualsItselfWithoutAQuestion)
{
    const auto account = KAAccount::initWithCSKavellAccount(nullptr);
    EXPECT_TRUE(account->isEqual(*account));
    EXPECT_FALSE(account->isEqual(*KAAccount::initWithCSKavellAccount(nullptr)));
}

TEST_F(KAAccountQuestionsTest, SameProviderAndLoginNameAreEqual)
{
    EXPECT_TRUE(newAccount()->isEqual(*newAccount()));
    EXPECT_FALSE(newAccount()->isEqual(*newAccount(QStringLiteral("ada"), kKAProviderGoogle)));
    EXPECT_FALSE(newAccount()->isEqual(*newAccount(QStringLiteral("grace"))));
}

TEST_F(KAAccountQuestionsTest, EqualityIsCaseSensitive)
{
    EXPECT_FALSE(
        newAccount(QStringLiteral("ada@example.org"))->isEqual(*newAccount(QStringLiteral("Ada@example.org"))));
}

TEST_F(KAAccountQuestionsTest, OneUserAtBothOfTheMakersMailDomainsIsEqual)
{
    const auto one = newAccount(QStringLiteral("ada@nimbrel.example"), kKAProviderNimbrel);
    const auto other = newAccount(QStringLiteral("ada@dorvex.example"), kKAProviderNimbrel);
    EXPECT_TRUE(one->isEqual(*other));
    EXPECT_TRUE(other->isEqual(*one));
    EXPECT_TRUE(one->isEqual(*newAccount(QStringLiteral("ada@nimbrel.example"), kKAProviderNimbrel)));
}

TEST_F(KAAccountQuestionsTest, TheOtherMailDomainsAddressIsInLowerCaseAndComparedAsItStands)
{
    const auto one = newAccount(QStringLiteral("Ada@Nimbrel.example"), kKAProviderNimbrel);
    EXPECT_TRUE(one->isEqual(*newAccount(QStringLiteral("ada@dorvex.example"), kKAProviderNimbrel)));
    EXPECT_FALSE(one->isEqual(*newAccount(QStringLiteral("Ada@dorvex.example"), kKAProviderNimbrel)));
    EXPECT_FALSE(one->isEqual(*newAccount(QStringLiteral("ada@nimbrel.example"), kKAProviderNimbrel)));
}

TEST_F(KAAccountQuestionsTest, OneUserAtBothMailDomainsWithDifferentProvidersIsNotEqual)
{
    const auto one = newAccount(QStringLiteral("ada@nimbrel.example"), kKAProviderNimbrel);
    EXPECT_FALSE(one->isEqual(*newAccount(QStringLiteral("ada@dorvex.example"), kKAProviderMail)));
}

TEST_F(KAAccountQuestionsTest, DifferentUsersAtTheMakersMailDomainsAreNotEqual)
{
    const auto one = newAccount(QStringLiteral("ada@nimbrel.example"), kKAProviderNimbrel);
    EXPECT_FALSE(one->isEqual(*newAccount(QStringLiteral("grace@dorvex.example"), kKAProviderNimbrel)));
    EXPECT_FALSE(one->isEqual(*newAccount(QStringLiteral("ada@example.org"), kKAProviderNimbrel)));
}

TEST_F(KAAccountQuestionsTest, TheDescriptionNamesTheAccountAndItsAttributes)
{
    const auto account = newAccount(QStringLiteral("ada@example.org"));
    account->setUID(QStringLiteral("uid-1"));
    account->setProviderAttributes({{QStringLiteral("port"), 993}, {QStringLiteral("useSSL"), true}});
    EXPECT_EQ(descriptionOf(*account),
              QStringLiteral(" -- uid: uid-1; loginName: ada@example.org; provider: com.corvane.account.mail"
                             "\n\taccount ID: ada@example.org"
                             "\n\tprovider attrs: {port = 993; useSSL = 1;}"));
}

TEST_F(KAAccountQuestionsTest, TheDescriptionOfAnAccountOverNoRecordSaysSo)
{
    EXPECT_EQ(descriptionOf(*KAAccount::initWithCSKavellAccount(nullptr)),
              QStringLiteral(" -- uid: (null); loginName: (null); provider: (null)"
                             "\n\taccount ID: (null)\n\tprovider attrs: {}"));
}

TEST_F(KAAccountQuestionsTest, TheDescriptionMasksThePasswordOnly)
{
    const auto account = newAccount(QStringLiteral("ada@example.org"));
    account->setProviderAttributes(
        {{QStringLiteral("password"), QStringLiteral("secret")}, {QStringLiteral("token"), QStringLiteral("shown")}});
    EXPECT_TRUE(
        descriptionOf(*account).endsWith(QStringLiteral("\n\tprovider attrs: {password = ***; token = shown;}")));
    EXPECT_EQ(account->providerAttributeForKey(QStringLiteral("password")), QVariant(QStringLiteral("secret")));
}

TEST_F(KAAccountQuestionsTest, TheDescriptionShowsAnEmptyPasswordAndOneThatIsNoText)
{
    const auto account = newAccount(QStringLiteral("ada@example.org"));
    account->setProviderAttribute(QStringLiteral(""), QStringLiteral("password"));
    EXPECT_TRUE(descriptionOf(*account).endsWith(QStringLiteral("\n\tprovider attrs: {password = ;}")));
    account->setProviderAttribute(7, QStringLiteral("password"));
    EXPECT_TRUE(descriptionOf(*account).endsWith(QStringLiteral("\n\tprovider attrs: {password = 7;}")));
}

TEST_F(KAAccountQuestionsTest, ThePercentSignsOfAValueAreShownAsTheyAre)
{
    const auto account = newAccount(QStringLiteral("ada%1@example.org"));
    account->setProviderAttribute(QStringLiteral("%2"), QStringLiteral("name"));
    EXPECT_TRUE(descriptionOf(*account).contains(QStringLiteral("loginName: ada%1@example.org; provider: ")));
}
