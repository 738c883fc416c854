// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <algorithm>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellCofferel.h>

#include "tools/doctor.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

/// Whether a state of the store says nothing about any item, so that asking for each account would only take time.
bool isSilent(CSKavellCofferelStatus status)
{
    return status != kCSKavellCofferelStatusStored && status != kCSKavellCofferelStatusAbsent;
}

void noteSilence(CSKavellCofferelStatus status, Findings &findings)
{
    findings.note("secrets-not-examined", {},
                  std::string("the passwords were not examined: the credential store (") +
                      CSKavellCofferelStoreGetName() + ") is " + CSKavellCofferelStatusGetName(status));
}

void examineItems(CSKavellArrayRef items, const std::vector<Address> &accounts, Findings &findings)
{
    for (size_t index = 0; index < CSKavellArrayGetCount(items); ++index) {
        const auto item =
            cast<CSKavellCofferelItemRef>(CSKavellArrayGetValueAtIndex(items, index), CSKavellCofferelItemGetTypeID());
        const Address address{toStdString(adopt(CSKavellCofferelItemCopyServiceName(item)).get()),
                              toStdString(adopt(CSKavellCofferelItemCopyAccountName(item)).get())};
        if (!std::binary_search(accounts.begin(), accounts.end(), address))
            findings.problem("secret-without-account", {},
                             "a password is stored for " + address.text() +
                                 ", and there is no such account; 'kavell-accounts password remove " + address.text() +
                                 "' removes it");
    }
}

bool refersToPassword(const OpenedAccount &account)
{
    return static_cast<bool>(
        adopt(_CSKavellAccountCopyProviderAttribute(account.record.get(), makeString(passwordReferenceKey).get())));
}

/// What the account's reference leads to; whether it makes sense to ask for the next account.
bool examineReference(const OpenedAccount &account, Findings &findings)
{
    const CSKavellCofferelStatus status = _CSKavellAccountGetPasswordStatus(account.record.get());
    const std::string name = account.address.text();
    if (status == kCSKavellCofferelStatusAbsent)
        findings.problem("account-without-secret", dataFileOf(account.address),
                         "the password that " + name + " refers to is gone; 'kavell-accounts password set " + name +
                             "' stores it anew, 'password remove' drops the reference");
    else if (status != kCSKavellCofferelStatusStored)
        findings.note("secret-not-examined", dataFileOf(account.address),
                      "the password of " + name + " was not examined: it is " + CSKavellCofferelStatusGetName(status));
    return status != kCSKavellCofferelStatusUnreachable;
}

}  // namespace

void examineSecrets(const std::vector<Address> &accounts, Findings &findings)
{
    CSKavellArrayRef found = nullptr;
    const CSKavellCofferelStatus status = CSKavellCofferelStoreCopyItems(&found);
    const Ref<CSKavellArrayRef> items = adopt(found);
    if (isSilent(status)) {
        noteSilence(status, findings);
        return;
    }
    examineItems(items.get(), accounts, findings);
    for (const Address &address : accounts) {
        if (findings.untouchable.contains(address) || !isOnDisk(address))
            continue;
        const auto account = openForExamination(address, findings);
        if (account && account->readable && refersToPassword(*account) && !examineReference(*account, findings))
            return;
    }
}

}  // namespace kavell::tools
