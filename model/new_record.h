// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The store's record of an account that is named by texts. Used by the account classes.

#ifndef KAVELL_MODEL_NEW_RECORD_H
#define KAVELL_MODEL_NEW_RECORD_H

#include <kavellaccounts/CSKavellAccount.h>

#include "platform/qt/value_conversion.h"

namespace kavell {

/// A new record, in no provider's list; none when the store makes none (a null or empty provider type or login name).
[[nodiscard]] inline Ref<CSKavellAccountRef> newRecord(const QString &providerType, const QString &loginName)
{
    return adopt(_CSKavellAccountCreate(nullptr, toStoreString(providerType).get(), toStoreString(loginName).get()));
}

}  // namespace kavell

#endif
