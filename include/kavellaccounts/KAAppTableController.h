// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The table in which a user picks the client applications that are to use an account, as an account-list plug-in's
// sheet sees it. User-interface thread only.

#ifndef KAVELLACCOUNTS_KAAPPTABLECONTROLLER_H
#define KAVELLACCOUNTS_KAAPPTABLECONTROLLER_H

#include <memory>

#include <QtCore/QList>
#include <QtCore/QObject>

#include <kavellaccounts/KAExport.h>

class KAApplication;

class KAVELL_ACCOUNTS_EXPORT KAAppTableController : public QObject {
    Q_OBJECT

public:
    ~KAAppTableController() override;

    /// The applications whose check boxes are on, in the table's order.
    [[nodiscard]] virtual QList<std::shared_ptr<KAApplication>> selectedApps() const = 0;
};

#endif
