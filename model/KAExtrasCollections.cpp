// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAExtras.h>

#include <algorithm>

#include "model/settings_reading.h"

namespace KAExtras {

namespace {

bool isInteger(int typeID)
{
    switch (typeID) {
    case QMetaType::Short:
    case QMetaType::UShort:
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::Long:
    case QMetaType::ULong:
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
        return true;
    default:
        return false;
    }
}

bool sameValue(const QVariant &first, const QVariant &second);

bool sameDictionary(const QVariantMap &first, const QVariantMap &second)
{
    return std::equal(first.keyValueBegin(), first.keyValueEnd(), second.keyValueBegin(), second.keyValueEnd(),
                      [](const auto &one, const auto &other) {
                          return one.first == other.first && sameValue(one.second, other.second);
                      });
}

bool sameList(const QVariantList &first, const QVariantList &second)
{
    return std::equal(first.begin(), first.end(), second.begin(), second.end(), sameValue);
}

/// Equality without the toolkit's conversions, for which the text "1", the number 1 and true are all alike.
bool sameValue(const QVariant &first, const QVariant &second)
{
    const int type = first.metaType().id();
    if (isInteger(type) && isInteger(second.metaType().id()))
        return first == second;
    if (type != second.metaType().id())
        return false;
    if (type == QMetaType::QVariantMap)
        return sameDictionary(first.toMap(), second.toMap());
    if (type == QMetaType::QVariantList)
        return sameList(first.toList(), second.toList());
    return first == second;
}

auto findDictionary(const QVariantList &list, const QString &key)
{
    return std::find_if(list.begin(), list.end(), [&](const QVariant &element) {
        return !key.isNull() && element.metaType().id() == QMetaType::QVariantMap &&
               kavell::hasValueForKey(*static_cast<const QVariantMap *>(element.constData()), key);
    });
}

}  // namespace

bool containsDictionaryWithKey(const QVariantList &list, const QString &key)
{
    return findDictionary(list, key) != list.end();
}

std::optional<QVariantMap> dictionaryWithKey(const QVariantList &list, const QString &key)
{
    const auto found = findDictionary(list, key);
    return found == list.end() ? std::nullopt : std::optional(found->toMap());
}

void removeDictionaryWithKey(QVariantList &list, const QString &key)
{
    const QVariantList &all = list;
    const auto found = findDictionary(all, key);
    if (found == all.end())
        return;
    // By its place first: not everything that a value can hold is equal to itself.
    const QVariant removed = list.takeAt(found - all.begin());
    list.removeIf([&](const QVariant &element) { return sameValue(element, removed); });
}

}  // namespace KAExtras
