// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structure of dictionaries, for code that fills and walks them without going through the C interface.
//
//     entries   [key value] [key value] [-- gone --] [key value] …     in the order of setting
//     index     slot of a key's hash -> position in entries + 1        only past kMostScanned entries
//
// A handful of entries is scanned, which is faster than an index and a third of its size; attribute sets are that
// small. A removed entry of an indexed dictionary leaves a gap, which the next growth closes. The entries that a dictionary
// is made for stand right behind it, in the same memory; when it outgrows that room, they move into memory of their own.

#ifndef KAVELL_RUNTIME_DICTIONARY_P_H
#define KAVELL_RUNTIME_DICTIONARY_P_H

#include <memory>
#include <span>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

#include "runtime/object_block.h"
#include "runtime/object_p.h"

namespace kavell {

struct DictionaryEntry {
    CSKavellTypeRef key;    ///< retained; none in a gap
    CSKavellTypeRef value;  ///< retained
};

}  // namespace kavell

struct CSKavellDictionary : kavell::Object {
    uint32_t count = 0;      ///< entries that are not gaps
    uint32_t used = 0;       ///< entries, gaps included
    uint32_t capacity = 0;   ///< how many have room where they stand
    uint32_t slotCount = 0;  ///< of the index; a power of two, or none
    std::unique_ptr<kavell::DictionaryEntry[]>
        outgrown{};  ///< the entries, when the room behind the structure is too small
    std::unique_ptr<uint32_t[]> index{};

    /// An empty one with room for so many entries, of its own memory or in a block; none when there is no memory for it.
    [[nodiscard]] static CSKavellDictionary *make(uint16_t flags, size_t entryCount,
                                                  kavell::ObjectBlock *block = nullptr) noexcept;

    /// The entry of a key; null when there is none.
    [[nodiscard]] const kavell::DictionaryEntry *find(CSKavellTypeRef key) const noexcept;

    /// Sets a key that is not none to a value that is not none, retaining both. May throw std::bad_alloc, and has then
    /// changed nothing.
    void set(CSKavellTypeRef key, CSKavellTypeRef value);

    /// The same for a key and a value whose references the caller gives away.
    void take(kavell::Ref<CSKavellTypeRef> key, kavell::Ref<CSKavellTypeRef> value);

    /// The same for a key that is certainly not there yet.
    void takeNew(kavell::Ref<CSKavellTypeRef> key, kavell::Ref<CSKavellTypeRef> value);

    void remove(CSKavellTypeRef key) noexcept;

    /// All entries in order, gaps included.
    [[nodiscard]] std::span<const kavell::DictionaryEntry> entries() const noexcept
    {
        const auto *const behind = reinterpret_cast<const kavell::DictionaryEntry *>(this + 1);
        return {outgrown ? outgrown.get() : behind, used};
    }

    /// Calls `body(key, value)` for each entry, in order.
    template <typename Body> void forEach(Body &&body) const
    {
        for (const kavell::DictionaryEntry &entry : entries()) {
            if (entry.key)
                body(entry.key, entry.value);
        }
    }

private:
    static constexpr uint32_t kMostScanned = 8;

    [[nodiscard]] kavell::DictionaryEntry *mutableEntries() noexcept;
    [[nodiscard]] size_t slotOf(CSKavellTypeRef key) const noexcept;
    void makeRoom();
    void closeGaps() noexcept;
    void fillIndex() noexcept;
};

#endif
