// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <gmock/gmock.h>
#include <sstream>

#include "tests/tools/client_fixture.h"

namespace kavell::test {

/// The bash completion, asked as bash asks it when the tab key is pressed at the end of a line.
class BashCompletion : public ClientTest {
protected:
    [[nodiscard]] static std::vector<std::string> complete(const std::string &line)
    {
        const std::string script = "PATH=" + buildPath("bin") + ":$PATH; compopt() { :; }; source '" +
                                   sourcePath("tools/completion/kavell-accounts.bash") +
                                   "'; COMP_LINE=$1; COMP_POINT=${#1}; _kavell_accounts; printf '%s\\n' "
                                   "\"${COMPREPLY[@]}\"";
        const ProgramResult result = runProgram({"bash", "-c", script, "bash", line});
        EXPECT_EQ(result.error, "");
        std::vector<std::string> words;
        std::istringstream lines(result.output);
        for (std::string word; std::getline(lines, word);)
            if (!word.empty())
                words.push_back(word);
        return words;
    }
};

TEST_F(BashCompletion, OffersCommands)
{
    EXPECT_THAT(complete("kavell-accounts s"), testing::ElementsAre("show", "set", "servers"));
}

TEST_F(BashCompletion, OffersKindsOfDataAndTheKeysOfSettings)
{
    EXPECT_THAT(complete("kavell-accounts match c"), testing::ElementsAre("calendar", "contacts", "chat"));
    EXPECT_THAT(complete("kavell-accounts match mail email"), testing::ElementsAre("emailAddress="));
    EXPECT_THAT(complete("kavell-accounts identify KAChat"),
                testing::ElementsAre("KAChatAccountType=", "KAChatLoginName=", "KAChatServer="));
    EXPECT_THAT(complete("kavell-accounts match --w"), testing::ElementsAre("--why"));
}

TEST_F(BashCompletion, OffersTheServersThatCanBeRemoved)
{
    run({"servers", "add", "mail.example.net"});

    EXPECT_THAT(complete("kavell-accounts servers "), testing::ElementsAre("add", "remove"));
    EXPECT_THAT(complete("kavell-accounts servers remove "), testing::ElementsAre("mail.example.net"));
    EXPECT_THAT(complete("kavell-accounts servers add "), testing::IsEmpty());
}

TEST_F(BashCompletion, OffersProvidersForAnAccount)
{
    EXPECT_THAT(complete("kavell-accounts show t"), testing::ElementsAre("tidewell", "test"));
    EXPECT_THAT(complete("kavell-accounts password get go"), testing::ElementsAre("google"));
}

TEST_F(BashCompletion, OffersTheLoginsOfTheProvider)
{
    run({"add", "google", "anna"});
    run({"add", "google", "bob"});
    run({"add", "mail", "carl"});

    EXPECT_THAT(complete("kavell-accounts show google "), testing::ElementsAre("anna", "bob"));
    EXPECT_THAT(complete("kavell-accounts --json password set mail "), testing::ElementsAre("carl"));
}

TEST_F(BashCompletion, ReplacesOnlyWhatStandsBehindTheAtSign)
{
    run({"add", "google", "anna@gmail.com"});

    EXPECT_THAT(complete("kavell-accounts show google an"), testing::ElementsAre("anna@gmail.com"));
    EXPECT_THAT(complete("kavell-accounts show google anna@g"), testing::ElementsAre("gmail.com"));
}

TEST_F(BashCompletion, OffersServicesAndKeys)
{
    EXPECT_THAT(complete("kavell-accounts set google anna --service Ca"), testing::ElementsAre("CardDAV", "CalDAV"));
    EXPECT_THAT(complete("kavell-accounts set google anna --service CalDAV po"), testing::ElementsAre("port="));
    EXPECT_THAT(complete("kavell-accounts unset google anna po"), testing::ElementsAre("port"));
}

TEST_F(BashCompletion, OffersOptionsOfTheCommand)
{
    EXPECT_THAT(complete("kavell-accounts doctor --r"), testing::ElementsAre("--repair"));
    EXPECT_THAT(complete("kavell-accounts list --r"), testing::IsEmpty());
}

/// What the program loads and says as a whole.
class ProgramItself : public ClientTest {};

TEST_F(ProgramItself, ListLoadsNoBusCredentialOrGLibLibrary)
{
    run({"add", "google", "anna"});

    const ProgramResult result = runProgram(commandLine({"list"}), {}, {"LD_DEBUG=files"});

    ASSERT_THAT(result.error, testing::HasSubstr("libkavellstore"));
    for (const char *library : {"libglib", "libgio", "libgobject", "libdbus", "libsodium", "kavellstore-services"})
        EXPECT_THAT(result.error, testing::Not(testing::HasSubstr(library)));
}

TEST_F(ProgramItself, EveryCommandExplainsItselfWithExamples)
{
    for (const char *command :
         {"list", "show", "add", "set", "unset", "remove", "password", "watch", "doctor", "import", "export"}) {
        const ProgramResult result = client({command, "--help"});
        EXPECT_EQ(result.status, 0);
        EXPECT_THAT(result.output, testing::HasSubstr("\nUsage: kavell-accounts " + std::string(command) + " "));
        EXPECT_THAT(result.output, testing::HasSubstr("\nExamples:\n  kavell-accounts " + std::string(command)));
        EXPECT_EQ(client({"help", command}).output, result.output);
    }
}

TEST_F(ProgramItself, TheManualPageNamesEveryCommand)
{
    const std::string page = readFile(sourcePath("docs/man/kavell-accounts.1"));
    for (const char *command :
         {"list", "show", "add", "set", "unset", "remove", "password", "watch", "doctor", "import", "export"})
        EXPECT_THAT(page, testing::ContainsRegex("\n(.BR |.BI |.fB|.f.)" + std::string(command)));
}

TEST_F(ProgramItself, SaysItsVersion)
{
    EXPECT_THAT(client({"--version"}).output, testing::MatchesRegex("kavell-accounts [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

}  // namespace kavell::test
