// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A redo record of any bytes, with and without a right checksum: it decodes within its bounds or not at all.

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "platform/checksum.h"
#include "platform/redo_record.h"

using namespace kavell;

namespace {

void tryRecord(std::string_view bytes)
{
    const auto record = decodeRedoRecord(bytes);
    if (!record)
        return;
    static_cast<void>(judgeRedoRecord(*record, record->inode, record->newContents));
    static_cast<void>(judgeRedoRecord(*record, record->inode, record->oldContents.value_or("x")));
    if (encodeRedoRecord(*record) != bytes)
        std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    std::string bytes(reinterpret_cast<const char *>(data), size);
    tryRecord(bytes);
    const uint64_t checksum = checksumOf(bytes);
    for (int shift = 0; shift < 64; shift += 8)
        bytes += static_cast<char>(checksum >> shift);
    tryRecord(bytes);
    return 0;
}
