// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "store/collection_helpers.h"

#include "runtime/dictionary_p.h"

namespace kavell {

namespace {

void removeFirstEqual(CSKavellMutableArrayRef array, CSKavellTypeRef value) noexcept
{
    CSKavellArrayRemoveValueAtIndex(array, CSKavellArrayGetFirstIndexOfValue(array, value));
}

void collapse(ArraySlot &slot) noexcept
{
    if (CSKavellArrayGetCount(slot.get()) == 0)
        ReleaseAndClear(slot);
}

void collapse(DictionarySlot &slot) noexcept
{
    if (CSKavellDictionaryGetCount(slot.get()) == 0)
        ReleaseAndClear(slot);
}

}  // namespace

Ref<CSKavellArrayRef> EmptyArray() noexcept
{
    return adopt(CSKavellArrayCreate(nullptr, 0));
}

Ref<CSKavellDictionaryRef> EmptyDictionary() noexcept
{
    return adopt(CSKavellDictionaryCreate(nullptr, nullptr, 0));
}

ArraySlot NewMutableArray() noexcept
{
    return adopt(CSKavellArrayCreateMutable());
}

DictionarySlot NewMutableDictionary() noexcept
{
    return adopt(CSKavellDictionaryCreateMutable());
}

Ref<CSKavellArrayRef> CopyDictKeys(CSKavellDictionaryRef dictionary) noexcept
{
    ArraySlot keys = NewMutableArray();
    if (dictionary) {
        dictionary->forEach([&](CSKavellTypeRef key, CSKavellTypeRef) { CSKavellArrayAppendValue(keys.get(), key); });
    }
    return keys;
}

void MergeDictKeys(DictionarySlot &slot, CSKavellDictionaryRef dictionary) noexcept
{
    if (!dictionary)
        return;
    if (!slot) {
        slot = adopt(CSKavellDictionaryCreateMutableCopy(dictionary));
        return;
    }
    dictionary->forEach(
        [&](CSKavellTypeRef key, CSKavellTypeRef value) { CSKavellDictionarySetValue(slot.get(), key, value); });
}

bool ArrayContainsValue(CSKavellArrayRef array, CSKavellTypeRef value) noexcept
{
    return CSKavellArrayGetFirstIndexOfValue(array, value) < CSKavellArrayGetCount(array);
}

CSKavellTypeRef GetDictValue(CSKavellDictionaryRef dictionary, CSKavellTypeRef key) noexcept
{
    return CSKavellDictionaryGetValue(dictionary, key);
}

void AddArrayValue(ArraySlot &slot, CSKavellTypeRef value) noexcept
{
    if (!slot)
        slot = NewMutableArray();
    if (!ArrayContainsValue(slot.get(), value))
        CSKavellArrayAppendValue(slot.get(), value);
}

void MergeArrayValues(ArraySlot &slot, CSKavellArrayRef array) noexcept
{
    if (!array)
        return;
    if (!slot) {
        slot = adopt(CSKavellArrayCreateMutableCopy(array));
        return;
    }
    for (size_t index = 0; index < CSKavellArrayGetCount(array); ++index)
        AddArrayValue(slot, CSKavellArrayGetValueAtIndex(array, index));
}

void RemoveDictKeys(DictionarySlot &slot, CSKavellArrayRef keys) noexcept
{
    if (!slot || !keys)
        return;
    for (size_t index = 0; index < CSKavellArrayGetCount(keys); ++index)
        CSKavellDictionaryRemoveValue(slot.get(), CSKavellArrayGetValueAtIndex(keys, index));
    collapse(slot);
}

void RemoveArrayValues(ArraySlot &slot, CSKavellArrayRef values) noexcept
{
    if (!slot || !values)
        return;
    for (size_t index = CSKavellArrayGetCount(values); index-- > 0;)
        removeFirstEqual(slot.get(), CSKavellArrayGetValueAtIndex(values, index));
    collapse(slot);
}

void RemoveArrayValue(ArraySlot &slot, CSKavellTypeRef value) noexcept
{
    if (!slot)
        return;
    removeFirstEqual(slot.get(), value);
    collapse(slot);
}

void RemoveDictKey(DictionarySlot &slot, CSKavellTypeRef key) noexcept
{
    if (!slot)
        return;
    CSKavellDictionaryRemoveValue(slot.get(), key);
    collapse(slot);
}

void SetDictKey(DictionarySlot &slot, CSKavellTypeRef key, CSKavellTypeRef value) noexcept
{
    if (!value) {
        RemoveDictKey(slot, key);
        return;
    }
    if (!slot)
        slot = NewMutableDictionary();
    CSKavellDictionarySetValue(slot.get(), key, value);
}

}  // namespace kavell
