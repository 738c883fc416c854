// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The pane in the right-to-left pseudo-language, whose every word is marked: what is on the screen without a mark was not
// looked up in a string table.

#include <QtWidgets/QGroupBox>
#include <QtWidgets/QToolButton>

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

const QChar kRightToLeftOverride(0x202E);

class PaneFromRightToLeft : public PaneTest {
protected:
    /// What a person sees or hears of a widget.
    static QStringList textsOf(const QWidget &widget)
    {
        QStringList texts{widget.toolTip(), widget.accessibleName()};
        if (widget.isWindow())
            texts += widget.windowTitle();
        for (const char *property : {"text", "title", "placeholderText"})
            texts += widget.property(property).toString();
        texts.removeAll(QString());
        return texts;
    }

    /// Words that are data and no texts.
    static bool isData(const QString &text)
    {
        return text == "ada" || text == "Test Kind" || text == "A test account" || text.contains(u'-');
    }

    static void expectAllFromTables()
    {
        int count = 0;
        for (const QWidget *widget : QApplication::allWidgets()) {
            for (const QString &text : textsOf(*widget)) {
                ++count;
                EXPECT_TRUE(text.contains(kRightToLeftOverride) || isData(text))
                    << widget->metaObject()->className() << " " << widget->objectName().toStdString() << ": "
                    << text.toStdString();
            }
        }
        EXPECT_GT(count, 5);
    }
};

TEST_F(PaneFromRightToLeft, LayoutIsMirrored)
{
    openPane();
    EXPECT_EQ(window().layoutDirection(), Qt::RightToLeft);
    EXPECT_GT(list().mapTo(&window(), list().rect().center()).x(), window().width() / 2);
}

TEST_F(PaneFromRightToLeft, EmptyPaneShowsTextsOfTheTablesOnly)
{
    openPane();
    expectAllFromTables();
}

TEST_F(PaneFromRightToLeft, AccountAndItsDialogsShowTextsOfTheTablesOnly)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    click("setPassword");
    waitFor([] { return visible<QLineEdit>("newPassword") != nullptr; }, "the dialog");
    expectAllFromTables();
    QApplication::activeModalWidget()->close();
    click("removeAccount");
    waitFor([] { return visible<QPushButton>("agree") != nullptr; }, "the question");
    expectAllFromTables();
    QApplication::activeModalWidget()->close();
    click("addAccount");
    waitFor([] { return visible<QPushButton>("continue") != nullptr; }, "the kinds of account");
    expectAllFromTables();
    QApplication::activeModalWidget()->close();
}

}  // namespace

}  // namespace kavell::test
