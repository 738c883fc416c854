// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Reading settings dictionaries. "Has a value" is a key with a value that is not null; a present but empty text is a
// value. A value of another type than text is no text.

#ifndef KAVELL_MODEL_SETTINGS_READING_H
#define KAVELL_MODEL_SETTINGS_READING_H

#include <algorithm>
#include <cmath>
#include <cstdlib>

#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include "platform/qt/value_conversion.h"

namespace kavell {

/// The text of a value; null for nothing and for values of other types.
[[nodiscard]] inline QString textOf(const QVariant &value)
{
    return value.metaType().id() == QMetaType::QString ? *static_cast<const QString *>(value.constData()) : QString();
}

[[nodiscard]] inline bool hasValueForKey(const QVariantMap &settings, const QString &key)
{
    const auto found = settings.constFind(key);
    return found != settings.cend() && !isNothing(*found);
}

[[nodiscard]] inline QString textForKey(const QVariantMap &settings, const QString &key)
{
    const auto found = settings.constFind(key);
    return found != settings.cend() ? textOf(*found) : QString();
}

/// Whether the key holds something that means yes: true, a number other than 0, or a text that begins with "y", "t" (in
/// any case) or a digit other than 0, since settings files write flags as text too.
[[nodiscard]] inline bool isTrueForKey(const QVariantMap &settings, const QString &key)
{
    const QVariant value = settings.value(key);
    const QString text = textOf(value);
    if (text.isNull())
        return value.toBool();
    const QChar first = text.isEmpty() ? QChar() : text.at(0).toLower();
    return first == u'y' || first == u't' || (first >= u'1' && first <= u'9');
}

/// Whether the key holds something that can be read as a number, as any text can.
[[nodiscard]] inline bool hasNumberForKey(const QVariantMap &settings, const QString &key)
{
    return hasValueForKey(settings, key) && settings.value(key).canConvert<qlonglong>();
}

/// The whole number that the key holds: the one that a text begins with, a real without its fraction; 0 for none.
[[nodiscard]] inline qlonglong integerForKey(const QVariantMap &settings, const QString &key)
{
    const QVariant value = settings.value(key);
    if (const QString text = textOf(value); !text.isNull())
        return std::strtoll(text.toUtf8().constData(), nullptr, 10);
    const bool isReal = value.metaType().id() == QMetaType::Double || value.metaType().id() == QMetaType::Float;
    if (!isReal)
        return value.toLongLong();
    constexpr double kLargest = 1e18;  // much larger ones cannot be converted, nor can what is no number
    const double real = value.toDouble();
    return std::isnan(real) ? 0 : static_cast<qlonglong>(std::clamp(real, -kLargest, kLargest));
}

/// Whether the key holds a text that is not empty.
[[nodiscard]] inline bool hasTextForKey(const QVariantMap &settings, const QString &key)
{
    return !textForKey(settings, key).isEmpty();
}

}  // namespace kavell

#endif
