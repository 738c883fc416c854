// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the library logged while a capture lives, one entry a message. The object layer's log is the toolkit's logging
// category "com.corvane.kavellaccounts". Messages of other categories pass through.

#ifndef KAVELL_TESTS_SUPPORT_LOG_CAPTURE_H
#define KAVELL_TESTS_SUPPORT_LOG_CAPTURE_H

#include <QtCore/QStringList>
#include <QtCore/QtGlobal>

namespace kavell::test {

/// One at a time; any thread may log meanwhile.
class LogCapture {
public:
    LogCapture();
    ~LogCapture();
    LogCapture(const LogCapture &) = delete;
    LogCapture &operator=(const LogCapture &) = delete;

    /// The messages so far.
    [[nodiscard]] QStringList messages() const;

private:
    static void take(QtMsgType type, const QMessageLogContext &context, const QString &message);
    QtMessageHandler m_previous;
    QStringList m_messages;
};

}  // namespace kavell::test

#endif
