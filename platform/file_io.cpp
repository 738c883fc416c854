// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/file_io.h"

#include <algorithm>
#include <fcntl.h>

namespace kavell {

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

}  // namespace

bool FileContents::read(int descriptor, size_t limit)
{
    m_large.clear();
    const ssize_t first = readAt(descriptor, m_small.data(), m_small.size(), 0);
    if (first < 0)
        return false;
    m_smallLength = static_cast<size_t>(first);
    // A read of a regular file that leaves room has seen its end.
    if (m_smallLength < m_small.size())
        return true;
    m_large.assign(m_small.data(), m_small.size());
    for (size_t length = m_large.size(); length <= limit;) {
        m_large.resize(length * 2);
        const ssize_t count = readAt(descriptor, m_large.data() + length, length, length);
        if (count < 0)
            return false;
        const bool isEnd = static_cast<size_t>(count) < length;
        length += static_cast<size_t>(count);
        m_large.resize(length);
        if (isEnd)
            break;
    }
    return true;
}

void FileContents::assign(std::string_view bytes)
{
    m_large.assign(bytes);
    m_smallLength = 0;
}

bool syncDirectoryOf(const char *path) noexcept
{
    const std::string_view view(path);
    const size_t slash = view.rfind('/');
    const std::string directory(slash == std::string_view::npos ? "." : view.substr(0, std::max<size_t>(slash, 1)));
    const FileDescriptor descriptor(open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    return descriptor && withoutInterruption([&] { return fsync(descriptor.get()); }) == 0;
}

}  // namespace kavell
