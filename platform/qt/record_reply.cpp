// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/record_reply.h"

#include <algorithm>
#include <arpa/nameser.h>
#include <array>
#include <cstring>
#include <limits>
#include <optional>

#include "platform/qt/record_query.h"

namespace kavell {

namespace {

constexpr size_t kPreferenceBytes = 2;

/// The length of an uncompressed name with its closing root label.
size_t wireLength(const unsigned char *name)
{
    size_t length = 0;
    while (name[length] != 0)
        length += size_t{1} + name[length];
    return length + 1;
}

/// Preference and exchanger with the name's pointers into the reply followed; none when they lead nowhere, or the name
/// does not end where the record does.
std::optional<std::string> expandedMailExchanger(const ns_msg &message, const ns_rr &record)
{
    const unsigned char *data = ns_rr_rdata(record);
    const size_t length = ns_rr_rdlen(record);
    if (length <= kPreferenceBytes)
        return std::nullopt;
    std::array<unsigned char, NS_MAXCDNAME> name{};
    const int consumed =
        ns_name_unpack(ns_msg_base(message), ns_msg_end(message), data + kPreferenceBytes, name.data(), name.size());
    if (consumed < 0 || kPreferenceBytes + static_cast<size_t>(consumed) != length)
        return std::nullopt;
    std::string expanded(reinterpret_cast<const char *>(data), kPreferenceBytes);
    expanded.append(reinterpret_cast<const char *>(name.data()), wireLength(name.data()));
    return expanded;
}

std::optional<std::string> expandedData(const ns_msg &message, const ns_rr &record)
{
    if (ns_rr_type(record) == kRecordTypeMX)
        return expandedMailExchanger(message, record);
    return std::string(reinterpret_cast<const char *>(ns_rr_rdata(record)), ns_rr_rdlen(record));
}

}  // namespace

std::vector<ReplyRecord> recordsOfReply(std::string_view reply, uint16_t type, uint16_t recordClass)
{
    if (reply.size() > std::numeric_limits<uint16_t>::max())
        return {};
    ns_msg message;
    if (ns_initparse(reinterpret_cast<const unsigned char *>(reply.data()), static_cast<int>(reply.size()), &message))
        return {};
    std::vector<ReplyRecord> records;
    for (int index = 0; index < ns_msg_count(message, ns_s_an); ++index) {
        ns_rr record;
        if (ns_parserr(&message, ns_s_an, index, &record))
            return {};
        if (ns_rr_type(record) != type || ns_rr_class(record) != recordClass)
            continue;
        if (auto data = expandedData(message, record))
            records.push_back({std::move(*data), ns_rr_ttl(record)});
    }
    return records;
}

}  // namespace kavell
