// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "store/CSKavellCofferel_p.h"

#include <functional>

namespace kavell {

namespace {

constexpr bool matches(CredentialStatus inner, CSKavellCofferelStatus outer)
{
    return static_cast<int>(inner) == static_cast<int>(outer);
}
static_assert(matches(CredentialStatus::stored, kCSKavellCofferelStatusStored) &&
              matches(CredentialStatus::absent, kCSKavellCofferelStatusAbsent) &&
              matches(CredentialStatus::locked, kCSKavellCofferelStatusLocked) &&
              matches(CredentialStatus::refused, kCSKavellCofferelStatusRefused) &&
              matches(CredentialStatus::unreachable, kCSKavellCofferelStatusUnreachable) &&
              matches(CredentialStatus::failed, kCSKavellCofferelStatusFailed) &&
              matches(CredentialStatus::unsupported, kCSKavellCofferelStatusUnsupported));

CSKavellCofferelStatus toPublic(CredentialStatus status)
{
    return static_cast<CSKavellCofferelStatus>(status);
}

/// A C function's body: its status, or Failed when it throws.
template <typename Body> CSKavellCofferelStatus answering(Body &&body) noexcept
{
    return guarded(kCSKavellCofferelStatusFailed, [&] { return toPublic(body()); });
}

bool itemsEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    const CredentialItem &one = static_cast<CSKavellCofferelItemRef>(first)->item;
    const CredentialItem &other = static_cast<CSKavellCofferelItemRef>(second)->item;
    return first == second ||
           (!one.identifier.empty() && one.identifier == other.identifier && one.storeName == other.storeName);
}

uint64_t itemHash(CSKavellTypeRef object)
{
    const CredentialItem &item = static_cast<CSKavellCofferelItemRef>(object)->item;
    return item.identifier.empty() ? addressHash(object) : std::hash<std::string>()(item.identifier);
}

bool accessesEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    const auto one = static_cast<CSKavellCofferelAccessRef>(first);
    const auto other = static_cast<CSKavellCofferelAccessRef>(second);
    return CSKavellEqual(one->description.get(), other->description.get()) &&
           CSKavellEqual(one->groups.get(), other->groups.get());
}

uint64_t accessHash(CSKavellTypeRef object)
{
    return CSKavellHash(static_cast<CSKavellCofferelAccessRef>(object)->description.get());
}

constexpr TypeOperations itemOperations{
    "CSKavellCofferelItem", nullptr, destroyFields<CSKavellCofferelItem>, itemsEqual, itemHash, nullptr};
constexpr TypeOperations accessOperations{
    "CSKavellCofferelAccess", nullptr, destroyFields<CSKavellCofferelAccess>, accessesEqual, accessHash, nullptr};

constinit LazyType itemType(itemOperations);
constinit LazyType accessType(accessOperations);

/// Asks a store; when it is locked, has it unlocked and asks once more.
template <typename Question>
CredentialStatus askStore(CredentialStore *store, const CredentialItem *item, Prompting prompting, Question &&question)
{
    if (!store)
        return CredentialStatus::unreachable;
    CredentialStatus status = question(*store);
    if (status != CredentialStatus::locked || prompting == Prompting::forbidden)
        return status;
    status = store->unlock(item);
    return status == CredentialStatus::stored ? question(*store) : status;
}

/// The same for an item's own store, whichever store new items go to.
template <typename Question>
CredentialStatus askItsStore(const CredentialItem &item, Prompting prompting, Question &&question)
{
    const std::shared_ptr<CredentialStore> store = credentialStoreNamed(item.storeName);
    return askStore(store.get(), &item, prompting, std::forward<Question>(question));
}

/// The text of a string that can be handed to a store: it must not hold a NUL.
bool storeText(CSKavellStringRef string, std::string &text)
{
    text = toStdString(string);
    return string && text.find('\0') == std::string::npos;
}

CredentialAccess toCredentialAccess(CSKavellCofferelAccessRef access)
{
    CredentialAccess result{toStdString(access->description.get()), {}};
    const size_t count = CSKavellArrayGetCount(access->groups.get());
    for (size_t index = 0; index < count; ++index) {
        const auto group = cast<CSKavellStringRef>(CSKavellArrayGetValueAtIndex(access->groups.get(), index),
                                                   CSKavellStringGetTypeID());
        if (group)
            result.groups.push_back(toStdString(group));
    }
    return result;
}

Ref<CSKavellCofferelAccessRef> makeAccess(const CredentialAccess &access)
{
    const auto groups = adopt(CSKavellArrayCreateMutable());
    for (const std::string &group : access.groups)
        CSKavellArrayAppendValue(groups.get(), makeString(group).get());
    return adopt(CSKavellCofferelAccessCreate(makeString(access.description).get(), groups.get()));
}

}  // namespace

Ref<CSKavellCofferelItemRef> makeCofferelItem(CredentialItem item)
{
    CSKavellCofferelItemRef made = makeObject<CSKavellCofferelItem>(nullptr, itemType.typeID(), 0, std::move(item));
    return adopt(made);
}

CredentialStatus resolveCofferelItem(CSKavellDataRef reference, Prompting prompting, CredentialItem &item)
{
    const std::string_view text(reinterpret_cast<const char *>(CSKavellDataGetBytes(reference)),
                                CSKavellDataGetLength(reference));
    CredentialItem named;
    if (!reference || !parsePersistentReference(text, named.storeName, named.identifier))
        return CredentialStatus::absent;
    return askItsStore(named, prompting, [&](CredentialStore &store) { return store.resolve(named.identifier, item); });
}

CredentialStatus readCofferelSecret(const CredentialItem &item, Prompting prompting, Secret &secret)
{
    return askItsStore(item, prompting, [&](CredentialStore &store) { return store.readSecret(item, secret); });
}

CredentialStatus replaceCofferelSecret(const CredentialItem &item, std::string_view secret)
{
    return askItsStore(item, Prompting::allowed,
                       [&](CredentialStore &store) { return store.replaceSecret(item, secret); });
}

CredentialStatus deleteCofferelItem(const CredentialItem &item)
{
    return askItsStore(item, Prompting::allowed, [&](CredentialStore &store) { return store.remove(item); });
}

Ref<CSKavellDataRef> copyCofferelReference(const CredentialItem &item)
{
    const std::string reference = persistentReference(item);
    return reference.empty() ? nullptr : adopt(CSKavellDataCreate(reference.data(), reference.size()));
}

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellCofferelItemGetTypeID(void)
{
    return itemType.typeID();
}

CSKavellTypeID CSKavellCofferelAccessGetTypeID(void)
{
    return accessType.typeID();
}

const char *CSKavellCofferelStatusGetName(CSKavellCofferelStatus status)
{
    return credentialStatusName(static_cast<CredentialStatus>(status));
}

const char *CSKavellCofferelStoreGetName(void)
{
    // The stores' names are literals, so that a pointer into them holds for ever.
    return guarded(kNoStoreName, [] {
        const std::shared_ptr<CredentialStore> store = defaultCredentialStore();
        if (!store)
            return kNoStoreName;
        return store->name() == kSecretServiceStoreName ? kSecretServiceStoreName.data() : kVaultStoreName.data();
    });
}

CSKavellCofferelStatus CSKavellCofferelStoreUnlock(void)
{
    return answering([] {
        const std::shared_ptr<CredentialStore> store = defaultCredentialStore();
        return store ? store->unlock(nullptr) : CredentialStatus::unreachable;
    });
}

CSKavellCofferelStatus CSKavellCofferelStoreFindItem(CSKavellStringRef serviceName, CSKavellStringRef accountName,
                                                     CSKavellCofferelItemRef *item)
{
    return answering([&] {
        std::string service;
        std::string account;
        if (!storeText(serviceName, service) || !storeText(accountName, account))
            return CredentialStatus::absent;
        CredentialItem found;
        const CredentialStatus status =
            askStore(defaultCredentialStore().get(), nullptr, Prompting::allowed,
                     [&](CredentialStore &store) { return store.find(service, account, found); });
        if (status == CredentialStatus::stored && item)
            *item = makeCofferelItem(std::move(found)).leak();
        return status;
    });
}

CSKavellCofferelStatus CSKavellCofferelStoreCopyItems(CSKavellArrayRef *items)
{
    return answering([&] {
        std::vector<CredentialItem> found;
        const CredentialStatus status = askStore(defaultCredentialStore().get(), nullptr, Prompting::forbidden,
                                                 [&](CredentialStore &store) { return store.list(found); });
        if (status != CredentialStatus::stored || !items)
            return status;
        auto array = adopt(CSKavellArrayCreateMutable());
        for (CredentialItem &item : found)
            CSKavellArrayAppendValue(array.get(), makeCofferelItem(std::move(item)).get());
        *items = array.leak();
        return status;
    });
}

CSKavellCofferelStatus CSKavellCofferelItemResolve(CSKavellDataRef persistentReference, CSKavellCofferelItemRef *item)
{
    return answering([&] {
        CredentialItem found;
        const CredentialStatus status = resolveCofferelItem(persistentReference, Prompting::allowed, found);
        if (status == CredentialStatus::stored && item)
            *item = makeCofferelItem(std::move(found)).leak();
        return status;
    });
}

CSKavellDataRef CSKavellCofferelItemCopyPersistentReference(CSKavellCofferelItemRef item)
{
    return guarded(CSKavellDataRef{}, [&] { return item ? copyCofferelReference(item->item).leak() : nullptr; });
}

CSKavellStringRef CSKavellCofferelItemCopyServiceName(CSKavellCofferelItemRef item)
{
    return guarded(CSKavellStringRef{}, [&] { return item ? makeString(item->item.serviceName).leak() : nullptr; });
}

CSKavellStringRef CSKavellCofferelItemCopyAccountName(CSKavellCofferelItemRef item)
{
    return guarded(CSKavellStringRef{}, [&] { return item ? makeString(item->item.accountName).leak() : nullptr; });
}

CSKavellCofferelStatus CSKavellCofferelItemCopySecret(CSKavellCofferelItemRef item, CSKavellDataRef *secret)
{
    return answering([&] {
        if (!item)
            return CredentialStatus::absent;
        Secret bytes;
        const CredentialStatus status = readCofferelSecret(item->item, Prompting::allowed, bytes);
        if (status == CredentialStatus::stored && secret)
            *secret = CSKavellDataCreateSecret(bytes.view().data(), bytes.view().size());
        return status;
    });
}

CSKavellCofferelStatus CSKavellCofferelItemDelete(CSKavellCofferelItemRef item)
{
    return answering([&] { return item ? deleteCofferelItem(item->item) : CredentialStatus::absent; });
}

CSKavellCofferelStatus CSKavellCofferelItemCopyAccess(CSKavellCofferelItemRef item, CSKavellCofferelAccessRef *access)
{
    return answering([&] {
        if (!item)
            return CredentialStatus::absent;
        CredentialAccess kept;
        const CredentialStatus status = askItsStore(
            item->item, Prompting::allowed, [&](CredentialStore &store) { return store.readAccess(item->item, kept); });
        if (status == CredentialStatus::stored && access)
            *access = makeAccess(kept).leak();
        return status;
    });
}

CSKavellCofferelStatus CSKavellCofferelItemSetAccess(CSKavellCofferelItemRef item, CSKavellCofferelAccessRef access)
{
    return answering([&] {
        if (!item || !access)
            return CredentialStatus::absent;
        const CredentialAccess wanted = toCredentialAccess(access);
        return askItsStore(item->item, Prompting::allowed,
                           [&](CredentialStore &store) { return store.writeAccess(item->item, wanted); });
    });
}

CSKavellCofferelAccessRef CSKavellCofferelAccessCreate(CSKavellStringRef description, CSKavellArrayRef groups)
{
    if (!description || !groups)
        return nullptr;
    return guarded(CSKavellCofferelAccessRef{}, [&]() -> CSKavellCofferelAccessRef {
        // A copy: the caller may go on changing a mutable array.
        Ref<CSKavellArrayRef> copy = adopt(CSKavellArrayCreateMutableCopy(groups));
        return makeObject<CSKavellCofferelAccess>(nullptr, accessType.typeID(), 0, retain(description),
                                                  std::move(copy));
    });
}

CSKavellStringRef CSKavellCofferelAccessGetDescription(CSKavellCofferelAccessRef access)
{
    return access ? access->description.get() : nullptr;
}

CSKavellArrayRef CSKavellCofferelAccessGetGroups(CSKavellCofferelAccessRef access)
{
    return access ? access->groups.get() : nullptr;
}
