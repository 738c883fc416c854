// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/preferences.h"

#include <cerrno>
#include <cstring>

#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellPropertyList.h>

#include "platform/qt/log.h"
#include "platform/qt/value_conversion.h"

namespace kavell {

namespace {

void logFailure(const char *what, const std::string &path, const char *why)
{
    log(QStringLiteral("Cannot ") + QString::fromUtf8(what) + QStringLiteral(" the preferences file ") +
        QString::fromStdString(path) + QStringLiteral(": ") + QString::fromUtf8(why));
}

void logFailure(const char *what, const std::string &path, int error)
{
    logFailure(what, path, std::strerror(error));
}

void apply(CSKavellMutableDictionaryRef values, const QString &key, CSKavellTypeRef object)
{
    const auto storeKey = toStoreString(key);
    if (object)
        CSKavellDictionarySetValue(values, storeKey.get(), object);
    else
        CSKavellDictionaryRemoveValue(values, storeKey.get());
}

void apply(QVariantMap &values, const QString &key, CSKavellTypeRef object)
{
    if (object)
        values.insert(key, toVariant(object));
    else
        values.remove(key);
}

}  // namespace

Preferences::Preferences(const QString &domain, std::chrono::milliseconds longestWait)
    : m_domain(domain.toStdString()), m_longestWait(longestWait)
{
}

QVariant Preferences::objectForKey(const QString &key) const
{
    if (key.isNull())
        return {};
    const std::lock_guard lock(m_mutex);
    return m_values.value(key);
}

void Preferences::setObject(const QVariant &object, const QString &key)
{
    const auto entry = toStoreEntry(object, key);
    if (!entry || !entry->key)
        return;
    const std::lock_guard lock(m_mutex);
    m_changes.insert_or_assign(key, entry->object);
    apply(m_values, key, entry->object.get());
}

bool Preferences::synchronize()
{
    const std::string path = preferencesPath(m_domain);
    const bool hasChanges = [this] {
        const std::lock_guard lock(m_mutex);
        return !m_changes.empty();
    }();
    return hasChanges ? merge(path) : readIfChanged(path);
}

bool Preferences::readIfChanged(const std::string &path)
{
    const std::lock_guard lock(m_diskMutex);
    const auto stamp = preferencesStamp(path);
    if (stamp && *stamp == m_stamp && path == m_path)
        return true;
    const auto contents = stamp ? readPreferencesFile(path) : std::nullopt;
    if (!contents) {
        logFailure("read", path, errno);
        return false;
    }
    if (contents->isDamaged)
        log(QStringLiteral("The preferences file ") + QString::fromStdString(path) +
            QStringLiteral(" is damaged and counts as empty"));
    install(path, *contents, {});
    return true;
}

bool Preferences::merge(const std::string &path)
{
    const PreferencesLock writers(path, m_longestWait);
    if (writers.error() != 0) {
        logFailure("lock", path, writers.error());
        return false;
    }
    const std::lock_guard lock(m_diskMutex);
    auto contents = readPreferencesFile(path);
    if (!contents) {
        logFailure("read", path, errno);
        return false;
    }
    Changes changes;
    {
        const std::lock_guard valuesLock(m_mutex);
        changes = m_changes;
    }
    return write(path, std::move(*contents), changes);
}

bool Preferences::write(const std::string &path, PreferencesContents contents, const Changes &changes)
{
    for (const auto &[key, object] : changes)
        apply(contents.values.get(), key, object.get());
    const auto xml = adopt(CSKavellPropertyListCopyXML(contents.values.get()));
    if (!xml) {
        // Each value passed when it was set, so that it is what they come to with the file's.
        logFailure("write", path, "the values are together more than could be read again");
        return false;
    }
    if (contents.isDamaged) {
        const std::string aside = setDamagedFileAside(path);
        if (aside.empty()) {
            logFailure("set aside", path, errno);
            return false;
        }
        log(QStringLiteral("Kept a damaged preferences file as ") + QString::fromStdString(aside));
    }
    const std::string_view bytes(reinterpret_cast<const char *>(CSKavellDataGetBytes(xml.get())),
                                 CSKavellDataGetLength(xml.get()));
    const auto stamp = replacePreferencesFile(path, bytes);
    if (!stamp) {
        logFailure("write", path, errno);
        return false;
    }
    contents.stamp = *stamp;
    install(path, contents, changes);
    return true;
}

/// Makes the file's contents the values. What was set again since it was written is still a change over them.
void Preferences::install(const std::string &path, const PreferencesContents &contents, const Changes &written)
{
    m_path = path;
    m_stamp = contents.stamp;
    QVariantMap values = toVariantMap(contents.values.get());
    const std::lock_guard lock(m_mutex);
    for (const auto &[key, object] : written) {
        const auto change = m_changes.find(key);
        if (change != m_changes.end() && change->second.get() == object.get())
            m_changes.erase(change);
    }
    for (const auto &[key, object] : m_changes)
        apply(values, key, object.get());
    m_values = std::move(values);
}

}  // namespace kavell
