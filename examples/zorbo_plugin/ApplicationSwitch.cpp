// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ApplicationSwitch.h"

#include <iterator>

#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/Ref.h>

#include "SetupDriver.h"
#include "application_input.h"

namespace {

const QString kUIDKey = QStringLiteral("uid");  // of a child

/// The application's data plug-in; null when it is not installed.
KADataPlugin *dataPluginOf(const KAApplication &application)
{
    const QString identifier = application.associatedPluginID();
    return identifier.isNull()
               ? nullptr
               : qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(identifier));
}

/// The UID of the account's child in the application; null when it has none.
QString childUIDOf(const KAAccount &account, const KAApplication &application)
{
    const auto child = account.childAccountWithPluginID(application.associatedPluginID());
    return child ? child->value(kUIDKey).toString() : QString();
}

/// Whether the account's file is there. Accounts are few: reading the directory takes a moment only.
bool isStored(const KAAccount &account)
{
    return KAProvider::initWithProviderType(account.provider())->hasAccountWithLoginName(account.loginName());
}

/// Tells every process, as saving an account does, that there is something new about it.
void announce(const KAAccount &account)
{
    const auto provider = kavell::makeString(account.provider().toStdString());
    const auto loginName = kavell::makeString(account.loginName().toStdString());
    const CSKavellTypeRef keys[] = {kCSKavellAccountProviderName, kCSKavellAccountUserLoginName};
    const CSKavellTypeRef values[] = {provider.get(), loginName.get()};
    const auto information = kavell::adopt(CSKavellDictionaryCreate(keys, values, std::size(keys)));
    (void)CSKavellNotificationPost(kCSKavellAccountNotificationSender,
                                   kCSKavellAccountProviderSettingsChangedNotification, information.get());
}

bool isInactive(const QVariantMap &settings)
{
    return settings.value(KAMailInactiveAccountKey).toBool();
}

}  // namespace

ApplicationSwitch::ApplicationSwitch(KAAListPlugin *plugin) : QObject(plugin), m_plugin(plugin)
{
    m_worker.setMaxThreadCount(1);
}

ApplicationSwitch::~ApplicationSwitch()
{
    m_worker.waitForDone();
}

void ApplicationSwitch::turn(bool on, const std::shared_ptr<KAApplication> &application,
                             const std::shared_ptr<KAAccount> &account, QWidget *window)
{
    if (!application || !account)
        return;
    m_orders.enqueue({on, application, account, window, isStored(*account), childUIDOf(*account, *application)});
    if (m_orders.size() == 1)
        startNext();
}

void ApplicationSwitch::startNext()
{
    m_worker.start([this, order = m_orders.head()] {
        const Outcome outcome = carryOut(order);
        QMetaObject::invokeMethod(
            this, [this, order, outcome] { finish(order, outcome); }, Qt::QueuedConnection);
    });
}

/// Worker thread.
ApplicationSwitch::Outcome ApplicationSwitch::carryOut(const Order &order) const
{
    // Another process may have turned on another application meanwhile.
    (void)CSKavellAccountLoadData(order.account->accountRef());
    KADataPlugin *const dataPlugin = dataPluginOf(*order.application);
    if (!dataPlugin)
        return {childUIDOf(*order.account, *order.application),
                {},
                text("SWITCH_NO_PLUGIN").arg(order.application->displayName())};
    return order.on ? turnOn(order, dataPlugin) : turnOff(order, dataPlugin);
}

ApplicationSwitch::Outcome ApplicationSwitch::turnOn(const Order &order, KADataPlugin *dataPlugin) const
{
    const QString name = order.application->displayName();
    QString uid = childUIDOf(*order.account, *order.application);
    KAError error;
    if (!uid.isNull() && dataPlugin->accountUIDs().contains(uid)) {
        dataPlugin->activateAccountUID(uid);
    } else {
        // There was none, or the user has deleted it in the application.
        SetupDriver driver(dataPlugin, name);
        uid = driver.makeAccount(applicationInput(*order.application, *order.account), &error);
    }
    if (uid.isEmpty()) {
        const QString reason = error.isNull() ? text("SWITCH_NO_ANSWER").arg(name) : error.description();
        return {{}, {}, text("SWITCH_ON_FAILED").arg(name, reason)};
    }
    const QVariantMap settings = dataPlugin->settingsForAccountUID(uid);
    const bool isOff = isInactive(settings);
    return {uid, settings, isOff ? text("SWITCH_ON_FAILED").arg(name, text("SWITCH_STILL_OFF")) : QString()};
}

ApplicationSwitch::Outcome ApplicationSwitch::turnOff(const Order &order, KADataPlugin *dataPlugin) const
{
    QString uid = childUIDOf(*order.account, *order.application);
    if (uid.isNull())
        uid = order.childUID;  // an account that is removed meanwhile knows its child no more
    if (uid.isNull() || !dataPlugin->accountUIDs().contains(uid))
        return {uid, {}, {}};
    dataPlugin->deactivateAccountUID(uid);
    const QVariantMap settings = dataPlugin->settingsForAccountUID(uid);
    const QString name = order.application->displayName();
    return {uid, settings, isInactive(settings) ? QString() : text("SWITCH_OFF_FAILED").arg(name)};
}

void ApplicationSwitch::finish(const Order &order, const Outcome &outcome)
{
    const bool isRemoved = order.wasStored && !isStored(*order.account);
    if (isRemoved && order.on && !outcome.childUID.isNull()) {
        turnOffAgain(order, outcome.childUID);
        return;
    }
    if (!isRemoved) {
        remember(order, outcome);
        if (!outcome.problem.isNull())
            showProblem(order.window, outcome.problem);
    }
    end(order);
}

/// The online account went while its child was being made; the child must not stay on without it.
void ApplicationSwitch::turnOffAgain(const Order &order, const QString &childUID)
{
    m_worker.start([this, order, childUID] {
        dataPluginOf(*order.application)->deactivateAccountUID(childUID);
        QMetaObject::invokeMethod(
            this, [this, order] { end(order); }, Qt::QueuedConnection);
    });
}

/// Tells that the order is carried out, and starts the next.
void ApplicationSwitch::end(const Order &order)
{
    m_orders.dequeue();
    if (!m_orders.isEmpty())
        startNext();
    KANotificationCenter::shared().post(KAChangedAccountsNotification,
                                        QVariant::fromValue(QList<std::shared_ptr<KAAccount>>{order.account}),
                                        {{QStringLiteral("plugin"), QVariant::fromValue(m_plugin)}});
}

/// Stores the child's settings in the online account, or forgets a child that the application does not have. Where the
/// account has nothing new to store it is not saved either: whether the child is inactive, the application alone keeps.
void ApplicationSwitch::remember(const Order &order, const Outcome &outcome) const
{
    if (outcome.childUID.isNull() || (outcome.settings.isEmpty() && order.on))
        return;
    KAAccount &account = *order.account;
    const QVariantMap child = KAAccount::childDictionaryWithSettings(outcome.settings, outcome.childUID,
                                                                     order.application->associatedPluginID());
    if (outcome.settings.isEmpty()) {
        account.removeChildAccountWithUID(outcome.childUID);
    } else if (account.childAccountWithUID(outcome.childUID) != child) {
        account.addChildAccountDict(child, outcome.childUID);
    } else {
        announce(account);
        return;
    }
    _CSKavellAccountCommitChanges(account.accountRef());
}

void ApplicationSwitch::showProblem(QWidget *window, const QString &sentence) const
{
    if (!window) {
        qWarning("%s", qUtf8Printable(sentence));
        return;
    }
    auto *const box = new QMessageBox(window);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->setIcon(QMessageBox::Warning);
    box->setWindowTitle(m_plugin->brandName());
    box->setTextFormat(Qt::PlainText);
    box->setText(sentence);
    box->setDefaultButton(box->addButton(text("OK"), QMessageBox::AcceptRole));
    box->open();  // returns at once, unlike exec
}

QString ApplicationSwitch::text(const char *key) const
{
    return m_plugin->bundle()->localizedString(QLatin1String(key));
}
