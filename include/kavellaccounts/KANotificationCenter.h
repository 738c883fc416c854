// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Notifications within this process: a name, an object that it is about, and user information. Observers are called on
// the thread that posts, in the order in which they were added, before the post returns. Any thread may post, add and
// remove; an observer removed while a post is under way may still be called by that post.

#ifndef KAVELLACCOUNTS_KANOTIFICATIONCENTER_H
#define KAVELLACCOUNTS_KANOTIFICATIONCENTER_H

#include <functional>
#include <memory>

#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAExport.h>

struct KANotification {
    QString name;
    QVariant object;
    QVariantMap userInformation;
};

class KAVELL_ACCOUNTS_EXPORT KANotificationCenter {
public:
    using Observer = std::function<void(const KANotification &)>;

    /// Ends the observation when it goes.
    using Observation = std::shared_ptr<void>;

    /// The process's own centre; lives for ever.
    [[nodiscard]] static KANotificationCenter &shared();

    KANotificationCenter();
    ~KANotificationCenter();
    KANotificationCenter(const KANotificationCenter &) = delete;
    KANotificationCenter &operator=(const KANotificationCenter &) = delete;

    /// Calls `observer` for each post of the name, or of every name for a null one, until the answer is dropped. The
    /// centre may go first.
    [[nodiscard]] Observation addObserver(const QString &name, Observer observer);

    /// An exception that an observer throws reaches the poster; the observers after it are not called.
    void post(const QString &name, const QVariant &object = {}, const QVariantMap &userInformation = {});

private:
    struct State;
    std::shared_ptr<State> m_state;
};

#endif
