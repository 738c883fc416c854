// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The registry of types and the operations that every object has.

#include <kavellaccounts/CSKavellType.h>

#include <array>
#include <cassert>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <mutex>

#include "runtime/object_p.h"
#include "runtime/reference_count.h"

namespace kavell {

namespace {

constexpr size_t kMaximumTypes = 64;

// Slots are filled once and never change; readers see a slot through its atomic pointer without the mutex.
constinit std::array<std::atomic<const TypeOperations *>, kMaximumTypes> registeredTypes{
    nullptr,         &stringOperations, &numberOperations,     &booleanOperations, &dateOperations,
    &dataOperations, &arrayOperations,  &dictionaryOperations, &uuidOperations,    &urlOperations};
constinit std::mutex registryMutex;
constinit CSKavellTypeID nextTypeID = kFirstRecordType;

/// What stands before an object that came from a custom allocator. Its size keeps the object aligned for any type.
struct alignas(std::max_align_t) AllocatorPrefix {
    CSKavellAllocator allocator;
};

}  // namespace

const TypeOperations &typeOperations(CSKavellTypeRef object) noexcept
{
    return *registeredTypes[objectOf(object)->typeID].load(std::memory_order_acquire);
}

CSKavellTypeID LazyType::typeID() noexcept
{
    if (const CSKavellTypeID known = m_typeID.load(std::memory_order_acquire))
        return known;
    const std::lock_guard guard(registryMutex);
    if (const CSKavellTypeID known = m_typeID.load(std::memory_order_relaxed))
        return known;
    assert(nextTypeID < kMaximumTypes);
    registeredTypes[nextTypeID].store(&m_operations, std::memory_order_release);
    m_typeID.store(nextTypeID, std::memory_order_release);
    return nextTypeID++;
}

void *allocateObject(const CSKavellAllocator *allocator, CSKavellTypeID typeID, size_t size, uint16_t flags) noexcept
{
    if (!allocator) {
        void *memory = std::malloc(size);
        return memory ? new (memory) Object{1, static_cast<uint16_t>(typeID), flags} : nullptr;
    }
    if (size > SIZE_MAX - sizeof(AllocatorPrefix))
        return nullptr;
    void *memory = allocator->allocate(sizeof(AllocatorPrefix) + size, allocator->context);
    if (!memory)
        return nullptr;
    auto *prefix = new (memory) AllocatorPrefix{*allocator};
    return new (prefix + 1)
        Object{1, static_cast<uint16_t>(typeID), static_cast<uint16_t>(flags | kObjectHasAllocator)};
}

void deallocateObject(Object *object, uint16_t flags) noexcept
{
    if (flags >> kObjectDistanceShift != 0) {
        deallocateInPiece(object, flags);
        return;
    }
    if (!(flags & kObjectHasAllocator)) {
        std::free(object);
        return;
    }
    AllocatorPrefix *prefix = reinterpret_cast<AllocatorPrefix *>(object) - 1;
    const CSKavellAllocator allocator = prefix->allocator;
    allocator.deallocate(prefix, allocator.context);
}

}  // namespace kavell

using namespace kavell;

CSKavellTypeRef CSKavellRetain(CSKavellTypeRef object)
{
    if (!object)
        return object;
    const uint32_t current = objectOf(object)->references.load(std::memory_order_relaxed);
    if (current == kImmortal)
        return object;
    [[maybe_unused]] const uint32_t before = countUp(objectOf(object)->references, current);
    assert(before != 0 && before < kImmortal - 1);
    return object;
}

void CSKavellRelease(CSKavellTypeRef object)
{
    if (!object)
        return;
    const uint32_t current = objectOf(object)->references.load(std::memory_order_relaxed);
    if (current == kImmortal)
        return;
    const uint32_t before = countDown(objectOf(object)->references, current);
    assert(before != 0);
    if (before != 1)
        return;
    Object *last = const_cast<Object *>(objectOf(object));
    // The finaliser may end the fields' lifetime, the flags among them.
    const TypeOperations &operations = typeOperations(object);
    const uint16_t flags = last->flags;
    if (operations.finalise)
        operations.finalise(last);
    deallocateObject(last, flags);
}

bool CSKavellEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    if (first == second)
        return true;
    if (!first || !second || objectOf(first)->typeID != objectOf(second)->typeID)
        return false;
    const TypeOperations &operations = typeOperations(first);
    return operations.equal && operations.equal(first, second);
}

uint64_t CSKavellHash(CSKavellTypeRef object)
{
    if (!object)
        return 0;
    const TypeOperations &operations = typeOperations(object);
    return operations.hash ? operations.hash(object) : addressHash(object);
}

CSKavellTypeID CSKavellGetTypeID(CSKavellTypeRef object)
{
    return object ? objectOf(object)->typeID : 0;
}

const char *CSKavellTypeIDGetName(CSKavellTypeID typeID)
{
    const TypeOperations *operations =
        typeID < kMaximumTypes ? registeredTypes[typeID].load(std::memory_order_acquire) : nullptr;
    return operations ? operations->name : nullptr;
}

CSKavellTypeRef CSKavellCreateCopy(const CSKavellAllocator *allocator, CSKavellTypeRef object)
{
    if (!object)
        return nullptr;
    const TypeOperations &operations = typeOperations(object);
    return operations.copy ? operations.copy(allocator, object) : CSKavellRetain(object);
}

CSKavellStringRef CSKavellCopyDescription(CSKavellTypeRef object)
{
    return guarded(CSKavellStringRef{}, [&] {
        std::string text;
        describeObject(object, 0, text);
        return CSKavellStringCreateWithBytes(text.data(), text.size());
    });
}
