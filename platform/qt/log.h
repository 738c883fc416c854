// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The library's log: the logging category "com.corvane.kavellaccounts" of the toolkit, one line a message. Any thread.

#ifndef KAVELL_PLATFORM_QT_LOG_H
#define KAVELL_PLATFORM_QT_LOG_H

#include <QtCore/QString>

namespace kavell {

/// Writes one message as it stands, as a warning.
void log(const QString &message);

}  // namespace kavell

#endif
