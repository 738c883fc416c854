// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/kernel_keyring.h"

#include <linux/keyctl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace kavell {

namespace {

constexpr const char *kType = "user";
constexpr unsigned kLifeInSeconds = 24 * 60 * 60;

// Everything for who possesses the key; to see, read, search, link and set attributes for the user's other processes.
constexpr unsigned kPossessorAll = 0x3f000000;
constexpr unsigned kUserMayUse = 0x00010000 | 0x00020000 | 0x00080000 | 0x00100000 | 0x00200000;

template <typename... Arguments> long keyctl(int operation, Arguments... arguments)
{
    return syscall(SYS_keyctl, operation, arguments...);
}

}  // namespace

// A key added straight to the user keyring could not be read by processes that do not possess that keyring. So it is
// added to this thread's, opened to the user, and then linked.
bool keepInKernel(const std::string &name, std::string_view bytes)
{
    const long key = syscall(SYS_add_key, kType, name.c_str(), bytes.data(), bytes.size(), KEY_SPEC_THREAD_KEYRING);
    if (key < 0)
        return false;
    const bool kept = keyctl(KEYCTL_SETPERM, key, kPossessorAll | kUserMayUse) == 0 &&
                      keyctl(KEYCTL_SET_TIMEOUT, key, kLifeInSeconds) == 0 &&
                      keyctl(KEYCTL_LINK, key, KEY_SPEC_USER_KEYRING) == 0;
    keyctl(KEYCTL_UNLINK, key, KEY_SPEC_THREAD_KEYRING);
    return kept;
}

Secret findInKernel(const std::string &name, size_t length)
{
    const long key = keyctl(KEYCTL_SEARCH, KEY_SPEC_USER_KEYRING, kType, name.c_str(), 0);
    if (key < 0)
        return {};
    std::string buffer(length, '\0');
    const long count = keyctl(KEYCTL_READ, key, buffer.data(), buffer.size());
    Secret found = count == static_cast<long>(length) ? Secret(buffer) : Secret();
    explicit_bzero(buffer.data(), buffer.size());
    return found;
}

}  // namespace kavell
