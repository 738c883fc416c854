// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/faults/system_calls.h"

#include <array>
#include <cerrno>
#include <cstdarg>
#include <cstdint>
#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/sem.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace kavell::test {

namespace {

constinit thread_local SystemCallObserver *observing = nullptr;

/// What the observer itself calls is not observed.
class Pause {
public:
    Pause() : m_observer(observing) { observing = nullptr; }
    ~Pause() { observing = m_observer; }
    Pause(const Pause &) = delete;
    Pause &operator=(const Pause &) = delete;

    [[nodiscard]] SystemCallObserver *observer() const { return m_observer; }

private:
    SystemCallObserver *m_observer;
};

template <typename Make> long observed(SystemCall call, Make &&make)
{
    if (!observing)
        return make(call);
    const Pause pause;
    return pause.observer()->onCall(call, [&] { return static_cast<long>(make(call)); });
}

template <typename... Arguments> auto kernel(long number, Arguments... arguments)
{
    return [=](const SystemCall &) {
        return syscall(number, arguments...);
    };
}

/// The C library's function of a name that is defined here.
template <typename Function> Function *libraryFunction(const char *name)
{
    return reinterpret_cast<Function *>(dlsym(RTLD_NEXT, name));
}

}  // namespace

std::string_view nameOf(CallKind kind)
{
    static constexpr std::array<std::string_view, 25> kNames = {
        "open",    "read",     "write",  "ftruncate", "fallocate", "fsync",   "fdatasync", "stat",  "access",
        "chmod",   "futimens", "flock",  "rename",    "link",      "unlink",  "mkdir",     "rmdir", "opendir",
        "readdir", "ftok",     "semget", "semop",     "socket",    "connect", "send"};
    return kNames[static_cast<size_t>(kind)];
}

Observation::Observation(SystemCallObserver &observer)
{
    observing = &observer;
}

Observation::~Observation()
{
    observing = nullptr;
}

}  // namespace kavell::test

using namespace kavell::test;

extern "C" {

int openat(int directory, const char *path, int flags, ...)
{
    mode_t mode = 0;
    if ((flags & O_CREAT) != 0) {
        va_list arguments;
        va_start(arguments, flags);
        mode = va_arg(arguments, mode_t);
        va_end(arguments);
    }
    return static_cast<int>(observed({.kind = CallKind::Open, .descriptor = directory, .path = path, .flags = flags},
                                     kernel(SYS_openat, directory, path, flags, mode)));
}

int open(const char *path, int flags, ...)
{
    mode_t mode = 0;
    if ((flags & O_CREAT) != 0) {
        va_list arguments;
        va_start(arguments, flags);
        mode = va_arg(arguments, mode_t);
        va_end(arguments);
    }
    return static_cast<int>(observed({.kind = CallKind::Open, .path = path, .flags = flags},
                                     kernel(SYS_openat, AT_FDCWD, path, flags, mode)));
}

ssize_t read(int descriptor, void *bytes, size_t length)
{
    return observed({.kind = CallKind::Read, .descriptor = descriptor, .length = length},
                    [=](const SystemCall &call) { return syscall(SYS_read, descriptor, bytes, call.length); });
}

ssize_t pread(int descriptor, void *bytes, size_t length, off_t offset)
{
    return observed(
        {.kind = CallKind::Read, .descriptor = descriptor, .length = length, .offset = offset},
        [=](const SystemCall &call) { return syscall(SYS_pread64, descriptor, bytes, call.length, offset); });
}

ssize_t write(int descriptor, const void *bytes, size_t length)
{
    return observed({.kind = CallKind::Write,
                     .descriptor = descriptor,
                     .bytes = static_cast<const char *>(bytes),
                     .length = length},
                    [=](const SystemCall &call) { return syscall(SYS_write, descriptor, bytes, call.length); });
}

ssize_t pwrite(int descriptor, const void *bytes, size_t length, off_t offset)
{
    return observed(
        {.kind = CallKind::Write,
         .descriptor = descriptor,
         .bytes = static_cast<const char *>(bytes),
         .length = length,
         .offset = offset},
        [=](const SystemCall &call) { return syscall(SYS_pwrite64, descriptor, bytes, call.length, offset); });
}

int ftruncate(int descriptor, off_t size) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Truncate, .descriptor = descriptor, .offset = size},
                                     kernel(SYS_ftruncate, descriptor, size)));
}

int fallocate(int descriptor, int mode, off_t offset, off_t length)
{
    return static_cast<int>(observed({.kind = CallKind::Reserve, .descriptor = descriptor},
                                     kernel(SYS_fallocate, descriptor, mode, offset, length)));
}

int fsync(int descriptor)
{
    return static_cast<int>(
        observed({.kind = CallKind::SyncFile, .descriptor = descriptor}, kernel(SYS_fsync, descriptor)));
}

int fdatasync(int descriptor)
{
    return static_cast<int>(
        observed({.kind = CallKind::SyncData, .descriptor = descriptor}, kernel(SYS_fdatasync, descriptor)));
}

int stat(const char *path, struct stat *status) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::Status, .path = path}, kernel(SYS_newfstatat, AT_FDCWD, path, status, 0)));
}

int lstat(const char *path, struct stat *status) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Status, .path = path},
                                     kernel(SYS_newfstatat, AT_FDCWD, path, status, AT_SYMLINK_NOFOLLOW)));
}

int fstatat(int directory, const char *path, struct stat *status, int flags) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Status, .descriptor = directory, .path = path},
                                     kernel(SYS_newfstatat, directory, path, status, flags)));
}

int fstat(int descriptor, struct stat *status) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::Status, .descriptor = descriptor}, kernel(SYS_fstat, descriptor, status)));
}

int access(const char *path, int mode) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::Access, .path = path}, kernel(SYS_faccessat, AT_FDCWD, path, mode)));
}

int faccessat(int directory, const char *path, int mode, int flags) noexcept
{
    // The kernel's call of this name has no flags, and the code under test has none for it.
    return static_cast<int>(observed({.kind = CallKind::Access, .descriptor = directory, .path = path, .flags = flags},
                                     kernel(SYS_faccessat, directory, path, mode)));
}

int chmod(const char *path, mode_t mode) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::ChangeMode, .path = path, .mode = mode},
                                     kernel(SYS_fchmodat, AT_FDCWD, path, mode)));
}

int fchmod(int descriptor, mode_t mode) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::ChangeMode, .descriptor = descriptor, .mode = mode},
                                     kernel(SYS_fchmod, descriptor, mode)));
}

int futimens(int descriptor, const struct timespec times[2]) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::SetTimes, .descriptor = descriptor},
                                     kernel(SYS_utimensat, descriptor, static_cast<const char *>(nullptr), times, 0)));
}

int flock(int descriptor, int operation) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Lock, .descriptor = descriptor, .flags = operation},
                                     kernel(SYS_flock, descriptor, operation)));
}

int rename(const char *path, const char *newPath) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Rename, .path = path, .newPath = newPath},
                                     kernel(SYS_renameat2, AT_FDCWD, path, AT_FDCWD, newPath, 0)));
}

int renameat2(int directory, const char *path, int newDirectory, const char *newPath, unsigned flags) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::Rename, .path = path, .newPath = newPath, .flags = static_cast<int>(flags)},
                 kernel(SYS_renameat2, directory, path, newDirectory, newPath, flags)));
}

int link(const char *path, const char *newPath) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::Link, .path = path, .newPath = newPath},
                                     kernel(SYS_linkat, AT_FDCWD, path, AT_FDCWD, newPath, 0)));
}

int unlink(const char *path) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::Unlink, .path = path}, kernel(SYS_unlinkat, AT_FDCWD, path, 0)));
}

int mkdir(const char *path, mode_t mode) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::MakeDirectory, .path = path, .mode = mode},
                                     kernel(SYS_mkdirat, AT_FDCWD, path, mode)));
}

int rmdir(const char *path) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::RemoveDirectory, .path = path},
                                     kernel(SYS_unlinkat, AT_FDCWD, path, AT_REMOVEDIR)));
}

int semget(key_t key, int count, int flags) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::GetSemaphore, .flags = flags}, kernel(SYS_semget, key, count, flags)));
}

int semop(int set, struct sembuf *operations, size_t count) noexcept
{
    return static_cast<int>(
        observed({.kind = CallKind::OperateSemaphore, .descriptor = set, .change = operations->sem_op},
                 kernel(SYS_semop, set, operations, count)));
}

int socket(int domain, int type, int protocol) noexcept
{
    return static_cast<int>(observed({.kind = CallKind::MakeSocket}, kernel(SYS_socket, domain, type, protocol)));
}

int connect(int descriptor, const struct sockaddr *address, socklen_t length)
{
    return static_cast<int>(observed({.kind = CallKind::Connect, .descriptor = descriptor},
                                     kernel(SYS_connect, descriptor, address, length)));
}

ssize_t send(int descriptor, const void *bytes, size_t length, int flags)
{
    return observed({.kind = CallKind::Send, .descriptor = descriptor},
                    kernel(SYS_sendto, descriptor, bytes, length, flags, static_cast<const void *>(nullptr), 0));
}

key_t ftok(const char *path, int project) noexcept
{
    static const auto real = libraryFunction<key_t(const char *, int)>("ftok");
    return static_cast<key_t>(
        observed({.kind = CallKind::MakeKey, .path = path}, [=](const SystemCall &) { return real(path, project); }));
}

DIR *opendir(const char *path)
{
    static const auto real = libraryFunction<DIR *(const char *)>("opendir");
    const long result = observed({.kind = CallKind::OpenDirectory, .path = path},
                                 [=](const SystemCall &) { return reinterpret_cast<intptr_t>(real(path)); });
    return result == -1 ? nullptr : reinterpret_cast<DIR *>(result);
}

struct dirent *readdir(DIR *directory)
{
    static const auto real = libraryFunction<dirent *(DIR *)>("readdir");
    const long result = observed({.kind = CallKind::ReadDirectory},
                                 [=](const SystemCall &) { return reinterpret_cast<intptr_t>(real(directory)); });
    return result == -1 ? nullptr : reinterpret_cast<dirent *>(result);
}

// The names that code built for large files calls; the same calls on 64-bit systems.
static_assert(sizeof(off_t) == 8);
int open64(const char *path, int flags, ...) __attribute__((alias("open")));
int openat64(int directory, const char *path, int flags, ...) __attribute__((alias("openat")));
ssize_t pread64(int descriptor, void *bytes, size_t length, off_t offset) __attribute__((alias("pread")));
ssize_t pwrite64(int descriptor, const void *bytes, size_t length, off_t offset) __attribute__((alias("pwrite")));
int ftruncate64(int descriptor, off_t size) noexcept __attribute__((alias("ftruncate")));
}
