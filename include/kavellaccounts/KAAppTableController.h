// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The table in which a user picks the client applications that are to use an account, one row (KAAppTableRow) for each
// application that the account-list plug-in's provider has a service for:
//
//     _table = KAAppTableController::initWithAccount(account, plugin);
//     _table->setDelegate(plugin);
//     container->layout()->addWidget(_table->view());
//
// The delegate decides, by two invokable methods, each of which it may leave out:
//
//     bool appToggle(const std::shared_ptr<KAApplication> &application);       whether a clicked check box may stay so
//     void showInfoForApp(const std::shared_ptr<KAApplication> &application);  the information button was pressed
//
// Where nobody answers appToggle, no click stays: an application that nobody turns on must not look turned on.
//
// An account with a true provider attribute "KAConflictsWithAerwyn" cannot be used together with the maker's newest
// online service: all applications but the chat one are greyed out then, for the life of their rows.
//
// User-interface thread only; the properties account, apps, pairedServices and delegate may be read from any.

#ifndef KAVELLACCOUNTS_KAAPPTABLECONTROLLER_H
#define KAVELLACCOUNTS_KAAPPTABLECONTROLLER_H

#include <memory>
#include <mutex>

#include <QtCore/QList>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QScrollArea>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAViewController.h>

class KAAListPlugin;
class KAAccount;
class KAAppTableRow;
class KAApplication;

namespace kavell {
class AppTableRows;
}

class KAVELL_ACCOUNTS_EXPORT KAAppTableController : public KAViewController {
    Q_OBJECT

public:
    /// A controller with the table of an interface file NAME.ui of the bundle (null: the library's own), which needs a
    /// QScrollArea "scrollView" and in it a QWidget "appsTable". No account, no plug-in. Never null; without such a file
    /// there is "*** Couldn't load nib NAME" in the log and no view.
    [[nodiscard]] static std::shared_ptr<KAAppTableController> initWithNibName(const QString &name,
                                                                               const std::shared_ptr<KABundle> &bundle);

    /// The table of an account's applications, each of which is picked as the account says. Information buttons and
    /// spinners are on. The plug-in may be null: there are no applications until setServices then.
    [[nodiscard]] static std::shared_ptr<KAAppTableController>
    initWithAccount(const std::shared_ptr<KAAccount> &account, KAAListPlugin *plugin);

    ~KAAppTableController() override;

    /// @name Properties. Replaced applications and services show in the table with the next reloadTable
    /// @{
    [[nodiscard]] std::shared_ptr<KAAccount> account() const;
    void setAccount(std::shared_ptr<KAAccount> account);

    /// The rows' applications in the order of the rows, and at the same places the service types (kKAServiceIMAP, …)
    /// through which they use the account.
    [[nodiscard]] QList<std::shared_ptr<KAApplication>> apps() const;
    void setApps(const QList<std::shared_ptr<KAApplication>> &apps);
    [[nodiscard]] QStringList pairedServices() const;
    void setPairedServices(const QStringList &pairedServices);

    /// Null when there is none, and when one whose owner is elsewhere has gone.
    [[nodiscard]] QObject *delegate() const;
    void setDelegate(std::shared_ptr<QObject> delegate);  ///< retained
    void setDelegate(QObject *delegate);                  ///< whose owner is elsewhere, as a registered plug-in's

    /// Given to each row when it is made; false after initWithNibName, true after initWithAccount.
    [[nodiscard]] bool showInfoButtons() const;
    void setShowInfoButtons(bool showInfoButtons);
    [[nodiscard]] bool spinOnSelection() const;
    void setSpinOnSelection(bool spinOnSelection);
    /// @}

    /// Shows the applications that use the services, in ascending order of their sort values, each picked as the account
    /// says. May read the disk for names and icons.
    void setServices(const QStringList &services);

    /// Shows another account with its plug-in; nothing when it is the account shown. As setServices otherwise.
    void setAccountAndPlugin(const std::shared_ptr<KAAccount> &account, KAAListPlugin *plugin);

    /// Picks the applications anew as the account says, except those whose rows are spinning.
    void updateTable();

    /// Picks every application whose controls are not disabled.
    void selectAllApps();

    /// The applications that are picked, in the table's order.
    [[nodiscard]] virtual QList<std::shared_ptr<KAApplication>> selectedApps() const;

    /// The applications of the bundle identifiers, in the table's order.
    [[nodiscard]] QList<std::shared_ptr<KAApplication>> appsWithBundleIDs(const QStringList &bundleIDs) const;

    /// @name One application's check box and spinner. The application's enabled flag stays
    /// @{
    void selectApp(const std::shared_ptr<KAApplication> &application);
    void deselectApp(const std::shared_ptr<KAApplication> &application);
    void startProgressForApp(const std::shared_ptr<KAApplication> &application);
    void stopProgressForApp(const std::shared_ptr<KAApplication> &application);
    void stopProgressForAllApps();
    /// @}

    /// The application of a row; null for a row that there is not.
    [[nodiscard]] std::shared_ptr<KAApplication> appAtRow(int row) const;

    /// The row of an application, which is made when it is first asked for and lives as long as the application; null
    /// for none, and when the row's interface file cannot be read. It stays with the controller that made it, and after
    /// that one with the next that asks.
    [[nodiscard]] std::shared_ptr<KAAppTableRow> rowViewForApp(const std::shared_ptr<KAApplication> &application);

    /// @name What rows tell: the check box was clicked, the information button was pressed
    /// @{
    void checkboxClickedForApp(QCheckBox *checkbox, const std::shared_ptr<KAApplication> &application);
    void infoButtonClickedForApp(const std::shared_ptr<KAApplication> &application);
    /// @}

    /// @name What the table shows
    /// @{
    [[nodiscard]] int numberOfRows() const;
    [[nodiscard]] std::shared_ptr<KAApplication> objectValueForRow(int row) const;
    [[nodiscard]] std::shared_ptr<KAAppTableRow> rowViewForRow(int row);

    /// Shows the applications as they stand. Rows are made a few at a time, those in view first, and the rest in the
    /// event loop's idle time.
    void reloadTable();
    /// @}

    /// Sorts applications with their services in ascending order of sort values; equal ones keep their order.
    void _sortApps();

    void describeFields(KAFieldList &fields) const override;

protected:
    /// Without a view.
    KAAppTableController();

private:
    void loadTable(const QString &name, const std::shared_ptr<KABundle> &bundle);
    void fetchAppsForServices(const QStringList &services);
    void synchronizeWithAccount(const std::shared_ptr<KAApplication> &application);
    [[nodiscard]] QStringList servicesOffered() const;
    [[nodiscard]] QString serviceForApp(const std::shared_ptr<KAApplication> &application) const;
    [[nodiscard]] bool isConflicting(const KAApplication &application) const;
    void nameRow(KAAppTableRow &row, const std::shared_ptr<KAApplication> &application) const;

    mutable std::mutex m_mutex;  // of the properties that any thread may read
    std::shared_ptr<KAAccount> _account;
    QList<std::shared_ptr<KAApplication>> _apps;
    QStringList _pairedServices;
    QPointer<KAAListPlugin> _plugin;
    QPointer<QObject> _delegate;
    bool _showInfoButtons = false;
    bool _spinOnSelection = false;
    QPointer<QScrollArea> _scrollView;
    QPointer<QWidget> _appTable;

    std::shared_ptr<QObject> m_retainedDelegate;
    std::unique_ptr<kavell::AppTableRows> m_rows;
};

#endif
