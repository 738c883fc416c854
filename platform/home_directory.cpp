// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/home_directory.h"

#include <array>
#include <cerrno>
#include <cstdlib>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace kavell {

namespace {

std::string withoutClosingSlash(std::string path)
{
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    return path;
}

/// An environment variable that holds an absolute path; empty otherwise. A program with raised privileges does not let
/// its caller say where its files are.
std::string absolutePathVariable(const char *name)
{
    const char *value = secure_getenv(name);
    return value && value[0] == '/' ? withoutClosingSlash(value) : std::string();
}

/// Whether the path is a directory, not a link, that only this user may enter.
bool isPrivateDirectory(const std::string &path)
{
    struct stat status;
    if (lstat(path.c_str(), &status) != 0)
        return false;
    errno = EPERM;
    return S_ISDIR(status.st_mode) && status.st_uid == geteuid() && (status.st_mode & 077) == 0;
}

}  // namespace

std::string homeDirectory()
{
    std::string home = absolutePathVariable("HOME");
    if (!home.empty())
        return home;
    passwd entry{};
    passwd *found = nullptr;
    std::array<char, 16384> buffer;
    if (getpwuid_r(geteuid(), &entry, buffer.data(), buffer.size(), &found) == 0 && found && found->pw_dir[0] == '/')
        return withoutClosingSlash(found->pw_dir);
    return "/";
}

std::string runtimeDirectory()
{
    std::string directory = absolutePathVariable("XDG_RUNTIME_DIR");
    if (!directory.empty() && isPrivateDirectory(directory))
        return directory;
    directory = "/run/user/" + std::to_string(geteuid());
    if (isPrivateDirectory(directory))
        return directory;
    directory = "/tmp/kavell-accounts-" + std::to_string(geteuid());
    mkdir(directory.c_str(), 0700);
    return isPrivateDirectory(directory) ? directory : std::string();
}

}  // namespace kavell
