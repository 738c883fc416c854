// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How long the application table keeps a person waiting: the longest stretch in which no event is answered, while a
// table of 50 applications is filled, filled again, sorted, painted, and one of its check boxes is clicked. A stretch is
// one call of the table, or one round of the event loop after it. The window is drawn to memory.

#include <algorithm>
#include <chrono>
#include <ranges>

#include <benchmark/benchmark.h>

#include <QtCore/QAbstractEventDispatcher>
#include <QtCore/QDir>
#include <QtCore/QEventLoop>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>

namespace {

using Clock = std::chrono::steady_clock;
using Seconds = std::chrono::duration<double>;
using Applications = QList<std::shared_ptr<KAApplication>>;

constexpr int kApplications = 50;
constexpr int kIconSide = 256;

/// An icon file as applications have them.
QString iconPath()
{
    static const QString path = [] {
        QImage icon(kIconSide, kIconSide, QImage::Format_ARGB32);
        for (int y = 0; y < kIconSide; ++y) {
            for (int x = 0; x < kIconSide; ++x)
                icon.setPixelColor(x, y, QColor::fromHsv((x + y) % 360, 255 - x / 2, 255 - y / 3));
        }
        QString file = QDir::temp().filePath(QStringLiteral("icon.png"));
        icon.save(file);
        return file;
    }();
    return path;
}

/// New applications, in descending order of their sort values.
Applications newApplications()
{
    const QStringList known{kKAParlexAppID, kKATidewellAppID, kKACardellAppID, kKAMailAppID};
    Applications applications;
    for (int number = 0; number < kApplications; ++number) {
        const int kind = number * (int(known.size()) + 1) / kApplications;
        applications += KAApplication::initWithBundleID(kind == 0 ? "com.example.application" + QString::number(number)
                                                                  : known.at(kind - 1));
        applications.last()->setImagePath(iconPath());
    }
    return applications;
}

class Toggled : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE bool appToggle(const std::shared_ptr<KAApplication> &) { return true; }
};

/// A table on the screen without applications.
class Table {
public:
    Table()
    {
        m_controller->setDelegate(&m_delegate);
        m_controller->view()->resize(420, 480);
        m_controller->view()->show();
        settle();
    }

    KAAppTableController &operator*() { return *m_controller; }
    KAAppTableController *operator->() { return m_controller.get(); }

    /// Runs the event loop until nothing is left to do; the longest of its rounds.
    Seconds settle()
    {
        Seconds longest{0};
        for (bool isBusy = true; isBusy;) {
            const auto start = Clock::now();
            isBusy = QCoreApplication::eventDispatcher()->processEvents(QEventLoop::AllEvents);
            longest = std::max(longest, Seconds(Clock::now() - start));
        }
        return longest;
    }

    /// The longest stretch of the work and what follows from it.
    template <typename Work> Seconds longestStretch(Work work)
    {
        const auto start = Clock::now();
        work();
        const Seconds called = Clock::now() - start;
        return std::max(called, settle());
    }

private:
    Toggled m_delegate;
    std::shared_ptr<KAAppTableController> m_controller = KAAppTableController::initWithAccount(
        KAAccount::initWithProviderType(kKAProviderTest, QStringLiteral("anna@zorbo.example")), nullptr);
};

void fillTable(benchmark::State &state)
{
    Table table;
    for (auto _ : state) {
        table->setApps(newApplications());
        state.SetIterationTime(table.longestStretch([&] { table->reloadTable(); }).count());
    }
}
BENCHMARK(fillTable)->UseManualTime()->Unit(benchmark::kMicrosecond);

void refillTable(benchmark::State &state)
{
    Table table;
    table->setApps(newApplications());
    table->reloadTable();
    table.settle();
    for (auto _ : state) {
        Applications turned = table->apps();
        std::ranges::reverse(turned);
        table->setApps(turned);
        state.SetIterationTime(table.longestStretch([&] { table->reloadTable(); }).count());
    }
}
BENCHMARK(refillTable)->UseManualTime()->Unit(benchmark::kMicrosecond);

void toggleRow(benchmark::State &state)
{
    Table table;
    table->setApps(newApplications());
    table->setSpinOnSelection(false);
    table->reloadTable();
    table.settle();
    auto *const checkbox = table->rowViewForRow(3)->findChild<QCheckBox *>();
    for (auto _ : state)
        state.SetIterationTime(table.longestStretch([&] { checkbox->click(); }).count());
}
BENCHMARK(toggleRow)->UseManualTime()->Unit(benchmark::kMicrosecond);

void pickAllRows(benchmark::State &state)
{
    Table table;
    table->setApps(newApplications());
    table->reloadTable();
    table.settle();
    for (auto _ : state) {
        state.SetIterationTime(table.longestStretch([&] { table->selectAllApps(); }).count());
        table->updateTable();
        table.settle();
    }
}
BENCHMARK(pickAllRows)->UseManualTime()->Unit(benchmark::kMicrosecond);

void sortReversed(benchmark::State &state)
{
    Table table;
    const Applications reversed = newApplications();
    for (auto _ : state) {
        table->setApps(reversed);
        table->_sortApps();
    }
}
BENCHMARK(sortReversed)->Unit(benchmark::kMicrosecond);

void paintTable(benchmark::State &state)
{
    Table table;
    table->setApps(newApplications());
    table->reloadTable();
    table.settle();
    for (auto _ : state)
        table->view()->repaint();
}
BENCHMARK(paintTable)->Unit(benchmark::kMicrosecond);

}  // namespace

int main(int argc, char *argv[])
{
    const QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}

#include "app_table_bench.moc"
