// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/record_query.h"

#include <strings.h>

#include "platform/qt/query_queue.h"
#include "platform/qt/record_query_back_end.h"

namespace kavell {

namespace {

/// Whether multicast serves the name: "local", or anything that ends in ".local", with or without the closing dot.
bool isLocalName(std::string_view name)
{
    constexpr std::string_view local = "local";
    if (name.ends_with('.'))
        name.remove_suffix(1);
    if (name.size() < local.size())
        return false;
    const std::string_view end = name.substr(name.size() - local.size());
    if (strncasecmp(end.data(), local.data(), local.size()) != 0)
        return false;
    return name.size() == local.size() || name[name.size() - local.size() - 1] == '.';
}

}  // namespace

void RecordQueryBackEnd::cancel()
{
    m_cancelled = true;
    const std::lock_guard lock(m_callbackMutex);
}

void RecordQueryBackEnd::deliver(const RecordAnswer &answer)
{
    const std::lock_guard lock(m_callbackMutex);
    if (!m_cancelled)
        m_callback(answer);
}

std::unique_ptr<RecordQuery> RecordQuery::start(const std::string &name, uint16_t type, uint16_t recordClass,
                                                RecordCallback callback)
{
    // A NUL would end the name early for the libraries below, which would then ask for another domain.
    if (name.find('\0') != std::string::npos)
        return nullptr;
    const auto make = isLocalName(name) ? makeServiceQuery : makeResolverQuery;
    auto backEnd = make(name, type, recordClass, std::move(callback));
    if (!backEnd)
        return nullptr;
    return std::unique_ptr<RecordQuery>(new RecordQuery(std::move(backEnd)));
}

RecordQuery::RecordQuery(std::shared_ptr<RecordQueryBackEnd> backEnd) : m_backEnd(std::move(backEnd))
{
}

RecordQuery::~RecordQuery()
{
    m_backEnd->cancel();
    if (m_queue)
        m_queue->wake();  // so that it lets go of the back end, with its sockets
}

int RecordQuery::attach(QueryQueue &queue)
{
    const int error = queue.add(m_backEnd);
    if (error == 0)
        m_queue = &queue;
    return error;
}

}  // namespace kavell
