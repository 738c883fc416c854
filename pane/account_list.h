// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The left side of the pane: the accounts below their providers. A reading that differs a little changes the list a
// little, so that selection and scroll position stay. User-interface thread only.

#ifndef KAVELL_PANE_ACCOUNT_LIST_H
#define KAVELL_PANE_ACCOUNT_LIST_H

#include <QtGui/QStandardItemModel>
#include <QtWidgets/QTreeView>

#include "pane/account_records.h"

namespace kavell::pane {

class AccountList : public QTreeView {
    Q_OBJECT

public:
    explicit AccountList(QWidget *parent = nullptr);
    ~AccountList() override;

    void showAccounts(const QList<AccountGroup> &groups);

    /// Null when no account is selected.
    [[nodiscard]] AccountName selectedAccount() const;

    /// Selects an account and brings it into view. False when it is not in the list.
    bool selectAccount(const AccountName &name);

    /// Selects the first account, if there is one.
    void selectFirst();

signals:
    /// Another account than before is selected, or none (a null name).
    void selected(const AccountName &name);

protected:
    void selectionChanged(const QItemSelection &now, const QItemSelection &before) override;

private:
    void updateGroup(QStandardItem &group, const QList<AccountSummary> &accounts);

    QStandardItemModel m_model;
    AccountName m_told;  // by the signal
};

}  // namespace kavell::pane

#endif
