// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vault's passphrase asked for at a terminal: a child process with a pseudo-terminal of its own is asked, the test
// types.

#include "tests/platform/credential_fixture.h"

#include <linux/keyctl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/syscall.h>
#include <termios.h>

namespace kavell::test {

namespace {

/// A child that has the given terminal as its own, and the typist's end of that terminal.
class Typist {
public:
    explicit Typist(const std::function<int()> &body)
    {
        m_terminal = posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC);
        if (m_terminal < 0 || grantpt(m_terminal) != 0 || unlockpt(m_terminal) != 0)
            std::abort();
        const std::string path = ptsname(m_terminal);
        m_child = std::make_unique<ChildProcess>([&] {
            setsid();
            const int own = open(path.c_str(), O_RDWR);
            return own >= 0 && ioctl(own, TIOCSCTTY, 0) == 0 ? body() : 99;
        });
    }
    ~Typist() { close(m_terminal); }

    /// Waits until the terminal has shown this.
    bool waitFor(const std::string &text)
    {
        const Stopwatch watch;
        size_t found;
        while ((found = m_shown.find(text, m_read)) == std::string::npos && watch.elapsed() < 10s) {
            pollfd waiting{m_terminal, POLLIN, 0};
            char buffer[256];
            if (poll(&waiting, 1, 1000) <= 0)
                continue;
            const ssize_t count = read(m_terminal, buffer, sizeof buffer);
            if (count <= 0)
                break;
            m_shown.append(buffer, static_cast<size_t>(count));
        }
        if (found == std::string::npos)
            return false;
        m_read = found + text.size();
        return true;
    }

    void type(const std::string &text)
    {
        if (write(m_terminal, text.data(), text.size()) != static_cast<ssize_t>(text.size()))
            std::abort();
    }

    [[nodiscard]] const std::string &shown() const { return m_shown; }
    [[nodiscard]] ChildProcess &child() { return *m_child; }

    [[nodiscard]] bool hasEcho() const
    {
        termios state{};
        tcgetattr(m_terminal, &state);
        return (state.c_lflag & ECHO) != 0;
    }

private:
    int m_terminal;
    std::string m_shown;
    size_t m_read = 0;
    std::unique_ptr<ChildProcess> m_child;
};

constexpr const char *kChoose = "Choose a passphrase for a new Kavell accounts vault: ";
constexpr const char *kAgain = "The same passphrase again: ";
constexpr const char *kAsk = "Passphrase of the Kavell accounts vault: ";

class VaultPromptTest : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
    }

    void TearDown() override
    {
        forgetKernelKey();
        CredentialTest::TearDown();
    }

    /// The child's status as its exit code.
    static int unlockInChild() { return static_cast<int>(defaultCredentialStore()->unlock(nullptr)); }

    /// A vault with the passphrase "correct horse" and no trace of its key.
    void makeVault()
    {
        givePassphrase("correct horse");
        ASSERT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::stored);
        unsetenv("KAVELL_VAULT_PASSPHRASE_FILE");
        useCredentialStoreForTesting(nullptr);
    }

    /// What the vault's key is called in the kernel: by the salt, bytes 24 to 39 of the file.
    std::string kernelName()
    {
        std::string name = "kavell-accounts:vault:";
        const std::string bytes = readFile(vaultPath());
        for (size_t index = 24; index < 40 && index < bytes.size(); ++index) {
            char digits[3];
            snprintf(digits, sizeof digits, "%02x", static_cast<unsigned char>(bytes[index]));
            name += digits;
        }
        return name;
    }

    long findKernelKey()
    {
        return syscall(SYS_keyctl, KEYCTL_SEARCH, KEY_SPEC_USER_KEYRING, "user", kernelName().c_str(), 0);
    }

    void forgetKernelKey()
    {
        const long key = findKernelKey();
        if (key >= 0)
            syscall(SYS_keyctl, KEYCTL_UNLINK, key, KEY_SPEC_USER_KEYRING);
    }
};

TEST_F(VaultPromptTest, TheFirstUseAsksTwiceWithoutEchoAndMakesTheVault)
{
    Typist typist(unlockInChild);
    ASSERT_TRUE(typist.waitFor(kChoose));
    EXPECT_FALSE(typist.hasEcho());
    typist.type("correct horse\n");
    ASSERT_TRUE(typist.waitFor(kAgain));
    typist.type("correct horse\n");
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::stored));
    EXPECT_TRUE(typist.hasEcho());
    EXPECT_EQ(typist.shown().find("horse"), std::string::npos);
    givePassphrase("correct horse");
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::stored);
}

TEST_F(VaultPromptTest, TwoDifferentPassphrasesAreAskedForAgain)
{
    Typist typist(unlockInChild);
    ASSERT_TRUE(typist.waitFor(kChoose));
    typist.type("one\n");
    ASSERT_TRUE(typist.waitFor(kAgain));
    typist.type("two\n");
    ASSERT_TRUE(typist.waitFor(kChoose));
    typist.type("\x03");
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::refused));
    EXPECT_FALSE(std::filesystem::exists(vaultPath()));
}

TEST_F(VaultPromptTest, TheRightPassphraseUnlocksAndIsKeptForTheSession)
{
    makeVault();
    Typist typist(unlockInChild);
    ASSERT_TRUE(typist.waitFor(kAsk));
    typist.type("wrong\x15"
                "correct horsx\x7f"
                "e\n");
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::stored));
    if (findKernelKey() < 0)
        GTEST_SKIP() << "this kernel lets nobody keep a key";
    CredentialItem item;
    EXPECT_EQ(defaultCredentialStore()->find("com.example.mail", "paul", item), CredentialStatus::absent);
}

TEST_F(VaultPromptTest, AWrongPassphraseIsAskedForThreeTimesAndRefused)
{
    makeVault();
    Typist typist(unlockInChild);
    for (int tries = 0; tries < 3; ++tries) {
        ASSERT_TRUE(typist.waitFor(kAsk));
        typist.type("wrong\n");
    }
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::refused));
}

TEST_F(VaultPromptTest, ControlCRefusesAndLeavesTheProcessAndTheEchoAlive)
{
    makeVault();
    Typist typist(unlockInChild);
    ASSERT_TRUE(typist.waitFor(kAsk));
    typist.type("half\x03");
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::refused));
    EXPECT_TRUE(typist.hasEcho());
}

TEST_F(VaultPromptTest, NobodyAtTheTerminalMeansLockedWithinTheBound)
{
    makeVault();
    setenv("KAVELL_UNLOCK_TIMEOUT", "300", 1);
    const Stopwatch watch;
    Typist typist(unlockInChild);
    ASSERT_TRUE(typist.waitFor(kAsk));
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::locked));
    EXPECT_LT(watch.elapsed(), 3s);
    EXPECT_TRUE(typist.hasEcho());
}

TEST_F(VaultPromptTest, OnlyUnlockingAsksAnyone)
{
    makeVault();
    Typist typist([] {
        CredentialItem item;
        return static_cast<int>(defaultCredentialStore()->find("com.example.mail", "paul", item));
    });
    EXPECT_EQ(typist.child().wait(), static_cast<int>(CredentialStatus::locked));
    EXPECT_EQ(typist.shown(), "");
}

}  // namespace

}  // namespace kavell::test
