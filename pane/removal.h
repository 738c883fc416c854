// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Removing an account, after a question: its applications give it up first, then it goes, and its password with it.
// User-interface thread only.

#ifndef KAVELL_PANE_REMOVAL_H
#define KAVELL_PANE_REMOVAL_H

#include <memory>

#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QTimer>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAAListPlugin.h>

#include "pane/account_records.h"

namespace kavell::pane {

class Undertakings;

/// One removal; deletes itself at its end.
class Removal : public QObject {
    Q_OBJECT

public:
    Removal(const std::shared_ptr<KAAccount> &account, KAAListPlugin *plugin, Undertakings &undertakings,
            QWidget *window);
    ~Removal() override;

    /// Asks, and removes the account when the user agrees.
    void begin();

signals:
    /// Something went wrong: a sentence for the user.
    void failed(const QString &sentence);

private:
    void openForPlugin();
    void switchApplicationsOff(const std::shared_ptr<KAAccount> &account);
    void look();
    void askWhetherToGoOn(const QStringList &left);
    void remove();

    std::shared_ptr<KAAccount> m_account;
    QPointer<KAAListPlugin> m_plugin;
    Undertakings &m_undertakings;
    QWidget *const m_window;
    const AccountName m_name;
    QTimer m_again;  // looks whether the applications have given the account up
    int m_looksLeft = 0;
};

}  // namespace kavell::pane

#endif
