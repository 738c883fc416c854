// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Desktop entries that are none. What a whole one says is shown by the tests of the workspace.

#include "platform/qt/desktop_entry.h"

#include <sys/stat.h>

#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>

#include <gtest/gtest.h>

#include "tests/support/process.h"

namespace kavell::test {

TEST(DesktopEntryTest, AFileWithTheGroupIsOne)
{
    const QTemporaryDir directory;
    const QString path = directory.filePath("quill.desktop");
    writeFile(path.toStdString(), "[Desktop Entry]\nType=Application\nName=Quill\n");
    EXPECT_TRUE(readDesktopEntry(path));
}

TEST(DesktopEntryTest, APipeIsNotWaitedFor)
{
    const QTemporaryDir directory;
    const QString path = directory.filePath("pipe.desktop");
    ASSERT_EQ(mkfifo(QFile::encodeName(path).constData(), 0600), 0);
    EXPECT_FALSE(readDesktopEntry(path));
}

TEST(DesktopEntryTest, ADirectoryIsNone)
{
    const QTemporaryDir directory;
    EXPECT_FALSE(readDesktopEntry(directory.path()));
}

}  // namespace kavell::test
