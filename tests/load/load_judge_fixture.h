// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Logs written by hand, for the tests of the load test's judge.

#ifndef KAVELL_TESTS_LOAD_LOAD_JUDGE_FIXTURE_H
#define KAVELL_TESTS_LOAD_LOAD_JUDGE_FIXTURE_H

#include <gtest/gtest.h>
#include <initializer_list>
#include <string>

#include "tests/load/load_judge.h"

namespace kavell::test {

inline constexpr uint64_t kInode = 100, kNewInode = 200;
inline constexpr int32_t kAda = 1, kBob = 2, kCid = 3;

/// Values of the first three workers.
inline LoadValues values(uint32_t first, uint32_t second = 0, uint32_t third = 0)
{
    LoadValues all{};
    all[0] = first;
    all[1] = second;
    all[2] = third;
    return all;
}

/// The first complaint of several events. A list is worked off in its order, unlike the operands of "+".
inline std::string inTurn(std::initializer_list<std::string> complaints)
{
    for (const std::string &complaint : complaints) {
        if (!complaint.empty())
            return complaint;
    }
    return {};
}

class LoadJudgeTest : public testing::Test {
protected:
    LoadJudgeTest() { judge.begin(0, kInode); }

    /// Follows an event of a process, which is the worker of the number before its own.
    std::string event(int32_t process, LoadEvent kind, const LoadValues &values = {}, uint64_t inode = kInode,
                      bool flag = false, uint32_t number = 0)
    {
        LoadEntry entry;
        entry.event = kind;
        entry.flag = flag;
        entry.worker = static_cast<uint16_t>(process - 1);
        entry.process = process;
        entry.number = number;
        entry.isForReading = isReading;
        entry.inode = inode;
        entry.values = values;
        return judge.follow(entry);
    }

    std::string willSave(int32_t process, uint32_t number)
    {
        return inTurn({event(process, LoadEvent::WillSave, {}, 0, false, number), event(process, LoadEvent::Status)});
    }
    std::string hold(int32_t process, const LoadValues &before, const LoadValues &after)
    {
        return inTurn({event(process, LoadEvent::Take, before), event(process, LoadEvent::Release, after)});
    }
    std::string done(int32_t process) { return event(process, LoadEvent::Done, {}, 0, true); }

    bool isReading = true;  ///< whether files are opened for nothing else from now on
    LoadJudge judge;
};

}  // namespace kavell::test

#endif
