// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <filesystem>

#include <nlohmann/json.hpp>

#include "tests/tools/client_fixture.h"

namespace kavell::test {

using Json = nlohmann::ordered_json;

class TransferCommands : public ClientTest {
protected:
    /// Imports a document with these accounts.
    [[nodiscard]] static ProgramResult import(const std::string &accounts, std::vector<std::string> options = {})
    {
        options.insert(options.begin(), {"import", "-"});
        return client(std::move(options), "{\"kavellAccounts\": 1, \"accounts\": [" + accounts + "]}");
    }

    [[nodiscard]] static Json shown(const std::string &login)
    {
        return Json::parse(client({"show", "google", login, "--json"}).output);
    }
};

TEST_F(TransferCommands, AnAccountTooLargeToBeSavedIsRefusedBeforeAnythingIsImported)
{
    std::string attributes;
    for (int number = 0; number < 9001; ++number)
        attributes += (number > 0 ? ", \"" : "\"") + std::to_string(number) + "\": true";
    const ProgramResult result = import(R"({"provider": "google", "login": "small", "attributes": {}, "services": {}},)"
                                        R"({"provider": "google", "login": "large", "services": {}, "attributes": {)" +
                                        attributes + "}}");
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.error, "kavell-accounts: nothing was imported, because google large is too large for an account, "
                            "which has room for 9000 keys and 30 MiB\n");
    EXPECT_EQ(client({"show", "google", "small"}).status, 3);
}

TEST_F(TransferCommands, AFileTooLargeForAnAttributeIsRefused)
{
    writeFile(std::filesystem::current_path().string() + "/large", std::string((size_t{16} << 20) + 1, 'x'));
    run({"add", "google", "anna"});
    const ProgramResult result = client({"set", "google", "anna", "picture:data=@large"});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.error, "kavell-accounts: the value of 'picture', the file 'large', is larger "
                            "than the 16 MiB that an attribute may have\n");
}

TEST_F(TransferCommands, AnImportedExportIsTheSameToTheLastByte)
{
    run({"add",
         "google",
         "anna",
         "text=\xc3\xa4\n\"x\"",
         "int:int=-9223372036854775808",
         "one:real=1",
         "tenth:real=0.1",
         "huge:real=1.7976931348623157e308",
         "yes:bool=true",
         "date:date=1932-12-13T20:45:52Z",
         "data:data=AP8=",
         "$odd=top",
         "map:json={\"$dict\": {\"$date\": \"no date\", \"a\": {\"$dict\": {\"$dict\": 1}}}}",
         "list:json=[[], {}, [true, 1, 1.0, \"1\"]]",
         "--service",
         "CalDAV",
         "server=c",
         "--service",
         "org.example.S",
         "$data=x"});
    run({"add", "org.example.forum", "b b"});
    const std::string exported = client({"export"}).output;
    run({"remove", "google", "anna", "--yes"});
    run({"remove", "org.example.forum", "b b", "--yes"});

    const ProgramResult imported = client({"import", "-"}, exported);

    EXPECT_EQ(imported.status, 0) << imported.error;
    EXPECT_EQ(client({"export"}).output, exported);
}

TEST_F(TransferCommands, WhatExportWritesSaysTheTypeOfEachValue)
{
    run({"add", "google", "anna", "r:real=1", "i:int=1", "d:date=2026-01-31",
         "b:data=AA==", "m:json={\"$dict\": {\"$date\": 1}}"});

    const Json document = Json::parse(client({"export"}).output);

    EXPECT_EQ(document["kavellAccounts"], 1);
    EXPECT_EQ(document["accounts"][0]["attributes"].dump(),
              R"({"r":1.0,"i":1,"d":{"$date":"2026-01-31T00:00:00Z"},"b":{"$data":"AA=="},"m":{"$dict":{"$date":1}}})");
}

TEST_F(TransferCommands, ExportToAFileReplacesItForItsOwnerOnly)
{
    run({"add", "google", "anna"});
    writeFile(home() + "/out.json", "old");

    run({"export", home() + "/out.json"});

    EXPECT_EQ(Json::parse(readFile(home() + "/out.json"))["accounts"][0]["login"], "anna");
    EXPECT_EQ(std::filesystem::status(home() + "/out.json").permissions(),
              std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

TEST_F(TransferCommands, ExportNamesWhatItLeavesOut)
{
    run({"add", "google", "anna"});
    writeFile(dataFilePath(googleType, "bad"), "nonsense");

    const ProgramResult result = client({"export"});

    EXPECT_EQ(result.status, 1);
    EXPECT_NE(result.error.find("kavell-accounts: left out, because their data files cannot be read: google bad; "
                                "'kavell-accounts doctor' says why\n"),
              std::string::npos);
    EXPECT_EQ(Json::parse(result.output)["accounts"].size(), 1U);
}

TEST_F(TransferCommands, ImportKeepsTheUUIDOfANewAccount)
{
    ASSERT_EQ(
        import(R"({"provider": "google", "login": "anna", "uuid": "123e4567-e89b-42d3-a456-426614174000"})").status, 0);

    EXPECT_EQ(shown("anna")["uuid"], "123e4567-e89b-42d3-a456-426614174000");
}

TEST_F(TransferCommands, ExistingAccountsStopAnImportThatDoesNotSayWhatToDo)
{
    run({"add", "google", "anna", "a=1"});
    const std::string before = everythingOnDisk();

    const ProgramResult result = import(R"({"provider": "google", "login": "new"},
                                           {"provider": "google", "login": "anna", "attributes": {"a": "2"}})");

    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.error,
              "kavell-accounts: nothing was imported, because these accounts exist already: google anna; say --merge "
              "to lay the imported attributes over theirs, --replace to take theirs away first, or --skip-existing to "
              "leave them alone\n");
    EXPECT_EQ(everythingOnDisk(), before);
}

TEST_F(TransferCommands, MergeLaysTheImportedAttributesOverTheExistingOnes)
{
    run({"add", "google", "anna", "a=1", "b=1", "--service", "CalDAV", "x=1"});

    const ProgramResult result = import(R"({"provider": "google", "login": "anna", "attributes": {"b": 2, "c": 3},
                                            "services": {"CalDAV": {"y": 2}}})",
                                        {"--merge"});

    EXPECT_EQ(result.output, "merge  google anna\n");
    EXPECT_EQ(shown("anna")["attributes"], Json::parse(R"({"a": "1", "b": 2, "c": 3})"));
    EXPECT_EQ(shown("anna")["services"], Json::parse(R"({"com.corvane.service.CalDAV": {"x": "1", "y": 2}})"));
}

TEST_F(TransferCommands, ReplaceTakesTheExistingAttributesAway)
{
    run({"add", "google", "anna", "a=1", "b=1", "--service", "CalDAV", "x=1"});

    const ProgramResult result =
        import(R"({"provider": "google", "login": "anna", "attributes": {"b": 2}})", {"--replace"});

    EXPECT_EQ(result.output, "replace  google anna\n");
    EXPECT_EQ(shown("anna")["attributes"], Json::parse(R"({"b": 2})"));
    EXPECT_EQ(shown("anna")["services"], Json::object());
}

TEST_F(TransferCommands, SkipLeavesExistingAccountsAndAddsTheOthers)
{
    run({"add", "google", "anna", "a=1"});

    const ProgramResult result = import(
        R"({"provider": "google", "login": "anna"}, {"provider": "google", "login": "new"})", {"--skip-existing"});

    EXPECT_EQ(result.output, "skip  google anna\nadd   google new\n");
    EXPECT_EQ(shown("anna")["attributes"], Json::parse(R"({"a": "1"})"));
    EXPECT_TRUE(std::filesystem::exists(dataFilePath(googleType, "new")));
}

TEST_F(TransferCommands, ADryRunOnlySaysWhatItWouldDo)
{
    const ProgramResult result = import(R"({"provider": "google", "login": "new"})", {"--dry-run"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "add  google new\n");
    EXPECT_EQ(everythingOnDisk(), "");
}

struct BadDocumentCase {
    std::string document;
    std::string sentence;
};

class BadDocument : public ClientTest, public testing::WithParamInterface<BadDocumentCase> {};

TEST_P(BadDocument, ChangesNothingEvenIfItsFirstAccountIsGood)
{
    const ProgramResult result = client({"import", "-"}, GetParam().document);

    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.error, "kavell-accounts: " + GetParam().sentence + "\n");
    EXPECT_EQ(everythingOnDisk(), "");
}

std::string documentWith(const std::string &account)
{
    return R"({"kavellAccounts": 1, "accounts": [{"provider": "google", "login": "good"}, )" + account + "]}";
}

INSTANTIATE_TEST_SUITE_P(
    All, BadDocument,
    testing::Values(
        BadDocumentCase{"", "standard input is not JSON: it goes wrong in line 1, byte 1"},
        BadDocumentCase{"{\n\"a\": x}", "standard input is not JSON: it goes wrong in line 2, byte 8"},
        BadDocumentCase{"[]", "standard input is no export of kavell-accounts: it has no number at \"kavellAccounts\""},
        BadDocumentCase{R"({"kavellAccounts": 2, "accounts": []})",
                        "standard input has the format 2, and this program knows 1 only; use a newer kavell-accounts"},
        BadDocumentCase{R"({"kavellAccounts": 1})", "standard input has no array \"accounts\""},
        BadDocumentCase{documentWith("5"), "standard input, account 2 is not a JSON object"},
        BadDocumentCase{documentWith(R"({"provider": "google"})"), "standard input, account 2 has no login"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": 5})"),
                        "standard input, account 2 has a login that is no text"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "../x"})"),
                        "standard input, account 2: the login name '../x' contains a \"/\"; it becomes a file's name, "
                        "so choose another"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "good"})"),
                        "standard input, account 2: google good is there twice"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "pasword": ""})"),
                        "standard input, account 2 has 'pasword', which means nothing; an account has provider, "
                        "login, uuid, attributes, services"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "uuid": "5"})"),
                        "standard input, account 2 (google x) has the uuid '5', which is none; write 36 characters "
                        "like 123e4567-e89b-42d3-a456-426614174000, or leave it out"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "attributes": []})"),
                        "standard input, account 2 (google x) attributes is not a JSON object"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "attributes": {"a": [null]}})"),
                        "standard input, account 2 (google x) attributes.a[0] is null, and accounts have no such "
                        "value; leave it out or remove it with unset"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "attributes": {"a": "\u0001"}})"),
                        "standard input, account 2 (google x) attributes.a has a character that a data file cannot "
                        "hold; give such bytes as data"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "attributes": {"a\uffff": "b"}})"),
                        "the key 'a\xef\xbf\xbf' in standard input, account 2 (google x) attributes has a character "
                        "that a data file cannot hold"},
        BadDocumentCase{
            documentWith(
                R"({"provider": "google", "login": "x", "attributes": {"com.corvane.account.CofferelToken": ""}})"),
            "standard input, account 2 (google x) attributes has com.corvane.account.CofferelToken, a reference to a "
            "password, which means nothing elsewhere; leave it out"},
        BadDocumentCase{documentWith(R"({"provider": "google", "login": "x", "services": {"CalDAV": 1}})"),
                        "standard input, account 2 (google x) CalDAV is not a JSON object"}));

}  // namespace kavell::test
