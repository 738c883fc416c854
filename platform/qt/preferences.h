// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One domain of the user's preferences: keys and values that all processes of the user share through one property-list
// file, DOMAIN.plist below the user's configuration directory. Values are read from memory; only synchronize touches
// the disk. It writes key by key: what this process set goes over what the file holds by then, so that processes which
// set different keys both keep theirs, and of two that set the same key the later one wins.
//
// Any thread may call. Values set are not in the file before the next synchronize.

#ifndef KAVELL_PLATFORM_QT_PREFERENCES_H
#define KAVELL_PLATFORM_QT_PREFERENCES_H

#include <chrono>
#include <map>
#include <mutex>
#include <string>

#include <QtCore/QString>
#include <QtCore/QVariant>
#include <QtCore/QVariantMap>

#include "platform/qt/preferences_file.h"

namespace kavell {

class Preferences {
public:
    /// How long synchronize waits for another writer.
    static constexpr std::chrono::milliseconds kLongestWait{10000};

    /// Reads nothing yet. The domain becomes the file's name and has no "/".
    explicit Preferences(const QString &domain, std::chrono::milliseconds longestWait = kLongestWait);

    /// The value of a key; invalid when there is none. In the form in which it was or will be read from the file.
    [[nodiscard]] QVariant objectForKey(const QString &key) const;

    /// Sets a value, or removes the key for one that stands for nothing. A value that a property list cannot hold is
    /// refused with one line in the log, and the key keeps its value.
    void setObject(const QVariant &object, const QString &key);

    /// Writes what was set since the last time, if anything was, and reads what others wrote, if the file has changed.
    /// Blocks on the disk, and on another writer for a bounded time. False, with one line in the log, when it could
    /// not; what was set is then kept for the next time. A file that is no property list counts as empty and is set
    /// aside before it is replaced, with one line in the log each.
    bool synchronize();

private:
    /// The objects set here and not in the file yet; none for a key to be removed.
    using Changes = std::map<QString, Ref<CSKavellTypeRef>>;

    bool readIfChanged(const std::string &path);
    bool merge(const std::string &path);
    bool write(const std::string &path, PreferencesContents contents, const Changes &changes);
    void install(const std::string &path, const PreferencesContents &contents, const Changes &written);

    const std::string m_domain;
    const std::chrono::milliseconds m_longestWait;

    /// Held from looking at the file to installing what was found, so that nothing older is installed over it. Taken
    /// before m_mutex, after the writers' lock; never while another process is waited for.
    std::mutex m_diskMutex;
    std::string m_path;  ///< of the file that was read last; under m_diskMutex, as is m_stamp
    PreferencesStamp m_stamp;

    mutable std::mutex m_mutex;
    QVariantMap m_values;  ///< what the file held, with m_changes over it
    Changes m_changes;
};

}  // namespace kavell

#endif
