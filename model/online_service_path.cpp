// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where the maker's online-service library is, apart from the other configuration values so that the tests' build of
// the library can name another one.

#include "model/configuration.h"

namespace kavell::configuration {

const char kOnlineServiceLibraryPath[] = KAVELL_ONLINE_SERVICE_LIBRARY;

}  // namespace kavell::configuration
