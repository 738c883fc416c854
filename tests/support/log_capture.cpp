// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/log_capture.h"

#include <atomic>
#include <cstring>
#include <mutex>

namespace kavell::test {

namespace {

std::atomic<LogCapture *> current = nullptr;

// Of the current one's messages. In a capture, it would leave its place on the stack to some other mutex, and the thread
// sanitizer would take the two for one that is locked in both orders.
std::mutex messagesMutex;

}  // namespace

LogCapture::LogCapture()
{
    current = this;
    m_previous = qInstallMessageHandler(take);
}

LogCapture::~LogCapture()
{
    qInstallMessageHandler(m_previous);
    current = nullptr;
}

QStringList LogCapture::messages() const
{
    const std::lock_guard lock(messagesMutex);
    return m_messages;
}

void LogCapture::take(QtMsgType type, const QMessageLogContext &context, const QString &message)
{
    LogCapture *const capture = current;
    if (!capture)
        return;
    if (context.category && std::strcmp(context.category, "com.corvane.kavellaccounts") == 0) {
        const std::lock_guard lock(messagesMutex);
        capture->m_messages += message;
    } else if (capture->m_previous) {
        capture->m_previous(type, context, message);
    }
}

}  // namespace kavell::test
