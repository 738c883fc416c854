// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One piece of memory for the many small objects of a document, which are made together, are read together and mostly go
// together. That costs a tenth of what the allocator takes for each of them, and they stand side by side.
//
//     piece    [how many live, 8 bytes] [object] [object] … [room that was not needed]
//
// An object has its distance from the start of the piece in its flags. The last one that goes frees the piece: whoever
// keeps one of them keeps all that memory. The objects are like any others and may go on any thread; an ObjectBlock
// serves one thread. For the address sanitizer there is a gap behind each object, and what is free may not be used.

#ifndef KAVELL_RUNTIME_OBJECT_BLOCK_H
#define KAVELL_RUNTIME_OBJECT_BLOCK_H

#include <cstddef>

#include "runtime/memory_poison.h"
#include "runtime/object_p.h"

namespace kavell {

struct Piece;

/// What fills a piece with objects.
class ObjectBlock {
public:
    /// Objects begin at multiples of this.
    static constexpr size_t kUnit = 8;
    static constexpr size_t kGap = kCanPoison ? kUnit : 0;

    /// A piece with room for objects of so many bytes in all, each counted up to a multiple of kUnit, or of as many as can
    /// be told apart (64 KiB). Without memory for it there is none, and nothing fits in.
    explicit ObjectBlock(size_t capacity) noexcept;
    ~ObjectBlock();
    ObjectBlock(const ObjectBlock &) = delete;
    ObjectBlock &operator=(const ObjectBlock &) = delete;

    /// Raw memory for an object of `size` bytes with one reference: in the piece while it fits in there, else of its own.
    /// Null when there is none to be had.
    [[nodiscard]] void *allocateObject(CSKavellTypeID typeID, size_t size) noexcept;

private:
    Piece *m_piece;
    size_t m_used;
    size_t m_size;
};

/// Makes an object of type T, as the other makeObject does, in the block where it fits.
template <typename T, typename... Arguments>
[[nodiscard]] T *makeObject(ObjectBlock &block, CSKavellTypeID typeID, size_t extraBytes,
                            Arguments &&...arguments) noexcept
{
    static_assert(alignof(T) <= ObjectBlock::kUnit);
    return initialiseObject<T>(block.allocateObject(typeID, sizeof(T) + extraBytes), typeID,
                               std::forward<Arguments>(arguments)...);
}

}  // namespace kavell

#endif
