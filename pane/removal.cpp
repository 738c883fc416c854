// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/removal.h"

#include <chrono>
#include <exception>

#include <QtCore/QLocale>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/question.h"
#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

constexpr std::chrono::milliseconds kBetweenLooks{100};
constexpr int kLooks = 150;  // 15 seconds in all

QStringList applicationsOf(const KAAccount &account)
{
    return account.enabledApplications(false).value_or(QStringList());
}

QString namesOf(const QStringList &bundleIDs)
{
    QStringList names;
    for (const QString &bundleID : bundleIDs) {
        const auto application = KAPluginManager::shared()->applicationWithBundleID(bundleID);
        names += application ? application->displayName() : bundleID;
    }
    return QLocale().createSeparatedList(names);
}

}  // namespace

Removal::Removal(const std::shared_ptr<KAAccount> &account, KAAListPlugin *plugin, Undertakings &undertakings,
                 QWidget *window)
    : QObject(window), m_account(account), m_plugin(plugin), m_undertakings(undertakings), m_window(window),
      m_name(nameOf(*account))
{
    m_again.setInterval(kBetweenLooks);
    connect(&m_again, &QTimer::timeout, this, &Removal::look);
}

Removal::~Removal() = default;

void Removal::begin()
{
    const QStringList applications = applicationsOf(*m_account);
    const QString details = applications.isEmpty() ? qtTrId("REMOVE_DETAILS")
                                                   : qtTrId("REMOVE_DETAILS_APPLICATIONS").arg(namesOf(applications));
    ask(
        m_window, qtTrId("REMOVE_QUESTION").arg(m_name.loginName), details, qtTrId("REMOVE_NOW"), this,
        [this] { openForPlugin(); }, [this] { deleteLater(); });
}

void Removal::openForPlugin()
{
    // Opened anew: the answer may have taken long, and the plug-in works on a record that nobody reads meanwhile.
    m_undertakings.start<std::shared_ptr<KAAccount>>(
        qtTrId("REMOVING_ACCOUNT").arg(m_name.loginName), this,
        [name = m_name](const CancelFlag &) { return openAccount(name); },
        [this](const std::shared_ptr<KAAccount> *account) {
            if (account && *account)
                switchApplicationsOff(*account);
            else
                deleteLater();  // the user stopped, or another program was faster
        });
}

void Removal::switchApplicationsOff(const std::shared_ptr<KAAccount> &account)
{
    const QStringList applications = applicationsOf(*account);
    if (!m_plugin || applications.isEmpty()) {
        remove();
        return;
    }
    for (const QString &bundleID : applications) {
        const auto application = KAPluginManager::shared()->applicationWithBundleID(bundleID);
        if (!application)
            continue;
        try {
            m_plugin->setAccount(account);
            m_plugin->setEnabled(false, application, account, m_window);
        } catch (const std::exception &) {
            // The application keeps the account; the question below says so.
        }
    }
    m_looksLeft = kLooks;
    m_again.start();
}

void Removal::look()
{
    m_again.stop();
    m_undertakings.start<QStringList>(
        qtTrId("SWITCHING_APPLICATIONS_OFF"), this,
        [name = m_name](const CancelFlag &) {
            const std::shared_ptr<KAAccount> account = openAccount(name);
            return account ? applicationsOf(*account) : QStringList();
        },
        [this](const QStringList *left) {
            if (!left)
                deleteLater();  // the user stopped: the account stays
            else if (left->isEmpty())
                remove();
            else if (--m_looksLeft > 0)
                m_again.start();
            else
                askWhetherToGoOn(*left);
        });
}

void Removal::askWhetherToGoOn(const QStringList &left)
{
    ask(
        m_window, qtTrId("REMOVE_ANYWAY_QUESTION").arg(m_name.loginName),
        qtTrId("REMOVE_ANYWAY_DETAILS").arg(namesOf(left)), qtTrId("REMOVE_ANYWAY"), this, [this] { remove(); },
        [this] { deleteLater(); });
}

void Removal::remove()
{
    m_undertakings.start<ChangeResult>(
        qtTrId("REMOVING_ACCOUNT").arg(m_name.loginName), this,
        [name = m_name](const CancelFlag &isCancelled) { return removeAccount(name, isCancelled); },
        [this](const ChangeResult *result) {
            if (result && *result == ChangeResult::NotSaved)
                emit failed(qtTrId("NOT_REMOVED").arg(m_name.loginName));
            else if (result && *result == ChangeResult::PasswordLeft)
                emit failed(qtTrId("PASSWORD_LEFT").arg(m_name.loginName));
            deleteLater();
        });
}

}  // namespace kavell::pane
