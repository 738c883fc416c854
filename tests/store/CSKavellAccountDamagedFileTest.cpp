// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Damaged and hostile data files: no crash, no hang, no account emptied, and no damaged file lost to a save.

#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <sys/stat.h>
#include <unistd.h>

#include <gmock/gmock.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

/// A record that has read a good file, whose file is then damaged.
class DamagedFile : public StoreTest {
protected:
    DamagedFile() { openGoodFile(); }

    void openGoodFile()
    {
        writeFile(fileOf("ada"),
                  accountFile("<key>a</key><integer>1</integer>",
                              "<key>com.corvane.service.Mail</key><dict><key>port</key><integer>25</integer></dict>"));
        m_account = openAccount("ada");
    }

    void expectUnchanged() const
    {
        EXPECT_TRUE(same(attributes(m_account), dictionary({{"a", integer(1)}})));
        EXPECT_TRUE(
            same(serviceAttributes(m_account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
        EXPECT_EQ(uuidOf(m_account), kUUID);
        EXPECT_FALSE(hasPendingChanges(m_account));
    }

    void expectRefused(std::string_view contents) const
    {
        writeFile(fileOf("ada"), contents);
        StandardErrorCapture capture;
        EXPECT_FALSE(CSKavellAccountLoadData(m_account.get()));
        EXPECT_EQ(capture.take(), kLoadMessage);
        expectUnchanged();
    }

    Account m_account;
};

std::string repeated(std::string_view part, int count)
{
    std::string whole;
    for (int index = 0; index < count; ++index)
        whole += part;
    return whole;
}

}  // namespace

TEST_F(DamagedFile, AnEmptyFileIsRefused)
{
    expectRefused("");
}

TEST_F(DamagedFile, TextThatIsNoPropertyListIsRefused)
{
    expectRefused("hello");
    expectRefused("<html><body>no</body></html>");
    expectRefused("{\"UUID\": \"json\"}");
    expectRefused(std::string(100, ' '));
}

TEST_F(DamagedFile, BinaryGarbageIsRefused)
{
    std::string bytes;
    uint32_t state = 1;
    for (int index = 0; index < 5000; ++index) {
        state = state * 1664525 + 1013904223;
        bytes += static_cast<char>(state >> 24);
    }
    expectRefused(bytes);
    expectRefused(std::string(4096, '\0'));
}

TEST_F(DamagedFile, AFileCutOffAtAnyByteIsRefused)
{
    const std::string whole = accountFile("<key>b</key><array><data>AAEC</data><true/></array>");
    const size_t end = whole.find("</plist>") + 8;
    for (size_t length = 0; length < end; ++length) {
        SCOPED_TRACE(whole.substr(0, length));
        expectRefused(std::string_view(whole).substr(0, length));
        if (HasFailure())
            return;
    }
}

TEST_F(DamagedFile, BytesThatAreNotUTF8AreRefused)
{
    expectRefused(accountFile("<key>a</key><string>\xFF\xFE</string>"));
    expectRefused(accountFile("<key>\xC0\xAF</key><string>a</string>"));
}

TEST_F(DamagedFile, AMillionLevelsAreRefused)
{
    expectRefused(propertyList("<key>AccountSettings</key>" + repeated("<array>", 1000000)));
    expectRefused(repeated("<dict><key>a</key>", 1000000));
    expectRefused(propertyList("<key>a</key>" + repeated("<array>", 1000000) + repeated("</array>", 1000000)));
}

TEST_F(DamagedFile, AMillionLevelsHiddenByWhereMarkupEndsAreRefused)
{
    // The parser goes on to where the quotes end, or stops at once, and sees all the levels; who ends the markup elsewhere
    // sees a comment, a section or an instruction around them.
    const std::string levels = "<dict><key>a</key>" + repeated("<array>", 1000000);
    expectRefused("<?a \"?><!--\" ?><plist>" + levels + "--><dict/>");
    expectRefused("<?><plist>" + levels + "?><dict/>");
    expectRefused("<!DOCTYPE plist \"><!--\"><plist>" + levels + "--><dict/>");
    expectRefused("<plist a=\"><b><![CDATA[\">" + levels + "]]></b></plist>");
}

TEST_F(DamagedFile, QuotesInPairsHideNothing)
{
    writeFile(fileOf("ada"), "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<!DOCTYPE plist PUBLIC \"a\" \"b\">\n"
                             "<plist version=\"1.0\" a=\"\"><dict a=\"b\"><key>AccountSettings</key>"
                             "<dict><key>c</key><string>\"</string></dict></dict></plist>");
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_TRUE(same(attributes(m_account), dictionary({{"c", text("\"")}})));
}

TEST_F(DamagedFile, AnEntityThatGrowsWithoutBoundIsRefused)
{
    std::string entities = "<?xml version=\"1.0\"?>\n<!DOCTYPE plist [\n<!ENTITY a0 \"aaaaaaaaaa\">\n";
    for (int level = 1; level < 12; ++level) {
        const std::string reference = "&a" + std::to_string(level - 1) + ";";
        entities += "<!ENTITY a" + std::to_string(level) + " \"" + repeated(reference, 10) + "\">\n";
    }
    expectRefused(entities + "]>\n<plist version=\"1.0\"><dict><key>UUID</key><string>&a11;</string></dict></plist>");
}

TEST_F(DamagedFile, AGigabyteIsRefusedWithoutReadingItAll)
{
    ASSERT_EQ(truncate(fileOf("ada").c_str(), off_t{1} << 30), 0);
    StandardErrorCapture capture;
    EXPECT_FALSE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(capture.take(), kLoadMessage);
    expectUnchanged();
}

TEST_F(DamagedFile, ATopLevelThatIsNoDictionaryIsRefused)
{
    expectRefused("<?xml version=\"1.0\"?><plist version=\"1.0\"><array><string>a</string></array></plist>");
    expectRefused("<?xml version=\"1.0\"?><plist version=\"1.0\"><string>a</string></plist>");
    expectRefused("<?xml version=\"1.0\"?><plist version=\"1.0\"></plist>");
}

TEST_F(DamagedFile, ABinaryPropertyListNeitherCrashesNorEmptiesTheAccount)
{
    // {"UUID": "x"} in the binary form, with its offset table and trailer.
    const std::string binary("bplist00\xD1\x01\x02TUUIDQx\x08\x0B\x10\0\0\0\0\0\0\x01\x01\0\0\0\0\0\0\0\x03"
                             "\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x12",
                             8 + 3 + 5 + 2 + 3 + 32);
    for (size_t length : {binary.size(), binary.size() - 1, size_t{8}}) {
        writeFile(fileOf("ada"), std::string_view(binary).substr(0, length));
        StandardErrorCapture capture;
        const bool accepted = CSKavellAccountLoadData(m_account.get());
        EXPECT_EQ(capture.take(), accepted ? "" : kLoadMessage);
        if (!accepted)
            expectUnchanged();
    }
}

TEST_F(DamagedFile, ControlCharactersNeitherCrashNorEmptyTheAccount)
{
    writeFile(fileOf("ada"), accountFile("<key>a</key><string>x\x01y\x1Bz</string>"));
    StandardErrorCapture capture;
    if (CSKavellAccountLoadData(m_account.get())) {
        EXPECT_EQ(capture.take(), "");
        EXPECT_TRUE(same(attribute(m_account, "a"), text("x\x01y\x1Bz")));
    } else {
        EXPECT_EQ(capture.take(), kLoadMessage);
        expectUnchanged();
    }
}

TEST_F(DamagedFile, AValueThatTheParserTakesForAnotherIsRefused)
{
    const std::string blanks(12, ' ');
    for (const std::string &value :
         {std::string("<integer>0993</integer>"), std::string("<integer>010</integer>"),
          std::string("<integer> -010 </integer>"), std::string("<integer>+08</integer>"),
          std::string("<integer>+-5</integer>"), std::string("<integer>-+5</integer>"), std::string("<real>+-5</real>"),
          std::string("<real>1,5</real>"), "<date>2026-01-31T10:00:00Z" + blanks + "</date>"}) {
        SCOPED_TRACE(value);
        expectRefused(accountFile("<key>a</key>" + value));
    }
}

TEST_F(DamagedFile, AnAmpersandThatBeginsNoReferenceIsRefused)
{
    for (const char *characters : {"Tom &amp Jerry; x", "&ampere;", "&lthello;", "&unknown;", "a &", "&;", "& amp;",
                                   "&<!-- -->lt;", "&am<!-- -->p;", "&AMP;"}) {
        SCOPED_TRACE(characters);
        expectRefused(accountFile("<key>a</key><string>" + std::string(characters) + "</string>"));
        expectRefused(accountFile("<key>a" + std::string(characters) + "</key><string>x</string>"));
    }
}

TEST_F(DamagedFile, WhatWouldBeLeftOutIsRefused)
{
    const std::string dictionary = "<dict><key>UUID</key><string>x</string></dict>";
    for (const std::string &document : std::vector<std::string>{
             "<plist><dict/><key>a</key><string>b</string></plist>",
             "<plist><dict/></plist><key>a</key><string>b</string>",
             "<plist>" + dictionary + dictionary + "</plist>",
             dictionary + dictionary,
             "<plist>" + dictionary + "</plist>" + dictionary,
             "<plist>" + dictionary + "</plist><dict/>",
             "<plist>" + dictionary + "x</plist>",
             "<plist>" + dictionary + "</plist>x",
             "x<plist>" + dictionary + "</plist>",
             "<plist>" + dictionary + "</foo>",
             "<plist><plist>" + dictionary + "</plist></plist>",
         }) {
        SCOPED_TRACE(document);
        expectRefused(document);
    }
    for (const char *entries :
         {"<key>a</key>", "<key>a</key><key>b</key><string>x</string>", "<string>x</string>", "<key>a</key><key/>",
          "<key>a</key><array><key>z</key></array>", "<key/><string>x</string>", "<key>a</key><true>false</true>",
          "<key>a</key><true><![CDATA[x]]></true>", "<key>a</key><plist><string>x</string></plist>",
          "<key>a</key><integer/>", "<key>a</key><integer value=\"7\" />", "<key>a</key><real/>", "<key>a</key><date/>",
          "<key>a</key><string b='>'>x</string>"}) {
        SCOPED_TRACE(entries);
        expectRefused(accountFile(entries));
    }
}

TEST_F(DamagedFile, ADepthThatCouldNotBeWrittenAgainIsRefused)
{
    // The root, AccountSettings and the arrays are containers of levels 2 to 255; one more could hold nothing.
    const auto contents = [](int arrays, std::string_view deepest) {
        return accountFile("<key>a</key>" + repeated("<array>", arrays) + std::string(deepest) +
                           repeated("</array>", arrays));
    };
    for (const char *deepest : {"<dict/>", "<array/>", "<dict></dict>", "<array><true/></array>"}) {
        SCOPED_TRACE(deepest);
        expectRefused(contents(252, deepest));
    }
    writeFile(fileOf("ada"), contents(252, "<true/>"));
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    setAttribute(m_account, "b", integer(4));
    commit(m_account);
    EXPECT_FALSE(hasPendingChanges(m_account));
    EXPECT_TRUE(same(attribute(openAccount("ada"), "b"), integer(4)));
}

TEST_F(DamagedFile, ManyReferencesInOneTextAreReadAsOne)
{
    // Four million of them would be ten minutes' work for the parser, were they one part of the text for it.
    const std::string lesses = repeated("&lt;", 1 << 22);
    writeFile(fileOf("ada"),
              accountFile("<key>a</key><real>1.5</real><!-- > &amp; --><key>b</key><string>" + lesses +
                          "<![CDATA[ > &amp; ]]>" + repeated("&#65;b&gt;", 1000) + "<!-- & -->z</string>"));
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_TRUE(
        same(attribute(m_account, "b"), text(std::string(1 << 22, '<') + " > &amp; " + repeated("Ab>", 1000) + "z")));
}

TEST_F(DamagedFile, KeysOfMoreThanAMebibyteAreNeitherReadNorWritten)
{
    const std::string half(1 << 19, 'k');
    for (const char *value : {"<true/>", "<real>1</real>"}) {
        SCOPED_TRACE(value);
        expectRefused(accountFile("<key>a" + half + "</key>" + value + "<key>b" + half + "</key>" + value));
        writeFile(fileOf("ada"), accountFile("<key>" + half + "</key>" + value));
        ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
        setAttribute(m_account, "b" + half, integer(1));
        StandardErrorCapture capture;
        commit(m_account);
        EXPECT_NE(capture.take(), "");
        EXPECT_TRUE(hasPendingChanges(m_account));
        setAttribute(m_account, "b" + half, nullptr);
        setAttribute(m_account, "c", integer(1));
        commit(m_account);
        EXPECT_FALSE(hasPendingChanges(m_account));
        EXPECT_TRUE(same(attribute(openAccount("ada"), "c"), integer(1)));
        openGoodFile();
    }
}

TEST_F(DamagedFile, TheLongestKeyThatIsWrittenIsRead)
{
    const StandardErrorCapture capture;
    for (const Value &value : {Value(integer(1)), Value(real(1.5))}) {
        const auto isWritten = [&](size_t length) {
            std::filesystem::remove(fileOf("long"));
            const Account account = openAccount("long");
            setAttribute(account, std::string(length, 'k'), value);
            commit(account);
            return !hasPendingChanges(account);
        };
        size_t refused = size_t{1} << 20, written = refused - 1024;  // the account has other keys
        while (refused - written > 1) {
            const size_t middle = (written + refused) / 2;
            (isWritten(middle) ? written : refused) = middle;
        }
        ASSERT_TRUE(isWritten(written));
        EXPECT_TRUE(same(attribute(openAccount("long"), std::string(written, 'k')), value));
    }
}

TEST_F(DamagedFile, ZerosSignsAndBlanksThatChangeNoValueAreRead)
{
    writeFile(
        fileOf("ada"),
        accountFile("<key>a</key><integer> 0 </integer><key>b</key><integer>-0</integer><key>c</key><integer>\n+10\n"
                    "</integer><key>d</key><integer>100</integer><key>e</key><real> +007.50 </real>"
                    "<key>f</key><date>\n  1970-01-01T00:00:09Z\n  </date>"));
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_TRUE(same(attributes(m_account), dictionary({{"a", integer(0)},
                                                        {"b", integer(0)},
                                                        {"c", integer(10)},
                                                        {"d", integer(100)},
                                                        {"e", real(7.5)},
                                                        {"f", date(9)}})));
}

TEST_F(DamagedFile, AReferenceToACharacterThatCouldNotBeWrittenAgainIsRefused)
{
    for (const char *reference : {"&#16;", "&#x1B;", "&#0;", "&#xFFFE;", "&#xFFFF;", "&#xD800;", "&#x110000;", "&#16",
                                  "&# 65;", "&#+65;", "&#X41;", "&#;", "&#-1;", "&#4294967361;"}) {
        SCOPED_TRACE(reference);
        expectRefused(accountFile("<key>a</key><string>x" + std::string(reference) + "</string>"));
        expectRefused(accountFile("<key>a" + std::string(reference) + "</key><string>x</string>"));
    }
}

TEST_F(DamagedFile, ACharacterThatCouldNotBeWrittenAgainIsRefused)
{
    for (const char *character : {"\xEF\xBF\xBE", "\xEF\xBF\xBF"}) {  // U+FFFE and U+FFFF, which XML does not have
        SCOPED_TRACE(character);
        expectRefused(accountFile("<key>a</key><string>x" + std::string(character) + "</string>"));
        expectRefused(accountFile("<key>a" + std::string(character) + "</key><string>x</string>"));
        expectRefused(accountFile("<key>a</key><string><![CDATA[" + std::string(character) + "]]></string>"));
    }
}

TEST_F(DamagedFile, ItsNeighboursAreReadAndWrittenAgain)
{
    // U+FFFD, U+10000, and U+1FFFE, which means nothing but which XML allows.
    constexpr std::string_view kNeighbours = "\xEF\xBF\xBD\xF0\x90\x80\x80\xF0\x9F\xBF\xBE";
    writeFile(fileOf("ada"), accountFile("<key>a</key><string>" + std::string(kNeighbours) + "</string>"));
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_TRUE(same(attribute(m_account, "a"), text(kNeighbours)));
    setAttribute(m_account, "b", integer(4));
    commit(m_account);
    EXPECT_FALSE(hasPendingChanges(m_account));
    EXPECT_TRUE(same(attribute(openAccount("ada"), "a"), text(kNeighbours)));
}

TEST_F(DamagedFile, OtherReferencesAndTextThatOnlyLooksLikeOneAreRead)
{
    writeFile(fileOf("ada"), accountFile("<!-- &#16; --><key>a</key><string>&#65;&#x9;&#x1F600;&#127;</string>"
                                         "<key>b</key><string><![CDATA[&#16;]]></string>"
                                         "<key>c</key><string>&amp;#16;</string>"));
    ASSERT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_TRUE(same(attribute(m_account, "a"), text("A\t\xF0\x9F\x98\x80\x7F")));
    EXPECT_TRUE(same(attribute(m_account, "b"), text("&#16;")));
    EXPECT_TRUE(same(attribute(m_account, "c"), text("&#16;")));
    setAttribute(m_account, "d", integer(4));
    commit(m_account);
    EXPECT_FALSE(hasPendingChanges(m_account));
    EXPECT_TRUE(same(attribute(openAccount("ada"), "b"), text("&#16;")));
}

TEST_F(DamagedFile, AWrongTypeOfServicesCountsAsAbsent)
{
    writeFile(fileOf("ada"), propertyList("<key>UUID</key><string>" + std::string(kUUID) +
                                          "</string><key>AccountSettings</key><dict><key>b</key><true/></dict>"
                                          "<key>Services</key><string>none</string>"));
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attributes(m_account), dictionary({{"b", boolean(true)}})));
    EXPECT_EQ(ServiceForID(m_account.get(), kCSKavellAccountServiceMail, false), nullptr);
}

TEST_F(DamagedFile, AWrongTypeOfAccountSettingsCountsAsAbsent)
{
    writeFile(fileOf("ada"),
              propertyList("<key>AccountSettings</key><array/><key>Services</key><dict>"
                           "<key>com.corvane.service.LDAP</key><dict><key>b</key><true/></dict></dict>"));
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(m_account).get()), 0u);
    EXPECT_TRUE(same(serviceAttributes(m_account, kCSKavellAccountServiceLDAP), dictionary({{"b", boolean(true)}})));
    EXPECT_EQ(uuidOf(m_account), kUUID);
}

TEST_F(DamagedFile, AWrongTypeOfUUIDCountsAsAbsent)
{
    writeFile(fileOf("ada"), propertyList("<key>UUID</key><integer>5</integer>"));
    EXPECT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(uuidOf(m_account), kUUID);
    const Account fresh = openAccount("ada");
    EXPECT_TRUE(hasPendingChanges(fresh));
    EXPECT_EQ(uuidOf(fresh).size(), 36u);
}

TEST_F(DamagedFile, AWrongTypeOfOneServiceLeavesTheOthers)
{
    writeFile(fileOf("ada"), accountFile("", "<key>com.corvane.service.Mail</key><string>none</string>"
                                             "<key>com.corvane.service.LDAP</key><dict><key>b</key><true/></dict>"
                                             "<key>com.corvane.service.CalDAV</key><array/>"));
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(m_account, kCSKavellAccountServiceMail).get()), 0u);
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(m_account, kCSKavellAccountServiceCalDAV).get()), 0u);
    EXPECT_TRUE(same(serviceAttributes(m_account, kCSKavellAccountServiceLDAP), dictionary({{"b", boolean(true)}})));
}

TEST_F(DamagedFile, ADirectoryInItsPlaceLeavesTheRecord)
{
    std::filesystem::remove(fileOf("ada"));
    std::filesystem::create_directory(fileOf("ada"));
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(m_account.get()));
    EXPECT_EQ(capture.take(), "");
    expectUnchanged();
}

TEST_F(DamagedFile, AFifoInItsPlaceNeitherHangsNorEmptiesTheRecord)
{
    std::filesystem::remove(fileOf("ada"));
    ASSERT_EQ(mkfifo(fileOf("ada").c_str(), 0600), 0);
    StandardErrorCapture capture;
    const bool loaded = CSKavellAccountLoadData(m_account.get());
    EXPECT_EQ(capture.take(), loaded ? "" : kLoadMessage);
    expectUnchanged();
    setAttribute(m_account, "b", integer(2));
    commit(m_account);
    EXPECT_EQ(capture.take(), kSaveMessage);
    EXPECT_TRUE(hasPendingChanges(m_account));
}

TEST_F(DamagedFile, ADamagedFileAboutToBeReplacedIsKeptBesideIt)
{
    writeFile(fileOf("ada"), "damaged, but perhaps worth something");
    setAttribute(m_account, "b", integer(2));
    StandardErrorCapture capture;
    commit(m_account);
    EXPECT_EQ(capture.take(), kLoadMessage);
    EXPECT_FALSE(hasPendingChanges(m_account));
    const Names kept = entriesBeginningWith("damaged");
    ASSERT_EQ(kept.size(), 1u);
    EXPECT_THAT(kept[0], testing::MatchesRegex("damaged-[0-9a-f]{16}-[0-9]{8}T[0-9]{6}Z.*"));
    EXPECT_FALSE(kept[0].ends_with(".plist"));
    EXPECT_EQ(readFile(providerDirectory() + "/" + kept[0]), "damaged, but perhaps worth something");
    EXPECT_EQ(permissionsOf(providerDirectory() + "/" + kept[0]), 0600u);
    // What the record last read well is still its committed side, and is saved with the change.
    EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"a", integer(1)}, {"b", integer(2)}})));
}

TEST_F(DamagedFile, EachDamagedFileIsKeptForItself)
{
    for (int round = 0; round < 3; ++round) {
        writeFile(fileOf("ada"), "damaged " + std::to_string(round));
        setAttribute(m_account, "b", integer(round));
        StandardErrorCapture capture;
        commit(m_account);
        EXPECT_EQ(capture.take(), kLoadMessage);
    }
    Names contents;
    for (const std::string &name : entriesBeginningWith("damaged"))
        contents.push_back(readFile(providerDirectory() + "/" + name));
    std::sort(contents.begin(), contents.end());
    EXPECT_EQ(contents, (Names{"damaged 0", "damaged 1", "damaged 2"}));
}

TEST_F(DamagedFile, AGoodFileIsNotKeptBesideItself)
{
    setAttribute(m_account, "b", integer(2));
    commit(m_account);
    EXPECT_EQ(entriesBeginningWith("damaged"), Names{});
}

TEST_F(DamagedFile, ADamagedFileOfANewRecordIsAnAccountOfItsOwn)
{
    writeFile(fileOf("ada"), "damaged");
    StandardErrorCapture capture;
    const Account account = openAccount("ada");
    EXPECT_EQ(capture.take(), kLoadMessage);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_NE(uuidOf(account), kUUID);
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(account).get()), 0u);
}
