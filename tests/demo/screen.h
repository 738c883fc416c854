// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a person does and sees at a screen, for programs that show something by themselves: to click, to type, to wait. A
// program ends with a sentence when what it waits for does not come. The user-interface thread only.

#ifndef KAVELL_TESTS_DEMO_SCREEN_H
#define KAVELL_TESTS_DEMO_SCREEN_H

#include <cstdio>
#include <cstdlib>
#include <functional>

#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>

namespace kavell::demo {

constexpr int kBound = 20'000;  // ms, for any one step

inline void require(bool holds, const char *what)
{
    if (holds)
        return;
    std::fprintf(stderr, "This did not happen: %s\n", what);
    std::exit(EXIT_FAILURE);
}

inline void waitFor(const std::function<bool()> &condition, const char *what)
{
    require(QTest::qWaitFor(condition, kBound), what);
}

/// The widget of an object name that is on the screen; null when there is none.
template <typename View> View *visible(const char *name)
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (const QWidget *window : windows) {
        for (View *view : window->findChildren<View *>(QLatin1String(name))) {
            if (view->isVisible())
                return view;
        }
    }
    return nullptr;
}

template <typename View = QPushButton> void click(const char *name)
{
    waitFor([name] { return visible<View>(name) && visible<View>(name)->isEnabled(); }, name);
    QTest::mouseClick(visible<View>(name), Qt::LeftButton);
}

inline void type(const char *field, const QString &text)
{
    waitFor([field] { return visible<QLineEdit>(field) != nullptr; }, field);
    visible<QLineEdit>(field)->clear();
    QTest::keyClicks(visible<QLineEdit>(field), text);
}

/// The check box of an application's row in a table that is on the screen.
inline QCheckBox *checkBoxOf(const QString &bundleID)
{
    const QWidgetList widgets = QApplication::allWidgets();
    for (QWidget *widget : widgets) {
        auto *const row = qobject_cast<KAAppTableRow *>(widget);
        if (row && row->isVisible() && row->application() && row->application()->bundleID() == bundleID)
            return row->findChild<QCheckBox *>();
    }
    return nullptr;
}

}  // namespace kavell::demo

#endif
