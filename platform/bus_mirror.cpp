// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The road of a copy: the poster translates it and puts it in the queue; the worker, started with the first copy, loads
// the services module and sends what is in the queue; at the process's end the queue gets a moment to drain. Whatever
// the bus does, only the worker waits for it.

#include "platform/bus_mirror.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <cstdlib>
#include <deque>
#include <memory>
#include <mutex>
#include <thread>
#include <unistd.h>

#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellNumber.h>
#include <kavellaccounts/Ref.h>

#include "platform/services/session_bus_address.h"
#include "platform/services_module.h"

namespace kavell {

namespace {

// Behind a bus that has stopped, copies beyond this many are dropped: the observers' sockets have them all.
constexpr size_t kMostQueued = 10'000;

constexpr std::chrono::milliseconds kDrainBound{200};

// How long the worker lets copies gather before it sends them. On a machine of few processors, sending each at once would
// compete with the commits that post them: it made a commit in a row of many a third slower.
constexpr std::chrono::milliseconds kGatherTime{25};

/// The queue and its worker. Made once per process and never destroyed, because the worker outlives everything.
struct Mirror {
    const pid_t owner = getpid();
    std::mutex mutex;
    std::condition_variable filled;
    std::condition_variable drained;
    std::condition_variable urgent;
    std::deque<BusSignal> queue;
    bool isSending = false;
    bool isEnding = false;  ///< the process ends: nothing gathers any more
    bool hasWorker = false;
};

// Not under a mutex: a process may be forked at the very moment when another thread holds one.
std::atomic<Mirror *> current{nullptr};

bool toBusValue(CSKavellTypeRef object, BusSignal::Value &value)
{
    if (const auto string = cast<CSKavellStringRef>(object, CSKavellStringGetTypeID()))
        value = toStdString(string);
    else if (const auto boolean = cast<CSKavellBooleanRef>(object, CSKavellBooleanGetTypeID()))
        value = CSKavellBooleanGetValue(boolean);
    else if (const auto number = cast<CSKavellNumberRef>(object, CSKavellNumberGetTypeID())) {
        if (CSKavellNumberIsReal(number))
            value = CSKavellNumberGetDouble(number);
        else if (CSKavellNumberIsUnsigned(number))
            value = CSKavellNumberGetUInt64(number);
        else
            value = CSKavellNumberGetInt64(number);
    } else
        return false;
    return true;
}

/// The copy that travels. Values of kinds that a signal has no plain form for are left out.
BusSignal toSignal(CSKavellStringRef name, CSKavellStringRef object, CSKavellDictionaryRef userInformation)
{
    BusSignal signal{toStdString(name), toStdString(object), {}};
    const size_t count = CSKavellDictionaryGetCount(userInformation);
    std::vector<CSKavellTypeRef> keys(count);
    std::vector<CSKavellTypeRef> values(count);
    CSKavellDictionaryGetKeysAndValues(userInformation, keys.data(), values.data());
    for (size_t index = 0; index < count; ++index) {
        const auto key = cast<CSKavellStringRef>(keys[index], CSKavellStringGetTypeID());
        BusSignal::Value value;
        if (key && toBusValue(values[index], value))
            signal.information.emplace_back(toStdString(key), std::move(value));
    }
    return signal;
}

/// Sends a batch. What the bus cannot be reached for is dropped: it would be stale by the time the bus is back.
void sendAll(BusSender &sender, const std::deque<BusSignal> &batch)
{
    for (const BusSignal &signal : batch)
        if (!sender.send(signal))
            return;
    sender.flush();
}

void work(Mirror *mirror)
{
    const ServicesModule *module = servicesModule();
    const std::unique_ptr<BusSender> sender(module ? module->makeBusSender() : nullptr);
    std::unique_lock lock(mirror->mutex);
    for (;;) {
        mirror->filled.wait(lock, [&] { return !mirror->queue.empty(); });
        mirror->isSending = true;
        mirror->urgent.wait_for(lock, kGatherTime, [&] { return mirror->isEnding; });
        while (!mirror->queue.empty()) {
            std::deque<BusSignal> batch;
            batch.swap(mirror->queue);
            lock.unlock();
            if (sender)
                sendAll(*sender, batch);
            lock.lock();
        }
        mirror->isSending = false;
        mirror->drained.notify_all();
    }
}

/// Blocks every signal in this thread while it lives.
class SignalsBlocked {
public:
    SignalsBlocked() noexcept
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &m_saved);
    }
    ~SignalsBlocked() { pthread_sigmask(SIG_SETMASK, &m_saved, nullptr); }
    SignalsBlocked(const SignalsBlocked &) = delete;
    SignalsBlocked &operator=(const SignalsBlocked &) = delete;

private:
    sigset_t m_saved;
};

/// Starts the worker with every signal blocked, which it inherits: the host's signals are the host's threads' business.
/// Throws when the system gives no thread.
void startWorker(Mirror *mirror)
{
    const SignalsBlocked blocked;
    std::thread(work, mirror).detach();
    mirror->hasWorker = true;
}

/// At the end of the process: what was posted just before must still go out, but a bus that hangs must not hold it up.
void drain()
{
    Mirror *mirror = current;
    if (!mirror || mirror->owner != getpid())
        return;
    std::unique_lock lock(mirror->mutex);
    mirror->isEnding = true;
    mirror->urgent.notify_all();
    mirror->drained.wait_for(lock, kDrainBound, [&] { return mirror->queue.empty() && !mirror->isSending; });
}

/// This process's queue. A forked child gets one of its own; the parent's may have been in use at that moment.
Mirror *ownMirror()
{
    static std::once_flag drainsAtExit;
    std::call_once(drainsAtExit, [] { std::atexit(drain); });
    Mirror *mirror = current;
    while (!mirror || mirror->owner != getpid()) {
        auto fresh = std::make_unique<Mirror>();
        if (current.compare_exchange_strong(mirror, fresh.get()))
            return fresh.release();
    }
    return mirror;
}

void post(BusSignal signal)
{
    Mirror *mirror = ownMirror();
    {
        const std::lock_guard lock(mirror->mutex);
        if (mirror->queue.size() >= kMostQueued)
            return;
        if (!mirror->hasWorker)
            startWorker(mirror);
        mirror->queue.push_back(std::move(signal));
    }
    // Not before: the worker would wake up only to wait for the mutex, and to be woken again.
    mirror->filled.notify_one();
}

}  // namespace

void mirrorToSessionBus(CSKavellStringRef name, CSKavellStringRef object,
                        CSKavellDictionaryRef userInformation) noexcept
{
    try {
        if (!sessionBusAddress().empty())
            post(toSignal(name, object, userInformation));
    } catch (...) {
        // Out of memory or threads: the copy is lost, the notification itself is not.
    }
}

}  // namespace kavell
