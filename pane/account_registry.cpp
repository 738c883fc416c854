// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/account_registry.h"

#include <algorithm>
#include <chrono>

#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

// A save comes with several events, and programs save in bursts.
constexpr std::chrono::milliseconds kGathering{15};

}  // namespace

AccountRegistry::AccountRegistry(Undertakings &undertakings, QObject *parent)
    : QObject(parent), m_undertakings(undertakings)
{
    m_next.setSingleShot(true);
    m_next.setInterval(kGathering);
    connect(&m_next, &QTimer::timeout, this, &AccountRegistry::reload);
    connect(&m_watch, &ChangeWatch::changed, this, [this] {
        if (!m_next.isActive())
            m_next.start();
    });
}

AccountRegistry::~AccountRegistry() = default;

void AccountRegistry::reload()
{
    if (m_isReading) {
        m_hasChanged = true;
        return;
    }
    m_isReading = true;
    m_hasChanged = false;
    m_watch.watchDirectories();
    m_undertakings.start<QList<AccountGroup>>(
        qtTrId("READING_ACCOUNTS"), this, [](const CancelFlag &) { return readAccounts(); },
        [this](const QList<AccountGroup> *groups) {
            m_isReading = false;
            if (!groups) {
                emit notRead();
                return;
            }
            m_groups = *groups;
            emit read();
            if (m_hasChanged)
                reload();
        });
}

const AccountGroup *AccountRegistry::groupOf(const AccountName &name) const
{
    const auto found = std::find_if(m_groups.begin(), m_groups.end(),
                                    [&](const AccountGroup &group) { return group.providerType == name.providerType; });
    return found == m_groups.end() ? nullptr : &*found;
}

const AccountSummary *AccountRegistry::summaryOf(const AccountName &name) const
{
    const AccountGroup *const group = groupOf(name);
    if (!group)
        return nullptr;
    const auto found = std::find_if(group->accounts.begin(), group->accounts.end(),
                                    [&](const AccountSummary &account) { return account.name == name; });
    return found == group->accounts.end() ? nullptr : &*found;
}

}  // namespace kavell::pane
