// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAObject.h>

#include <cstdlib>
#include <cxxabi.h>
#include <memory>
#include <typeinfo>

#include "model/class_name.h"

QString kavell::className(const std::type_info &type)
{
    int status = 0;
    const std::unique_ptr<char, void (*)(void *)> name(abi::__cxa_demangle(type.name(), nullptr, nullptr, &status),
                                                       std::free);
    return QString::fromUtf8(status == 0 ? name.get() : type.name());
}

KAObject::~KAObject() = default;

QString KAObject::className() const
{
    return kavell::className(typeid(*this));
}

QString KAObject::description() const
{
    return QStringLiteral("<%1: 0x%2>").arg(className(), QString::number(reinterpret_cast<quintptr>(this), 16));
}

void KAObject::describeFields(KAFieldList &) const
{
}
