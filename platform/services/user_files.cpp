// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/user_files.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

#include "platform/home_directory.h"

namespace kavell {

namespace {

std::string dataDirectory()
{
    // A relative path there is to be ignored, as the base directory rules say.
    const char *data = secure_getenv("XDG_DATA_HOME");
    return data && data[0] == '/' ? std::string(data) : homeDirectory() + "/.local/share";
}

}  // namespace

std::string credentialDirectory()
{
    return dataDirectory() + "/kavell-accounts";
}

bool makeCredentialDirectory()
{
    const std::string path = credentialDirectory() + "/";
    createDirectoriesAbove(path.c_str());
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

FileLock::FileLock(const std::string &name, const Deadline &deadline)
{
    if (!makeCredentialDirectory())
        return;
    const std::string path = credentialDirectory() + "/" + name;
    m_file = openFile(path.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW, 0600);
    if (!m_file)
        return;
    int error = 0;
    const bool taken = waitUntil(deadline, [&] {
        error = flock(m_file.get(), LOCK_EX | LOCK_NB) == 0 ? 0 : errno;
        return error != EWOULDBLOCK && error != EINTR;
    });
    m_state = !taken ? State::timedOut : error == 0 ? State::held : State::failed;
}

FileLock::~FileLock()
{
    // Explicitly: a child that the host forks meanwhile has the file open too, and would keep the lock.
    if (m_state == State::held)
        flock(m_file.get(), LOCK_UN);
}

StoredFile readWholeFile(const std::string &path, size_t most)
{
    // Not blocking: what stands there may be a pipe.
    const FileDescriptor file = openFile(path.c_str(), O_RDONLY | O_NONBLOCK);
    if (!file)
        return {errno == ENOENT ? StoredFile::State::absent : StoredFile::State::failed, {}};
    struct stat status {};
    if (fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode) || static_cast<size_t>(status.st_size) > most)
        return {};
    StoredFile contents{StoredFile::State::read, std::string(static_cast<size_t>(status.st_size), '\0')};
    size_t done = 0;
    while (done < contents.bytes.size()) {
        const ssize_t count = ::read(file.get(), contents.bytes.data() + done, contents.bytes.size() - done);
        if (count < 0 && errno == EINTR)
            continue;
        if (count <= 0)
            return {};
        done += static_cast<size_t>(count);
    }
    return contents;
}

bool replaceFile(const std::string &name, std::string_view bytes)
{
    const std::string directory = credentialDirectory();
    const std::string path = directory + "/" + name;
    const std::string fresh = path + ".new";
    // A leftover of a process that was killed here; the lock's holder is its only user.
    ::unlink(fresh.c_str());
    const FileDescriptor file = openFile(fresh.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW, 0600);
    if (!file)
        return false;
    if (!writeWhole(file.get(), bytes) || withoutInterruption([&] { return fsync(file.get()); }) != 0 ||
        std::rename(fresh.c_str(), path.c_str()) != 0) {
        ::unlink(fresh.c_str());
        return false;
    }
    // The new file stands either way; a directory that cannot be synced only weakens what a power cut leaves.
    static_cast<void>(syncDirectoryOf(path.c_str()));
    return true;
}

}  // namespace kavell
