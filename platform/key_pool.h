// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Lets equal keys of many property lists share one string: accounts use the same few keys over and over, and keys would
// be half of a loaded account. Bounded, so that hostile files only push others out. Used by the readers of property lists;
// any thread may make a KeyMaker, which serves that thread.

#ifndef KAVELL_PLATFORM_KEY_POOL_H
#define KAVELL_PLATFORM_KEY_POOL_H

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

private:
    std::unique_lock<std::mutex> m_poolLock;
};

}  // namespace kavell

#endif
