// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A process of its own for the tests that need several: "credential_client add SERVICE ACCOUNT SECRET" adds one item to
// the default store, "credential_client add-many SERVICE PREFIX COUNT" several; prints the status and, for one, the
// item's persistent reference. Ends with 0 when all was stored.

#include <cstdio>
#include <cstdlib>
#include <string>

#include "platform/credential_store.h"

int main(int count, char **words)
{
    if (count != 5)
        return 2;
    const std::string command = words[1];
    const std::shared_ptr<kavell::CredentialStore> store = kavell::defaultCredentialStore();
    if (!store)
        return 3;
    kavell::CredentialItem item;
    kavell::CredentialStatus status = kavell::CredentialStatus::stored;
    if (command == "add")
        status = store->add(words[2], words[3], words[4], item);
    for (int index = 0; command == "add-many" && index < std::atoi(words[4]); ++index) {
        if (status == kavell::CredentialStatus::stored)
            status = store->add(words[2], words[3] + std::to_string(index), "secret", item);
    }
    std::printf("%s %s\n", kavell::credentialStatusName(status), kavell::persistentReference(item).c_str());
    return status == kavell::CredentialStatus::stored ? 0 : 1;
}
