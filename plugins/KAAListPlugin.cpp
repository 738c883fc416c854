// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAListPlugin.h>

#include <QtCore/QFile>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KARequiredMethodException.h>
#include <kavellaccounts/KASheetMorpher.h>
#include <kavellaccounts/KASheetWindow.h>

#include "platform/qt/interface_file.h"
#include "plugins/domain_matcher.h"
#include "plugins/information_dictionary.h"

namespace {

constexpr int kHostSheetSide = 200;

const QString kDomainsResource = QStringLiteral("domains");
const QString kDomainsType = QStringLiteral("plist");
const QString kInterfaceType = QStringLiteral("ui");

}  // namespace

KAAListPlugin::KAAListPlugin(std::shared_ptr<KABundle> bundle) : KAPlugin(std::move(bundle))
{
}

KAAListPlugin::~KAAListPlugin()
{
    _sheetMorpher.reset();
    _appTableController.reset();
    _provisionalAccount.reset();
    _hostSheet.reset();
    _cachedDomains.reset();
}

void KAAListPlugin::cancel(QObject *)
{
    if (!_hostSheet)
        return;
    _hostSheet->endSheet(0);
    _hostSheet->orderOut();
}

void KAAListPlugin::back(QObject *)
{
    // Only showView makes a sheet; without one there is nothing to go back in.
    if (!_sheetMorpher)
        _sheetMorpher = KASheetMorpher::initWithHostSheet(_hostSheet);
    _sheetMorpher->setContentView(_validationView, true);
}

void KAAListPlugin::continueButton(QObject *)
{
}

void KAAListPlugin::addAccount(QObject *)
{
    if (_hostSheet) {
        _hostSheet->endSheet(QDialog::Accepted);
        _hostSheet->orderOut();
    }
    QList<std::shared_ptr<KAAccount>> created;
    if (_provisionalAccount)
        created.append(_provisionalAccount);
    QVariantMap information{{QStringLiteral("plugin"), QVariant::fromValue(this)}};
    if (_appTableController)
        information.insert(QStringLiteral("selectedApps"), QVariant::fromValue(_appTableController->selectedApps()));
    KANotificationCenter::shared().post(KACreatedAccountsNotification, QVariant::fromValue(created), information);
}

bool KAAListPlugin::appToggle(const std::shared_ptr<KAApplication> &)
{
    enableAppSelectionOKButton();
    return true;
}

bool KAAListPlugin::showMigrationSyncAlertForService(const QString &)
{
    return false;
}

bool KAAListPlugin::shouldShowMigrationSyncAlertForService(const QString &) const
{
    return false;
}

std::optional<QVariantMap> KAAListPlugin::domains()
{
    const std::lock_guard lock(m_domainsMutex);
    if (_cachedDomains)
        return _cachedDomains;
    const std::shared_ptr<KABundle> own = bundle();
    const QString path = own ? own->pathForResource(kDomainsResource, kDomainsType) : QString();
    if (!path.isNull())
        _cachedDomains = kavell::readPropertyList(path);
    return _cachedDomains;
}

bool KAAListPlugin::supportsDomain(const QString &domain)
{
    if (domain.isNull())
        return false;
    const std::optional<QVariantMap> served = domains();
    if (!served)
        return false;
    std::shared_ptr<const kavell::DomainMatcher> matcher;
    {
        const std::lock_guard lock(m_domainsMutex);
        if (!m_domainMatcher || !m_domainMatcher->isFor(*served))
            m_domainMatcher = std::make_shared<const kavell::DomainMatcher>(*served);
        matcher = m_domainMatcher;
    }
    return matcher->matches(domain.toLower());
}

bool KAAListPlugin::supportsDataMigration() const
{
    return false;
}

bool KAAListPlugin::shouldShowPasswordField() const
{
    return true;
}

QImage KAAListPlugin::bannerImage() const
{
    return {};
}

std::shared_ptr<KAAccount> KAAListPlugin::accountFromSettings(const QVariantMap &)
{
    throw KARequiredMethodException("-[KAAListPlugin accountFromSettings:]");
}

QImage KAAListPlugin::imageForAccount(const std::shared_ptr<KAAccount> &)
{
    throw KARequiredMethodException("-[KAAListPlugin imageForAccount:]");
}

void KAAListPlugin::signInAccount(const std::shared_ptr<KAAccount> &, QWidget *)
{
}

void KAAListPlugin::createAccountInWindowWithWayfenArgs(QWidget *, const QVariantMap &)
{
}

void KAAListPlugin::createAccountInWindow(QWidget *)
{
    throw KARequiredMethodException("-[KAAListPlugin createAccountInWindow:]");
}

bool KAAListPlugin::canSignOutForAccount(const std::shared_ptr<KAAccount> &) const
{
    return true;
}

void KAAListPlugin::setEnabled(bool, const std::shared_ptr<KAApplication> &, const std::shared_ptr<KAAccount> &,
                               QWidget *)
{
    throw KARequiredMethodException("-[KAAListPlugin setEnabled:application:account:inWindow:]");
}

void KAAListPlugin::configViewDidLoad()
{
}

void KAAListPlugin::configViewWillLoad()
{
}

QWidget *KAAListPlugin::signInView()
{
    return nullptr;
}

void KAAListPlugin::showAppSelectionPanel(bool animate)
{
    showView(_appSelectionView, animate);
    enableAppSelectionOKButton();
}

void KAAListPlugin::showValidationPanel(bool animate)
{
    showView(_validationView, animate);
}

void KAAListPlugin::showView(QWidget *view, bool animate)
{
    if (!_hostSheet) {
        _hostSheet = std::make_shared<KASheetWindow>();
        _hostSheet->resize(kHostSheetSide, kHostSheetSide);
        if (_sheetMorpher)
            _sheetMorpher->setHostSheet(_hostSheet);
    }
    if (!_sheetMorpher)
        _sheetMorpher = KASheetMorpher::initWithHostSheet(_hostSheet);
    _sheetMorpher->setContentView(view, animate);
}

bool KAAListPlugin::loadInterfaceFile(const QString &name)
{
    const std::shared_ptr<KABundle> own = bundle();
    auto interface = kavell::InterfaceFile::load(own ? own->pathForResource(name, kInterfaceType) : QString());
    if (!interface)
        return false;
    bool complete = interface->connectOutlet(_validationView, QStringLiteral("validationView"));
    complete &= interface->connectOutlet(_appSelectionView, QStringLiteral("appSelectionView"));
    complete &= interface->connectOutlet(_appTableContainer, QStringLiteral("appTableContainer"));
    complete &= interface->connectOutlet(_appSelectionAccountName, QStringLiteral("appSelectionAccountName"));
    complete &= interface->connectOutlet(_appSelectionOKButton, QStringLiteral("appSelectionOKButton"));
    complete &= interface->connectActions(this);
    m_interfaces.push_back(std::move(interface));
    return complete;
}

void KAAListPlugin::makeAppTable(const std::shared_ptr<KAAccount> &account)
{
    _appTableController = KAAppTableController::initWithAccount(account, this);
    _appTableController->setDelegate(this);
    _appTableController->setSpinOnSelection(false);
    _appTableController->setShowInfoButtons(false);
    if (_appTableContainer && _appTableController->view()) {
        if (!_appTableContainer->layout())
            (new QVBoxLayout(_appTableContainer))->setContentsMargins(0, 0, 0, 0);
        _appTableContainer->layout()->addWidget(_appTableController->view());
    }
    if (_appSelectionAccountName) {
        _appSelectionAccountName->setTextFormat(Qt::PlainText);
        _appSelectionAccountName->setText(account ? account->loginName() : QString());
    }
}

void KAAListPlugin::describeFields(KAFieldList &fields) const
{
    fields.add("_appTableController", _appTableController);
    fields.add("_provisionalAccount", _provisionalAccount);
    fields.add("_sheetMorpher", _sheetMorpher);
    fields.add("_hostSheet", _hostSheet);
    {
        const std::lock_guard lock(m_domainsMutex);
        fields.add("_cachedDomains", _cachedDomains);
    }
    fields.add("_validationView", _validationView);
    fields.add("_appSelectionView", _appSelectionView);
    fields.add("_appTableContainer", _appTableContainer);
    fields.add("_appSelectionAccountName", _appSelectionAccountName);
    fields.add("_appSelectionOKButton", _appSelectionOKButton);
    KAPlugin::describeFields(fields);
}

void KAAListPlugin::enableAppSelectionOKButton()
{
    if (_appSelectionOKButton)
        _appSelectionOKButton->setEnabled(_appTableController && !_appTableController->selectedApps().isEmpty());
}
