/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * Our side, through the store's C interface. */

#include "bench/side_by_side/side.h"

#include <poll.h>
#include <stdlib.h>

#include <kavellaccounts/KavellStore.h>

const size_t valuesOfAccount = 4 + kServices * kFields;

/** The provider record is the registry, an account record an account; the handles only carry them. */
static CSKavellAccountProviderRef providerOf(Registry *registry)
{
    return (CSKavellAccountProviderRef)registry;
}

static CSKavellAccountRef recordOf(Account *account)
{
    return (CSKavellAccountRef)account;
}

/** Names are made once, as a program's constants are. */
static CSKavellStringRef enabledKey, displayNameKey, serviceIDs[kServices], fieldKeys[kServices][kFields];

static void makeNames(void)
{
    if (enabledKey)
        return;
    enabledKey = CSKavellStringCreateWithUTF8("enabled");
    displayNameKey = kCSKavellAccountUserFullName;
    serviceIDs[0] = kCSKavellAccountServiceIMAPMail;
    serviceIDs[1] = kCSKavellAccountServiceCalDAV;
    for (int service = 0; service < kServices; ++service) {
        for (int field = 0; field < kFields; ++field)
            fieldKeys[service][field] = CSKavellStringCreateWithUTF8(kServiceFields[service][field].key);
    }
}

Registry *openRegistry(void)
{
    makeNames();
    CSKavellStringRef type = CSKavellStringCreateWithUTF8(EXAMPLE_PROVIDER);
    CSKavellAccountProviderRef provider = _CSKavellAccountProviderCreate(NULL, type);
    CSKavellRelease(type);
    if (!provider)
        fail("the provider cannot be opened");
    return (Registry *)provider;
}

void closeRegistry(Registry *registry)
{
    CSKavellRelease(providerOf(registry));
}

static void takeValue(Reading *reading, Kind kind, const char *key, CSKavellTypeRef value)
{
    if (!value)
        fail("an attribute is missing");
    if (kind == kText)
        takeText(reading, key, CSKavellStringGetUTF8(value));
    else
        takeNumber(reading, key, kind == kFlag ? CSKavellBooleanGetValue(value) : (int)CSKavellNumberGetInt64(value));
}

static void readAccount(CSKavellAccountRef account, Reading *reading)
{
    CSKavellStringRef loginName = _CSKavellAccountCopyLoginName(account);
    CSKavellStringRef provider = _CSKavellAccountCopyProviderType(account);
    CSKavellDictionaryRef own = _CSKavellAccountCopyProviderAttributes(account);
    takeValue(reading, kText, "login", loginName);
    takeValue(reading, kText, "name", CSKavellDictionaryGetValue(own, displayNameKey));
    takeValue(reading, kFlag, "enabled", CSKavellDictionaryGetValue(own, enabledKey));
    takeValue(reading, kText, "provider", provider);
    for (int service = 0; service < kServices; ++service) {
        CSKavellDictionaryRef attributes = _CSKavellAccountCopyServiceAttributes(account, serviceIDs[service]);
        for (int field = 0; field < kFields; ++field)
            takeValue(reading, kServiceFields[service][field].kind, kServiceFields[service][field].key,
                      CSKavellDictionaryGetValue(attributes, fieldKeys[service][field]));
        CSKavellRelease(attributes);
    }
    CSKavellRelease(own);
    CSKavellRelease(provider);
    CSKavellRelease(loginName);
    endAccount(reading);
}

void readAccounts(Registry *registry, Reading *reading)
{
    CSKavellArrayRef accounts = _CSKavellAccountProviderCopyAccounts(providerOf(registry));
    for (size_t index = 0, count = CSKavellArrayGetCount(accounts); index < count; ++index)
        readAccount((CSKavellAccountRef)CSKavellArrayGetValueAtIndex(accounts, index), reading);
    CSKavellRelease(accounts);
}

void listAccounts(Registry *registry, Reading *reading)
{
    CSKavellArrayRef accounts = _CSKavellAccountProviderCopyAccounts(providerOf(registry));
    for (size_t index = 0, count = CSKavellArrayGetCount(accounts); index < count; ++index) {
        CSKavellStringRef name =
            _CSKavellAccountCopyLoginName((CSKavellAccountRef)CSKavellArrayGetValueAtIndex(accounts, index));
        takeValue(reading, kText, "login", name);
        CSKavellRelease(name);
        endAccount(reading);
    }
    CSKavellRelease(accounts);
}

static CSKavellTypeRef makeValue(Kind kind, const Value *value)
{
    if (kind == kText)
        return CSKavellStringCreateWithUTF8(value->text);
    if (kind == kNumber)
        return CSKavellNumberCreateWithInt64(value->number);
    return CSKavellBooleanGetShared(value->number);
}

Account *createAccount(Registry *registry, const AccountValues *values)
{
    CSKavellStringRef loginName = CSKavellStringCreateWithUTF8(values->loginName);
    CSKavellStringRef displayName = CSKavellStringCreateWithUTF8(values->displayName);
    CSKavellAccountRef account = _CSKavellAccountProviderCreateAccount(providerOf(registry), loginName);
    _CSKavellAccountSetProviderAttribute(account, displayNameKey, displayName);
    _CSKavellAccountSetProviderAttribute(account, enabledKey, CSKavellBooleanGetShared(values->isEnabled));
    for (int service = 0; service < kServices; ++service) {
        for (int field = 0; field < kFields; ++field) {
            CSKavellTypeRef value = makeValue(kServiceFields[service][field].kind, &values->services[service][field]);
            _CSKavellAccountSetServiceAttribute(account, serviceIDs[service], fieldKeys[service][field], value);
            CSKavellRelease(value);
        }
    }
    _CSKavellAccountCommitChanges(account);
    if (!account || _CSKavellAccountHasPendingChanges(account))
        fail("an account cannot be saved");
    CSKavellRelease(displayName);
    CSKavellRelease(loginName);
    return (Account *)account;
}

void changeAccount(Registry *registry, Account *account, const char *host)
{
    (void)registry;
    CSKavellStringRef value = CSKavellStringCreateWithUTF8(host);
    _CSKavellAccountSetServiceAttribute(recordOf(account), serviceIDs[0], fieldKeys[0][0], value);
    _CSKavellAccountCommitChanges(recordOf(account));
    if (_CSKavellAccountHasPendingChanges(recordOf(account)))
        fail("a change cannot be saved");
    CSKavellRelease(value);
}

void removeAccount(Registry *registry, Account *account)
{
    CSKavellStringRef loginName = _CSKavellAccountCopyLoginName(recordOf(account));
    _CSKavellAccountProviderRemoveAccount(providerOf(registry), loginName);
    CSKavellRelease(loginName);
    CSKavellRelease(account);
}

void settle(void)
{
}

void observe(void (*ready)(void), void (*changed)(void))
{
    CSKavellNotificationObserverRef observer = CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender);
    if (!observer)
        fail("notifications cannot be observed");
    ready();
    struct pollfd waiting = {CSKavellNotificationObserverGetFileDescriptor(observer), POLLIN, 0};
    while (poll(&waiting, 1, -1) > 0) {
        for (CSKavellNotificationRef each; (each = CSKavellNotificationObserverCopyNext(observer)) != NULL;) {
            CSKavellDictionaryRef information = CSKavellNotificationGetUserInformation(each);
            if (CSKavellDictionaryGetValue(information, kCSKavellAccountUserLoginName))
                changed();
            CSKavellRelease(each);
        }
    }
}
