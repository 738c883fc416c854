// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The exception that is being handled, as a text for the log.

#ifndef KAVELL_PLATFORM_QT_EXCEPTION_TEXT_H
#define KAVELL_PLATFORM_QT_EXCEPTION_TEXT_H

#include <QtCore/QString>

namespace kavell {

/// What a std::exception says of itself, else the name of the thrown type. To be called in a catch block only.
[[nodiscard]] QString currentExceptionText();

}  // namespace kavell

#endif
