// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account record in memory: identity, attributes, pending changes. What touches the disk is in
// CSKavellAccountDataFile.cpp, the password in CSKavellAccountCredentials.cpp.

#include "store/CSKavellAccount_p.h"

#include <cstring>
#include <mutex>

#include <kavellaccounts/CSKavellType.h>

#include "platform/home_directory.h"
#include "runtime/string_p.h"
#include "store/error_message.h"

using namespace kavell;

namespace {

constexpr std::string_view kDataRoot = "/Library/Kavell Accounts/V1";

using Guard = std::lock_guard<RecordLock>;

void finaliseAccount(Object *object)
{
    auto *account = static_cast<CSKavellAccount *>(object);
    {
        const Guard guard(account->lock);
        account->providerType = nullptr;
        account->loginName = nullptr;
        account->uuidString = nullptr;
        account->newUUIDString = nullptr;
        ReleaseAndClear(account->services);
        account->accountSettings = nullptr;
        account->dataFilePath = nullptr;
    }
    account->~CSKavellAccount();
}

/// The two locks are taken one after the other, never one inside the other: two threads that compare the same two
/// records in opposite orders must not wait for each other for ever. What is compared is fixed at creation.
bool accountsEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    auto *one = const_cast<CSKavellAccount *>(static_cast<const CSKavellAccount *>(first));
    auto *other = const_cast<CSKavellAccount *>(static_cast<const CSKavellAccount *>(second));
    Ref<CSKavellStringRef> providerType, loginName;
    {
        const Guard guard(one->lock);
        providerType = one->providerType;
        loginName = one->loginName;
    }
    const Guard guard(other->lock);
    return CSKavellEqual(providerType.get(), other->providerType.get()) &&
           CSKavellEqual(loginName.get(), other->loginName.get());
}

constinit const TypeOperations accountOperations{
    .name = "CSKavellAccount",
    .finalise = finaliseAccount,
    .equal = accountsEqual,
    // Deliberately not consistent with the equality; clients rely on telling records apart by it.
    .hash = addressHash,
};

constinit LazyType accountType(accountOperations);

Ref<CSKavellStringRef> emptyString()
{
    return makeString("");
}

OwnedCString makeDataFilePath(std::string_view directory, std::string_view loginName)
{
    std::string path;
    path.reserve(directory.size() + 1 + loginName.size() + kDataFileSuffix.size());
    path.append(directory).append("/").append(loginName).append(kDataFileSuffix);
    // A name with a NUL in it cannot be a path; the account then lives without a file.
    return path.find('\0') == std::string::npos ? OwnedCString(strdup(path.c_str())) : nullptr;
}

Ref<CSKavellStringRef> freshUUIDString()
{
    return adopt(CSKavellUUIDCopyString(adopt(CSKavellUUIDCreate()).get()));
}

/// The settings of a service that has some; none otherwise.
CSKavellAccountSettingsRef existingService(CSKavellAccountRef account, CSKavellStringRef serviceID)
{
    return ServiceForID(account, serviceID, false);
}

}  // namespace

namespace kavell {

OwnedCString CreateUTF8CString(CSKavellStringRef string) noexcept
{
    if (!string || std::memchr(string->text(), '\0', string->length))
        return nullptr;
    return OwnedCString(strdup(string->text()));
}

std::string dataRootPath()
{
    std::string home = homeDirectory();
    if (home == "/")
        home.clear();
    return home.append(kDataRoot);
}

std::string providerDirectoryPath(CSKavellStringRef providerType)
{
    return dataRootPath().append("/").append(providerType->view());
}

}  // namespace kavell

CSKavellTypeID _CSKavellAccountGetTypeID(void)
{
    return accountType.typeID();
}

CSKavellAccountRef _CSKavellAccountCreate(const CSKavellAllocator *allocator, CSKavellStringRef providerType,
                                          CSKavellStringRef loginName)
{
    return createFoundAccount({}, {}, allocator, providerType, loginName);
}

CSKavellAccountRef kavell::createFoundAccount(FoundFile found, std::string_view directory,
                                              const CSKavellAllocator *allocator, CSKavellStringRef providerType,
                                              CSKavellStringRef loginName) noexcept
{
    if (CSKavellStringGetLength(providerType) == 0) {
        writeError("Error: No service provider specified in CSKavellAccountCreate\n");
        return nullptr;
    }
    if (CSKavellStringGetLength(loginName) == 0) {
        writeError("Error: No account name specified in CSKavellAccountCreate\n");
        return nullptr;
    }
    auto account = adopt(makeObject<CSKavellAccount>(allocator, accountType.typeID(), 0));
    if (!account)
        return nullptr;
    return guarded(CSKavellAccountRef{}, [&]() -> CSKavellAccountRef {
        account->providerType = adopt(CSKavellStringCreateCopy(allocator, providerType));
        account->loginName = adopt(CSKavellStringCreateCopy(allocator, loginName));
        account->services = NewMutableDictionary();
        account->accountSettings = adopt(CSKavellAccountSettingsCreate(allocator));
        if (!account->providerType || !account->loginName || !account->services || !account->accountSettings)
            return nullptr;
        account->dataFilePath = directory.empty()
                                    ? makeDataFilePath(providerDirectoryPath(providerType), loginName->view())
                                    : makeDataFilePath(directory, loginName->view());
        const Guard guard(account->lock);
        ReadAccountData(*account.get(), std::move(found));
        if (!account->uuidString) {
            account->uuidString = freshUUIDString();
            account->hasChanges = true;
        }
        return account.leak();
    });
}

CSKavellStringRef _CSKavellAccountCopyProviderType(CSKavellAccountRef account)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    return Ref(account->providerType).leak();
}

CSKavellStringRef _CSKavellAccountCopyLoginName(CSKavellAccountRef account)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    return Ref(account->loginName).leak();
}

bool _CSKavellAccountHasLoginName(CSKavellAccountRef account, CSKavellStringRef loginName)
{
    if (!account || !loginName)
        return false;
    const Guard guard(account->lock);
    return CSKavellEqual(account->loginName.get(), loginName);
}

CSKavellStringRef _CSKavellAccountCopyUUIDString(CSKavellAccountRef account)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    if (account->newUUIDString)
        return Ref(account->newUUIDString).leak();
    return account->uuidString ? Ref(account->uuidString).leak() : emptyString().leak();
}

CSKavellUUIDRef _CSKavellAccountCopyUUID(CSKavellAccountRef account)
{
    return CSKavellUUIDCreateFromString(adopt(_CSKavellAccountCopyUUIDString(account)).get());
}

void _CSKavellAccountSetUUIDString(CSKavellAccountRef account, CSKavellStringRef uuidString)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    account->newUUIDString = retain(uuidString);
}

void _CSKavellAccountSetUUID(CSKavellAccountRef account, CSKavellUUIDRef uuid)
{
    if (const auto text = adopt(CSKavellUUIDCopyString(uuid)))
        _CSKavellAccountSetUUIDString(account, text.get());
}

CSKavellURLRef _CSKavellAccountCopyBaseURL(CSKavellAccountRef)
{
    return guarded(CSKavellURLRef{}, [] { return CSKavellURLCreateWithFileSystemPath(dataRootPath().c_str(), true); });
}

CSKavellArrayRef _CSKavellAccountCopyServiceIDs(CSKavellAccountRef account)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    ArraySlot serviceIDs = NewMutableArray();
    forEachService(*account, [&](CSKavellStringRef serviceID, CSKavellAccountSettingsRef settings) {
        const auto attributes = adopt(CSKavellAccountSettingsCopyAttributes(settings));
        if (CSKavellDictionaryGetCount(attributes.get()) > 0)
            CSKavellArrayAppendValue(serviceIDs.get(), serviceID);
    });
    return serviceIDs.leak();
}

CSKavellDictionaryRef _CSKavellAccountCopyServiceAttributes(CSKavellAccountRef account, CSKavellStringRef serviceID)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    const auto settings = existingService(account, serviceID);
    return settings ? CSKavellAccountSettingsCopyAttributes(settings) : EmptyDictionary().leak();
}

CSKavellTypeRef _CSKavellAccountCopyServiceAttribute(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                                     CSKavellStringRef key)
{
    if (!account)
        return nullptr;
    const Guard guard(account->lock);
    return CSKavellAccountSettingsCopyAttribute(existingService(account, serviceID), key);
}

void _CSKavellAccountSetServiceAttributes(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                          CSKavellDictionaryRef attributes)
{
    if (!account || !attributes)
        return;
    const Guard guard(account->lock);
    CSKavellAccountSettingsSetAttributes(ServiceForID(account, serviceID, true), attributes);
    account->hasChanges = true;
}

void _CSKavellAccountSetServiceAttribute(CSKavellAccountRef account, CSKavellStringRef serviceID, CSKavellStringRef key,
                                         CSKavellTypeRef value)
{
    if (!value) {
        _CSKavellAccountRemoveServiceAttribute(account, serviceID, key);
        return;
    }
    if (!account || !key)
        return;
    const Guard guard(account->lock);
    CSKavellAccountSettingsSetAttribute(ServiceForID(account, serviceID, true), key, value);
    account->hasChanges = true;
}

void _CSKavellAccountRemoveServiceAttribute(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                            CSKavellStringRef key)
{
    if (!account || !key)
        return;
    const Guard guard(account->lock);
    const auto settings = existingService(account, serviceID);
    if (!settings)
        return;
    CSKavellAccountSettingsRemoveAttribute(settings, key);
    account->hasChanges = true;
}

void _CSKavellAccountRemoveAllServiceAttributes(CSKavellAccountRef account, CSKavellStringRef serviceID)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    const auto settings = existingService(account, serviceID);
    if (!settings)
        return;
    CSKavellAccountSettingsRemoveAllAttributes(settings);
    account->hasChanges = true;
}

CSKavellAccountSettingsRef ServiceForID(CSKavellAccountRef account, CSKavellStringRef serviceID, bool create)
{
    if (!account)
        return nullptr;
    if (!serviceID)
        return account->accountSettings.get();
    // Only settings are ever put into this dictionary.
    const auto *existing =
        static_cast<const CSKavellAccountSettings *>(GetDictValue(account->services.get(), serviceID));
    if (existing || !create)
        return const_cast<CSKavellAccountSettingsRef>(existing);
    const auto settings = adopt(CSKavellAccountSettingsCreate(nullptr));
    SetDictKey(account->services, serviceID, settings.get());
    return settings.get();
}

CSKavellDictionaryRef _CSKavellAccountCopyProviderAttributes(CSKavellAccountRef account)
{
    return _CSKavellAccountCopyServiceAttributes(account, nullptr);
}

CSKavellTypeRef _CSKavellAccountCopyProviderAttribute(CSKavellAccountRef account, CSKavellStringRef key)
{
    return _CSKavellAccountCopyServiceAttribute(account, nullptr, key);
}

void _CSKavellAccountSetProviderAttributes(CSKavellAccountRef account, CSKavellDictionaryRef attributes)
{
    _CSKavellAccountSetServiceAttributes(account, nullptr, attributes);
}

void _CSKavellAccountSetProviderAttribute(CSKavellAccountRef account, CSKavellStringRef key, CSKavellTypeRef value)
{
    _CSKavellAccountSetServiceAttribute(account, nullptr, key, value);
}

void _CSKavellAccountRemoveProviderAttribute(CSKavellAccountRef account, CSKavellStringRef key)
{
    _CSKavellAccountRemoveServiceAttribute(account, nullptr, key);
}

void _CSKavellAccountRemoveAllProviderAttributes(CSKavellAccountRef account)
{
    _CSKavellAccountRemoveAllServiceAttributes(account, nullptr);
}

bool _CSKavellAccountHasPendingChanges(CSKavellAccountRef account)
{
    if (!account)
        return false;
    const Guard guard(account->lock);
    return account->hasChanges || account->pendingRemove;
}

void _CSKavellAccountRemove(CSKavellAccountRef account)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    account->pendingRemove = true;
}

void _CSKavellAccountCancelRemove(CSKavellAccountRef account)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    account->pendingRemove = false;
}

void _CSKavellAccountCancelChanges(CSKavellAccountRef account)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    CSKavellAccountSettingsCancelChanges(account->accountSettings.get());
    forEachService(*account, [](CSKavellStringRef, CSKavellAccountSettingsRef settings) {
        CSKavellAccountSettingsCancelChanges(settings);
    });
    account->newUUIDString = nullptr;
    account->hasChanges = false;
    account->pendingRemove = false;
    // In the same hold of the lock, so that nobody sees the account between its changes and what the file says.
    ReadAccountData(*account);
}

void _CSKavellAccountCommitChanges(CSKavellAccountRef account)
{
    if (!account)
        return;
    const Guard guard(account->lock);
    commitAccount(*account);
}

bool CSKavellAccountLoadData(CSKavellAccountRef account)
{
    if (!account)
        return false;
    const Guard guard(account->lock);
    return ReadAccountData(*account);
}
