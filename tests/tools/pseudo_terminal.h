// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A pseudo-terminal for tests: runs a program whose controlling terminal it is, types, and sees what the program shows.
// For one thread; every wait has a bound.

#ifndef KAVELL_TESTS_TOOLS_PSEUDO_TERMINAL_H
#define KAVELL_TESTS_TOOLS_PSEUDO_TERMINAL_H

#include <csignal>
#include <cstdlib>
#include <poll.h>
#include <pty.h>
#include <string>
#include <string_view>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>
#include <vector>

namespace kavell::test {

class PseudoTerminal {
public:
    explicit PseudoTerminal(const std::vector<std::string> &words)
    {
        std::vector<char *> arguments;
        for (const std::string &word : words)
            arguments.push_back(const_cast<char *>(word.c_str()));
        arguments.push_back(nullptr);
        m_pid = forkpty(&m_terminal, nullptr, nullptr, nullptr);
        if (m_pid == 0) {
            execv(arguments[0], arguments.data());
            _exit(127);
        }
    }

    ~PseudoTerminal()
    {
        if (m_pid > 0) {
            kill(m_pid, SIGKILL);
            waitpid(m_pid, nullptr, 0);
        }
        close(m_terminal);
    }

    PseudoTerminal(const PseudoTerminal &) = delete;
    PseudoTerminal &operator=(const PseudoTerminal &) = delete;

    /// Waits until the text has been shown, at most ten seconds.
    [[nodiscard]] bool waitFor(std::string_view text)
    {
        while (m_shown.find(text) == std::string::npos)
            if (!readMore())
                return false;
        return true;
    }

    /// Whether the terminal shows what is typed.
    [[nodiscard]] bool echoes() const
    {
        termios settings{};
        return tcgetattr(m_terminal, &settings) == 0 && (settings.c_lflag & ECHO) != 0;
    }

    void type(std::string_view text) const
    {
        if (write(m_terminal, text.data(), text.size()) != static_cast<ssize_t>(text.size()))
            std::abort();
    }

    /// Everything shown until the program ended.
    [[nodiscard]] const std::string &shownToTheEnd()
    {
        while (readMore()) {
        }
        return m_shown;
    }

    /// The exit code, or 128 plus the signal, once the program has closed the terminal.
    [[nodiscard]] int wait()
    {
        (void)shownToTheEnd();
        int status = 0;
        waitpid(m_pid, &status, 0);
        m_pid = -1;
        return WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status);
    }

private:
    bool readMore()
    {
        pollfd waiting{m_terminal, POLLIN, 0};
        char buffer[4096];
        if (poll(&waiting, 1, 10000) <= 0)
            return false;
        const ssize_t count = read(m_terminal, buffer, sizeof buffer);
        if (count <= 0)
            return false;
        m_shown.append(buffer, static_cast<size_t>(count));
        return true;
    }

    int m_terminal = -1;
    pid_t m_pid = -1;
    std::string m_shown;
};

}  // namespace kavell::test

#endif
