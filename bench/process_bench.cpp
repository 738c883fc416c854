// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whole processes, from their start to their end: the command-line client, a C program that reads the same files, and a
// C++ program that does nothing.

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "bench/accounts.h"

using namespace kavell;

namespace {

std::string besideThisProgram(const char *relative)
{
    return (std::filesystem::read_symlink("/proc/self/exe").parent_path() / relative).string();
}

void runProcess(benchmark::State &state, const std::string &program, std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), program);
    std::vector<char *> words;
    for (std::string &argument : arguments)
        words.push_back(argument.data());
    words.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    for (auto _ : state) {
        pid_t pid = 0;
        int status = 0;
        if (posix_spawn(&pid, program.c_str(), &actions, nullptr, words.data(), environ) != 0 ||
            waitpid(pid, &status, 0) != pid || status != 0) {
            state.SkipWithError("the process failed");
            break;
        }
    }
    posix_spawn_file_actions_destroy(&actions);
}

void clientList(benchmark::State &state)
{
    const auto providerType = bench::providerWithAccounts(static_cast<int>(state.range(0)));
    runProcess(state, besideThisProgram("../bin/kavell-accounts"),
               {"list", "--provider", toStdString(providerType.get())});
}

void readFiles(benchmark::State &state)
{
    const auto providerType = bench::providerWithAccounts(static_cast<int>(state.range(0)));
    runProcess(state, besideThisProgram("read_files"), {bench::providerDirectory(providerType.get())});
}

void emptyProcess(benchmark::State &state)
{
    runProcess(state, besideThisProgram("empty_process"), {});
}

BENCHMARK(clientList)->Arg(1)->Arg(1000)->Unit(benchmark::kMicrosecond)->UseRealTime();
BENCHMARK(readFiles)->Arg(1)->Arg(1000)->Unit(benchmark::kMicrosecond)->UseRealTime();
BENCHMARK(emptyProcess)->Unit(benchmark::kMicrosecond)->UseRealTime();

}  // namespace

BENCHMARK_MAIN();
