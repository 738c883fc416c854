// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structure of a settings record.

#ifndef KAVELL_STORE_CSKAVELLACCOUNTSETTINGS_P_H
#define KAVELL_STORE_CSKAVELLACCOUNTSETTINGS_P_H

#include <kavellaccounts/CSKavellAccountSettings.h>

#include "runtime/object_p.h"
#include "store/collection_helpers.h"

struct CSKavellAccountSettings : kavell::Object {
    /// What the data file last said.
    kavell::DictionarySlot attributes{};
    /// Pending values. No key is both here and in removedKeys.
    kavell::DictionarySlot changedAttributes{};
    /// Pending removals, without duplicates.
    kavell::ArraySlot removedKeys{};
};

namespace kavell {

/// CSKavellAccountSettingsUpdateAttributes for a dictionary that nobody else will use again: it is taken over instead
/// of copied.
void TakeAttributes(CSKavellAccountSettings &settings, CSKavellDictionaryRef attributes) noexcept;

}  // namespace kavell

#endif
