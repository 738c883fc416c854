// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Short ways to write values down in tests and to compare them, and an allocator that counts. Used by the tests of the
// runtime and of the store; one thread.

#ifndef KAVELL_TESTS_RUNTIME_VALUES_H
#define KAVELL_TESTS_RUNTIME_VALUES_H

#include <cstdlib>
#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gtest/gtest.h>
#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

namespace kavell::test {

using Value = Ref<CSKavellTypeRef>;
using String = Ref<CSKavellStringRef>;

[[nodiscard]] inline String text(std::string_view characters)
{
    return makeString(characters);
}

[[nodiscard]] inline Ref<CSKavellNumberRef> integer(int64_t value)
{
    return adopt(CSKavellNumberCreateWithInt64(value));
}

[[nodiscard]] inline Ref<CSKavellNumberRef> unsignedInteger(uint64_t value)
{
    return adopt(CSKavellNumberCreateWithUInt64(value));
}

[[nodiscard]] inline Ref<CSKavellNumberRef> real(double value)
{
    return adopt(CSKavellNumberCreateWithDouble(value));
}

[[nodiscard]] inline Ref<CSKavellBooleanRef> boolean(bool value)
{
    return retain(CSKavellBooleanGetShared(value));
}

[[nodiscard]] inline Ref<CSKavellDateRef> date(int64_t seconds)
{
    return adopt(CSKavellDateCreate(seconds));
}

[[nodiscard]] inline Ref<CSKavellDataRef> bytes(std::string_view contents)
{
    return adopt(CSKavellDataCreate(contents.data(), contents.size()));
}

[[nodiscard]] inline Ref<CSKavellArrayRef> array(std::initializer_list<Value> values)
{
    std::vector<CSKavellTypeRef> pointers;
    for (const Value &value : values)
        pointers.push_back(value.get());
    return adopt(CSKavellArrayCreate(pointers.data(), pointers.size()));
}

[[nodiscard]] inline Ref<CSKavellDictionaryRef>
dictionary(std::initializer_list<std::pair<std::string_view, Value>> pairs)
{
    const Ref<CSKavellMutableDictionaryRef> result = adopt(CSKavellDictionaryCreateMutable());
    for (const auto &[key, value] : pairs)
        CSKavellDictionarySetValue(result.get(), text(key).get(), value.get());
    return result;
}

/// The value of a text key, borrowed.
[[nodiscard]] inline CSKavellTypeRef valueOf(CSKavellDictionaryRef dictionary, std::string_view key)
{
    return CSKavellDictionaryGetValue(dictionary, text(key).get());
}

/// The keys of a dictionary of text keys, in its order.
[[nodiscard]] inline std::vector<std::string> keysOf(CSKavellDictionaryRef dictionary)
{
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(dictionary));
    CSKavellDictionaryGetKeysAndValues(dictionary, keys.data(), nullptr);
    std::vector<std::string> names;
    for (CSKavellTypeRef key : keys)
        names.push_back(toStdString(cast<CSKavellStringRef>(key, CSKavellStringGetTypeID())));
    return names;
}

/// An array of texts as such.
[[nodiscard]] inline std::vector<std::string> textsOf(CSKavellArrayRef array)
{
    std::vector<std::string> texts;
    for (size_t index = 0; index < CSKavellArrayGetCount(array); ++index)
        texts.push_back(toStdString(
            cast<CSKavellStringRef>(CSKavellArrayGetValueAtIndex(array, index), CSKavellStringGetTypeID())));
    return texts;
}

[[nodiscard]] inline std::string describe(CSKavellTypeRef object)
{
    return toStdString(adopt(CSKavellCopyDescription(object)).get());
}

/// `EXPECT_TRUE(same(actual, expected))`: equal by value, and both descriptions when they are not.
[[nodiscard]] inline testing::AssertionResult same(CSKavellTypeRef actual, CSKavellTypeRef expected)
{
    if (CSKavellEqual(actual, expected))
        return testing::AssertionSuccess();
    return testing::AssertionFailure() << "actual " << describe(actual) << ", expected " << describe(expected);
}

template <typename First, typename Second>
[[nodiscard]] testing::AssertionResult same(const Ref<First> &actual, const Ref<Second> &expected)
{
    return same(CSKavellTypeRef(actual.get()), CSKavellTypeRef(expected.get()));
}

/// An allocator that counts what it gives and takes back, and gives nothing once `remaining` creations were served.
class CountingAllocator {
public:
    explicit CountingAllocator(int remaining = 1000000) : m_remaining(remaining) {}
    CountingAllocator(const CountingAllocator &) = delete;
    CountingAllocator &operator=(const CountingAllocator &) = delete;

    [[nodiscard]] const CSKavellAllocator *get() const { return &m_allocator; }
    [[nodiscard]] int allocated() const { return m_allocated; }
    [[nodiscard]] int deallocated() const { return m_deallocated; }

private:
    static void *allocate(size_t size, void *context)
    {
        auto *self = static_cast<CountingAllocator *>(context);
        if (self->m_remaining == 0)
            return nullptr;
        --self->m_remaining;
        ++self->m_allocated;
        return std::malloc(size);
    }

    static void deallocate(void *memory, void *context)
    {
        ++static_cast<CountingAllocator *>(context)->m_deallocated;
        std::free(memory);
    }

    int m_remaining;
    int m_allocated = 0;
    int m_deallocated = 0;
    CSKavellAllocator m_allocator{allocate, deallocate, this};
};

/// A string whose end can be seen: the allocator counts it when its last reference goes.
[[nodiscard]] inline String watchedText(const CountingAllocator &allocator, std::string_view characters)
{
    return adopt(CSKavellStringCreateCopy(allocator.get(), text(characters).get()));
}

}  // namespace kavell::test

#endif
