// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellType.h>

#include "runtime/secret_memory.h"
#include "runtime/string_p.h"
#include "runtime/utf8.h"

namespace kavell {

namespace {

// Room for the structure, the terminator and an allocator's prefix stays within 32 bits of length.
constexpr size_t kLongestString = UINT32_MAX - 64;

uint64_t mixed(uint64_t first, uint64_t second) noexcept
{
    const auto product = static_cast<unsigned __int128>(first) * second;
    return static_cast<uint64_t>(product) ^ static_cast<uint64_t>(product >> 64);
}

}  // namespace

uint32_t hashOfText(std::string_view text) noexcept
{
    constexpr uint64_t kFirst = 0xa0761d6478bd642f, kSecond = 0xe7037ed1a0b428db;
    uint64_t state = kFirst ^ text.size();
    for (; text.size() >= 8; text.remove_prefix(8)) {
        uint64_t word;
        std::memcpy(&word, text.data(), 8);
        state = mixed(state ^ word, kSecond);
    }
    uint64_t rest = 0;
    std::memcpy(&rest, text.data(), text.size());
    const uint64_t hash = mixed(state ^ rest, kFirst);
    const auto folded = static_cast<uint32_t>(hash ^ (hash >> 32));
    return folded ? folded : 1;
}

namespace {

/// From an allocator or a block.
template <typename Memory> CSKavellStringRef makeStringIn(Memory &&memory, std::string_view text) noexcept
{
    if (text.size() > kLongestString)
        return nullptr;
    auto *string =
        makeObject<CSKavellString>(memory, kTypeString, text.size() + 1, static_cast<uint32_t>(text.size()), 0u);
    if (!string)
        return nullptr;
    std::memcpy(string->text(), text.data(), text.size());
    string->text()[text.size()] = '\0';
    return string;
}

}  // namespace

CSKavellStringRef makeValidString(const CSKavellAllocator *allocator, std::string_view text) noexcept
{
    return makeStringIn(allocator, text);
}

CSKavellStringRef makeValidString(ObjectBlock &block, std::string_view text) noexcept
{
    return makeStringIn(block, text);
}

namespace {

CSKavellTypeRef copyString(const CSKavellAllocator *allocator, CSKavellTypeRef object)
{
    return CSKavellStringCreateCopy(allocator, static_cast<CSKavellStringRef>(object));
}

bool stringsEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return equalStrings(*static_cast<CSKavellStringRef>(first), *static_cast<CSKavellStringRef>(second));
}

uint64_t stringHash(CSKavellTypeRef object)
{
    return static_cast<CSKavellStringRef>(object)->hash();
}

void describeString(CSKavellTypeRef object, int, std::string &text)
{
    text += static_cast<CSKavellStringRef>(object)->view();
}

}  // namespace

constinit const TypeOperations stringOperations{"CSKavellString", copyString, nullptr,
                                                stringsEqual,     stringHash, describeString};

}  // namespace kavell

using namespace kavell;

uint32_t CSKavellString::hash() const noexcept
{
    uint32_t hash = cachedHash.load(std::memory_order_relaxed);
    if (hash == 0) {
        hash = hashOfText(view());
        cachedHash.store(hash, std::memory_order_relaxed);
    }
    return hash;
}

CSKavellTypeID CSKavellStringGetTypeID(void)
{
    return kTypeString;
}

CSKavellStringRef CSKavellStringCreateWithUTF8(const char *text)
{
    return text ? CSKavellStringCreateWithBytes(text, std::strlen(text)) : nullptr;
}

CSKavellStringRef CSKavellStringCreateWithBytes(const char *bytes, size_t length)
{
    if (!bytes || !isUTF8({bytes, length}))
        return nullptr;
    return makeValidString(nullptr, {bytes, length});
}

CSKavellStringRef CSKavellStringCreateSecret(const char *bytes, size_t length)
{
    if (!bytes || !isUTF8({bytes, length}))
        return nullptr;
    return makeValidString(&secretAllocator, {bytes, length});
}

CSKavellStringRef CSKavellStringCreateCopy(const CSKavellAllocator *allocator, CSKavellStringRef string)
{
    if (!string)
        return nullptr;
    if (!allocator)
        return static_cast<CSKavellStringRef>(CSKavellRetain(string));
    return makeValidString(allocator, string->view());
}

const char *CSKavellStringGetUTF8(CSKavellStringRef string)
{
    return string ? string->text() : nullptr;
}

size_t CSKavellStringGetLength(CSKavellStringRef string)
{
    return string ? string->length : 0;
}
