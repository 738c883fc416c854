// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list plug-in settings belong to, on a machine without the maker's online service; and how many look-ups
// each decision makes.

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAHaldenServer.h>

#include "tests/model/plugin_fixture.h"

namespace {

const QString kExchange = "com.corvane.exchange.kaplugin";
const QString kNimbrel = "com.corvane.nimbrel.kaplugin";
const QString kQuillane = "com.corvane.placeholder.kaplugin";
const QString kHaldenServer = "com.corvane.haldenserver.kaplugin";
const QString kGoogle = "com.google.kaplugin";
const QString kYahoo = "com.yahoo.kaplugin";
const QString kAOL = "com.aol.kaplugin";
const QString kZorbo = "org.zorbo.kaplugin";

/// A plug-in claims zorbo.example and its servers.
class KAAccountIdentificationTest : public kavell::test::AccountWithPluginsTest {
protected:
    void SetUp() override
    {
        AccountWithPluginsTest::SetUp();
        addListPlugin(kZorbo, "com.corvane.account.yahoo", {"zorbo.example"});
    }

    /// A domain whose mail Google's exchangers receive.
    void addHostedDomain(const char *domain) { nameServer().addMailExchanger(domain, 10, "aspmx.l.google.com"); }
};

using ExchangeRuleTest = KAAccountIdentificationTest;
using OnlineServiceRuleTest = KAAccountIdentificationTest;
using ServerRuleTest = KAAccountIdentificationTest;
using AddressRuleTest = KAAccountIdentificationTest;
using ChatRuleTest = KAAccountIdentificationTest;

QString pluginFor(const QVariantMap &settings)
{
    return KAAccount::aListPluginIDForSettings(settings);
}

}  // namespace

// Exchange, by type or path

TEST_F(ExchangeRuleTest, TheThreeExchangeTypesAreExchanges)
{
    for (const char *type : {"kKAServiceExchangeMail", "kKAServiceExchangeContacts", "kKAServiceExchangeCalendar"}) {
        EXPECT_EQ(pluginFor({{"KAAccountTypeKey", type}}), kExchange);
        EXPECT_EQ(pluginFor({{"accountType", type}}), kExchange);
    }
    for (const char *type : {"kKAServiceIMAP", "kKAServiceCalDAV", "kkaserviceexchangemail", ""})
        EXPECT_TRUE(pluginFor({{"KAAccountTypeKey", type}}).isNull()) << type;
}

TEST_F(ExchangeRuleTest, TheOlderTypeKeyCountsOnlyWhereTheOtherIsAbsent)
{
    EXPECT_TRUE(
        pluginFor({{"KAAccountTypeKey", "kKAServiceIMAP"}, {"accountType", "kKAServiceExchangeMail"}}).isNull());
    EXPECT_TRUE(pluginFor({{"KAAccountTypeKey", ""}, {"accountType", "kKAServiceExchangeMail"}}).isNull());
    EXPECT_EQ(pluginFor({{"KAAccountTypeKey", QString()}, {"accountType", "kKAServiceExchangeMail"}}), kExchange);
}

TEST_F(ExchangeRuleTest, APathIsExchangesWhateverTheServer)
{
    EXPECT_EQ(pluginFor({{"serverRootPath", "/EWS"}}), kExchange);
    EXPECT_EQ(pluginFor({{"serverRootPath", "/EWS"}, {"serverAddress", "dav.zorbo.example"}}), kExchange);
    EXPECT_EQ(pluginFor({{"serverRootPath", "/EWS"}, {"serverAddress", "mail.nimbrel.example"}}), kExchange);
    EXPECT_EQ(pluginFor({{"serverRootPath", "/EWS"}, {"serverAddress", "exchange1.example"}}), kExchange);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(ExchangeRuleTest, AnEmptyPathIsNone)
{
    EXPECT_TRUE(pluginFor({{"serverRootPath", ""}}).isNull());
    EXPECT_TRUE(pluginFor({{"serverRootPath", QString()}}).isNull());
}

TEST_F(ExchangeRuleTest, NothingIsLookedUpForAnExchangeType)
{
    EXPECT_EQ(pluginFor({{"KAAccountTypeKey", "kKAServiceExchangeMail"},
                         {"emailAddress", "ada@exchange2.example"},
                         {"serverAddress", "exchange2.example"}}),
              kExchange);
    EXPECT_EQ(lookupCount(), 0u);
}

// The maker's online services

TEST_F(OnlineServiceRuleTest, ServersOfTheOnlineServicesBelongToTheirPlugins)
{
    const std::pair<const char *, QString> rows[] = {
        {"dorvex.example", kNimbrel},         {"mail.dorvex.example", kNimbrel},    {"nimbrel.example", kNimbrel},
        {"CalDAV.Nimbrel.example", kNimbrel}, {"member.nimbrel.example", kNimbrel}, {"aerwyn.example", kQuillane},
        {"p01-caldav.aerwyn.org", kQuillane},
    };
    for (const auto &[server, plugin] : rows)
        EXPECT_EQ(pluginFor({{"serverAddress", server}}), plugin) << server;
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(OnlineServiceRuleTest, TheServerIsInAnyOfItsThreeKeys)
{
    for (const char *key : {"serverAddress", "KAChatServer", "incomingMailServer"})
        EXPECT_EQ(pluginFor({{key, "mail.nimbrel.example"}}), kNimbrel) << key;
    EXPECT_TRUE(pluginFor({{"HaldenServerAddress", "mail.nimbrel.example"}}).isNull());
}

TEST_F(OnlineServiceRuleTest, TheProviderTypeOfTheNewerServiceInTheTypesPlaceCountsAsItsServer)
{
    EXPECT_EQ(pluginFor({{"KAAccountTypeKey", "com.corvane.account.placeholder"}}), kNimbrel);
    EXPECT_EQ(pluginFor({{"accountType", "com.corvane.account.placeholder"}}), kNimbrel);
    EXPECT_EQ(
        pluginFor({{"KAAccountTypeKey", "com.corvane.account.placeholder"}, {"serverAddress", "dav.aerwyn.example"}}),
        kQuillane);
    EXPECT_EQ(pluginFor({{"KAAccountTypeKey", "com.corvane.account.placeholder"},
                         {"serverAddress", "imap.zorbo.example"},
                         {"emailAddress", "ada@zorbo.example"}}),
              kNimbrel);
    EXPECT_TRUE(pluginFor({{"KAAccountTypeKey", "com.corvane.account.nimbrel"}}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(OnlineServiceRuleTest, ContactsBelongToTheNewerServiceByTheNewerTypeKeyAlone)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"KAAccountTypeKey", "kKAServiceCardDAV"}}),
              kQuillane);
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"accountType", "kKAServiceCardDAV"}}), kNimbrel);
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"KAAccountTypeKey", "kKAServiceCalDAV"}}),
              kNimbrel);
    EXPECT_EQ(
        pluginFor({{"accountType", "com.corvane.account.placeholder"}, {"KAAccountTypeKey", "kKAServiceCardDAV"}}),
        QString());
}

TEST_F(OnlineServiceRuleTest, WithoutTheOnlineServiceLibraryAddressesAreOfTheOlderKind)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"emailAddress", "brondel@nimbrel.example"}}),
              kNimbrel);
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("brondel@nimbrel.example"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel({}));
}

TEST_F(OnlineServiceRuleTest, ADomainThatOnlyContainsTheNameIsAnothers)
{
    EXPECT_TRUE(pluginFor({{"serverAddress", "mynimbrel.online1.example"}}).isNull());
    EXPECT_TRUE(pluginFor({{"serverAddress", "nimbrelonline1.example"}}).isNull());
}

// A known server

TEST_F(ServerRuleTest, AServerBelongsToThePluginThatClaimsItsDomain)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "IMAP.Zorbo.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"KAChatServer", "zorbo.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"incomingMailServer", "imap.zorbo.example/path"}}), kZorbo);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(ServerRuleTest, TheFirstServerKeyThatIsPresentCounts)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "zorbo.example"}, {"KAChatServer", "mail.nimbrel.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"KAChatServer", "zorbo.example"}, {"incomingMailServer", "mail.nimbrel.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"serverAddress", QString()}, {"incomingMailServer", "zorbo.example"}}), kZorbo);
}

TEST_F(ServerRuleTest, AServerThatIsPresentAndEmptyHidesTheOthers)
{
    EXPECT_TRUE(pluginFor({{"serverAddress", ""}, {"incomingMailServer", "zorbo.example"}}).isNull());
    EXPECT_EQ(pluginFor({{"serverAddress", ""},
                         {"incomingMailServer", "mail.nimbrel.example"},
                         {"emailAddress", "ada@zorbo.example"}}),
              kZorbo);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(ServerRuleTest, ThePluginsComeBeforeTheRegistryOfServers)
{
    KAAddHaldenServer("dav.zorbo.example", QStringList{kKAServiceCalDAV});
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.zorbo.example"}}), kZorbo);
    KARemoveHaldenServer("dav.zorbo.example");
}

TEST_F(ServerRuleTest, ARegisteredServerNeedsThePluginsLookupOnly)
{
    addHostedDomain("registered1.example");
    KAAddHaldenServer("registered1.example", QStringList{kKAServiceCalDAV});
    EXPECT_EQ(pluginFor({{"serverAddress", "Registered1.example"}}), kHaldenServer);
    EXPECT_EQ(lookupCount(), 1u);
    KARemoveHaldenServer("registered1.example");
}

TEST_F(ServerRuleTest, AServerWhoseMailGoogleReceivesIsGoogles)
{
    addHostedDomain("hosted1.example");
    EXPECT_EQ(pluginFor({{"serverAddress", "hosted1.example"}}), kGoogle);
    EXPECT_EQ(nameServer().queryCount("hosted1.example"), 1);
    EXPECT_EQ(lookupCount(), 1u);
}

TEST_F(ServerRuleTest, TheOwnLookupIsOfTheServerAndNotOfItsDomain)
{
    nameServer().addEmpty("hosted2.example");
    EXPECT_TRUE(pluginFor({{"serverAddress", "hosted2.example/ada"}}).isNull());
    EXPECT_EQ(nameServer().queries(), (std::vector<std::string>{"hosted2.example", "hosted2.example/ada"}));
}

TEST_F(ServerRuleTest, ADecisionMakesAtMostTwoLookups)
{
    EXPECT_TRUE(pluginFor({{"serverAddress", "unknown1.example/ada"},
                           {"KAChatServer", "unknown2.example"},
                           {"incomingMailServer", "unknown3.example"},
                           {"emailAddress", "ada@unknown4.example"}})
                    .isNull());
    EXPECT_EQ(lookupCount(), 2u);
}

TEST_F(ServerRuleTest, AServerThatNobodyClaimsNeverFallsBackToTheAddress)
{
    nameServer().addEmpty("nobody1.example");
    QVariantMap settings{{"serverAddress", "nobody1.example"}, {"emailAddress", "ada@zorbo.example"}};
    EXPECT_TRUE(pluginFor(settings).isNull());
    settings.insert("KAChatAccountType", "aim");
    EXPECT_EQ(pluginFor(settings), kAOL);
    EXPECT_EQ(lookupCount(), 1u);
}

TEST_F(ServerRuleTest, AnotherExchangersDomainIsNobodys)
{
    nameServer().addMailExchanger("nobody2.example", 10, "mx.notgoogle.com");
    EXPECT_TRUE(pluginFor({{"serverAddress", "nobody2.example"}}).isNull());
}

// A known address

TEST_F(AddressRuleTest, AnAddressBelongsToThePluginThatClaimsItsDomain)
{
    EXPECT_EQ(pluginFor({{"emailAddress", "Ada@ZORBO.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"emailAddress", "ada@mail.zorbo.example"}, {"serverAddress", ""}}), kZorbo);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(AddressRuleTest, AnAddressWithoutAnAtSignIsAskedForAsADomain)
{
    EXPECT_EQ(pluginFor({{"emailAddress", "zorbo.example"}}), kZorbo);
    EXPECT_TRUE(pluginFor({{"emailAddress", "ada"}}).isNull());
    EXPECT_TRUE(pluginFor({{"emailAddress", "ada@"}}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(AddressRuleTest, AnAddressWhoseMailGoogleReceivesIsGooglesAfterOneLookup)
{
    addHostedDomain("hosted3.example");
    EXPECT_EQ(pluginFor({{"emailAddress", "ada@hosted3.example"}}), kGoogle);
    EXPECT_EQ(nameServer().queryCount("hosted3.example"), 1);
    EXPECT_EQ(lookupCount(), 1u);
}

TEST_F(AddressRuleTest, AHostedDomainIsGooglesByThePluginManagersOwnLookup)
{
    nameServer().addMailExchanger("hosted4.example", 10, "aspmx2.googlemail.com");
    EXPECT_EQ(pluginFor({{"emailAddress", "ada@hosted4.example"}}), kGoogle);
    EXPECT_EQ(lookupCount(), 1u);
}

TEST_F(AddressRuleTest, AnAddressOfTheCurrentServiceStaysThereWithoutTheOnlineServiceLibrary)
{
    addListPlugin(kNimbrel, "com.corvane.account.nimbrel", {"nimbrel.example"});
    EXPECT_EQ(pluginFor({{"emailAddress", "brondel@nimbrel.example"}}), kNimbrel);
}

TEST_F(AddressRuleTest, TheServersOfTheOnlineServicesAreNotLookedForInTheAddress)
{
    nameServer().addEmpty("nimbrel.example");
    EXPECT_TRUE(pluginFor({{"emailAddress", "ada@nimbrel.example"}}).isNull());
}

TEST_F(AddressRuleTest, TheAddressIsNotDerivedFromOtherSettingsHere)
{
    EXPECT_TRUE(pluginFor({{"userName", "ada@zorbo.example"}}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(AddressRuleTest, AnAddressThatNobodyClaimsGoesOnToTheChatType)
{
    nameServer().addEmpty("nobody3.example");
    EXPECT_EQ(pluginFor({{"emailAddress", "ada@nobody3.example"}, {"KAChatAccountType", "google"}}), kGoogle);
    EXPECT_EQ(lookupCount(), 1u);
}

// The chat type

TEST_F(ChatRuleTest, EachChatServiceHasItsPlugin)
{
    const std::pair<const char *, QString> rows[] = {
        {"com.corvane.Parlex.services.Yahoo", kYahoo},
        {"Yahoo!", kYahoo},
        {"aim", kAOL},
        {"nimbrel", kNimbrel},
        {"dorvex", kNimbrel},
        {"google", kGoogle},
    };
    for (const auto &[type, plugin] : rows)
        EXPECT_EQ(pluginFor({{"KAChatAccountType", type}}), plugin) << type;
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(ChatRuleTest, OtherChatServicesAndNoneHaveNoPlugin)
{
    for (const char *type : {"jabber", "AIM", "yahoo!", "facebook", ""})
        EXPECT_TRUE(pluginFor({{"KAChatAccountType", type}}).isNull()) << type;
    EXPECT_TRUE(pluginFor({}).isNull());
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(ChatRuleTest, TheOtherRulesComeBeforeTheChatType)
{
    EXPECT_EQ(pluginFor({{"KAChatAccountType", "aim"}, {"serverRootPath", "/EWS"}}), kExchange);
    EXPECT_EQ(pluginFor({{"KAChatAccountType", "aim"}, {"KAChatServer", "chat.nimbrel.example"}}), kNimbrel);
    EXPECT_EQ(pluginFor({{"KAChatAccountType", "aim"}, {"KAChatServer", "chat.zorbo.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"KAChatAccountType", "aim"}, {"emailAddress", "ada@zorbo.example"}}), kZorbo);
}

// The plug-in and its brand

TEST_F(KAAccountIdentificationTest, SettingsAreNormalisedBeforeThePluginIsLookedFor)
{
    const QVariantMap settings{{"userName", "ada@zorbo.example"}};
    ASSERT_TRUE(KAAccount::_pluginForSettings(settings));
    EXPECT_EQ(KAAccount::_pluginForSettings(settings)->identifier(), kZorbo);
}

TEST_F(KAAccountIdentificationTest, APluginThatIsNotInstalledIsNone)
{
    EXPECT_FALSE(KAAccount::_pluginForSettings({{"serverRootPath", "/EWS"}}));
    EXPECT_FALSE(KAAccount::_pluginForSettings({}));
}

TEST_F(KAAccountIdentificationTest, ADataPluginIsNoAccountListPlugin)
{
    addDataPlugin(kExchange);
    ASSERT_TRUE(KAPluginManager::shared()->pluginWithIdentifier(kExchange));
    EXPECT_FALSE(KAAccount::_pluginForSettings({{"serverRootPath", "/EWS"}}));
}

TEST_F(KAAccountIdentificationTest, TheBrandIsThePlugins)
{
    const QVariantMap settings{{"emailAddress", "ada@zorbo.example"}};
    EXPECT_EQ(KAAccount::brandNameForAccountSettings(settings), "Quillmere");
    EXPECT_EQ(KAAccount::defaultDescriptionForAccountSettings(settings), "Quillmere account");
    EXPECT_EQ(KAAccount::supportURLForAccountSettings(settings), QUrl("https://help.example.net/"));
    EXPECT_EQ(KAAccount::brandIconForAccountSettings(settings).size(), QSize(1, 1));  // two wide for an account
}

TEST_F(KAAccountIdentificationTest, WithoutAPluginThereIsNoBrand)
{
    const QVariantMap settings{{"serverRootPath", "/EWS"}};
    EXPECT_TRUE(KAAccount::brandNameForAccountSettings(settings).isNull());
    EXPECT_TRUE(KAAccount::defaultDescriptionForAccountSettings(settings).isNull());
    EXPECT_TRUE(KAAccount::supportURLForAccountSettings(settings).isEmpty());
    EXPECT_TRUE(KAAccount::brandIconForAccountSettings(settings).isNull());
    EXPECT_TRUE(KAAccount::brandNameForAccountSettings({}).isNull());
}
