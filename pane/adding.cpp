// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/adding.h"

#include <algorithm>
#include <exception>

#include <QtCore/QCoreApplication>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/account_registry.h"
#include "pane/provider_chooser.h"
#include "pane/provider_looks.h"
#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

constexpr int kLongestShown = 60;  // characters of a name that cannot be an account's

QString shortened(const QString &name)
{
    return name.size() > kLongestShown ? name.left(kLongestShown) + QChar(0x2026) : name;
}

}  // namespace

Adding::Adding(AccountRegistry &registry, Undertakings &undertakings, QWidget *window)
    : QObject(window), m_registry(registry), m_undertakings(undertakings), m_window(window),
      m_observation(KANotificationCenter::shared().addObserver(KACreatedAccountsNotification, forward()))
{
}

Adding::~Adding() = default;

KANotificationCenter::Observer Adding::forward()
{
    // A plug-in may post on a thread of its own, and while this object goes.
    return [adding = QPointer<Adding>(this)](const KANotification &notification) {
        QMetaObject::invokeMethod(QCoreApplication::instance(), [adding, notification] {
            if (adding)
                adding->receive(notification);
        });
    };
}

void Adding::begin()
{
    m_undertakings.start<QList<KAAListPlugin *>>(
        qtTrId("LOOKING_FOR_PLUGINS"), this, [](const CancelFlag &) { return accountListPlugins(); },
        [this](const QList<KAAListPlugin *> *plugins) {
            if (plugins)
                chooseAmong(*plugins);
        });
}

void Adding::chooseAmong(const QList<KAAListPlugin *> &plugins)
{
    auto *const chooser = new ProviderChooser(plugins, m_window);
    connect(chooser, &ProviderChooser::chosen, this, &Adding::showSheet);
    chooser->open();
}

void Adding::showSheet(KAAListPlugin *plugin)
{
    try {
        plugin->createAccountInWindow(m_window);
    } catch (const std::exception &error) {
        emit failed(pluginFailure(*plugin, error));
    }
}

void Adding::receive(const KANotification &notification)
{
    const auto accounts = notification.object.value<QList<std::shared_ptr<KAAccount>>>();
    const auto applications = notification.userInformation.value(QStringLiteral("selectedApps"))
                                  .value<QList<std::shared_ptr<KAApplication>>>();
    auto *const plugin = notification.userInformation.value(QStringLiteral("plugin")).value<KAAListPlugin *>();
    for (const std::shared_ptr<KAAccount> &account : accounts) {
        if (!account)
            continue;
        const AccountSummary summary = summaryOf(*account);
        if (!canBeStored(summary.name)) {
            emit failed(qtTrId("NAME_NOT_POSSIBLE").arg(shortened(summary.name.loginName)));
            continue;
        }
        save(account, {summary.name, plugin, applications, m_registry.summaryOf(summary.name) != nullptr,
                       likelyDuplicates(summary, m_registry.groups())});
    }
}

void Adding::save(const std::shared_ptr<KAAccount> &account, AddedAccount added)
{
    m_undertakings.start<ChangeResult>(
        qtTrId("SAVING_ACCOUNT").arg(added.name.loginName), this,
        [account](const CancelFlag &isCancelled) {
            if (!account->hasPendingChanges())
                return ChangeResult::Saved;
            return *isCancelled ? ChangeResult::Cancelled : saveAccount(account);
        },
        [this, added = std::move(added)](const ChangeResult *result) {
            if (result && *result == ChangeResult::Saved)
                emit this->added(added);
            else if (result)
                emit failed(qtTrId("NOT_SAVED").arg(added.name.loginName));
            else
                emit failed(qtTrId("NOT_ADDED").arg(added.name.loginName));
        });
}

}  // namespace kavell::pane
