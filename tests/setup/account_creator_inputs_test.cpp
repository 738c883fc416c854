// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What each application's creator makes of the settings.

#include <kavellaccounts/KAAListPlugin.h>

#include "tests/setup/creator_fixture.h"

using namespace kavell::test;

namespace {

class CreatorInputs : public CreatorTest {
protected:
    std::shared_ptr<KAMailAccountSetupInput> mailInput(const QVariantMap &settings, const QString &provider = {})
    {
        return inputOf<KAMailAccountCreator, KAMailAccountSetupInput>(settings, provider);
    }
    std::shared_ptr<KACalDAVAccountSetupInput> calendarInput(const QVariantMap &settings, const QString &provider = {})
    {
        return inputOf<KATidewellAccountCreator, KACalDAVAccountSetupInput>(settings, provider);
    }
    std::shared_ptr<KACardDAVAccountSetupInput> contactsInput(const QVariantMap &settings, const QString &provider = {})
    {
        return inputOf<KACardellAccountCreator, KACardDAVAccountSetupInput>(settings, provider);
    }
    std::shared_ptr<KAChatAccountSetupInput> chatInput(const QVariantMap &settings, const QString &provider = {})
    {
        return inputOf<KAParlexAccountCreator, KAChatAccountSetupInput>(settings, provider);
    }

    /// The registered account-list plug-in of a provider, with a domain to make addresses of.
    KAPlugin *addListPluginWithDomain(const QVariant &domain)
    {
        addListPlugin(kKAExchangePluginID, kKAProviderExchange);
        KAPlugin *const listPlugin = KAPluginManager::shared()->pluginWithIdentifier(kKAExchangePluginID);
        EXPECT_TRUE(listPlugin);
        listPlugin->setProperty("autodiscoverDomain", domain);
        return listPlugin;
    }
};

const QString kNoAddress = "*** KAMailAccountCreator warning: Trying to create a mail account with no email address.";

TEST_F(CreatorInputs, AllInputsGoOnThroughErrors)
{
    EXPECT_TRUE(mailInput(kSettings)->continueThroughError());
    EXPECT_TRUE(calendarInput({})->continueThroughError());
    EXPECT_TRUE(contactsInput({})->continueThroughError());
    EXPECT_TRUE(chatInput({})->continueThroughError());
    EXPECT_FALSE(mailInput(kSettings)->continueWithoutSSL());
}

TEST_F(CreatorInputs, AllInputsHaveThePasswordAndTheDescription)
{
    const QVariantMap settings{{"password", "sesame"}, {"accountDescription", "Work"}, {"emailAddress", "a@b.example"}};
    const std::vector<std::shared_ptr<KAAccountSetupInput>> inputs{mailInput(settings), calendarInput(settings),
                                                                   contactsInput(settings), chatInput(settings)};
    for (const auto &input : inputs) {
        EXPECT_EQ(input->password(), "sesame");
        EXPECT_EQ(input->accountDescription(), "Work");
    }
}

TEST_F(CreatorInputs, WhatTheSettingsLackStaysEmpty)
{
    const std::vector<std::shared_ptr<KAAccountSetupInput>> inputs{mailInput({}), calendarInput({}), contactsInput({}),
                                                                   chatInput({})};
    for (const auto &input : inputs) {
        EXPECT_TRUE(input->password().isNull());
        EXPECT_TRUE(input->accountDescription().isNull());
        EXPECT_TRUE(input->userName().isNull());
    }
    EXPECT_TRUE(mailInput({})->fullName().isNull());
    EXPECT_TRUE(calendarInput({})->emailAddress().isNull());
    EXPECT_TRUE(calendarInput({})->serverAddress().isNull());
    EXPECT_TRUE(contactsInput({})->serverAddress().isNull());
    const auto chat = chatInput({});
    EXPECT_TRUE(chat->loginName().isNull());
    EXPECT_TRUE(chat->accountType().isNull());
    EXPECT_TRUE(chat->serverName().isNull());
    EXPECT_EQ(chat->serverPort(), 0);
    EXPECT_FALSE(chat->useSSL());
    EXPECT_FALSE(chat->useKerberosV5());
}

TEST_F(CreatorInputs, ANullTextIsMissingAndAnEmptyOneIsNot)
{
    const LogCapture log;
    const auto input = mailInput({{"emailAddress", ""}, {"fullName", QString()}});
    EXPECT_FALSE(input->emailAddress().isNull());
    EXPECT_TRUE(input->fullName().isNull());
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(CreatorInputs, AValueThatIsNoTextIsMissing)
{
    const LogCapture log;
    const auto input = mailInput({{"emailAddress", 7}, {"fullName", true}});
    EXPECT_TRUE(input->emailAddress().isNull());
    EXPECT_TRUE(input->fullName().isNull());
    EXPECT_EQ(log.messages(), QStringList{kNoAddress});
}

TEST_F(CreatorInputs, MailHasTheAddressAndTheFullName)
{
    const auto input =
        mailInput({{"emailAddress", "ada@zorbo.example"}, {"fullName", "Ada"}, {"userName", "lovelace"}});
    EXPECT_EQ(input->emailAddress(), "ada@zorbo.example");
    EXPECT_EQ(input->fullName(), "Ada");
    EXPECT_TRUE(input->userName().isNull());
}

TEST_F(CreatorInputs, AMailAddressIsMadeOfTheUserNameAndTheProvidersDomain)
{
    addListPluginWithDomain("corp.example");
    const LogCapture log;
    EXPECT_EQ(mailInput({{"userName", "ada"}}, kKAProviderExchange)->emailAddress(), "ada@corp.example");
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(CreatorInputs, AMailAddressIsMadeOfWhatIsThereEvenIfItIsEmpty)
{
    KAPlugin *const listPlugin = addListPluginWithDomain("corp.example");
    const LogCapture log;
    EXPECT_EQ(mailInput({{"userName", ""}}, kKAProviderExchange)->emailAddress(), "@corp.example");
    listPlugin->setProperty("autodiscoverDomain", "");
    EXPECT_EQ(mailInput({{"userName", "ada"}}, kKAProviderExchange)->emailAddress(), "ada@");
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(CreatorInputs, AnAddressInTheSettingsIsNotReplaced)
{
    addListPluginWithDomain("corp.example");
    EXPECT_EQ(
        mailInput({{"userName", "ada"}, {"emailAddress", "ada@zorbo.example"}}, kKAProviderExchange)->emailAddress(),
        "ada@zorbo.example");
}

TEST_F(CreatorInputs, WithoutUserNameDomainOrPluginTheMissingAddressIsOnlyAWarning)
{
    const LogCapture log;
    EXPECT_TRUE(mailInput({{"userName", "ada"}})->emailAddress().isNull());                       // no provider
    EXPECT_TRUE(mailInput({{"userName", "ada"}}, kKAProviderExchange)->emailAddress().isNull());  // no plug-in
    EXPECT_TRUE(mailInput({{"userName", "ada"}}, "com.example.any")->emailAddress().isNull());    // no identifier
    KAPlugin *const listPlugin = addListPluginWithDomain({});
    EXPECT_TRUE(mailInput({{"userName", "ada"}}, kKAProviderExchange)->emailAddress().isNull());  // no domain
    listPlugin->setProperty("autodiscoverDomain", "corp.example");
    EXPECT_TRUE(mailInput({{"fullName", "Ada"}}, kKAProviderExchange)->emailAddress().isNull());  // no user name
    EXPECT_EQ(log.messages(), QStringList({kNoAddress, kNoAddress, kNoAddress, kNoAddress, kNoAddress}));
    EXPECT_EQ(creations, 5);
}

TEST_F(CreatorInputs, CalendarsHaveTheUserNameTheAddressAndTheProvidersHost)
{
    const auto input = calendarInput({{"userName", "ada"}, {"emailAddress", "ada@yahoo.com"}}, kKAProviderYahoo);
    EXPECT_EQ(input->userName(), "ada");
    EXPECT_EQ(input->emailAddress(), "ada@yahoo.com");
    EXPECT_EQ(input->serverAddress(), "yahoo.com");
}

TEST_F(CreatorInputs, ABareUserNameOfGoogleCalendarsBecomesTheAddress)
{
    const QVariantMap bare{{"userName", "ada"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(calendarInput(bare, kKAProviderGoogle)->userName(), "ada@gmail.com");
    EXPECT_EQ(calendarInput(bare, kKAProviderGoogle)->serverAddress(), "gmail.com");
    EXPECT_EQ(calendarInput(bare, kKAProviderYahoo)->userName(), "ada");
    const QVariantMap whole{{"userName", "ada@corp.example"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(calendarInput(whole, kKAProviderGoogle)->userName(), "ada@corp.example");
}

TEST_F(CreatorInputs, AMissingUserNameOfGoogleStaysMissing)
{
    const QVariantMap settings{{"emailAddress", "ada@gmail.com"}};
    EXPECT_TRUE(calendarInput(settings, kKAProviderGoogle)->userName().isNull());
    EXPECT_TRUE(contactsInput(settings, kKAProviderGoogle)->userName().isNull());
    EXPECT_TRUE(chatInput(settings, kKAProviderGoogle)->loginName().isNull());
}

TEST_F(CreatorInputs, ABareUserNameOfGoogleGoesWhenThereIsNoAddress)
{
    EXPECT_TRUE(calendarInput({{"userName", "ada"}}, kKAProviderGoogle)->userName().isNull());
    EXPECT_TRUE(contactsInput({{"userName", "ada"}}, kKAProviderGoogle)->userName().isNull());
    EXPECT_TRUE(chatInput({{"userName", "ada"}}, kKAProviderGoogle)->loginName().isNull());
}

TEST_F(CreatorInputs, ContactsHaveTheUserNameAndTheProvidersHost)
{
    const auto input = contactsInput({{"userName", "ada"}, {"emailAddress", "ada@yahoo.com"}}, kKAProviderYahoo);
    EXPECT_EQ(input->userName(), "ada");
    EXPECT_EQ(input->serverAddress(), "yahoo.com");
}

TEST_F(CreatorInputs, ABareUserNameOfGoogleContactsBecomesTheAddress)
{
    const QVariantMap bare{{"userName", "ada"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(contactsInput(bare, kKAProviderGoogle)->userName(), "ada@gmail.com");
    EXPECT_EQ(contactsInput(bare, kKAProviderNimbrel)->userName(), "ada");
    const QVariantMap whole{{"userName", "ada@corp.example"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(contactsInput(whole, kKAProviderGoogle)->userName(), "ada@corp.example");
}

TEST_F(CreatorInputs, ChatHasServiceLoginServerAndFlags)
{
    const auto input = chatInput({{"KAChatAccountType", "jabber"},
                                  {"KAChatLoginName", "countess"},
                                  {"KAChatServer", "chat.zorbo.example"},
                                  {"KAChatServerPort", 5222},
                                  {"KAChatUseSSL", true},
                                  {"KAChatUseKerberosV5", true}});
    EXPECT_EQ(input->accountType(), "jabber");
    EXPECT_EQ(input->loginName(), "countess");
    EXPECT_EQ(input->serverName(), "chat.zorbo.example");
    EXPECT_EQ(input->serverPort(), 5222);
    EXPECT_TRUE(input->useSSL());
    EXPECT_TRUE(input->useKerberosV5());
}

TEST_F(CreatorInputs, AChatPortAndFlagsMayBeText)
{
    const auto input = chatInput({{"KAChatServerPort", "5223"}, {"KAChatUseSSL", "YES"}, {"KAChatUseKerberosV5", "0"}});
    EXPECT_EQ(input->serverPort(), 5223);
    EXPECT_TRUE(input->useSSL());
    EXPECT_FALSE(input->useKerberosV5());
}

TEST_F(CreatorInputs, AChatLoginOverridesTheUserName)
{
    EXPECT_EQ(chatInput({{"userName", "ada"}})->loginName(), "ada");
    EXPECT_EQ(chatInput({{"userName", "ada"}, {"KAChatLoginName", "countess"}})->loginName(), "countess");
}

TEST_F(CreatorInputs, ABareChatLoginOfGoogleBecomesTheAddress)
{
    const QVariantMap bare{{"KAChatLoginName", "ada"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(chatInput(bare, kKAProviderGoogle)->loginName(), "ada@gmail.com");
    EXPECT_EQ(chatInput(bare, kKAProviderYahoo)->loginName(), "ada");
    const QVariantMap whole{{"KAChatLoginName", "ada@corp.example"}, {"emailAddress", "ada@gmail.com"}};
    EXPECT_EQ(chatInput(whole, kKAProviderGoogle)->loginName(), "ada@corp.example");
}

TEST_F(CreatorInputs, TheProviderDecidesOnTheChatService)
{
    const QVariantMap settings{{"KAChatAccountType", "copied"}, {"KAChatLoginName", "ada@x.example"}};
    EXPECT_EQ(chatInput(settings, kKAProviderNimbrel)->accountType(), "nimbrel");
    EXPECT_EQ(chatInput(settings, kKAProviderYahoo)->accountType(), "com.corvane.Parlex.services.Yahoo");
    EXPECT_EQ(chatInput(settings, kKAProviderGoogle)->accountType(), "google");
    EXPECT_EQ(chatInput(settings, kKAProviderAOL)->accountType(), "aim");
    EXPECT_EQ(chatInput(settings, kKAProviderHaldenServer)->accountType(), "jabber");
    EXPECT_EQ(chatInput(settings, kKAProviderExchange)->accountType(), "copied");
    EXPECT_EQ(chatInput(settings)->accountType(), "copied");
}

TEST_F(CreatorInputs, AnAddressOfTheOlderOnlineServiceChatsThere)
{
    const auto serviceFor = [&](const QString &address) {
        return chatInput({{"emailAddress", address}}, kKAProviderNimbrel)->accountType();
    };
    EXPECT_EQ(serviceFor("ada@dorvex.example"), "dorvex");
    EXPECT_EQ(serviceFor("ada@nimbrel.example"), "nimbrel");
    EXPECT_EQ(serviceFor("ada@DORVEX.example"), "nimbrel");
    EXPECT_EQ(chatInput({}, kKAProviderNimbrel)->accountType(), "nimbrel");
}

TEST_F(CreatorInputs, OnlyTheMakersServiceShortensTheChatLogin)
{
    const QVariantMap settings{{"KAChatLoginName", "Ada@Nimbrel.example"}};
    EXPECT_EQ(chatInput(settings, kKAProviderNimbrel)->loginName(), "ada");
    EXPECT_EQ(chatInput({{"userName", "Ada"}}, kKAProviderNimbrel)->loginName(), "Ada");
    EXPECT_TRUE(chatInput({}, kKAProviderNimbrel)->loginName().isNull());
    EXPECT_EQ(chatInput(settings, kKAProviderAOL)->loginName(), "Ada@Nimbrel.example");
}

}  // namespace
