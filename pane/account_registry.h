// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The accounts as the pane shows them: read in the background, and again whenever any program changes something.
// User-interface thread only.

#ifndef KAVELL_PANE_ACCOUNT_REGISTRY_H
#define KAVELL_PANE_ACCOUNT_REGISTRY_H

#include <QtCore/QList>
#include <QtCore/QObject>
#include <QtCore/QTimer>

#include "pane/account_records.h"
#include "pane/change_watch.h"

namespace kavell::pane {

class Undertakings;

class AccountRegistry : public QObject {
    Q_OBJECT

public:
    explicit AccountRegistry(Undertakings &undertakings, QObject *parent = nullptr);
    ~AccountRegistry() override;

    /// Reads all accounts; `read` or `notRead` tells the end.
    void reload();

    /// As they were last read; empty before.
    [[nodiscard]] const QList<AccountGroup> &groups() const { return m_groups; }

    /// @name Null when there is none of that name
    /// @{
    [[nodiscard]] const AccountGroup *groupOf(const AccountName &name) const;
    [[nodiscard]] const AccountSummary *summaryOf(const AccountName &name) const;
    /// @}

signals:
    /// The accounts were read, for the first time or again.
    void read();

    /// The user did not want to wait any longer.
    void notRead();

private:
    Undertakings &m_undertakings;
    ChangeWatch m_watch;
    QTimer m_next;  // runs while changes are gathered for one reading
    QList<AccountGroup> m_groups;
    bool m_isReading = false;
    bool m_hasChanged = false;  // since the reading under way began
};

}  // namespace kavell::pane

#endif
