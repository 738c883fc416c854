// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What carries a record query: the machine's resolver, or its DNS-SD service. After the start it is used by the queue's
// thread only, but for `cancel`. The last holder frees it, which may be either thread.

#ifndef KAVELL_PLATFORM_QT_RECORD_QUERY_BACK_END_H
#define KAVELL_PLATFORM_QT_RECORD_QUERY_BACK_END_H

#include <atomic>
#include <mutex>
#include <string>

#include "platform/qt/query_queue.h"
#include "platform/qt/record_query.h"

namespace kavell {

class RecordQueryBackEnd : public QuerySource {
public:
    explicit RecordQueryBackEnd(RecordCallback callback) : m_callback(std::move(callback)) {}

    /// From here on the callback does not run; one that runs on another thread is waited for.
    virtual void cancel();

    [[nodiscard]] bool isCancelled() const { return m_cancelled; }

protected:
    /// Runs the callback unless the query is cancelled.
    void deliver(const RecordAnswer &answer);

private:
    // Recursive, since a callback may cancel its own query. It is held for the callback only, never for the reading of
    // replies: a server that floods its clients cannot hold up the one who cancels.
    std::recursive_mutex m_callbackMutex;
    RecordCallback m_callback;
    std::atomic<bool> m_cancelled{false};
};

/// Null when the query cannot be asked.
[[nodiscard]] std::shared_ptr<RecordQueryBackEnd> makeResolverQuery(const std::string &name, uint16_t type,
                                                                    uint16_t recordClass, RecordCallback callback);
[[nodiscard]] std::shared_ptr<RecordQueryBackEnd> makeServiceQuery(const std::string &name, uint16_t type,
                                                                   uint16_t recordClass, RecordCallback callback);

}  // namespace kavell

#endif
