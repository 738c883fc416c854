// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/data_directory.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>

#include "platform/sibling_path.h"

namespace kavell {

namespace {

int64_t nanosecondsBetween(const timespec &from, const timespec &to) noexcept
{
    return (to.tv_sec - from.tv_sec) * 1'000'000'000 + (to.tv_nsec - from.tv_nsec);
}

bool isRegularFile(int directory, const dirent &entry) noexcept
{
    if (entry.d_type != DT_UNKNOWN)
        return entry.d_type == DT_REG;
    struct stat status;
    return fstatat(directory, entry.d_name, &status, AT_SYMLINK_NOFOLLOW) == 0 && S_ISREG(status.st_mode);
}

}  // namespace

bool wouldChangeTell(const timespec &changed, const timespec &now) noexcept
{
    return changed.tv_nsec != 0 && nanosecondsBetween(changed, now) > kLongestTick;
}

DataDirectory::DataDirectory(const char *path) : m_directory(opendir(path))
{
    if (!m_directory)
        return;
    // Before the listing, so that what comes meanwhile is later.
    noteTime();
    errno = 0;
    while (const dirent *entry = readdir(m_directory.get())) {
        add(*entry);
        errno = 0;
    }
    // A listing that broke off may lack the record of a file that it has.
    m_isTelling = m_isTelling && errno == 0;
}

void DataDirectory::noteTime() noexcept
{
    struct stat status;
    timespec now;
    if (fstat(descriptor(), &status) != 0 || clock_gettime(CLOCK_REALTIME_COARSE, &now) != 0)
        return;
    m_changed = status.st_ctim;
    m_isTelling = wouldChangeTell(m_changed, now);
}

void DataDirectory::add(const dirent &entry)
{
    const std::string_view name(entry.d_name);
    // No record's name ends like a data file's, but a login name may begin like a record's.
    if (!name.ends_with(kDataFileSuffix)) {
        if (name.starts_with(kRedoRecordPrefix))
            m_records.emplace(name);
    } else if (name.size() > kDataFileSuffix.size() && isRegularFile(descriptor(), entry)) {
        m_names.append(name).push_back('\0');
    }
}

bool DataDirectory::hadNoRecordOf(const char *name) const
{
    return m_isTelling && (m_records.empty() || !m_records.contains(siblingPath(name, kRedoRecordPrefix)));
}

bool DataDirectory::isAsListed() const noexcept
{
    struct stat status;
    return !m_isTelling || (fstat(descriptor(), &status) == 0 && nanosecondsBetween(m_changed, status.st_ctim) == 0);
}

}  // namespace kavell
