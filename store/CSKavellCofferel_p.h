// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structures of credential items and access objects, and the questions to their store that the items and the
// account's password share. Any thread may call.

#ifndef KAVELL_STORE_CSKAVELLCOFFEREL_P_H
#define KAVELL_STORE_CSKAVELLCOFFEREL_P_H

#include <kavellaccounts/CSKavellCofferel.h>
#include <kavellaccounts/Ref.h>

#include "platform/credential_store.h"
#include "runtime/object_p.h"

/// Immutable: a name of an item, not the item.
struct CSKavellCofferelItem : kavell::Object {
    kavell::CredentialItem item;
};

/// Immutable.
struct CSKavellCofferelAccess : kavell::Object {
    kavell::Ref<CSKavellStringRef> description;
    kavell::Ref<CSKavellArrayRef> groups;
};

namespace kavell {

/// Whether a question may lead to a prompt.
enum class Prompting { forbidden, allowed };

/// The runtime object of an item; none when there is no memory.
[[nodiscard]] Ref<CSKavellCofferelItemRef> makeCofferelItem(CredentialItem item);

/// The item of a persistent reference, as CSKavellCofferelItemResolve says.
[[nodiscard]] CredentialStatus resolveCofferelItem(CSKavellDataRef reference, Prompting prompting,
                                                   CredentialItem &item);

/// The item's secret.
[[nodiscard]] CredentialStatus readCofferelSecret(const CredentialItem &item, Prompting prompting, Secret &secret);

/// Puts another secret in the place of the item's.
[[nodiscard]] CredentialStatus replaceCofferelSecret(const CredentialItem &item, std::string_view secret);

/// Deletes the item from its store.
[[nodiscard]] CredentialStatus deleteCofferelItem(const CredentialItem &item);

/// The item's persistent reference as data; none when none can be made.
[[nodiscard]] Ref<CSKavellDataRef> copyCofferelReference(const CredentialItem &item);

}  // namespace kavell

#endif
