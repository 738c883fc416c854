// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The icon files of applications, in a directory of bundles that each test writes.

#include <kavellaccounts/KAExtras.h>

#include <cstdlib>

#include <QtCore/QTemporaryDir>

#include <gtest/gtest.h>

#include "tests/support/process.h"

using KAExtras::iconPathForAppName;

namespace {

class IconPathTest : public testing::Test {
protected:
    IconPathTest() { setenv("KAVELL_APPLICATION_PATH", m_directory.path().toUtf8().constData(), 1); }
    ~IconPathTest() override { unsetenv("KAVELL_APPLICATION_PATH"); }

    /// Writes an application's bundle with these entries of its information dictionary.
    void addApplication(const std::string &name, const std::string &entries) const
    {
        kavell::test::writeFile(pathOf(name).toStdString() + "/Contents/Info.plist",
                                "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\"><dict>" + entries +
                                    "</dict></plist>\n");
    }

    [[nodiscard]] QString pathOf(const std::string &name) const
    {
        return m_directory.path() + '/' + QString::fromStdString(name) + ".app";
    }

private:
    QTemporaryDir m_directory;
};

}  // namespace

TEST_F(IconPathTest, AnIconWithoutExtensionGetsTheUsualOne)
{
    addApplication("Quill", "<key>KABundleIconFile</key><string>feather</string>");
    EXPECT_EQ(iconPathForAppName("Quill"), pathOf("Quill") + "/Contents/Resources/feather.icns");
}

TEST_F(IconPathTest, AnIconWithADotKeepsItsName)
{
    addApplication("Quill", "<key>KABundleIconFile</key><string>feather.png</string>");
    EXPECT_EQ(iconPathForAppName("Quill"), pathOf("Quill") + "/Contents/Resources/feather.png");
}

TEST_F(IconPathTest, ThePathIsStandardised)
{
    addApplication("Quill", "<key>KABundleIconFile</key><string>../icons//feather.png</string>");
    EXPECT_EQ(iconPathForAppName("Quill"), pathOf("Quill") + "/Contents/icons/feather.png");
}

TEST_F(IconPathTest, AnApplicationThatNamesNoIconHasNone)
{
    addApplication("Quill", "<key>KABundleName</key><string>Quill</string>");
    EXPECT_TRUE(iconPathForAppName("Quill").isNull());
}

TEST_F(IconPathTest, AnUnknownApplicationHasNone)
{
    EXPECT_TRUE(iconPathForAppName("Quill").isNull());
    EXPECT_TRUE(iconPathForAppName({}).isNull());
}
