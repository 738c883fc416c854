// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/files.h"

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

#include "tools/failure.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr size_t largestInput = size_t{256} << 20;

[[noreturn]] void failToWrite(const std::string &path, int error)
{
    throw Failure(ExitCode::Failed, "cannot write " + inQuotes(path) + ": " + std::strerror(error));
}

/// Whether everything was written; the reason is in errno.
bool writeAll(int descriptor, std::string_view contents)
{
    while (!contents.empty()) {
        const ssize_t written = write(descriptor, contents.data(), contents.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written < 0)
            return false;
        contents.remove_prefix(static_cast<size_t>(written));
    }
    return true;
}

void writeInPlace(const std::string &path, std::string_view contents)
{
    const FileDescriptor file(open(path.c_str(), O_WRONLY | O_CLOEXEC));
    if (file.get() < 0 || !writeAll(file.get(), contents))
        failToWrite(path, errno);
}

}  // namespace

FileDescriptor::~FileDescriptor()
{
    if (m_descriptor > STDERR_FILENO)
        close(m_descriptor);
}

bool lockWithinBound(int descriptor, int operation)
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (flock(descriptor, operation | LOCK_NB) != 0) {
        if ((errno != EWOULDBLOCK && errno != EINTR) || std::chrono::steady_clock::now() > deadline)
            return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
}

std::string readInputFile(const std::string &path)
{
    const FileDescriptor file(path == "-" ? STDIN_FILENO : open(path.c_str(), O_RDONLY | O_CLOEXEC));
    const std::string name = path == "-" ? "standard input" : inQuotes(path);
    if (file.get() < 0)
        refuse("cannot open " + name + ": " + std::strerror(errno));
    std::string contents;
    std::string buffer(65536, '\0');
    ssize_t count;
    while ((count = read(file.get(), buffer.data(), buffer.size())) != 0) {
        if (count < 0 && errno == EINTR)
            continue;
        if (count < 0)
            refuse("cannot read " + name + ": " + std::strerror(errno));
        contents.append(buffer, 0, static_cast<size_t>(count));
        if (contents.size() > largestInput)
            refuse(name + " has more than 256 MiB");
    }
    return contents;
}

void writeOutputFile(const std::string &path, std::string_view contents)
{
    struct stat status;
    if (stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode))
        return writeInPlace(path, contents);
    std::string temporary = path + ".XXXXXX";
    const FileDescriptor file(mkostemp(temporary.data(), O_CLOEXEC));
    if (file.get() < 0)
        failToWrite(path, errno);
    if (writeAll(file.get(), contents) && fsync(file.get()) == 0 && rename(temporary.c_str(), path.c_str()) == 0)
        return;
    const int error = errno;
    unlink(temporary.c_str());
    failToWrite(path, error);
}

QuietStandardError::QuietStandardError() : m_saved(-1)
{
    std::fflush(stderr);
    const FileDescriptor nothing(open("/dev/null", O_WRONLY | O_CLOEXEC));
    m_saved = fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
    if (nothing.get() >= 0 && m_saved >= 0)
        dup2(nothing.get(), STDERR_FILENO);
}

QuietStandardError::~QuietStandardError()
{
    std::fflush(stderr);
    if (m_saved < 0)
        return;
    dup2(m_saved, STDERR_FILENO);
    close(m_saved);
}

}  // namespace kavell::tools
