// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structure of dictionaries, for code that fills and walks them without going through the C interface.
//
//     entries   [key value] [key value] [-- gone --] [key value] …     in the order of setting
//     index     slot of a key's hash -> position in entries + 1        only past kMostScanned entries
//
// A handful of entries is scanned, which is faster than an index and a third of its size; attribute sets are that
// small. A removed entry of an indexed dictionary leaves a gap, which the next growth closes.

#ifndef KAVELL_RUNTIME_DICTIONARY_P_H
#define KAVELL_RUNTIME_DICTIONARY_P_H

#include <memory>
#include <vector>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

#include "runtime/object_p.h"

namespace kavell {

struct DictionaryEntry {
    CSKavellTypeRef key;    ///< retained; none in a gap
    CSKavellTypeRef value;  ///< retained
};

}  // namespace kavell

struct CSKavellDictionary : kavell::Object {
    std::vector<kavell::DictionaryEntry> entries{};
    std::vector<uint32_t> index{};  ///< a power of two of slots, or none
    uint32_t count = 0;             ///< entries that are not gaps

    /// Makes room for this many entries in all.
    void reserve(size_t entryCount) { entries.reserve(entryCount); }

    /// The entry of a key; null when there is none.
    [[nodiscard]] const kavell::DictionaryEntry *find(CSKavellTypeRef key) const noexcept;

    /// Sets a key that is not none to a value that is not none, retaining both. May throw std::bad_alloc, and has then
    /// changed nothing.
    void set(CSKavellTypeRef key, CSKavellTypeRef value);

    /// The same for a key and a value whose references the caller gives away.
    void take(kavell::Ref<CSKavellTypeRef> key, kavell::Ref<CSKavellTypeRef> value);

    void remove(CSKavellTypeRef key) noexcept;

    /// Calls `body(key, value)` for each entry, in order.
    template <typename Body> void forEach(Body &&body) const
    {
        for (const kavell::DictionaryEntry &entry : entries) {
            if (entry.key)
                body(entry.key, entry.value);
        }
    }

private:
    static constexpr size_t kMostScanned = 8;

    [[nodiscard]] size_t slotOf(CSKavellTypeRef key) const noexcept;
    void closeGaps() noexcept;
    void rebuildIndex();
};

#endif
