// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Values as the library's messages and dumps show them: nothing is "(null)", text is itself, numbers are decimal,
// booleans 1 and 0, a dictionary is "{key = value; …}" with sorted keys, an array "(a, b)", an object
// "<ClassName: 0xADDRESS>" or what it says of itself. Any thread may call.

#ifndef KAVELLACCOUNTS_KADESCRIPTION_H
#define KAVELLACCOUNTS_KADESCRIPTION_H

#include <cstddef>

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>

class KAObject;
class QObject;
class QVariant;

[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString KADescription(std::nullptr_t);
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString KADescription(const QString &text);
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString KADescription(const KAObject *object);
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString KADescription(const QObject *object);
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QString KADescription(const QVariant &value);

#endif
