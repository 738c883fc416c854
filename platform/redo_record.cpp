// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/redo_record.h"

#include <algorithm>

#include "platform/checksum.h"
#include "platform/sibling_path.h"

namespace kavell {

namespace {

constexpr std::string_view kMagic = "KAVREDO1";
constexpr uint64_t kUnknownLength = UINT64_MAX;
constexpr size_t kInodeOffset = 8, kHeaderLength = 32, kChecksumLength = 8;
static_assert(kInodeOffset + sizeof(uint64_t) == kVoidRecordLength, "a void record ends with the inode");

void appendInteger(std::string &bytes, uint64_t value)
{
    for (int shift = 0; shift < 64; shift += 8)
        bytes += static_cast<char>(value >> shift);
}

uint64_t integerAt(std::string_view bytes, size_t offset) noexcept
{
    uint64_t value = 0;
    for (int index = 7; index >= 0; --index)
        value = value << 8 | static_cast<unsigned char>(bytes[offset + static_cast<size_t>(index)]);
    return value;
}

/// Whether an interrupted replacement of the old by the new contents can have left these: each byte is the old one, the
/// new one, or, past the end of either, a zero: one that was not filled yet, or one that was cleared before the file
/// became shorter.
bool isMix(std::string_view oldContents, std::string_view newContents, std::string_view contents) noexcept
{
    if (contents.size() < std::min(oldContents.size(), newContents.size()) ||
        contents.size() > std::max(oldContents.size(), newContents.size()))
        return false;
    for (size_t place = 0; place < contents.size(); ++place) {
        const bool isOld = place < oldContents.size() ? contents[place] == oldContents[place] : contents[place] == '\0';
        const bool isNew = place < newContents.size() ? contents[place] == newContents[place] : contents[place] == '\0';
        if (!isOld && !isNew)
            return false;
    }
    return true;
}

}  // namespace

std::string encodeRedoRecord(const RedoRecord &record)
{
    const std::string_view oldContents = record.oldContents.value_or(std::string_view());
    std::string bytes;
    bytes.reserve(kHeaderLength + oldContents.size() + record.newContents.size() + kChecksumLength);
    bytes += kMagic;
    appendInteger(bytes, record.inode);
    appendInteger(bytes, record.oldContents ? oldContents.size() : kUnknownLength);
    appendInteger(bytes, record.newContents.size());
    bytes += oldContents;
    bytes += record.newContents;
    appendInteger(bytes, checksumOf(bytes));
    return bytes;
}

std::optional<RedoRecord> decodeRedoRecord(std::string_view bytes) noexcept
{
    if (bytes.size() < kHeaderLength + kChecksumLength || !bytes.starts_with(kMagic))
        return std::nullopt;
    const std::string_view body = bytes.substr(0, bytes.size() - kChecksumLength);
    if (checksumOf(body) != integerAt(bytes, body.size()))
        return std::nullopt;
    const uint64_t oldLength = integerAt(body, 16), newLength = integerAt(body, 24);
    const uint64_t contentsLength = body.size() - kHeaderLength;
    const uint64_t keptLength = oldLength == kUnknownLength ? 0 : oldLength;
    if (keptLength > contentsLength || newLength != contentsLength - keptLength)
        return std::nullopt;
    RedoRecord record;
    record.inode = static_cast<ino_t>(integerAt(body, kInodeOffset));
    if (oldLength != kUnknownLength)
        record.oldContents = body.substr(kHeaderLength, keptLength);
    record.newContents = body.substr(kHeaderLength + keptLength);
    return record;
}

std::optional<ino_t> inodeOfRedoRecord(std::string_view bytes) noexcept
{
    if (bytes.size() < kInodeOffset + sizeof(uint64_t) || !bytes.starts_with(kMagic))
        return std::nullopt;
    return static_cast<ino_t>(integerAt(bytes, kInodeOffset));
}

RedoVerdict judgeRedoRecord(const RedoRecord &record, ino_t inode, std::string_view contents) noexcept
{
    if (record.inode != inode)
        return RedoVerdict::Discard;
    // The new contents whole are a mix too: their permissions may not be what they are to be yet.
    if (!record.oldContents || isMix(*record.oldContents, record.newContents, contents))
        return RedoVerdict::Finish;
    return RedoVerdict::Discard;
}

}  // namespace kavell
