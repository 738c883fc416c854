// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Copies of notifications on a real session bus: what arrives, and what a bus that is absent, stopped or killed costs
// the poster.

#include "platform/bus_mirror.h"

#include "tests/platform/credential_fixture.h"

#include <csignal>
#include <gio/gio.h>
#include <kavellaccounts/Ref.h>
#include <stdexcept>

namespace kavell::test {

namespace {

/// The test's own connection to its bus.
class BusClient {
public:
    BusClient()
    {
        GError *error = nullptr;
        m_connection = g_dbus_connection_new_for_address_sync(
            std::getenv("DBUS_SESSION_BUS_ADDRESS"),
            static_cast<GDBusConnectionFlags>(G_DBUS_CONNECTION_FLAGS_AUTHENTICATION_CLIENT |
                                              G_DBUS_CONNECTION_FLAGS_MESSAGE_BUS_CONNECTION),
            nullptr, nullptr, &error);
        if (!m_connection)
            throw std::runtime_error(error->message);
    }
    ~BusClient() { g_clear_object(&m_connection); }
    BusClient(const BusClient &) = delete;
    BusClient &operator=(const BusClient &) = delete;

    [[nodiscard]] GDBusConnection *get() const { return m_connection; }

    /// Returns once the bus has dealt with all that was sent before.
    void settle()
    {
        GVariant *reply = g_dbus_connection_call_sync(m_connection, "org.freedesktop.DBus", "/org/freedesktop/DBus",
                                                      "org.freedesktop.DBus", "GetId", nullptr, nullptr,
                                                      G_DBUS_CALL_FLAGS_NONE, 5000, nullptr, nullptr);
        ASSERT_NE(reply, nullptr);
        g_variant_unref(reply);
    }

private:
    GDBusConnection *m_connection = nullptr;
};

/// Takes the signals of this library off the test's bus.
class Subscriber {
public:
    Subscriber()
    {
        g_main_context_push_thread_default(m_context);
        m_subscription = g_dbus_connection_signal_subscribe(m_client.get(), nullptr, "com.corvane.KavellAccounts",
                                                            "Posted", "/com/corvane/KavellAccounts", nullptr,
                                                            G_DBUS_SIGNAL_FLAGS_NONE, received, this, nullptr);
        g_main_context_pop_thread_default(m_context);
        m_client.settle();
    }
    ~Subscriber()
    {
        g_dbus_connection_signal_unsubscribe(m_client.get(), m_subscription);
        g_main_context_unref(m_context);
    }
    Subscriber(const Subscriber &) = delete;
    Subscriber &operator=(const Subscriber &) = delete;

    /// The texts of the signals, once `count` of them have come or 10 seconds have passed.
    const std::vector<std::string> &waitFor(size_t count)
    {
        return waitUntil([&] { return m_texts.size() >= count; });
    }

    /// The same, once this text is the last of them.
    const std::vector<std::string> &waitForLast(const std::string &text)
    {
        return waitUntil([&] { return !m_texts.empty() && m_texts.back() == text; });
    }

private:
    const std::vector<std::string> &waitUntil(const std::function<bool()> &done)
    {
        GSource *timer = g_timeout_source_new(20);
        g_source_set_callback(
            timer, [](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr, nullptr);
        g_source_attach(timer, m_context);
        for (const Stopwatch watch; !done() && watch.elapsed() < 10s;)
            g_main_context_iteration(m_context, TRUE);
        g_source_destroy(timer);
        g_source_unref(timer);
        return m_texts;
    }

    static void received(GDBusConnection *, const char *, const char *, const char *, const char *, GVariant *arguments,
                         gpointer data)
    {
        char *text = g_variant_print(arguments, TRUE);
        static_cast<Subscriber *>(data)->m_texts.emplace_back(text);
        g_free(text);
    }

    BusClient m_client;
    GMainContext *m_context = g_main_context_new();
    guint m_subscription = 0;
    std::vector<std::string> m_texts;
};

/// A process that posts; what it reads comes from the test through type().
class Poster {
public:
    explicit Poster(std::vector<std::string> words)
    {
        words.insert(words.begin(), buildPath("tests/bus_mirror_client"));
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0)
            std::abort();
        m_child =
            std::make_unique<ChildProcess>(words, std::vector<std::string>{}, ends[0], STDERR_FILENO, STDERR_FILENO);
        close(ends[0]);
        m_input = ends[1];
    }
    ~Poster() { close(m_input); }
    Poster(const Poster &) = delete;
    Poster &operator=(const Poster &) = delete;

    void type(const std::string &text) const
    {
        if (write(m_input, text.data(), text.size()) != static_cast<ssize_t>(text.size()))
            std::abort();
    }

    /// The exit status, once the end of its input has let the process end.
    [[nodiscard]] int wait()
    {
        close(std::exchange(m_input, -1));
        return m_child->wait();
    }

    [[nodiscard]] pid_t pid() const { return m_child->pid(); }

private:
    std::unique_ptr<ChildProcess> m_child;
    int m_input = -1;
};

class BusMirrorTest : public CredentialTest {};

TEST_F(BusMirrorTest, ASubscriberGetsNameObjectAndThePlainValuesOfTheInformation)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Subscriber subscriber;
    Poster poster({"post-all-kinds"});
    EXPECT_EQ(poster.wait(), 0);
    const auto &texts = subscriber.waitFor(1);
    ASSERT_EQ(texts.size(), 1u);
    EXPECT_EQ(texts[0], "('com.example.name', 'object', {'text': <'päul'>, 'integer': <int64 -7>, "
                        "'large': <uint64 18446744073709551615>, 'real': <1.5>, 'truth': <true>})");
}

TEST_F(BusMirrorTest, EveryPostOfAProcessThatEndsRightAfterArrivesInOrder)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Subscriber subscriber;
    Poster poster({"post-many", "100"});
    EXPECT_EQ(poster.wait(), 0);
    const auto &texts = subscriber.waitFor(100);
    ASSERT_EQ(texts.size(), 100u);
    for (size_t index = 0; index < texts.size(); ++index)
        EXPECT_EQ(texts[index], "('post " + std::to_string(index) + "', '', @a{sv} {})");
}

TEST_F(BusMirrorTest, WithoutABusNoThreadIsStarted)
{
    const auto threads = [] {
        return std::distance(std::filesystem::directory_iterator("/proc/self/task"), {});
    };
    const auto before = threads();
    mirrorToSessionBus(makeString("unheard").get(), nullptr, nullptr);
    EXPECT_EQ(threads(), before);
}

TEST_F(BusMirrorTest, AStoppedBusHoldsUpNeitherThePosterNorItsExit)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    bus.signal(SIGSTOP);
    const Stopwatch watch;
    Poster poster({"post-many", "1000"});
    EXPECT_EQ(poster.wait(), 0);
    EXPECT_LT(watch.elapsed(), 1s);
    bus.signal(SIGCONT);
}

TEST_F(BusMirrorTest, ABusThatStopsLaterHoldsUpNoExitEither)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Subscriber subscriber;
    Poster poster({"post-lines"});
    poster.type("first\n");
    ASSERT_EQ(subscriber.waitFor(1).size(), 1u);
    bus.signal(SIGSTOP);
    const Stopwatch watch;
    poster.type("second\n");
    EXPECT_EQ(poster.wait(), 0);
    EXPECT_LT(watch.elapsed(), 1s);
    bus.signal(SIGCONT);
}

TEST_F(BusMirrorTest, ABusThatDiesLeavesThePosterAliveAndTheNextBusGetsItsPosts)
{
    auto bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
    auto subscriber = std::make_unique<Subscriber>();
    Poster poster({"post-lines"});
    poster.type("first\n");
    ASSERT_EQ(subscriber->waitFor(1).size(), 1u);
    bus->kill();
    poster.type("into nothing\n");
    subscriber.reset();
    bus.reset();
    bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
    subscriber = std::make_unique<Subscriber>();
    poster.type("second\n");
    // The post between the two buses may still find the second one.
    const auto &texts = subscriber->waitForLast("('second', '', @a{sv} {})");
    EXPECT_EQ(poster.wait(), 0);
    ASSERT_FALSE(texts.empty());
    EXPECT_EQ(texts.back(), "('second', '', @a{sv} {})");
}

TEST_F(BusMirrorTest, ItsThreadsTakeNoneOfTheHostsSignals)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Subscriber subscriber;
    Poster poster({"post-lines"});
    poster.type("heard\n");
    ASSERT_EQ(subscriber.waitFor(1).size(), 1u);
    int threads = 0;
    for (const auto &task : std::filesystem::directory_iterator("/proc/" + std::to_string(poster.pid()) + "/task")) {
        if (task.path().filename() == std::to_string(poster.pid()))
            continue;
        const std::string status = readFile(task.path().string() + "/status");
        const size_t line = status.find("SigBlk:\t");
        ASSERT_NE(line, std::string::npos);
        const unsigned long long blocked = std::stoull(status.substr(line + 8, 16), nullptr, 16);
        EXPECT_NE(blocked & (1ULL << (SIGTERM - 1)), 0u) << status;
        EXPECT_NE(blocked & (1ULL << (SIGCHLD - 1)), 0u) << status;
        ++threads;
    }
    EXPECT_GE(threads, 1);
    EXPECT_EQ(poster.wait(), 0);
}

}  // namespace

}  // namespace kavell::test
