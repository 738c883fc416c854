// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellType.h>

#include <algorithm>
#include <vector>

#include "runtime/object_p.h"

struct CSKavellArray : kavell::Object {
    std::vector<CSKavellTypeRef> values{};  ///< each retained
};

namespace kavell {

namespace {

CSKavellArray *makeArray(uint16_t flags) noexcept
{
    auto *array = makeObject<CSKavellArray>(nullptr, kTypeArray, 0);
    if (array)
        array->flags |= flags;
    return array;
}

void append(CSKavellArray &array, CSKavellTypeRef value)
{
    array.values.push_back(value);
    CSKavellRetain(value);
}

CSKavellTypeRef copyArray(const CSKavellAllocator *, CSKavellTypeRef object)
{
    return CSKavellArrayCreateMutableCopy(static_cast<CSKavellArrayRef>(object));
}

void finaliseArray(Object *object)
{
    auto *array = static_cast<CSKavellArray *>(object);
    for (CSKavellTypeRef value : array->values)
        CSKavellRelease(value);
    array->~CSKavellArray();
}

bool arraysEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    const auto &one = static_cast<CSKavellArrayRef>(first)->values,
               &other = static_cast<CSKavellArrayRef>(second)->values;
    return std::equal(one.begin(), one.end(), other.begin(), other.end(), CSKavellEqual);
}

uint64_t arrayHash(CSKavellTypeRef object)
{
    return static_cast<CSKavellArrayRef>(object)->values.size();
}

void describeArray(CSKavellTypeRef object, int depth, std::string &text)
{
    const auto &values = static_cast<CSKavellArrayRef>(object)->values;
    text += '(';
    for (size_t index = 0; index < values.size(); ++index) {
        if (index > 0)
            text += ", ";
        describeObject(values[index], depth + 1, text);
    }
    text += ')';
}

}  // namespace

constinit const TypeOperations arrayOperations{"CSKavellArray", copyArray, finaliseArray,
                                               arraysEqual,     arrayHash, describeArray};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellArrayGetTypeID(void)
{
    return kTypeArray;
}

CSKavellArrayRef CSKavellArrayCreate(const CSKavellTypeRef *values, size_t count)
{
    if (count > 0 && (!values || std::find(values, values + count, nullptr) != values + count))
        return nullptr;
    CSKavellArray *array = makeArray(0);
    const bool filled = array && guarded(false, [&] {
                            array->values.reserve(count);
                            for (size_t index = 0; index < count; ++index)
                                append(*array, values[index]);
                            return true;
                        });
    if (!filled) {
        CSKavellRelease(array);
        return nullptr;
    }
    return array;
}

CSKavellMutableArrayRef CSKavellArrayCreateMutable(void)
{
    return makeArray(kObjectIsMutable);
}

CSKavellMutableArrayRef CSKavellArrayCreateMutableCopy(CSKavellArrayRef array)
{
    if (!array)
        return nullptr;
    auto *copy = const_cast<CSKavellMutableArrayRef>(CSKavellArrayCreate(array->values.data(), array->values.size()));
    if (copy)
        copy->flags |= kObjectIsMutable;
    return copy;
}

size_t CSKavellArrayGetCount(CSKavellArrayRef array)
{
    return array ? array->values.size() : 0;
}

CSKavellTypeRef CSKavellArrayGetValueAtIndex(CSKavellArrayRef array, size_t index)
{
    return array && index < array->values.size() ? array->values[index] : nullptr;
}

size_t CSKavellArrayGetFirstIndexOfValue(CSKavellArrayRef array, CSKavellTypeRef value)
{
    if (!array)
        return 0;
    const auto &values = array->values;
    const auto found = std::find_if(values.begin(), values.end(),
                                    [value](CSKavellTypeRef each) { return CSKavellEqual(each, value); });
    return static_cast<size_t>(found - values.begin());
}

void CSKavellArrayAppendValue(CSKavellMutableArrayRef array, CSKavellTypeRef value)
{
    if (array && value && (array->flags & kObjectIsMutable))
        guarded([&] { append(*array, value); });
}

void CSKavellArrayRemoveValueAtIndex(CSKavellMutableArrayRef array, size_t index)
{
    if (!array || index >= array->values.size() || !(array->flags & kObjectIsMutable))
        return;
    CSKavellTypeRef removed = array->values[index];
    array->values.erase(array->values.begin() + static_cast<std::ptrdiff_t>(index));
    CSKavellRelease(removed);
}
