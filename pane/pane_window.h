// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The preferences pane's window: the accounts on the left, the selected one on the right. User-interface thread only.

#ifndef KAVELL_PANE_PANE_WINDOW_H
#define KAVELL_PANE_PANE_WINDOW_H

#include <QtCore/QSet>
#include <QtWidgets/QMainWindow>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QStackedWidget>

#include "pane/account_registry.h"
#include "pane/adding.h"
#include "pane/undertakings.h"

namespace kavell::pane {

class AccountList;
class AccountPage;
class NoticeBar;
struct OpenAccount;

class PaneWindow : public QMainWindow {
    Q_OBJECT

public:
    /// Begins to read the accounts at once.
    explicit PaneWindow(QWidget *parent = nullptr);
    ~PaneWindow() override;

    /// Selects an account by its login name as soon as the accounts are read.
    void selectWhenRead(const QString &loginName);

    /// The registry that is shown.
    [[nodiscard]] AccountRegistry &registry() { return m_registry; }

protected:
    /// Saves what is being typed.
    void closeEvent(QCloseEvent *event) override;

signals:
    /// What the window shows is complete for now: an account, or that there is none.
    void shown();

    /// Once, after the first `shown`: nothing is under way any more, and the window has been laid out.
    void settled();

private:
    QWidget *makeLeftSide();
    QWidget *makeRightSide();
    QWidget *makeEmptyPage();
    void makeShortcuts();
    void accountsWereRead();
    void accountsWereNotRead();
    void showEmptyPage();
    void open(const AccountName &name);
    void wasNotOpened(const AccountName &name);
    void showOpened(const AccountName &name, const OpenAccount &account);
    void removeSelected();
    void accountWasAdded(const AddedAccount &account);
    void switchPickedApplicationsOn(const AccountName &name);
    void selectAdded(const AccountName &name);

    Undertakings m_undertakings;
    AccountRegistry m_registry;
    AccountList *m_list;
    QPushButton *m_add;
    QPushButton *m_remove;
    NoticeBar *m_notice;
    QStackedWidget *m_pages;
    QWidget *m_blankPage;
    QWidget *m_emptyPage;
    AccountPage *m_accountPage;
    Adding *m_adding;
    QTimer m_settling;                // runs while the window comes to rest
    QString m_wanted;                 // a login name to select
    AccountName m_selectAfterAdding;  // once the registry knows it
    QList<AddedAccount> m_added;      // whose applications are still to be switched on
};

}  // namespace kavell::pane

#endif
