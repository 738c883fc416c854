// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellDate.h>

#include <cstdio>
#include <ctime>

#include "runtime/object_p.h"

struct CSKavellDate : kavell::Object {
    int64_t seconds;
};

namespace kavell {

namespace {

bool datesEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return static_cast<CSKavellDateRef>(first)->seconds == static_cast<CSKavellDateRef>(second)->seconds;
}

uint64_t dateHash(CSKavellTypeRef object)
{
    return static_cast<uint64_t>(static_cast<CSKavellDateRef>(object)->seconds) * 0x9e3779b97f4a7c15u;
}

void describeDate(CSKavellTypeRef object, int, std::string &text)
{
    const time_t seconds = static_cast<CSKavellDateRef>(object)->seconds;
    tm parts{};
    char written[64];
    if (gmtime_r(&seconds, &parts) && std::strftime(written, sizeof written, "%Y-%m-%dT%H:%M:%SZ", &parts) > 0)
        text += written;
    else
        text += std::to_string(seconds);
}

}  // namespace

constinit const TypeOperations dateOperations{"CSKavellDate", nullptr, nullptr, datesEqual, dateHash, describeDate};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellDateGetTypeID(void)
{
    return kTypeDate;
}

CSKavellDateRef CSKavellDateCreate(int64_t secondsSince1970)
{
    return makeObject<CSKavellDate>(nullptr, kTypeDate, 0, secondsSince1970);
}

int64_t CSKavellDateGetSeconds(CSKavellDateRef date)
{
    return date ? date->seconds : 0;
}
