// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <csignal>
#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "tests/tools/client_fixture.h"
#include "tests/tools/pseudo_terminal.h"

namespace kavell::test {

using Json = nlohmann::json;

/// The password commands with the vault, whose passphrase is in a file.
class PasswordCommand : public ClientTest {
protected:
    void SetUp() override
    {
        ClientTest::SetUp();
        writeFile(home() + "/passphrase", "correct horse");
        std::filesystem::permissions(home() + "/passphrase", std::filesystem::perms::owner_all);
        setenv("XDG_DATA_HOME", (home() + "/.local/share").c_str(), 1);
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        setenv("KAVELL_VAULT_PASSPHRASE_FILE", (home() + "/passphrase").c_str(), 1);
        run({"add", "google", "anna"});
    }

    [[nodiscard]] static std::string passwordState()
    {
        return Json::parse(client({"show", "google", "anna", "--json"}).output)["passwordState"];
    }

    /// Another passphrase than the one that the vault was made with.
    void forgetPassphrase() const { writeFile(home() + "/passphrase", "wrong"); }
};

TEST_F(PasswordCommand, APasswordFromStandardInputIsReadBack)
{
    run({"password", "set", "google", "anna"}, "s3cret with blanks \n");

    const ProgramResult result = client({"password", "get", "google", "anna"});

    EXPECT_EQ(result.status, 0) << result.error;
    EXPECT_EQ(result.output, "s3cret with blanks \n");
    EXPECT_EQ(passwordState(), "stored");
}

TEST_F(PasswordCommand, ThePasswordIsInNoFileAsItStands)
{
    run({"password", "set", "google", "anna"}, "s3cret");

    EXPECT_EQ(everythingOnDisk().find("s3cret"), std::string::npos);
    EXPECT_EQ(client({"export"}).output.find("CofferelToken"), std::string::npos);
    EXPECT_EQ(client({"show", "google", "anna"}).output.find("CofferelToken"), std::string::npos);
}

TEST_F(PasswordCommand, GetWithoutAPasswordSaysHowToStoreOne)
{
    const ProgramResult result = client({"password", "get", "google", "anna"});

    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.error, "kavell-accounts: google anna has no password stored; 'kavell-accounts password set google "
                            "anna' stores one\n");
}

TEST_F(PasswordCommand, ARemovedPasswordIsAbsent)
{
    run({"password", "set", "google", "anna"}, "s3cret");

    const ProgramResult result = client({"password", "remove", "google", "anna"});

    EXPECT_EQ(result.status, 0) << result.error;
    EXPECT_EQ(result.output, "Removed the password of google anna.\n");
    EXPECT_EQ(passwordState(), "absent");
    EXPECT_EQ(client({"password", "get", "google", "anna"}).status, 1);
}

TEST_F(PasswordCommand, RemovingAnAccountRemovesItsPassword)
{
    run({"password", "set", "google", "anna"}, "s3cret");

    run({"remove", "google", "anna", "--yes"});

    const ProgramResult doctor = client({"doctor"});
    EXPECT_EQ(doctor.status, 0) << doctor.output;
    EXPECT_EQ(doctor.output, "0 accounts examined, no problems.\n");
}

TEST_F(PasswordCommand, RemovingADamagedAccountRemovesItsPassword)
{
    run({"password", "set", "google", "anna"}, "s3cret");
    writeFile(dataFilePath(googleType, "anna"), "<plist><dict>");

    const ProgramResult removed = client({"remove", "google", "anna", "--yes"});

    EXPECT_EQ(removed.status, 0) << removed.error;
    EXPECT_EQ(client({"doctor"}).output, "0 accounts examined, no problems.\n");
}

TEST_F(PasswordCommand, AKeptPasswordIsReportedByTheDoctorAndCanStillBeRemoved)
{
    run({"password", "set", "google", "anna"}, "s3cret");
    run({"remove", "google", "anna", "--yes", "--keep-password"});

    const ProgramResult doctor = client({"doctor"});

    EXPECT_EQ(doctor.status, 1);
    EXPECT_THAT(doctor.output, testing::HasSubstr("problem: a password is stored for google anna, and there is no such "
                                                  "account; 'kavell-accounts password remove google anna' removes "
                                                  "it\n"));
    run({"password", "remove", "google", "anna"});
    EXPECT_EQ(client({"doctor"}).status, 0);
}

TEST_F(PasswordCommand, AnAccountWhosePasswordIsGoneIsReportedByTheDoctor)
{
    run({"password", "set", "google", "anna"}, "s3cret");
    const std::string file = readFile(dataFilePath(googleType, "anna"));
    run({"password", "remove", "google", "anna"});
    writeFile(dataFilePath(googleType, "anna"), file);

    const ProgramResult doctor = client({"doctor"});

    EXPECT_EQ(doctor.status, 1);
    EXPECT_THAT(doctor.output, testing::HasSubstr("problem: the password that google anna refers to is gone; "));
    EXPECT_EQ(passwordState(), "absent");
}

TEST_F(PasswordCommand, AClosedVaultHasAnExitCodeOfItsOwnAndIsNotTakenForAnEmptyOne)
{
    run({"password", "set", "google", "anna"}, "s3cret");
    forgetPassphrase();

    const ProgramResult get = client({"password", "get", "google", "anna"});
    const ProgramResult set = client({"password", "set", "google", "anna"}, "other");

    EXPECT_EQ(get.status, 4) << get.error;
    EXPECT_THAT(get.error, testing::HasSubstr("the password of google anna cannot be read: the credential store is "));
    EXPECT_EQ(set.status, 4) << set.error;
    EXPECT_THAT(passwordState(), testing::AnyOf("refused", "locked"));
    const ProgramResult doctor = client({"doctor"});
    EXPECT_EQ(doctor.status, 0) << doctor.output;
    EXPECT_THAT(doctor.output, testing::HasSubstr("note: the passwords were not examined: the credential store (vault) "
                                                  "is "));
}

TEST_F(PasswordCommand, WithoutAStoreThePasswordIsNeitherStoredNorSaidToBeAbsent)
{
    run({"password", "set", "google", "anna"}, "s3cret");
    setenv("KAVELL_CREDENTIAL_STORE", "none", 1);

    EXPECT_EQ(passwordState(), "unreachable");
    EXPECT_EQ(client({"password", "get", "google", "anna"}).status, 4);
    EXPECT_EQ(client({"password", "set", "google", "anna"}, "other").status, 4);
    const ProgramResult removed = client({"remove", "google", "anna", "--yes"});
    EXPECT_EQ(removed.status, 4);
    EXPECT_EQ(removed.error, "kavell-accounts: google anna was removed, but not its password: the credential store is "
                             "unreachable; try 'kavell-accounts password remove google anna' later\n");
    EXPECT_FALSE(std::filesystem::exists(dataFilePath(googleType, "anna")));
}

TEST_F(PasswordCommand, BytesThatAreNoTextAreRefused)
{
    for (const std::string_view password : {std::string_view("a\xff"), std::string_view("a\0b", 3)}) {
        const ProgramResult result = client({"password", "set", "google", "anna"}, password);
        EXPECT_EQ(result.status, 2);
        EXPECT_EQ(result.error, "kavell-accounts: the password is not valid UTF-8 text, so nothing was stored\n");
    }
    EXPECT_EQ(passwordState(), "absent");
}

TEST_F(PasswordCommand, ImportReplacingAnAccountKeepsItsPassword)
{
    const std::string exported = client({"export"}).output;
    run({"password", "set", "google", "anna"}, "s3cret");

    run({"import", "-", "--replace"}, exported);
    run({"set", "google", "anna", "a=b"});
    run({"unset", "google", "anna", "--all"});

    EXPECT_EQ(client({"password", "get", "google", "anna"}).output, "s3cret\n");
}

TEST_F(PasswordCommand, OnATerminalThePasswordIsAskedTwiceAndNeverShown)
{
    PseudoTerminal terminal(commandLine({"password", "set", "google", "anna"}));
    ASSERT_TRUE(terminal.waitFor("Password for google anna: "));
    terminal.type("s3cret\n");
    ASSERT_TRUE(terminal.waitFor("Once more: "));
    terminal.type("s3cret\n");

    EXPECT_EQ(terminal.shownToTheEnd(), "Password for google anna: \r\nOnce more: \r\nStored the password of google "
                                        "anna.\r\n");
    EXPECT_EQ(terminal.wait(), 0);
    EXPECT_EQ(client({"password", "get", "google", "anna"}).output, "s3cret\n");
}

TEST_F(PasswordCommand, TwoDifferentPasswordsAreRefused)
{
    PseudoTerminal terminal(commandLine({"password", "set", "google", "anna"}));
    ASSERT_TRUE(terminal.waitFor("Password for google anna: "));
    terminal.type("s3cret\n");
    ASSERT_TRUE(terminal.waitFor("Once more: "));
    terminal.type("secret\n");

    EXPECT_EQ(terminal.wait(), 2);
    EXPECT_THAT(terminal.shownToTheEnd(), testing::HasSubstr("the two passwords differ; nothing was stored"));
    EXPECT_EQ(passwordState(), "absent");
}

TEST_F(PasswordCommand, CtrlCWhileTypingEndsTheProgramAndRestoresTheEcho)
{
    PseudoTerminal terminal(commandLine({"password", "set", "google", "anna"}));
    ASSERT_TRUE(terminal.waitFor("Password for google anna: "));
    EXPECT_FALSE(terminal.echoes());

    terminal.type("s3c\x03");

    EXPECT_EQ(terminal.wait(), 130);
    EXPECT_TRUE(terminal.echoes());
    EXPECT_EQ(terminal.shownToTheEnd().find("s3c"), std::string::npos);
    EXPECT_EQ(passwordState(), "absent");
}

}  // namespace kavell::test
