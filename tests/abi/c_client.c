// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The store as a C program uses it, through the shared library: makes an account, saves it, finds it again through its
// provider, is notified, and removes it. Ends with 0, or says which check failed and ends with 1.

#include <poll.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <kavellaccounts/KavellStore.h>

#define CHECK(condition)                                                                                               \
    do {                                                                                                               \
        if (!(condition)) {                                                                                            \
            printf("%s:%d: not so: %s\n", __FILE__, __LINE__, #condition);                                             \
            exit(1);                                                                                                   \
        }                                                                                                              \
    } while (0)

static CSKavellStringRef makeString(const char *text)
{
    return CSKavellStringCreateWithUTF8(text);
}

/// Saves an account with an attribute of each kind.
static void saveAccount(CSKavellAccountProviderRef provider, CSKavellStringRef loginName)
{
    CSKavellAccountRef account = _CSKavellAccountProviderCreateAccount(provider, loginName);
    CHECK(account != NULL);
    CHECK(CSKavellGetTypeID(account) == _CSKavellAccountGetTypeID());
    CHECK(_CSKavellAccountHasPendingChanges(account));

    CSKavellNumberRef port = CSKavellNumberCreateWithInt64(993);
    _CSKavellAccountSetServiceAttribute(account, kCSKavellAccountServiceIMAPMail, kCSKavellAccountSettingPort, port);
    _CSKavellAccountSetProviderAttribute(account, kCSKavellAccountUserFullName, loginName);
    CSKavellTypeRef members[] = {CSKavellBooleanGetShared(true), port, loginName};
    CSKavellArrayRef list = CSKavellArrayCreate(members, 3);
    CSKavellStringRef key = makeString("list");
    _CSKavellAccountSetProviderAttribute(account, key, list);
    _CSKavellAccountCommitChanges(account);
    CHECK(!_CSKavellAccountHasPendingChanges(account));
    CSKavellRelease(key);
    CSKavellRelease(list);
    CSKavellRelease(port);
    CSKavellRelease(account);
}

/// Finds the account in a provider of its own and reads it.
static void findAccount(CSKavellStringRef loginName)
{
    CSKavellAccountProviderRef provider = _CSKavellAccountProviderCreate(NULL, kCSKavellAccountProviderMail);
    CSKavellArrayRef accounts = _CSKavellAccountProviderCopyAccounts(provider);
    CHECK(CSKavellArrayGetCount(accounts) == 1);
    CSKavellAccountRef account = (CSKavellAccountRef)CSKavellArrayGetValueAtIndex(accounts, 0);
    CHECK(_CSKavellAccountHasLoginName(account, loginName));

    CSKavellNumberRef port = (CSKavellNumberRef)_CSKavellAccountCopyServiceAttribute(
        account, kCSKavellAccountServiceIMAPMail, kCSKavellAccountSettingPort);
    CHECK(CSKavellGetTypeID(port) == CSKavellNumberGetTypeID());
    CHECK(CSKavellNumberGetInt64(port) == 993);
    CSKavellStringRef name =
        (CSKavellStringRef)_CSKavellAccountCopyProviderAttribute(account, kCSKavellAccountUserFullName);
    CHECK(strcmp(CSKavellStringGetUTF8(name), "ada@example.org") == 0);
    CSKavellDictionaryRef attributes = _CSKavellAccountCopyProviderAttributes(account);
    CHECK(CSKavellDictionaryGetCount(attributes) == 2);
    CSKavellRelease(attributes);
    CSKavellRelease(name);
    CSKavellRelease(port);
    CSKavellRelease(accounts);
    CSKavellRelease(provider);
}

/// Takes one notification and looks at all of it.
static void expectNotification(CSKavellNotificationObserverRef observer, CSKavellStringRef loginName)
{
    struct pollfd waiting = {CSKavellNotificationObserverGetFileDescriptor(observer), POLLIN, 0};
    CHECK(poll(&waiting, 1, 10000) == 1);
    CSKavellNotificationRef notification = CSKavellNotificationObserverCopyNext(observer);
    CHECK(notification != NULL);
    CHECK(CSKavellEqual(CSKavellNotificationGetName(notification), kCSKavellAccountNotificationSender));
    CHECK(CSKavellEqual(CSKavellNotificationGetObject(notification),
                        kCSKavellAccountProviderSettingsChangedNotification));
    CSKavellDictionaryRef information = CSKavellNotificationGetUserInformation(notification);
    CHECK(CSKavellEqual(CSKavellDictionaryGetValue(information, kCSKavellAccountUserLoginName), loginName));
    CHECK(CSKavellEqual(CSKavellDictionaryGetValue(information, kCSKavellAccountProviderName),
                        kCSKavellAccountProviderMail));
    CSKavellRelease(notification);
}

int main(void)
{
    CSKavellStringRef loginName = makeString("ada@example.org");
    CSKavellNotificationObserverRef observer = CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender);
    CHECK(observer != NULL);
    CSKavellAccountProviderRef provider = _CSKavellAccountProviderCreate(NULL, kCSKavellAccountProviderMail);
    CHECK(strcmp(CSKavellTypeIDGetName(CSKavellGetTypeID(provider)), "CSKavellAccountProvider") == 0);

    saveAccount(provider, loginName);
    expectNotification(observer, loginName);
    findAccount(loginName);
    _CSKavellAccountProviderRemoveAccount(provider, loginName);
    expectNotification(observer, loginName);
    CSKavellArrayRef accounts = _CSKavellAccountProviderCopyAccounts(provider);
    CHECK(CSKavellArrayGetCount(accounts) == 0);

    CSKavellRelease(accounts);
    CSKavellRelease(provider);
    CSKavellRelease(observer);
    CSKavellRelease(loginName);
    puts("ok");
    return 0;
}
