// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The child accounts that client applications hold for an account-list account, and the applications they tell.

#include <gmock/gmock.h>

#include <kavellaccounts/KADataPlugin.h>

#include "tests/model/plugin_fixture.h"

using kavell::test::PluginDirectory;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

namespace {

const QString kMail = "com.corvane.mail.kaplugin";
const QString kCalendar = "com.corvane.calendar.kaplugin";
const QString kChildren = "com.corvane.KavellAccounts.childAccounts";

class KAAccountChildrenTest : public kavell::test::AccountWithPluginsTest {
protected:
    void SetUp() override
    {
        AccountWithPluginsTest::SetUp();
        account = newAccount("ada", kKAProviderGoogle);
    }

    /// A child of a plug-in, as the application's own settings make it.
    static QVariantMap child(const QString &uid, const QString &pluginID)
    {
        return KAAccount::childDictionaryWithSettings({{"userName", "ada"}}, uid, pluginID);
    }

    [[nodiscard]] QStringList childUIDs() const { return account->providerAttributeForKey(kChildren).toMap().keys(); }

    /// The plug-in says whether its application keeps the account inactive.
    void setInactive(const QString &pluginID, const QString &uid, const QVariant &inactive)
    {
        auto *const plugin = qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(pluginID));
        ASSERT_TRUE(plugin);
        PluginDirectory::setSettings(plugin, uid, {{"inactive", inactive}});
    }

    std::shared_ptr<KAAccount> account;
};

}  // namespace

// Making a child dictionary

TEST_F(KAAccountChildrenTest, AChildHasItsUIDItsPluginAndTheSettings)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"userName", "ada"}, {"port", 993}}, "child", kMail),
              QVariantMap({{"uid", "child"}, {"pluginID", kMail}, {"userName", "ada"}, {"port", 993}}));
}

TEST_F(KAAccountChildrenTest, PasswordAndInactiveFlagStayWithTheApplication)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"password", "secret"}, {"inactive", true}}, "child", kMail),
              QVariantMap({{"uid", "child"}, {"pluginID", kMail}}));
}

TEST_F(KAAccountChildrenTest, WithoutAUIDAChildHasNeitherUIDNorPlugin)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"userName", "ada"}}, {}, kMail),
              QVariantMap({{"userName", "ada"}}));
}

TEST_F(KAAccountChildrenTest, WithoutAPluginAChildHasItsUIDOnly)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({}, "child", {}), QVariantMap({{"uid", "child"}}));
}

TEST_F(KAAccountChildrenTest, AnEmptyUIDAndAnEmptyPluginAreValues)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({}, "", ""), QVariantMap({{"uid", ""}, {"pluginID", ""}}));
}

TEST_F(KAAccountChildrenTest, SettingsCalledUIDOrPluginIDWin)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"uid", "own"}, {"pluginID", "own.kaplugin"}}, "child", kMail),
              QVariantMap({{"uid", "own"}, {"pluginID", "own.kaplugin"}}));
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"uid", "own"}}, {}, kMail), QVariantMap({{"uid", "own"}}));
}

TEST_F(KAAccountChildrenTest, SettingsThatAreNothingAreLeftOutAndEmptyOnesKept)
{
    EXPECT_EQ(KAAccount::childDictionaryWithSettings({{"uid", QString()}, {"a", QVariant()}, {"b", ""}}, "child", {}),
              QVariantMap({{"uid", "child"}, {"b", ""}}));
}

// Keeping children

TEST_F(KAAccountChildrenTest, AChildIsKeptInOneProviderAttributeByItsUID)
{
    account->addChildAccountDict(child("child", kMail), "child");
    EXPECT_EQ(account->providerAttributes(),
              QVariantMap({{kChildren, QVariantMap{{"child", QVariantMap{{"uid", "child"},
                                                                         {"pluginID", "com.corvane.mail.kaplugin"},
                                                                         {"userName", "ada"}}}}}}));
}

TEST_F(KAAccountChildrenTest, AddingAndRemovingStayPending)
{
    commit(account);
    account->addChildAccountDict(child("child", kMail), "child");
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_FALSE(newAccount("ada", kKAProviderGoogle)->childAccountWithUID("child"));
    commit(account);
    EXPECT_TRUE(newAccount("ada", kKAProviderGoogle)->childAccountWithUID("child"));
    account->removeChildAccountWithUID("child");
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_TRUE(newAccount("ada", kKAProviderGoogle)->childAccountWithUID("child"));
}

TEST_F(KAAccountChildrenTest, ANewChildReplacesTheOtherChildOfItsPlugin)
{
    account->addChildAccountDict(child("old", kMail), "old");
    account->addChildAccountDict(child("calendar", kCalendar), "calendar");
    account->addChildAccountDict(child("new", kMail), "new");
    EXPECT_EQ(childUIDs(), QStringList({"calendar", "new"}));
}

TEST_F(KAAccountChildrenTest, ANewChildReplacesAllChildrenOfItsPluginThatOthersStored)
{
    account->setProviderAttribute(QVariantMap{{"one", child("one", kMail)}, {"two", child("two", kMail)}}, kChildren);
    account->addChildAccountDict(child("three", kMail), "three");
    EXPECT_EQ(childUIDs(), QStringList("three"));
}

TEST_F(KAAccountChildrenTest, ANewChildReplacesTheOneUnderItsUIDOfWhateverPlugin)
{
    account->addChildAccountDict(child("child", kMail), "child");
    account->addChildAccountDict(child("child", kCalendar), "child");
    EXPECT_EQ(childUIDs(), QStringList("child"));
    EXPECT_EQ(account->childAccountWithUID("child")->value("pluginID"), QVariant(kCalendar));
}

TEST_F(KAAccountChildrenTest, ChildrenWithoutAPluginReplaceNoneAndAreReplacedByNone)
{
    account->addChildAccountDict({{"uid", "one"}}, "one");
    account->addChildAccountDict({{"uid", "two"}}, "two");
    account->addChildAccountDict(child("three", ""), "three");
    EXPECT_EQ(childUIDs(), QStringList({"one", "three", "two"}));
    account->addChildAccountDict(child("four", ""), "four");
    EXPECT_EQ(childUIDs(), QStringList({"four", "one", "two"}));
}

TEST_F(KAAccountChildrenTest, AChildUnderANullUIDIsNotStored)
{
    account->addChildAccountDict(child("child", kMail), {});
    EXPECT_FALSE(account->providerAttributeForKey(kChildren).isValid());
}

TEST_F(KAAccountChildrenTest, TheUIDGivenCountsAndNotTheOneInTheChild)
{
    account->addChildAccountDict(child("inside", kMail), "given");
    EXPECT_TRUE(account->childAccountWithUID("given"));
    EXPECT_FALSE(account->childAccountWithUID("inside"));
}

// Finding children

TEST_F(KAAccountChildrenTest, AChildIsFoundByItsUID)
{
    account->addChildAccountDict(child("child", kMail), "child");
    EXPECT_EQ(account->childAccountWithUID("child"), child("child", kMail));
    EXPECT_FALSE(account->childAccountWithUID("other"));
    EXPECT_FALSE(account->childAccountWithUID("CHILD"));
}

TEST_F(KAAccountChildrenTest, ANullUIDFindsNotEvenTheChildUnderTheEmptyOne)
{
    account->addChildAccountDict(child("", kMail), "");
    EXPECT_TRUE(account->childAccountWithUID(""));
    EXPECT_FALSE(account->childAccountWithUID({}));
    account->removeChildAccountWithUID({});
    EXPECT_TRUE(account->childAccountWithUID(""));
}

TEST_F(KAAccountChildrenTest, AChildIsFoundByItsPlugin)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->addChildAccountDict(child("calendar", kCalendar), "calendar");
    EXPECT_EQ(account->childAccountWithPluginID(kCalendar), child("calendar", kCalendar));
    EXPECT_FALSE(account->childAccountWithPluginID("com.corvane.chat.kaplugin"));
}

TEST_F(KAAccountChildrenTest, AChildWithoutAPluginIsFoundByNoPlugin)
{
    account->addChildAccountDict({{"uid", "child"}}, "child");
    EXPECT_FALSE(account->childAccountWithPluginID({}));
    EXPECT_FALSE(account->childAccountWithPluginID(""));
}

TEST_F(KAAccountChildrenTest, AllChildrenAreListed)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->addChildAccountDict(child("calendar", kCalendar), "calendar");
    EXPECT_THAT(account->allChildAccounts(), UnorderedElementsAre(child("mail", kMail), child("calendar", kCalendar)));
}

TEST_F(KAAccountChildrenTest, AnAccountWithoutChildrenHasNone)
{
    EXPECT_FALSE(account->childAccountWithUID("child"));
    EXPECT_FALSE(account->childAccountWithPluginID(kMail));
    EXPECT_THAT(account->allChildAccounts(), IsEmpty());
}

TEST_F(KAAccountChildrenTest, ChildrenThatAreNoDictionariesAreNoChildren)
{
    account->setProviderAttribute(QVariantMap{{"text", "?"}, {"list", QVariantList{1}}}, kChildren);
    EXPECT_FALSE(account->childAccountWithUID("text"));
    EXPECT_THAT(account->allChildAccounts(), IsEmpty());
    account->setProviderAttribute("text", kChildren);
    EXPECT_THAT(account->allChildAccounts(), IsEmpty());
    EXPECT_FALSE(account->enabledApplications(true));
}

// Removing children

TEST_F(KAAccountChildrenTest, ARemovedChildIsGoneAndTheOthersStay)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->addChildAccountDict(child("calendar", kCalendar), "calendar");
    account->removeChildAccountWithUID("mail");
    EXPECT_EQ(childUIDs(), QStringList("calendar"));
}

TEST_F(KAAccountChildrenTest, RemovingTheLastChildLeavesAnEmptyDictionary)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->removeChildAccountWithUID("mail");
    EXPECT_EQ(account->providerAttributeForKey(kChildren), QVariant(QVariantMap()));
}

TEST_F(KAAccountChildrenTest, RemovingAnUnknownChildStoresTheChildrenBackAsTheyAre)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    commit(account);
    account->removeChildAccountWithUID("unknown");
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_EQ(childUIDs(), QStringList("mail"));
}

TEST_F(KAAccountChildrenTest, RemovingFromAnAccountThatNeverHadChildrenDoesNothing)
{
    commit(account);
    account->removeChildAccountWithUID("unknown");
    EXPECT_FALSE(account->hasPendingChanges());
    EXPECT_FALSE(account->providerAttributeForKey(kChildren).isValid());
}

// The applications

TEST_F(KAAccountChildrenTest, AnAccountThatNeverHadChildrenHasNoListOfApplications)
{
    EXPECT_FALSE(account->enabledApplications(true));
    EXPECT_FALSE(account->enabledApplications(false));
    EXPECT_FALSE(account->enabledForApplication("com.corvane.mail"));
}

TEST_F(KAAccountChildrenTest, AnAccountWhoseChildrenAreGoneHasAnEmptyListOfApplications)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->removeChildAccountWithUID("mail");
    EXPECT_EQ(account->enabledApplications(true), QStringList());
}

TEST_F(KAAccountChildrenTest, AnAccountOfTheNewerOnlineServiceHasNoListOfApplications)
{
    const auto newer = newAccount("ada", kKAProviderQuillane);
    newer->addChildAccountDict(child("mail", kMail), "mail");
    EXPECT_FALSE(newer->enabledApplications(true));
    EXPECT_FALSE(newer->enabledForApplication("com.corvane.mail"));
}

TEST_F(KAAccountChildrenTest, TheApplicationsAreThoseOfTheChildrensPlugins)
{
    account->addChildAccountDict(child("a", kMail), "a");
    account->addChildAccountDict(child("b", kCalendar), "b");
    account->addChildAccountDict(child("c", "com.corvane.chat.kaplugin"), "c");
    account->addChildAccountDict(child("d", "com.corvane.contacts.kaplugin"), "d");
    EXPECT_THAT(
        account->enabledApplications(false).value_or(QStringList()),
        UnorderedElementsAre("com.corvane.mail", "com.corvane.Tidewell", "com.corvane.Parlex", "com.corvane.Cardell"));
}

TEST_F(KAAccountChildrenTest, AnInactiveChildsApplicationIsLeftOutUnlessInactiveOnesAreWanted)
{
    addDataPlugin(kMail);
    addDataPlugin(kCalendar);
    account->addChildAccountDict(child("mail", kMail), "mail");
    account->addChildAccountDict(child("calendar", kCalendar), "calendar");
    setInactive(kMail, "mail", true);
    setInactive(kCalendar, "calendar", false);
    EXPECT_THAT(account->enabledApplications(false).value_or(QStringList()), ElementsAre("com.corvane.Tidewell"));
    EXPECT_THAT(account->enabledApplications(true).value_or(QStringList()),
                UnorderedElementsAre("com.corvane.mail", "com.corvane.Tidewell"));
    EXPECT_FALSE(account->enabledForApplication("com.corvane.mail"));
    EXPECT_TRUE(account->enabledForApplication("com.corvane.Tidewell"));
}

TEST_F(KAAccountChildrenTest, ThePluginIsAskedWhetherAChildIsInactiveAndNotTheStoredSettings)
{
    addDataPlugin(kMail);
    QVariantMap stored = child("mail", kMail);
    stored.insert("inactive", true);
    account->addChildAccountDict(stored, "mail");
    EXPECT_THAT(account->enabledApplications(false).value_or(QStringList()), ElementsAre("com.corvane.mail"));
    setInactive(kMail, "another", true);
    EXPECT_THAT(account->enabledApplications(false).value_or(QStringList()), ElementsAre("com.corvane.mail"));
}

TEST_F(KAAccountChildrenTest, AChildWhosePluginIsNotLoadedCountsAsActive)
{
    account->addChildAccountDict(child("mail", kMail), "mail");
    EXPECT_TRUE(account->enabledForApplication("com.corvane.mail"));
}

TEST_F(KAAccountChildrenTest, AnApplicationWithTwoChildrenIsListedOnce)
{
    addDataPlugin(kMail);
    account->setProviderAttribute(QVariantMap{{"one", child("one", kMail)}, {"two", child("two", kMail)}}, kChildren);
    EXPECT_THAT(account->enabledApplications(true).value_or(QStringList()), ElementsAre("com.corvane.mail"));
    setInactive(kMail, "one", true);
    EXPECT_THAT(account->enabledApplications(false).value_or(QStringList()), ElementsAre("com.corvane.mail"));
}

TEST_F(KAAccountChildrenTest, ChildrenOfUnknownPluginsAndOfNoneTellNoApplication)
{
    account->addChildAccountDict(child("one", "org.example.kaplugin"), "one");
    account->addChildAccountDict({{"uid", "two"}}, "two");
    EXPECT_EQ(account->enabledApplications(true), QStringList());
    EXPECT_EQ(account->enabledApplications(false), QStringList());
    EXPECT_FALSE(account->enabledForApplication({}));
}
