// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The identifiers of accounts and of settings dictionaries, and the host labels they end in.

#include "tests/model/plugin_fixture.h"

namespace {

using KAAccountIdentityTest = kavell::test::AccountWithPluginsTest;

/// A plug-in claims zorbo.example and its servers.
class ClaimedDomainTest : public kavell::test::AccountWithPluginsTest {
protected:
    void SetUp() override
    {
        AccountWithPluginsTest::SetUp();
        addListPlugin("org.zorbo.kaplugin", "com.corvane.account.yahoo", {"zorbo.example"});
    }
};

QString identifierOf(const QVariantMap &settings)
{
    return KAAccount::accountIdentifierForSettings(settings);
}

}  // namespace

// Host labels

TEST_F(ClaimedDomainTest, TheLabelOfAClaimedServerIsThePluginsProviderType)
{
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("zorbo.example"), "com.corvane.account.yahoo");
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("IMAP.Zorbo.example"), "com.corvane.account.yahoo");
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("dav.zorbo.example/principals/ada"), "com.corvane.account.yahoo");
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, TheLabelOfAnotherServerIsItsDomain)
{
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("Label1.example"), "label1.example");
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("label1.example/dav"), "label1.example");
    EXPECT_EQ(nameServer().queryCount("label1.example"), 1);
    EXPECT_EQ(lookupCount(), 1u);
}

TEST_F(KAAccountIdentityTest, ANullAddressHasNoLabelAndAnEmptyOneAnEmptyLabel)
{
    EXPECT_TRUE(KAAccount::_hostLabelForServerAddress({}).isNull());
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress(""), "");
    EXPECT_FALSE(KAAccount::_hostLabelForServerAddress("").isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, ADomainOfAPluginThatIsNotInstalledIsItsOwnLabel)
{
    nameServer().addMailExchanger("label2.example", 10, "aspmx.googlemail.com");
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("label2.example"), "label2.example");
    EXPECT_EQ(nameServer().queryCount("label2.example"), 1);
}

TEST_F(KAAccountIdentityTest, AHostedDomainHasTheLabelOfThePluginThatServesIt)
{
    addListPlugin("com.google.kaplugin", "com.corvane.account.google");
    nameServer().addMailExchanger("label3.example", 10, "aspmx.googlemail.com");
    EXPECT_EQ(KAAccount::_hostLabelForServerAddress("label3.example"), "com.corvane.account.google");
}

TEST_F(KAAccountIdentityTest, APluginWithoutAProviderGivesItsDomainsNoLabel)
{
    addListPlugin("org.zorbo.kaplugin", {}, {"zorbo.example"});
    EXPECT_TRUE(KAAccount::_hostLabelForServerAddress("zorbo.example").isNull());
    EXPECT_TRUE(identifierOf({{"emailAddress", "ada@zorbo.example"}}).isNull());
}

// Identifiers of settings

TEST_F(ClaimedDomainTest, AllServicesOfOneUserAtOneProviderHaveOneIdentifier)
{
    const QString expected = "ada@com.corvane.account.yahoo";
    EXPECT_EQ(identifierOf({{"emailAddress", "Ada@Zorbo.example"}}), expected);
    EXPECT_EQ(identifierOf({{"userName", "ada"}, {"incomingMailServer", "imap.zorbo.example"}}), expected);
    EXPECT_EQ(identifierOf({{"userName", "ada"}, {"serverAddress", "caldav.zorbo.example/ada"}}), expected);
    EXPECT_EQ(identifierOf({{"KAChatLoginName", "ada"}, {"KAChatServer", "chat.zorbo.example"}}), expected);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, TheAddressComesBeforeTheUserNameAndThatBeforeTheChatLogin)
{
    QVariantMap settings{{"emailAddress", "mail@a.who1.example"},
                         {"userName", "user@b.who1.example"},
                         {"KAChatLoginName", "chat@c.who1.example"}};
    EXPECT_EQ(identifierOf(settings), "mail@a.who1.example");
    settings.remove("emailAddress");
    EXPECT_EQ(identifierOf(settings), "user@b.who1.example");
    settings.remove("userName");
    EXPECT_EQ(identifierOf(settings), "chat@c.who1.example");
}

TEST_F(KAAccountIdentityTest, TheFirstUserThatIsPresentCountsEvenWhenItIsEmpty)
{
    EXPECT_EQ(identifierOf({{"emailAddress", ""}, {"userName", "ada"}, {"serverAddress", "who2.example"}}),
              "@who2.example");
    EXPECT_EQ(identifierOf({{"emailAddress", QString()}, {"userName", "ada"}, {"serverAddress", "who2.example"}}),
              "ada@who2.example");
}

TEST_F(KAAccountIdentityTest, TheHostOfTheUserComesBeforeTheServers)
{
    EXPECT_EQ(identifierOf({{"emailAddress", "ada@who3.example"}, {"incomingMailServer", "imap.other.example"}}),
              "ada@who3.example");
}

TEST_F(KAAccountIdentityTest, TheMailServerComesBeforeTheDAVServerAndThatBeforeTheChatServer)
{
    QVariantMap settings{{"userName", "ada"},
                         {"incomingMailServer", "a.where1.example"},
                         {"serverAddress", "b.where1.example"},
                         {"KAChatServer", "c.where1.example"}};
    EXPECT_EQ(identifierOf(settings), "ada@a.where1.example");
    settings.remove("incomingMailServer");
    EXPECT_EQ(identifierOf(settings), "ada@b.where1.example");
    settings.remove("serverAddress");
    EXPECT_EQ(identifierOf(settings), "ada@c.where1.example");
}

TEST_F(KAAccountIdentityTest, TheFirstServerThatIsPresentCountsEvenWhenItIsEmpty)
{
    EXPECT_EQ(identifierOf({{"userName", "ada"}, {"incomingMailServer", ""}, {"serverAddress", "where2.example"}}),
              "ada@");
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, AUserWithAnEmptyHostIsShortenedAndTheServersAreAsked)
{
    EXPECT_EQ(identifierOf({{"emailAddress", "Ada@"}, {"serverAddress", "where3.example"}}), "ada@where3.example");
    EXPECT_TRUE(identifierOf({{"emailAddress", "Ada@"}}).isNull());
}

TEST_F(KAAccountIdentityTest, AUserWithoutAnAtSignKeepsItsCase)
{
    EXPECT_EQ(identifierOf({{"userName", "Ada"}, {"serverAddress", "where4.example"}}), "Ada@where4.example");
}

TEST_F(KAAccountIdentityTest, AServerThatIsAnAddressStandsForItsHost)
{
    EXPECT_EQ(identifierOf({{"userName", "ada"}, {"serverAddress", "user@Where5.example"}}), "ada@where5.example");
    EXPECT_TRUE(identifierOf({{"userName", "ada"}, {"serverAddress", "user@"}}).isNull());
}

TEST_F(KAAccountIdentityTest, SettingsWithoutAUserHaveNoIdentifier)
{
    EXPECT_TRUE(identifierOf({}).isNull());
    EXPECT_TRUE(identifierOf({{"serverAddress", "where6.example"}}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, SettingsWithoutAServerHaveNoIdentifier)
{
    EXPECT_TRUE(identifierOf({{"emailAddress", "ada"}}).isNull());
    EXPECT_TRUE(identifierOf({{"emailAddress", "ada"}, {"serverAddress", QString()}}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(KAAccountIdentityTest, ValuesThatAreNoTextsCountAsMissing)
{
    EXPECT_EQ(identifierOf({{"emailAddress", 1}, {"userName", "ada@where7.example"}}), "ada@where7.example");
}

// Identifiers of accounts

TEST_F(KAAccountIdentityTest, AnAccountWithoutSettingsIsItsLoginNameAtItsProvider)
{
    EXPECT_EQ(newAccount("Ada", kKAProviderMail)->accountIdentifier(), "Ada@com.corvane.account.mail");
    EXPECT_EQ(newAccount("Ada@Login1.example", kKAProviderMail)->accountIdentifier(), "ada@login1.example");
}

TEST_F(KAAccountIdentityTest, AnAccountWithABareUserNameIsAtItsProvider)
{
    const auto account = newAccount("login", kKAProviderMail);
    account->setProviderAttribute("ada", "emailAddress");
    EXPECT_EQ(account->accountIdentifier(), "ada@com.corvane.account.mail");
}

TEST_F(KAAccountIdentityTest, AnAccountsProviderTypeIsAServerLikeAnyOther)
{
    EXPECT_EQ(newAccount("ada", kKAProviderTest)->accountIdentifier(), "ada@com.corvane.account.testing");
    EXPECT_EQ(nameServer().queryCount("com.corvane.account.testing"), 1);
    EXPECT_EQ(newAccount("ada", "user@Type1.example")->accountIdentifier(), "ada@type1.example");
}

TEST_F(ClaimedDomainTest, AnAccountsAttributesAreReadInTheOrderOfSettings)
{
    const auto account = newAccount("login@other.example");
    account->setProviderAttribute("chat", "KAChatLoginName");
    account->setProviderAttribute("imap.zorbo.example", "KAChatServer");
    EXPECT_EQ(account->accountIdentifier(), "chat@com.corvane.account.yahoo");
    account->setProviderAttribute("user", "userName");
    account->setProviderAttribute("attributes1.example", "serverAddress");
    EXPECT_EQ(account->accountIdentifier(), "user@attributes1.example");
    account->setProviderAttribute("Mail@zorbo.example", "emailAddress");
    EXPECT_EQ(account->accountIdentifier(), "mail@com.corvane.account.yahoo");
    account->setProviderAttribute("mail", "emailAddress");
    account->setProviderAttribute("attributes2.example", "incomingMailServer");
    EXPECT_EQ(account->accountIdentifier(), "mail@attributes2.example");
}

TEST_F(KAAccountIdentityTest, AnAccountsAttributeThatIsEmptyIsPresent)
{
    const auto account = newAccount("login@other.example");
    account->setProviderAttribute("", "emailAddress");
    EXPECT_EQ(account->accountIdentifier(), "@com.corvane.account.mail");
}

TEST_F(KAAccountIdentityTest, AnAccountOverNoRecordHasNoIdentifier)
{
    EXPECT_TRUE(KAAccount::initWithCSKavellAccount(nullptr)->accountIdentifier().isNull());
}
