// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Between the toolkit's values and the store's objects. What goes in comes out the same:
//
//     QString           string         QVariantMap, QVariantHash                      dictionary
//     bool              boolean        QVariantList, QStringList, QList<QVariantMap>  array
//     whole numbers     integer        QByteArray                                     data
//     double, float     real           QDateTime                                      date, in whole seconds and UTC
//     QUrl              string, the URL's absolute text
//
// Whatever a property list cannot hold is refused on the way in, so that no account becomes one that cannot be saved.
// Nothing is none, and in a dictionary a key that is not there; a list has no place that holds nothing, so that a list
// with one is refused.
// Used by the object layer wherever it touches the store; any thread may call, nothing blocks.

#ifndef KAVELL_PLATFORM_QT_VALUE_CONVERSION_H
#define KAVELL_PLATFORM_QT_VALUE_CONVERSION_H

#include <optional>

#include <QtCore/QString>
#include <QtCore/QVariant>
#include <QtCore/QVariantMap>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

/// Whether a value stands for nothing: invalid, or a null text. (A variant that holds a null text is not null itself.)
[[nodiscard]] inline bool isNothing(const QVariant &value)
{
    return !value.isValid() ||
           (value.metaType().id() == QMetaType::QString && static_cast<const QString *>(value.constData())->isNull());
}

/// The text of a string; null for none, and never null for an empty string.
[[nodiscard]] QString toQString(CSKavellStringRef string);

/// A string of the text, none for a null one. Halves of characters become U+FFFD.
[[nodiscard]] Ref<CSKavellStringRef> toStoreString(const QString &text);

/// The same of a password: overwritten when it is let go, and so is every copy that is made on the way.
[[nodiscard]] Ref<CSKavellStringRef> toSecretString(const QString &text);

/// The value of an object; invalid for none, for objects of other types than those above and URLs (which come out as
/// QUrl), and for containers too deep for a property list. Whole numbers come out as qlonglong, or as qulonglong above
/// its range. Members without a value are left out of their container.
[[nodiscard]] QVariant toVariant(CSKavellTypeRef object);
[[nodiscard]] QVariantMap toVariantMap(CSKavellDictionaryRef dictionary);

/// The key to store under, none for a null one, which the store ignores. Not set when a property list could not hold
/// it; one line in the log then names it.
[[nodiscard]] std::optional<Ref<CSKavellStringRef>> toStoreKey(const QString &key);

struct StoreEntry {
    Ref<CSKavellStringRef> key;
    Ref<CSKavellTypeRef> object;  ///< none for a value that stands for nothing, which removes the key
};

/// What to store under a key. Not set when a property list could not hold the key or the value; one line in the log
/// then names the key and the type that was refused.
[[nodiscard]] std::optional<StoreEntry> toStoreEntry(const QVariant &value, const QString &key);

/// The dictionary to store, without null keys and those whose values stand for nothing. Not set when a key or value is refused, as
/// above.
[[nodiscard]] std::optional<Ref<CSKavellDictionaryRef>> toStoreDictionary(const QVariantMap &map);

}  // namespace kavell

#endif
