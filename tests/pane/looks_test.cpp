// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether a person can read what the pane shows: no text is cut off, whatever accounts are called.

#include <QtGui/QTextDocument>
#include <QtWidgets/QScrollArea>
#include <QtWidgets/QScrollBar>

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

class PaneLooks : public PaneTest {};

TEST_F(PaneLooks, LongLoginNameIsElidedInsteadOfWideningThePage)
{
    const QString name = QString(80, u'x') + QStringLiteral("@") + QString(80, u'y');
    storedAccount(name);
    openPane();
    waitForPage(name);
    window().resize(window().minimumSizeHint());
    const auto *const page = window().findChild<QScrollArea *>();
    waitFor([&] { return page->viewport()->width() >= page->widget()->minimumSizeHint().width(); }, "the layout");
    EXPECT_FALSE(page->horizontalScrollBar()->isVisible());
    EXPECT_LT(window().width(), 880);
}

TEST_F(PaneLooks, EmptyPageShowsAllOfItsText)
{
    openPane();
    for (const QLabel *label : window().findChildren<QLabel *>()) {
        if (!label->isVisible())
            continue;
        EXPECT_GE(label->height(), label->heightForWidth(label->width())) << label->text().toStdString();
    }
}

TEST_F(PaneLooks, NamesAreNeverTakenForMarkup)
{
    storedAccount("<b>ada");
    openPane();
    waitForPage("<b>ada");
    for (const QLabel *label : window().findChildren<QLabel *>()) {
        if (!label->text().contains("<b>"))
            continue;
        EXPECT_EQ(label->textFormat(), Qt::PlainText);
    }
    const QModelIndex group = list().model()->index(0, 0);
    EXPECT_EQ(list().model()->index(0, 0, group).data(Qt::ToolTipRole).toString(), Qt::convertFromPlainText("<b>ada"));
}

}  // namespace

}  // namespace kavell::test
