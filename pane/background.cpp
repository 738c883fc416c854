// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/background.h"

#include <QtCore/QThreadPool>

namespace kavell::pane {

namespace {

// Far more than are ever busy at a time, unless each waits for a lock that nobody releases.
constexpr int kThreads = 16;
constexpr int kPatience = 1000;  // ms

}  // namespace

QThreadPool &backgroundThreads()
{
    static QThreadPool *const threads = [] {
        auto *const pool = new QThreadPool;
        pool->setMaxThreadCount(kThreads);
        return pool;
    }();
    return *threads;
}

void letBackgroundWorkFinish()
{
    backgroundThreads().waitForDone(kPatience);
}

}  // namespace kavell::pane
