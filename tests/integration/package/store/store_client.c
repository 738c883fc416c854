// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Makes an account and says whether it was saved.

#include <stdio.h>

#include <kavellaccounts/KavellStore.h>

int main(void)
{
    CSKavellAccountProviderRef provider = _CSKavellAccountProviderCreate(NULL, kCSKavellAccountProviderMail);
    CSKavellStringRef login = CSKavellStringCreateWithUTF8("ada@example.org");
    CSKavellAccountRef account = _CSKavellAccountProviderCreateAccount(provider, login);
    _CSKavellAccountSetProviderAttribute(account, kCSKavellAccountUserFullName, login);
    _CSKavellAccountCommitChanges(account);
    puts(!account || _CSKavellAccountHasPendingChanges(account) ? "not saved" : "saved");
    CSKavellRelease(account);
    CSKavellRelease(login);
    CSKavellRelease(provider);
    return 0;
}
