// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellType.h>

#include <algorithm>
#include <bit>
#include <new>
#include <string>
#include <utility>
#include <vector>

#include "runtime/dictionary_p.h"
#include "runtime/string_p.h"

namespace kavell {

namespace {

/// What a dictionary has room for that nobody gave a number for.
constexpr uint32_t kUsualRoom = 4;

/// Positions, of which each is one more than the entry's, and the slots of the index, which are fewer than four times as
/// many, must fit into their fields, and their bytes into a length.
constexpr size_t kMostEntries = std::min<size_t>(UINT32_MAX / 4, SIZE_MAX / sizeof(DictionaryEntry) / 2);

// A stable hash of any key; a string's is cached in it.
uint32_t keyHash(CSKavellTypeRef key) noexcept
{
    if (isType(key, kTypeString))
        return static_cast<CSKavellStringRef>(key)->hash();
    const uint64_t hash = CSKavellHash(key);
    return static_cast<uint32_t>(hash ^ (hash >> 32));
}

/// Whether a key is this text.
bool isText(CSKavellTypeRef key, const CSKavellString &text) noexcept
{
    return key == &text || (isType(key, kTypeString) && equalStrings(*static_cast<CSKavellStringRef>(key), text));
}

/// The entry of a text among some without gaps.
const DictionaryEntry *scanFor(const CSKavellString &key, std::span<const DictionaryEntry> entries) noexcept
{
    for (const DictionaryEntry &entry : entries) {
        if (isText(entry.key, key))
            return &entry;
    }
    return nullptr;
}

/// The same for a key of another type.
const DictionaryEntry *scanFor(CSKavellTypeRef key, std::span<const DictionaryEntry> entries) noexcept
{
    const auto found =
        std::ranges::find_if(entries, [key](const DictionaryEntry &entry) { return CSKavellEqual(entry.key, key); });
    return found != entries.end() ? &*found : nullptr;
}

bool sameKey(CSKavellTypeRef first, CSKavellTypeRef second) noexcept
{
    return isType(second, kTypeString) ? isText(first, *static_cast<CSKavellStringRef>(second))
                                       : CSKavellEqual(first, second);
}

}  // namespace

}  // namespace kavell

using namespace kavell;

static_assert(sizeof(CSKavellDictionary) % alignof(DictionaryEntry) == 0, "entries stand right behind the structure");

CSKavellDictionary *CSKavellDictionary::make(uint16_t flags, size_t entryCount, ObjectBlock *block) noexcept
{
    if (entryCount > kMostEntries)
        return nullptr;
    const size_t room = entryCount * sizeof(DictionaryEntry);
    auto *dictionary = block ? makeObject<CSKavellDictionary>(*block, kTypeDictionary, room)
                             : makeObject<CSKavellDictionary>(nullptr, kTypeDictionary, room);
    if (dictionary) {
        dictionary->flags |= flags;
        dictionary->capacity = static_cast<uint32_t>(entryCount);
    }
    return dictionary;
}

DictionaryEntry *CSKavellDictionary::mutableEntries() noexcept
{
    return const_cast<DictionaryEntry *>(entries().data());
}

/// The slot that holds the key's position, or the empty slot where it would go. There is always an empty one.
size_t CSKavellDictionary::slotOf(CSKavellTypeRef key) const noexcept
{
    const size_t mask = slotCount - 1;
    size_t slot = keyHash(key) & mask;
    while (index[slot] != 0) {
        const CSKavellTypeRef other = entries()[index[slot] - 1].key;
        if (other && sameKey(other, key))
            break;
        slot = (slot + 1) & mask;
    }
    return slot;
}

const DictionaryEntry *CSKavellDictionary::find(CSKavellTypeRef key) const noexcept
{
    if (slotCount > 0) {
        const uint32_t position = index[slotOf(key)];
        return position ? &entries()[position - 1] : nullptr;
    }
    return isType(key, kTypeString) ? scanFor(*static_cast<CSKavellStringRef>(key), entries())
                                    : scanFor(key, entries());
}

void CSKavellDictionary::set(CSKavellTypeRef key, CSKavellTypeRef value)
{
    take(retain(key), retain(value));
}

void CSKavellDictionary::take(Ref<CSKavellTypeRef> key, Ref<CSKavellTypeRef> value)
{
    if (auto *existing = const_cast<DictionaryEntry *>(find(key.get())))
        CSKavellRelease(std::exchange(existing->value, value.leak()));
    else
        takeNew(std::move(key), std::move(value));
}

void CSKavellDictionary::takeNew(Ref<CSKavellTypeRef> key, Ref<CSKavellTypeRef> value)
{
    makeRoom();
    if (slotCount > 0)
        index[slotOf(key.get())] = used + 1;
    // The dictionary owns them from here on.
    mutableEntries()[used++] = {key.leak(), value.leak()};
    ++count;
}

void CSKavellDictionary::remove(CSKavellTypeRef key) noexcept
{
    const DictionaryEntry *found = find(key);
    if (!found)
        return;
    const DictionaryEntry removed = *found;
    const auto position = static_cast<size_t>(found - entries().data());
    DictionaryEntry *const all = mutableEntries();
    if (slotCount > 0)
        all[position] = {};
    else
        std::copy(all + position + 1, all + used--, all + position);
    if (--count == 0) {
        used = slotCount = 0;
        index.reset();
    }
    CSKavellRelease(removed.key);
    CSKavellRelease(removed.value);
}

/// Makes room for one entry more, in the index too. May throw std::bad_alloc, and has then changed nothing that shows.
void CSKavellDictionary::makeRoom()
{
    if (used == capacity && count < used)
        closeGaps();
    if (used == capacity) {
        if (used > kMostEntries / 2)
            throw std::bad_alloc();
        const uint32_t larger = std::max(2 * capacity, kUsualRoom);
        auto moved = std::make_unique_for_overwrite<DictionaryEntry[]>(larger);
        std::ranges::copy(entries(), moved.get());
        outgrown = std::move(moved);
        capacity = larger;
    }
    const size_t needed = size_t{used} + 1;
    if (needed > kMostScanned && (needed + 1) * 4 > size_t{slotCount} * 3) {
        const size_t slots = std::bit_ceil(needed * 2);
        index = std::make_unique<uint32_t[]>(slots);
        slotCount = static_cast<uint32_t>(slots);
        fillIndex();
    }
}

void CSKavellDictionary::closeGaps() noexcept
{
    DictionaryEntry *const all = mutableEntries();
    used = static_cast<uint32_t>(
        std::remove_if(all, all + used, [](const DictionaryEntry &entry) { return !entry.key; }) - all);
    // Positions have moved; there are fewer of them than before, so the index has room.
    std::fill_n(index.get(), slotCount, 0);
    fillIndex();
}

/// Puts the position of each entry into the index, which is empty.
void CSKavellDictionary::fillIndex() noexcept
{
    for (uint32_t position = 0; position < used; ++position) {
        if (const CSKavellTypeRef key = entries()[position].key)
            index[slotOf(key)] = position + 1;
    }
}

namespace kavell {

namespace {

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
    return std::ranges::all_of(one->entries(), [other](const DictionaryEntry &entry) {
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
    CSKavellDictionary *dictionary = CSKavellDictionary::make(0, count);
    const bool filled = dictionary && guarded(false, [&] {
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
    return CSKavellDictionary::make(kObjectIsMutable, kUsualRoom);
}

CSKavellMutableDictionaryRef CSKavellDictionaryCreateMutableCopy(CSKavellDictionaryRef dictionary)
{
    CSKavellDictionary *copy = dictionary ? CSKavellDictionary::make(kObjectIsMutable, dictionary->count) : nullptr;
    const bool filled =
        copy && guarded(false, [&] {
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
