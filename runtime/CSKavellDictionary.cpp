// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellType.h>

#include <algorithm>
#include <bit>

#include "runtime/dictionary_p.h"
#include "runtime/string_p.h"

namespace kavell {

namespace {

// A stable hash of any key; a string's is cached in it.
uint32_t keyHash(CSKavellTypeRef key) noexcept
{
    if (isType(key, kTypeString))
        return static_cast<CSKavellStringRef>(key)->hash();
    const uint64_t hash = CSKavellHash(key);
    return static_cast<uint32_t>(hash ^ (hash >> 32));
}

bool sameKey(CSKavellTypeRef first, CSKavellTypeRef second) noexcept
{
    if (first == second)
        return true;
    if (!isType(first, kTypeString) || !isType(second, kTypeString))
        return CSKavellEqual(first, second);
    return equalStrings(*static_cast<CSKavellStringRef>(first), *static_cast<CSKavellStringRef>(second));
}

}  // namespace

}  // namespace kavell

using namespace kavell;

/// The slot that holds the key's position, or the empty slot where it would go. There is always an empty one.
size_t CSKavellDictionary::slotOf(CSKavellTypeRef key) const noexcept
{
    const size_t mask = index.size() - 1;
    size_t slot = keyHash(key) & mask;
    while (index[slot] != 0) {
        const CSKavellTypeRef other = entries[index[slot] - 1].key;
        if (other && sameKey(other, key))
            break;
        slot = (slot + 1) & mask;
    }
    return slot;
}

const DictionaryEntry *CSKavellDictionary::find(CSKavellTypeRef key) const noexcept
{
    if (!index.empty()) {
        const uint32_t position = index[slotOf(key)];
        return position ? &entries[position - 1] : nullptr;
    }
    for (const DictionaryEntry &entry : entries) {
        if (sameKey(entry.key, key))
            return &entry;
    }
    return nullptr;
}

void CSKavellDictionary::set(CSKavellTypeRef key, CSKavellTypeRef value)
{
    take(retain(key), retain(value));
}

void CSKavellDictionary::take(Ref<CSKavellTypeRef> key, Ref<CSKavellTypeRef> value)
{
    if (auto *existing = const_cast<DictionaryEntry *>(find(key.get()))) {
        CSKavellRelease(std::exchange(existing->value, value.leak()));
        return;
    }
    if (entries.size() == entries.capacity() && count < entries.size())
        closeGaps();
    entries.push_back({key.get(), value.get()});
    try {
        if (entries.size() > kMostScanned && (entries.size() + 1) * 4 > index.size() * 3)
            rebuildIndex();
        else if (!index.empty())
            index[slotOf(key.get())] = static_cast<uint32_t>(entries.size());
    } catch (...) {
        entries.pop_back();
        throw;
    }
    // The dictionary owns them from here on.
    static_cast<void>(key.leak());
    static_cast<void>(value.leak());
    ++count;
}

void CSKavellDictionary::remove(CSKavellTypeRef key) noexcept
{
    const DictionaryEntry *found = find(key);
    if (!found)
        return;
    const DictionaryEntry removed = *found;
    if (index.empty())
        entries.erase(entries.begin() + (found - entries.data()));
    else
        entries[static_cast<size_t>(found - entries.data())] = {};
    --count;
    if (count == 0) {
        entries.clear();
        index.clear();
    }
    CSKavellRelease(removed.key);
    CSKavellRelease(removed.value);
}

void CSKavellDictionary::closeGaps() noexcept
{
    std::erase_if(entries, [](const DictionaryEntry &entry) { return !entry.key; });
    // Positions have moved; there are fewer of them than before, so the index has room.
    std::fill(index.begin(), index.end(), 0);
    for (size_t position = 0; position < entries.size() && !index.empty(); ++position)
        index[slotOf(entries[position].key)] = static_cast<uint32_t>(position + 1);
}

void CSKavellDictionary::rebuildIndex()
{
    index = std::vector<uint32_t>(std::bit_ceil(entries.size() * 2), 0);
    for (size_t position = 0; position < entries.size(); ++position) {
        if (entries[position].key)
            index[slotOf(entries[position].key)] = static_cast<uint32_t>(position + 1);
    }
}

namespace kavell {

namespace {

CSKavellDictionary *makeDictionary(uint16_t flags) noexcept
{
    auto *dictionary = makeObject<CSKavellDictionary>(nullptr, kTypeDictionary, 0);
    if (dictionary)
        dictionary->flags |= flags;
    return dictionary;
}

CSKavellTypeRef copyDictionary(const CSKavellAllocator *, CSKavellTypeRef object)
{
    return CSKavellDictionaryCreateMutableCopy(static_cast<CSKavellDictionaryRef>(object));
}

void finaliseDictionary(Object *object)
{
    auto *dictionary = static_cast<CSKavellDictionary *>(object);
    dictionary->forEach([](CSKavellTypeRef key, CSKavellTypeRef value) {
        CSKavellRelease(key);
        CSKavellRelease(value);
    });
    dictionary->~CSKavellDictionary();
}

bool dictionariesEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    const auto *one = static_cast<CSKavellDictionaryRef>(first), *other = static_cast<CSKavellDictionaryRef>(second);
    if (one->count != other->count)
        return false;
    return std::all_of(one->entries.begin(), one->entries.end(), [other](const DictionaryEntry &entry) {
        if (!entry.key)
            return true;
        const DictionaryEntry *match = other->find(entry.key);
        return match && CSKavellEqual(entry.value, match->value);
    });
}

uint64_t dictionaryHash(CSKavellTypeRef object)
{
    return static_cast<CSKavellDictionaryRef>(object)->count;
}

void describeDictionary(CSKavellTypeRef object, int depth, std::string &text)
{
    std::vector<std::pair<std::string, CSKavellTypeRef>> sorted;
    static_cast<CSKavellDictionaryRef>(object)->forEach([&](CSKavellTypeRef key, CSKavellTypeRef value) {
        std::string keyText;
        describeObject(key, depth + 1, keyText);
        sorted.emplace_back(std::move(keyText), value);
    });
    std::stable_sort(sorted.begin(), sorted.end(),
                     [](const auto &one, const auto &other) { return one.first < other.first; });
    text += '{';
    const char *separator = "";
    for (const auto &[key, value] : sorted) {
        text += separator + key + " = ";
        describeObject(value, depth + 1, text);
        separator = "; ";
    }
    text += '}';
}

}  // namespace

constinit const TypeOperations dictionaryOperations{"CSKavellDictionary", copyDictionary, finaliseDictionary,
                                                    dictionariesEqual,    dictionaryHash, describeDictionary};

}  // namespace kavell

CSKavellTypeID CSKavellDictionaryGetTypeID(void)
{
    return kTypeDictionary;
}

CSKavellDictionaryRef CSKavellDictionaryCreate(const CSKavellTypeRef *keys, const CSKavellTypeRef *values, size_t count)
{
    const auto hasNone = [count](const CSKavellTypeRef *list) {
        return !list || std::find(list, list + count, nullptr) != list + count;
    };
    if (count > 0 && (hasNone(keys) || hasNone(values)))
        return nullptr;
    CSKavellDictionary *dictionary = makeDictionary(0);
    const bool filled = dictionary && guarded(false, [&] {
                            dictionary->reserve(count);
                            for (size_t position = 0; position < count; ++position)
                                dictionary->set(keys[position], values[position]);
                            return true;
                        });
    if (!filled) {
        CSKavellRelease(dictionary);
        return nullptr;
    }
    return dictionary;
}

CSKavellMutableDictionaryRef CSKavellDictionaryCreateMutable(void)
{
    return makeDictionary(kObjectIsMutable);
}

CSKavellMutableDictionaryRef CSKavellDictionaryCreateMutableCopy(CSKavellDictionaryRef dictionary)
{
    CSKavellDictionary *copy = dictionary ? makeDictionary(kObjectIsMutable) : nullptr;
    const bool filled =
        copy && guarded(false, [&] {
            copy->reserve(dictionary->count);
            dictionary->forEach([copy](CSKavellTypeRef key, CSKavellTypeRef value) { copy->set(key, value); });
            return true;
        });
    if (!filled) {
        CSKavellRelease(copy);
        return nullptr;
    }
    return copy;
}

size_t CSKavellDictionaryGetCount(CSKavellDictionaryRef dictionary)
{
    return dictionary ? dictionary->count : 0;
}

CSKavellTypeRef CSKavellDictionaryGetValue(CSKavellDictionaryRef dictionary, CSKavellTypeRef key)
{
    const DictionaryEntry *entry = dictionary && key ? dictionary->find(key) : nullptr;
    return entry ? entry->value : nullptr;
}

void CSKavellDictionaryGetKeysAndValues(CSKavellDictionaryRef dictionary, CSKavellTypeRef *keys,
                                        CSKavellTypeRef *values)
{
    if (!dictionary)
        return;
    dictionary->forEach([&](CSKavellTypeRef key, CSKavellTypeRef value) {
        if (keys)
            *keys++ = key;
        if (values)
            *values++ = value;
    });
}

void CSKavellDictionarySetValue(CSKavellMutableDictionaryRef dictionary, CSKavellTypeRef key, CSKavellTypeRef value)
{
    if (dictionary && key && value && (dictionary->flags & kObjectIsMutable))
        guarded([&] { dictionary->set(key, value); });
}

void CSKavellDictionaryRemoveValue(CSKavellMutableDictionaryRef dictionary, CSKavellTypeRef key)
{
    if (dictionary && key && (dictionary->flags & kObjectIsMutable))
        dictionary->remove(key);
}
