// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Small operations on text, URLs, dictionaries, lists and objects that accounts and servers are compared with, and the
// one operation that brings a settings dictionary into its normal shape. They keep no state and block on nothing; any
// thread may call. A null text gives a null text or false.

#ifndef KAVELLACCOUNTS_KAEXTRAS_H
#define KAVELLACCOUNTS_KAEXTRAS_H

#include <concepts>
#include <optional>
#include <type_traits>

#include <QtCore/QMap>
#include <QtCore/QString>
#include <QtCore/QUrl>
#include <QtCore/QVariantList>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class QLineEdit;
class QObject;

namespace KAExtras {

/// @name Settings dictionaries (keys of KAConstants.h)
/// @{

/// A copy in normal shape: a chat login serves as user name, an e-mail address is derived from the user name where the
/// kind of account tells its mail domain, and the parts of group-ware server addresses are put together as URLs.
/// Nothing that is there is replaced. Values of other types than the keys want count as missing.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QVariantMap fixUpSettings(const QVariantMap &settings);
/// @}

/// @name Addresses and servers
/// @{

/// Without leading and trailing blanks; only U+0020 counts, tabs and line breaks stay.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString stringByTrimmingWhitespace(const QString &text);

/// The part before the first "@" in lower case; a text without "@" as it is.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString emailUserName(const QString &address);

/// The part after the first "@" in lower case, null when that is empty; a text without "@" as it is.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString emailHostName(const QString &address);

/// The host of a server address "host" or "host/path", in lower case. Made for server addresses: of a whole URL it
/// gives the scheme with its colon ("http:"), deliberately so.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString urlDomain(const QString &serverAddress);

/// Whether a server address begins with the prefix or holds it after a dot, in any case of letters. A prefix is a first
/// label with its dot: "example." claims "example.net", "mail.example.org" and their like.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT bool serverAddrIsInDomain(const QString &serverAddress,
                                                               const QString &domainPrefix);

/// The same user at the other one of the maker's two mail domains; null for an address at neither.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString otherNimbrelOrDorvexEmail(const QString &address);

/// What was typed into a field for an e-mail address, trimmed and in lower case.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString validatedEmailAddressStringValue(const QLineEdit *field);
/// @}

/// @name URLs
/// @{

/// The text after the first "#"; null when there is none. Throws std::out_of_range for a URL whose first "?" stands
/// behind its first "#", deliberately so: such a URL is malformed for its callers.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString _hash(const QUrl &url);

/// The arguments of the query, which are set apart by "?" (not "&"), each at least "key=value"; what follows a second
/// "=" is dropped. Percent escapes are decoded as UTF-8. The last of equal keys stands.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QMap<QString, QString> queryArguments(const QUrl &url);

/// The arguments of the fragment, which are set apart by "&", each exactly "key=value"; others are dropped. Throws as
/// _hash does.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QMap<QString, QString> hashArguments(const QUrl &url);
/// @}

/// @name Lists of dictionaries. Elements of other types are passed over
/// @{
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT bool containsDictionaryWithKey(const QVariantList &list, const QString &key);

/// The first dictionary that has the key; null when none has.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT std::optional<QVariantMap> dictionaryWithKey(const QVariantList &list,
                                                                                  const QString &key);

/// Removes the first dictionary that has the key, and every element equal to it.
KAVELL_ACCOUNTS_EXPORT void removeDictionaryWithKey(QVariantList &list, const QString &key);
/// @}

/// @name Applications
/// @{

/// The path of the icon file of the application of that name; null when the application, or its icon, is unknown.
/// Reads the disk.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString iconPathForAppName(const QString &appName);
/// @}

/// @name Descriptions of objects
/// @{

/// The value's description; of a dictionary with an entry "password", with "***" in its place (top level only).
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString descriptionNoPasswords(const QVariant &value);

template <typename Object>
concept Describable = std::derived_from<Object, KAObject> || std::derived_from<Object, QObject>;

/// The root class that an object is described as.
template <Describable Object> using RootOf = std::conditional_t<std::derived_from<Object, KAObject>, KAObject, QObject>;

/// The object's own description: what it masks, its class decides.
template <Describable Object> [[nodiscard]] QString descriptionNoPasswords(const Object *object)
{
    return KADescription(static_cast<const RootOf<Object> *>(object));
}

/// One line for each field of the object, "\tNAME <ENCODING, POINTER>: VALUE\n", its own class first and then each base
/// class (KAFieldList.h). Without passwords, the value of a field named "password" or "_password" is "***". Null for a
/// null object. Of a toolkit object that is no KAObject, its declared properties.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString _ivarDumpCoreShowingPasswords(const KAObject *object, bool showPasswords);
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString _ivarDumpCoreShowingPasswords(const QObject *object, bool showPasswords);

template <Describable Object> [[nodiscard]] QString _ivarDump(const Object *object)
{
    return _ivarDumpCoreShowingPasswords(static_cast<const RootOf<Object> *>(object), true);
}

template <Describable Object> [[nodiscard]] QString _ivarDumpNoPasswords(const Object *object)
{
    return _ivarDumpCoreShowingPasswords(static_cast<const RootOf<Object> *>(object), false);
}
/// @}

}  // namespace KAExtras

#endif
