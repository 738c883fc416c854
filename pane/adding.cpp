// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/adding.h"

#include <algorithm>
#include <exception>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/account_registry.h"
#include "pane/provider_chooser.h"
#include "pane/undertakings.h"

namespace kavell::pane {

Adding::Adding(AccountRegistry &registry, Undertakings &undertakings, QWidget *window)
    : QObject(window), m_registry(registry), m_undertakings(undertakings), m_window(window),
      m_observation(KANotificationCenter::shared().addObserver(
          KACreatedAccountsNotification, [this](const KANotification &notification) { receive(notification); }))
{
}

Adding::~Adding() = default;

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
        emit failed(qtTrId("PLUGIN_FAILED").arg(plugin->userVisibleProviderName(), QString::fromUtf8(error.what())));
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
        save(account, {summary.name, plugin, applications, m_registry.summaryOf(summary.name) != nullptr,
                       likelyDuplicates(summary, m_registry.groups())});
    }
}

void Adding::save(const std::shared_ptr<KAAccount> &account, AddedAccount added)
{
    m_undertakings.start<ChangeResult>(
        qtTrId("SAVING_ACCOUNT").arg(added.name.loginName), this,
        [account](const CancelFlag &) {
            return account->hasPendingChanges() ? saveAccount(account) : ChangeResult::Saved;
        },
        [this, added = std::move(added)](const ChangeResult *result) {
            if (result && *result == ChangeResult::Saved)
                emit this->added(added);
            else if (result)
                emit failed(qtTrId("NOT_SAVED").arg(added.name.loginName));
        });
}

}  // namespace kavell::pane
