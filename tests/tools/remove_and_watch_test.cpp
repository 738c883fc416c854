// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <fcntl.h>
#include <gmock/gmock.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <poll.h>

#include "tests/tools/client_fixture.h"
#include "tests/tools/pseudo_terminal.h"

namespace kavell::test {

using RemoveCommand = ClientTest;

TEST_F(RemoveCommand, DeletesTheDataFile)
{
    run({"add", "google", "anna"});

    const ProgramResult result = client({"remove", "google", "anna", "--yes"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "Removed google anna.\n");
    EXPECT_FALSE(std::filesystem::exists(dataFilePath(googleType, "anna")));
}

TEST_F(RemoveCommand, DeletesADamagedAccount)
{
    writeFile(dataFilePath(googleType, "anna"), "nonsense");

    EXPECT_EQ(client({"remove", "google", "anna", "--yes"}).status, 0);

    EXPECT_FALSE(std::filesystem::exists(dataFilePath(googleType, "anna")));
}

TEST_F(RemoveCommand, AsksOnATerminalAndTakesNoForNo)
{
    run({"add", "google", "anna"});
    PseudoTerminal terminal(commandLine({"remove", "google", "anna"}));
    ASSERT_TRUE(terminal.waitFor("Remove google anna with all its attributes and its password? [y/N] "));

    terminal.type("\n");

    EXPECT_EQ(terminal.wait(), 1);
    EXPECT_TRUE(std::filesystem::exists(dataFilePath(googleType, "anna")));
}

TEST_F(RemoveCommand, AsksOnATerminalAndTakesYesForYes)
{
    run({"add", "google", "anna"});
    PseudoTerminal terminal(commandLine({"remove", "google", "anna"}));
    ASSERT_TRUE(terminal.waitFor("[y/N] "));

    terminal.type("y\n");

    EXPECT_EQ(terminal.wait(), 0);
    EXPECT_FALSE(std::filesystem::exists(dataFilePath(googleType, "anna")));
}

/// A running watch, with its standard output and standard error in pipes.
class Watcher {
public:
    explicit Watcher(const std::vector<std::string> &words)
        : m_output(makePipe()), m_error(makePipe()), m_input(open("/dev/null", O_RDONLY | O_CLOEXEC)),
          m_child(words, {}, m_input, m_output.second, m_error.second)
    {
        close(m_output.second);
        close(m_error.second);
    }

    ~Watcher()
    {
        close(m_output.first);
        close(m_error.first);
        close(m_input);
    }

    [[nodiscard]] std::string nextLine() const { return lineFrom(m_output.first); }
    [[nodiscard]] std::string nextErrorLine() const { return lineFrom(m_error.first); }
    [[nodiscard]] ChildProcess &child() { return m_child; }

private:
    static std::pair<int, int> makePipe()
    {
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0)
            std::abort();
        return {ends[0], ends[1]};
    }

    /// The next line without its end; empty when none comes within ten seconds.
    static std::string lineFrom(int descriptor)
    {
        std::string line;
        pollfd waiting{descriptor, POLLIN, 0};
        char letter = 0;
        while (poll(&waiting, 1, 10000) > 0 && read(descriptor, &letter, 1) == 1 && letter != '\n')
            line += letter;
        return line;
    }

    std::pair<int, int> m_output;
    std::pair<int, int> m_error;
    int m_input;
    ChildProcess m_child;
};

class WatchCommand : public ClientTest {
protected:
    /// Starts a watch that is ready when this returns.
    [[nodiscard]] static std::unique_ptr<Watcher> startWatch(std::vector<std::string> words)
    {
        words.insert(words.begin(), "watch");
        auto watcher = std::make_unique<Watcher>(commandLine(std::move(words)));
        EXPECT_EQ(watcher->nextErrorLine(), "kavell-accounts: watching; press Ctrl-C to end");
        return watcher;
    }
};

TEST_F(WatchCommand, PrintsALineForEachChangeOfAnotherProcess)
{
    const auto watcher = startWatch({});

    run({"add", "google", "anna"});
    run({"set", "google", "anna", "a=b"});
    run({"remove", "google", "anna", "--yes"});

    for (int line = 0; line < 3; ++line)
        EXPECT_THAT(watcher->nextLine(), testing::MatchesRegex("....-..-..T..:..:..Z changed google anna"));
}

TEST_F(WatchCommand, WritesJsonLines)
{
    const auto watcher = startWatch({"--json"});

    run({"add", "org.example.forum", "anna"});

    const auto line = nlohmann::json::parse(watcher->nextLine());
    EXPECT_EQ(line["event"], "changed");
    EXPECT_EQ(line["provider"], "org.example.forum");
    EXPECT_EQ(line["login"], "anna");
}

TEST_F(WatchCommand, EndsWithSuccessOnInterruptAndTermination)
{
    for (const int number : {SIGINT, SIGTERM}) {
        const auto watcher = startWatch({});
        watcher->child().signal(number);
        EXPECT_EQ(watcher->child().wait(), 0);
    }
}

TEST_F(WatchCommand, EndsAfterTheCount)
{
    const auto watcher = startWatch({"--count", "2"});

    run({"add", "google", "anna"});
    run({"add", "google", "bob"});

    EXPECT_EQ(watcher->child().wait(), 0);
}

TEST_F(WatchCommand, FailsWhenTheTimePassesBeforeTheCount)
{
    EXPECT_EQ(client({"watch", "--count", "1", "--timeout", "0.1"}).status, 1);
    EXPECT_EQ(client({"watch", "--timeout", "0.1"}).status, 0);
}

TEST_F(WatchCommand, OfOneAccountLeavesTheOthersOut)
{
    const auto watcher = startWatch({"google", "bob", "--count", "1"});

    run({"add", "google", "anna"});
    run({"add", "google", "bob"});

    EXPECT_THAT(watcher->nextLine(), testing::EndsWith(" changed google bob"));
    EXPECT_EQ(watcher->child().wait(), 0);
}

}  // namespace kavell::test
