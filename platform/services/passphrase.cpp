// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/passphrase.h"

#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <sys/stat.h>
#include <termios.h>
#include <unistd.h>

#include "platform/services/user_files.h"

namespace kavell {

namespace {

constexpr const char *kFileVariable = "KAVELL_VAULT_PASSPHRASE_FILE";
constexpr size_t kMostBytes = 4096;

constexpr char kInterrupt = 3;
constexpr char kEndOfInput = 4;
constexpr char kBackspace = 8;
constexpr char kEraseLine = 21;
constexpr char kEscape = 27;
constexpr char kDelete = 127;

bool isPrivate(const struct stat &status)
{
    return S_ISREG(status.st_mode) && (status.st_uid == getuid() || status.st_uid == 0) &&
           (status.st_mode & (S_IRWXG | S_IRWXO)) == 0;
}

/// Reads to the end of the file or of the room; -1 when that fails part way: a part of a passphrase is another one.
ssize_t readToEnd(int file, char *bytes, size_t room)
{
    size_t length = 0;
    while (length < room) {
        const ssize_t count = withoutInterruption([&] { return ::read(file, bytes + length, room - length); });
        if (count < 0)
            return -1;
        if (count == 0)
            break;
        length += static_cast<size_t>(count);
    }
    return static_cast<ssize_t>(length);
}

/// A terminal that hands over each key as it is typed, shows none, and makes no signal of any: the process must not end
/// with the echo still off. Restored on every way out.
class SilentTerminal {
public:
    explicit SilentTerminal(int terminal) : m_terminal(terminal)
    {
        m_isSilent = tcgetattr(terminal, &m_saved) == 0;
        termios silent = m_saved;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO | ECHONL | ICANON | ISIG);
        m_isSilent = m_isSilent && tcsetattr(terminal, TCSAFLUSH, &silent) == 0;
    }
    ~SilentTerminal()
    {
        if (m_isSilent)
            tcsetattr(m_terminal, TCSAFLUSH, &m_saved);
    }
    SilentTerminal(const SilentTerminal &) = delete;
    SilentTerminal &operator=(const SilentTerminal &) = delete;

    [[nodiscard]] bool isSilent() const { return m_isSilent; }

private:
    int m_terminal;
    termios m_saved{};
    bool m_isSilent = false;
};

/// A line being typed, in memory that never moves, so that no copy of it is left behind.
class TypedLine {
public:
    ~TypedLine() { explicit_bzero(m_text, sizeof m_text); }

    /// Takes one key; false when the line is at its end, as `isGivenUp` explains.
    bool take(char key)
    {
        switch (key) {
        case '\n':
        case '\r':
            return false;
        case kInterrupt:
        case kEndOfInput:
        case kEscape:
            isGivenUp = true;
            return false;
        case kEraseLine:
            m_length = 0;
            return true;
        case kBackspace:
        case kDelete:
            erase();
            return true;
        default:
            if (m_length < sizeof m_text)
                m_text[m_length++] = key;
            return true;
        }
    }

    [[nodiscard]] std::string_view view() const { return {m_text, m_length}; }

    bool isGivenUp = false;

private:
    /// Takes back one character, which in UTF-8 may be several bytes.
    void erase()
    {
        while (m_length > 0 && (static_cast<unsigned char>(m_text[--m_length]) & 0xc0) == 0x80) {
        }
    }

    char m_text[kMostBytes];
    size_t m_length = 0;
};

void show(int terminal, std::string_view text)
{
    while (!text.empty()) {
        const ssize_t count = ::write(terminal, text.data(), text.size());
        if (count <= 0 && errno != EINTR)
            return;
        text.remove_prefix(count > 0 ? static_cast<size_t>(count) : 0);
    }
}

/// The terminal, unless this process is in its background: there reading would stop the whole program.
FileDescriptor openTerminal()
{
    FileDescriptor terminal(::open("/dev/tty", O_RDWR | O_NOCTTY | O_CLOEXEC));
    return terminal && tcgetpgrp(terminal.get()) == getpgrp() ? std::move(terminal) : FileDescriptor();
}

CredentialStatus readLine(int terminal, const Deadline &deadline, TypedLine &line)
{
    for (;;) {
        pollfd waiting{terminal, POLLIN, 0};
        const int ready = ::poll(&waiting, 1, deadline.remaining());
        if (ready < 0 && errno == EINTR)
            continue;
        char key = 0;
        if (ready <= 0 || ::read(terminal, &key, 1) != 1)
            return CredentialStatus::locked;
        if (!line.take(key))
            return line.isGivenUp || line.view().empty() ? CredentialStatus::refused : CredentialStatus::stored;
    }
}

}  // namespace

bool hasPassphraseFile()
{
    const char *path = secure_getenv(kFileVariable);
    return path && *path;
}

CredentialStatus readPassphraseFile(Secret &passphrase)
{
    // Not blocking: what stands there may be a pipe.
    const FileDescriptor file = openFile(secure_getenv(kFileVariable), O_RDONLY | O_NONBLOCK | O_NOCTTY);
    struct stat status {};
    if (!file || fstat(file.get(), &status) != 0 || !isPrivate(status))
        return CredentialStatus::locked;
    char buffer[kMostBytes + 1];
    const ssize_t count = readToEnd(file.get(), buffer, sizeof buffer);
    std::string_view text(buffer, count > 0 ? static_cast<size_t>(count) : 0);
    const bool isTooLong = text.size() > kMostBytes;
    if (text.ends_with('\n'))
        text.remove_suffix(1);
    if (text.ends_with('\r'))
        text.remove_suffix(1);
    passphrase = Secret(text);
    explicit_bzero(buffer, sizeof buffer);
    return text.empty() || isTooLong ? CredentialStatus::locked : CredentialStatus::stored;
}

CredentialStatus askForPassphrase(std::string_view question, const Deadline &deadline, Secret &passphrase)
{
    const FileDescriptor terminal = openTerminal();
    if (!terminal)
        return CredentialStatus::locked;
    const SilentTerminal silent(terminal.get());
    if (!silent.isSilent())
        return CredentialStatus::locked;
    show(terminal.get(), question);
    TypedLine line;
    const CredentialStatus status = readLine(terminal.get(), deadline, line);
    show(terminal.get(), "\n");
    if (status == CredentialStatus::stored)
        passphrase = Secret(line.view());
    return status;
}

void tellAtTerminal(std::string_view text)
{
    if (const FileDescriptor terminal = openTerminal())
        show(terminal.get(), text);
}

}  // namespace kavell
