// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What every object begins with, and the registry of their types. Used by everything in the library that makes a type
// of its own; any thread may call.
//
//     object in memory    [allocator, 32 bytes, only with a custom one] [Object: count, type, flags] [the type's own
//     fields]
//
// The reference points at Object. The built-in types have fixed identifiers, so that constant strings need no code to
// run before main; the records register when they are first asked for.

#ifndef KAVELL_RUNTIME_OBJECT_P_H
#define KAVELL_RUNTIME_OBJECT_P_H

#include <atomic>
#include <cstdint>
#include <new>
#include <string>
#include <utility>

#include <kavellaccounts/CSKavellBase.h>

namespace kavell {

/// The count of an object that is never freed; it is not counted up or down.
inline constexpr uint32_t kImmortal = UINT32_MAX;

enum ObjectFlag : uint16_t {
    kObjectHasAllocator = 1,  ///< the allocator stands before the object
    kObjectIsMutable = 2,     ///< a container that may be changed
};

/// The flags above these bits are the distance of an object from the start of the piece of memory that it shares with
/// others (object_block.h), in units of eight bytes; 0 where it shares none.
inline constexpr unsigned kObjectDistanceShift = 3;

struct Object {
    mutable std::atomic<uint32_t> references;
    uint16_t typeID;
    uint16_t flags;
};

/// The identifiers of the built-in types.
enum BuiltInType : uint16_t {
    kTypeString = 1,
    kTypeNumber,
    kTypeBoolean,
    kTypeDate,
    kTypeData,
    kTypeArray,
    kTypeDictionary,
    kTypeUUID,
    kTypeURL,
    kFirstRecordType,
};

/// How objects of one type behave. A null operation means: copying retains, nothing to finalise, equality by identity,
/// hash from the address, description <Name 0xADDRESS>.
struct TypeOperations {
    const char *name;
    CSKavellTypeRef (*copy)(const CSKavellAllocator *allocator, CSKavellTypeRef object) = nullptr;
    void (*finalise)(Object *object) = nullptr;
    bool (*equal)(CSKavellTypeRef first, CSKavellTypeRef second) = nullptr;
    uint64_t (*hash)(CSKavellTypeRef object) = nullptr;
    void (*describe)(CSKavellTypeRef object, int depth, std::string &text) = nullptr;
};

extern const TypeOperations stringOperations, numberOperations, booleanOperations, dateOperations, dataOperations,
    arrayOperations, dictionaryOperations, uuidOperations, urlOperations;

/// A type that registers itself on the first request for its identifier. Constant-initialised; one per type.
class LazyType {
public:
    explicit constexpr LazyType(const TypeOperations &operations) noexcept : m_operations(operations) {}

    [[nodiscard]] CSKavellTypeID typeID() noexcept;

private:
    const TypeOperations &m_operations;
    std::atomic<CSKavellTypeID> m_typeID{0};
};

/// The object behind a reference; none for none.
[[nodiscard]] inline const Object *objectOf(CSKavellTypeRef reference) noexcept
{
    return static_cast<const Object *>(reference);
}

[[nodiscard]] inline bool isType(CSKavellTypeRef reference, CSKavellTypeID typeID) noexcept
{
    return reference && objectOf(reference)->typeID == typeID;
}

/// The rule by which records hash: their address shifted right by two bits.
[[nodiscard]] inline uint64_t addressHash(CSKavellTypeRef object) noexcept
{
    return reinterpret_cast<uintptr_t>(object) >> 2;
}

/// The operations of the type of an object that is not none.
[[nodiscard]] const TypeOperations &typeOperations(CSKavellTypeRef object) noexcept;

/// Raw memory for an object of `size` bytes with one reference; null when there is none to be had.
[[nodiscard]] void *allocateObject(const CSKavellAllocator *allocator, CSKavellTypeID typeID, size_t size,
                                   uint16_t flags) noexcept;

/// Gives the memory of a finalised object back, whose flags were these.
void deallocateObject(Object *object, uint16_t flags) noexcept;

/// The same for an object in a piece of memory that it shares.
void deallocateInPiece(Object *object, uint16_t flags) noexcept;

/// Adds the description of any object, none included.
void describeObject(CSKavellTypeRef object, int depth, std::string &text);

/// Makes an object of type T, which derives from Object, in the memory that an allocation gave; its other fields are made
/// from `arguments`. Null when it gave none.
template <typename T, typename... Arguments>
[[nodiscard]] T *initialiseObject(void *memory, CSKavellTypeID typeID, Arguments &&...arguments) noexcept
{
    if (!memory)
        return nullptr;
    const uint16_t flags = static_cast<Object *>(memory)->flags;
    return new (memory) T{{1, static_cast<uint16_t>(typeID), flags}, std::forward<Arguments>(arguments)...};
}

/// Makes an object of type T with `extraBytes` of room behind it. Null when there is no memory.
template <typename T, typename... Arguments>
[[nodiscard]] T *makeObject(const CSKavellAllocator *allocator, CSKavellTypeID typeID, size_t extraBytes,
                            Arguments &&...arguments) noexcept
{
    return initialiseObject<T>(allocateObject(allocator, typeID, sizeof(T) + extraBytes, 0), typeID,
                               std::forward<Arguments>(arguments)...);
}

/// The finaliser of a type whose fields release themselves.
template <typename T> void destroyFields(Object *object)
{
    static_cast<T *>(object)->~T();
}

/// A lambda's or function's result, or `fallback` when it throws: the seam between C++ code and a C function, from
/// which no exception may leave.
template <typename Body, typename Result> [[nodiscard]] Result guarded(Result fallback, Body &&body) noexcept
{
    try {
        return body();
    } catch (...) {
        return fallback;
    }
}

/// The same for a C function without a result.
template <typename Body> void guarded(Body &&body) noexcept
{
    try {
        body();
    } catch (...) {
    }
}

}  // namespace kavell

#endif
