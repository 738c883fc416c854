// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The records in a name server's reply. The bytes come from the network and may be anything. Any thread.

#ifndef KAVELL_PLATFORM_QT_RECORD_REPLY_H
#define KAVELL_PLATFORM_QT_RECORD_REPLY_H

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace kavell {

struct ReplyRecord {
    std::string data;  ///< in wire form; the exchanger's name of an MX record uncompressed
    uint32_t timeToLive = 0;
};

/// The answer records of the type and class, in the reply's order; records of other types, such as the aliases that
/// lead to the answer, are passed over. A record whose name cannot be read is left out; a damaged reply has none.
[[nodiscard]] std::vector<ReplyRecord> recordsOfReply(std::string_view reply, uint16_t type, uint16_t recordClass);

}  // namespace kavell

#endif
