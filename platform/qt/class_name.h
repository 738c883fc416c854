// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The name of a class as a person writes it. Any thread.

#ifndef KAVELL_PLATFORM_QT_CLASS_NAME_H
#define KAVELL_PLATFORM_QT_CLASS_NAME_H

#include <typeinfo>

#include <QtCore/QString>

namespace kavell {

[[nodiscard]] QString className(const std::type_info &type);

}  // namespace kavell

#endif
