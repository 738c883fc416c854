// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Applications by their names, in directories of a test's own that stand for the user's and the system's.

#include "platform/qt/workspace.h"

#include <gtest/gtest.h>

#include <QtCore/QDir>
#include <QtCore/QTemporaryDir>
#include <QtGui/QIcon>

#include "platform/qt/desktop_entry.h"
#include "tests/support/process.h"

namespace {

using kavell::pathForApplication;

class Workspace : public testing::Test {
protected:
    Workspace()
    {
        qputenv("KAVELL_APPLICATION_PATH", (path("first") + "::" + path("second")).toUtf8());
        qputenv("XDG_DATA_HOME", path("user").toUtf8());
        qputenv("XDG_DATA_DIRS", path("system").toUtf8());
    }
    ~Workspace() override
    {
        qunsetenv("KAVELL_APPLICATION_PATH");
        qputenv("XDG_DATA_HOME", m_dataHome);
        qunsetenv("XDG_DATA_DIRS");
    }

    [[nodiscard]] QString path(const QString &relative) const { return m_scratch.filePath(relative); }

    void write(const QString &relative, const std::string &content) const
    {
        kavell::test::writeFile(path(relative).toStdString(), content);
    }

    void addEntry(const QString &relative, const std::string &keys) const
    {
        write(relative, "[Desktop Entry]\nType=Application\n" + keys);
    }

    void addBundle(const QString &relative, const std::string &entries = {}) const
    {
        write(relative + "/Contents/Info.plist", "<plist version=\"1.0\"><dict>" + entries + "</dict></plist>");
    }

private:
    const QTemporaryDir m_scratch;
    const QByteArray m_dataHome = qgetenv("XDG_DATA_HOME");
};

TEST_F(Workspace, BundleIsFoundInTheFirstDirectoryThatHasIt)
{
    addBundle("second/Mail.app");
    EXPECT_EQ(pathForApplication("Mail"), path("second/Mail.app"));
    addBundle("first/Mail.app");
    EXPECT_EQ(pathForApplication("Mail"), path("first/Mail.app"));
}

TEST_F(Workspace, BundleBesideTheDesktopEntriesIsFound)
{
    addBundle("system/applications/Mail.app");
    EXPECT_EQ(pathForApplication("Mail"), path("system/applications/Mail.app"));
}

TEST_F(Workspace, BundleComesBeforeADesktopEntry)
{
    addEntry("user/applications/Mail.desktop", "Name=Mail\n");
    EXPECT_EQ(pathForApplication("Mail"), path("user/applications/Mail.desktop"));
    addBundle("second/Mail.app");
    EXPECT_EQ(pathForApplication("Mail"), path("second/Mail.app"));
}

TEST_F(Workspace, EntryIsFoundByItsFileElseByItsUntranslatedName)
{
    addEntry("user/applications/org.example.letters.desktop", "Name=Cardell Book\nName[en]=Addresses\n");
    EXPECT_EQ(pathForApplication("Cardell Book"), path("user/applications/org.example.letters.desktop"));
    EXPECT_TRUE(pathForApplication("Addresses").isNull());
    addEntry("system/applications/Cardell Book.desktop", "Name=Other\n");
    EXPECT_EQ(pathForApplication("Cardell Book"), path("system/applications/Cardell Book.desktop"));
}

TEST_F(Workspace, UsersEntryComesBeforeTheSystems)
{
    addEntry("system/applications/Mail.desktop", "Name=Mail\n");
    addEntry("user/applications/Mail.desktop", "Name=Mail\n");
    EXPECT_EQ(pathForApplication("Mail"), path("user/applications/Mail.desktop"));
}

TEST_F(Workspace, HiddenEntryOfTheUserHidesTheSystems)
{
    addEntry("system/applications/Mail.desktop", "Name=Mail\n");
    addEntry("user/applications/Mail.desktop", "Name=Mail\nHidden=true\n");
    EXPECT_TRUE(pathForApplication("Mail").isNull());
    addEntry("system/applications/org.example.letters.desktop", "Name=Mail\n");
    EXPECT_EQ(pathForApplication("Mail"), path("system/applications/org.example.letters.desktop"));
}

TEST_F(Workspace, FileWithoutTheGroupIsNoEntry)
{
    write("user/applications/Mail.desktop", "Name=Mail\n");
    EXPECT_TRUE(pathForApplication("Mail").isNull());
}

TEST_F(Workspace, UnknownEmptyAndImpossibleNamesHaveNoPath)
{
    addBundle("first/Mail.app");
    EXPECT_TRUE(pathForApplication("Nobody").isNull());
    EXPECT_TRUE(pathForApplication("").isNull());
    EXPECT_TRUE(pathForApplication("../first/Mail").isNull());
}

TEST_F(Workspace, BundleIsCalledByItsBundleName)
{
    addBundle("first/Mail.app", "<key>KABundleName</key><string>Letters</string>");
    EXPECT_EQ(kavell::displayNameAtPath(path("first/Mail.app")), "Letters");
    addBundle("first/Bare.app");
    EXPECT_TRUE(kavell::displayNameAtPath(path("first/Bare.app")).isNull());
    EXPECT_TRUE(kavell::displayNameAtPath("/nowhere/Mail.app").isNull());
}

TEST_F(Workspace, EntryIsCalledByItsNameInTheUsersLanguage)
{
    addEntry("user/applications/Mail.desktop", "Name=Mail\nName[de]=Post\nName[de_AT]=Briefe\nName[fr]=Courrier\n");
    const auto nameFor = [this](const std::string &languages) {
        return kavell::test::runProgram({kavell::test::buildPath("tests/language_probe"), "names",
                                         path("user/applications/Mail.desktop").toStdString()},
                                        {}, {"LANGUAGE=" + languages})
            .output;
    };
    EXPECT_EQ(nameFor("de_AT:fr"), "Briefe\n");
    EXPECT_EQ(nameFor("de_CH:fr"), "Post\n");
    EXPECT_EQ(nameFor("it:fr"), "Courrier\n");
    EXPECT_EQ(nameFor("it"), "Mail\n");
}

TEST_F(Workspace, EscapesInAnEntryStandForTheirCharacters)
{
    addEntry("user/applications/Mail.desktop", "# Name=Comment\nName = Two\\sWords\\\\n \n[Other Group]\nName=Other\n");
    EXPECT_EQ(kavell::readDesktopEntry(path("user/applications/Mail.desktop"))->name, "Two Words\\n");
}

TEST_F(Workspace, IconFileOfABundleIsBelowItsResources)
{
    addBundle("first/Mail.app", "<key>KABundleIconFile</key><string>letters</string>");
    EXPECT_EQ(kavell::iconFileAtPath(path("first/Mail.app")), path("first/Mail.app/Contents/Resources/letters.icns"));
    addBundle("first/Other.app", "<key>KABundleIconFile</key><string>letters.png</string>");
    EXPECT_EQ(kavell::iconFileAtPath(path("first/Other.app")), path("first/Other.app/Contents/Resources/letters.png"));
    addBundle("first/Bare.app");
    EXPECT_TRUE(kavell::iconFileAtPath(path("first/Bare.app")).isNull());
}

TEST_F(Workspace, IconOfAnEntryIsAFileOrAPixmap)
{
    write("absolute.png", "picture");
    write("system/pixmaps/letters.png", "picture");
    addEntry("user/applications/A.desktop", "Name=A\nIcon=" + path("absolute.png").toStdString() + "\n");
    addEntry("user/applications/B.desktop", "Name=B\nIcon=letters\n");
    addEntry("user/applications/C.desktop", "Name=C\nIcon=nobody\n");
    addEntry("user/applications/D.desktop", "Name=D\n");
    EXPECT_EQ(kavell::iconFileAtPath(path("user/applications/A.desktop")), path("absolute.png"));
    EXPECT_EQ(kavell::iconFileAtPath(path("user/applications/B.desktop")), path("system/pixmaps/letters.png"));
    EXPECT_TRUE(kavell::iconFileAtPath(path("user/applications/C.desktop")).isNull());
    EXPECT_TRUE(kavell::iconFileAtPath(path("user/applications/D.desktop")).isNull());
}

TEST_F(Workspace, IconOfAThemeIsTheOneOfTheNearestSizeOrOfAParentTheme)
{
    const QStringList places = QIcon::themeSearchPaths();
    QIcon::setThemeSearchPaths({path("icons")});
    QIcon::setThemeName("test");
    write("icons/test/index.theme", "[Icon Theme]\nName=Test\nInherits=parent\nDirectories=16,48\n\n"
                                    "[16]\nSize=16\nType=Fixed\n\n[48]\nSize=48\nType=Fixed\n");
    write("icons/parent/index.theme", "[Icon Theme]\nName=Parent\nDirectories=any\n\n[any]\nSize=16\nType=Scalable\n");
    write("icons/test/16/both.png", "picture");
    write("icons/test/48/both.png", "picture");
    write("icons/parent/any/both.svg", "picture");
    write("icons/parent/any/inherited.svg", "picture");
    write("icons/hicolor/index.theme", "[Icon Theme]\nName=Hicolor\nDirectories=64\n\n[64]\nSize=64\nType=Fixed\n");
    write("icons/hicolor/64/last.png", "picture");
    EXPECT_EQ(kavell::iconFileForName("both"), path("icons/test/48/both.png"));
    EXPECT_EQ(kavell::iconFileForName("inherited"), path("icons/parent/any/inherited.svg"));
    EXPECT_EQ(kavell::iconFileForName("last"), path("icons/hicolor/64/last.png"));
    EXPECT_TRUE(kavell::iconFileForName("nowhere").isNull());
    EXPECT_TRUE(kavell::iconFileForName("../test/48/both").isNull());
    QIcon::setThemeName({});
    QIcon::setThemeSearchPaths(places);
}

TEST_F(Workspace, ThemesThatInheritFromEachOtherEnd)
{
    const QStringList places = QIcon::themeSearchPaths();
    QIcon::setThemeSearchPaths({path("icons")});
    QIcon::setThemeName("one");
    write("icons/one/index.theme", "[Icon Theme]\nName=One\nInherits=two,one,two,one,two,one\nDirectories=\n");
    write("icons/two/index.theme", "[Icon Theme]\nName=Two\nInherits=one,two,one,two,one,two\nDirectories=\n");
    EXPECT_TRUE(kavell::iconFileForName("nobody").isNull());
    QIcon::setThemeName({});
    QIcon::setThemeSearchPaths(places);
}

TEST_F(Workspace, GenericIconsAreNeverNull)
{
    EXPECT_FALSE(kavell::genericNetworkIcon().isNull());
    EXPECT_FALSE(kavell::genericApplicationIcon().isNull());
}

}  // namespace
