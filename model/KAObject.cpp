// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAObject.h>

#include <typeinfo>

#include "platform/qt/class_name.h"

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
