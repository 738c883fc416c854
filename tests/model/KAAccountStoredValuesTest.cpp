// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The side store of accounts.

#include <QtCore/QRect>
#include <QtCore/QStringList>

#include "tests/model/account_fixture.h"
#include "tests/support/log_capture.h"
#include "tests/support/process.h"

using namespace kavell::test;

namespace {

const QString kKey = QStringLiteral("key");
const QString kAccounts = QStringLiteral("Accounts");

class KAAccountStoredValuesTest : public AccountTest {
protected:
    /// Stores a value for an account in a process of its own.
    static void storeInAnotherProcess(const QString &loginName, const QVariant &value)
    {
        ChildProcess other([&] {
            newAccount(loginName)->storeValue(value, kKey);
            return 0;
        });
        ASSERT_EQ(other.wait(), 0);
    }
};

QVariant accountsInPreferences()
{
    return KADefaults::shared()->objectForKey(kAccounts);
}

}  // namespace

TEST_F(KAAccountStoredValuesTest, AStoredValueIsReadBack)
{
    const auto account = newAccount();
    account->storeValue(QStringLiteral("value"), kKey);
    EXPECT_EQ(account->storedValueForKey(kKey), QVariant(QStringLiteral("value")));
    EXPECT_EQ(accountsInPreferences(),
              QVariant(QVariantMap{{QStringLiteral("ada"), QVariantMap{{kKey, QStringLiteral("value")}}}}));
}

TEST_F(KAAccountStoredValuesTest, AStoredValueIsOnTheDiskAtOnce)
{
    newAccount()->storeValue(1, kKey);
    EXPECT_TRUE(std::filesystem::exists(homePath("config/com.corvane.kavellaccounts.plist")));
}

TEST_F(KAAccountStoredValuesTest, StoringKeepsTheOtherKeysAndTheOtherAccounts)
{
    newAccount(QStringLiteral("grace"))->storeValue(1, kKey);
    const auto account = newAccount();
    account->storeValue(2, kKey);
    account->storeValue(3, QStringLiteral("other"));
    EXPECT_EQ(account->storedValueForKey(kKey), QVariant(2));
    EXPECT_EQ(newAccount(QStringLiteral("grace"))->storedValueForKey(kKey), QVariant(1));
}

TEST_F(KAAccountStoredValuesTest, StoringKeepsWhatAnotherProcessStoredMeanwhile)
{
    const auto account = newAccount();
    account->storeValue(1, kKey);
    storeInAnotherProcess(QStringLiteral("grace"), 2);
    account->storeValue(3, QStringLiteral("other"));
    EXPECT_EQ(accountsInPreferences(),
              QVariant(QVariantMap{{QStringLiteral("ada"), QVariantMap{{kKey, 1}, {QStringLiteral("other"), 3}}},
                                   {QStringLiteral("grace"), QVariantMap{{kKey, 2}}}}));
}

TEST_F(KAAccountStoredValuesTest, RemovingStoredDataKeepsWhatAnotherProcessStoredMeanwhile)
{
    const auto account = newAccount();
    account->storeValue(1, kKey);
    storeInAnotherProcess(QStringLiteral("grace"), 2);
    account->removeStoredData();
    EXPECT_EQ(accountsInPreferences(), QVariant(QVariantMap{{QStringLiteral("grace"), QVariantMap{{kKey, 2}}}}));
}

TEST_F(KAAccountStoredValuesTest, RemovingStoredDataFindsWhatOnlyAnotherProcessStored)
{
    const auto account = newAccount();
    storeInAnotherProcess(QStringLiteral("ada"), 1);
    account->removeStoredData();
    EXPECT_EQ(accountsInPreferences(), QVariant(QVariantMap()));
}

TEST_F(KAAccountStoredValuesTest, PreferencesThatCannotBeReadAreSaidOnceAndTheValueIsKeptForTheNextTime)
{
    const std::string path = homePath("config/com.corvane.kavellaccounts.plist");
    std::filesystem::create_directories(path);
    const auto account = newAccount();
    {
        const LogCapture capture;
        account->storeValue(1, kKey);
        EXPECT_EQ(capture.messages(), QStringList(QStringLiteral("Cannot read the preferences file ") +
                                                  QString::fromStdString(path) + QStringLiteral(": Invalid argument")));
    }
    EXPECT_EQ(account->storedValueForKey(kKey), QVariant(1));
    std::filesystem::remove(path);
    EXPECT_TRUE(KADefaults::shared()->synchronize());
    EXPECT_TRUE(std::filesystem::is_regular_file(path));
    EXPECT_EQ(account->storedValueForKey(kKey), QVariant(1));
}

TEST_F(KAAccountStoredValuesTest, AccountsOfOneLoginNameShareTheirStoredValues)
{
    newAccount(QStringLiteral("ada"), kKAProviderMail)->storeValue(1, kKey);
    EXPECT_EQ(newAccount(QStringLiteral("ada"), kKAProviderGoogle)->storedValueForKey(kKey), QVariant(1));
}

TEST_F(KAAccountStoredValuesTest, StoringNothingRemovesTheKey)
{
    const auto account = newAccount();
    account->storeValue(1, kKey);
    account->storeValue(QVariant(), kKey);
    EXPECT_FALSE(account->storedValueForKey(kKey).isValid());
}

TEST_F(KAAccountStoredValuesTest, StoringNothingInAnAccountWithoutEntryMakesTheEmptyEntry)
{
    newAccount()->storeValue(QVariant(), kKey);
    EXPECT_EQ(accountsInPreferences(), QVariant(QVariantMap{{QStringLiteral("ada"), QVariantMap()}}));
}

TEST_F(KAAccountStoredValuesTest, AnAccountWithoutEntryHasNoStoredValue)
{
    EXPECT_FALSE(newAccount()->storedValueForKey(kKey).isValid());
    newAccount(QStringLiteral("grace"))->storeValue(1, kKey);
    EXPECT_FALSE(newAccount()->storedValueForKey(kKey).isValid());
}

TEST_F(KAAccountStoredValuesTest, AValueThatCannotBeStoredIsRefusedWithItsKeyNamed)
{
    const LogCapture capture;
    newAccount()->storeValue(QRect(), kKey);
    EXPECT_FALSE(accountsInPreferences().isValid());
    EXPECT_EQ(capture.messages(),
              QStringList(QStringLiteral("Refused to store a value for \"key\": QRect is no type of a property list")));
}

TEST_F(KAAccountStoredValuesTest, AValueThatIsTooDeepInItsPlaceIsRefusedWithItsKeyNamed)
{
    const auto account = newAccount();
    QVariant value = 1;
    for (int level = 0; level < 238; ++level)
        value = QVariantList{value};
    account->storeValue(value, kKey);
    EXPECT_TRUE(account->storedValueForKey(kKey).isValid());
    const LogCapture capture;
    account->storeValue(QVariantList{value}, QStringLiteral("deeper"));
    EXPECT_FALSE(account->storedValueForKey(QStringLiteral("deeper")).isValid());
    EXPECT_EQ(capture.messages(),
              QStringList(QStringLiteral("Refused to store a value for \"deeper\": QVariantList nested too deeply")));
}

TEST_F(KAAccountStoredValuesTest, RemovingStoredDataRemovesTheWholeEntryOnly)
{
    const auto account = newAccount();
    account->storeValue(1, kKey);
    newAccount(QStringLiteral("grace"))->storeValue(2, kKey);
    account->removeStoredData();
    EXPECT_EQ(accountsInPreferences(), QVariant(QVariantMap{{QStringLiteral("grace"), QVariantMap{{kKey, 2}}}}));
}

TEST_F(KAAccountStoredValuesTest, RemovingTheLastEntryLeavesAnEmptyDictionary)
{
    const auto account = newAccount();
    account->storeValue(1, kKey);
    account->removeStoredData();
    EXPECT_EQ(accountsInPreferences(), QVariant(QVariantMap()));
}

TEST_F(KAAccountStoredValuesTest, RemovingWhereNothingWasStoredWritesNothing)
{
    newAccount()->removeStoredData();
    EXPECT_FALSE(accountsInPreferences().isValid());
    EXPECT_FALSE(std::filesystem::exists(homePath("config/com.corvane.kavellaccounts.plist")));
}

TEST_F(KAAccountStoredValuesTest, AnAccountOverNoRecordHasNoEntryNotEvenTheEmptyNames)
{
    const QVariantMap foreign{{QStringLiteral(""), QVariantMap{{kKey, 1}}}};
    KADefaults::shared()->setObject(foreign, kAccounts);
    const auto account = KAAccount::initWithCSKavellAccount(nullptr);
    EXPECT_FALSE(account->storedValueForKey(kKey).isValid());
    account->storeValue(2, kKey);
    account->removeStoredData();
    account->mergeStoredData();
    EXPECT_EQ(accountsInPreferences(), QVariant(foreign));
}

TEST_F(KAAccountStoredValuesTest, MergingSetsWhatTheAccountHasNoValueFor)
{
    const auto account = newAccount();
    commit(account);
    account->storeValue(QStringLiteral("stored"), kKey);
    account->mergeStoredData();
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(QStringLiteral("stored")));
    EXPECT_TRUE(account->hasPendingChanges());
}

TEST_F(KAAccountStoredValuesTest, MergingNeverOverwritesAnAttribute)
{
    const auto account = newAccount();
    account->setProviderAttribute(QStringLiteral(""), kKey);
    account->storeValue(QStringLiteral("stored"), kKey);
    account->mergeStoredData();
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(QStringLiteral("")));
}

TEST_F(KAAccountStoredValuesTest, MergingWithoutStoredDataChangesNothing)
{
    const auto account = newAccount();
    commit(account);
    account->mergeStoredData();
    EXPECT_FALSE(account->hasPendingChanges());
}
