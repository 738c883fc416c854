// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Adding an account: the user chooses a kind, the kind's plug-in shows its own sheet, and what it made is saved, pointed
// out when it looks like another account, and switched on for the applications that were picked. User-interface thread
// only.

#ifndef KAVELL_PANE_ADDING_H
#define KAVELL_PANE_ADDING_H

#include <QtCore/QList>
#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KANotificationCenter.h>

#include "pane/account_records.h"

class KAAListPlugin;

namespace kavell::pane {

class AccountRegistry;
class Undertakings;

/// An account that a plug-in's sheet made.
struct AddedAccount {
    AccountName name;
    QPointer<KAAListPlugin> plugin;
    QList<std::shared_ptr<KAApplication>> applications;  ///< that the user picked for it
    bool wasThere = false;                               ///< before: it has been brought up to date
    QList<AccountSummary> duplicates;                    ///< other accounts that are probably the same
};

class Adding : public QObject {
    Q_OBJECT

public:
    Adding(AccountRegistry &registry, Undertakings &undertakings, QWidget *window);
    ~Adding() override;

    /// Begins with the question for the kind of account.
    void begin();

signals:
    /// The account is saved.
    void added(const kavell::pane::AddedAccount &account);

    /// Something went wrong: a sentence for the user.
    void failed(const QString &sentence);

private:
    void chooseAmong(const QList<KAAListPlugin *> &plugins);
    void showSheet(KAAListPlugin *plugin);
    [[nodiscard]] KANotificationCenter::Observer forward();
    void receive(const KANotification &notification);
    void save(const std::shared_ptr<KAAccount> &account, AddedAccount added);

    AccountRegistry &m_registry;
    Undertakings &m_undertakings;
    QWidget *const m_window;
    KANotificationCenter::Observation m_observation;
};

}  // namespace kavell::pane

#endif
