// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Writes the log of one worker (load_log.h). One thread.

#ifndef KAVELL_TESTS_LOAD_LOAD_RECORDER_H
#define KAVELL_TESTS_LOAD_LOAD_RECORDER_H

#include "tests/load/load_log.h"

namespace kavell::test {

/// The shared log; ends the program when there is none.
[[nodiscard]] LoadLog &loadLog();

/// Which worker this process is. Nothing that the store does is recorded before this is called.
void setLoadWorker(size_t worker);

/// Draws the next number and writes the event down.
void recordLoad(LoadEvent event, size_t account, LoadEntry entry = {});

}  // namespace kavell::test

#endif
