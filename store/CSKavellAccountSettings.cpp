// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "store/CSKavellAccountSettings_p.h"

#include <kavellaccounts/CSKavellType.h>

#include "runtime/dictionary_p.h"

using namespace kavell;

namespace {

CSKavellTypeRef copySettings(const CSKavellAllocator *allocator, CSKavellTypeRef object)
{
    // Copying changes nothing in the source; only the C signature, shared with the setters, is not const.
    auto *settings = static_cast<const CSKavellAccountSettings *>(object);
    return CSKavellAccountSettingsCreateCopy(allocator, const_cast<CSKavellAccountSettingsRef>(settings));
}

constinit const TypeOperations settingsOperations{
    .name = "CSKavellAccountSettings",
    .copy = copySettings,
    .finalise = destroyFields<CSKavellAccountSettings>,
    .hash = addressHash,
};

constinit LazyType settingsType(settingsOperations);

void dropPendingChanges(CSKavellAccountSettings &settings) noexcept
{
    ReleaseAndClear(settings.changedAttributes);
    ReleaseAndClear(settings.removedKeys);
}

/// The committed attributes for a reader to keep. They are the record's own, which cannot be changed from here on, and
/// which the record replaces by a copy when it has to change them: most are read many times and never changed.
CSKavellDictionaryRef shareAttributes(const CSKavellAccountSettings &settings) noexcept
{
    CSKavellMutableDictionaryRef attributes = settings.attributes.get();
    // Others may be reading what was shared before, so that it is not written to again.
    if (attributes->flags & kObjectIsMutable)
        attributes->flags &= static_cast<uint16_t>(~kObjectIsMutable);
    return Ref<CSKavellDictionaryRef>(settings.attributes).leak();
}

/// Gives the record committed attributes that nobody else has; false when there is no memory for them.
bool unshareAttributes(CSKavellAccountSettings &settings) noexcept
{
    if (!settings.attributes || (settings.attributes->flags & kObjectIsMutable))
        return true;
    auto own = adopt(CSKavellDictionaryCreateMutableCopy(settings.attributes.get()));
    if (!own)
        return false;
    settings.attributes = std::move(own);
    return true;
}

}  // namespace

CSKavellTypeID _CSKavellAccountSettingsGetTypeID(void)
{
    return settingsType.typeID();
}

CSKavellAccountSettingsRef CSKavellAccountSettingsCreate(const CSKavellAllocator *allocator)
{
    return makeObject<CSKavellAccountSettings>(allocator, settingsType.typeID(), 0);
}

CSKavellAccountSettingsRef CSKavellAccountSettingsCreateCopy(const CSKavellAllocator *allocator,
                                                             CSKavellAccountSettingsRef settings)
{
    if (!settings)
        return nullptr;
    CSKavellAccountSettingsRef copy = CSKavellAccountSettingsCreate(allocator);
    const auto effective = adopt(CSKavellAccountSettingsCopyAttributes(settings));
    if (copy && CSKavellDictionaryGetCount(effective.get()) > 0)
        CSKavellAccountSettingsUpdateAttributes(copy, effective.get());
    return copy;
}

bool CSKavellAccountSettingsHasChanges(CSKavellAccountSettingsRef settings)
{
    return settings && (settings->changedAttributes || settings->removedKeys);
}

bool CSKavellAccountSettingsHasAttributes(CSKavellAccountSettingsRef settings)
{
    return settings && (settings->attributes || settings->changedAttributes);
}

bool CSKavellAccountSettingsHasAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key)
{
    if (!settings || !key)
        return false;
    if (GetDictValue(settings->changedAttributes.get(), key))
        return true;
    return !ArrayContainsValue(settings->removedKeys.get(), key) && GetDictValue(settings->attributes.get(), key);
}

CSKavellTypeRef CSKavellAccountSettingsCopyAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key)
{
    if (!settings || !key || ArrayContainsValue(settings->removedKeys.get(), key))
        return nullptr;
    CSKavellTypeRef value = GetDictValue(settings->changedAttributes.get(), key);
    if (!value)
        value = GetDictValue(settings->attributes.get(), key);
    return CSKavellRetain(value);
}

CSKavellDictionaryRef CSKavellAccountSettingsCopyAttributes(CSKavellAccountSettingsRef settings)
{
    if (!settings)
        return nullptr;
    if (settings->attributes && !CSKavellAccountSettingsHasChanges(settings) && settings->attributes->count > 0)
        return shareAttributes(*settings);
    DictionarySlot effective;
    MergeDictKeys(effective, settings->attributes.get());
    MergeDictKeys(effective, settings->changedAttributes.get());
    RemoveDictKeys(effective, settings->removedKeys.get());
    if (CSKavellDictionaryGetCount(effective.get()) == 0)
        return EmptyDictionary().leak();
    return effective.leak();
}

void CSKavellAccountSettingsSetAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key,
                                         CSKavellTypeRef value)
{
    if (!settings || !key)
        return;
    if (!value) {
        CSKavellAccountSettingsRemoveAttribute(settings, key);
        return;
    }
    SetDictKey(settings->changedAttributes, key, value);
    RemoveArrayValue(settings->removedKeys, key);
}

void CSKavellAccountSettingsRemoveAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key)
{
    if (!settings || !key)
        return;
    AddArrayValue(settings->removedKeys, key);
    RemoveDictKey(settings->changedAttributes, key);
}

void CSKavellAccountSettingsSetAttributes(CSKavellAccountSettingsRef settings, CSKavellDictionaryRef attributes)
{
    if (!settings || !attributes)
        return;
    dropPendingChanges(*settings);
    MergeDictKeys(settings->changedAttributes, attributes);
    const auto keys = CopyDictKeys(settings->attributes.get());
    for (size_t index = CSKavellArrayGetCount(keys.get()); index-- > 0;) {
        CSKavellTypeRef key = CSKavellArrayGetValueAtIndex(keys.get(), index);
        if (!GetDictValue(attributes, key))
            AddArrayValue(settings->removedKeys, key);
    }
}

void CSKavellAccountSettingsRemoveAllAttributes(CSKavellAccountSettingsRef settings)
{
    if (!settings)
        return;
    dropPendingChanges(*settings);
    const auto keys = CopyDictKeys(settings->attributes.get());
    if (CSKavellArrayGetCount(keys.get()) > 0)
        MergeArrayValues(settings->removedKeys, keys.get());
}

void CSKavellAccountSettingsCommitChanges(CSKavellAccountSettingsRef settings)
{
    if (!settings || !CSKavellAccountSettingsHasChanges(settings) || !unshareAttributes(*settings))
        return;
    MergeDictKeys(settings->attributes, settings->changedAttributes.get());
    ReleaseAndClear(settings->changedAttributes);
    RemoveDictKeys(settings->attributes, settings->removedKeys.get());
    ReleaseAndClear(settings->removedKeys);
}

void CSKavellAccountSettingsCancelChanges(CSKavellAccountSettingsRef settings)
{
    if (settings)
        dropPendingChanges(*settings);
}

void CSKavellAccountSettingsUpdateAttributes(CSKavellAccountSettingsRef settings, CSKavellDictionaryRef attributes)
{
    if (settings)
        settings->attributes = adopt(CSKavellDictionaryCreateMutableCopy(attributes));
}

void kavell::TakeAttributes(CSKavellAccountSettings &settings, CSKavellDictionaryRef attributes) noexcept
{
    if (attributes && (attributes->flags & kObjectIsMutable))
        settings.attributes = retain(const_cast<CSKavellMutableDictionaryRef>(attributes));
    else
        CSKavellAccountSettingsUpdateAttributes(&settings, attributes);
}
