// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A session bus and a keyring that answer nonsense, or far too much of it: every question ends within its bound with a
// status that says neither that a password was stored nor that there is none, and the program lives.

#include <atomic>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <thread>

#include "tests/platform/credential_fixture.h"

namespace kavell::test {

namespace {

constexpr auto kBound = 500ms;
/// What a busy machine may add to the bound.
constexpr auto kAllowance = 3s;

class ServiceFaults : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_TIMEOUT", std::to_string(kBound.count()).c_str(), 1);
        setenv("KAVELL_UNLOCK_TIMEOUT", std::to_string(kBound.count()).c_str(), 1);
    }

    /// Asks the store everything there is to ask; the statuses, each of which came within the bound.
    static std::vector<CredentialStatus> askEverything(CredentialStore &store)
    {
        const CredentialItem item{std::string(kSecretServiceStoreName), "00000000000000000000000000000001", "s", "a"};
        CredentialItem found;
        Secret secret;
        std::vector<CredentialItem> items;
        const std::function<CredentialStatus()> questions[] = {
            [&] { return store.find("s", "a", found); },
            [&] { return store.resolve(item.identifier, found); },
            [&] { return store.list(items); },
            [&] { return store.add("s", "a", "secret", found); },
            [&] { return store.readSecret(item, secret); },
            [&] { return store.replaceSecret(item, "secret"); },
            [&] { return store.remove(item); },
            [&] { return store.unlock(&item); },
        };
        std::vector<CredentialStatus> statuses;
        for (const auto &question : questions) {
            const Stopwatch watch;
            statuses.push_back(question());
            EXPECT_LT(watch.elapsed(), kBound + kAllowance) << "question " << statuses.size();
        }
        return statuses;
    }

    static void expectNothingIsKnown(const std::vector<CredentialStatus> &statuses)
    {
        for (size_t index = 0; index < statuses.size(); ++index)
            EXPECT_TRUE(statuses[index] == CredentialStatus::unreachable || statuses[index] == CredentialStatus::failed)
                << "question " << index + 1 << ": " << credentialStatusName(statuses[index]);
    }
};

/// A keyring in whose place somebody else answers.
class GarbageKeyring : public ServiceFaults {
protected:
    void SetUp() override
    {
        ServiceFaults::SetUp();
        m_bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
    }

    void TearDown() override
    {
        m_service.reset();
        m_bus.reset();
        CredentialTest::TearDown();
    }

    CredentialStore &storeAnswering(const char *behaviour)
    {
        m_service =
            std::make_unique<ChildProcess>(std::vector<std::string>{buildPath("tests/garbage_service"), behaviour},
                                           std::vector<std::string>{}, STDIN_FILENO, STDERR_FILENO, STDERR_FILENO);
        EXPECT_TRUE(waitForOwner("org.freedesktop.secrets"));
        m_store = credentialStoreNamed(kSecretServiceStoreName);
        return *m_store;
    }

    std::unique_ptr<PrivateBus> m_bus;
    std::unique_ptr<ChildProcess> m_service;
    std::shared_ptr<CredentialStore> m_store;
};

TEST_F(GarbageKeyring, RepliesOfTheWrongTypeTellNothing)
{
    expectNothingIsKnown(askEverything(storeAnswering("wrong-types")));
}

TEST_F(GarbageKeyring, EmptyRepliesTellNothing)
{
    expectNothingIsKnown(askEverything(storeAnswering("nothing")));
}

TEST_F(GarbageKeyring, SignalsInPlaceOfAReplyAreNotWaitedOutForLongerThanTheBound)
{
    expectNothingIsKnown(askEverything(storeAnswering("chatter")));
}

TEST_F(GarbageKeyring, ACrowdOfItemsThatDoNotExistEndsWithTheBound)
{
    CredentialStore &store = storeAnswering("crowd");
    std::vector<CredentialItem> items;
    const Stopwatch watch;
    EXPECT_EQ(store.list(items), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), kBound + kAllowance);
    EXPECT_TRUE(items.empty());
}

TEST_F(GarbageKeyring, ASecretThatIsNoTextIsGivenAsItIs)
{
    CredentialStore &store = storeAnswering("heavy");
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "20000", 1);
    const CredentialItem item{std::string(kSecretServiceStoreName), "00000000000000000000000000000001", "s", "a"};
    Secret secret;
    ASSERT_EQ(store.readSecret(item, secret), CredentialStatus::stored);
    EXPECT_EQ(secret.view().size(), size_t{8} << 20);
    EXPECT_EQ(secret.view().back(), '\xff');
}

/// A socket in the place of the session bus, which does the same to everybody who connects.
class GarbageBus {
public:
    using Behaviour = std::function<void(int connection, const std::atomic<bool> &isOver)>;

    GarbageBus(const std::string &path, Behaviour behaviour)
        : m_listener(socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0)), m_behaviour(std::move(behaviour))
    {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        path.copy(address.sun_path, sizeof address.sun_path - 1);
        if (bind(m_listener, reinterpret_cast<const sockaddr *>(&address), sizeof address) != 0 ||
            listen(m_listener, 16) != 0)
            std::abort();
        setenv("DBUS_SESSION_BUS_ADDRESS", ("unix:path=" + path).c_str(), 1);
        m_thread = std::thread([this] { serve(); });
    }
    ~GarbageBus()
    {
        m_isOver = true;
        shutdown(m_listener, SHUT_RDWR);
        m_thread.join();
        close(m_listener);
    }
    GarbageBus(const GarbageBus &) = delete;
    GarbageBus &operator=(const GarbageBus &) = delete;

private:
    void serve()
    {
        std::vector<std::thread> connections;
        for (int connection; (connection = accept(m_listener, nullptr, nullptr)) >= 0;)
            connections.emplace_back([this, connection] {
                m_behaviour(connection, m_isOver);
                close(connection);
            });
        for (std::thread &each : connections)
            each.join();
    }

    int m_listener;
    Behaviour m_behaviour;
    std::atomic<bool> m_isOver{false};
    std::thread m_thread;
};

/// Sends the text again and again until the other end has had enough.
void sendWithoutEnd(int connection, std::string_view text, const std::atomic<bool> &isOver)
{
    while (!isOver) {
        pollfd ready{connection, POLLOUT, 0};
        if (poll(&ready, 1, 100) == 1 && send(connection, text.data(), text.size(), MSG_NOSIGNAL | MSG_DONTWAIT) < 0 &&
            errno != EAGAIN)
            return;
    }
}

const std::pair<const char *, GarbageBus::Behaviour> kBusBehaviours[] = {
    {"HangsUp",
     [](int, const std::atomic<bool> &) {
     }},
    {"SendsAnEndlessLine",
     [](int connection, const std::atomic<bool> &isOver) {
         sendWithoutEnd(connection, std::string(4096, 'A'), isOver);
     }},
    {"SendsEndlessLines",
     [](int connection, const std::atomic<bool> &isOver) {
         sendWithoutEnd(connection, "REJECTED\r\n", isOver);
     }},
    {"AcceptsEverybodyAndSendsNoise", [](int connection, const std::atomic<bool> &isOver) {
         const std::string_view greeting = "OK 00000000000000000000000000000000\r\nAGREE_UNIX_FD\r\n";
         static_cast<void>(send(connection, greeting.data(), greeting.size(), MSG_NOSIGNAL));
         sendWithoutEnd(connection, std::string_view("\x00\xff l\x01\x7f", 6), isOver);
     }}};

class GarbageBusTest : public ServiceFaults, public testing::WithParamInterface<size_t> {
protected:
    void SetUp() override
    {
        ServiceFaults::SetUp();
        m_bus = std::make_unique<GarbageBus>(scratchPath("run/test-bus"), kBusBehaviours[GetParam()].second);
    }

    void TearDown() override
    {
        m_bus.reset();
        CredentialTest::TearDown();
    }

    std::unique_ptr<GarbageBus> m_bus;
};

TEST_P(GarbageBusTest, TellsNothingAboutItems)
{
    const auto store = credentialStoreNamed(kSecretServiceStoreName);
    ASSERT_TRUE(store);
    expectNothingIsKnown(askEverything(*store));
}

TEST_P(GarbageBusTest, HoldsUpNeitherAPosterNorItsExit)
{
    const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
    const Stopwatch watch;
    ChildProcess poster(std::vector<std::string>{buildPath("tests/bus_mirror_client"), "post-many", "500"}, {}, nothing,
                        nothing, STDERR_FILENO);
    EXPECT_EQ(poster.wait(), 0);
    EXPECT_LT(watch.elapsed(), 2s + kAllowance);
    close(nothing);
}

INSTANTIATE_TEST_SUITE_P(Buses, GarbageBusTest, testing::Range(size_t{0}, std::size(kBusBehaviours)),
                         [](const auto &bus) { return kBusBehaviours[bus.param].first; });

}  // namespace

}  // namespace kavell::test
