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

bool readWhole(int descriptor, size_t expectedSize, size_t limit, std::string &contents)
{
    // One byte more than expected: a read that leaves room has seen the end of a regular file.
    contents.resize(std::min(std::max<size_t>(expectedSize, 4095), limit) + 1);
    for (size_t length = 0;;) {
        const ssize_t count = withoutInterruption([&] {
            return pread(descriptor, contents.data() + length, contents.size() - length, static_cast<off_t>(length));
        });
        if (count < 0)
            return false;
        length += static_cast<size_t>(count);
        if (length < contents.size() || length > limit) {
            contents.resize(length);
            return true;
        }
        contents.resize(std::min(contents.size() * 2, limit + 1));
    }
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
