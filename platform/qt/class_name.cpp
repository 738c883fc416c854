// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/class_name.h"

#include <cstdlib>
#include <cxxabi.h>
#include <memory>

namespace kavell {

QString className(const std::type_info &type)
{
    int status = 0;
    const std::unique_ptr<char, void (*)(void *)> name(abi::__cxa_demangle(type.name(), nullptr, nullptr, &status),
                                                       std::free);
    return QString::fromUtf8(status == 0 ? name.get() : type.name());
}

}  // namespace kavell
