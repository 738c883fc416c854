// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Lets equal keys of many property lists share one string: accounts use the same few keys over and over, and keys would
// be half of a loaded account. Bounded, so that hostile files only push others out. Used by the readers of property lists;
// any thread may make a KeyMaker, which serves that thread.

#ifndef KAVELL_PLATFORM_KEY_POOL_H
#define KAVELL_PLATFORM_KEY_POOL_H

#include <cstdint>
#include <mutex>
#include <string_view>

#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

/// Makes the keys of one document, out of the pool unless another thread is using it just then.
class KeyMaker {
public:
    KeyMaker();

    /// A string of text that is UTF-8; none when there is no memory for it.
    [[nodiscard]] Ref<CSKavellStringRef> key(std::string_view text) noexcept;

    /// Whether equal keys of the document are certainly one string, so that two strings are two keys.
    [[nodiscard]] bool sharesEqualKeys() const noexcept { return m_poolLock.owns_lock() && !m_hasReplaced; }

private:
    std::unique_lock<std::mutex> m_poolLock;
    uint8_t m_last = 0;          ///< the slot of the key that was made last; before the first, any one does
    bool m_hasReplaced = false;  ///< a key of this document may have left the pool
};

}  // namespace kavell

#endif
