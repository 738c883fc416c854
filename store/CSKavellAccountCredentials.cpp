// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account's password: an item of the credential store under the provider type and the login name, and a reference
// to it among the account's own attributes. The account's lock is held only while an item is searched for and added;
// reading and storing the reference takes the lock inside the attribute operations.

#include <kavellaccounts/CSKavellAccount.h>

#include <cstdio>
#include <cstring>
#include <mutex>

#include <string.h>

#include "store/CSKavellAccount_p.h"
#include "store/CSKavellCofferel_p.h"

namespace kavell {

namespace {

constexpr std::string_view kReferenceKey = "com.corvane.account.CofferelToken";

constexpr const char *kCannotModify = "Error: failed to modify existing cofferel entry\n";
constexpr const char *kCannotAdd = "Error: failed to add cofferel entry for kavell account\n";
constexpr const char *kNoItem = "Error: failed to create new cofferel entry\n";
constexpr const char *kNoReference = "Error: failed to store persistent cofferel item reference\n";

void complain(const char *message)
{
    std::fputs(message, stderr);
}

/// A password on its way to the store, overwritten afterwards.
class PasswordText {
public:
    explicit PasswordText(CSKavellStringRef password) : m_text(CreateUTF8CString(password)) {}
    ~PasswordText()
    {
        if (m_text)
            explicit_bzero(m_text.get(), std::strlen(m_text.get()));
    }
    PasswordText(const PasswordText &) = delete;
    PasswordText &operator=(const PasswordText &) = delete;

    explicit operator bool() const { return m_text != nullptr; }
    [[nodiscard]] std::string_view view() const { return m_text.get(); }

private:
    OwnedCString m_text;
};

/// The item that the account refers to; absent when it refers to none, or to nothing that could be an item.
CredentialStatus referredItem(CSKavellAccountRef account, Prompting prompting, CredentialItem &item)
{
    const auto value = adopt(_CSKavellAccountCopyProviderAttribute(account, makeString(kReferenceKey).get()));
    const auto reference = cast<CSKavellDataRef>(value.get(), CSKavellDataGetTypeID());
    return reference ? resolveCofferelItem(reference, prompting, item) : CredentialStatus::absent;
}

void removeReference(CSKavellAccountRef account)
{
    _CSKavellAccountRemoveProviderAttribute(account, makeString(kReferenceKey).get());
}

void setReference(CSKavellAccountRef account, CSKavellDataRef reference)
{
    _CSKavellAccountSetProviderAttribute(account, makeString(kReferenceKey).get(), reference);
}

void removePassword(CSKavellAccountRef account)
{
    CredentialItem item;
    const CredentialStatus status = referredItem(account, Prompting::allowed, item);
    removeReference(account);
    if (status == CredentialStatus::stored)
        static_cast<void>(deleteCofferelItem(item));
}

/// Puts the password into the item that bears the account's names, or into a new one. A search that fails is not taken
/// for an empty one: to add an item then could leave two.
CredentialStatus findOrAdd(CSKavellAccount &account, CredentialStore &store, std::string_view password,
                           CredentialItem &item)
{
    const std::lock_guard lock(account.lock);
    const OwnedCString serviceName = CreateUTF8CString(account.providerType.get());
    const OwnedCString accountName = CreateUTF8CString(account.loginName.get());
    if (!serviceName || !accountName)
        return CredentialStatus::failed;
    const CredentialStatus found = store.find(serviceName.get(), accountName.get(), item);
    if (found == CredentialStatus::stored)
        return store.replaceSecret(item, password);
    if (found == CredentialStatus::absent)
        return store.add(serviceName.get(), accountName.get(), password, item);
    return found;
}

/// Stores the password in the item of the account's names, and the reference to it in the account.
Ref<CSKavellCofferelItemRef> storeByName(CSKavellAccountRef account, CredentialStore &store, std::string_view password)
{
    CredentialItem item;
    if (findOrAdd(*account, store, password, item) != CredentialStatus::stored) {
        complain(kCannotAdd);
        complain(kNoItem);
        return nullptr;
    }
    const Ref<CSKavellDataRef> reference = copyCofferelReference(item);
    if (!reference) {
        complain(kNoReference);
        return nullptr;
    }
    setReference(account, reference.get());
    return makeCofferelItem(std::move(item));
}

Ref<CSKavellCofferelItemRef> setPassword(CSKavellAccountRef account, CSKavellStringRef password)
{
    if (CSKavellStringGetLength(password) == 0) {
        removePassword(account);
        return nullptr;
    }
    const std::shared_ptr<CredentialStore> store = defaultCredentialStore();
    if (!store || store->unlock(nullptr) != CredentialStatus::stored)
        return nullptr;
    CredentialItem item;
    const CredentialStatus resolved = referredItem(account, Prompting::allowed, item);
    const PasswordText text(password);
    if (!text)
        return nullptr;
    if (resolved == CredentialStatus::absent)
        return storeByName(account, *store, text.view());
    // The reference's store is locked or silent: that does not mean that the item is gone, so no other takes its place.
    if (resolved != CredentialStatus::stored)
        return nullptr;
    if (replaceCofferelSecret(item, text.view()) != CredentialStatus::stored) {
        complain(kCannotModify);
        return nullptr;
    }
    return makeCofferelItem(std::move(item));
}

/// The account's secret; any other status than stored says why there is none.
CredentialStatus readPassword(CSKavellAccountRef account, Prompting prompting, Secret &secret)
{
    CredentialItem item;
    const CredentialStatus status = referredItem(account, prompting, item);
    return status == CredentialStatus::stored ? readCofferelSecret(item, prompting, secret) : status;
}

}  // namespace

}  // namespace kavell

using namespace kavell;

CSKavellCofferelItemRef _CSKavellAccountCopyCofferelItem(CSKavellAccountRef account)
{
    return guarded(CSKavellCofferelItemRef{}, [&]() -> CSKavellCofferelItemRef {
        CredentialItem item;
        if (referredItem(account, Prompting::allowed, item) != CredentialStatus::stored)
            return nullptr;
        return makeCofferelItem(std::move(item)).leak();
    });
}

void _CSKavellAccountSetCofferelItem(CSKavellAccountRef account, CSKavellCofferelItemRef item)
{
    guarded([&] {
        const Ref<CSKavellDataRef> reference = item ? copyCofferelReference(item->item) : nullptr;
        if (reference)
            setReference(account, reference.get());
        else
            removeReference(account);
    });
}

CSKavellStringRef _CSKavellAccountCopyPassword(CSKavellAccountRef account)
{
    return guarded(CSKavellStringRef{}, [&]() -> CSKavellStringRef {
        Secret secret;
        if (readPassword(account, Prompting::allowed, secret) != CredentialStatus::stored)
            return nullptr;
        return CSKavellStringCreateSecret(secret.view().data(), secret.view().size());
    });
}

CSKavellCofferelItemRef _CSKavellAccountSetPassword(CSKavellAccountRef account, CSKavellStringRef password)
{
    if (!account)
        return nullptr;
    return guarded(CSKavellCofferelItemRef{}, [&] { return setPassword(account, password).leak(); });
}

void _CSKavellAccountRemovePassword(CSKavellAccountRef account)
{
    if (account)
        guarded([&] { removePassword(account); });
}

CSKavellCofferelStatus _CSKavellAccountGetPasswordStatus(CSKavellAccountRef account)
{
    return guarded(kCSKavellCofferelStatusFailed, [&] {
        Secret secret;
        return static_cast<CSKavellCofferelStatus>(readPassword(account, Prompting::forbidden, secret));
    });
}
