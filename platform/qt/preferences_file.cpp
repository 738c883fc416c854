// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/preferences_file.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>

#include <kavellaccounts/CSKavellPropertyList.h>

#include "platform/home_directory.h"
#include "platform/property_list_guard.h"

namespace kavell {

namespace {

/// A hidden file beside the preferences file.
std::string hiddenSibling(const std::string &path, const char *suffix)
{
    const size_t name = path.rfind('/') + 1;
    return path.substr(0, name) + "." + path.substr(name) + suffix;
}

PreferencesStamp stampOf(const struct stat &status)
{
    return {status.st_dev, status.st_ino, status.st_size, status.st_mtim.tv_sec, status.st_mtim.tv_nsec};
}

/// Gives the file a modification time of its own: the kernel's is as coarse as its tick on many systems, and inode
/// numbers come back, so that two replacements within one tick could be taken for one.
bool stampFile(int file) noexcept
{
    std::array<timespec, 2> times{};
    times[0].tv_nsec = UTIME_OMIT;
    return clock_gettime(CLOCK_REALTIME, &times[1]) == 0 && futimens(file, times.data()) == 0;
}

/// Takes the lock of an open file, waiting until the deadline: 0, or the error.
int lockUntil(int file, std::chrono::steady_clock::time_point deadline)
{
    auto pause = std::chrono::microseconds(100);
    while (flock(file, LOCK_EX | LOCK_NB) != 0) {
        if (errno != EWOULDBLOCK && errno != EINTR)
            return errno;
        if (std::chrono::steady_clock::now() >= deadline)
            return ETIMEDOUT;
        std::this_thread::sleep_for(pause);
        pause = std::min(pause * 2, std::chrono::microseconds(5000));
    }
    return 0;
}

}  // namespace

std::string preferencesPath(const std::string &domain)
{
    // A relative path in the variable is to be ignored, as the base directory rules say.
    const char *configured = secure_getenv("XDG_CONFIG_HOME");
    const std::string directory =
        configured && configured[0] == '/' ? std::string(configured) : homeDirectory() + "/.config";
    return directory + "/" + domain + ".plist";
}

PreferencesLock::PreferencesLock(const std::string &path, std::chrono::milliseconds bound)
{
    const auto deadline = std::chrono::steady_clock::now() + bound;
    createDirectoriesAbove(path.c_str());
    m_file = openFile(hiddenSibling(path, ".lock").c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_NONBLOCK, 0600);
    m_error = m_file ? lockUntil(m_file.get(), deadline) : errno;
}

PreferencesLock::~PreferencesLock()
{
    // Explicitly: a child that the host forks meanwhile has the file open too, and would keep the lock.
    if (m_file && m_error == 0)
        flock(m_file.get(), LOCK_UN);
}

std::optional<PreferencesStamp> preferencesStamp(const std::string &path)
{
    struct stat status;
    if (stat(path.c_str(), &status) == 0)
        return stampOf(status);
    return errno == ENOENT || errno == ENOTDIR ? std::optional(PreferencesStamp{}) : std::nullopt;
}

std::optional<PreferencesContents> readPreferencesFile(const std::string &path)
{
    PreferencesContents contents;
    contents.values = adopt(CSKavellDictionaryCreateMutable());
    // Not blocking: what stands there may be a pipe.
    const FileDescriptor file = openFile(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY);
    if (!file)
        return errno == ENOENT || errno == ENOTDIR ? std::optional(contents) : std::nullopt;
    struct stat status;
    if (fstat(file.get(), &status) != 0)
        return std::nullopt;
    errno = EINVAL;
    FileContents bytes;
    if (!S_ISREG(status.st_mode) || !bytes.read(file.get(), kLargestPropertyList))
        return std::nullopt;
    contents.stamp = stampOf(status);
    const auto found = adopt(CSKavellPropertyListCreateDictionary(bytes.view().data(), bytes.view().size()));
    contents.isDamaged = !found;
    if (found)
        contents.values = adopt(CSKavellDictionaryCreateMutableCopy(found.get()));
    return contents;
}

std::string setDamagedFileAside(const std::string &path)
{
    const time_t now = time(nullptr);
    tm parts{};
    std::array<char, 32> when{};
    gmtime_r(&now, &parts);
    std::strftime(when.data(), when.size(), "%Y%m%dT%H%M%SZ", &parts);
    const std::string base = path + ".damaged-" + when.data();
    std::string aside = base;
    for (int number = 2; access(aside.c_str(), F_OK) == 0; ++number)
        aside = base + "-" + std::to_string(number);
    // Before another file takes the name: a power cut that keeps only the later change would lose the damaged one.
    return std::rename(path.c_str(), aside.c_str()) == 0 && syncDirectoryOf(aside.c_str()) ? aside : std::string();
}

std::optional<PreferencesStamp> replacePreferencesFile(const std::string &path, std::string_view xml)
{
    const std::string fresh = hiddenSibling(path, ".new");
    // A leftover of a process that was killed here; the lock's holder is its only user.
    unlink(fresh.c_str());
    const FileDescriptor file = openFile(fresh.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW, 0600);
    if (!file)
        return std::nullopt;
    struct stat status;
    if (writeWhole(file.get(), xml) && stampFile(file.get()) && fstat(file.get(), &status) == 0 &&
        withoutInterruption([&] { return fsync(file.get()); }) == 0 && std::rename(fresh.c_str(), path.c_str()) == 0) {
        // The new file stands either way; a directory that cannot be synced only weakens what a power cut leaves.
        static_cast<void>(syncDirectoryOf(path.c_str()));
        return stampOf(status);
    }
    const int error = errno;
    unlink(fresh.c_str());
    errno = error;
    return std::nullopt;
}

}  // namespace kavell
