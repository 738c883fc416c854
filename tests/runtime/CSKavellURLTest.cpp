// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <memory>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

Ref<CSKavellURLRef> url(std::string_view form)
{
    return adopt(CSKavellURLCreateWithString(text(form).get()));
}

std::string textOf(const Ref<CSKavellURLRef> &value)
{
    return toStdString(CSKavellURLGetString(value.get()));
}

/// The path of a file URL, "(none)" for none.
std::string pathOf(const Ref<CSKavellURLRef> &value)
{
    const std::unique_ptr<char, decltype(&std::free)> path(CSKavellURLCopyFileSystemPath(value.get()), std::free);
    return path ? path.get() : "(none)";
}

}  // namespace

TEST(CSKavellURL, KeepsItsTextAsItIs)
{
    EXPECT_EQ(textOf(url("https://Mail.Example/a%20b?q=1#f")), "https://Mail.Example/a%20b?q=1#f");
    EXPECT_EQ(textOf(url("mailto:ada@example.org")), "mailto:ada@example.org");
    EXPECT_EQ(CSKavellGetTypeID(url("x:y").get()), CSKavellURLGetTypeID());
}

TEST(CSKavellURL, IsNoneWithoutASchemeAndAColon)
{
    for (const char *form : {"", "mail.example", "/a/path", ":nothing", "1http://example.org", "a b:c"})
        EXPECT_FALSE(url(form)) << form;
    EXPECT_FALSE(adopt(CSKavellURLCreateWithString(nullptr)));
}

TEST(CSKavellURL, TheSameTextIsEqualAndHashesAlike)
{
    EXPECT_TRUE(same(url("https://example.org/"), url("https://example.org/")));
    EXPECT_EQ(CSKavellHash(url("https://example.org/").get()), CSKavellHash(url("https://example.org/").get()));
    EXPECT_FALSE(CSKavellEqual(url("https://example.org/").get(), url("https://example.org/a").get()));
}

TEST(CSKavellURL, EncodesThePathOfAFile)
{
    const auto file = adopt(CSKavellURLCreateWithFileSystemPath("/home/ada/Kavell Accounts/100%?.plist", false));
    EXPECT_EQ(textOf(file), "file:///home/ada/Kavell%20Accounts/100%25%3F.plist");
    EXPECT_EQ(pathOf(file), "/home/ada/Kavell Accounts/100%?.plist");
}

TEST(CSKavellURL, ADirectoryEndsInASlashAndItsPathDoesNot)
{
    for (const char *path : {"/home/ada/V1", "/home/ada/V1/"}) {
        const auto directory = adopt(CSKavellURLCreateWithFileSystemPath(path, true));
        EXPECT_EQ(textOf(directory), "file:///home/ada/V1/");
        EXPECT_EQ(pathOf(directory), "/home/ada/V1");
    }
}

TEST(CSKavellURL, APathGoesThroughUnchangedWhateverItsBytes)
{
    for (const char *path : {"/", "/a", "/\xC3\xA9/\xE2\x82\xAC", "/\xFF\x80 not UTF-8", R"(/a;b#c[d]^`{|}\"<>)"})
        EXPECT_EQ(pathOf(adopt(CSKavellURLCreateWithFileSystemPath(path, false))), path);
}

TEST(CSKavellURL, ThereIsNoFileURLOfARelativePath)
{
    EXPECT_FALSE(adopt(CSKavellURLCreateWithFileSystemPath("a/b", false)));
    EXPECT_FALSE(adopt(CSKavellURLCreateWithFileSystemPath("", true)));
    EXPECT_FALSE(adopt(CSKavellURLCreateWithFileSystemPath(nullptr, true)));
}

TEST(CSKavellURL, OnlyALocalFileHasAPath)
{
    EXPECT_EQ(pathOf(url("file:///a/b")), "/a/b");
    EXPECT_EQ(pathOf(url("file://localhost/a/b")), "/a/b");
    EXPECT_EQ(pathOf(url("https://example.org/a")), "(none)");
    EXPECT_EQ(pathOf(url("file://elsewhere.example/a")), "(none)");
    EXPECT_EQ(pathOf(url("file:///a%00b")), "(none)");
}

TEST(CSKavellURL, NoneHasNoTextAndNoPath)
{
    EXPECT_EQ(CSKavellURLGetString(nullptr), nullptr);
    EXPECT_EQ(pathOf(nullptr), "(none)");
}
