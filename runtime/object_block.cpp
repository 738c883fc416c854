// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "runtime/object_block.h"

#include <algorithm>
#include <cstdlib>
#include <new>

#include "runtime/reference_count.h"

namespace kavell {

/// The start of a piece.
struct Piece {
    /// Its objects that are not gone, and the ObjectBlock while that may make more of them.
    std::atomic<uint32_t> living;
};

namespace {

constexpr size_t kUnit = ObjectBlock::kUnit;
// The first object stands one unit from the start.
static_assert(sizeof(Piece) <= kUnit);

constexpr size_t kLargestPiece = kUnit * (size_t{UINT16_MAX >> kObjectDistanceShift} + 1);

void letGo(Piece *piece) noexcept
{
    if (countDown(piece->living, piece->living.load(std::memory_order_relaxed)) == 1)
        std::free(piece);
}

}  // namespace

ObjectBlock::ObjectBlock(size_t capacity) noexcept
    : m_used(kUnit), m_size(kUnit + std::min(capacity, kLargestPiece - kUnit))
{
    void *memory = std::malloc(m_size);
    m_piece = memory ? new (memory) Piece{1} : nullptr;
    if (memory)
        poison(static_cast<char *>(memory) + kUnit, m_size - kUnit);
}

ObjectBlock::~ObjectBlock()
{
    if (m_piece)
        letGo(m_piece);
}

void *ObjectBlock::allocateObject(CSKavellTypeID typeID, size_t size) noexcept
{
    const size_t room = m_piece ? m_size - m_used : 0;
    if (size > room)
        return kavell::allocateObject(nullptr, typeID, size, 0);
    void *memory = reinterpret_cast<char *>(m_piece) + m_used;
    unpoison(memory, size);
    const auto distance = static_cast<uint16_t>(m_used / kUnit << kObjectDistanceShift);
    m_used = std::min(m_used + (size + kUnit - 1) / kUnit * kUnit + kGap, m_size);
    countUp(m_piece->living, m_piece->living.load(std::memory_order_relaxed));
    return new (memory) Object{1, static_cast<uint16_t>(typeID), distance};
}

void deallocateInPiece(Object *object, uint16_t flags) noexcept
{
    poisonUpToPoison(object, kLargestPiece);
    const size_t distance = (flags >> kObjectDistanceShift) * kUnit;
    letGo(reinterpret_cast<Piece *>(reinterpret_cast<char *>(object) - distance));
}

}  // namespace kavell
