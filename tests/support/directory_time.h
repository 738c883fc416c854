// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Lets a directory's time grow older than the tick of the clock of files, after which every change of it shows. Any thread
// may call.

#ifndef KAVELL_TESTS_SUPPORT_DIRECTORY_TIME_H
#define KAVELL_TESTS_SUPPORT_DIRECTORY_TIME_H

#include <chrono>
#include <cstdint>
#include <ctime>
#include <gtest/gtest.h>
#include <string>
#include <sys/stat.h>
#include <thread>

#include "platform/data_directory.h"

namespace kavell::test {

/// How many nanoseconds the directory's time is in the past, as far as the clock of files tells.
[[nodiscard]] inline int64_t ageOfDirectory(const std::string &path)
{
    constexpr int64_t kSecond = 1'000'000'000;
    struct stat status {};
    timespec now{};
    EXPECT_EQ(stat(path.c_str(), &status), 0);
    EXPECT_EQ(clock_gettime(CLOCK_REALTIME_COARSE, &now), 0);
    return (now.tv_sec - status.st_ctim.tv_sec) * kSecond + (now.tv_nsec - status.st_ctim.tv_nsec);
}

inline void letTimePass(const std::string &path)
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (ageOfDirectory(path) <= kLongestTick) {
        ASSERT_LT(std::chrono::steady_clock::now(), deadline) << "the clock of files stands still, or was set back";
        std::this_thread::yield();
    }
}

}  // namespace kavell::test

#endif
