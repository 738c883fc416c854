// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/change_watch.h"

#include <QtCore/QDir>
#include <QtCore/QSocketNotifier>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/KAConstants.h>

#include "pane/account_records.h"

namespace kavell::pane {

namespace {

QStringList without(QStringList paths, const QStringList &others)
{
    paths.removeIf([&](const QString &path) { return others.contains(path); });
    return paths;
}

}  // namespace

ChangeWatch::ChangeWatch(QObject *parent) : QObject(parent)
{
    observe(kCSKavellAccountNotificationSender);
    const QByteArray reset = KADidResetDataNotification.toUtf8();
    observe(adopt(CSKavellStringCreateWithUTF8(reset.constData())).get());
    connect(&m_directories, &QFileSystemWatcher::directoryChanged, this, [this] {
        watchDirectories();
        emit changed();
    });
}

ChangeWatch::~ChangeWatch() = default;

void ChangeWatch::watchDirectories()
{
    const QString top = accountsDirectory();
    QStringList wanted;
    // The nearest directory that exists tells of the next one below it.
    for (QString path = top; path.size() >= QDir::homePath().size(); path.truncate(path.lastIndexOf(u'/'))) {
        if (QDir(path).exists()) {
            wanted += path;
            break;
        }
    }
    const QStringList types = QDir(top).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    for (const QString &type : types)
        wanted += top + u'/' + type;
    const QStringList watched = m_directories.directories();
    const QStringList missing = without(wanted, watched);
    if (!missing.isEmpty())
        m_directories.addPaths(missing);
    // A directory farther up has done its duty; in the home directory things change all the time.
    const QStringList superfluous = without(watched, wanted);
    if (!superfluous.isEmpty())
        m_directories.removePaths(superfluous);
}

void ChangeWatch::observe(CSKavellStringRef name)
{
    auto observer = adopt(CSKavellNotificationObserverCreate(name));
    if (!observer)
        return;  // no runtime directory to meet in; the directories are watched all the same
    auto arrival = std::make_unique<QSocketNotifier>(CSKavellNotificationObserverGetFileDescriptor(observer.get()),
                                                     QSocketNotifier::Read);
    connect(arrival.get(), &QSocketNotifier::activated, this, [this, raw = observer.get()] { receive(raw); });
    m_observations.push_back({std::move(observer), std::move(arrival)});
}

void ChangeWatch::receive(CSKavellNotificationObserverRef observer)
{
    bool hasArrived = false;
    while (const auto notification = adopt(CSKavellNotificationObserverCopyNext(observer)))
        hasArrived = true;
    if (hasArrived)
        emit changed();
}

}  // namespace kavell::pane
