// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/integration/hold_recorder.h"

#include <atomic>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <string>
#include <sys/mman.h>
#include <sys/sem.h>
#include <sys/stat.h>
#include <unistd.h>

namespace kavell::test {

namespace {

HoldLog *mapLog()
{
    const char *path = std::getenv(kHoldLogVariable);
    const int file = path ? open(path, O_RDWR | O_CLOEXEC) : -1;
    if (file < 0)
        return nullptr;
    void *memory = mmap(nullptr, sizeof(HoldLog), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
    close(file);
    return memory == MAP_FAILED ? nullptr : static_cast<HoldLog *>(memory);
}

HoldLog *sharedLog()
{
    static HoldLog *const log = mapLog();
    return log;
}

const char *dataFile()
{
    static const char *const path = std::getenv(kHoldFileVariable);
    return path ? path : "";
}

HoldValues valuesOfFile()
{
    HoldValues values;
    values.fill(-1);
    std::string contents(8192, '\0');
    const int file = open(dataFile(), O_RDONLY | O_CLOEXEC);
    const ssize_t length = file < 0 ? -1 : read(file, contents.data(), contents.size());
    close(file);
    contents.resize(length < 0 ? 0 : static_cast<size_t>(length));
    for (size_t worker = 0; worker < values.size(); ++worker) {
        const size_t key = contents.find("<key>worker " + std::to_string(worker) + "</key>");
        const size_t number = key == std::string::npos ? key : contents.find("<integer>", key);
        if (number != std::string::npos)
            values[worker] = std::atoi(contents.c_str() + number + std::strlen("<integer>"));
    }
    return values;
}

void record(HoldEvent event, const HoldValues &values)
{
    HoldLog *log = sharedLog();
    const uint64_t number = std::atomic_ref(log->count).fetch_add(1);
    if (number >= kMostHoldEntries)
        std::abort();
    log->entries[number] = {event, getpid(), values};
}

template <typename Function> Function *systemFunction(const char *name)
{
    return reinterpret_cast<Function *>(dlsym(RTLD_NEXT, name));
}

}  // namespace

}  // namespace kavell::test

using namespace kavell::test;

// The program's own definitions come before the C library's, for the shared library too.
extern "C" {

[[gnu::visibility("default")]] int semop(int set, sembuf *operations, size_t count) noexcept
{
    static auto *const system = systemFunction<int(int, sembuf *, size_t)>("semop");
    const bool isRecorded = sharedLog() && count == 1;
    // Drawn while the semaphore is still held.
    if (isRecorded && operations->sem_op == 1)
        record(HoldEvent::Release, valuesOfFile());
    const int result = system(set, operations, count);
    if (isRecorded && operations->sem_op == -1 && result == 0)
        record(HoldEvent::Take, valuesOfFile());
    return result;
}

[[gnu::visibility("default")]] int stat(const char *path, struct stat *status) noexcept
{
    static auto *const system = systemFunction<int(const char *, struct stat *)>("stat");
    if (sharedLog() && std::strcmp(path, dataFile()) == 0)
        record(HoldEvent::Status, {});
    return system(path, status);
}
}
