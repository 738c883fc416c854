// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the shared library exports and needs: the headers, the symbol map and the built library must name the same
// symbols, and a program that only lists accounts must not load what only passwords need.

#include <filesystem>
#include <regex>
#include <set>
#include <sstream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/process.h"

using namespace kavell::test;

namespace {

using Symbols = std::set<std::string>;

Symbols matchesOf(const std::string &text, const std::regex &pattern)
{
    Symbols found;
    for (std::sregex_iterator match(text.begin(), text.end(), pattern), end; match != end; ++match)
        found.insert((*match)[1]);
    return found;
}

std::string withoutComments(const std::string &text)
{
    return std::regex_replace(text, std::regex("//[^\n]*|/\\*[^*]*\\*/|#[^\n]*"), "");
}

/// What the headers declare as exported.
Symbols declaredSymbols()
{
    Symbols symbols;
    for (const auto &entry : std::filesystem::directory_iterator(sourcePath("include/kavellaccounts"))) {
        const std::string header = withoutComments(readFile(entry.path()));
        symbols.merge(matchesOf(header, std::regex("CSKAVELL_EXPORT\\s[^;(]*?(\\w+)\\s*\\([^;]*;")));
        symbols.merge(matchesOf(header, std::regex("CSKAVELL_EXPORT extern const \\w+ (\\w+);")));
    }
    return symbols;
}

/// What the symbol map lets out, each by name.
Symbols mappedSymbols()
{
    const std::string map = withoutComments(readFile(sourcePath("store/kavellstore.map")));
    const size_t begin = map.find("global:"), end = map.find("local:");
    return matchesOf(map.substr(begin, end - begin), std::regex("([\\w*]+)\\s*;"));
}

std::string library()
{
    return buildPath("lib/libkavellstore.so.1");
}

std::string outputOf(const std::vector<std::string> &arguments)
{
    const ProgramResult result = runProgram(arguments);
    EXPECT_EQ(result.status, 0) << result.error;
    return result.output;
}

/// What the built library defines for others, with the version of each.
Symbols builtSymbols()
{
    Symbols symbols;
    std::istringstream lines(outputOf({"nm", "-D", "--defined-only", "--with-symbol-versions", library()}));
    for (std::string address, kind, name; lines >> address >> kind >> name;) {
        if (kind != "A")
            symbols.insert(name);
    }
    return symbols;
}

Symbols withoutVersions(const Symbols &symbols)
{
    Symbols bare;
    for (const std::string &symbol : symbols)
        bare.insert(symbol.substr(0, symbol.find('@')));
    return bare;
}

}  // namespace

TEST(Symbols, TheHeadersDeclareTheWholeInterface)
{
    const Symbols declared = declaredSymbols();
    EXPECT_GT(declared.size(), 130u);
    for (const char *expected :
         {"CSKavellRetain", "_CSKavellAccountCreate", "CSKavellAccountLoadData", "ServiceForID",
          "_CSKavellAccountProviderReloadAccountData", "kCSKavellAccountProviderMail", "CSKavellNotificationPost",
          "CSKavellAccountSettingsUpdateAttributes", "CSKavellCofferelStoreUnlock"})
        EXPECT_TRUE(declared.contains(expected)) << expected;
}

TEST(Symbols, TheMapNamesExactlyWhatTheHeadersDeclare)
{
    EXPECT_THAT(mappedSymbols(), testing::ContainerEq(declaredSymbols()));
}

TEST(Symbols, TheLibraryExportsExactlyWhatTheHeadersDeclare)
{
    EXPECT_THAT(withoutVersions(builtSymbols()), testing::ContainerEq(declaredSymbols()));
}

TEST(Symbols, EachExportHasAVersion)
{
    for (const std::string &symbol : builtSymbols())
        EXPECT_NE(symbol.find("@@"), std::string::npos) << symbol;
}

TEST(Symbols, EveryExportLooksLikeTheStores)
{
    for (const std::string &symbol : withoutVersions(builtSymbols()))
        EXPECT_TRUE(std::regex_match(symbol, std::regex("_?CSKavell\\w+|kCSKavellAccount\\w+|ServiceForID"))) << symbol;
}

TEST(Dependencies, TheLibraryItselfNeedsNoBusAndNoCryptography)
{
    const std::string section = outputOf({"readelf", "-d", library()});
    const Symbols needed = matchesOf(section, std::regex("\\(NEEDED\\)[^\\[]*\\[([^\\]]+)\\]"));
    EXPECT_TRUE(needed.contains("libplist-2.0.so.3")) << section;
    for (const std::string &name : needed) {
        for (const char *unwanted : {"glib", "gio", "gobject", "sodium", "dbus", "systemd", "Qt"})
            EXPECT_EQ(name.find(unwanted), std::string::npos) << name;
    }
    EXPECT_THAT(section, testing::HasSubstr("Library soname: [libkavellstore.so.1]"));
}

TEST(Dependencies, WithoutABusAProgramThatUsesAccountsLoadsNoneOfThem)
{
    const ProgramResult result =
        runProgram({buildPath("tests/c_client")}, {}, {"LD_DEBUG=files", "DBUS_SESSION_BUS_ADDRESS="});
    EXPECT_EQ(result.status, 0) << result.output;
    EXPECT_THAT(result.error, testing::HasSubstr("libkavellstore.so.1"));
    for (const char *unwanted : {"libglib", "libgio", "libsodium", "libdbus"})
        EXPECT_THAT(result.error, testing::Not(testing::HasSubstr(unwanted)));
}
