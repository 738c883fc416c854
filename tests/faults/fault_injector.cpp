// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/faults/fault_injector.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <iostream>
#include <malloc.h>
#include <sys/stat.h>

#include <gtest/gtest.h>

namespace kavell::test {

namespace {

// After so many unlike outcomes the rest says nothing new.
constexpr int kMostFailures = 10;
// The allocator keeps about half of this at hand.
constexpr size_t kMostKeptBytes = 8192;

size_t memoryInUse()
{
    const struct mallinfo2 information = mallinfo2();
    return information.uordblks + information.hblkhd;
}

bool movesBytes(CallKind kind)
{
    return kind == CallKind::Read || kind == CallKind::Write;
}

/// Those on semaphores and sockets stand behind all others.
bool isOnFiles(CallKind kind)
{
    return kind < CallKind::MakeKey;
}

bool changesDisk(const SystemCall &call)
{
    switch (call.kind) {
    case CallKind::Open:
        return (call.flags & (O_ACCMODE | O_CREAT)) != 0;
    case CallKind::Write:
    case CallKind::Truncate:
    case CallKind::Reserve:
    case CallKind::SyncFile:
    case CallKind::SyncData:
    case CallKind::ChangeMode:
    case CallKind::SetTimes:
    case CallKind::Rename:
    case CallKind::Link:
    case CallKind::Unlink:
    case CallKind::MakeDirectory:
    case CallKind::RemoveDirectory:
        return true;
    default:
        return false;
    }
}

/// Whether the path is on another disk: observers of notifications meet there, not the accounts.
bool isElsewhere(std::string_view path)
{
    return path.starts_with(std::getenv("XDG_RUNTIME_DIR"));
}

std::vector<Fault> faultsOf(size_t number, CallKind kind, const FaultRuns &runs)
{
    std::vector<Fault> faults;
    for (const int error : runs.errors)
        faults.push_back({number, Fault::Form::Error, error});
    if (movesBytes(kind)) {
        faults.push_back({number, Fault::Form::Half});
        faults.push_back({number, Fault::Form::OneByte});
        faults.push_back({number, Fault::Form::HalfThenError, EIO});
    }
    faults.push_back({number, Fault::Form::ReadOnly, EROFS});
    faults.push_back({number, Fault::Form::Gone, EIO});
    return faults;
}

/// How many bytes the call would move.
size_t bytesThereFor(const SystemCall &call)
{
    struct stat status {};
    if (call.kind != CallKind::Read || call.offset < 0 || fstat(call.descriptor, &status) != 0)
        return call.length;
    return std::min(call.length, static_cast<size_t>(std::max<off_t>(status.st_size - call.offset, 0)));
}

}  // namespace

bool Fault::isPassing(CallKind kind) const
{
    if (form == Form::Half || form == Form::OneByte)
        return true;
    // The others never end so, whatever the system.
    static constexpr std::array kInterruptible = {
        CallKind::Open,     CallKind::Read,     CallKind::Write, CallKind::Truncate, CallKind::Reserve,
        CallKind::SyncFile, CallKind::SyncData, CallKind::Lock,  CallKind::Connect,  CallKind::Send};
    return form == Form::Error && error == EINTR &&
           std::find(kInterruptible.begin(), kInterruptible.end(), kind) != kInterruptible.end();
}

bool FaultInjector::strikes(const SystemCall &call, size_t number)
{
    if (number == m_fault.number && !m_fault.isLasting())
        return true;
    switch (m_fault.form) {
    case Fault::Form::HalfThenError:
        return m_fault.number != SIZE_MAX && number == m_fault.number + 1 && call.kind == m_calls[m_fault.number].kind;
    case Fault::Form::ReadOnly:
        return number >= m_fault.number && changesDisk(call);
    case Fault::Form::Gone:
        return number >= m_fault.number && isOnFiles(call.kind) && call.kind != CallKind::ReadDirectory &&
               !(call.path && isElsewhere(call.path));
    default:
        return false;
    }
}

long FaultInjector::onCall(SystemCall &call, const std::function<long()> &make)
{
    const size_t number = m_calls.size();
    m_calls.push_back({call.kind, call.path ? call.path : "", call.change});
    if (call.kind == CallKind::Rename && call.flags != 0 && !m_canRenameWithoutReplacing) {
        errno = EINVAL;
        return -1;
    }
    if (!strikes(call, number))
        return make();
    m_calls.back().isFailed = true;
    if (movesBytes(call.kind) && number == m_fault.number &&
        (m_fault.form == Fault::Form::Half || m_fault.form == Fault::Form::HalfThenError ||
         m_fault.form == Fault::Form::OneByte)) {
        call.length = m_fault.form == Fault::Form::OneByte ? 1 : (bytesThereFor(call) + 1) / 2;
        return make();
    }
    if (call.change > 0)
        make();
    errno = m_fault.error;
    return -1;
}

const FaultInjector::SeenCall *FaultInjector::failed() const
{
    for (const SeenCall &call : m_calls) {
        if (call.isFailed)
            return &call;
    }
    return nullptr;
}

bool FaultInjector::cameAfter(CallKind kind) const
{
    for (size_t number = 0; number < std::min(m_fault.number, m_calls.size()); ++number) {
        if (m_calls[number].kind == kind)
            return true;
    }
    return false;
}

std::string FaultInjector::description() const
{
    static constexpr std::array<const char *, 6> kForms = {"fails",
                                                           "is cut in half",
                                                           "is cut to a byte",
                                                           "fails half way",
                                                           "and all later writing fails",
                                                           "and all later calls fail"};
    if (m_fault.number >= m_calls.size())
        return "no fault";
    const SeenCall &call = m_calls[m_fault.number];
    return "call " + std::to_string(m_fault.number) + ", " + std::string(nameOf(call.kind)) + " " + call.path + ", " +
           kForms[static_cast<size_t>(m_fault.form)] +
           (m_fault.error ? std::string(": ") + std::strerror(m_fault.error) : "");
}

void forEachFault(const FaultRuns &runs, const std::function<void(FaultInjector &)> &run)
{
    // Twice, because the first run may make what all later ones find.
    FaultInjector first(Fault{}, runs.canRenameWithoutReplacing), counting(Fault{}, runs.canRenameWithoutReplacing);
    run(first);
    run(counting);
    ASSERT_FALSE(counting.calls().empty());
    ASSERT_FALSE(testing::Test::HasFailure()) << "without a fault";
    size_t count = 0, struck = 0;
    const size_t memory = memoryInUse();
    const auto *result = testing::UnitTest::GetInstance()->current_test_info()->result();
    for (size_t number = 0; number < counting.calls().size(); ++number) {
        const auto &call = counting.calls()[number];
        // Without its directory a poster makes one outside of the scratch home.
        if (call.kind == CallKind::Status && isElsewhere(call.path))
            continue;
        for (const Fault &fault : faultsOf(number, call.kind, runs)) {
            FaultInjector injector(fault, runs.canRenameWithoutReplacing);
            const int failures = result->total_part_count();
            run(injector);
            ++count;
            struck += injector.failed() ? 1 : 0;
            if (result->total_part_count() > failures)
                ADD_FAILURE() << "That was: " << injector.description();
            ASSERT_LT(result->total_part_count(), kMostFailures * 2);
        }
    }
    EXPECT_GT(struck, count / 2);
    // A leak in each run, or in each of a kind, comes to more; one in a single run is the sanitizer's to find.
    EXPECT_LT(runs.leaveNothing ? memoryInUse() : 0, memory + kMostKeptBytes);
    std::cout << "[   FAULTS ] " << counting.calls().size() << " calls, " << count << " runs\n";
}

size_t countOpenDescriptors()
{
    return static_cast<size_t>(std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {}));
}

}  // namespace kavell::test
