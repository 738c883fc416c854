// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Work that belongs to the main thread, where the program's event loop and its widgets live.

#ifndef KAVELL_PLATFORM_QT_MAIN_THREAD_H
#define KAVELL_PLATFORM_QT_MAIN_THREAD_H

#include <functional>

namespace kavell {

/// Runs the work on the main thread and returns when it is done; what it throws comes through. On the main thread
/// itself, and in a program without an application object, it runs on the calling thread. Another thread waits for the
/// main event loop to come to it, without a bound; work that it has not come to when the application object goes is not
/// done.
void runOnMainThread(const std::function<void()> &work);

}  // namespace kavell

#endif
