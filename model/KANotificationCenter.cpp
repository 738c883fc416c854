// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KANotificationCenter.h>

#include <algorithm>
#include <mutex>
#include <utility>
#include <vector>

struct KANotificationCenter::State {
    struct Entry {
        QString name;  ///< null: every name
        Observer call;
    };

    std::mutex mutex;
    std::vector<std::shared_ptr<Entry>> entries;
};

KANotificationCenter &KANotificationCenter::shared()
{
    static auto *const center = new KANotificationCenter;  // outlives every static object that may still post
    return *center;
}

KANotificationCenter::KANotificationCenter() : m_state(std::make_shared<State>())
{
}

KANotificationCenter::~KANotificationCenter() = default;

KANotificationCenter::Observation KANotificationCenter::addObserver(const QString &name, Observer observer)
{
    const auto entry = std::make_shared<State::Entry>(State::Entry{name, std::move(observer)});
    {
        const std::lock_guard lock(m_state->mutex);
        m_state->entries.push_back(entry);
    }
    return {entry.get(), [weak = std::weak_ptr(m_state), entry](void *) {
                if (const auto state = weak.lock()) {
                    const std::lock_guard lock(state->mutex);
                    std::erase(state->entries, entry);
                }
            }};
}

void KANotificationCenter::post(const QString &name, const QVariant &object, const QVariantMap &userInformation)
{
    std::vector<std::shared_ptr<State::Entry>> called;
    {
        const std::lock_guard lock(m_state->mutex);
        std::copy_if(m_state->entries.begin(), m_state->entries.end(), std::back_inserter(called),
                     [&](const auto &entry) { return entry->name.isNull() || entry->name == name; });
    }
    const KANotification notification{name, object, userInformation};
    for (const auto &entry : called)
        entry->call(notification);
}
