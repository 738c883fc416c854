// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A redo record of any bytes, with and without a right checksum: it decodes within its bounds or not at all, has one form
// only, and is finished over a file that was torn at any place.

#include <algorithm>

#include "platform/checksum.h"
#include "platform/redo_record.h"
#include "tests/fuzz/fuzz_target.h"

using namespace kavell;
using kavell::fuzz::require;

namespace {

/// The data file when the writing of the new contents stopped half-way.
std::string tornContents(std::string_view oldContents, std::string_view newContents)
{
    const std::string_view written = newContents.substr(0, newContents.size() / 2);
    return std::string(written) + std::string(oldContents.substr(std::min(written.size(), oldContents.size())));
}

void tryRecord(std::string_view bytes)
{
    const auto record = decodeRedoRecord(bytes);
    if (!record)
        return;
    require(encodeRedoRecord(*record) == bytes, "a record has one form only");
    require(judgeRedoRecord(*record, record->inode, record->newContents) == RedoVerdict::Finish,
            "new contents that may lack their permissions are finished");
    require(judgeRedoRecord(*record, record->inode + 1, "x") == RedoVerdict::Discard,
            "another file's record does not count");
    const std::string torn = tornContents(record->oldContents.value_or("x"), record->newContents);
    require(judgeRedoRecord(*record, record->inode, torn) == RedoVerdict::Finish, "a torn file is finished");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    std::string bytes(fuzz::textOf(data, size));
    tryRecord(bytes);
    const uint64_t checksum = checksumOf(bytes);
    for (int shift = 0; shift < 64; shift += 8)
        bytes += static_cast<char>(checksum >> shift);
    tryRecord(bytes);
    return 0;
}
