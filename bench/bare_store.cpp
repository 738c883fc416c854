// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "bench/bare_store.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <plist/plist.h>

namespace kavell::bench {

namespace {

void require(bool holds, const char *what)
{
    if (holds)
        return;
    std::perror(what);
    std::abort();
}

void operate(int set, short change)
{
    sembuf operation{0, change, 0};
    require(semop(set, &operation, 1) == 0, "semop");
}

}  // namespace

BareSemaphore::BareSemaphore(const char *path) : m_set(semget(ftok(path, 0), 0, 0))
{
    if (m_set >= 0)
        return;
    m_set = semget(ftok(path, 0), 1, IPC_CREAT | 0600);
    require(m_set >= 0 && semctl(m_set, 0, SETVAL, 1) == 0, "semget");
}

void BareSemaphore::take() const
{
    operate(m_set, -1);
}

void BareSemaphore::give() const
{
    operate(m_set, +1);
}

std::string readFileBare(const char *path, const BareSemaphore &semaphore)
{
    struct stat status;
    require(stat(path, &status) == 0, "stat");
    std::string contents(static_cast<size_t>(status.st_size) + 1, '\0');
    semaphore.take();
    const int file = open(path, O_RDONLY | O_CLOEXEC);
    const ssize_t length = read(file, contents.data(), contents.size());
    close(file);
    semaphore.give();
    require(length >= 0, "read");
    contents.resize(static_cast<size_t>(length));
    return contents;
}

int readDirectoryBare(const std::string &directory)
{
    DIR *listing = opendir(directory.c_str());
    require(listing != nullptr, "opendir");
    int count = 0;
    while (const dirent *entry = readdir(listing)) {
        if (entry->d_type != DT_REG)
            continue;
        const std::string path = directory + "/" + entry->d_name;
        const BareSemaphore semaphore(path.c_str());
        const std::string contents = readFileBare(path.c_str(), semaphore);
        plist_t root = nullptr;
        plist_from_xml(contents.data(), static_cast<uint32_t>(contents.size()), &root);
        require(root != nullptr, "plist_from_xml");
        plist_free(root);
        ++count;
    }
    closedir(listing);
    return count;
}

/// What a record is cut off to when it is void.
constexpr off_t kVoidRecord = 16;

void replaceFileBare(const char *path, std::string_view contents, const BareSemaphore &semaphore)
{
    const std::string old = readFileBare(path, semaphore);
    const std::string directory = std::string(path).substr(0, std::string(path).rfind('/'));
    const std::string recordPath = directory + "/.bare-record";
    semaphore.take();
    const int file = open(path, O_RDWR | O_CLOEXEC);
    std::string record(contents.size() + old.size() + 40, 'r');
    const ssize_t oldLength = pread(file, record.data(), record.size(), 0);
    const int recordFile = open(recordPath.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    require(oldLength >= 0 && pwrite(recordFile, record.data(), record.size(), 0) > 0 && fdatasync(recordFile) == 0,
            "record");
    timespec times[2] = {{0, UTIME_OMIT}, {0, UTIME_NOW}};
    require(pwrite(file, contents.data(), contents.size(), 0) > 0 &&
                ftruncate(file, static_cast<off_t>(contents.size())) == 0 && fchmod(file, 0600) == 0 &&
                futimens(file, times) == 0 && fdatasync(file) == 0,
            "replace");
    require(ftruncate(recordFile, kVoidRecord) == 0, "void record");
    close(recordFile);
    close(file);
    struct stat status;
    require(stat(path, &status) == 0, "stat");
    semaphore.give();
}

void postBare(std::string_view message)
{
    const std::string directory = std::string(std::getenv("XDG_RUNTIME_DIR")) + "/kavell-accounts";
    DIR *listing = opendir(directory.c_str());
    if (!listing)
        return;
    while (const dirent *entry = readdir(listing)) {
        if (std::strncmp(entry->d_name, "observer-", 9) != 0)
            continue;
        const int connection = socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0);
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        std::snprintf(address.sun_path, sizeof address.sun_path, "/proc/self/fd/%d/%.64s", dirfd(listing),
                      entry->d_name);
        require(connect(connection, reinterpret_cast<sockaddr *>(&address), sizeof address) == 0 &&
                    send(connection, message.data(), message.size(), MSG_NOSIGNAL) > 0,
                "post");
        close(connection);
    }
    closedir(listing);
}

}  // namespace kavell::bench
