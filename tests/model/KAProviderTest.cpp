// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAProvider.h>

#include <QtCore/QStringList>

#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KANimbrelAccount.h>

#include "tests/model/account_fixture.h"
#include "tests/support/process.h"
#include "tests/support/standard_error_capture.h"

using namespace kavell::test;

namespace {

class KAProviderTest : public AccountTest {
protected:
    /// A provider whose accounts of these login names are on the disk.
    static std::shared_ptr<KAProvider> providerWith(const QStringList &loginNames)
    {
        for (const QString &loginName : loginNames)
            commit(newAccount(loginName));
        return KAProvider::initWithProviderType(kKAProviderMail);
    }

    static QStringList loginNamesOf(const KAProvider &provider)
    {
        QStringList loginNames;
        for (const auto &account : provider.accounts())
            loginNames += account->loginName();
        loginNames.sort();
        return loginNames;
    }

    /// A provider over no record.
    static std::shared_ptr<KAProvider> providerWithoutRecord()
    {
        StandardErrorCapture capture;
        return KAProvider::initWithProviderType(QString());
    }
};

}  // namespace

TEST_F(KAProviderTest, TheWellKnownProvidersAreMadeAnewOnEveryCall)
{
    EXPECT_EQ(KAProvider::exchangeProvider()->providerType(), QStringLiteral("com.corvane.account.exchange"));
    EXPECT_EQ(KAProvider::facebookProvider()->providerType(), QStringLiteral("com.corvane.account.facebook"));
    EXPECT_EQ(KAProvider::nimbrelProvider()->providerType(), QStringLiteral("com.corvane.account.nimbrel"));
    EXPECT_EQ(KAProvider::googleProvider()->providerType(), QStringLiteral("com.corvane.account.google"));
    EXPECT_EQ(KAProvider::yahooProvider()->providerType(), QStringLiteral("com.corvane.account.yahoo"));
    EXPECT_NE(KAProvider::googleProvider(), KAProvider::googleProvider());
}

TEST_F(KAProviderTest, ServiceTypesAreEmptyUntilTheyAreSet)
{
    const auto provider = KAProvider::googleProvider();
    EXPECT_TRUE(provider->serviceTypesProvided().isEmpty());
    provider->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCalDAV});
    EXPECT_EQ(provider->serviceTypesProvided(),
              QStringList({QStringLiteral("kKAServiceIMAP"), QStringLiteral("kKAServiceCalDAV")}));
}

TEST_F(KAProviderTest, TheDescriptionNamesTheProviderType)
{
    const auto provider = KAProvider::googleProvider();
    const QString address = QString::number(reinterpret_cast<quintptr>(provider.get()), 16);
    EXPECT_EQ(provider->description(), QStringLiteral("<KAProvider: 0x") + address +
                                           QStringLiteral("> providerType: com.corvane.account.google"));
}

TEST_F(KAProviderTest, TheRootHostsOfTheMailProviders)
{
    struct Row {
        const char *providerType;
        const char *host;
    };
    constexpr Row kRows[] = {
        {"com.corvane.account.yahoo", "yahoo.com"},
        {"com.corvane.account.google", "gmail.com"},
        {"com.corvane.account.nimbrel", "nimbrel.example"},
        {"com.corvane.account.aol", "aol.com"},
    };
    for (const Row &row : kRows)
        EXPECT_EQ(KAProvider::initWithProviderType(QString::fromLatin1(row.providerType))->rootHost(),
                  QString::fromLatin1(row.host));
}

TEST_F(KAProviderTest, OtherProvidersHaveNoRootHost)
{
    for (const char *providerType :
         {"com.corvane.account.mail", "com.corvane.account.exchange", "com.corvane.account.facebook",
          "com.corvane.account.placeholder", "com.corvane.account.haldenserver", "com.corvane.account.testing"})
        EXPECT_TRUE(KAProvider::initWithProviderType(QString::fromLatin1(providerType))->rootHost().isNull())
            << providerType;
}

TEST_F(KAProviderTest, ItsAccountsAreThoseOnTheDisk)
{
    EXPECT_EQ(loginNamesOf(*providerWith({QStringLiteral("ada"), QStringLiteral("grace")})),
              QStringList({QStringLiteral("ada"), QStringLiteral("grace")}));
}

TEST_F(KAProviderTest, AccountsAreNewObjectsOverTheSameRecordsOnEveryCall)
{
    const auto provider = providerWith({QStringLiteral("ada")});
    const auto first = provider->accounts(), second = provider->accounts();
    ASSERT_EQ(first.size(), 1);
    ASSERT_EQ(second.size(), 1);
    EXPECT_NE(first[0], second[0]);
    EXPECT_EQ(first[0]->accountRef(), second[0]->accountRef());
}

TEST_F(KAProviderTest, AccountsOfTheOnlineServiceAreOfTheirClass)
{
    commit(newAccount(QStringLiteral("ada"), kKAProviderNimbrel));
    const auto accounts = KAProvider::nimbrelProvider()->accounts();
    ASSERT_EQ(accounts.size(), 1);
    EXPECT_TRUE(std::dynamic_pointer_cast<KANimbrelAccount>(accounts[0]));
}

TEST_F(KAProviderTest, ReloadingFindsWhatOthersSaved)
{
    const auto provider = providerWith({QStringLiteral("ada")});
    commit(newAccount(QStringLiteral("grace")));
    EXPECT_EQ(loginNamesOf(*provider), QStringList(QStringLiteral("ada")));
    provider->reloadData();
    EXPECT_EQ(loginNamesOf(*provider), QStringList({QStringLiteral("ada"), QStringLiteral("grace")}));
}

TEST_F(KAProviderTest, AnAddedAccountIsListedAndItsFileWrittenByItsCommit)
{
    const auto provider = providerWith({});
    const auto account = newAccount();
    provider->addAccount(account);
    ASSERT_EQ(provider->accounts().size(), 1);
    EXPECT_EQ(provider->accounts()[0]->accountRef(), account->accountRef());
    EXPECT_FALSE(std::filesystem::exists(dataFilePath("com.corvane.account.mail", "ada")));
    commit(account);
    EXPECT_TRUE(std::filesystem::exists(dataFilePath("com.corvane.account.mail", "ada")));
}

TEST_F(KAProviderTest, RemovingGoesByLoginNameAndIsOnTheDiskAtOnce)
{
    const auto provider = providerWith({QStringLiteral("ada"), QStringLiteral("grace")});
    provider->removeAccount(newAccount());
    EXPECT_EQ(loginNamesOf(*provider), QStringList(QStringLiteral("grace")));
    EXPECT_FALSE(std::filesystem::exists(dataFilePath("com.corvane.account.mail", "ada")));
    EXPECT_TRUE(std::filesystem::exists(dataFilePath("com.corvane.account.mail", "grace")));
}

TEST_F(KAProviderTest, NoAccountIsNeitherAddedNorRemoved)
{
    const auto provider = providerWith({QStringLiteral("ada")});
    provider->addAccount(nullptr);
    provider->removeAccount(nullptr);
    EXPECT_EQ(provider->accounts().size(), 1);
}

TEST_F(KAProviderTest, KnowsTheLoginNamesThatItHas)
{
    const auto provider = providerWith({QStringLiteral("ada")});
    EXPECT_TRUE(provider->hasAccountWithLoginName(QStringLiteral("ada")));
    EXPECT_FALSE(provider->hasAccountWithLoginName(QStringLiteral("grace")));
    EXPECT_FALSE(provider->hasAccountWithLoginName(QString()));
    EXPECT_EQ(provider->accounts().size(), 1);
}

TEST_F(KAProviderTest, ANullLoginNameGivesNoAccount)
{
    const auto provider = providerWith({});
    StandardErrorCapture capture;
    EXPECT_FALSE(provider->accountForLoginName(QString(), true));
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(provider->accounts().isEmpty());
}

TEST_F(KAProviderTest, AnUnknownLoginNameAddsNothingUnlessAskedTo)
{
    const auto provider = providerWith({});
    EXPECT_FALSE(provider->accountForLoginName(QStringLiteral("ada"), false));
    EXPECT_TRUE(provider->accounts().isEmpty());
    const auto account = provider->accountForLoginName(QStringLiteral("ada"), true);
    ASSERT_TRUE(account);
    EXPECT_EQ(account->loginName(), QStringLiteral("ada"));
    EXPECT_EQ(provider->accounts().size(), 1);
}

TEST_F(KAProviderTest, AKnownLoginNameGivesItsRecord)
{
    const auto provider = providerWith({QStringLiteral("ada")});
    const auto account = provider->accountForLoginName(QStringLiteral("ada"), false);
    ASSERT_TRUE(account);
    EXPECT_EQ(account->accountRef(), provider->accounts()[0]->accountRef());
}

TEST_F(KAProviderTest, CreatingGivesTheSameRecordOnEveryCall)
{
    const auto provider = providerWith({});
    const auto account = provider->createAccountWithLoginName(QStringLiteral("ada"));
    ASSERT_TRUE(account);
    EXPECT_EQ(provider->createAccountWithLoginName(QStringLiteral("ada"))->accountRef(), account->accountRef());
    EXPECT_EQ(provider->accounts().size(), 1);
}

TEST_F(KAProviderTest, FindsAnAccountByItsUUID)
{
    const auto provider = providerWith({QStringLiteral("ada"), QStringLiteral("grace")});
    const auto wanted = provider->accountForLoginName(QStringLiteral("grace"), false);
    const auto found = provider->accountWithUID(wanted->uid());
    ASSERT_TRUE(found);
    EXPECT_EQ(found->loginName(), QStringLiteral("grace"));
    EXPECT_FALSE(provider->accountWithUID(QStringLiteral("unknown")));
    EXPECT_FALSE(provider->accountWithUID(QString()));
}

TEST_F(KAProviderTest, OfTwoAccountsWithOneUUIDTheFirstIsFound)
{
    const auto provider = providerWith({});
    for (const QString &loginName : {QStringLiteral("ada"), QStringLiteral("grace")})
        provider->createAccountWithLoginName(loginName)->setUID(QStringLiteral("same"));
    EXPECT_EQ(provider->accountWithUID(QStringLiteral("same"))->loginName(), QStringLiteral("ada"));
}

TEST_F(KAProviderTest, ANullUUIDIsNotTheEmptyOne)
{
    const auto provider = providerWith({});
    provider->createAccountWithLoginName(QStringLiteral("ada"))->setUID(QStringLiteral(""));
    EXPECT_TRUE(provider->accountWithUID(QStringLiteral("")));
    EXPECT_FALSE(provider->accountWithUID(QString()));
}

TEST_F(KAProviderTest, FindsTheAccountThatHoldsAChild)
{
    const auto provider = providerWith({});
    for (const QString &loginName : {QStringLiteral("ada"), QStringLiteral("grace"), QStringLiteral("mary")})
        static_cast<void>(provider->createAccountWithLoginName(loginName));
    for (const auto &account : provider->accounts())
        if (account->loginName() != QStringLiteral("ada"))
            account->addChildAccountDict({{QStringLiteral("pluginID"), kKAMailPluginID}}, QStringLiteral("child"));
    const auto found = provider->aListAccountContainingChildUID(QStringLiteral("child"));
    ASSERT_TRUE(found);
    EXPECT_EQ(found->loginName(), QStringLiteral("grace"));
    EXPECT_FALSE(provider->aListAccountContainingChildUID(QStringLiteral("unknown")));
}

TEST_F(KAProviderTest, ANullChildUIDIsNotTheEmptyOne)
{
    const auto provider = KAProvider::googleProvider();
    provider->createAccountWithLoginName(QStringLiteral("ada"))->addChildAccountDict({}, QStringLiteral(""));
    EXPECT_TRUE(provider->aListAccountContainingChildUID(QStringLiteral("")));
    EXPECT_FALSE(provider->aListAccountContainingChildUID(QString()));
}

TEST_F(KAProviderTest, AProviderWithoutRecordAnswersNothing)
{
    const auto provider = providerWithoutRecord();
    ASSERT_TRUE(provider);
    EXPECT_TRUE(provider->providerType().isNull());
    EXPECT_TRUE(provider->rootHost().isNull());
    EXPECT_TRUE(provider->accounts().isEmpty());
    EXPECT_FALSE(provider->hasAccountWithLoginName(QStringLiteral("ada")));
    EXPECT_FALSE(provider->accountForLoginName(QStringLiteral("ada"), true));
    provider->addAccount(newAccount());
    provider->removeAccount(newAccount());
    provider->reloadData();
    EXPECT_TRUE(provider->description().endsWith(QStringLiteral("> providerType: (null)")));
}

TEST_F(KAProviderTest, TheFieldsAreTheRecordAndTheServiceTypes)
{
    const auto provider = KAProvider::googleProvider();
    KAFieldList before;
    provider->describeFields(before);
    ASSERT_EQ(before.fields().size(), 2u);
    EXPECT_EQ(before.fields()[0].name, QStringLiteral("_providerRef"));
    EXPECT_EQ(before.fields()[1].name, QStringLiteral("_servicesProvided"));
    EXPECT_EQ(before.fields()[1].encoding, QStringLiteral("@\"QStringList\""));
    EXPECT_EQ(before.fields()[1].value, QStringLiteral("(null)"));
    provider->setServiceTypesProvided({kKAServiceIMAP});
    KAFieldList after;
    provider->describeFields(after);
    EXPECT_EQ(after.fields()[1].encoding, QStringLiteral("@\"QStringList\""));
    EXPECT_EQ(after.fields()[1].value, QStringLiteral("(kKAServiceIMAP)"));
}
