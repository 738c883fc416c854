// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A serial work queue for look-ups: one thread that waits for the descriptors of all active sources at once, so that a
// slow server delays nobody else's answer. The record queries run on one such queue, what may block on another. Any
// thread may add.

#ifndef KAVELL_PLATFORM_QT_QUERY_QUEUE_H
#define KAVELL_PLATFORM_QT_QUERY_QUEUE_H

#include <atomic>
#include <memory>
#include <mutex>
#include <poll.h>
#include <vector>

namespace kavell {

/// Something with descriptors to wait for. The queue calls it on its own thread only, and lets go of it there.
class QuerySource {
public:
    QuerySource() = default;
    QuerySource(const QuerySource &) = delete;
    QuerySource &operator=(const QuerySource &) = delete;
    virtual ~QuerySource();

    /// Appends what to wait for and answers after how many milliseconds to come back without it; -1 for never.
    virtual int appendDescriptors(std::vector<pollfd> &descriptors) = 0;

    /// Does what can be done now; `descriptors` are those that it appended, with what happened to them. On the queue of
    /// all answers without blocking.
    virtual void process(const pollfd *descriptors, size_t count) = 0;

    /// Whether the source has nothing more to do; the queue then lets go of it.
    [[nodiscard]] virtual bool isDone() const = 0;
};

class QueryQueue {
public:
    /// The process's queue "com.corvane.kavellaccounts.dnsquery", made by the first call and kept to the end.
    [[nodiscard]] static QueryQueue &shared();

    /// The queue of what may block for long: the calls of the machine's DNS-SD service. Nobody waits for its sources.
    [[nodiscard]] static QueryQueue &services();

    /// Has the source waited for until it is done. 0, or the number of the error that keeps the queue from running.
    [[nodiscard]] int add(std::shared_ptr<QuerySource> source);

    /// Lets the thread look at its sources again.
    void wake() const;

    /// Lets every later `add` fail with this number; 0 ends that. For tests, as real failures want a starved machine.
    void failAdditionsWith(int error) { m_additionError = error; }

private:
    explicit QueryQueue(const char *threadName) : m_threadName(threadName) {}
    [[nodiscard]] int start();
    void run();
    [[nodiscard]] std::vector<std::shared_ptr<QuerySource>> sources();

    const char *const m_threadName;  ///< at most 15 bytes
    std::mutex m_mutex;
    std::vector<std::shared_ptr<QuerySource>> m_sources;
    int m_wakeDescriptor = -1;
    bool m_running = false;
    std::atomic<int> m_additionError{0};
};

}  // namespace kavell

#endif
