// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Asks for a new password. Deletes itself when it is closed. User-interface thread only.

#ifndef KAVELL_PANE_PASSWORD_DIALOG_H
#define KAVELL_PANE_PASSWORD_DIALOG_H

#include <QtWidgets/QDialog>
#include <QtWidgets/QLineEdit>

namespace kavell::pane {

class PasswordDialog : public QDialog {
    Q_OBJECT

public:
    PasswordDialog(const QString &loginName, QWidget *parent);

    /// As it was typed; not empty once the dialog was accepted.
    [[nodiscard]] QString password() const { return m_password->text(); }

private:
    QLineEdit *m_password;
};

}  // namespace kavell::pane

#endif
