// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <vector>

#include <gtest/gtest.h>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KAChatService.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>

namespace {

QStringList fieldNames(const KAObject &object)
{
    KAFieldList fields;
    object.describeFields(fields);
    QStringList names;
    for (const KAField &field : fields.fields())
        names += field.name;
    return names;
}

const QStringList kInputFields{"_password", "_description",          "_userName",          "_autoconfigDefaults",
                               "_context",  "_continueThroughError", "_continueWithoutSSL"};

/// A field by its getter and setter; the records have many that are alike.
template <typename Record, typename Value> struct Field {
    Value (Record::*get)() const;
    void (Record::*set)(Value);
};

/// Each field has the resting value in a fresh record, and setting one changes it and no other.
template <typename Record, typename Value>
void expectSeparateFields(const std::vector<Field<Record, Value>> &fields, Value resting, Value value)
{
    for (size_t changed = 0; changed < fields.size(); ++changed) {
        Record record;
        for (const auto &field : fields)
            EXPECT_EQ((record.*field.get)(), resting);
        (record.*fields[changed].set)(value);
        for (size_t index = 0; index < fields.size(); ++index)
            EXPECT_EQ((record.*fields[index].get)(), index == changed ? value : resting) << changed << ", " << index;
    }
}

}  // namespace

TEST(SetupInput, EachFlagIsFalseAtFirstAndItsOwn)
{
    using Base = KAAccountSetupInput;
    expectSeparateFields<Base, bool>({{&Base::continueThroughError, &Base::setContinueThroughError},
                                      {&Base::continueWithoutSSL, &Base::setContinueWithoutSSL}},
                                     false, true);
    using Mail = KAMailAccountSetupInput;
    expectSeparateFields<Mail, bool>({{&Mail::autoSSLEnabled, &Mail::setAutoSSLEnabled},
                                      {&Mail::autoSSLOptional, &Mail::setAutoSSLOptional},
                                      {&Mail::autoDeliverySSL, &Mail::setAutoDeliverySSL}},
                                     false, true);
    using Chat = KAChatAccountSetupInput;
    expectSeparateFields<Chat, bool>(
        {{&Chat::useSSL, &Chat::setUseSSL}, {&Chat::useKerberosV5, &Chat::setUseKerberosV5}}, false, true);
    using Server = KAServerAccountSetupInput;
    expectSeparateFields<Server, bool>({{&Server::enableMail, &Server::setEnableMail},
                                        {&Server::enableJabber, &Server::setEnableJabber},
                                        {&Server::enableCalDAV, &Server::setEnableCalDAV},
                                        {&Server::enableCardDAV, &Server::setEnableCardDAV},
                                        {&Server::enableVPN, &Server::setEnableVPN}},
                                       false, true);
    EXPECT_FALSE(KALDAPAccountSetupInput().authenticate());
}

TEST(SetupInput, PortsAreZeroAtFirst)
{
    EXPECT_EQ(KALDAPAccountSetupInput().port(), 0);
    EXPECT_EQ(KAChatAccountSetupInput().serverPort(), 0);
}

TEST(SetupResult, EachFlagAndPortIsUnsetAtFirstAndItsOwn)
{
    using Mail = KAMailAccountSetupResult;
    expectSeparateFields<Mail, bool>({{&Mail::receivingAlreadyExistsInMail, &Mail::setReceivingAlreadyExistsInMail},
                                      {&Mail::sendingAlreadyExistsInMail, &Mail::setSendingAlreadyExistsInMail}},
                                     false, true);
    using Groupware = KAEWSAccountSetupResult;
    expectSeparateFields<Groupware, bool>({{&Groupware::internalUseSSL, &Groupware::setInternalUseSSL},
                                           {&Groupware::externalUseSSL, &Groupware::setExternalUseSSL}},
                                          false, true);
    expectSeparateFields<Groupware, qint64>({{&Groupware::internalPort, &Groupware::setInternalPort},
                                             {&Groupware::externalPort, &Groupware::setExternalPort}},
                                            0, 8443);
    EXPECT_FALSE(KAChatAccountSetupResult().isExistingAccount());
    EXPECT_FALSE(KAServerAccountSetupResult().isExistingAccount());
}

TEST(ChatService, EachFlagIsItsOwn)
{
    using Service = KAChatService;
    const std::vector<Field<Service, bool>> flags{{&Service::showUsernameField, &Service::setShowUsernameField},
                                                  {&Service::showPasswordField, &Service::setShowPasswordField},
                                                  {&Service::showServerHostField, &Service::setShowServerHostField},
                                                  {&Service::showServerPortField, &Service::setShowServerPortField},
                                                  {&Service::showUseSSLCheckbox, &Service::setShowUseSSLCheckbox},
                                                  {&Service::showKerberosCheckbox, &Service::setShowKerberosCheckbox}};
    for (const auto &changed : flags) {
        const auto service = KAChatService::initWithIdentifier("jabber");
        const auto fresh = KAChatService::initWithIdentifier("jabber");
        ((*service).*changed.set)(!((*fresh).*changed.get)());
        for (const auto &flag : flags)
            EXPECT_EQ(((*service).*flag.get)() != ((*fresh).*flag.get)(), flag.get == changed.get);
    }
}

TEST(SetupInput, AFreshOneIsEmpty)
{
    const KAAccountSetupInput input;
    EXPECT_TRUE(input.password().isNull());
    EXPECT_TRUE(input.accountDescription().isNull());
    EXPECT_TRUE(input.userName().isNull());
    EXPECT_TRUE(input.autoconfigDefaults().isEmpty());
    EXPECT_FALSE(input.continueThroughError());
    EXPECT_FALSE(input.continueWithoutSSL());
}

TEST(SetupInput, UnsetDefaultsReadAsEmptyAlsoWhenSetToNothingAgain)
{
    KAAccountSetupInput input;
    input.setAutoconfigDefaults(QVariantMap{{"a", 1}});
    EXPECT_EQ(input.autoconfigDefaults(), (QVariantMap{{"a", 1}}));
    input.setAutoconfigDefaults(std::nullopt);
    EXPECT_TRUE(input.autoconfigDefaults().isEmpty());
}

TEST(SetupInput, DefaultsAreShownAsADictionaryWhetherSetOrNot)
{
    KAAccountSetupInput input;
    KAFieldList unset;
    input.describeFields(unset);
    EXPECT_EQ(unset.fields()[3].encoding, "@\"QVariantMap\"");
    EXPECT_EQ(unset.fields()[3].value, "(null)");
    input.setAutoconfigDefaults(QVariantMap{{"a", 1}});
    KAFieldList set;
    input.describeFields(set);
    EXPECT_EQ(set.fields()[3].encoding, "@\"QVariantMap\"");
    EXPECT_EQ(set.fields()[3].value, "{a = 1;}");
}

TEST(SetupInput, EachHasAContextOfItsOwnThatIsShared)
{
    const KAAccountSetupInput first;
    const KAAccountSetupInput second;
    first.context()->insert("found", true);
    EXPECT_EQ(first.context()->value("found"), true);
    EXPECT_TRUE(second.context()->isEmpty());
}

TEST(SetupInput, BaseKeepsWhatIsSet)
{
    KAAccountSetupInput input;
    input.setPassword("p");
    input.setAccountDescription("d");
    input.setUserName("u");
    input.setContinueThroughError(true);
    input.setContinueWithoutSSL(true);
    EXPECT_EQ(input.password(), "p");
    EXPECT_EQ(input.accountDescription(), "d");
    EXPECT_EQ(input.userName(), "u");
    EXPECT_TRUE(input.continueThroughError());
    EXPECT_TRUE(input.continueWithoutSSL());
    EXPECT_EQ(fieldNames(input), kInputFields);
}

TEST(SetupInput, MailKeepsWhatIsSet)
{
    KAMailAccountSetupInput input;
    EXPECT_EQ(input.autoDeliveryPort(), 0);
    input.setEmailAddress("a");
    input.setFullName("b");
    input.setAutoHostname("c");
    input.setAutoSSLEnabled(true);
    input.setAutoSSLOptional(true);
    input.setAutoEnableSchema("d");
    input.setAutoEnableHost("e");
    input.setAutoEnablePath("f");
    input.setAutoDeliveryHostname("g");
    input.setAutoDeliverySSL(true);
    input.setAutoDeliveryPort(587);
    EXPECT_EQ(input.emailAddress() + input.fullName() + input.autoHostname() + input.autoEnableSchema() +
                  input.autoEnableHost() + input.autoEnablePath() + input.autoDeliveryHostname(),
              "abcdefg");
    EXPECT_TRUE(input.autoSSLEnabled() && input.autoSSLOptional() && input.autoDeliverySSL());
    EXPECT_EQ(input.autoDeliveryPort(), 587);
    EXPECT_EQ(fieldNames(input),
              (QStringList{"_emailAddress", "_fullName", "_autoHostname", "_autoSSLEnabled", "_autoSSLOptional",
                           "_autoEnableSchema", "_autoEnableHost", "_autoEnablePath", "_autoDeliveryHostname",
                           "_autoDeliverySSL", "_autoDeliveryPort"} +
               kInputFields));
}

TEST(SetupInput, CalendarAndContactsKeepWhatIsSet)
{
    KACalDAVAccountSetupInput calendar;
    calendar.setServerAddress("s");
    calendar.setEmailAddress("e");
    EXPECT_EQ(calendar.serverAddress() + calendar.emailAddress(), "se");
    EXPECT_EQ(fieldNames(calendar), (QStringList{"_serverAddress", "_emailAddress"} + kInputFields));
    KACardDAVAccountSetupInput contacts;
    contacts.setServerAddress("s");
    contacts.setAutoHostname("h");
    contacts.setAutoSchema("https");
    EXPECT_EQ(contacts.serverAddress() + contacts.autoHostname() + contacts.autoSchema(), "shhttps");
    EXPECT_EQ(fieldNames(contacts), (QStringList{"_serverAddress", "_autoHostname", "_autoSchema"} + kInputFields));
}

TEST(SetupInput, ADirectoryTellsUnspecifiedSslFromNoSsl)
{
    KALDAPAccountSetupInput input;
    EXPECT_FALSE(input.useSSL().has_value());
    input.setUseSSL(false);
    ASSERT_TRUE(input.useSSL().has_value());
    EXPECT_FALSE(*input.useSSL());
    input.setServerAddress("s");
    input.setPort(636);
    input.setScope("sub");
    input.setSearchBase("dc=example");
    input.setAuthenticate(true);
    EXPECT_EQ(input.serverAddress() + input.scope() + input.searchBase(), "ssubdc=example");
    EXPECT_EQ(input.port(), 636);
    EXPECT_TRUE(input.authenticate());
    EXPECT_EQ(
        fieldNames(input),
        (QStringList{"_serverAddress", "_useSSL", "_port", "_scope", "_searchBase", "_authenticate"} + kInputFields));
}

TEST(SetupInput, ChatAndServerKeepWhatIsSet)
{
    KAChatAccountSetupInput chat;
    chat.setAccountType("aim");
    chat.setLoginName("l");
    chat.setServerName("s");
    chat.setServerPort(5222);
    chat.setUseSSL(true);
    chat.setUseKerberosV5(true);
    EXPECT_EQ(chat.accountType() + chat.loginName() + chat.serverName(), "aimls");
    EXPECT_EQ(chat.serverPort(), 5222);
    EXPECT_TRUE(chat.useSSL() && chat.useKerberosV5());
    EXPECT_EQ(fieldNames(chat),
              (QStringList{"_accountType", "_loginName", "_serverName", "_serverPort", "_useSSL", "_useKerberosV5"} +
               kInputFields));
    KAServerAccountSetupInput server;
    server.setServerName("n");
    server.setServerAddress("a");
    server.setEnableMail(true);
    server.setEnableJabber(true);
    server.setEnableCalDAV(true);
    server.setEnableCardDAV(true);
    EXPECT_FALSE(server.enableVPN());
    server.setEnableVPN(true);
    EXPECT_TRUE(server.enableMail() && server.enableJabber() && server.enableCalDAV() && server.enableCardDAV() &&
                server.enableVPN());
    EXPECT_EQ(server.serverName() + server.serverAddress(), "na");
    EXPECT_EQ(fieldNames(server), (QStringList{"_serverName", "_serverAddress", "_enableMail", "_enableJabber",
                                               "_enableCalDAV", "_enableCardDAV", "_enableVPN"} +
                                   kInputFields));
}

TEST(SetupResult, MailDescribesItsAccounts)
{
    KAMailAccountSetupResult result;
    const QString base = QStringLiteral("<KAMailAccountSetupResult: 0x%1>")
                             .arg(QString::number(reinterpret_cast<quintptr>(static_cast<KAObject *>(&result)), 16));
    EXPECT_EQ(result.description(), base + " receiving account: (null), sending account: (null)");
    result.setReceivingAccount("%2 %4");
    EXPECT_EQ(result.description(), base + " receiving account: %2 %4, sending account: (null)");
    result.setReceivingAccount("in");
    result.setSendingAccount("out");
    result.setReceivingAlreadyExistsInMail(true);
    EXPECT_EQ(result.description(), base + " receiving account: in (exists in Mail), sending account: out");
    result.setSendingAlreadyExistsInMail(true);
    EXPECT_EQ(result.description(),
              base + " receiving account: in (exists in Mail), sending account: out (exists in Mail)");
    EXPECT_EQ(fieldNames(result), (QStringList{"_receivingAccount", "_sendingAccount", "_receivingAlreadyExistsInMail",
                                               "_sendingAlreadyExistsInMail"}));
}

TEST(SetupResult, OthersKeepWhatIsSet)
{
    KACalDAVAccountSetupResult calendar;
    calendar.setUrl(QUrl("https://dav.example/"));
    EXPECT_EQ(calendar.url(), QUrl("https://dav.example/"));
    KACardDAVAccountSetupResult contacts;
    contacts.setUrl(QUrl("https://card.example/"));
    EXPECT_EQ(contacts.url(), QUrl("https://card.example/"));
    EXPECT_TRUE(fieldNames(KALDAPAccountSetupResult()).isEmpty());
    KAChatAccountSetupResult chat;
    EXPECT_TRUE(chat.setupError().isNull());
    chat.setAccountObject(7);
    chat.setIsExistingAccount(true);
    chat.setSetupError(KAError(kKAErrorDomain, 3));
    EXPECT_EQ(chat.accountObject(), 7);
    EXPECT_TRUE(chat.isExistingAccount());
    EXPECT_EQ(chat.setupError().code(), 3);
    EXPECT_EQ(fieldNames(chat), (QStringList{"_accountObject", "_isExistingAccount", "_error"}));
    KAServerAccountSetupResult server;
    server.setIsExistingAccount(true);
    server.setSetupError(KAError(kKAErrorDomain, 4));
    EXPECT_EQ(server.setupError().domain(), "CorvaneKavellAccountsErrorDomain");
    EXPECT_EQ(fieldNames(server), (QStringList{"_isExistingAccount", "_setupError"}));
}

TEST(SetupResult, GroupwareKeepsWhatIsSet)
{
    KAEWSAccountSetupResult result;
    result.setFullName("a");
    result.setEmail("b");
    result.setInternalHost("c");
    result.setInternalPath("d");
    result.setInternalUseSSL(true);
    result.setInternalPort(443);
    result.setExternalHost("e");
    result.setExternalPath("f");
    result.setExternalUseSSL(true);
    result.setExternalPort(8443);
    result.setInternalURL(QUrl("https://in.example/"));
    result.setExternalURL(QUrl("https://out.example/"));
    result.setRootFolderID("g");
    result.setAutodiscoverURL(QUrl("https://auto.example/"));
    EXPECT_EQ(result.fullName() + result.email() + result.internalHost() + result.internalPath() +
                  result.externalHost() + result.externalPath() + result.rootFolderID(),
              "abcdefg");
    EXPECT_EQ(result.internalPort() + result.externalPort(), 443 + 8443);
    EXPECT_TRUE(result.internalUseSSL() && result.externalUseSSL());
    EXPECT_EQ(result.internalURL().host() + result.externalURL().host() + result.autodiscoverURL().host(),
              "in.exampleout.exampleauto.example");
    EXPECT_EQ(fieldNames(result),
              (QStringList{"_fullName", "_email", "_internalHost", "_internalPath", "_internalUseSSL", "_internalPort",
                           "_externalHost", "_externalPath", "_externalUseSSL", "_externalPort", "_internalURL",
                           "_externalURL", "_rootFolderID", "_autodiscoverURL"}));
}

TEST(ChatService, AFreshOneShowsUserNameAndPasswordOnly)
{
    const auto service = KAChatService::initWithIdentifier("jabber");
    EXPECT_EQ(service->identifier(), "jabber");
    EXPECT_TRUE(service->displayName().isNull());
    EXPECT_TRUE(service->domainLabel().isNull());
    EXPECT_TRUE(service->accountLabel().isNull());
    EXPECT_TRUE(service->showUsernameField());
    EXPECT_TRUE(service->showPasswordField());
    EXPECT_FALSE(service->showServerHostField());
    EXPECT_FALSE(service->showServerPortField());
    EXPECT_FALSE(service->showUseSSLCheckbox());
    EXPECT_FALSE(service->showKerberosCheckbox());
}

TEST(ChatService, KeepsWhatIsSet)
{
    const auto service = KAChatService::initWithIdentifier("jabber");
    service->setIdentifier("other");
    service->setDisplayName("d");
    service->setDomainLabel("l");
    service->setAccountLabel("a");
    service->setShowUsernameField(false);
    service->setShowPasswordField(false);
    service->setShowServerHostField(true);
    service->setShowServerPortField(true);
    service->setShowUseSSLCheckbox(true);
    service->setShowKerberosCheckbox(true);
    EXPECT_EQ(service->identifier() + service->displayName() + service->domainLabel() + service->accountLabel(),
              "otherdla");
    EXPECT_FALSE(service->showUsernameField() || service->showPasswordField());
    EXPECT_TRUE(service->showServerHostField() && service->showServerPortField() && service->showUseSSLCheckbox() &&
                service->showKerberosCheckbox());
}
