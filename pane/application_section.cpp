// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/application_section.h"

#include <algorithm>
#include <chrono>
#include <exception>

#include <QtWidgets/QApplication>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>

#include "pane/account_records.h"
#include "pane/application_details.h"
#include "pane/provider_looks.h"

namespace kavell::pane {

namespace {

// A plug-in that asks a server and the user takes its time; one that takes longer is stuck.
constexpr std::chrono::seconds kPluginsTime{60};
constexpr std::chrono::seconds kLookAgain{1};
constexpr int kFrame = 2;  // around the rows

}  // namespace

ApplicationSection::ApplicationSection(QWidget *parent)
    : QWidget(parent), m_layout(new QVBoxLayout(this)), m_explanation(new QLabel)
{
    m_layout->setContentsMargins({});
    m_explanation->setObjectName(QStringLiteral("noApplications"));
    m_explanation->setWordWrap(true);
    m_layout->addWidget(m_explanation);
    m_deadline.setInterval(kLookAgain);
    connect(&m_deadline, &QTimer::timeout, this, &ApplicationSection::giveUp);
    m_observation = KANotificationCenter::shared().addObserver(
        KAChangedAccountsNotification,
        [section = QPointer<ApplicationSection>(this)](const KANotification &notification) {
            // Posted on whichever thread the plug-in works.
            const auto changed = notification.object.value<QList<std::shared_ptr<KAAccount>>>();
            QMetaObject::invokeMethod(
                qApp,
                [section, changed] {
                    if (section)
                        section->pluginIsDone(changed);
                },
                Qt::QueuedConnection);
        });
}

ApplicationSection::~ApplicationSection()
{
    // The table tells this object, and its view is a child that it deletes itself.
    m_table.reset();
}

void ApplicationSection::showAccount(const std::shared_ptr<KAAccount> &account,
                                     const std::shared_ptr<KAAccount> &pluginsAccount, KAAListPlugin *plugin)
{
    // Not KAAccount::isEqual, for which one user's accounts at the maker's two mail domains are the same.
    const bool isAnother = !m_account || !(nameOf(*account) == nameOf(*m_account)) || m_plugin != plugin;
    if (isAnother) {
        m_expected.clear();
        m_deadline.stop();
        m_table.reset();
    }
    m_account = account;
    m_plugin = plugin;
    if (isAnother && plugin)
        showTable();
    else if (m_table)
        m_table->setAccount(account);
    m_explanation->setText(plugin ? qtTrId("NO_APPLICATIONS") : qtTrId("NO_PLUGIN"));
    m_explanation->setHidden(m_table && !m_table->apps().isEmpty());
    settle();
    // What the plug-in has under way goes on with one record: an account's children are saved together, so that of two
    // records the later save would undo the earlier one.
    if (m_expected.isEmpty())
        m_pluginsAccount = pluginsAccount;
}

void ApplicationSection::showTable()
{
    m_table = KAAppTableController::initWithAccount(m_account, m_plugin);
    m_table->setDelegate(this);
    if (QWidget *const view = m_table->view()) {
        view->setHidden(m_table->apps().isEmpty());
        // The page scrolls as a whole, so the table does not.
        if (const auto row = m_table->rowViewForRow(0))
            view->setFixedHeight(row->sizeHint().height() * m_table->numberOfRows() + kFrame);
        m_layout->insertWidget(0, view);
    }
}

bool ApplicationSection::appToggle(const std::shared_ptr<KAApplication> &application)
{
    return setEnabled(application->enabled(), application);
}

bool ApplicationSection::setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application)
{
    if (!m_plugin || !m_pluginsAccount)
        return false;
    try {
        m_plugin->setAccount(m_pluginsAccount);
        m_plugin->setEnabled(enabled, application, m_pluginsAccount, window());
    } catch (const std::exception &error) {
        if (m_table)
            m_table->stopProgressForApp(application);
        emit failed(pluginFailure(*m_plugin, error));
        return false;
    }
    m_expected.insert(application->bundleID(), {application, enabled, QDeadlineTimer(kPluginsTime), false});
    m_deadline.start();
    if (m_table && enabled)
        m_table->startProgressForApp(application);
    return true;
}

void ApplicationSection::settle()
{
    for (auto expected = m_expected.begin(); expected != m_expected.end();) {
        if (!expected->isOver && m_account->enabledForApplication(expected.key()) != expected->isEnabled) {
            ++expected;
            continue;
        }
        if (m_table)
            m_table->stopProgressForApp(expected->application);
        expected = m_expected.erase(expected);
    }
    if (m_expected.isEmpty())
        m_deadline.stop();
    if (m_table)
        m_table->updateTable();
}

void ApplicationSection::pluginIsDone(const QList<std::shared_ptr<KAAccount>> &accounts)
{
    const bool isThisOne = m_account && std::any_of(accounts.begin(), accounts.end(), [this](const auto &account) {
                               return account && nameOf(*account) == nameOf(*m_account);
                           });
    // Which of several it has done, it does not say; each of them shows in the account, or ends with its time.
    if (!isThisOne || m_expected.size() != 1)
        return;
    m_expected.begin()->isOver = true;
    emit changed();
}

void ApplicationSection::giveUp()
{
    for (auto expected = m_expected.begin(); expected != m_expected.end();) {
        if (!expected->deadline.hasExpired()) {
            ++expected;
            continue;
        }
        if (m_table)
            m_table->stopProgressForApp(expected->application);
        const QString name = expected->application->displayNameForData();
        emit failed((expected->isEnabled ? qtTrId("NOT_SWITCHED_ON") : qtTrId("NOT_SWITCHED_OFF")).arg(name));
        expected = m_expected.erase(expected);
    }
    settle();
}

void ApplicationSection::showInfoForApp(const std::shared_ptr<KAApplication> &application)
{
    if (m_account && m_plugin)
        showApplicationDetails(window(), *m_account, *m_plugin, application);
}

}  // namespace kavell::pane
