// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The preferences pane with 200 accounts of 10 plug-ins, offscreen: how long it takes to start beside an empty window of
// the same toolkit, and how long a change in another process takes to be on the screen.

#include <array>
#include <chrono>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <spawn.h>
#include <stdexcept>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

#include <QtCore/QEventLoop>
#include <QtCore/QTimer>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLabel>

#include <benchmark/benchmark.h>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/background.h"
#include "pane/pane_window.h"
#include "pane/texts.h"

namespace {

constexpr int kKinds = 10;
constexpr int kAccountsEach = 20;
constexpr int kBound = 10'000;  // ms

std::string kindIdentifier(int number)
{
    return "org.zorbo.kind" + std::to_string(number) + ".kaplugin";
}

void addKind(const std::string &directory, int number)
{
    const std::string identifier = kindIdentifier(number);
    const std::string bundle = directory + "/" + identifier;
    std::filesystem::copy(KAVELL_BENCH_KIND, bundle, std::filesystem::copy_options::recursive);
    std::ofstream(bundle + "/Contents/Info.plist")
        << R"(<?xml version="1.0" encoding="UTF-8"?><plist version="1.0"><dict>)"
        << "<key>KABundleIdentifier</key><string>" << identifier << "</string>"
        << "<key>KABundleName</key><string>Kind " << number << "</string>"
        << "<key>KABundleExecutable</key><string>libBenchKind.so</string>"
        << "<key>KABundlePrincipalClass</key><string>BenchKindPlugin</string>"
        << "<key>KAPluginVersion</key><integer>1</integer></dict></plist>";
}

std::shared_ptr<KAAccount> account(int kind, int number)
{
    return KAAccount::accountWithProviderType(QString::fromStdString(kindIdentifier(kind)),
                                              QStringLiteral("user%1@zorbo.example").arg(number, 2, 10, QChar(u'0')));
}

/// The kinds and the accounts, below the scratch home.
void makeRegistry()
{
    std::string directory = std::filesystem::temp_directory_path() / "pane-bench-XXXXXX";
    if (!mkdtemp(directory.data()))
        throw std::runtime_error("cannot make " + directory);
    for (int kind = 0; kind < kKinds; ++kind) {
        addKind(directory, kind);
        for (int number = 0; number < kAccountsEach; ++number) {
            const auto made = account(kind, number);
            made->setProviderAttribute(QStringLiteral("Account %1").arg(number), KAMailAccountDescriptionKey);
            _CSKavellAccountCommitChanges(made->accountRef());
        }
    }
    setenv("VESK_FRAMEWORK_PATH", directory.c_str(), 1);
}

/// Another process, which changes the description of the first account whenever it is told to, and answers when it began.
class Changer {
public:
    Changer()
    {
        if (pipe(m_orders.data()) != 0 || pipe(m_answers.data()) != 0)
            throw std::runtime_error("cannot make a pipe");
        if (fork() == 0) {
            close(m_orders[1]);
            run();
        }
        close(m_orders[0]);
    }

    /// The monotonic time at which it began, in nanoseconds.
    int64_t change(int number) const
    {
        int64_t began = 0;
        if (write(m_orders[1], &number, sizeof number) != sizeof number ||
            read(m_answers[0], &began, sizeof began) != sizeof began)
            throw std::runtime_error("the other process has gone");
        return began;
    }

    [[nodiscard]] static int64_t now()
    {
        timespec time;
        clock_gettime(CLOCK_MONOTONIC, &time);
        return time.tv_sec * 1'000'000'000LL + time.tv_nsec;
    }

private:
    [[noreturn]] void run() const
    {
        int number = 0;
        while (read(m_orders[0], &number, sizeof number) == sizeof number) {
            const auto changed = account(0, 0);
            changed->setProviderAttribute(QStringLiteral("Changed %1").arg(number), KAMailAccountDescriptionKey);
            const int64_t began = now();
            if (write(m_answers[1], &began, sizeof began) != sizeof began)
                break;
            _CSKavellAccountCommitChanges(changed->accountRef());
        }
        _exit(0);
    }

    std::array<int, 2> m_orders{};
    std::array<int, 2> m_answers{};
};

const Changer *changer = nullptr;

/// Notes when a label has painted the text that is waited for.
class PaintWatch : public QObject {
public:
    explicit PaintWatch(QLabel *label) : m_label(label)
    {
        label->installEventFilter(this);
        connect(&m_patience, &QTimer::timeout, &m_loop, &QEventLoop::quit);
    }

    /// The time of the painting; 0 when it does not come.
    int64_t waitFor(const QString &text)
    {
        m_painted = 0;
        m_text = text;
        m_patience.start(kBound);
        m_loop.exec();
        m_patience.stop();
        return m_painted;
    }

protected:
    bool eventFilter(QObject *watched, QEvent *event) override
    {
        if (event->type() == QEvent::Paint && m_label->text() == m_text)
            QMetaObject::invokeMethod(
                this, [this] { notePainting(); }, Qt::QueuedConnection);
        return QObject::eventFilter(watched, event);
    }

private:
    void notePainting()
    {
        m_painted = Changer::now();
        m_loop.quit();
    }

    QLabel *const m_label;
    QEventLoop m_loop;
    QTimer m_patience;
    QString m_text;
    int64_t m_painted = 0;
};

void changeOnScreen(benchmark::State &state)
{
    static int number = 0;
    kavell::pane::PaneWindow window;
    window.show();
    auto *const title = window.findChild<QLabel *>(QStringLiteral("accountTitle"));
    if (!QTest::qWaitFor([&] { return title->isVisible(); }, kBound))
        state.SkipWithError("the pane shows nothing");
    PaintWatch watch(title);
    for (auto _ : state) {
        const int64_t began = changer->change(++number);
        const int64_t painted = watch.waitFor(QStringLiteral("Changed %1").arg(number));
        if (painted == 0) {
            state.SkipWithError("the change was never shown");
            break;
        }
        state.SetIterationTime(static_cast<double>(painted - began) * 1e-9);
    }
}

void runProbe(benchmark::State &state, const char *what)
{
    const std::string probe = std::filesystem::read_symlink("/proc/self/exe").parent_path() / "pane_probe";
    std::array<char *, 3> words{const_cast<char *>(probe.c_str()), const_cast<char *>(what), nullptr};
    for (auto _ : state) {
        pid_t pid = 0;
        int status = 0;
        if (posix_spawn(&pid, probe.c_str(), nullptr, nullptr, words.data(), environ) != 0 ||
            waitpid(pid, &status, 0) != pid || status != 0) {
            state.SkipWithError("the process failed");
            break;
        }
    }
}

void startPane(benchmark::State &state)
{
    runProbe(state, "pane");
}

void startEmptyWindow(benchmark::State &state)
{
    runProbe(state, "window");
}

BENCHMARK(startPane)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(startEmptyWindow)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(changeOnScreen)->UseManualTime()->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char *argv[])
{
    makeRegistry();
    const Changer other;  // forked before there are threads
    changer = &other;
    QApplication application(argc, argv);
    kavell::pane::installTexts(application);
    (void)KAPluginManager::shared();
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    kavell::pane::letBackgroundWorkFinish();
    return 0;
}
