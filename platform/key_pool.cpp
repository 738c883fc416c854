// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/key_pool.h"

#include <array>

#include "runtime/string_p.h"

namespace kavell {

namespace {

struct KeyPool {
    std::mutex mutex;
    std::array<Ref<CSKavellStringRef>, 256> slots;
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
    Ref<CSKavellStringRef> &slot = slots[hashOfText(text) % slots.size()];
    if (slot && equalTexts(slot->view(), text))
        return slot;
    return slot = adopt(makeValidString(nullptr, text));
}

}  // namespace kavell
