// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// For builds with the thread sanitizer only. The toolkit is not built with it, so that a closure which a thread hands to
// the pool looks like one that two threads use at once. This stands in for the pool's entry and for the wait for its end,
// and says what happens first.

#include <dlfcn.h>
#include <functional>

class QThreadPool;

extern "C" {
void __tsan_acquire(void *address);
void __tsan_release(void *address);

/// QThreadPool::start(std::function<void()>, int), by its name in the toolkit's library.
__attribute__((visibility("default"))) void
kavellStartInPool(QThreadPool *pool, std::function<void()> work,
                  int priority) __asm__("_ZN11QThreadPool5startESt8functionIFvvEEi");

/// QThreadPool::waitForDone(int), in the same way.
__attribute__((visibility("default"))) bool
kavellWaitForPool(QThreadPool *pool, int milliseconds) __asm__("_ZN11QThreadPool11waitForDoneEi");
}

namespace {

char sTasksDone;  // its address stands for all tasks that have ended

/// Has a name of its own, by which reports about it are recognised: the texts in a closure are shared with the toolkit,
/// which lets go of them by counts that the sanitizer does not see.
__attribute__((noinline)) void letTaskGo(std::function<void()> *task)
{
    delete task;
}

}  // namespace

void kavellStartInPool(QThreadPool *pool, std::function<void()> work, int priority)
{
    using Start = void (*)(QThreadPool *, std::function<void()>, int);
    static const auto start = reinterpret_cast<Start>(dlsym(RTLD_NEXT, "_ZN11QThreadPool5startESt8functionIFvvEEi"));
    auto *const handedOver = new std::function<void()>(std::move(work));
    __tsan_release(handedOver);
    start(
        pool,
        [handedOver] {
            __tsan_acquire(handedOver);
            (*handedOver)();
            letTaskGo(handedOver);
            __tsan_release(&sTasksDone);
        },
        priority);
}

bool kavellWaitForPool(QThreadPool *pool, int milliseconds)
{
    using Wait = bool (*)(QThreadPool *, int);
    static const auto wait = reinterpret_cast<Wait>(dlsym(RTLD_NEXT, "_ZN11QThreadPool11waitForDoneEi"));
    const bool isDone = wait(pool, milliseconds);
    if (isDone)
        __tsan_acquire(&sTasksDone);
    return isDone;
}
