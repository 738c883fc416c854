// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The subcommands. Each reads the words behind its name, does its work and answers the exit code, or throws Failure.

#ifndef KAVELL_TOOLS_COMMANDS_H
#define KAVELL_TOOLS_COMMANDS_H

#include "tools/account_access.h"
#include "tools/failure.h"

namespace kavell::tools {

ExitCode runList(const Words &words);
ExitCode runShow(const Words &words);
ExitCode runAdd(const Words &words);
ExitCode runSet(const Words &words);
ExitCode runUnset(const Words &words);
ExitCode runRemove(const Words &words);
ExitCode runPassword(const Words &words);
ExitCode runWatch(const Words &words);
ExitCode runDoctor(const Words &words);
ExitCode runImport(const Words &words);
ExitCode runExport(const Words &words);

// These load the object layer (object_layer.h).
ExitCode runPlugins(const Words &words);
ExitCode runIdentify(const Words &words);
ExitCode runMatch(const Words &words);
ExitCode runChildren(const Words &words);
ExitCode runServers(const Words &words);

/// Hidden: the words of one kind, one a line, for shell completion.
ExitCode runWords(const Words &words);

}  // namespace kavell::tools

#endif
