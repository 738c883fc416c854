// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/process.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <poll.h>
#include <sstream>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace kavell::test {

namespace {

int statusOf(int waited)
{
    return WIFSIGNALED(waited) ? 128 + WTERMSIG(waited) : WEXITSTATUS(waited);
}

std::string contentsOf(int file)
{
    std::string text;
    std::array<char, 65536> buffer;
    lseek(file, 0, SEEK_SET);
    for (ssize_t count; (count = read(file, buffer.data(), buffer.size())) > 0;)
        text.append(buffer.data(), static_cast<size_t>(count));
    close(file);
    return text;
}

}  // namespace

ChildProcess::ChildProcess(const std::function<int()> &body)
{
    std::fflush(nullptr);
    m_pid = fork();
    if (m_pid == 0)
        _exit(body());
}

ChildProcess::ChildProcess(const std::vector<std::string> &arguments, const std::vector<std::string> &environment,
                           int standardInput, int standardOutput, int standardError)
    : ChildProcess([&] {
          dup2(standardInput, STDIN_FILENO);
          dup2(standardOutput, STDOUT_FILENO);
          dup2(standardError, STDERR_FILENO);
          for (const std::string &entry : environment)
              putenv(const_cast<char *>(entry.c_str()));
          std::vector<char *> words;
          for (const std::string &argument : arguments)
              words.push_back(const_cast<char *>(argument.c_str()));
          words.push_back(nullptr);
          execvp(words[0], words.data());
          return 127;
      })
{
}

ChildProcess::~ChildProcess()
{
    if (m_pid <= 0)
        return;
    kill(m_pid, SIGKILL);
    waitpid(m_pid, nullptr, 0);
}

void ChildProcess::signal(int number) const
{
    if (m_pid > 0)
        kill(m_pid, number);
}

int ChildProcess::wait(std::chrono::milliseconds bound)
{
    if (m_pid <= 0)
        return -1;
    const int descriptor = static_cast<int>(syscall(SYS_pidfd_open, m_pid, 0));
    pollfd waiting{descriptor, POLLIN, 0};
    int ready;
    while ((ready = poll(&waiting, 1, static_cast<int>(bound.count()))) < 0 && errno == EINTR) {
    }
    close(descriptor);
    if (ready == 0)
        kill(m_pid, SIGKILL);
    int waited = 0;
    waitpid(m_pid, &waited, 0);
    m_pid = -1;
    return ready == 0 ? -1 : statusOf(waited);
}

ProgramResult runProgram(const std::vector<std::string> &arguments, std::string_view input,
                         const std::vector<std::string> &environment, std::chrono::milliseconds bound)
{
    const int in = memfd_create("input", MFD_CLOEXEC);
    const int out = memfd_create("output", MFD_CLOEXEC);
    const int err = memfd_create("error", MFD_CLOEXEC);
    if (write(in, input.data(), input.size()) != static_cast<ssize_t>(input.size()))
        std::abort();
    lseek(in, 0, SEEK_SET);
    ChildProcess child(arguments, environment, in, out, err);
    ProgramResult result;
    result.status = child.wait(bound);
    close(in);
    result.output = contentsOf(out);
    result.error = contentsOf(err);
    return result;
}

std::string buildPath(std::string_view relative)
{
    const char *directory = std::getenv("KAVELL_BUILD_DIR");
    return std::string(directory ? directory : ".") + "/" + std::string(relative);
}

std::string sourcePath(std::string_view relative)
{
    const char *directory = std::getenv("KAVELL_SOURCE_DIR");
    return std::string(directory ? directory : ".") + "/" + std::string(relative);
}

std::string readFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream contents;
    contents << file.rdbuf();
    return contents.str();
}

void writeFile(const std::string &path, std::string_view contents)
{
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    std::ofstream(path, std::ios::binary | std::ios::trunc)
        .write(contents.data(), static_cast<std::streamsize>(contents.size()));
}

std::string dataFilePath(std::string_view providerType, std::string_view loginName)
{
    return std::string(std::getenv("HOME")) + "/Library/Kavell Accounts/V1/" + std::string(providerType) + "/" +
           std::string(loginName) + ".plist";
}

}  // namespace kavell::test
