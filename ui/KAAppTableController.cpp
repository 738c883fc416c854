// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAppTableController.h>

#include <utility>

#include <QtCore/QMetaMethod>
#include <QtWidgets/QScroller>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "model/configuration.h"
#include "model/settings_reading.h"
#include "ui/app_table_rows.h"
#include "ui/library_text.h"

namespace {

using Application = std::shared_ptr<KAApplication>;

const QString kInterfaceName = QStringLiteral("AppTable");
const QString kRowKey = QStringLiteral("rowView");  // of an application's user information

// Provider attribute: the account cannot be used together with the maker's newest online service.
const QString kConflictsWithAerwynKey = QStringLiteral("KAConflictsWithAerwyn");

/// The row that an application has already; null when it has none.
std::shared_ptr<KAAppTableRow> existingRow(const Application &application)
{
    const std::shared_ptr<QVariantMap> information = application ? application->userInfo() : nullptr;
    return information ? information->value(kRowKey).value<std::shared_ptr<KAAppTableRow>>() : nullptr;
}

/// Stores the row where it lives as long as the application; one that a caller left without a dictionary is given one.
void keepRow(const Application &application, const std::shared_ptr<KAAppTableRow> &row)
{
    if (!application->userInfo())
        application->setUserInfo(std::make_shared<QVariantMap>());
    application->userInfo()->insert(kRowKey, QVariant::fromValue(row));
}

/// The delegate's method of that name that takes an application; an invalid one when its class has none.
QMetaMethod methodOf(const QObject *delegate, const char *name)
{
    if (!delegate)
        return {};
    const QByteArray signature = QByteArray(name) + '(' + QMetaType::fromType<Application>().name() + ')';
    const QMetaObject *const metaObject = delegate->metaObject();
    return metaObject->method(metaObject->indexOfMethod(signature.constData()));
}

}  // namespace

std::shared_ptr<KAAppTableController> KAAppTableController::initWithNibName(const QString &name,
                                                                            const std::shared_ptr<KABundle> &bundle)
{
    std::shared_ptr<KAAppTableController> controller(new KAAppTableController);
    controller->loadTable(name, bundle);
    return controller;
}

std::shared_ptr<KAAppTableController> KAAppTableController::initWithAccount(const std::shared_ptr<KAAccount> &account,
                                                                            KAAListPlugin *plugin)
{
    const std::shared_ptr<KAAppTableController> controller = initWithNibName(kInterfaceName, nullptr);
    controller->_account = account;
    controller->_plugin = plugin;
    controller->_spinOnSelection = true;
    controller->_showInfoButtons = true;
    controller->m_rows->setHighlightsSelection(false);
    if (plugin)
        controller->setServices(controller->servicesOffered());
    return controller;
}

KAAppTableController::KAAppTableController() = default;

KAAppTableController::~KAAppTableController() = default;

void KAAppTableController::loadTable(const QString &name, const std::shared_ptr<KABundle> &bundle)
{
    if (loadInterface(name, bundle)) {
        _scrollView = outlet<QScrollArea>(QStringLiteral("scrollView"));
        _appTable = outlet<QWidget>(QStringLiteral("appsTable"));
    }
    if (_appTable)
        _appTable->setAccessibleName(kavell::libraryText("APP_TABLE"));
    m_rows =
        std::make_unique<kavell::AppTableRows>(_scrollView, _appTable, [this](int row) { return rowViewForRow(row); });
    if (_scrollView) {
        QScroller *const scroller = QScroller::scroller(_scrollView->viewport());
        QScrollerProperties properties = scroller->scrollerProperties();
        properties.setScrollMetric(QScrollerProperties::VerticalOvershootPolicy,
                                   QVariant::fromValue(QScrollerProperties::OvershootAlwaysOff));
        scroller->setScrollerProperties(properties);
    }
}

std::shared_ptr<KAAccount> KAAppTableController::account() const
{
    const std::lock_guard lock(m_mutex);
    return _account;
}

void KAAppTableController::setAccount(std::shared_ptr<KAAccount> account)
{
    const std::lock_guard lock(m_mutex);
    _account.swap(account);
}

QList<Application> KAAppTableController::apps() const
{
    const std::lock_guard lock(m_mutex);
    return _apps;
}

void KAAppTableController::setApps(const QList<Application> &apps)
{
    QList<Application> former = apps;  // goes after the lock is given back, and its rows with it
    const std::lock_guard lock(m_mutex);
    _apps.swap(former);
}

QStringList KAAppTableController::pairedServices() const
{
    const std::lock_guard lock(m_mutex);
    return _pairedServices;
}

void KAAppTableController::setPairedServices(const QStringList &pairedServices)
{
    const std::lock_guard lock(m_mutex);
    _pairedServices = pairedServices;
}

QObject *KAAppTableController::delegate() const
{
    const std::lock_guard lock(m_mutex);
    return _delegate;
}

void KAAppTableController::setDelegate(std::shared_ptr<QObject> delegate)
{
    const std::lock_guard lock(m_mutex);
    _delegate = delegate.get();
    m_retainedDelegate.swap(delegate);
}

void KAAppTableController::setDelegate(QObject *delegate)
{
    std::shared_ptr<QObject> former;
    const std::lock_guard lock(m_mutex);
    _delegate = delegate;
    m_retainedDelegate.swap(former);
}

bool KAAppTableController::showInfoButtons() const
{
    return _showInfoButtons;
}

void KAAppTableController::setShowInfoButtons(bool showInfoButtons)
{
    _showInfoButtons = showInfoButtons;
}

bool KAAppTableController::spinOnSelection() const
{
    return _spinOnSelection;
}

void KAAppTableController::setSpinOnSelection(bool spinOnSelection)
{
    _spinOnSelection = spinOnSelection;
}

void KAAppTableController::setServices(const QStringList &services)
{
    fetchAppsForServices(services);
    for (const Application &application : apps())
        synchronizeWithAccount(application);
    reloadTable();
}

void KAAppTableController::setAccountAndPlugin(const std::shared_ptr<KAAccount> &account, KAAListPlugin *plugin)
{
    if (account == this->account())
        return;
    setAccount(account);
    _plugin = plugin;
    setServices(servicesOffered());
}

void KAAppTableController::updateTable()
{
    for (const Application &application : apps()) {
        const std::shared_ptr<KAAppTableRow> row = existingRow(application);
        if (!row || !row->isSpinning())
            synchronizeWithAccount(application);
    }
}

void KAAppTableController::selectAllApps()
{
    for (const Application &application : apps()) {
        const std::shared_ptr<KAAppTableRow> row = existingRow(application);
        const bool isDisabled = row ? row->disableControls() : isConflicting(*application);
        if (!isDisabled)
            application->setEnabled(true);
        if (row)
            isDisabled ? row->syncUI() : row->select();
    }
    reloadTable();
}

QList<Application> KAAppTableController::selectedApps() const
{
    QList<Application> selected = apps();
    selected.removeIf([](const Application &application) { return !application->enabled(); });
    return selected;
}

QList<Application> KAAppTableController::appsWithBundleIDs(const QStringList &bundleIDs) const
{
    QList<Application> found = apps();
    found.removeIf([&](const Application &application) {
        const QString bundleID = application->bundleID();
        return bundleID.isNull() || !bundleIDs.contains(bundleID);
    });
    return found;
}

void KAAppTableController::selectApp(const Application &application)
{
    if (const std::shared_ptr<KAAppTableRow> row = rowViewForApp(application))
        row->select();
}

void KAAppTableController::deselectApp(const Application &application)
{
    if (const std::shared_ptr<KAAppTableRow> row = rowViewForApp(application))
        row->deselect();
}

void KAAppTableController::startProgressForApp(const Application &application)
{
    if (const std::shared_ptr<KAAppTableRow> row = rowViewForApp(application))
        row->startSpinner();
}

void KAAppTableController::stopProgressForApp(const Application &application)
{
    if (const std::shared_ptr<KAAppTableRow> row = rowViewForApp(application))
        row->stopSpinner();
}

void KAAppTableController::stopProgressForAllApps()
{
    for (const Application &application : apps()) {
        if (existingRow(application))
            stopProgressForApp(application);
    }
}

Application KAAppTableController::appAtRow(int row) const
{
    const std::lock_guard lock(m_mutex);
    return row >= 0 && row < _apps.size() ? _apps.at(row) : nullptr;
}

std::shared_ptr<KAAppTableRow> KAAppTableController::rowViewForApp(const Application &application)
{
    if (!application)
        return nullptr;
    if (const std::shared_ptr<KAAppTableRow> row = existingRow(application)) {
        if (!row->delegate())
            row->setDelegate(this);
        return row;
    }
    const std::shared_ptr<KAAppTableRow> row = KAAppTableRow::createFromNib();
    if (!row)
        return nullptr;
    row->setShowInfoButton(_showInfoButtons);
    row->setSpinOnSelection(_spinOnSelection);
    keepRow(application, row);
    row->setApplication(application);
    row->setDelegate(this);
    nameRow(*row, application);
    const bool isConflicting = this->isConflicting(*application);
    row->setDisableControls(isConflicting);
    row->setSecondaryText(isConflicting ? kavell::libraryText("CONFLICTS_WITH_AERWYN") : QStringLiteral(""));
    return row;
}

void KAAppTableController::checkboxClickedForApp(QCheckBox *checkbox, const Application &application)
{
    if (!checkbox || !application)
        return;
    const QPointer<QCheckBox> clicked = checkbox;
    const bool isOn = checkbox->isChecked();
    application->setEnabled(isOn);
    bool isAccepted = false;
    QObject *const asked = delegate();
    const QMetaMethod appToggle = methodOf(asked, "appToggle");
    if (appToggle.isValid())
        appToggle.invoke(asked, Qt::DirectConnection, Q_RETURN_ARG(bool, isAccepted),
                         Q_ARG(std::shared_ptr<KAApplication>, application));
    if (!isAccepted && clicked)
        clicked->setChecked(!isOn);
}

void KAAppTableController::infoButtonClickedForApp(const Application &application)
{
    QObject *const told = delegate();
    const QMetaMethod showInfoForApp = methodOf(told, "showInfoForApp");
    if (showInfoForApp.isValid())
        showInfoForApp.invoke(told, Qt::DirectConnection, Q_ARG(std::shared_ptr<KAApplication>, application));
}

int KAAppTableController::numberOfRows() const
{
    const std::lock_guard lock(m_mutex);
    return int(_apps.size());
}

Application KAAppTableController::objectValueForRow(int row) const
{
    return appAtRow(row);
}

std::shared_ptr<KAAppTableRow> KAAppTableController::rowViewForRow(int row)
{
    return rowViewForApp(appAtRow(row));
}

void KAAppTableController::reloadTable()
{
    if (m_rows)
        m_rows->reload(numberOfRows());
}

void KAAppTableController::_sortApps()
{
    const std::lock_guard lock(m_mutex);
    qsizetype end = _apps.size();
    while (end > 1) {
        qsizetype lastSwap = 0;
        for (qsizetype right = 1; right < end; ++right) {
            if (_apps.at(right - 1)->sortValue() <= _apps.at(right)->sortValue())
                continue;
            _apps.swapItemsAt(right - 1, right);
            if (right < _pairedServices.size())
                _pairedServices.swapItemsAt(right - 1, right);
            lastSwap = right;
        }
        // What lies from the last swap on is in its place.
        end = lastSwap;
    }
}

void KAAppTableController::fetchAppsForServices(const QStringList &services)
{
    QStringList paired;
    QList<Application> fetched = KAPluginManager::shared()->applicationsForServices(services, &paired);
    setApps(fetched);
    setPairedServices(paired);
    _sortApps();
}

void KAAppTableController::synchronizeWithAccount(const Application &application)
{
    const std::shared_ptr<KAAccount> shown = account();
    const bool isEnabled = shown && shown->enabledForApplication(application->bundleID());
    application->setEnabled(isEnabled);
    if (const std::shared_ptr<KAAppTableRow> row = existingRow(application))
        isEnabled ? row->select() : row->deselect();
    else if (isConflicting(*application))
        application->setEnabled(false);  // as the row does when it is made, and it may be made much later
}

QStringList KAAppTableController::servicesOffered() const
{
    const std::shared_ptr<KAProvider> provider = _plugin ? _plugin->provider() : nullptr;
    QStringList services = provider ? provider->serviceTypesProvided() : QStringList();
    const std::shared_ptr<KAAccount> shown = account();
    // Japanese accounts of Yahoo have neither contacts nor calendars to offer.
    if (_plugin && _plugin->identifier() == kKAYahooPluginID && shown &&
        shown->loginName().endsWith(kavell::configuration::kJapaneseCommercialSuffix)) {
        services.removeAll(kKAServiceCardDAV);
        services.removeAll(kKAServiceCalDAV);
    }
    return services;
}

QString KAAppTableController::serviceForApp(const Application &application) const
{
    const std::lock_guard lock(m_mutex);
    return _pairedServices.value(_apps.indexOf(application));
}

bool KAAppTableController::isConflicting(const KAApplication &application) const
{
    const std::shared_ptr<KAAccount> shown = account();
    if (!shown || application.bundleID() == kKAParlexAppID)
        return false;
    return kavell::isTrueForKey({{kConflictsWithAerwynKey, shown->providerAttributeForKey(kConflictsWithAerwynKey)}},
                                kConflictsWithAerwynKey);
}

void KAAppTableController::nameRow(KAAppTableRow &row, const Application &application) const
{
    const QString service = serviceForApp(application);
    row.setServiceDisplayName(_plugin ? _plugin->serviceDisplayNameForService(service) : QStringLiteral(""));
    row.setAppDisplayName(_plugin ? _plugin->displayNameForApplication(application) : QStringLiteral(""));
}

void KAAppTableController::describeFields(KAFieldList &fields) const
{
    {
        const std::lock_guard lock(m_mutex);
        fields.add("_account", _account);
        fields.add("_apps", _apps);
        fields.add("_pairedServices", _pairedServices);
        fields.add("_plugin", _plugin);
        fields.add("_delegate", _delegate);
    }
    fields.add("_showInfoButtons", _showInfoButtons);
    fields.add("_spinOnSelection", _spinOnSelection);
    fields.add("_scrollView", _scrollView);
    fields.add("_appTable", _appTable);
    KAViewController::describeFields(fields);
}
