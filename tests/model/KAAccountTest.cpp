// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account as a face of its record.

#include <kavellaccounts/KAAccount.h>

#include <typeinfo>

#include <QtCore/QRect>
#include <QtCore/QStringList>
#include <QtCore/QUrl>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KANimbrelAccount.h>

#include "tests/model/account_fixture.h"
#include "tests/support/log_capture.h"
#include "tests/support/standard_error_capture.h"

using namespace kavell;
using namespace kavell::test;

namespace {

const QString kKey = QStringLiteral("key");
const QString kMailService = QStringLiteral("com.corvane.service.Mail");

using KAAccountTest = AccountTest;
using KAAccountPasswordTest = AccountWithVaultTest;

Ref<CSKavellAccountRef> record(const char *providerType, const char *loginName = "ada")
{
    return adopt(_CSKavellAccountCreate(nullptr, makeString(providerType).get(), makeString(loginName).get()));
}

const std::type_info &classOf(const KAAccount &account)
{
    return typeid(account);
}

std::string attributeOf(CSKavellAccountRef account, const char *key)
{
    const auto value = adopt(_CSKavellAccountCopyProviderAttribute(account, makeString(key).get()));
    return toStdString(cast<CSKavellStringRef>(value.get(), CSKavellStringGetTypeID()));
}

}  // namespace

TEST_F(KAAccountTest, AnAccountOfTheOnlineServiceIsOfItsOwnClass)
{
    const auto account = KAAccount::accountWithProviderType(kKAProviderNimbrel, QStringLiteral("ada"));
    EXPECT_TRUE(std::dynamic_pointer_cast<KANimbrelAccount>(account));
    EXPECT_EQ(account->provider(), QStringLiteral("com.corvane.account.nimbrel"));
}

TEST_F(KAAccountTest, AnAccountOfAnotherProviderIsAPlainOne)
{
    const auto account = KAAccount::accountWithProviderType(kKAProviderQuillane, QStringLiteral("ada"));
    EXPECT_EQ(classOf(*account), typeid(KAAccount));
    EXPECT_EQ(account->provider(), QStringLiteral("com.corvane.account.placeholder"));
    EXPECT_EQ(account->loginName(), QStringLiteral("ada"));
}

TEST_F(KAAccountTest, ARecordOfTheOnlineServiceGetsItsClass)
{
    const auto account = KAAccount::accountWithCSKavellAccount(record("com.corvane.account.nimbrel").get());
    EXPECT_TRUE(std::dynamic_pointer_cast<KANimbrelAccount>(account));
}

TEST_F(KAAccountTest, ARecordOfTheNewerOnlineServiceGetsThePlainClass)
{
    const auto account = KAAccount::accountWithCSKavellAccount(record("com.corvane.account.placeholder").get());
    ASSERT_TRUE(account);
    EXPECT_EQ(classOf(*account), typeid(KAAccount));
}

TEST_F(KAAccountTest, NoRecordGivesNoAccount)
{
    EXPECT_FALSE(KAAccount::accountWithCSKavellAccount(nullptr));
}

TEST_F(KAAccountTest, ANullOrEmptyNameGivesNoAccount)
{
    StandardErrorCapture capture;
    EXPECT_FALSE(KAAccount::accountWithProviderType(QString(), QStringLiteral("ada")));
    EXPECT_FALSE(KAAccount::accountWithProviderType(QStringLiteral(""), QStringLiteral("ada")));
    EXPECT_FALSE(KAAccount::accountWithProviderType(kKAProviderMail, QString()));
    EXPECT_FALSE(KAAccount::initWithProviderType(kKAProviderMail, QStringLiteral("")));
    EXPECT_FALSE(KAAccount::accountWithProviderType(kKAProviderNimbrel, QString()));
}

TEST_F(KAAccountTest, ThePlainInitialisersMakePlainAccounts)
{
    const auto made = KAAccount::initWithProviderType(kKAProviderNimbrel, QStringLiteral("ada"));
    EXPECT_EQ(classOf(*made), typeid(KAAccount));
    const auto wrapped = KAAccount::initWithCSKavellAccount(record("com.corvane.account.nimbrel").get());
    EXPECT_EQ(classOf(*wrapped), typeid(KAAccount));
}

TEST_F(KAAccountTest, LocalStorageIsNeverUsed)
{
    EXPECT_FALSE(KAAccount::useLocalStorage());
}

TEST_F(KAAccountTest, TheRecordIsKeptAliveAndHandedOutAsItIs)
{
    auto wrapped = record("com.corvane.account.mail");
    const CSKavellAccountRef pointer = wrapped.get();
    const auto account = KAAccount::initWithCSKavellAccount(pointer);
    wrapped = nullptr;
    EXPECT_EQ(account->accountRef(), pointer);
    EXPECT_EQ(account->loginName(), QStringLiteral("ada"));
}

TEST_F(KAAccountTest, AnAccountOverNoRecordAnswersNothing)
{
    const auto account = KAAccount::initWithCSKavellAccount(nullptr);
    EXPECT_TRUE(account->provider().isNull());
    EXPECT_TRUE(account->loginName().isNull());
    EXPECT_TRUE(account->uid().isNull());
    EXPECT_TRUE(account->providerAttributes().isEmpty());
    EXPECT_FALSE(account->hasPendingChanges());
}

TEST_F(KAAccountTest, SeveralAccountsMayShowOneRecord)
{
    const auto wrapped = record("com.corvane.account.mail");
    const auto one = KAAccount::accountWithCSKavellAccount(wrapped.get());
    const auto other = KAAccount::accountWithCSKavellAccount(wrapped.get());
    one->setProviderAttribute(1, kKey);
    EXPECT_EQ(other->providerAttributeForKey(kKey), QVariant(1));
}

TEST_F(KAAccountTest, AFreshAccountHasAUUIDWhichCanBeReplaced)
{
    const auto account = newAccount();
    EXPECT_EQ(account->uid().size(), 36);
    account->setUID(QStringLiteral("my-uid"));
    EXPECT_EQ(account->uid(), QStringLiteral("my-uid"));
}

TEST_F(KAAccountTest, ANullUUIDTakesAReplacementBackAndAnEmptyOneReplaces)
{
    const auto account = newAccount();
    const QString own = account->uid();
    account->setUID(QStringLiteral("my-uid"));
    account->setUID(QString());
    EXPECT_EQ(account->uid(), own);
    account->setUID(QStringLiteral(""));
    EXPECT_TRUE(account->uid().isEmpty());
    EXPECT_FALSE(account->uid().isNull());
}

TEST_F(KAAccountTest, TheFullNameIsAProviderAttribute)
{
    const auto account = newAccount();
    EXPECT_TRUE(account->fullName().isNull());
    account->setFullName(QStringLiteral("Ada Lovelace"));
    EXPECT_EQ(account->fullName(), QStringLiteral("Ada Lovelace"));
    EXPECT_EQ(attributeOf(account->accountRef(), "com.corvane.provider.fullname"), "Ada Lovelace");
    account->setFullName(QString());
    EXPECT_FALSE(account->providerAttributes().contains(QStringLiteral("com.corvane.provider.fullname")));
}

TEST_F(KAAccountTest, TheNicknameReadsTheFullNameDeliberately)
{
    const auto account = newAccount();
    account->setNickname(QStringLiteral("Countess"));
    EXPECT_TRUE(account->nickname().isNull());
    account->setFullName(QStringLiteral("Ada Lovelace"));
    EXPECT_EQ(account->nickname(), QStringLiteral("Ada Lovelace"));
    EXPECT_EQ(attributeOf(account->accountRef(), "com.corvane.provider.nickname"), "Countess");
}

TEST_F(KAAccountTest, ProviderAttributesAreSetReadAndRemovedByKey)
{
    const auto account = newAccount();
    EXPECT_FALSE(account->providerAttributeForKey(kKey).isValid());
    account->setProviderAttribute(QStringLiteral("value"), kKey);
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(QStringLiteral("value")));
    account->removeProviderAttributeForKey(kKey);
    EXPECT_FALSE(account->providerAttributeForKey(kKey).isValid());
}

TEST_F(KAAccountTest, SettingANullValueRemovesTheKey)
{
    const auto account = newAccount();
    account->setProviderAttribute(1, kKey);
    account->setProviderAttribute(QVariant(), kKey);
    EXPECT_FALSE(account->providerAttributes().contains(kKey));
    account->setProviderAttribute(1, kKey);
    account->setProviderAttribute(QString(), kKey);
    EXPECT_FALSE(account->providerAttributes().contains(kKey));
}

TEST_F(KAAccountTest, AnEmptyTextIsAValue)
{
    const auto account = newAccount();
    account->setProviderAttribute(QStringLiteral(""), kKey);
    EXPECT_TRUE(account->providerAttributes().contains(kKey));
    EXPECT_FALSE(account->providerAttributeForKey(kKey).toString().isNull());
}

TEST_F(KAAccountTest, ProviderAttributesAreReplacedAndRemovedAsAWhole)
{
    const auto account = newAccount();
    account->setProviderAttribute(1, kKey);
    account->setProviderAttributes({{QStringLiteral("other"), 2}});
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{QStringLiteral("other"), 2}}));
    account->removeAllProviderAttributes();
    EXPECT_TRUE(account->providerAttributes().isEmpty());
}

TEST_F(KAAccountTest, ChangingAnAnsweredDictionaryChangesNothing)
{
    const auto account = newAccount();
    account->setProviderAttribute(QVariantMap{{kKey, 1}}, kKey);
    QVariantMap answer = account->providerAttributes();
    answer.clear();
    QVariantMap value = account->providerAttributeForKey(kKey).toMap();
    value.insert(kKey, 2);
    EXPECT_EQ(account->providerAttributeForKey(kKey).toMap().value(kKey), QVariant(1));
}

TEST_F(KAAccountTest, AServicesAttributesAreItsOwn)
{
    const auto account = newAccount();
    account->setAttribute(25, kKey, kMailService);
    EXPECT_EQ(account->attributeForKey(kKey, kMailService), QVariant(25));
    EXPECT_FALSE(account->attributeForKey(kKey, QStringLiteral("com.corvane.service.CalDAV")).isValid());
    EXPECT_FALSE(account->providerAttributeForKey(kKey).isValid());
    EXPECT_EQ(account->attributesForService(kMailService), QVariantMap({{kKey, 25}}));
    account->removeAttributeForKey(kKey, kMailService);
    EXPECT_FALSE(account->attributeForKey(kKey, kMailService).isValid());
}

TEST_F(KAAccountTest, ANullServiceIsTheAccountItselfAndAnEmptyOneIsNot)
{
    const auto account = newAccount();
    account->setAttribute(1, kKey, QString());
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(1));
    EXPECT_EQ(account->attributeForKey(kKey, QString()), QVariant(1));
    EXPECT_FALSE(account->attributeForKey(kKey, QStringLiteral("")).isValid());
    account->setAttributes({{QStringLiteral("other"), 2}}, QString());
    EXPECT_EQ(account->providerAttributes(), account->attributesForService(QString()));
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{QStringLiteral("other"), 2}}));
    account->removeAttributeForKey(QStringLiteral("other"), QString());
    account->setAttribute(1, kKey, QString());
    account->removeAllAttributesForService(QString());
    EXPECT_TRUE(account->providerAttributes().isEmpty());
}

TEST_F(KAAccountTest, AServicesAttributesAreReplacedAndRemovedAsAWhole)
{
    const auto account = newAccount();
    account->setAttribute(25, kKey, kMailService);
    account->setAttributes({{QStringLiteral("other"), true}}, kMailService);
    EXPECT_EQ(account->attributesForService(kMailService), QVariantMap({{QStringLiteral("other"), true}}));
    account->setAttribute(QVariant(), QStringLiteral("other"), kMailService);
    EXPECT_TRUE(account->attributesForService(kMailService).isEmpty());
    account->setAttribute(25, kKey, kMailService);
    account->removeAllAttributesForService(kMailService);
    EXPECT_TRUE(account->attributesForService(kMailService).isEmpty());
}

TEST_F(KAAccountTest, AURLIsKeptAsItsAbsoluteText)
{
    const auto account = newAccount();
    account->setProviderAttribute(QUrl(QStringLiteral("https://example.org/a b")), kKey);
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(QStringLiteral("https://example.org/a%20b")));
}

TEST_F(KAAccountTest, AValueThatCannotBeSavedIsRefusedAndTheRecordLeftAsItWas)
{
    const auto account = newAccount();
    account->setProviderAttribute(1, kKey);
    const LogCapture capture;
    account->setProviderAttribute(QRect(), kKey);
    account->setProviderAttributes({{QStringLiteral("good"), 2}, {QStringLiteral("bad"), QVariantList{QRect()}}});
    account->setAttribute(QStringLiteral("\u0001"), kKey, kMailService);
    account->setAttributes({{kKey, QRect()}}, kMailService);
    account->setAttribute(1, kKey, QStringLiteral("service\u0001"));
    account->setUID(QStringLiteral("\u0002"));
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{kKey, 1}}));
    EXPECT_TRUE(account->attributesForService(kMailService).isEmpty());
    EXPECT_EQ(account->uid().size(), 36);
    EXPECT_EQ(capture.messages(),
              QStringList({QStringLiteral("Refused to store a value for \"key\": QRect is no type of a property list"),
                           QStringLiteral("Refused to store a value for \"bad\": QRect is no type of a property list"),
                           QStringLiteral("Refused to store a value for \"key\": QString with control characters"),
                           QStringLiteral("Refused to store a value for \"key\": QRect is no type of a property list"),
                           QStringLiteral("Refused to store a value for \"service\uFFFD\": QString with control "
                                          "characters"),
                           QStringLiteral("Refused to store a value for \"uid\": QString with control characters")}));
}

TEST_F(KAAccountTest, ANullKeyIsIgnored)
{
    const auto account = newAccount();
    account->setProviderAttribute(1, QString());
    account->setVolatileAttribute(1, QString());
    account->storeValue(1, QString());
    EXPECT_TRUE(account->providerAttributes().isEmpty());
    EXPECT_FALSE(account->volatileAttributeForKey(QStringLiteral("")).isValid());
    EXPECT_FALSE(KADefaults::shared()->objectForKey(QStringLiteral("Accounts")).isValid());
}

TEST_F(KAAccountTest, ANullKeyNamesNothingNotEvenTheEmptyKey)
{
    const auto account = newAccount();
    const QString empty = QStringLiteral("");
    account->setProviderAttribute(1, empty);
    account->setAttribute(2, empty, kMailService);
    account->setVolatileAttribute(3, empty);
    account->storeValue(4, empty);
    EXPECT_FALSE(account->providerAttributeForKey(QString()).isValid());
    EXPECT_FALSE(account->attributeForKey(QString(), kMailService).isValid());
    EXPECT_FALSE(account->volatileAttributeForKey(QString()).isValid());
    EXPECT_FALSE(account->storedValueForKey(QString()).isValid());
    account->removeProviderAttributeForKey(QString());
    account->setVolatileAttribute(QVariant(), QString());
    account->storeValue(QVariant(), QString());
    EXPECT_EQ(account->providerAttributeForKey(empty), QVariant(1));
    EXPECT_EQ(account->volatileAttributeForKey(empty), QVariant(3));
    EXPECT_EQ(account->storedValueForKey(empty), QVariant(4));
}

TEST_F(KAAccountTest, ChangesStayPendingUntilTheRecordIsCommitted)
{
    const auto account = newAccount();
    commit(account);
    EXPECT_FALSE(account->hasPendingChanges());
    account->setProviderAttribute(1, kKey);
    EXPECT_TRUE(account->hasPendingChanges());
    account->commitPendingChanges();
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_FALSE(newAccount()->providerAttributeForKey(kKey).isValid());
    commit(account);
    EXPECT_FALSE(account->hasPendingChanges());
    EXPECT_EQ(newAccount()->providerAttributeForKey(kKey), QVariant(1));
}

TEST_F(KAAccountTest, PendingChangesCanBeDropped)
{
    const auto account = newAccount();
    account->setProviderAttribute(1, kKey);
    commit(account);
    account->setProviderAttribute(2, kKey);
    account->cancelPendingChanges();
    EXPECT_EQ(account->providerAttributeForKey(kKey), QVariant(1));
    EXPECT_FALSE(account->hasPendingChanges());
}

TEST_F(KAAccountTest, RemovingAnAccountByItselfDoesNothing)
{
    const auto account = newAccount();
    commit(account);
    account->removeAccount();
    EXPECT_FALSE(account->hasPendingChanges());
    commit(account);
    EXPECT_TRUE(std::filesystem::exists(dataFilePath("com.corvane.account.mail", "ada")));
}

TEST_F(KAAccountTest, VolatileAttributesBelongToTheObjectAlone)
{
    const auto wrapped = record("com.corvane.account.mail");
    const auto one = KAAccount::accountWithCSKavellAccount(wrapped.get());
    const auto other = KAAccount::accountWithCSKavellAccount(wrapped.get());
    EXPECT_FALSE(one->volatileAttributeForKey(kKey).isValid());
    one->setVolatileAttribute(QRect(1, 2, 3, 4), kKey);
    EXPECT_EQ(one->volatileAttributeForKey(kKey), QVariant(QRect(1, 2, 3, 4)));
    EXPECT_FALSE(other->volatileAttributeForKey(kKey).isValid());
    EXPECT_FALSE(one->providerAttributes().contains(kKey));
    one->setVolatileAttribute(QVariant(), kKey);
    EXPECT_FALSE(one->volatileAttributeForKey(kKey).isValid());
}

TEST_F(KAAccountTest, TheFieldsAreTheRecordAndTheVolatileAttributes)
{
    const auto account = newAccount();
    KAFieldList before;
    account->describeFields(before);
    ASSERT_EQ(before.fields().size(), 2u);
    EXPECT_EQ(before.fields()[0].name, QStringLiteral("_accountRef"));
    EXPECT_EQ(before.fields()[0].encoding, QStringLiteral("^v"));
    EXPECT_EQ(before.fields()[0].pointer, account->accountRef());
    EXPECT_EQ(before.fields()[1].name, QStringLiteral("_private"));
    EXPECT_EQ(before.fields()[1].encoding, QStringLiteral("@\"QVariantMap\""));
    EXPECT_EQ(before.fields()[1].value, QStringLiteral("(null)"));
    account->setVolatileAttribute(1, kKey);
    KAFieldList after;
    account->describeFields(after);
    EXPECT_EQ(after.fields()[1].encoding, QStringLiteral("@\"QVariantMap\""));
    EXPECT_EQ(after.fields()[1].value, QStringLiteral("{key = 1;}"));
}

TEST_F(KAAccountPasswordTest, APasswordIsStoredReadAndRemoved)
{
    const auto account = newAccount();
    EXPECT_TRUE(account->password().isNull());
    EXPECT_TRUE(account->setPassword(QStringLiteral("p\u00e4ss")));
    EXPECT_EQ(account->password(), QStringLiteral("p\u00e4ss"));
    account->removePassword();
    EXPECT_TRUE(account->password().isNull());
}

TEST_F(KAAccountPasswordTest, ANullOrEmptyPasswordRemovesTheStoredOneAndFails)
{
    const auto account = newAccount();
    ASSERT_TRUE(account->setPassword(QStringLiteral("secret")));
    EXPECT_FALSE(account->setPassword(QStringLiteral("")));
    EXPECT_TRUE(account->password().isNull());
    ASSERT_TRUE(account->setPassword(QStringLiteral("secret")));
    EXPECT_FALSE(account->setPassword(QString()));
    EXPECT_TRUE(account->password().isNull());
}

TEST_F(KAAccountPasswordTest, APasswordWithHalfOfACharacterIsNotStoredAsAnother)
{
    const auto account = newAccount();
    ASSERT_TRUE(account->setPassword(QStringLiteral("secret")));
    EXPECT_FALSE(account->setPassword(QStringLiteral("half ") + QChar(0xD83D)));
    EXPECT_EQ(account->password(), QStringLiteral("secret"));
    EXPECT_TRUE(account->setPassword(QStringLiteral("whole \U0001F511")));
    EXPECT_EQ(account->password(), QStringLiteral("whole \U0001F511"));
}

TEST_F(KAAccountPasswordTest, TheItemIsOwnedByTheCallerAndCanBeGivenToAnotherAccount)
{
    const auto account = newAccount();
    EXPECT_FALSE(adopt(account->cofferelItem()));
    ASSERT_TRUE(account->setPassword(QStringLiteral("secret")));
    const auto item = adopt(account->cofferelItem());
    ASSERT_TRUE(item);
    const auto other = newAccount(QStringLiteral("grace"));
    other->setCofferelItem(item.get());
    EXPECT_EQ(other->password(), QStringLiteral("secret"));
    other->setCofferelItem(nullptr);
    EXPECT_TRUE(other->password().isNull());
}
