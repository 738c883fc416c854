// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <nlohmann/json.hpp>

#include "tests/tools/client_fixture.h"

namespace kavell::test {

using Json = nlohmann::ordered_json;
using AttributeCommands = ClientTest;

TEST_F(AttributeCommands, AnAddedAccountIsListedWithItsNameAndServices)
{
    run({"add", "google", "anna@gmail.com", "fullname=Anna Example", "--service", "IMAPMail", "server=imap.gmail.com"});

    const ProgramResult result = client({"list"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "PROVIDER  LOGIN           NAME          SERVICES\n"
                             "google    anna@gmail.com  Anna Example  IMAPMail\n");
}

TEST_F(AttributeCommands, AnEmptyListSaysHowToAdd)
{
    const ProgramResult result = client({"list"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.error,
              "kavell-accounts: there are no accounts; add one with 'kavell-accounts add google anna@gmail.com'\n");
}

TEST_F(AttributeCommands, ListOfOneProviderLeavesTheOthersOut)
{
    run({"add", "google", "anna"});
    run({"add", "mail", "bob"});

    const Json list = Json::parse(client({"list", "--provider", "mail", "--json"}).output);

    ASSERT_EQ(list["accounts"].size(), 1U);
    EXPECT_EQ(list["accounts"][0]["provider"], "com.corvane.account.mail");
    EXPECT_EQ(list["accounts"][0]["login"], "bob");
}

TEST_F(AttributeCommands, ListNamesTheAddressesForCompletion)
{
    run({"add", "google", "anna"});
    run({"add", "org.example.forum", "bob"});

    EXPECT_EQ(client({"list", "--names"}).output, "google/anna\norg.example.forum/bob\n");
    EXPECT_EQ(client({"list", "--names", "--provider", "google"}).output, "anna\n");
}

TEST_F(AttributeCommands, EveryTypeOfValueIsShownAsItWasGiven)
{
    run({"add", "google", "anna"});
    run({"set", "google/anna", "text=a = b", "empty=", "string:string=:x", "int:int=-9223372036854775808",
         "large:int=9223372036854775807", "real:real=1", "small:real=-2.5e-300", "yes:bool=yes", "no:bool=false",
         "date:date=2026-01-31T12:00:00+02:00", "day:date=1999-12-31", "data:data=aGVsbG8=", "none:data=",
         "list:array=[1, 2.0, \"three\", true]", "map:dict={\"b\": {\"$data\": \"AA==\"}, \"a\": []}"});

    const ProgramResult result = client({"show", "google", "anna"});

    EXPECT_EQ(result.status, 0);
    EXPECT_NE(result.output.find("Attributes\n"
                                 "  text=a = b\n"
                                 "  empty=\n"
                                 "  string=:x\n"
                                 "  int:int=-9223372036854775808\n"
                                 "  large:int=9223372036854775807\n"
                                 "  real:real=1.0\n"
                                 "  small:real=-2.5e-300\n"
                                 "  yes:bool=true\n"
                                 "  no:bool=false\n"
                                 "  date:date=2026-01-31T10:00:00Z\n"
                                 "  day:date=1999-12-31T00:00:00Z\n"
                                 "  data:data=aGVsbG8=\n"
                                 "  none:data=\n"
                                 "  list:json=[1,2.0,\"three\",true]\n"
                                 "  map:json={\"b\":{\"$data\":\"AA==\"},\"a\":[]}\n"),
              std::string::npos)
        << result.output;
}

TEST_F(AttributeCommands, AKeyThatEndsLikeATypeIsShownWithTheTypeBehindIt)
{
    run({"add", "google", "anna", "a:b:string=x", "a:string:string=y", "a:B=z", "a:b:int=1"});

    const std::string shown = client({"show", "google", "anna"}).output;

    EXPECT_NE(shown.find("Attributes\n"
                         "  a:b:int=1\n"
                         "  a:string:string=y\n"
                         "  a:B=z\n"),
              std::string::npos)
        << shown;
    run({"set", "google", "anna", "a:b:string=x"});
    EXPECT_NE(client({"show", "google", "anna"}).output.find("  a:b:string=x\n"), std::string::npos);
}

TEST_F(AttributeCommands, TypesReachTheDataFile)
{
    run({"add", "google", "anna", "port:int=993", "on:bool=true", "real:real=1", "date:date=2026-01-31T10:00:00Z",
         "data:data=aGVsbG8="});

    const std::string file = readFile(dataFilePath(googleType, "anna"));

    for (const char *element : {"<key>com.corvane.Port</key>", "<integer>993</integer>", "<true/>", "<real>1",
                                "<date>2026-01-31T10:00:00Z</date>", "aGVsbG8="})
        EXPECT_NE(file.find(element), std::string::npos) << element << " in\n" << file;
}

TEST_F(AttributeCommands, AtNamesAFileOfDataOrJson)
{
    writeFile(home() + "/bytes", std::string_view("\0\xff", 2));
    writeFile(home() + "/value", "[true]");

    run({"add", "google", "anna", "bytes:data=@" + home() + "/bytes", "value:json=@" + home() + "/value"});

    const Json account = Json::parse(client({"show", "google", "anna", "--json"}).output);
    EXPECT_EQ(account["attributes"]["bytes"], Json::parse(R"({"$data": "AP8="})"));
    EXPECT_EQ(account["attributes"]["value"], Json::parse("[true]"));
}

TEST_F(AttributeCommands, AServiceCountsForTheWordsAfterIt)
{
    run({"add", "google", "anna"});
    run({"set", "google", "anna", "fullname=Anna", "--service", "caldav", "server=cal", "port:int=1", "-s",
         "org.example.Notes", "server=notes"});

    const Json account = Json::parse(client({"show", "google", "anna", "--json"}).output);

    EXPECT_EQ(account["attributes"], Json::parse(R"({"com.corvane.provider.fullname": "Anna"})"));
    EXPECT_EQ(account["services"], Json::parse(R"({"com.corvane.service.CalDAV": {"com.corvane.Server": "cal",
        "com.corvane.Port": 1}, "org.example.Notes": {"com.corvane.Server": "notes"}})"));
}

TEST_F(AttributeCommands, ShortKeysMeanTheStoresKeysAndOthersThemselves)
{
    run({"add", "mail", "anna", "server=1", "port=2", "path=3", "smtpServer=4", "smtpPort=5", "uid=6", "fullname=7",
         "nickname=8", "picture=9", "Server=10"});

    const Json account = Json::parse(client({"show", "mail", "anna", "--json"}).output);

    EXPECT_EQ(account["attributes"],
              Json::parse(R"({"com.corvane.Server": "1", "com.corvane.Port": "2", "com.corvane.path": "3",
                  "com.corvane.smtpServer": "4", "com.corvane.smtpPort": "5", "com.corvane.uid": "6",
                  "com.corvane.provider.fullname": "7", "com.corvane.provider.nickname": "8",
                  "com.corvane.provider.picture": "9", "Server": "10"})"));
}

struct ProviderCase {
    const char *word;
    const char *directory;
};

class ProviderWords : public ClientTest, public testing::WithParamInterface<ProviderCase> {};

TEST_P(ProviderWords, AnAccountsFileLiesInItsProvidersDirectory)
{
    run({"add", GetParam().word, "anna"});

    EXPECT_TRUE(std::filesystem::exists(dataFilePath(GetParam().directory, "anna")));
}

INSTANTIATE_TEST_SUITE_P(All, ProviderWords,
                         testing::Values(ProviderCase{"yahoo", "com.corvane.account.yahoo"},
                                         ProviderCase{"google", "com.corvane.account.google"},
                                         ProviderCase{"nimbrel", "com.corvane.account.nimbrel"},
                                         ProviderCase{"quillane", "com.corvane.account.placeholder"},
                                         ProviderCase{"facebook", "com.corvane.account.facebook"},
                                         ProviderCase{"exchange", "com.corvane.account.exchange"},
                                         ProviderCase{"aol", "com.corvane.account.aol"},
                                         ProviderCase{"mail", "com.corvane.account.mail"},
                                         ProviderCase{"cardell", "com.corvane.account.cardell"},
                                         ProviderCase{"parlex", "com.corvane.account.parlex"},
                                         ProviderCase{"tidewell", "com.corvane.account.tidewell"},
                                         ProviderCase{"haldenserver", "com.corvane.account.haldenserver"},
                                         ProviderCase{"test", "com.corvane.account.testing"},
                                         ProviderCase{"Google", "com.corvane.account.google"},
                                         ProviderCase{"com.corvane.account.google", "com.corvane.account.google"},
                                         ProviderCase{"org.example.forum", "org.example.forum"}));

TEST_F(AttributeCommands, UnsetRemovesAttributesAndTheLastOneItsService)
{
    run({"add", "google", "anna", "nickname=A", "fullname=B", "--service", "CalDAV", "server=c"});

    run({"unset", "google", "anna", "nickname", "--service", "CalDAV", "server"});

    const Json account = Json::parse(client({"show", "google", "anna", "--json"}).output);
    EXPECT_EQ(account["attributes"], Json::parse(R"({"com.corvane.provider.fullname": "B"})"));
    EXPECT_EQ(account["services"], Json::object());
}

TEST_F(AttributeCommands, UnsetAllOfAServiceLeavesTheAccountsOwnAttributes)
{
    run({"add", "google", "anna", "nickname=A", "--service", "CalDAV", "server=c", "port:int=1"});

    run({"unset", "google", "anna", "--all", "--service", "CalDAV"});

    const Json account = Json::parse(client({"show", "google", "anna", "--json"}).output);
    EXPECT_EQ(account["attributes"], Json::parse(R"({"com.corvane.provider.nickname": "A"})"));
    EXPECT_EQ(account["services"], Json::object());
}

TEST_F(AttributeCommands, AWordInBracketsIsOneWord)
{
    run({"add", "google", "[a,b]", "list=[1,2]"});

    EXPECT_TRUE(std::filesystem::exists(dataFilePath(googleType, "[a,b]")));
    const Json account = Json::parse(client({"show", "google", "[a,b]", "--json"}).output);
    EXPECT_EQ(account["attributes"]["list"], "[1,2]");
}

TEST_F(AttributeCommands, WordsBehindTwoDashesAreNoOptions)
{
    run({"add", "google", "--", "--json"});

    EXPECT_TRUE(std::filesystem::exists(dataFilePath(googleType, "--json")));
}

TEST_F(AttributeCommands, StoredControlCharactersDoNotReachTheTerminal)
{
    // U+009B begins a terminal's control sequences, U+202E turns the writing around; a property list can hold both.
    run({"add", "google", "anna",
         "fullname=a\xc2\x9b"
         "31m\xe2\x80\xae\x7f\nb"});

    for (const std::vector<std::string> &words : std::vector<std::vector<std::string>>{
             {"list"}, {"show", "google", "anna"}, {"show", "google", "anna", "--json"}, {"export"}}) {
        const std::string output = client(words).output;
        EXPECT_EQ(output.find("\xc2\x9b"), std::string::npos) << output;
        EXPECT_EQ(output.find('\x7f'), std::string::npos) << output;
    }
    EXPECT_NE(client({"show", "google", "anna"}).output.find("  fullname=a\\x9b31m\\u{202e}\\x7f\\nb\n"),
              std::string::npos);
}

TEST_F(AttributeCommands, ChangesAreReportedAsJsonOrNotAtAll)
{
    EXPECT_EQ(client({"add", "google", "anna"}).output, "Added google anna.\n");
    EXPECT_EQ(client({"set", "google", "anna", "a=b", "--json"}).output,
              "{\n  \"provider\": \"com.corvane.account.google\",\n  \"login\": \"anna\",\n  \"changed\": true\n}\n");
    EXPECT_EQ(client({"--json", "unset", "google", "anna", "a"}).output,
              "{\n  \"provider\": \"com.corvane.account.google\",\n  \"login\": \"anna\",\n  \"changed\": true\n}\n");
    EXPECT_EQ(client({"set", "google", "anna", "a=b", "--quiet"}).output, "");
}

TEST_F(AttributeCommands, AChangeThatCannotBeSavedFails)
{
    run({"add", "google", "anna"});
    const std::string directory = std::filesystem::path(dataFilePath(googleType, "anna")).parent_path();
    std::filesystem::rename(directory, directory + ".away");
    writeFile(directory, "in the way");

    const ProgramResult result = client({"add", "google", "bob"});

    EXPECT_EQ(result.status, 1);
    EXPECT_NE(result.error.find("kavell-accounts: the new account google bob could not be saved in "),
              std::string::npos)
        << result.error;
}

TEST_F(AttributeCommands, ADamagedAccountIsNamedInTheListAndNotChanged)
{
    run({"add", "google", "anna"});
    writeFile(dataFilePath(googleType, "damaged"), "<plist><dict>");
    const std::string before = everythingOnDisk();

    const ProgramResult list = client({"list"});
    const ProgramResult set = client({"set", "google", "damaged", "a=b"});

    EXPECT_EQ(list.status, 1);
    EXPECT_NE(list.output.find("google    damaged  (cannot be read)\n"), std::string::npos) << list.output;
    EXPECT_NE(list.output.find("google    anna\n"), std::string::npos) << list.output;
    EXPECT_EQ(set.status, 1);
    EXPECT_NE(set.error.find("the data file of google damaged cannot be read or is damaged"), std::string::npos);
    EXPECT_EQ(everythingOnDisk(), before);
}

TEST_F(AttributeCommands, ADirectoryInAFilesPlaceIsNoAccount)
{
    std::filesystem::create_directories(dataFilePath(googleType, "anna"));

    EXPECT_EQ(client({"show", "google", "anna"}).status, 1);
    EXPECT_EQ(client({"set", "google", "anna", "a=b"}).status, 1);
    EXPECT_EQ(client({"remove", "google", "anna", "--yes"}).status, 1);

    EXPECT_TRUE(std::filesystem::is_directory(dataFilePath(googleType, "anna")));
}

}  // namespace kavell::test
