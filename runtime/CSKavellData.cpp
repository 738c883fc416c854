// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellData.h>

#include <cstring>
#include <string_view>

#include "runtime/object_p.h"
#include "runtime/secret_memory.h"
#include "runtime/string_p.h"

/// The bytes follow the structure.
struct CSKavellData : kavell::Object {
    size_t length;

    [[nodiscard]] const uint8_t *bytes() const noexcept { return reinterpret_cast<const uint8_t *>(this + 1); }
    [[nodiscard]] std::string_view view() const noexcept { return {reinterpret_cast<const char *>(bytes()), length}; }
};

namespace kavell {

namespace {

// A description is for people; past this many bytes it says only how many there are.
constexpr size_t kMostBytesDescribed = 32;

bool dataEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return static_cast<CSKavellDataRef>(first)->view() == static_cast<CSKavellDataRef>(second)->view();
}

uint64_t dataHash(CSKavellTypeRef object)
{
    return hashOfText(static_cast<CSKavellDataRef>(object)->view());
}

void describeData(CSKavellTypeRef object, int, std::string &text)
{
    constexpr char kDigits[] = "0123456789abcdef";
    const auto *data = static_cast<CSKavellDataRef>(object);
    text += '<';
    for (size_t index = 0; index < data->length && index < kMostBytesDescribed; ++index) {
        text += kDigits[data->bytes()[index] >> 4];
        text += kDigits[data->bytes()[index] & 15];
    }
    if (data->length > kMostBytesDescribed)
        text += "… " + std::to_string(data->length) + " bytes";
    text += '>';
}

}  // namespace

constinit const TypeOperations dataOperations{"CSKavellData", nullptr, nullptr, dataEqual, dataHash, describeData};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellDataGetTypeID(void)
{
    return kTypeData;
}

static CSKavellDataRef makeData(const CSKavellAllocator *allocator, const void *bytes, size_t length) noexcept
{
    if ((!bytes && length > 0) || length > SIZE_MAX / 2)
        return nullptr;
    auto *data = makeObject<CSKavellData>(allocator, kTypeData, length, length);
    if (data && length > 0)
        std::memcpy(const_cast<uint8_t *>(data->bytes()), bytes, length);
    return data;
}

CSKavellDataRef CSKavellDataCreate(const void *bytes, size_t length)
{
    return makeData(nullptr, bytes, length);
}

CSKavellDataRef CSKavellDataCreateSecret(const void *bytes, size_t length)
{
    return makeData(&secretAllocator, bytes, length);
}

const uint8_t *CSKavellDataGetBytes(CSKavellDataRef data)
{
    return data ? data->bytes() : nullptr;
}

size_t CSKavellDataGetLength(CSKavellDataRef data)
{
    return data ? data->length : 0;
}
