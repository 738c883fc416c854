// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Files that are no interface. What the library does with good ones is tested where it shows them.

#include "platform/qt/interface_file.h"

#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtWidgets/QApplication>
#include <QtWidgets/QBoxLayout>

#include <gmock/gmock.h>

#include "tests/support/log_capture.h"

using kavell::InterfaceFile;
using kavell::test::LogCapture;

namespace {

class InterfaceFileTest : public testing::Test {
protected:
    QString write(const QByteArray &xml)
    {
        QFile file(m_directory.filePath("Sheet.ui"));
        EXPECT_TRUE(file.open(QIODevice::WriteOnly));
        EXPECT_EQ(file.write(xml), xml.size());
        return file.fileName();
    }

    /// An interface of widgets in one another.
    static QByteArray nested(int widgets)
    {
        const QByteArray outer = "<ui version=\"4.0\">";
        return outer + QByteArray("<widget class=\"QWidget\" name=\"a\">").repeated(widgets) +
               QByteArray("</widget>").repeated(widgets) + "</ui>";
    }

private:
    const QTemporaryDir m_directory;
};

}  // namespace

TEST_F(InterfaceFileTest, WidgetsInOneAnotherAreReadAndGoWithTheFile)
{
    {
        const auto interface = InterfaceFile::load(write(nested(100)));
        ASSERT_TRUE(interface);
        EXPECT_EQ(QApplication::allWidgets().size(), 100);
    }
    EXPECT_TRUE(QApplication::allWidgets().isEmpty());
}

TEST_F(InterfaceFileTest, WhatIsNestedDeeperThanAnyInterfaceIsNotRead)
{
    QString problem;
    EXPECT_FALSE(InterfaceFile::load(write(nested(200)), &problem));
    EXPECT_EQ(problem, "It is too large or nested too deeply.");
    // The toolkit's reader would run out of stack.
    const QByteArray layouts = QByteArray("<layout class=\"QVBoxLayout\"><item>").repeated(100000);
    EXPECT_FALSE(InterfaceFile::load(write("<ui version=\"4.0\"><widget class=\"QWidget\" name=\"a\">" + layouts)));
}

TEST_F(InterfaceFileTest, WhatIsLargerThanAnyInterfaceIsNotRead)
{
    const LogCapture log;
    const QString path = write({});
    ASSERT_TRUE(QFile::resize(path, qint64{1} << 40));
    EXPECT_FALSE(InterfaceFile::load(path));
    EXPECT_THAT(log.messages(), testing::ElementsAre("*** Cannot read the interface file " + path +
                                                     ": It is too large or nested too deeply."));
}

TEST_F(InterfaceFileTest, WhatIsNoInterfaceHasAReason)
{
    for (const char *xml : {"", "text", "<ui version=\"4.0\"/>", "<ui version=\"4.0\"><widget"}) {
        QString problem;
        EXPECT_FALSE(InterfaceFile::load(write(xml), &problem)) << xml;
        EXPECT_FALSE(problem.isEmpty()) << xml;
    }
}

// The toolkit's reader would fill a layout that is not there.
TEST_F(InterfaceFileTest, WhatHasALayoutOfAnUnknownClassIsNotRead)
{
    for (const char *layout :
         {"<layout class=\"QSlider\"/>", "<layout class=\"QSlider\"><item><layout class=\"QDial\"/></item></layout>",
          "<layout class=\"QHBoxLayout\"><item><layout class=\"QSlider\"><item>"
          "<widget class=\"QLabel\"/></item></layout></item></layout>",
          "<layout class=\"QSlider\"><property name=\"margin\"><number>4</number></property>"
          "<item row=\"1\" column=\"2\"><spacer/></item></layout>"}) {
        QString problem;
        const QByteArray xml = QByteArray("<ui version=\"4.0\"><widget class=\"QWidget\">") + layout + "</widget></ui>";
        EXPECT_FALSE(InterfaceFile::load(write(xml), &problem)) << layout;
        EXPECT_EQ(problem, "It has a layout of an unknown class, QSlider.") << layout;
        EXPECT_TRUE(QApplication::allWidgets().isEmpty()) << layout;
    }
}

TEST_F(InterfaceFileTest, WhatHasALayoutWithoutAClassIsNotRead)
{
    for (const char *layout : {"<layout/>", "<layout class=\"\"/>"}) {
        QString problem;
        const QByteArray xml = QByteArray("<ui version=\"4.0\"><widget class=\"QWidget\">") + layout + "</widget></ui>";
        EXPECT_FALSE(InterfaceFile::load(write(xml), &problem)) << layout;
        EXPECT_EQ(problem, "It has a layout without a class.") << layout;
    }
}

// A dock has a layout of its own already; the sanitizers say whether the other one is left behind.
TEST_F(InterfaceFileTest, ALayoutThatHasNoPlaceGoesAgain)
{
    const auto interface =
        InterfaceFile::load(write("<ui version=\"4.0\"><widget class=\"QDockWidget\" name=\"dock\">"
                                  "<layout class=\"QVBoxLayout\"><item><layout class=\"QGridLayout\"/>"
                                  "</item></layout></widget></ui>"));
    ASSERT_TRUE(interface);
    EXPECT_TRUE(interface->root()->findChildren<QVBoxLayout *>().isEmpty());
}
