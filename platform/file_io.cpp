// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/file_io.h"

#include <algorithm>
#include <fcntl.h>
#include <mutex>
#include <new>
#include <sys/stat.h>

namespace kavell {

FileDescriptor openFile(const char *path, int flags, mode_t mode, int directory) noexcept
{
    return FileDescriptor(withoutInterruption([&] { return openat(directory, path, flags | O_CLOEXEC, mode); }));
}

bool writeWhole(int descriptor, std::string_view bytes, off_t offset) noexcept
{
    while (!bytes.empty()) {
        const ssize_t written =
            withoutInterruption([&] { return pwrite(descriptor, bytes.data(), bytes.size(), offset); });
        if (written <= 0)
            return false;
        bytes.remove_prefix(static_cast<size_t>(written));
        offset += written;
    }
    return true;
}

namespace {

ssize_t readAt(int descriptor, char *bytes, size_t length, size_t offset) noexcept
{
    return withoutInterruption([&] { return pread(descriptor, bytes, length, static_cast<off_t>(offset)); });
}

/// Whether a read that came short certainly ended where the file ends, which has this size. Others end at the border of a
/// sector.
bool isEnd(size_t length, off_t size) noexcept
{
    constexpr size_t kSector = 512;
    return length == static_cast<size_t>(size) && length % kSector != 0;
}

}  // namespace

bool FileContents::read(int descriptor, size_t limit, off_t size)
{
    m_large.clear();
    m_smallLength = 0;
    // Else only a read of nothing has seen the end: one that comes short may have met a bad place of the disk.
    while (m_smallLength < m_small.size() && !isEnd(m_smallLength, size)) {
        const ssize_t count =
            readAt(descriptor, m_small.data() + m_smallLength, m_small.size() - m_smallLength, m_smallLength);
        if (count <= 0)
            return count == 0;
        m_smallLength += static_cast<size_t>(count);
    }
    return m_smallLength < m_small.size() || readLarge(descriptor, limit);
}

/// Goes on where m_small is full.
bool FileContents::readLarge(int descriptor, size_t limit)
{
    m_large.assign(m_small.data(), m_small.size());
    for (size_t length = m_large.size(); length <= limit;) {
        m_large.resize(length * 2);
        const ssize_t count = readAt(descriptor, m_large.data() + length, length, length);
        m_large.resize(length + static_cast<size_t>(std::max<ssize_t>(count, 0)));
        if (count <= 0)
            return count == 0;
        length = m_large.size();
    }
    return true;
}

void FileContents::assign(std::string_view bytes)
{
    m_large.assign(bytes);
    m_smallLength = 0;
}

namespace {

/// The directories whose names, all the way from the root, this process has made sure are on the disk: the last few.
class DurableDirectories {
public:
    [[nodiscard]] bool contains(const struct stat &status)
    {
        const std::lock_guard lock(m_mutex);
        return std::find(m_directories.begin(), m_directories.end(), Directory{status.st_dev, status.st_ino}) !=
               m_directories.end();
    }

    void add(const struct stat &status)
    {
        const std::lock_guard lock(m_mutex);
        m_directories[m_next++ % m_directories.size()] = {status.st_dev, status.st_ino};
    }

private:
    using Directory = std::pair<dev_t, ino_t>;

    std::mutex m_mutex;
    std::array<Directory, 8> m_directories{};
    size_t m_next = 0;
};

constinit DurableDirectories durableDirectories;

/// Makes the directory unless it stands. False when its name is not certain to be on the disk.
bool makeDirectory(const std::string &path) noexcept
{
    struct stat status;
    const bool stands = stat(path.c_str(), &status) == 0;
    // What the system or another user made is theirs to see to.
    if (stands && status.st_uid != geteuid())
        return true;
    const bool isMade = !stands && mkdir(path.c_str(), 0700) == 0;
    // The process's file mode mask may have taken bits away.
    if (isMade)
        chmod(path.c_str(), 0700);
    // Also where it stood already: whoever made it may have died before this. Not every directory may be opened, though.
    return syncDirectoryOf(path.c_str()) || !isMade || errno == EACCES;
}

}  // namespace

bool createDirectoriesAbove(const char *path) noexcept
try {
    const std::string_view view(path);
    const std::string directory(view.substr(0, view.rfind('/') + 1));
    struct stat status;
    if (stat(directory.c_str(), &status) == 0 && durableDirectories.contains(status))
        return true;
    bool isDurable = true;
    for (size_t slash = view.find('/', 1); slash != std::string_view::npos; slash = view.find('/', slash + 1))
        isDurable = makeDirectory(std::string(view.substr(0, slash))) && isDurable;
    if (isDurable && stat(directory.c_str(), &status) == 0)
        durableDirectories.add(status);
    return isDurable;
} catch (const std::bad_alloc &) {
    return false;
}

bool syncDirectoryOf(const char *path) noexcept
{
    const std::string_view view(path);
    const size_t slash = view.rfind('/');
    const std::string directory(slash == std::string_view::npos ? "." : view.substr(0, std::max<size_t>(slash, 1)));
    const FileDescriptor descriptor = openFile(directory.c_str(), O_RDONLY | O_DIRECTORY);
    return descriptor && withoutInterruption([&] { return fsync(descriptor.get()); }) == 0;
}

}  // namespace kavell
