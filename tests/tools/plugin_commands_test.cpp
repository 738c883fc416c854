// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The commands that ask the object layer, over real bundles and a real name server.

#include <filesystem>
#include <regex>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/support/dns_server.h"
#include "tests/support/plugin_directory.h"
#include "tests/tools/client_fixture.h"

namespace kavell::test {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;
using Json = nlohmann::ordered_json;

class ObjectLayerCommands : public ClientTest {
protected:
    void addGoogle()
    {
        m_plugins.addListPlugin(
            {.identifier = kKAGooglePluginID, .providerType = kKAProviderGoogle, .domains = {"gmail.com"}});
    }

    [[nodiscard]] PluginDirectory &plugins() { return m_plugins; }
    [[nodiscard]] DnsServer &nameServer() { return m_nameServer; }
    [[nodiscard]] std::string pluginPath(const std::string &name) const
    {
        return m_plugins.path().toStdString() + "/" + name;
    }

    /// A step's rule, what was asked about and the answer, of a --json answer.
    [[nodiscard]] static std::vector<std::string> stepsOf(const Json &answer)
    {
        std::vector<std::string> steps;
        for (const Json &step : answer["steps"])
            steps.push_back(step["rule"].get<std::string>() + " | " + step["askedAbout"].dump() + " | " +
                            step["answer"].dump());
        return steps;
    }

private:
    DnsServer m_nameServer;
    PluginDirectory m_plugins;
};

class PluginsCommand : public ObjectLayerCommands {};
class IdentifyCommand : public ObjectLayerCommands {};
class MatchCommand : public ObjectLayerCommands {};
class ChildrenCommand : public ObjectLayerCommands {};
class ServersCommand : public ObjectLayerCommands {};

TEST_F(PluginsCommand, TellsWhatIsLoadedAndWhyTheRestWasRefused)
{
    addGoogle();
    std::filesystem::create_directory(pluginPath("empty.kaplugin"));
    std::filesystem::create_directory(pluginPath("Other.KAPlugin"));

    const ProgramResult result = client({"plugins"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, StartsWith("IDENTIFIER           KIND          STATE"));
    EXPECT_THAT(result.output, HasSubstr("com.google.kaplugin  account list  loaded"));
    EXPECT_THAT(result.output, HasSubstr(" no bundle        " + pluginPath("empty.kaplugin") + "\n"));
    EXPECT_THAT(result.output,
                HasSubstr("\n" + pluginPath("empty.kaplugin") + ": There is no readable Contents/Info.plist.\n"));
    EXPECT_THAT(result.output, HasSubstr(" wrong extension  " + pluginPath("Other.KAPlugin") + "\n"));
}

TEST_F(PluginsCommand, WritesTheSameAsJson)
{
    addGoogle();
    plugins().addDataPlugin({.identifier = kKAMailPluginID});

    const Json answer = Json::parse(client({"plugins", "--json"}).output);

    std::vector<std::string> loaded;
    for (const Json &bundle : answer["bundles"]) {
        if (bundle["state"] == "loaded")
            loaded.push_back(bundle["identifier"].get<std::string>() + " " + bundle["kind"].get<std::string>());
    }
    EXPECT_THAT(loaded,
                testing::UnorderedElementsAre("com.google.kaplugin account list", "com.corvane.mail.kaplugin data"));
}

TEST_F(PluginsCommand, LeavesTheUnsetSearchPathOut)
{
    unsetenv("VESK_FRAMEWORK_PATH");

    const ProgramResult result = client({"plugins"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, testing::Not(HasSubstr("(null)")));
    EXPECT_THAT(result.output, HasSubstr("/System/Library/KavellAccounts"));
}

TEST_F(IdentifyCommand, NamesThePluginAndItsProvider)
{
    addGoogle();

    const ProgramResult result = client({"identify", "anna@gmail.com"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("Plug-in:     com.google.kaplugin\n"
                                         "Provider:    com.corvane.account.google\n"));
    EXPECT_THAT(nameServer().queries(), IsEmpty());
}

TEST_F(IdentifyCommand, TellsAPluginThatIsNotInstalled)
{
    nameServer().addMailExchanger("hosted.example", 1, "alt1.aspmx.googlemail.com");

    const ProgramResult result = client({"identify", "anna@hosted.example"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, StartsWith("Plug-in:     com.google.kaplugin (not installed)\nProvider:    -\n"));
}

TEST_F(IdentifyCommand, ABrokenBundleIsReportedOnceThoughSeveralRulesSearch)
{
    addGoogle();
    for (const auto &entry : std::filesystem::directory_iterator(pluginPath("com.google.kaplugin/Contents"))) {
        if (entry.path().filename().string().starts_with("Linux-"))
            std::filesystem::remove_all(entry.path());
    }

    const std::string error = client({"identify", "anna@nobody.example"}).error;

    const std::string line =
        "kavell-accounts: *** Loading bundle at path " + pluginPath("com.google.kaplugin") + " failed\n";
    EXPECT_THAT(error, HasSubstr(line));
    EXPECT_EQ(error.find(line), error.rfind(line));
}

TEST_F(IdentifyCommand, WhyShowsEachRuleWithItsAnswerAndTime)
{
    addGoogle();

    const ProgramResult result = client({"identify", "anna@gmail.com", "--why"});

    EXPECT_THAT(result.output, HasSubstr("\nRULE "));
    EXPECT_TRUE(std::regex_search(
        result.output, std::regex(R"(\ndomains of the plug-ins +gmail\.com +com\.google\.kaplugin +[0-9.]+ [um]s\n)")))
        << result.output;
}

TEST_F(IdentifyCommand, WhatNobodyClaimsHasAnExitCodeOfItsOwn)
{
    const ProgramResult result = client({"identify", "anna@nobody.example"});

    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.error, "kavell-accounts: no plug-in claims these settings; --why shows what was tried\n");
}

TEST_F(IdentifyCommand, JsonHasTheStepsAndNullForWhatIsUnknown)
{
    addGoogle();

    const ProgramResult result = client({"identify", "emailAddress=anna@nobody.example", "--json"});

    EXPECT_EQ(result.status, 3);
    const Json answer = Json::parse(result.output);
    EXPECT_TRUE(answer["pluginID"].is_null());
    EXPECT_EQ(answer["installed"], false);
    EXPECT_THAT(stepsOf(answer), testing::Contains("domains of the plug-ins | \"nobody.example\" | null"));
}

TEST_F(IdentifyCommand, AServerIsAskedAboutAsAServer)
{
    addGoogle();
    run({"servers", "add", "mail.work.example"});

    const Json answer = Json::parse(client({"identify", "mail.work.example", "--json"}).output);

    EXPECT_EQ(answer["pluginID"], "com.corvane.haldenserver.kaplugin");
    EXPECT_THAT(stepsOf(answer), testing::Contains("registered server | \"mail.work.example\" | "
                                                   "\"com.corvane.haldenserver.kaplugin\""));
}

TEST_F(IdentifyCommand, SettingsComeFromJsonAndPropertyListFilesAndStandardInput)
{
    addGoogle();
    const std::string json = R"({"emailAddress": "anna@gmail.com"})";
    writeFile(home() + "/settings.json", json);
    writeFile(home() + "/settings.plist", "<?xml version=\"1.0\"?><plist version=\"1.0\"><dict>"
                                          "<key>emailAddress</key><string>anna@gmail.com</string></dict></plist>");
    for (const ProgramResult &result :
         {client({"identify", home() + "/settings.json"}), client({"identify", home() + "/settings.plist"}),
          client({"identify", "-"}, json)}) {
        EXPECT_EQ(result.status, 0) << result.error;
        EXPECT_THAT(result.output, StartsWith("Plug-in:     com.google.kaplugin\n"));
    }
}

TEST_F(IdentifyCommand, ABadFileIsNamed)
{
    writeFile(home() + "/settings.json", "[1]");
    const ProgramResult list = client({"identify", home() + "/settings.json"});
    EXPECT_EQ(list.status, 2);
    EXPECT_EQ(list.error, "kavell-accounts: '" + home() +
                              "/settings.json' holds no settings: a property list or a JSON object is needed\n");

    const ProgramResult missing = client({"identify", home() + "/none.json"});
    EXPECT_EQ(missing.status, 2);
    EXPECT_EQ(missing.error, "kavell-accounts: cannot open '" + home() + "/none.json': No such file or directory\n");
}

TEST_F(MatchCommand, FindsTheAccountOfAnApplicationsAccount)
{
    addGoogle();
    run({"add", "google", "anna@gmail.com"});

    const ProgramResult result = client({"match", "mail", "emailAddress=anna@gmail.com"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, StartsWith("Provider:  com.corvane.account.google\n"
                                          "Login:     anna@gmail.com\n"
                                          "UUID:      "));
}

TEST_F(MatchCommand, WhyShowsEachLoginNameThatWasTried)
{
    addGoogle();
    run({"add", "google", "anna@gmail.com"});

    const Json answer = Json::parse(client({"match", "mail", "emailAddress=anna@gmail.com", "--json"}).output);

    EXPECT_EQ(answer["account"]["login"], "anna@gmail.com");
    EXPECT_THAT(stepsOf(answer),
                ElementsAre("domains of the plug-ins | \"gmail.com\" | \"com.google.kaplugin\"",
                            "login name at the provider | \"anna\" | null",
                            "login name at the provider | \"anna@gmail.com\" | " + answer["account"]["uuid"].dump()));
    EXPECT_THAT(client({"match", "mail", "emailAddress=anna@gmail.com", "--why"}).output,
                HasSubstr("\nlogin name at the provider  anna "));
}

TEST_F(MatchCommand, AnAccountThatIsNotThereIsNotMade)
{
    addGoogle();

    const ProgramResult result = client({"match", "chat", "KAChatAccountType=google", "KAChatLoginName=anna"});

    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.error, "kavell-accounts: no account of the account list matches; --why shows what was tried\n");
    EXPECT_EQ(client({"list", "--names"}).output, "");
}

TEST_F(ChildrenCommand, ListsTheAccountsOfTheApplications)
{
    addGoogle();
    plugins().addDataPlugin({.identifier = kKAMailPluginID});
    const auto account = KAProvider::initWithProviderType(kKAProviderGoogle)->createAccountWithLoginName("anna");
    account->addChildAccountDict({{"uid", "child-1"}, {"pluginID", kKAMailPluginID}, {"password", "secret"}},
                                 "child-1");
    account->addChildAccountDict({{"uid", "child-2"}, {"pluginID", kKACalendarPluginID}}, "child-2");
    _CSKavellAccountCommitChanges(account->accountRef());

    const ProgramResult result = client({"children", "google/anna"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "UID      APPLICATION           STATE    PLUG-IN\n"
                             "child-1  com.corvane.mail      active   com.corvane.mail.kaplugin\n"
                             "child-2  com.corvane.Tidewell  unknown  com.corvane.calendar.kaplugin\n");
    EXPECT_THAT(client({"children", "google/anna", "--json"}).output, testing::Not(HasSubstr("secret")));
}

TEST_F(ChildrenCommand, AnAccountWithoutChildrenAndAMissingOneDiffer)
{
    run({"add", "google", "anna"});

    const ProgramResult none = client({"children", "google", "anna"});
    EXPECT_EQ(none.status, 0);
    EXPECT_EQ(none.output, "");
    EXPECT_EQ(none.error, "kavell-accounts: no client application holds an account for 'google anna'\n");
    const ProgramResult missing = client({"children", "google", "bert"});
    EXPECT_EQ(missing.status, 3);
    EXPECT_EQ(missing.error, "kavell-accounts: there is no account google bert; 'kavell-accounts list' shows all\n");
}

TEST_F(ServersCommand, AddedServersAreListedUntilTheyAreRemoved)
{
    run({"servers", "add", "mail.work.example", "kKAServiceIMAP", "kKAServiceCalDAV"});
    run({"servers", "add", "other.example"});
    EXPECT_EQ(client({"servers"}).output, "SERVER             SERVICES\n"
                                          "mail.work.example  kKAServiceIMAP kKAServiceCalDAV\n"
                                          "other.example\n");
    EXPECT_EQ(client({"servers", "--names"}).output, "mail.work.example\nother.example\n");

    EXPECT_EQ(client({"servers", "remove", "mail.work.example"}).output, "Removed 'mail.work.example'.\n");
    EXPECT_EQ(Json::parse(client({"servers", "--json"}).output)["servers"],
              Json::parse(R"([{"server": "other.example", "services": []}])"));
}

TEST_F(ServersCommand, RemovingAnUnknownServerFails)
{
    const ProgramResult result = client({"servers", "remove", "mail.work.example"});

    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.error, "kavell-accounts: there is no server 'mail.work.example'\n");
}

TEST_F(ServersCommand, NoServersSayHowToAddOne)
{
    const ProgramResult result = client({"servers"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.error, "kavell-accounts: there are no servers; add one with 'kavell-accounts servers add "
                            "mail.example.net'\n");
}

TEST_F(ObjectLayerCommands, WordsThatMakeNoSenseChangeNothing)
{
    const std::pair<std::vector<std::string>, std::string> rows[] = {
        {{"plugins", "word"}, "the word 'word' is one too many; 'kavell-accounts plugins --help' explains"},
        {{"identify"}, "settings are missing: an address, a server, a file or KEY=VALUE"},
        {{"identify", "two words"}, "'two words' is no address, server, file or KEY=VALUE"},
        {{"match"}, "say what kind of account it is: mail, calendar, contacts or chat"},
        {{"match", "fax", "a=b"}, "unknown kind of data 'fax'; known are mail, calendar, contacts, chat"},
        {{"match", "mail"}, "settings are missing: an address, a server, a file or KEY=VALUE"},
        {{"servers", "ad"}, "unknown action 'ad'; known are add and remove"},
        {{"servers", "add"}, "the server is missing; name its host, such as mail.example.net"},
        {{"servers", "remove", "a.example", "b.example"},
         "the word 'b.example' is one too many; 'kavell-accounts servers --help' explains"},
    };
    for (const auto &[words, sentence] : rows) {
        const ProgramResult result = client(words);
        EXPECT_EQ(result.status, 2) << sentence;
        EXPECT_EQ(result.output, "");
        EXPECT_EQ(result.error, "kavell-accounts: " + sentence + "\n");
    }
    EXPECT_EQ(everythingOnDisk(), "");
}

TEST_F(ObjectLayerCommands, OtherCommandsStartWithoutTheToolkit)
{
    run({"add", "google", "anna"});

    const ProgramResult list = runProgram(commandLine({"list"}), {}, {"LD_DEBUG=files"});

    EXPECT_THAT(list.error, HasSubstr("libkavellstore.so"));
    EXPECT_THAT(list.error, testing::Not(HasSubstr("libQt6")));
    EXPECT_THAT(runProgram(commandLine({"servers"}), {}, {"LD_DEBUG=files"}).error, HasSubstr("libQt6Core"));
}

}  // namespace kavell::test
