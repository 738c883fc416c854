// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The order of the application table's rows.

#include <algorithm>

#include <gmock/gmock.h>

#include "tests/ui/app_table_fixture.h"

using namespace kavell::test;
using testing::ElementsAre;

namespace {

TEST(KAAppTableSort, SortingKeepsEqualApplicationsInTheirOrderWithTheirServices)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    const auto app = [](const QString &bundleID) {
        return KAApplication::initWithBundleID(bundleID);
    };
    table->setApps({app("z.one"), app(kKAParlexAppID), app("a.two"), app(kKAMailAppID), app("m.three")});
    table->setPairedServices({"1", "chat", "2", "mail", "3"});
    table->_sortApps();
    EXPECT_THAT(bundleIDsOf(table->apps()), ElementsAre(kKAMailAppID, kKAParlexAppID, "z.one", "a.two", "m.three"));
    EXPECT_THAT(table->pairedServices(), ElementsAre("mail", "chat", "1", "2", "3"));
}

TEST(KAAppTableSort, EveryOrderOfFiveApplicationsIsSorted)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    const QStringList sorted = {kKAMailAppID, kKACardellAppID, kKATidewellAppID, kKAParlexAppID, "other"};
    QList<int> order = {0, 1, 2, 3, 4};
    do {
        QList<Application> apps;
        QStringList services;
        for (const int place : order) {
            apps += KAApplication::initWithBundleID(sorted.at(place));
            services += QString::number(place);
        }
        table->setApps(apps);
        table->setPairedServices(services);
        table->_sortApps();
        ASSERT_EQ(bundleIDsOf(table->apps()), sorted);
        ASSERT_THAT(table->pairedServices(), ElementsAre("0", "1", "2", "3", "4"));
    } while (std::next_permutation(order.begin(), order.end()));
}

TEST(KAAppTableSort, SortingNeedsNoServicesAndNoApplications)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    table->_sortApps();
    table->setApps({KAApplication::initWithBundleID("other"), KAApplication::initWithBundleID(kKAMailAppID)});
    table->setPairedServices({"1"});
    table->_sortApps();
    EXPECT_THAT(bundleIDsOf(table->apps()), ElementsAre(kKAMailAppID, "other"));
    EXPECT_THAT(table->pairedServices(), ElementsAre("1"));
}

}  // namespace
