// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A poster in a process of its own, for the tests of the bus mirror (a fork of the test would inherit GLib without its
// thread). "post-lines" posts each line of standard input as a name, "post-all-kinds" one notification with a value of
// each kind, "post-many COUNT" numbered ones, ending with 1 when the posting itself took 100 ms or more.

#include <chrono>
#include <cstdlib>
#include <iostream>
#include <string>

#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellNumber.h>
#include <kavellaccounts/Ref.h>

#include "platform/bus_mirror.h"

namespace {

using kavell::adopt;
using kavell::makeString;

void post(const std::string &name)
{
    kavell::mirrorToSessionBus(makeString(name).get(), nullptr, nullptr);
}

void postAllKinds()
{
    const auto information = adopt(CSKavellDictionaryCreateMutable());
    const auto set = [&](const char *key, CSKavellTypeRef value) {
        CSKavellDictionarySetValue(information.get(), makeString(key).get(), value);
        CSKavellRelease(value);
    };
    set("text", CSKavellStringCreateWithUTF8("päul"));
    set("integer", CSKavellNumberCreateWithInt64(-7));
    set("large", CSKavellNumberCreateWithUInt64(UINT64_MAX));
    set("real", CSKavellNumberCreateWithDouble(1.5));
    set("truth", CSKavellRetain(CSKavellBooleanGetShared(true)));
    set("data", CSKavellDataCreate("x", 1));
    kavell::mirrorToSessionBus(makeString("com.example.name").get(), makeString("object").get(), information.get());
}

bool postMany(int count)
{
    const auto start = std::chrono::steady_clock::now();
    for (int index = 0; index < count; ++index)
        post("post " + std::to_string(index));
    return std::chrono::steady_clock::now() - start < std::chrono::milliseconds(100);
}

}  // namespace

int main(int count, char **words)
{
    const std::string command = count > 1 ? words[1] : "";
    if (command == "post-all-kinds")
        postAllKinds();
    else if (command == "post-many" && count > 2)
        return postMany(std::atoi(words[2])) ? 0 : 1;
    else if (command == "post-lines") {
        for (std::string line; std::getline(std::cin, line);)
            post(line);
    } else
        return 2;
    return 0;
}
