// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of the application table share: an account-list plug-in that offers services, delegates that answer,
// the controls of a row by their object names, and fixtures with a row and with tables.

#ifndef KAVELL_TESTS_UI_APP_TABLE_FIXTURE_H
#define KAVELL_TESTS_UI_APP_TABLE_FIXTURE_H

#include <functional>

#include <gtest/gtest.h>

#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLabel>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "ui/row_label.h"

namespace kavell::test {

using Application = std::shared_ptr<KAApplication>;

/// An account-list plug-in with services, a brand, and an own word for the mail application's data.
class OfferingPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    explicit OfferingPlugin(const QStringList &services, std::shared_ptr<KABundle> bundle = nullptr)
        : KAAListPlugin(std::move(bundle))
    {
        const auto offering = KAProvider::initWithProviderType(kKAProviderTest);
        offering->setServiceTypesProvided(services);
        setProvider(offering);
    }

    QString brandName() const override { return QStringLiteral("Zorbo"); }
    QString displayNameForApplication(const Application &application) const override
    {
        return application->bundleID() == kKAMailAppID ? QStringLiteral("Letters")
                                                       : KAAListPlugin::displayNameForApplication(application);
    }
};

/// A delegate that answers everything and writes down what it is asked.
class RecordingDelegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE bool appToggle(const std::shared_ptr<KAApplication> &application)
    {
        toggled += application;
        enabledWhenAsked += application->enabled();
        if (whenAsked)
            whenAsked();
        return accepts;
    }
    Q_INVOKABLE void showInfoForApp(const std::shared_ptr<KAApplication> &application) { shown += application; }

    bool accepts = true;
    std::function<void()> whenAsked;
    QList<Application> toggled;
    QList<bool> enabledWhenAsked;
    QList<Application> shown;
};

inline QStringList allServices()
{
    return {kKAServiceIM, kKAServiceCalDAV, kKAServiceCardDAV, kKAServiceIMAP};
}

inline std::shared_ptr<KAAccount> accountFor(const QStringList &pluginIDs, const QString &loginName = "anna@zorbo.test")
{
    auto account = KAAccount::initWithProviderType(kKAProviderGoogle, loginName);
    for (const QString &pluginID : pluginIDs)
        account->addChildAccountDict(KAAccount::childDictionaryWithSettings({}, "uid-" + pluginID, pluginID),
                                     "uid-" + pluginID);
    return account;
}

inline std::shared_ptr<KAAccount> conflictingAccount(const QStringList &pluginIDs = {})
{
    auto account = accountFor(pluginIDs);
    account->setProviderAttribute(true, "KAConflictsWithAerwyn");
    return account;
}

inline QStringList bundleIDsOf(const QList<Application> &applications)
{
    QStringList bundleIDs;
    for (const Application &application : applications)
        bundleIDs += application->bundleID();
    return bundleIDs;
}

/// @name The controls of a row
/// @{
template <typename Control> Control *controlOf(const KAAppTableRow &row, const char *name)
{
    return row.findChild<Control *>(QString::fromLatin1(name));
}
inline QCheckBox *checkboxOf(const KAAppTableRow &row)
{
    return controlOf<QCheckBox>(row, "checkbox");
}
inline QAbstractButton *infoButtonOf(const KAAppTableRow &row)
{
    return controlOf<QAbstractButton>(row, "infoButton");
}
inline QLabel *nameOf(const KAAppTableRow &row)
{
    return controlOf<QLabel>(row, "appNameField");
}
inline QLabel *secondaryOf(const KAAppTableRow &row)
{
    return controlOf<QLabel>(row, "secondaryTextField");
}
inline QWidget *spinnerOf(const KAAppTableRow &row)
{
    return controlOf<QWidget>(row, "spinner");
}
/// @}

/// A row without a table.
class AppTableRowTest : public testing::Test {
protected:
    ~AppTableRowTest() override { qApp->setLayoutDirection(Qt::LeftToRight); }

    [[nodiscard]] RowLabel *nameField() const { return controlOf<RowLabel>(*row, "appNameField"); }
    [[nodiscard]] bool hasInfoButton() const { return !infoButtonOf(*row)->isHidden(); }

    /// What of the row is painted when it is drawn.
    QImage drawn() const { return row->grab().toImage(); }

    std::shared_ptr<KAAppTableRow> row = KAAppTableRow::createFromNib();
    Application mail = KAApplication::initWithBundleID(kKAMailAppID);
};

/// Tables of accounts of one plug-in, which are not shown.
class AppTableTest : public testing::Test {
protected:
    std::shared_ptr<KAAppTableController> tableFor(const std::shared_ptr<KAAccount> &account)
    {
        return KAAppTableController::initWithAccount(account, &plugin);
    }

    OfferingPlugin plugin{allServices()};
};

}  // namespace kavell::test

#endif
