// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A property list of any bytes: it parses or it does not, and what parses can be written and parsed again to the same
// value. What the quick reader answers, the general one answers too.

#include <kavellaccounts/CSKavellType.h>

#include "platform/plain_property_list.h"
#include "platform/property_list.h"
#include "tests/fuzz/fuzz_target.h"

using namespace kavell;
using kavell::fuzz::require;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const auto first = parsePropertyList(fuzz::textOf(data, size));
    require(isPropertyList(fuzz::textOf(data, size)) == static_cast<bool>(first), "what is a property list parses");
    const auto plain = parsePlainPropertyList(fuzz::textOf(data, size));
    require(!plain || CSKavellEqual(plain.get(), parseAnyPropertyList(fuzz::textOf(data, size)).get()),
            "both readers answer the same value");
    if (!first)
        return 0;
    std::string xml;
    require(writePropertyList(first.get(), xml), "what parses can be written");
    const auto second = parsePropertyList(xml);
    require(second && CSKavellEqual(first.get(), second.get()), "what is written parses to the same value");
    return 0;
}
