// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/terminal.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <string_view>
#include <strings.h>
#include <termios.h>
#include <unistd.h>

#include "tools/failure.h"
#include "tools/files.h"

namespace kavell::tools {

namespace {

constexpr std::array<int, 4> endingSignals{SIGINT, SIGTERM, SIGHUP, SIGTSTP};

volatile std::sig_atomic_t receivedSignal = 0;

void noteSignal(int number)
{
    receivedSignal = number;
}

/// While it lives, the terminal does not echo and signals break a read off instead of ending the program; afterwards
/// the terminal is as before, and a signal that came takes effect.
class EchoOff {
public:
    explicit EchoOff(int terminal) : m_terminal(terminal)
    {
        receivedSignal = 0;
        struct sigaction noting = {};
        noting.sa_handler = noteSignal;
        for (size_t index = 0; index < endingSignals.size(); ++index)
            sigaction(endingSignals[index], &noting, &m_formerActions[index]);
        m_changed = tcgetattr(m_terminal, &m_former) == 0;
        termios silent = m_former;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO | ECHOE | ECHOK | ECHONL);
        m_changed = m_changed && tcsetattr(m_terminal, TCSAFLUSH, &silent) == 0;
    }

    ~EchoOff()
    {
        if (m_changed)
            tcsetattr(m_terminal, TCSANOW, &m_former);
        for (size_t index = 0; index < endingSignals.size(); ++index)
            sigaction(endingSignals[index], &m_formerActions[index], nullptr);
        if (receivedSignal != 0)
            raise(receivedSignal);
    }

    EchoOff(const EchoOff &) = delete;
    EchoOff &operator=(const EchoOff &) = delete;

    [[nodiscard]] bool isSilent() const { return m_changed; }

private:
    int m_terminal;
    bool m_changed = false;
    termios m_former{};
    std::array<struct sigaction, endingSignals.size()> m_formerActions{};
};

void say(int terminal, std::string_view text)
{
    while (!text.empty()) {
        const ssize_t written = write(terminal, text.data(), text.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0)
            return;
        text.remove_prefix(static_cast<size_t>(written));
    }
}

/// A line without its end; what was typed so far when a signal or the end of input comes.
std::string readLine(int terminal)
{
    std::string line;
    char letter = 0;
    while (receivedSignal == 0) {
        const ssize_t count = read(terminal, &letter, 1);
        if (count < 0 && errno == EINTR)
            continue;
        if (count <= 0 || letter == '\n' || letter == '\r')
            break;
        line += letter;
    }
    return line;
}

std::string askSilently(int terminal, const std::string &prompt)
{
    std::string line;
    {
        const EchoOff silence(terminal);
        if (!silence.isSilent())
            refuse("the terminal cannot hide what is typed; give the password on standard input");
        say(terminal, prompt);
        line = readLine(terminal);
        say(terminal, "\n");
    }
    return line;
}

int openTerminal()
{
    const int terminal = open("/dev/tty", O_RDWR | O_CLOEXEC | O_NOCTTY);
    if (terminal < 0)
        refuse("there is no terminal to ask on; give the password on standard input");
    return terminal;
}

}  // namespace

bool confirm(const std::string &question)
{
    const FileDescriptor terminal(open("/dev/tty", O_RDWR | O_CLOEXEC | O_NOCTTY));
    if (terminal.get() < 0)
        return false;
    receivedSignal = 0;
    say(terminal.get(), question + " [y/N] ");
    const std::string answer = readLine(terminal.get());
    return !answer.empty() && (answer.front() == 'y' || answer.front() == 'Y');
}

std::string askForNewPassword(const std::string &account)
{
    const FileDescriptor terminal(openTerminal());
    std::string password = askSilently(terminal.get(), "Password for " + account + ": ");
    std::string again = password.empty() ? std::string() : askSilently(terminal.get(), "Once more: ");
    const bool same = password == again;
    wipe(again);
    if (same)
        return password;
    wipe(password);
    refuse("the two passwords differ; nothing was stored");
}

void wipe(std::string &secret) noexcept
{
    explicit_bzero(secret.data(), secret.size());
    secret.clear();
}

}  // namespace kavell::tools
