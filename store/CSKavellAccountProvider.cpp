// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The provider record: the accounts found in one directory, and those added since.

#include <kavellaccounts/CSKavellAccountProvider.h>

#include <mutex>

#include <kavellaccounts/CSKavellType.h>

#include "runtime/string_p.h"
#include "store/CSKavellAccount_p.h"
#include "store/error_message.h"

using namespace kavell;

struct CSKavellAccountProvider : kavell::Object {
    Ref<CSKavellStringRef> providerType{};
    /// The account records in order, each login name once; none when there are none.
    ArraySlot accounts{};
    RecordLock lock{};
    /// The same records by login name, so that loading many accounts does not compare each with each.
    DictionarySlot accountsByLoginName{};
};

namespace {

using Guard = std::lock_guard<RecordLock>;

void dropAccounts(CSKavellAccountProvider &provider) noexcept
{
    ReleaseAndClear(provider.accounts);
    ReleaseAndClear(provider.accountsByLoginName);
}

void finaliseProvider(Object *object)
{
    auto *provider = static_cast<CSKavellAccountProvider *>(object);
    {
        const Guard guard(provider->lock);
        provider->providerType = nullptr;
        dropAccounts(*provider);
    }
    provider->~CSKavellAccountProvider();
}

/// One lock after the other, as for accounts: opposite comparisons must not wait for each other for ever.
bool providersEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    auto *one = const_cast<CSKavellAccountProvider *>(static_cast<const CSKavellAccountProvider *>(first));
    auto *other = const_cast<CSKavellAccountProvider *>(static_cast<const CSKavellAccountProvider *>(second));
    const auto providerType = adopt(_CSKavellAccountProviderCopyProviderType(one));
    const Guard guard(other->lock);
    return CSKavellEqual(providerType.get(), other->providerType.get());
}

constinit const TypeOperations providerOperations{
    .name = "CSKavellAccountProvider",
    .finalise = finaliseProvider,
    .equal = providersEqual,
    // Deliberately not consistent with the equality, as for accounts.
    .hash = addressHash,
};

constinit LazyType providerRecordType(providerOperations);

void appendAccount(CSKavellAccountProvider &provider, CSKavellAccountRef account, CSKavellStringRef loginName) noexcept
{
    if (!provider.accounts)
        provider.accounts = NewMutableArray();
    CSKavellArrayAppendValue(provider.accounts.get(), account);
    SetDictKey(provider.accountsByLoginName, loginName, account);
}

/// Makes an account record and lists it. None, with nothing listed, when that fails. For the file and the directory, see
/// createFoundAccount.
CSKavellAccountRef addNewAccount(CSKavellAccountProvider &provider, CSKavellStringRef loginName, FoundFile found = {},
                                 std::string_view directory = {}) noexcept
{
    const auto account =
        adopt(createFoundAccount(std::move(found), directory, nullptr, provider.providerType.get(), loginName));
    if (account)
        appendAccount(provider, account.get(), loginName);
    return account.get();
}

CSKavellAccountRef accountOf(const CSKavellAccountProvider &provider, CSKavellStringRef loginName) noexcept
{
    // Only accounts are ever put into this dictionary.
    const auto *account =
        static_cast<const CSKavellAccount *>(GetDictValue(provider.accountsByLoginName.get(), loginName));
    return const_cast<CSKavellAccountRef>(account);
}

/// Takes the account of a login name out of the list. None when it is not there.
Ref<CSKavellAccountRef> takeAccount(CSKavellAccountProvider &provider, CSKavellStringRef loginName) noexcept
{
    auto account = retain(accountOf(provider, loginName));
    if (!account)
        return nullptr;
    // By identity: the record that is listed, not one equal to it.
    for (size_t index = 0; index < CSKavellArrayGetCount(provider.accounts.get()); ++index) {
        if (CSKavellArrayGetValueAtIndex(provider.accounts.get(), index) == account.get()) {
            CSKavellArrayRemoveValueAtIndex(provider.accounts.get(), index);
            break;
        }
    }
    if (CSKavellArrayGetCount(provider.accounts.get()) == 0)
        ReleaseAndClear(provider.accounts);
    RemoveDictKey(provider.accountsByLoginName, loginName);
    return account;
}

/// Makes a record for each data file of a directory, in the directory's own order.
void addListedAccounts(CSKavellAccountProvider &provider, const DataDirectory &directory, const std::string &path)
{
    directory.forEachDataFile([&](std::string_view name) {
        // A name that is not UTF-8 cannot be a login name, and answers none here.
        const auto loginName = makeString(name.substr(0, name.size() - kDataFileSuffix.size()));
        if (loginName && !accountOf(provider, loginName.get()))
            addNewAccount(provider, loginName.get(), FoundFile::open(directory, name.data()), path);
    });
}

/// Makes a record for each data file of the provider's directory.
void CSKavellAccountProviderLoadAccountData(CSKavellAccountProvider &provider)
{
    const std::string path = providerDirectoryPath(provider.providerType.get());
    if (path.find('\0') != std::string::npos)
        return;
    DataDirectory directory(path.c_str());
    addListedAccounts(provider, directory, path);
    if (directory.isAsListed())
        return;
    // A name has come or gone in the directory meanwhile. If it was that of a record, by a program that died in the middle
    // of a file, the file was read as it was left. Where each record is looked for, that does not happen; a file that
    // cannot be read may be told of twice.
    dropAccounts(provider);
    directory.doubtListing();
    addListedAccounts(provider, directory, path);
}

}  // namespace

CSKavellTypeID _CSKavellAccountProviderGetTypeID(void)
{
    return providerRecordType.typeID();
}

CSKavellAccountProviderRef _CSKavellAccountProviderCreate(const CSKavellAllocator *allocator,
                                                          CSKavellStringRef providerType)
{
    if (CSKavellStringGetLength(providerType) == 0) {
        writeError("Error: No service provider specified in CSKavellAccountProviderCreate\n");
        return nullptr;
    }
    auto provider = adopt(makeObject<CSKavellAccountProvider>(allocator, providerRecordType.typeID(), 0));
    if (!provider)
        return nullptr;
    return guarded(CSKavellAccountProviderRef{}, [&]() -> CSKavellAccountProviderRef {
        provider->providerType = adopt(CSKavellStringCreateCopy(allocator, providerType));
        if (!provider->providerType)
            return nullptr;
        // Nobody else has the record yet, so its lock is not needed.
        CSKavellAccountProviderLoadAccountData(*provider.get());
        return provider.leak();
    });
}

CSKavellStringRef _CSKavellAccountProviderCopyProviderType(CSKavellAccountProviderRef provider)
{
    if (!provider)
        return nullptr;
    const Guard guard(provider->lock);
    return Ref(provider->providerType).leak();
}

CSKavellArrayRef _CSKavellAccountProviderCopyAccounts(CSKavellAccountProviderRef provider)
{
    if (!provider)
        return nullptr;
    const Guard guard(provider->lock);
    return provider->accounts ? CSKavellArrayCreateMutableCopy(provider->accounts.get()) : EmptyArray().leak();
}

CSKavellAccountRef _CSKavellAccountProviderGetAccount(CSKavellAccountProviderRef provider, CSKavellStringRef loginName,
                                                      bool create)
{
    if (!provider)
        return nullptr;
    CSKavellAccountRef existing = accountOf(*provider, loginName);
    return existing || !create ? existing : addNewAccount(*provider, loginName);
}

CSKavellAccountRef _CSKavellAccountProviderCopyAccount(CSKavellAccountProviderRef provider, CSKavellStringRef loginName,
                                                       bool create)
{
    if (!provider)
        return nullptr;
    const Guard guard(provider->lock);
    return retain(_CSKavellAccountProviderGetAccount(provider, loginName, create)).leak();
}

CSKavellAccountRef _CSKavellAccountProviderCreateAccount(CSKavellAccountProviderRef provider,
                                                         CSKavellStringRef loginName)
{
    return _CSKavellAccountProviderCopyAccount(provider, loginName, true);
}

void _CSKavellAccountProviderAddAccount(CSKavellAccountProviderRef provider, CSKavellAccountRef account)
{
    if (!provider || !account)
        return;
    const auto accountType = adopt(_CSKavellAccountCopyProviderType(account));
    if (!CSKavellEqual(accountType.get(), provider->providerType.get()))
        return;
    const auto loginName = adopt(_CSKavellAccountCopyLoginName(account));
    const Guard guard(provider->lock);
    if (!accountOf(*provider, loginName.get()))
        appendAccount(*provider, account, loginName.get());
}

void _CSKavellAccountProviderRemoveAccount(CSKavellAccountProviderRef provider, CSKavellStringRef loginName)
{
    if (!provider || !loginName)
        return;
    const Guard guard(provider->lock);
    const auto account = takeAccount(*provider, loginName);
    _CSKavellAccountRemove(account.get());
    _CSKavellAccountCommitChanges(account.get());
}

void _CSKavellAccountProviderReloadAccountData(CSKavellAccountProviderRef provider)
{
    if (!provider)
        return;
    const Guard guard(provider->lock);
    dropAccounts(*provider);
    guarded([&] { CSKavellAccountProviderLoadAccountData(*provider); });
}
