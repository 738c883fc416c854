// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/exception_text.h"

#include <cxxabi.h>
#include <exception>
#include <typeinfo>

#include "platform/qt/class_name.h"

namespace kavell {

QString currentExceptionText()
{
    try {
        throw;
    } catch (const std::exception &exception) {
        return QString::fromUtf8(exception.what());
    } catch (...) {
        const std::type_info *const type = abi::__cxa_current_exception_type();
        return QStringLiteral("exception of type ") + (type ? className(*type) : QStringLiteral("unknown"));
    }
}

}  // namespace kavell
