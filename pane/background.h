// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Work that may wait for the disk, another program or a keyring, off the user-interface thread. Each piece has its
// thread for as long as it takes, so that one that waits for a dead program's lock holds up nothing else.

#ifndef KAVELL_PANE_BACKGROUND_H
#define KAVELL_PANE_BACKGROUND_H

#include <type_traits>
#include <utility>

#include <QtConcurrent/QtConcurrentRun>
#include <QtCore/QFutureWatcher>
#include <QtCore/QObject>

class QThreadPool;

namespace kavell::pane {

/// The threads for such work. Never destroyed: a program that ends must not wait for a thread that waits for ever.
[[nodiscard]] QThreadPool &backgroundThreads();

/// Waits for what is under way, at most a second: a save that was begun should not be torn by the program's end.
void letBackgroundWorkFinish();

/// Runs `work` on a thread of its own and hands its answer to `done` on the context's thread, from the event loop and
/// never before this returns, unless the context is gone by then.
template <typename Work, typename Done> void runInBackground(QObject *context, Work work, Done done)
{
    using Result = std::invoke_result_t<Work>;
    auto *const watcher = new QFutureWatcher<Result>(context);
    QObject::connect(watcher, &QFutureWatcherBase::finished, context, [watcher, done = std::move(done)] {
        watcher->deleteLater();
        done(watcher->future().takeResult());
    });
    watcher->setFuture(QtConcurrent::run(&backgroundThreads(), std::move(work)));
}

}  // namespace kavell::pane

#endif
