// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/damaged_copy.h"

#include <algorithm>
#include <array>
#include <ctime>
#include <fcntl.h>
#include <linux/fs.h>
#include <string>
#include <sys/ioctl.h>
#include <sys/stat.h>

#include "platform/data_file.h"
#include "platform/file_io.h"

namespace kavell {

namespace {

constexpr int kMostCopiesASecond = 100;

bool copyExtent(int from, int to, off_t start, off_t end) noexcept
{
    std::array<char, 65536> buffer;
    while (start < end) {
        const auto wanted = static_cast<size_t>(std::min<off_t>(end - start, buffer.size()));
        const ssize_t count = withoutInterruption([&] { return pread(from, buffer.data(), wanted, start); });
        if (count < 0 || !writeWhole(to, {buffer.data(), static_cast<size_t>(std::max<ssize_t>(count, 0))}, start))
            return false;
        if (count == 0)
            return true;
        start += count;
    }
    return true;
}

/// Copies the data between holes only: a huge file is most often an empty one.
bool copyContents(int from, int to, off_t size) noexcept
{
    if (ioctl(to, FICLONE, from) == 0)
        return true;
    for (off_t start = 0; start < size;) {
        const off_t data = lseek(from, start, SEEK_DATA);
        if (data < 0 && errno == ENXIO)
            break;
        const off_t first = data < 0 ? start : data;
        const off_t hole = data < 0 ? size : lseek(from, first, SEEK_HOLE);
        const off_t end = hole < 0 ? size : std::min(hole, size);
        if (!copyExtent(from, to, first, end))
            return false;
        start = end;
    }
    return withoutInterruption([&] { return ftruncate(to, size); }) == 0;
}

/// A name that is not taken yet, and the file of that name.
FileDescriptor createCopy(const char *path, std::string &copyPath)
{
    const time_t now = time(nullptr);
    tm parts{};
    std::array<char, 32> when{};
    gmtime_r(&now, &parts);
    std::strftime(when.data(), when.size(), "-%Y%m%dT%H%M%SZ", &parts);
    const std::string base = siblingPath(path, kDamagedCopyPrefix) + when.data();
    for (int number = 1; number <= kMostCopiesASecond; ++number) {
        copyPath = number == 1 ? base : base + "-" + std::to_string(number);
        FileDescriptor copy = openFile(copyPath.c_str(), O_WRONLY | O_CREAT | O_EXCL, 0600);
        if (copy || errno != EEXIST)
            return copy;
    }
    return FileDescriptor();
}

}  // namespace

bool keepDamagedCopy(int file, const char *path)
{
    struct stat status;
    std::string copyPath;
    if (fstat(file, &status) != 0)
        return false;
    const FileDescriptor copy = createCopy(path, copyPath);
    if (!copy)
        return false;
    if (copyContents(file, copy.get(), status.st_size) && withoutInterruption([&] { return fsync(copy.get()); }) == 0 &&
        syncDirectoryOf(path))
        return true;
    unlink(copyPath.c_str());
    return false;
}

}  // namespace kavell
