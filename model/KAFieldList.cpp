// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAFieldList.h>

#include "platform/qt/class_name.h"

namespace {

QString objectEncoding(const QString &typeName)
{
    return QStringLiteral("@\"%1\"").arg(typeName);
}

QString pointerText(const void *pointer)
{
    return QStringLiteral("0x") + QString::number(reinterpret_cast<quintptr>(pointer), 16);
}

}  // namespace

void KAFieldList::add(const char *name, bool value)
{
    m_fields.push_back({QString::fromUtf8(name), QStringLiteral("c"), &value,
                        value ? QStringLiteral("true") : QStringLiteral("false")});
}

void KAFieldList::add(const char *name, const char *value)
{
    m_fields.push_back({QString::fromUtf8(name), QStringLiteral("*"), &value,
                        value ? QString::fromUtf8(value) : KADescription(nullptr)});
}

QString KAFieldList::className(const std::type_info &type)
{
    return kavell::className(type);
}

void KAFieldList::addInteger(const char *name, char encoding, qlonglong value)
{
    // A character-sized field is shown as the boolean that it most often is.
    const QString text =
        encoding == 'c' ? (value & 0xff ? QStringLiteral("true") : QStringLiteral("false")) : QString::number(value);
    m_fields.push_back({QString::fromUtf8(name), QString(QLatin1Char(encoding)), &value, text});
}

void KAFieldList::addReal(const char *name, char encoding, double value)
{
    m_fields.push_back(
        {QString::fromUtf8(name), QString(QLatin1Char(encoding)), &value, QString::number(value, 'f', 6)});
}

void KAFieldList::addObject(const char *name, const QString &typeName, const void *object, const QString &description)
{
    m_fields.push_back({QString::fromUtf8(name), objectEncoding(typeName), object, description});
}

void KAFieldList::addPointer(const char *name, const void *pointer)
{
    m_fields.push_back({QString::fromUtf8(name), QStringLiteral("^v"), pointer, pointerText(pointer)});
}
