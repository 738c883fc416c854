// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <cstring>
#include <string>

#include <kavellaccounts/KAHaldenServer.h>
#include <kavellaccounts/Ref.h>

#include "platform/qt/log.h"

using kavell::adopt;
using kavell::makeString;
using kavell::Ref;

namespace {

constexpr char kGroupName[] = "KavellAccounts";
constexpr char kAccessDescription[] = "KavellAccounts Access Group";

/// The answer for an item that nobody has given an access object, which is not one of the store's.
constexpr int32_t kNoDecryptEntries = -1;

/// An access object holds one entry, which authorises reading; one that was never set is without even a description.
bool hasDecryptEntry(CSKavellCofferelAccessRef access)
{
    return CSKavellStringGetLength(CSKavellCofferelAccessGetDescription(access)) > 0 ||
           CSKavellArrayGetCount(CSKavellCofferelAccessGetGroups(access)) > 0;
}

/// The same description, and one group more.
Ref<CSKavellCofferelAccessRef> withGroup(CSKavellCofferelAccessRef access, CSKavellStringRef group)
{
    const auto groups = adopt(CSKavellArrayCreateMutableCopy(CSKavellCofferelAccessGetGroups(access)));
    CSKavellArrayAppendValue(groups.get(), group);
    return adopt(CSKavellCofferelAccessCreate(CSKavellCofferelAccessGetDescription(access), groups.get()));
}

void logStatus(const char *what, CSKavellCofferelStatus status)
{
    kavell::log(QStringLiteral("Could not create an %1 for the KavellAccounts group.  Error: [%2]")
                    .arg(QString::fromUtf8(what), QString::fromUtf8(CSKavellCofferelStatusGetName(status))));
}

/// Only the vault keeps access objects; with no store at all there is nothing that one could be set on either.
CSKavellCofferelStatus groupSupport()
{
    const char *store = CSKavellCofferelStoreGetName();
    if (std::strcmp(store, "vault") == 0)
        return kCSKavellCofferelStatusStored;
    return std::strcmp(store, "none") == 0 ? kCSKavellCofferelStatusUnreachable : kCSKavellCofferelStatusUnsupported;
}

}  // namespace

int32_t KAAddTrustedAppGroup(CSKavellCofferelItemRef item, const QString &groupName)
{
    CSKavellCofferelAccessRef kept = nullptr;
    const CSKavellCofferelStatus status = CSKavellCofferelItemCopyAccess(item, &kept);
    const auto access = adopt(kept);
    if (status != kCSKavellCofferelStatusStored)
        return status;
    if (!hasDecryptEntry(access.get()))
        return kNoDecryptEntries;
    if (CSKavellArrayGetCount(CSKavellCofferelAccessGetGroups(access.get())) == 0)
        return kCSKavellCofferelStatusStored;
    const auto group = makeString(groupName.toStdString());
    if (groupName.isEmpty() || !group)
        return kCSKavellCofferelStatusFailed;
    return CSKavellCofferelItemSetAccess(item, withGroup(access.get(), group.get()).get());
}

CSKavellCofferelAccessRef KACreateCofferelAccessGroup()
{
    const auto group = makeString(kGroupName);
    const CSKavellCofferelStatus support = group ? groupSupport() : kCSKavellCofferelStatusFailed;
    if (support != kCSKavellCofferelStatusStored) {
        logStatus("application group", support);
        return nullptr;
    }
    CSKavellTypeRef groupName = group.get();
    const auto groups = adopt(CSKavellArrayCreate(&groupName, 1));
    CSKavellCofferelAccessRef access = CSKavellCofferelAccessCreate(makeString(kAccessDescription).get(), groups.get());
    if (!access)
        logStatus("access reference", kCSKavellCofferelStatusFailed);
    return access;
}
