// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Owned descriptors and whole reads and writes. Used by platform/; any thread may call.

#ifndef KAVELL_PLATFORM_FILE_IO_H
#define KAVELL_PLATFORM_FILE_IO_H

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <unistd.h>
#include <utility>

namespace kavell {

/// Owns a descriptor, or none (-1).
class FileDescriptor {
public:
    FileDescriptor() noexcept = default;
    explicit FileDescriptor(int descriptor) noexcept : m_descriptor(descriptor) {}
    FileDescriptor(FileDescriptor &&other) noexcept : m_descriptor(std::exchange(other.m_descriptor, -1)) {}
    FileDescriptor &operator=(FileDescriptor &&other) noexcept
    {
        std::swap(m_descriptor, other.m_descriptor);
        return *this;
    }
    ~FileDescriptor()
    {
        if (m_descriptor >= 0)
            close(m_descriptor);
    }

    [[nodiscard]] int get() const noexcept { return m_descriptor; }
    explicit operator bool() const noexcept { return m_descriptor >= 0; }

private:
    int m_descriptor = -1;
};

/// Repeats a system call that a signal interrupted.
template <typename Call> auto withoutInterruption(Call &&call) noexcept
{
    auto result = call();
    while (result < 0 && errno == EINTR)
        result = call();
    return result;
}

/// Opens a file that the programs which this one starts do not get; none, with errno, when that fails. A relative path is
/// looked up from the directory.
[[nodiscard]] FileDescriptor openFile(const char *path, int flags, mode_t mode = 0, int directory = AT_FDCWD) noexcept;

/// Writes all bytes at an offset; false, with errno, when that fails part way.
[[nodiscard]] bool writeWhole(int descriptor, std::string_view bytes, off_t offset = 0) noexcept;

/// The contents of a file in memory. A small file, as nearly all are, takes no memory from the heap.
class FileContents {
public:
    /// Reads from the start to the end of the file; false, with errno, on failure. Of a file longer than `limit` it
    /// reads just more than that. With the size that the file had just before, it can do with fewer system calls.
    [[nodiscard]] bool read(int descriptor, size_t limit, off_t size = 0);

    void assign(std::string_view bytes);

    [[nodiscard]] std::string_view view() const noexcept
    {
        return m_large.empty() ? std::string_view(m_small.data(), m_smallLength) : std::string_view(m_large);
    }

private:
    [[nodiscard]] bool readLarge(int descriptor, size_t limit);

    std::array<char, 8192> m_small;
    size_t m_smallLength = 0;
    std::string m_large;  ///< instead of m_small, when it is not empty
};

/// Creates each missing directory above the path, with permissions 0700, and makes sure once in a process that their
/// names are on the disk; false when one was made whose name may not be. That one could not be made at all shows when a file
/// is made there.
bool createDirectoriesAbove(const char *path) noexcept;

/// Makes names created, renamed and deleted in the directory of a path durable.
[[nodiscard]] bool syncDirectoryOf(const char *path) noexcept;

}  // namespace kavell

#endif
