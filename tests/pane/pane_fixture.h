// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of the pane share: a scratch home, the tests' own kind of account, another process that changes
// accounts, and ways to find and click what a person sees. The user-interface thread only.

#ifndef KAVELL_TESTS_PANE_PANE_FIXTURE_H
#define KAVELL_TESTS_PANE_PANE_FIXTURE_H

#include <chrono>
#include <functional>

#include <QtGui/QAccessible>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QToolButton>

#include <gmock/gmock.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/account_list.h"
#include "pane/background.h"
#include "pane/notice_bar.h"
#include "pane/pane_window.h"
#include "tests/model/account_fixture.h"

namespace kavell::test {

inline const QString kKindIdentifier = QStringLiteral("com.corvane.testkind.kaplugin");
inline const QString kKindType = QStringLiteral("com.corvane.testkind.kaplugin.type");

class PaneTest : public AccountWithVaultTest {
protected:
#ifdef __SANITIZE_THREAD__
    static constexpr std::chrono::milliseconds kBound = std::chrono::seconds(60);  // all takes several times as long
#else
    static constexpr std::chrono::milliseconds kBound = std::chrono::seconds(15);
#endif

    void TearDown() override
    {
        m_window.reset();
        pane::backgroundThreads().waitForDone();
        if (KAAListPlugin *const plugin = kindIfLoaded())
            plugin->setProperty("switching", {});
        AccountWithVaultTest::TearDown();
    }

    /// Runs the event loop until the condition holds; a failure when the bound passes first.
    static void waitFor(const std::function<bool()> &condition, const char *what)
    {
        ASSERT_TRUE(QTest::qWaitFor(condition, static_cast<int>(kBound.count()))) << "waited in vain: " << what;
    }

    void openPaneWithoutWaiting()
    {
        m_window = std::make_unique<pane::PaneWindow>();
        m_window->show();
    }

    /// Shows the pane and waits until it shows what there is.
    void openPane()
    {
        bool isShown = false;
        openPaneWithoutWaiting();
        const auto connection = QObject::connect(m_window.get(), &pane::PaneWindow::shown, [&] { isShown = true; });
        waitFor([&] { return isShown; }, "the pane's contents");
        QObject::disconnect(connection);
    }

    /// Closes the pane as its user does, and lets the program have no window any more.
    void closePane()
    {
        m_window->close();
        m_window.reset();
    }

    [[nodiscard]] pane::PaneWindow &window() { return *m_window; }

    /// An account on the disk, made by this process before the pane looks.
    static std::shared_ptr<KAAccount> storedAccount(const QString &loginName, const QString &type = kKindType)
    {
        const auto account = newAccount(loginName, type);
        account->setProviderAttribute(loginName, KAMailEmailAddressKey);
        commit(account);
        return account;
    }

    /// Another process removes an account of the tests' kind.
    static void removeElsewhere(const std::string &loginName)
    {
        runClient({"remove", kKindType.toStdString(), loginName, "--yes"});
    }

    /// Runs the command-line client, which is another process.
    static void runClient(const std::vector<std::string> &arguments)
    {
        std::vector<std::string> command{buildPath("bin/kavell-accounts")};
        command.insert(command.end(), arguments.begin(), arguments.end());
        const ProgramResult result = runProgram(command);
        ASSERT_EQ(result.status, 0) << result.error;
    }

    /// The widget of an object name in whichever window is open; a failure when it is not on the screen.
    template <typename View> [[nodiscard]] static View *visible(const QString &name)
    {
        for (QWidget *top : QApplication::topLevelWidgets()) {
            if (!top->isVisible())
                continue;
            for (View *view : top->findChildren<View *>(name)) {
                if (view->isVisible())
                    return view;
            }
        }
        return nullptr;
    }

    template <typename View = QPushButton> static void click(const QString &name)
    {
        waitFor([&] { return visible<View>(name) != nullptr; }, qPrintable(name));
        auto *const view = visible<View>(name);
        ASSERT_TRUE(view);
        ASSERT_TRUE(view->isEnabled()) << name.toStdString();
        QTest::mouseClick(view, Qt::LeftButton, {}, clickPoint(view));
    }

    [[nodiscard]] pane::AccountList &list() { return *m_window->findChild<pane::AccountList *>(); }
    [[nodiscard]] QString notice() { return m_window->findChild<pane::NoticeBar *>()->notice(); }

    /// Login names and group titles as the list shows them, from top to bottom.
    [[nodiscard]] QStringList listed()
    {
        QStringList texts;
        const QAbstractItemModel *const model = list().model();
        for (int group = 0; group < model->rowCount(); ++group) {
            const QModelIndex parent = model->index(group, 0);
            texts += parent.data().toString();
            for (int row = 0; row < model->rowCount(parent); ++row)
                texts += QStringLiteral("  ") + model->index(row, 0, parent).data().toString();
        }
        return texts;
    }

    /// Waits until the page shows the account.
    void waitForPage(const QString &title)
    {
        waitFor(
            [&] {
                auto *const label = visible<QLabel>(QStringLiteral("accountTitle"));
                return label && label->text() == title;
            },
            qPrintable(title));
    }

    [[nodiscard]] static KAAListPlugin &kind()
    {
        return *qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(kKindIdentifier));
    }

    /// The check box of an application's row on the page; null when there is none.
    [[nodiscard]] QCheckBox *applicationCheckBox(const QString &bundleID)
    {
        for (KAAppTableRow *row : m_window->findChildren<KAAppTableRow *>()) {
            if (row->application() && row->application()->bundleID() == bundleID)
                return row->findChild<QCheckBox *>();
        }
        return nullptr;
    }

private:
    static KAAListPlugin *kindIfLoaded()
    {
        return qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(kKindIdentifier));
    }

    /// Where a check box takes clicks: on its box, in whichever direction it is laid out.
    static QPoint clickPoint(QWidget *view)
    {
        if (!qobject_cast<QCheckBox *>(view))
            return view->rect().center();
        const int inset = view->height() / 2;
        return {view->layoutDirection() == Qt::RightToLeft ? view->width() - inset : inset, inset};
    }

    std::unique_ptr<pane::PaneWindow> m_window;
};

}  // namespace kavell::test

#endif
