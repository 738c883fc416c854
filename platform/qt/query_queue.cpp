// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/query_queue.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdint>
#include <iterator>
#include <pthread.h>
#include <sys/eventfd.h>
#include <system_error>
#include <thread>
#include <unistd.h>

namespace kavell {

namespace {

/// Keeps the program's signals away from a thread that is started meanwhile.
class BlockedSignals {
public:
    BlockedSignals()
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &m_previous);
    }
    ~BlockedSignals() { pthread_sigmask(SIG_SETMASK, &m_previous, nullptr); }
    BlockedSignals(const BlockedSignals &) = delete;
    BlockedSignals &operator=(const BlockedSignals &) = delete;

private:
    sigset_t m_previous{};
};

/// The sooner of two time-outs of poll, in which -1 is never.
int sooner(int a, int b)
{
    if (a < 0 || b < 0)
        return std::max(a, b);
    return std::min(a, b);
}

}  // namespace

QuerySource::~QuerySource() = default;

QueryQueue &QueryQueue::shared()
{
    // Never destroyed: its thread runs until the process ends.
    static auto *const gDNSQueryDispatchQ = new QueryQueue("kavell.dnsquery");
    return *gDNSQueryDispatchQ;
}

QueryQueue &QueryQueue::services()
{
    static auto *const queue = new QueryQueue("kavell.dnssd");
    return *queue;
}

int QueryQueue::add(std::shared_ptr<QuerySource> source)
{
    if (const int error = m_additionError)
        return error;
    const std::lock_guard lock(m_mutex);
    if (const int error = start())
        return error;
    m_sources.push_back(std::move(source));
    wake();
    return 0;
}

int QueryQueue::start()
{
    if (m_running)
        return 0;
    if (m_wakeDescriptor < 0)
        m_wakeDescriptor = eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK);
    if (m_wakeDescriptor < 0)
        return errno;
    const BlockedSignals blocked;
    try {
        std::thread(&QueryQueue::run, this).detach();
    } catch (const std::system_error &failure) {
        return failure.code().value();
    }
    m_running = true;
    return 0;
}

void QueryQueue::wake() const
{
    const uint64_t one = 1;
    // A full counter is as good as one more.
    static_cast<void>(!write(m_wakeDescriptor, &one, sizeof one));
}

std::vector<std::shared_ptr<QuerySource>> QueryQueue::sources()
{
    // What is done is freed after the lock is given back: that may block, and nobody who adds waits for it.
    std::vector<std::shared_ptr<QuerySource>> done;
    const std::lock_guard lock(m_mutex);
    const auto isActive = [](const auto &source) {
        return !source->isDone();
    };
    const auto firstDone = std::stable_partition(m_sources.begin(), m_sources.end(), isActive);
    done.assign(std::move_iterator(firstDone), std::move_iterator(m_sources.end()));
    m_sources.erase(firstDone, m_sources.end());
    return m_sources;
}

void QueryQueue::run()
{
    pthread_setname_np(pthread_self(), m_threadName);
    std::vector<pollfd> descriptors;
    std::vector<size_t> ends;
    for (;;) {
        const auto active = sources();
        descriptors.assign(1, pollfd{m_wakeDescriptor, POLLIN, 0});
        ends.clear();
        int timeOut = -1;
        for (const auto &source : active) {
            timeOut = sooner(timeOut, source->appendDescriptors(descriptors));
            ends.push_back(descriptors.size());
        }
        if (poll(descriptors.data(), descriptors.size(), timeOut) < 0)
            continue;
        if (uint64_t count = 0; descriptors.front().revents)
            static_cast<void>(!read(m_wakeDescriptor, &count, sizeof count));
        size_t begin = 1;
        for (size_t index = 0; index < active.size(); ++index) {
            active[index]->process(descriptors.data() + begin, ends[index] - begin);
            begin = ends[index];
        }
    }
}

}  // namespace kavell
