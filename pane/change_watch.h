// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Tells when any program may have changed an account. Saves and resets are announced by the library; an account that is
// removed is not, so the directories are watched too. User-interface thread only.

#ifndef KAVELL_PANE_CHANGE_WATCH_H
#define KAVELL_PANE_CHANGE_WATCH_H

#include <memory>
#include <vector>

#include <QtCore/QFileSystemWatcher>
#include <QtCore/QObject>

#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/Ref.h>

class QSocketNotifier;

namespace kavell::pane {

class ChangeWatch : public QObject {
    Q_OBJECT

public:
    explicit ChangeWatch(QObject *parent = nullptr);
    ~ChangeWatch() override;

    /// Watches the directories that exist by now.
    void watchDirectories();

signals:
    /// At least one account may have changed; several changes can come as one.
    void changed();

private:
    void observe(CSKavellStringRef name);
    void receive(CSKavellNotificationObserverRef observer);

    struct Observation {
        Ref<CSKavellNotificationObserverRef> observer;
        std::unique_ptr<QSocketNotifier> arrival;
    };
    std::vector<Observation> m_observations;
    QFileSystemWatcher m_directories;
};

}  // namespace kavell::pane

#endif
