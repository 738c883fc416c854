// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The password of the account that is shown: whether there is one, and setting, showing and removing it. The credential
// store is asked in the background. User-interface thread only.

#ifndef KAVELL_PANE_PASSWORD_SECTION_H
#define KAVELL_PANE_PASSWORD_SECTION_H

#include <QtCore/QVariant>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QWidget>

#include "pane/account_records.h"

namespace kavell::pane {

class Undertakings;

class PasswordSection : public QWidget {
    Q_OBJECT

public:
    explicit PasswordSection(Undertakings &undertakings, QWidget *parent = nullptr);
    ~PasswordSection() override;

    /// Shows the state of an account's password. The store is asked when the account or its reference to the password is
    /// another than before.
    void showAccount(const AccountName &name, const QVariant &reference);

    /// Asks the store for the state again, which may have been unlocked since.
    void askForStatus();

signals:
    /// Something went wrong: a sentence for the user.
    void failed(const QString &sentence);

private:
    void showStatus(CSKavellCofferelStatus status);
    void askForNewPassword();
    void store(const AccountName &name, const QString &password);
    void reveal();
    void conceal();
    void askToRemove();

    Undertakings &m_undertakings;
    AccountName m_name;
    QVariant m_reference;
    int m_lastQuestion = 0;  // that was put to the store for the state
    QLabel *m_state;
    QLineEdit *m_revealed;
    QPushButton *m_set;
    QPushButton *m_show;
    QPushButton *m_remove;
};

}  // namespace kavell::pane

#endif
