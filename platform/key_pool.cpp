// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/key_pool.h"

#include <array>

#include "runtime/string_p.h"

namespace kavell {

namespace {

/// A key, and the slot of the one that came after it in a document before.
struct KeySlot {
    Ref<CSKavellStringRef> key;
    uint8_t next = 0;
};

struct KeyPool {
    std::mutex mutex;
    std::array<KeySlot, 256> slots;
};

KeyPool &keyPool()
{
    // Never destroyed: a thread may still be reading a file while the process exits.
    static auto *const pool = new KeyPool;
    return *pool;
}

}  // namespace

KeyMaker::KeyMaker() : m_poolLock(keyPool().mutex, std::try_to_lock)
{
}

Ref<CSKavellStringRef> KeyMaker::key(std::string_view text) noexcept
{
    if (!m_poolLock.owns_lock())
        return adopt(makeValidString(nullptr, text));
    auto &slots = keyPool().slots;
    const auto holds = [&](uint8_t slot) {
        return slots[slot].key && equalTexts(slots[slot].key->view(), text);
    };
    // Most documents have the keys of the one before in its order.
    uint8_t slot = slots[m_last].next;
    if (!holds(slot)) {
        slot = static_cast<uint8_t>(hashOfText(text) % slots.size());
        slots[m_last].next = slot;
    }
    if (!holds(slot)) {
        m_hasReplaced = m_hasReplaced || slots[slot].key;
        slots[slot].key = adopt(makeValidString(nullptr, text));
    }
    m_last = slot;
    return slots[slot].key;
}

}  // namespace kavell
