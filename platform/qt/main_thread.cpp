// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/main_thread.h"

#include <chrono>
#include <condition_variable>
#include <exception>
#include <memory>
#include <mutex>

#include <QtCore/QCoreApplication>
#include <QtCore/QThread>

namespace kavell {

namespace {

/// How often a thread that waits looks whether the program is ending.
constexpr std::chrono::milliseconds kLookInterval{50};

/// Work that a thread has asked the main thread for.
class Request {
public:
    /// Main thread. Nothing when nobody waits any more.
    void run(const std::function<void()> &work)
    {
        {
            const std::lock_guard lock(m_mutex);
            if (m_state == State::Withdrawn)
                return;
            m_state = State::Running;
        }
        std::exception_ptr thrown;
        try {
            work();
        } catch (...) {
            thrown = std::current_exception();
        }
        const std::lock_guard lock(m_mutex);
        m_thrown = thrown;
        m_state = State::Done;
        m_changed.notify_one();
    }

    /// Ends the wait unless the work has begun.
    void withdraw()
    {
        const std::lock_guard lock(m_mutex);
        if (m_state == State::Asked)
            m_state = State::Withdrawn;
        m_changed.notify_one();
    }

    /// The other thread.
    void wait()
    {
        std::unique_lock lock(m_mutex);
        while (!m_changed.wait_for(lock, kLookInterval, [this] { return isOver(); })) {
            // The main event loop comes to nothing more, and the program would wait for its pool's threads for ever.
            if (m_state == State::Asked && QCoreApplication::closingDown())
                m_state = State::Withdrawn;
        }
        if (m_thrown)
            std::rethrow_exception(m_thrown);
    }

private:
    enum class State { Asked, Running, Done, Withdrawn };

    [[nodiscard]] bool isOver() const { return m_state == State::Done || m_state == State::Withdrawn; }

    std::mutex m_mutex;
    std::condition_variable m_changed;
    State m_state = State::Asked;
    std::exception_ptr m_thrown;
};

}  // namespace

void runOnMainThread(const std::function<void()> &work)
{
    QCoreApplication *const application = QCoreApplication::instance();
    if (!application || QThread::currentThread() == application->thread()) {
        work();
        return;
    }
    const auto request = std::make_shared<Request>();
    // Goes with the event, which is dropped with the application object when the loop did not come to it.
    std::shared_ptr<Request> asked(request.get(), [request](Request *dropped) { dropped->withdraw(); });
    QMetaObject::invokeMethod(
        application, [asked = std::move(asked), &work] { asked->run(work); }, Qt::QueuedConnection);
    request->wait();
}

}  // namespace kavell
