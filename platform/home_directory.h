// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where the user's files are. Any thread may call; nothing is cached, so that a program may change HOME.

#ifndef KAVELL_PLATFORM_HOME_DIRECTORY_H
#define KAVELL_PLATFORM_HOME_DIRECTORY_H

#include <string>

namespace kavell {

/// The user's home directory as an absolute path without a closing "/": HOME where it is set to one, else what the user
/// database says, else "/".
[[nodiscard]] std::string homeDirectory();

/// The user's runtime directory (XDG Base Directory Specification), which must belong to this user and to nobody else:
/// XDG_RUNTIME_DIR, else /run/user/UID, else a directory of this library's own below /tmp, which is made. Empty, with
/// errno set, when there is none.
[[nodiscard]] std::string runtimeDirectory();

}  // namespace kavell

#endif
