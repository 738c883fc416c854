// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of the command-line client share: a home of its own for each test, the program run to its end in it,
// and the store as another program would use it. For one thread.

#ifndef KAVELL_TESTS_TOOLS_CLIENT_FIXTURE_H
#define KAVELL_TESTS_TOOLS_CLIENT_FIXTURE_H

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <string>
#include <string_view>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <unistd.h>
#include <vector>

#include "tests/support/process.h"

namespace kavell::test {

inline constexpr std::string_view googleType = "com.corvane.account.google";
inline constexpr std::string_view mailType = "com.corvane.account.mail";

class ClientTest : public testing::Test {
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "client-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        m_home = pattern;
        setenv("HOME", m_home.c_str(), 1);
        setenv("XDG_CONFIG_HOME", (m_home + "/config").c_str(), 1);
        setenv("KAVELL_CREDENTIAL_STORE", "none", 1);
    }

    void TearDown() override { std::filesystem::remove_all(m_home); }

    [[nodiscard]] static std::vector<std::string> commandLine(std::vector<std::string> words)
    {
        words.insert(words.begin(), buildPath("bin/kavell-accounts"));
        return words;
    }

    [[nodiscard]] static ProgramResult client(std::vector<std::string> words, std::string_view input = {})
    {
        return runProgram(commandLine(std::move(words)), input);
    }

    /// Runs a command that must succeed.
    static void run(std::vector<std::string> words, std::string_view input = {})
    {
        const ProgramResult result = client(std::move(words), input);
        ASSERT_EQ(result.status, 0) << result.error;
    }

    /// Everything below the home: paths and contents, to compare before and after.
    [[nodiscard]] std::string everythingOnDisk() const
    {
        std::vector<std::string> paths;
        for (const auto &entry : std::filesystem::recursive_directory_iterator(m_home))
            paths.push_back(entry.path().string());
        std::sort(paths.begin(), paths.end());
        std::string all;
        for (const std::string &path : paths)
            all += path + "\n" + (std::filesystem::is_regular_file(path) ? readFile(path) : "") + "\n";
        return all;
    }

    [[nodiscard]] const std::string &home() const { return m_home; }

private:
    std::string m_home;
};

}  // namespace kavell::test

#endif
