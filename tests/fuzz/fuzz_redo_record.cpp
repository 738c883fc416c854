// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A redo record of any bytes, with and without a right checksum: it decodes within its bounds or not at all, has one form
// only, is finished over a file that was torn, left over one that somebody else wrote, and void for its own file alone.

#include <algorithm>

#include "platform/checksum.h"
#include "platform/redo_record.h"
#include "platform/sibling_path.h"
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

/// The new contents with a first byte that neither they nor the old ones have.
std::string foreignContents(std::string_view oldContents, std::string_view newContents)
{
    const char oldByte = oldContents.empty() ? '\0' : oldContents.front();
    std::string contents(newContents);
    while (contents.front() == newContents.front() || contents.front() == oldByte)
        ++contents.front();
    return contents;
}

void tryForeignContents(const RedoRecord &record)
{
    if (!record.oldContents)
        return;  // anything counts as a mix
    const std::string longer = std::string(std::max(record.oldContents->size(), record.newContents.size()) + 1, '\0');
    require(judgeRedoRecord(record, record.inode, longer) == RedoVerdict::Discard,
            "a file that is longer than it ever was is somebody else's");
    if (record.newContents.empty())
        return;
    const std::string foreign = foreignContents(*record.oldContents, record.newContents);
    require(judgeRedoRecord(record, record.inode, foreign) == RedoVerdict::Discard,
            "a byte that is neither the old nor the new one is somebody else's");
}

void tryRecord(std::string_view bytes)
{
    require(inodeOfRedoRecord(bytes.substr(0, kVoidRecordLength)) == inodeOfRedoRecord(bytes),
            "a record is its file's as far as that one is named");
    const auto record = decodeRedoRecord(bytes);
    if (!record)
        return;
    require(inodeOfRedoRecord(bytes) == record->inode, "a record that becomes void stays its own file's");
    tryForeignContents(*record);
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
