// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list account an application's account belongs to, on a machine without the maker's online service.

#include <gmock/gmock.h>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KADecisionTrace.h>
#include <kavellaccounts/KAHaldenServer.h>

#include "tests/plugins/matching_fixture.h"

using testing::IsEmpty;

namespace {

class Matching : public kavell::test::MatchingTest {};
class MatchingMail : public kavell::test::MatchingTest {};
class MatchingChat : public kavell::test::MatchingTest {};

/// Each of the plug-ins that a set-up input can lead to, with an account of the same login name.
class MatchingSetupInput : public kavell::test::MatchingTest {
protected:
    MatchingSetupInput()
    {
        addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
        addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    }

    static QString matching(const std::shared_ptr<KAAccountSetupInput> &input)
    {
        return named(manager().matchingAListAccountForSetupInput(input, nullptr));
    }
};

}  // namespace

// Mail

TEST_F(MatchingMail, WithoutUserNameAndAddressNoPluginIsAsked)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo);
    KADecisionTrace trace;
    EXPECT_FALSE(manager()._matchingAlistAccountForMailAccountSettings(
        {{"incomingMailServer", "mail.zorbo.example"}, {"KAAccountTypeKey", "kKAServiceExchangeMail"}}, &trace));
    EXPECT_TRUE(trace.steps().empty());
    EXPECT_THAT(nameServer().queries(), IsEmpty());
}

TEST_F(MatchingMail, TheUserNameOfTheAddressStandsInForAMissingOne)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}}), "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingMail, AUserNameThatIsThereAndEmptyIsNotMissing)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "anna");
    const QVariantMap settings{{"userName", ""}, {"emailAddress", "anna@zorbo.example"}};
    EXPECT_EQ(mail(settings), "none");
    addAccount(kKAProviderYahoo, "anna@zorbo.example");
    EXPECT_EQ(mail(settings), "anna@zorbo.example at com.corvane.account.yahoo");
}

TEST_F(MatchingMail, ThePluginIsChosenByTheAddressAndNotByTheServer)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle, {"other.example"});
    addAccount(kKAProviderYahoo, "anna");
    addAccount(kKAProviderGoogle, "anna");
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}, {"incomingMailServer", "imap.other.example"}}),
              "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingMail, ARegisteredServerComesBeforeTheDomainOfTheAddress)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addAccount(kKAProviderYahoo, "anna");
    addAccount(kKAProviderHaldenServer, "anna");
    KAAddHaldenServer("mail.work.example", QStringList{kKAServiceIMAP});
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}, {"incomingMailServer", "mail.work.example"}}),
              "anna at com.corvane.account.haldenserver");
}

TEST_F(MatchingMail, TriesTheUserNameThenTheAddressThenTheUserNameAtTheServer)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    const QVariantMap settings{
        {"userName", "u"}, {"emailAddress", "u2@zorbo.example"}, {"incomingMailServer", "imap.zorbo.example"}};
    addAccount(kKAProviderYahoo, "u@imap.zorbo.example");
    EXPECT_EQ(mail(settings), "u@imap.zorbo.example at com.corvane.account.yahoo");
    addAccount(kKAProviderYahoo, "u2@zorbo.example");
    EXPECT_EQ(mail(settings), "u2@zorbo.example at com.corvane.account.yahoo");
    addAccount(kKAProviderYahoo, "u");
    EXPECT_EQ(mail(settings), "u at com.corvane.account.yahoo");
}

TEST_F(MatchingMail, WithoutAServerThereIsNoThirdLookUp)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "u@");
    EXPECT_EQ(mail({{"userName", "u"}, {"emailAddress", "u2@zorbo.example"}}), "none");
    EXPECT_EQ(mail({{"userName", "u"}, {"emailAddress", "u2@zorbo.example"}, {"incomingMailServer", ""}}),
              "u@ at com.corvane.account.yahoo");
}

TEST_F(MatchingMail, AnAddressThatNobodyClaimsIsDecidedByTheAccountType)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderHaldenServer, "anna");
    addAccount(kKAProviderExchange, "anna");
    const auto withType = [](const QVariant &type) {
        return mail({{"emailAddress", "anna@unclaimed.example"}, {"KAAccountTypeKey", type}});
    };
    EXPECT_EQ(withType("com.corvane.account.haldenserver"), "anna at com.corvane.account.haldenserver");
    EXPECT_EQ(withType("kKAServiceExchangeMail"), "anna at com.corvane.account.exchange");
    EXPECT_EQ(withType("kKAServiceExchangeCalendar"), "none");
    EXPECT_EQ(withType("kkaserviceexchangemail"), "none");
}

TEST_F(MatchingMail, AServerPathMarksAnExchangeAccountUnlessItIsEmpty)
{
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(mail({{"userName", "anna"}, {"serverRootPath", "/EWS"}}), "anna at com.corvane.account.exchange");
    EXPECT_EQ(mail({{"userName", "anna"}, {"serverRootPath", ""}}), "none");
}

TEST_F(MatchingMail, AClaimedAddressIsNotDecidedByTheAccountType)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}, {"KAAccountTypeKey", "kKAServiceExchangeMail"}}), "none");
}

TEST_F(MatchingMail, ADomainWhoseMailGoogleTakesInIsGoogles)
{
    nameServer().addMailExchanger("hosted.example", 1, "alt1.aspmx.googlemail.com");
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderGoogle, "anna@hosted.example");
    EXPECT_EQ(mail({{"emailAddress", "anna@hosted.example"}}), "anna@hosted.example at com.corvane.account.google");
}

TEST_F(MatchingMail, APluginThatIsNotInstalledOrHasNoProviderMatchesNothing)
{
    addListPlugin(kKAYahooPluginID, {}, {"zorbo.example"});
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}}), "none");
    EXPECT_EQ(mail({{"userName", "anna"}, {"serverRootPath", "/EWS"}}), "none");
}

TEST_F(MatchingMail, NoAccountIsMade)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}, {"incomingMailServer", "imap.zorbo.example"}}), "none");
    EXPECT_THAT(manager().providerOfType(kKAProviderYahoo)->accounts(), IsEmpty());
}

TEST_F(MatchingMail, ValuesThatAreNoTextCountAsMissing)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(mail({{"emailAddress", "anna@zorbo.example"}, {"userName", 7}}), "anna at com.corvane.account.yahoo");
}

// Chat

TEST_F(MatchingChat, TheTypeOfTheChatAccountChoosesThePlugin)
{
    addListPlugin(kKAAOLPluginID, kKAProviderAOL);
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addListPlugin(kKANimbrelPluginID, kKAProviderNimbrel);
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo);
    for (const QString &provider : {kKAProviderAOL, kKAProviderGoogle, kKAProviderNimbrel, kKAProviderYahoo})
        addAccount(provider, "anna");
    const std::pair<const char *, const char *> rows[] = {
        {"aim", "anna at com.corvane.account.aol"},
        {"google", "anna at com.corvane.account.google"},
        {"nimbrel", "anna at com.corvane.account.nimbrel"},
        {"dorvex", "anna at com.corvane.account.nimbrel"},
        {"com.corvane.Parlex.services.Yahoo", "anna at com.corvane.account.yahoo"},
        {"Yahoo!", "anna at com.corvane.account.yahoo"},
        {"jabber", "none"},
        {"AIM", "none"},
        {"yahoo!", "none"},
    };
    for (const auto &[type, expected] : rows)
        EXPECT_EQ(chat({{"KAChatAccountType", type}, {"KAChatLoginName", "anna"}}), expected) << type;
}

TEST_F(MatchingChat, OtherTypesBelongToTheServerProductByTypeOrRegistry)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addAccount(kKAProviderHaldenServer, "anna");
    KAAddHaldenServer("chat.work.example", QStringList{kKAServiceIM});
    QVariantMap settings{{"KAChatAccountType", "jabber"}, {"KAChatLoginName", "anna"}};
    EXPECT_EQ(chat(settings), "none");
    settings.insert("KAChatServer", "chat.work.example");
    EXPECT_EQ(chat(settings), "anna at com.corvane.account.haldenserver");
    settings.insert("KAChatServer", "chat.other.example");
    EXPECT_EQ(chat(settings), "none");
    settings.insert("KAAccountTypeKey", "com.corvane.account.haldenserver");
    EXPECT_EQ(chat(settings), "anna at com.corvane.account.haldenserver");
}

TEST_F(MatchingChat, AKnownTypeComesBeforeARegisteredServer)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderHaldenServer, "anna");
    addAccount(kKAProviderGoogle, "anna");
    KAAddHaldenServer("chat.work.example", QStringList{kKAServiceIM});
    EXPECT_EQ(
        chat({{"KAChatAccountType", "google"}, {"KAChatLoginName", "anna"}, {"KAChatServer", "chat.work.example"}}),
        "anna at com.corvane.account.google");
}

TEST_F(MatchingChat, OneLoginNameIsTriedWithoutAFallBack)
{
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderGoogle, "anna");
    EXPECT_EQ(chat({{"KAChatAccountType", "google"}, {"KAChatLoginName", "anna@gmail.com"}}), "none");
    EXPECT_EQ(chat({{"KAChatAccountType", "google"}}), "none");
}

// Which matcher

TEST_F(Matching, EachDataPluginHasItsMatcher)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderYahoo, "mail");
    addAccount(kKAProviderExchange, "server");
    addAccount(kKAProviderGoogle, "chat");
    const auto matching = [](const QVariantMap &settings, const QString &pluginID) {
        return named(manager().matchingAListAccountForAccountSettings(settings, pluginID));
    };
    const QVariantMap mailSettings{{"emailAddress", "mail@zorbo.example"}};
    EXPECT_EQ(matching(mailSettings, "com.corvane.mail.kaplugin"), "mail at com.corvane.account.yahoo");
    EXPECT_EQ(matching(mailSettings, "com.corvane.test.kaplugin"), "mail at com.corvane.account.yahoo");
    EXPECT_EQ(matching(mailSettings, "com.corvane.calendar.kaplugin"), "none");
    EXPECT_EQ(matching(mailSettings, "com.corvane.contacts.kaplugin"), "none");
    EXPECT_EQ(matching(mailSettings, "com.yahoo.kaplugin"), "none");
    EXPECT_EQ(matching(mailSettings, "com.corvane.Mail.kaplugin"), "none");
    EXPECT_EQ(matching(mailSettings, {}), "none");
    const QVariantMap calendarSettings{{"userName", "server"}, {"KAAccountTypeKey", "kKAServiceExchangeCalendar"}};
    EXPECT_EQ(matching(calendarSettings, "com.corvane.calendar.kaplugin"), "server at com.corvane.account.exchange");
    EXPECT_EQ(matching(calendarSettings, "com.corvane.contacts.kaplugin"), "none");
    const QVariantMap contactsSettings{{"userName", "server"}, {"KAAccountTypeKey", "kKAServiceExchangeContacts"}};
    EXPECT_EQ(matching(contactsSettings, "com.corvane.contacts.kaplugin"), "server at com.corvane.account.exchange");
    const QVariantMap chatSettings{{"KAChatAccountType", "google"}, {"KAChatLoginName", "chat"}};
    EXPECT_EQ(matching(chatSettings, "com.corvane.chat.kaplugin"), "chat at com.corvane.account.google");
}

TEST_F(Matching, TheTraceTellsEachLoginNameThatWasTried)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "anna@zorbo.example");
    KADecisionTrace trace;
    const auto account =
        manager()._matchingAlistAccountForMailAccountSettings({{"emailAddress", "anna@zorbo.example"}}, &trace);
    ASSERT_TRUE(account);
    ASSERT_EQ(trace.steps().size(), 3U);
    EXPECT_EQ(trace.steps()[0].source, "zorbo.example");
    EXPECT_EQ(trace.steps()[0].answer, "com.yahoo.kaplugin");
    EXPECT_EQ(trace.steps()[1].source, "anna");
    EXPECT_TRUE(trace.steps()[1].answer.isNull());
    EXPECT_EQ(trace.steps()[2].source, "anna@zorbo.example");
    EXPECT_EQ(trace.steps()[2].answer, account->uid());
}

// From the input of a set-up

TEST_F(MatchingSetupInput, AMailInputIsMatchedByItsAddress)
{
    addAccount(kKAProviderYahoo, "anna");
    const auto input = std::make_shared<KAMailAccountSetupInput>();
    input->setUserName("bert");
    EXPECT_EQ(matching(input), "none");
    input->setEmailAddress("anna@zorbo.example");
    EXPECT_EQ(matching(input), "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingSetupInput, InputsOfServersHaveNoLoginNameToMatch)
{
    addAccount(kKAProviderYahoo, "anna");
    const auto calendarInput = std::make_shared<KACalDAVAccountSetupInput>();
    calendarInput->setServerAddress("dav.zorbo.example");
    calendarInput->setUserName("anna");
    EXPECT_EQ(matching(calendarInput), "none");
    const auto contactsInput = std::make_shared<KACardDAVAccountSetupInput>();
    contactsInput->setServerAddress("dav.zorbo.example");
    contactsInput->setUserName("anna");
    EXPECT_EQ(matching(contactsInput), "none");
}

TEST_F(MatchingSetupInput, InputsOfServersAskForTheirServer)
{
    const auto calendarInput = std::make_shared<KACalDAVAccountSetupInput>();
    calendarInput->setServerAddress("dav.calendar.example");
    EXPECT_EQ(matching(calendarInput), "none");
    EXPECT_EQ(nameServer().queryCount("dav.calendar.example"), 1);
    const auto contactsInput = std::make_shared<KACardDAVAccountSetupInput>();
    contactsInput->setServerAddress("dav.contacts.example");
    EXPECT_EQ(matching(contactsInput), "none");
    EXPECT_EQ(nameServer().queryCount("dav.contacts.example"), 1);
}

TEST_F(MatchingSetupInput, AChatInputIsMatchedByTypeAndLoginName)
{
    addAccount(kKAProviderGoogle, "anna");
    const auto input = std::make_shared<KAChatAccountSetupInput>();
    input->setLoginName("anna");
    EXPECT_EQ(matching(input), "none");
    input->setAccountType("google");
    EXPECT_EQ(matching(input), "anna at com.corvane.account.google");
}

TEST_F(MatchingSetupInput, DirectoriesServersAndUnknownInputsNeverMatch)
{
    addAccount(kKAProviderYahoo, "anna");
    const auto directory = std::make_shared<KALDAPAccountSetupInput>();
    directory->setServerAddress("ldap.zorbo.example");
    directory->setUserName("anna");
    EXPECT_EQ(matching(directory), "none");
    EXPECT_EQ(matching(std::make_shared<KAServerAccountSetupInput>()), "none");
    EXPECT_EQ(matching(std::make_shared<KAAccountSetupInput>()), "none");
    EXPECT_EQ(matching(nullptr), "none");
}

TEST_F(MatchingSetupInput, SubclassesAreMatchedLikeTheirBase)
{
    class OwnInput : public KAMailAccountSetupInput {};
    addAccount(kKAProviderYahoo, "anna");
    const auto input = std::make_shared<OwnInput>();
    input->setEmailAddress("anna@zorbo.example");
    EXPECT_EQ(matching(input), "anna at com.corvane.account.yahoo");
}
