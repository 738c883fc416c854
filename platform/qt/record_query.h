// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One question to the domain name system: started with a callback, attached to a serial queue, deallocated.
//
//     auto query = RecordQuery::start("example.net", 15, 1, [](const RecordAnswer &answer) { … });
//     if (query && query->attach(QueryQueue::shared()) == 0) … wait for the callback …
//     query.reset();  // from here on the callback does not run
//
// Names at or below ".local" are asked of the machine's DNS-SD service, all others of its resolver, or of the servers
// of the environment variable KAVELL_DNS_SERVERS ("127.0.0.1:5353[,…]"). A service or server that hangs holds up neither
// the one who asks nor other queries. Needs no application object. A query belongs to one thread; its callback runs on
// the queue's.

#ifndef KAVELL_PLATFORM_QT_RECORD_QUERY_H
#define KAVELL_PLATFORM_QT_RECORD_QUERY_H

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace kavell {

class QueryQueue;
class RecordQueryBackEnd;

/// Bits of RecordAnswer::flags, with the numbers of the DNS-SD interface.
constexpr uint32_t kRecordMoreComing = 1;  ///< on all answers of a batch but the last
constexpr uint32_t kRecordAdded = 2;

/// Values of RecordAnswer::error, with the numbers of the DNS-SD interface.
constexpr int32_t kRecordUnknownError = -65537;
constexpr int32_t kRecordNoSuchName = -65538;
constexpr int32_t kRecordNoSuchRecord = -65554;

constexpr uint16_t kRecordTypeMX = 15;
constexpr uint16_t kRecordClassIN = 1;

/// One record, or, with an error and no data, the news that there is none.
struct RecordAnswer {
    uint32_t flags = 0;
    int32_t error = 0;
    std::string_view fullName;
    uint16_t type = 0;
    uint16_t recordClass = 0;
    std::string_view data;  ///< in wire form, names in it uncompressed
    uint32_t timeToLive = 0;
};

using RecordCallback = std::function<void(const RecordAnswer &)>;

class RecordQuery {
public:
    /// Null when the query cannot even be asked: a name that is none, or no means to ask. Does not wait for an answer.
    [[nodiscard]] static std::unique_ptr<RecordQuery> start(const std::string &name, uint16_t type,
                                                            uint16_t recordClass, RecordCallback callback);

    /// Deallocates the query: a callback that runs on the queue is waited for, and none follows. In the callback itself
    /// this is allowed, too.
    ~RecordQuery();
    RecordQuery(const RecordQuery &) = delete;
    RecordQuery &operator=(const RecordQuery &) = delete;

    /// Lets the answers come on the queue; before, none comes. 0, or the error that kept it from that.
    [[nodiscard]] int attach(QueryQueue &queue);

private:
    explicit RecordQuery(std::shared_ptr<RecordQueryBackEnd> backEnd);
    std::shared_ptr<RecordQueryBackEnd> m_backEnd;
    QueryQueue *m_queue = nullptr;
};

}  // namespace kavell

#endif
