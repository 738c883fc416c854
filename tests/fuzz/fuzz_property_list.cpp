// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A data file of any bytes: it parses or it does not, and what parses can be written and parsed again to the same
// value, unless it holds what a property list cannot keep.

#include <cstdint>
#include <cstdlib>
#include <string_view>

#include <kavellaccounts/CSKavellType.h>

#include "platform/property_list.h"

using namespace kavell;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const auto first = parsePropertyList({reinterpret_cast<const char *>(data), size});
    std::string xml;
    if (!first || !writePropertyList(first.get(), xml))
        return 0;
    const auto second = parsePropertyList(xml);
    if (!second || !CSKavellEqual(first.get(), second.get()))
        std::abort();
    return 0;
}
