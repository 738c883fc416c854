// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the credential tests share: a scratch user directory, a session bus and a keyring daemon of one test alone,
// which can be stopped and killed. For one thread.

#ifndef KAVELL_TESTS_PLATFORM_CREDENTIAL_FIXTURE_H
#define KAVELL_TESTS_PLATFORM_CREDENTIAL_FIXTURE_H

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/credential_store.h"
#include "tests/support/process.h"

namespace kavell {

/// So that a failed comparison reads well.
inline void PrintTo(CredentialStatus status, std::ostream *stream)
{
    *stream << credentialStatusName(status);
}

}  // namespace kavell

namespace kavell::test {

using namespace std::chrono_literals;

/// Measures what a bounded wait took.
class Stopwatch {
public:
    [[nodiscard]] std::chrono::milliseconds elapsed() const
    {
        return std::chrono::duration_cast<std::chrono::milliseconds>(std::chrono::steady_clock::now() - m_start);
    }

private:
    std::chrono::steady_clock::time_point m_start = std::chrono::steady_clock::now();
};

/// A descriptor that the child reads `text` from.
inline int inputWith(std::string_view text)
{
    const int file = memfd_create("input", 0);
    if (write(file, text.data(), text.size()) != static_cast<ssize_t>(text.size()))
        std::abort();
    lseek(file, 0, SEEK_SET);
    return file;
}

/// A session bus of this test's own, named by the environment while it stands.
class PrivateBus {
public:
    explicit PrivateBus(const std::string &socketPath)
    {
        std::filesystem::remove(socketPath);
        // The address of the command line replaces the one here, without which the daemon does not start.
        writeFile(socketPath + ".conf",
                  "<busconfig><type>session</type><listen>unix:tmpdir=/tmp</listen><auth>EXTERNAL</auth>"
                  "<policy context=\"default\"><allow send_destination=\"*\" eavesdrop=\"true\"/>"
                  "<allow eavesdrop=\"true\"/><allow own=\"*\"/></policy></busconfig>");
        int ends[2];
        if (pipe(ends) != 0)
            std::abort();
        const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
        m_daemon = std::make_unique<ChildProcess>(
            std::vector<std::string>{"dbus-daemon", "--config-file=" + socketPath + ".conf", "--nofork",
                                     "--print-address=1", "--address=unix:path=" + socketPath},
            std::vector<std::string>{}, nothing, ends[1], nothing);
        close(ends[1]);
        close(nothing);
        // The daemon prints its address once it listens.
        std::string address;
        for (char letter; read(ends[0], &letter, 1) == 1 && letter != '\n';)
            address += letter;
        close(ends[0]);
        setenv("DBUS_SESSION_BUS_ADDRESS", address.c_str(), 1);
    }
    ~PrivateBus() { unsetenv("DBUS_SESSION_BUS_ADDRESS"); }

    void signal(int number) const { m_daemon->signal(number); }

    [[nodiscard]] pid_t pid() const { return m_daemon->pid(); }

    void kill()
    {
        m_daemon->signal(SIGKILL);
        EXPECT_EQ(m_daemon->wait(), 128 + SIGKILL);
    }

private:
    std::unique_ptr<ChildProcess> m_daemon;
};

/// Calls a method on the test's bus; its reply as dbus-send prints it, or nothing.
inline std::string callOnBus(const std::string &name, const std::string &path, const std::string &method,
                             const std::string &argument)
{
    const ProgramResult result =
        runProgram({"dbus-send", "--print-reply=literal", "--dest=" + name, path, method, argument});
    return result.status == 0 ? result.output : "";
}

/// Waits until somebody owns the name.
inline bool waitForOwner(const std::string &name)
{
    for (const Stopwatch watch; watch.elapsed() < 10s;) {
        const std::string reply = callOnBus("org.freedesktop.DBus", "/org/freedesktop/DBus",
                                            "org.freedesktop.DBus.NameHasOwner", "string:" + name);
        if (reply.find("boolean true") != std::string::npos)
            return true;
    }
    return false;
}

/// A real keyring daemon, unlocked with the password "keyring password", or left locked.
class Keyring {
public:
    explicit Keyring(bool isUnlocked = true)
    {
        const int input = inputWith("keyring password");
        const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
        std::vector<std::string> words = {"gnome-keyring-daemon", "--foreground", "--components=secrets"};
        if (isUnlocked)
            words.push_back("--unlock");
        m_daemon = std::make_unique<ChildProcess>(words, std::vector<std::string>{}, input, nothing, nothing);
        close(input);
        close(nothing);
        EXPECT_TRUE(waitForOwner("org.freedesktop.secrets"));
    }

    void signal(int number) const { m_daemon->signal(number); }

    void kill()
    {
        m_daemon->signal(SIGKILL);
        EXPECT_EQ(m_daemon->wait(), 128 + SIGKILL);
    }

    /// Locks the default collection, as a desktop does when the user asks for it.
    static void lock()
    {
        EXPECT_NE(callOnBus("org.freedesktop.secrets", "/org/freedesktop/secrets",
                            "org.freedesktop.Secret.Service.Lock",
                            "array:objpath:/org/freedesktop/secrets/aliases/default"),
                  "");
    }

private:
    std::unique_ptr<ChildProcess> m_daemon;
};

/// A scratch user: directories of one test's own, no bus, no store chosen.
class CredentialTest : public testing::Test {
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "credentials-XXXXXX").string();
        m_scratch = mkdtemp(pattern.data());
        std::filesystem::create_directories(m_scratch + "/run");
        chmod((m_scratch + "/run").c_str(), 0700);
        setenv("XDG_DATA_HOME", (m_scratch + "/data").c_str(), 1);
        setenv("XDG_RUNTIME_DIR", (m_scratch + "/run").c_str(), 1);
        setenv("KAVELL_SERVICES_MODULE", buildPath("lib/kavellaccounts/kavellstore-services.so").c_str(), 1);
        for (const char *variable : {"DBUS_SESSION_BUS_ADDRESS", "KAVELL_CREDENTIAL_STORE", "KAVELL_CREDENTIAL_TIMEOUT",
                                     "KAVELL_UNLOCK_TIMEOUT", "KAVELL_VAULT_PASSPHRASE_FILE"})
            unsetenv(variable);
        useCredentialStoreForTesting(nullptr);
    }

    void TearDown() override
    {
        useCredentialStoreForTesting(nullptr);
        std::filesystem::remove_all(m_scratch);
    }

    [[nodiscard]] std::string scratchPath(const std::string &name) const { return m_scratch + "/" + name; }

    /// Names a file with this passphrase in the environment.
    void givePassphrase(const std::string &passphrase) const
    {
        const std::string path = scratchPath("passphrase");
        writeFile(path, passphrase + "\n");
        chmod(path.c_str(), 0600);
        setenv("KAVELL_VAULT_PASSPHRASE_FILE", path.c_str(), 1);
    }

    /// The file of the vault.
    [[nodiscard]] std::string vaultPath() const { return scratchPath("data/kavell-accounts/vault"); }

private:
    std::string m_scratch;
};

}  // namespace kavell::test

#endif
