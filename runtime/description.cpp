// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The description that any object has, whatever its type.

#include <array>
#include <cstdio>

#include <kavellaccounts/CSKavellType.h>

#include "runtime/object_p.h"

namespace kavell {

// A container may hold itself; a description ends all the same.
constexpr int kDeepestDescription = 64;

void describeObject(CSKavellTypeRef object, int depth, std::string &text)
{
    if (!object) {
        text += "(null)";
        return;
    }
    const TypeOperations &operations = typeOperations(object);
    if (operations.describe && depth < kDeepestDescription) {
        operations.describe(object, depth, text);
        return;
    }
    std::array<char, 32> address;
    std::snprintf(address.data(), address.size(), " %p>", object);
    text += '<';
    text += operations.name;
    text += address.data();
}

}  // namespace kavell
