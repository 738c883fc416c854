// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/main_thread.h"

#include <exception>

#include <QtCore/QCoreApplication>
#include <QtCore/QThread>

namespace kavell {

void runOnMainThread(const std::function<void()> &work)
{
    QCoreApplication *application = QCoreApplication::instance();
    if (!application || QThread::currentThread() == application->thread()) {
        work();
        return;
    }
    std::exception_ptr thrown;
    QMetaObject::invokeMethod(
        application,
        [&] {
            try {
                work();
            } catch (...) {
                thrown = std::current_exception();
            }
        },
        Qt::BlockingQueuedConnection);
    if (thrown)
        std::rethrow_exception(thrown);
}

}  // namespace kavell
