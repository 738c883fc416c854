// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the cross-application set-up adds to its plug-ins' own work: from making the controller of a new mail account, over
// its count and its view, to the delegate's answer that contacts, calendars and chat have their accounts. The plug-ins
// measure themselves, from being asked to find an account to their report; that is taken off the whole time.

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdlib>

#include <QtCore/QEventLoop>
#include <QtWidgets/QApplication>

#include <benchmark/benchmark.h>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KACrossAppSetupViewController.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

namespace {

using Clock = std::chrono::steady_clock;
using State = KACrossAppSetupViewController::ApplicationOutcome::State;

/// Ends its loop when it is told.
class Delegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void controllerDidSave(KACrossAppSetupViewController *, bool, void *) { loop.quit(); }

    QEventLoop loop;
};

std::array<KAPlugin *, 3> dataPlugins()
{
    KAPluginManager *const manager = KAPluginManager::shared();
    return {manager->pluginWithIdentifier(kKAContactsPluginID), manager->pluginWithIdentifier(kKACalendarPluginID),
            manager->pluginWithIdentifier(kKAChatPluginID)};
}

/// Offers and makes the accounts; whether all three came to be.
bool setUpThree()
{
    const auto controller = KACrossAppSetupViewController::initWithSettings(
        {{KAMailEmailAddressKey, QStringLiteral("ada@zorbo.example")}}, kKAMailAppID);
    if (controller->numberOfAppsNeedingSetup() != 3 || !controller->view())
        return false;
    const auto delegate = std::make_shared<Delegate>();
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    delegate->loop.exec();
    const auto outcomes = controller->applicationOutcomes();
    return outcomes.size() == 3 && std::all_of(outcomes.begin(), outcomes.end(),
                                               [](const auto &outcome) { return outcome.state == State::Done; });
}

/// With plug-ins that take so many milliseconds each.
void setUpThreeApplications(benchmark::State &state)
{
    for (KAPlugin *plugin : dataPlugins()) {
        if (!plugin)
            return state.SkipWithError("the plug-ins are not there");
        plugin->setProperty("delay", static_cast<int>(state.range(0)));
    }
    for (auto _ : state) {
        const auto start = Clock::now();
        const bool complete = setUpThree();
        auto own = Clock::now() - start;
        for (KAPlugin *plugin : dataPlugins())
            own -= std::chrono::nanoseconds(plugin->property("own").toLongLong());
        if (!complete)
            return state.SkipWithError("three accounts were expected");
        state.SetIterationTime(std::chrono::duration<double>(own).count());
    }
}

BENCHMARK(setUpThreeApplications)->Arg(0)->Arg(20)->UseManualTime()->Unit(benchmark::kMicrosecond);

}  // namespace

int main(int argc, char *argv[])
{
    setenv("VESK_FRAMEWORK_PATH", KAVELL_BENCH_SETUP_BUNDLES, 1);
    const QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
}

#include "setup_bench.moc"
