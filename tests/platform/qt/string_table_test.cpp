// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/string_table.h"

#include <gtest/gtest.h>

#include "tests/support/process.h"

namespace {

/// The texts of keys, a line each, for a user of these languages.
std::string texts(const std::string &languages, const std::vector<std::string> &keys)
{
    std::vector<std::string> command{kavell::test::buildPath("tests/language_probe"), "strings", KAVELL_TEST_STRINGS};
    command.insert(command.end(), keys.begin(), keys.end());
    return kavell::test::runProgram(command, {}, {"LANGUAGE=" + languages}).output;
}

TEST(StringTable, TextComesFromTheFirstOfTheUsersLanguagesThatHasIt)
{
    EXPECT_EQ(texts("fr:de", {"EVERYWHERE", "FRENCH_ONLY", "GERMAN_ONLY"}),
              "français\nseulement français\nnur deutsch\n");
    EXPECT_EQ(texts("de:fr", {"EVERYWHERE", "FRENCH_ONLY"}), "deutsch\nseulement français\n");
}

TEST(StringTable, EnglishIsTheLastResort)
{
    EXPECT_EQ(texts("it", {"EVERYWHERE"}), "english\n");
    EXPECT_EQ(texts("de:fr", {"ENGLISH_ONLY"}), "only english\n");
}

TEST(StringTable, EnglishBeforeAnotherLanguageIsAsked)
{
    EXPECT_EQ(texts("en:de", {"EVERYWHERE", "GERMAN_ONLY"}), "english\nnur deutsch\n");
}

TEST(StringTable, CountrysOwnTextsComeBeforeThoseOfItsLanguage)
{
    EXPECT_EQ(texts("de_AT:fr", {"AUSTRIAN", "EVERYWHERE"}), "österreichisch\ndeutsch\n");
    EXPECT_EQ(texts("de_CH", {"AUSTRIAN"}), "deutsch\n");
    EXPECT_EQ(texts("de", {"AUSTRIAN"}), "deutsch\n");
}

TEST(StringTable, ScriptComesBeforeTheLanguageAlone)
{
    EXPECT_EQ(texts("zh_TW", {"EVERYWHERE"}), "繁體\n");
    EXPECT_EQ(texts("zh_CN", {"EVERYWHERE"}), "简体\n");
}

TEST(StringTable, KeyWithoutATextHasNone)
{
    EXPECT_EQ(texts("de", {"NO_SUCH_KEY", ""}), "(none)\n(none)\n");
}

TEST(StringTable, DirectoryWithoutTablesHasNoTexts)
{
    const kavell::StringTable table(QStringLiteral("/nowhere"), QStringLiteral("Table"));
    EXPECT_TRUE(table.textForKey(QStringLiteral("EVERYWHERE")).isNull());
}

}  // namespace
