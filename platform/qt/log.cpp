// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/log.h"

#include <QtCore/QLoggingCategory>

namespace kavell {

namespace {

Q_LOGGING_CATEGORY(category, "com.corvane.kavellaccounts")

}  // namespace

void log(const QString &message)
{
    qCWarning(category).noquote() << message;
}

}  // namespace kavell
