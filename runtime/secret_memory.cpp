// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "runtime/secret_memory.h"

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string.h>

namespace kavell {

namespace {

/// Stands before the memory, and keeps its alignment.
struct alignas(std::max_align_t) Frame {
    size_t size;
};

void *allocateSecret(size_t size, void *) noexcept
{
    if (size > SIZE_MAX - sizeof(Frame))
        return nullptr;
    auto *frame = static_cast<Frame *>(std::malloc(sizeof(Frame) + size));
    if (!frame)
        return nullptr;
    frame->size = size;
    return frame + 1;
}

void deallocateSecret(void *memory, void *) noexcept
{
    Frame *frame = static_cast<Frame *>(memory) - 1;
    explicit_bzero(memory, frame->size);
    std::free(frame);
}

}  // namespace

constinit const CSKavellAllocator secretAllocator{allocateSecret, deallocateSecret, nullptr};

}  // namespace kavell
