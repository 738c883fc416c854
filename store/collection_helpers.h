// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Small helpers over containers that live in a slot: a variable that owns a container or holds none. The removal
// helpers empty a slot whose container became empty, so that present usually means non-empty; the setting and merging
// ones do not. Used by the records of store/, under the record's lock. All may throw nothing; an out-of-memory changes
// nothing.

#ifndef KAVELL_STORE_COLLECTION_HELPERS_H
#define KAVELL_STORE_COLLECTION_HELPERS_H

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

using ArraySlot = Ref<CSKavellMutableArrayRef>;
using DictionarySlot = Ref<CSKavellMutableDictionaryRef>;

/// Empties the slot.
template <typename Pointer> void ReleaseAndClear(Ref<Pointer> &slot) noexcept
{
    slot = nullptr;
}

[[nodiscard]] Ref<CSKavellArrayRef> EmptyArray() noexcept;
[[nodiscard]] Ref<CSKavellDictionaryRef> EmptyDictionary() noexcept;
[[nodiscard]] ArraySlot NewMutableArray() noexcept;
[[nodiscard]] DictionarySlot NewMutableDictionary() noexcept;

/// The dictionary's keys in its order; an empty array for none.
[[nodiscard]] Ref<CSKavellArrayRef> CopyDictKeys(CSKavellDictionaryRef dictionary) noexcept;

/// Sets every pair of the dictionary in the slot's. An empty slot receives a copy, even of an empty dictionary; none
/// does nothing.
void MergeDictKeys(DictionarySlot &slot, CSKavellDictionaryRef dictionary) noexcept;

/// Whether an equal value is in the array; false for none.
[[nodiscard]] bool ArrayContainsValue(CSKavellArrayRef array, CSKavellTypeRef value) noexcept;

/// The key's value, borrowed; none for none.
[[nodiscard]] CSKavellTypeRef GetDictValue(CSKavellDictionaryRef dictionary, CSKavellTypeRef key) noexcept;

/// Appends the value unless an equal one is there, making the array if need be.
void AddArrayValue(ArraySlot &slot, CSKavellTypeRef value) noexcept;

/// Adds each value that is not there yet, in order. An empty slot receives a copy of the array as it is, duplicates
/// included; none does nothing.
void MergeArrayValues(ArraySlot &slot, CSKavellArrayRef array) noexcept;

/// Removes each of the keys.
void RemoveDictKeys(DictionarySlot &slot, CSKavellArrayRef keys) noexcept;

/// For each value, from the last to the first, removes the first equal one.
void RemoveArrayValues(ArraySlot &slot, CSKavellArrayRef values) noexcept;

/// Removes the first equal value. An array that was already empty is let go too.
void RemoveArrayValue(ArraySlot &slot, CSKavellTypeRef value) noexcept;

/// Removes the key.
void RemoveDictKey(DictionarySlot &slot, CSKavellTypeRef key) noexcept;

/// Sets the key, making the dictionary if need be; a none value removes the key.
void SetDictKey(DictionarySlot &slot, CSKavellTypeRef key, CSKavellTypeRef value) noexcept;

}  // namespace kavell

#endif
