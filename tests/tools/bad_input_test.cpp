// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/tools/client_fixture.h"

namespace kavell::test {

/// Words that make no sense, and what the sentence about them must say.
struct BadInputCase {
    std::vector<std::string> words;
    std::string sentence;
};

class BadInput : public ClientTest, public testing::WithParamInterface<BadInputCase> {};

TEST_P(BadInput, IsRefusedInOneSentenceAndChangesNothing)
{
    run({"add", "google", "anna", "nickname=A"});
    const std::string before = everythingOnDisk();

    const ProgramResult result = client(GetParam().words);

    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.error, "kavell-accounts: " + GetParam().sentence + "\n");
    EXPECT_EQ(everythingOnDisk(), before);
}

const std::string isFileName = "; it becomes a file's name, so choose another";

INSTANTIATE_TEST_SUITE_P(
    Names, BadInput,
    testing::Values(
        BadInputCase{{"add", "google", "a/b"}, "the login name 'a/b' contains a \"/\"" + isFileName},
        BadInputCase{{"add", "google", "."}, "the login name '.' means a directory" + isFileName},
        BadInputCase{{"add", "google", ".."}, "the login name '..' means a directory" + isFileName},
        BadInputCase{{"add", "google/.."}, "the login name '..' means a directory" + isFileName},
        BadInputCase{{"add", "google", ""}, "the login name is empty" + isFileName},
        BadInputCase{{"add", "google", "a\nb"}, "the login name 'a\\nb' contains a control character" + isFileName},
        BadInputCase{{"add", "google", "a\x7f"}, "the login name 'a\\x7f' contains a control character" + isFileName},
        BadInputCase{{"add", "google", "a\xc2\x9b"},
                     "the login name 'a\\x9b' contains a control character" + isFileName},
        BadInputCase{{"add", "google", "a\xff"}, "the login name 'a\\xff' is not valid UTF-8" + isFileName},
        BadInputCase{{"add", "google", "a\xed\xa0\x80"},
                     "the login name 'a\\xed\\xa0\\x80' is not valid UTF-8" + isFileName},
        BadInputCase{{"add", "google", "a\xf8\x99\x99\xa0"},
                     "the login name 'a\\xf8\\x99\\x99\\xa0' is not valid UTF-8" + isFileName},
        BadInputCase{{"add", "google", std::string(250, 'x')},
                     "the login name has 250 bytes, and at most 249 are possible" + isFileName},
        BadInputCase{{"add", "org.example\n", "a"},
                     "the provider type 'org.example\\n' contains a control character" + isFileName},
        BadInputCase{{"add", "..", "a"}, "the provider type '..' means a directory" + isFileName}));

// The first byte of the key's second character is one of five bytes' length, which Unicode has no more.
INSTANTIATE_TEST_SUITE_P(Keys, BadInput,
                         testing::Values(BadInputCase{
                             {"set", "google", "anna", "a\xf8\x99\x99\xa0=1"},
                             "the attribute key 'a\\xf8\\x99\\x99\\xa0' has a control character or is not UTF-8; "
                             "choose another"}));

// U+FFFE is valid UTF-8 and no control character, but no XML file can hold it.
INSTANTIATE_TEST_SUITE_P(
    NoncharacterNames, BadInput,
    testing::Values(BadInputCase{{"set", "google", "anna", "a\xef\xbf\xbe=1"},
                                 "the attribute key 'a\xef\xbf\xbe' has a character that a data file cannot hold; "
                                 "choose another"},
                    BadInputCase{{"set", "google", "anna", "--service", "org.example\xef\xbf\xbe.x", "a=1"},
                                 "the service 'org.example\xef\xbf\xbe.x' has a character that a data file cannot "
                                 "hold; choose another"}));

const std::string knownProviders = "; known are yahoo, google, nimbrel, quillane, facebook, exchange, aol, mail, "
                                   "cardell, parlex, tidewell, haldenserver, test, or a full name such as "
                                   "com.corvane.account.yahoo";
const std::string knownTypes = "; known are string, int, real, bool, date, data, json, array, dict";

INSTANTIATE_TEST_SUITE_P(
    Words, BadInput,
    testing::Values(
        BadInputCase{{},
                     "a command is missing; 'kavell-accounts --help' shows all, 'kavell-accounts list' the "
                     "accounts"},
        BadInputCase{{"lsit"}, "unknown command 'lsit', did you mean 'list'?"},
        BadInputCase{{"--colour"}, "unknown option '--colour'; 'kavell-accounts --help' explains"},
        BadInputCase{{"list", "--all"}, "unknown option '--all'; 'kavell-accounts list --help' explains"},
        BadInputCase{{"list", "google"}, "the word 'google' is one too many; 'kavell-accounts list --help' explains"},
        BadInputCase{{"show"}, "the account is missing; name it as PROVIDER LOGIN, such as google anna@gmail.com"},
        BadInputCase{{"show", "google"},
                     "the login name is missing; name the account as PROVIDER LOGIN, such as google "
                     "anna@example.org"},
        BadInputCase{{"show", "gogle", "anna"},
                     "unknown provider type 'gogle' (did you mean 'google'?)" + knownProviders},
        BadInputCase{{"show", "zzzzzzzz", "anna"}, "unknown provider type 'zzzzzzzz'" + knownProviders},
        BadInputCase{{"add", "google", "anna"},
                     "the account google anna exists already; change it with 'kavell-accounts set'"},
        BadInputCase{{"set", "google", "anna"},
                     "there is nothing to set; write KEY=VALUE behind the account, such as server=imap.example.org"},
        BadInputCase{{"unset", "google", "anna"},
                     "there is nothing to remove; name keys behind the account, or say --all"},
        BadInputCase{{"unset", "google", "anna", "--all", "server"},
                     "--all removes every attribute, so name no key with it"},
        BadInputCase{{"unset", "google", "anna", "server"},
                     "google anna has no attribute 'server'; 'kavell-accounts show google anna' lists what it has"},
        BadInputCase{{"set", "google", "anna", "a=b", "--service", "CalDAV"},
                     "--service CalDAV has nothing behind it; it counts for the words after it, so put it before "
                     "them"},
        BadInputCase{{"set", "google", "anna", "--service", "CalDAF", "a=b"},
                     "unknown service 'CalDAF' (did you mean 'CalDAV'?); known are Mail, POPMail, IMAPMail, Photos, "
                     "LDAP, CardDAV, CalDAV, Jabber, VoIP, or a full name such as com.corvane.service.Mail"},
        BadInputCase{{"remove", "google", "anna"},
                     "removing google anna cannot be undone; say --yes to do it without being asked"},
        BadInputCase{{"watch", "--count", "0"}, "--count is a whole number of notifications, at least 1"},
        BadInputCase{{"watch", "--timeout", "-1"}, "--timeout is a number of seconds from 0 to 1000000"},
        BadInputCase{{"password"},
                     "say what to do with the password: set, get or remove, such as 'kavell-accounts "
                     "password set google anna@gmail.com'"},
        BadInputCase{{"password", "show", "google", "anna"}, "cannot 'show' a password; say set, get or remove"},
        BadInputCase{{"password", "set", "google", "anna", "secret"},
                     "a password is not given on the command line, where other users can read it; leave the last "
                     "word out and type it when asked, or give it on standard input"},
        BadInputCase{{"password", "set", "google", "anna"},
                     "the password is empty, so nothing was stored; 'kavell-accounts password remove' removes one"},
        BadInputCase{{"import"}, "the file is missing; name it, or write - for standard input"},
        BadInputCase{{"import", "/nonexistent"}, "cannot open '/nonexistent': No such file or directory"}));

INSTANTIATE_TEST_SUITE_P(
    Values, BadInput,
    testing::Values(
        BadInputCase{{"set", "google", "anna", "good=1", "word"},
                     "the word 'word' is no attribute; write KEY=VALUE, such as server=imap.example.org"},
        BadInputCase{{"set", "google", "anna", "=1"},
                     "an attribute key is missing; write KEY=VALUE, such as server=imap.example.org"},
        BadInputCase{{"set", "google", "anna", "a\nb=1"},
                     "the attribute key 'a\\nb' has a control character or is not UTF-8; choose another"},
        BadInputCase{{"set", "google", "anna", "a:itn=1"},
                     "unknown type 'itn' in 'a:itn' (did you mean 'int'?)" + knownTypes},
        BadInputCase{{"set", "google", "anna", "a:int=1x"},
                     "the value of 'a', '1x', is no whole number from -9223372036854775808 to 9223372036854775807; "
                     "write it like a:int=993"},
        BadInputCase{{"set", "google", "anna", "a:int=9223372036854775808"},
                     "the value of 'a', '9223372036854775808', is no whole number from -9223372036854775808 to "
                     "9223372036854775807; write it like a:int=993"},
        BadInputCase{{"set", "google", "anna", "a:real=nan"},
                     "the value of 'a', 'nan', is no real number; write it like a:real=1.5"},
        BadInputCase{{"set", "google", "anna", "a:bool=maybe"},
                     "the value of 'a', 'maybe', is neither true nor false; write a:bool=true or a:bool=false"},
        BadInputCase{{"set", "google", "anna", "a:date=2026-02-30"},
                     "the value of 'a', '2026-02-30', is no date; write it like a:date=2026-01-31T10:00:00Z"},
        BadInputCase{{"set", "google", "anna", "a:date=2069-01-19T03:14:08Z"},
                     "the value of 'a', '2069-01-19T03:14:08Z', is outside the dates that a data file can hold, "
                     "1932-12-13T20:45:52Z to 2069-01-19T03:14:07Z"},
        BadInputCase{{"set", "google", "anna", "a:data=abc"},
                     "the value of 'a' is not base64; write it like a:data=aGVsbG8= or a:data=@FILE"},
        BadInputCase{{"set", "google", "anna", "a:data=@/nonexistent"},
                     "cannot open '/nonexistent': No such file or directory"},
        BadInputCase{{"set", "google", "anna", "a=\x01"},
                     "the value of 'a' has a control character, which a data file cannot hold; give it as "
                     "a:data=BASE64 or :data=@FILE"},
        BadInputCase{{"set", "google", "anna", "a=\xff"},
                     "the value of 'a' is not valid UTF-8; give such bytes as a:data=BASE64 or :data=@FILE"},
        BadInputCase{{"set", "google", "anna", "a:json=[1,"},
                     "the value of 'a' is not JSON: it goes wrong in line 1, byte 4"},
        BadInputCase{{"set", "google", "anna", "a:json=[null]"},
                     "the value of 'a'[0] is null, and accounts have no such value; leave it out or remove it with "
                     "unset"},
        BadInputCase{{"set", "google", "anna", "a:json=9223372036854775808"},
                     "the value of 'a' is larger than 9223372036854775807, the largest integer of a data file"},
        BadInputCase{{"set", "google", "anna", "a:json={\"$date\":\"soon\"}"},
                     "the value of 'a' is no date between 1932-12-13T20:45:52Z and 2069-01-19T03:14:07Z; write it "
                     "like {\"$date\": \"2026-01-31T10:00:00Z\"}"},
        BadInputCase{{"set", "google", "anna", "a:json={\"$other\":1}"},
                     "the value of 'a' has a key beginning with \"$\" that means nothing here; a dictionary with "
                     "such keys is written {\"$dict\": {...}}"},
        BadInputCase{{"set", "google", "anna", "a:array={}"},
                     "the value of 'a' is no JSON array; write it like a:array='[\"a\", \"b\"]'"},
        BadInputCase{{"set", "google", "anna", "com.corvane.account.CofferelToken:data=AA=="},
                     "the attribute 'com.corvane.account.CofferelToken' refers to the password; change it with "
                     "'kavell-accounts password set' or 'password remove'"}));

using NestedInput = ClientTest;

TEST_F(NestedInput, AMillionLevelsOfJsonAreRefused)
{
    run({"add", "google", "anna"});
    writeFile(home() + "/deep.json", std::string(1000000, '['));
    writeFile(home() + "/closed.json", std::string(1000, '[') + std::string(1000, ']'));

    EXPECT_EQ(client({"set", "google", "anna", "a:json=@" + home() + "/deep.json"}).status, 2);
    const ProgramResult closed = client({"set", "google", "anna", "a:json=@" + home() + "/closed.json"});
    EXPECT_EQ(closed.status, 2);
    EXPECT_NE(closed.error.find("is nested more than 100 levels deep"), std::string::npos);
}

using MissingAccount = ClientTest;

TEST_F(MissingAccount, HasAnExitCodeOfItsOwnAndTheNearestNameIsSuggested)
{
    run({"add", "google", "anna"});
    for (const std::vector<std::string> &words :
         std::vector<std::vector<std::string>>{{"show", "google", "ana"},
                                               {"set", "google", "ana", "a=b"},
                                               {"unset", "google", "ana", "a"},
                                               {"remove", "google", "ana", "--yes"},
                                               {"password", "get", "google", "ana"}}) {
        const ProgramResult result = client(words);
        EXPECT_EQ(result.status, 3) << words[0];
        EXPECT_EQ(result.error, "kavell-accounts: there is no account google ana, did you mean 'anna'?\n");
    }
}

}  // namespace kavell::test
