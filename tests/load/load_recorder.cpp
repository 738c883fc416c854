// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/load/load_recorder.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <optional>
#include <string_view>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/sibling_path.h"
#include "tests/support/redo_records.h"

namespace kavell::test {

namespace {

constexpr std::string_view kSuffix = ".plist";

std::optional<size_t> thisWorker;

/// The account whose data file has the path, also after it was deleted.
std::optional<size_t> accountOfPath(std::string_view path)
{
    constexpr std::string_view kPrefix = "account ";
    const size_t name = path.rfind('/') + 1;
    if (!thisWorker || !path.substr(name).starts_with(kPrefix) || path.find(kSuffix, name) == std::string_view::npos)
        return std::nullopt;
    return std::strtoul(path.data() + name + kPrefix.size(), nullptr, 10);
}

std::string pathOf(int file)
{
    std::array<char, 4096> path;
    const ssize_t length = readlink(("/proc/self/fd/" + std::to_string(file)).c_str(), path.data(), path.size() - 1);
    return {path.data(), length < 0 ? 0 : static_cast<size_t>(length)};
}

LoadValues valuesIn(int file)
{
    LoadValues values{};
    std::string contents(8192, '\0');
    const ssize_t length = pread(file, contents.data(), contents.size(), 0);
    contents.resize(length < 0 ? 0 : static_cast<size_t>(length));
    for (size_t worker = 0; worker < values.size(); ++worker) {
        const size_t key = contents.find("<key>" + loadKey(worker) + "</key>");
        const size_t number = key == std::string::npos ? key : contents.find("<integer>", key);
        if (number != std::string::npos)
            values[worker] =
                static_cast<uint32_t>(std::strtoul(contents.c_str() + number + std::strlen("<integer>"), nullptr, 10));
    }
    return values;
}

/// Whether a redo record stands there that is to be settled.
bool hasRedoRecord(std::string_view path)
{
    // The path of a file that was deleted is followed by a remark.
    const std::string_view dataFile = path.substr(0, path.rfind(kSuffix) + kSuffix.size());
    return isPendingRecordAt(siblingPath(dataFile, kRedoRecordPrefix));
}

/// What stands in an open file.
LoadEntry entryOf(int file)
{
    LoadEntry entry;
    struct stat status {};
    if (fstat(file, &status) == 0)
        entry.inode = status.st_ino;
    entry.values = valuesIn(file);
    return entry;
}

/// The same of a file that has the path; none when there is no such file.
std::optional<LoadEntry> entryAt(const char *path)
{
    const int file = open(path, O_RDONLY | O_CLOEXEC);
    if (file < 0)
        return std::nullopt;
    const LoadEntry entry = entryOf(file);
    close(file);
    return entry;
}

/// What an open file says, and whether a redo record stands beside it.
void recordHold(LoadEvent event, int file, const std::string &path, size_t account)
{
    LoadEntry entry = entryOf(file);
    entry.flag = hasRedoRecord(path);
    entry.isForReading = (fcntl(file, F_GETFL) & O_ACCMODE) == O_RDONLY;
    recordLoad(event, account, entry);
}

/// The data file whose flock this process has. It never has two.
struct {
    int file = -1;
    size_t account = 0;
    std::string path;
} held;

void recordTake(int file)
{
    std::string path = pathOf(file);
    const auto account = accountOfPath(path);
    if (!account)
        return;
    held = {file, *account, std::move(path)};
    recordHold(LoadEvent::Take, held.file, held.path, held.account);
}

/// Closing a file gives its flock back, too.
void recordRelease(int file)
{
    if (file < 0 || file != held.file)
        return;
    held.file = -1;
    recordHold(LoadEvent::Release, file, held.path, held.account);
}

template <typename Function> Function *systemFunction(const char *name)
{
    return reinterpret_cast<Function *>(dlsym(RTLD_NEXT, name));
}

}  // namespace

LoadLog &loadLog()
{
    static LoadLog *const log = mapLoadLog(std::getenv(kLoadLogVariable));
    if (!log)
        std::abort();
    return *log;
}

void setLoadWorker(size_t worker)
{
    thisWorker = worker;
}

void recordLoad(LoadEvent event, size_t account, LoadEntry entry)
{
    LoadLog &log = loadLog();
    const uint64_t number = log.count.fetch_add(1);
    if (number >= kMostLoadEntries)
        std::abort();
    LoadEntry &place = log.entries[number];
    entry.worker = static_cast<uint16_t>(*thisWorker);
    entry.account = static_cast<uint32_t>(account);
    entry.process = getpid();
    place = entry;
    // Last, for a process that is killed meanwhile.
    std::atomic_ref(place.event).store(event, std::memory_order_release);
}

}  // namespace kavell::test

using namespace kavell::test;

// The program's own definitions come before the C library's, for the shared library too.
extern "C" {

[[gnu::visibility("default")]] int flock(int file, int operation) noexcept
{
    static auto *const system = systemFunction<int(int, int)>("flock");
    if (operation == LOCK_UN)
        recordRelease(file);
    const int result = system(file, operation);
    const int error = errno;
    if (result == 0 && operation != LOCK_UN)
        recordTake(file);
    errno = error;
    return result;
}

[[gnu::visibility("default")]] int close(int file)
{
    static auto *const system = systemFunction<int(int)>("close");
    recordRelease(file);
    return system(file);
}

[[gnu::visibility("default")]] int stat(const char *path, struct stat *status) noexcept
{
    static auto *const system = systemFunction<int(const char *, struct stat *)>("stat");
    const auto account = accountOfPath(path);
    if (account)
        recordLoad(LoadEvent::Status, *account);
    const int result = system(path, status);
    const int error = errno;
    if (account && result != 0 && error == ENOENT)
        recordLoad(LoadEvent::Missing, *account);
    errno = error;
    return result;
}

[[gnu::visibility("default")]] int unlink(const char *path) noexcept
{
    static auto *const system = systemFunction<int(const char *)>("unlink");
    const auto account = accountOfPath(path);
    // Also where there is no file: one may come until the call is made.
    const LoadEntry removed = account ? entryAt(path).value_or(LoadEntry{}) : LoadEntry{};
    if (account)
        recordLoad(LoadEvent::Removing, *account, removed);
    const int result = system(path);
    const int error = errno;
    if (account && result == 0)
        recordLoad(LoadEvent::Removed, *account, removed);
    errno = error;
    return result;
}

[[gnu::visibility("default")]] int renameat2(int from, const char *oldPath, int to, const char *newPath,
                                             unsigned flags) noexcept
{
    static auto *const system = systemFunction<int(int, const char *, int, const char *, unsigned)>("renameat2");
    const auto account = accountOfPath(newPath);
    const auto created = account ? entryAt(oldPath) : std::nullopt;
    if (created)
        recordLoad(LoadEvent::Creating, *account, *created);
    const int result = system(from, oldPath, to, newPath, flags);
    const int error = errno;
    if (created && result == 0)
        recordLoad(LoadEvent::Created, *account, *created);
    errno = error;
    return result;
}
}
