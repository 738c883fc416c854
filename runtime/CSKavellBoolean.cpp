// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellBoolean.h>

#include "runtime/object_p.h"

struct CSKavellBoolean : kavell::Object {
    bool value;
};

namespace kavell {

namespace {

constinit CSKavellBoolean trueObject{{{kImmortal}, kTypeBoolean, 0}, true};
constinit CSKavellBoolean falseObject{{{kImmortal}, kTypeBoolean, 0}, false};

void describeBoolean(CSKavellTypeRef object, int, std::string &text)
{
    text += static_cast<CSKavellBooleanRef>(object)->value ? '1' : '0';
}

}  // namespace

// There is one object of each value, so that identity is equality.
constinit const TypeOperations booleanOperations{
    "CSKavellBoolean", nullptr, nullptr, nullptr, nullptr, describeBoolean,
};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellBooleanGetTypeID(void)
{
    return kTypeBoolean;
}

CSKavellBooleanRef CSKavellBooleanGetShared(bool value)
{
    return value ? &trueObject : &falseObject;
}

bool CSKavellBooleanGetValue(CSKavellBooleanRef boolean)
{
    return boolean && boolean->value;
}
