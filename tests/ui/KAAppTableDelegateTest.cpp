// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the application table asks and tells its delegate.

#include <kavellaccounts/KAAppTableController.h>

#include <gmock/gmock.h>

#include "tests/ui/app_table_fixture.h"

using namespace kavell::test;
using testing::ElementsAre;

namespace {

class KAAppTableDelegateTest : public AppTableTest {};

TEST_F(KAAppTableDelegateTest, AnAcceptedToggleStays)
{
    RecordingDelegate delegate;
    const auto table = tableFor(accountFor({}));
    table->setDelegate(&delegate);
    QCheckBox box;
    box.setChecked(true);
    table->checkboxClickedForApp(&box, table->appAtRow(0));
    EXPECT_TRUE(box.isChecked());
    EXPECT_TRUE(table->appAtRow(0)->enabled());
    EXPECT_THAT(delegate.toggled, ElementsAre(table->appAtRow(0)));
    EXPECT_THAT(delegate.enabledWhenAsked, ElementsAre(true));
}

TEST_F(KAAppTableDelegateTest, ARefusedToggleShowsTheFormerStateButKeepsTheFlag)
{
    RecordingDelegate delegate;
    delegate.accepts = false;
    const auto table = tableFor(accountFor({}));
    table->setDelegate(&delegate);
    QCheckBox box;
    box.setChecked(true);
    table->checkboxClickedForApp(&box, table->appAtRow(0));
    EXPECT_FALSE(box.isChecked());
    EXPECT_TRUE(table->appAtRow(0)->enabled());
    table->checkboxClickedForApp(&box, table->appAtRow(0));
    EXPECT_TRUE(box.isChecked());
    EXPECT_FALSE(table->appAtRow(0)->enabled());
}

TEST_F(KAAppTableDelegateTest, AToggleThatNobodyAnswersIsRefused)
{
    const auto table = tableFor(accountFor({}));
    QObject mute;
    for (QObject *delegate : {static_cast<QObject *>(nullptr), &mute}) {
        table->setDelegate(delegate);
        QCheckBox box;
        box.setChecked(true);
        table->checkboxClickedForApp(&box, table->appAtRow(0));
        EXPECT_FALSE(box.isChecked());
        EXPECT_TRUE(table->appAtRow(0)->enabled());
    }
    table->checkboxClickedForApp(nullptr, table->appAtRow(0));
    QCheckBox box;
    table->checkboxClickedForApp(&box, nullptr);
}

TEST_F(KAAppTableDelegateTest, TheDelegateShowsInformation)
{
    RecordingDelegate delegate;
    QObject mute;
    const auto table = tableFor(accountFor({}));
    table->infoButtonClickedForApp(table->appAtRow(1));
    table->setDelegate(&mute);
    table->infoButtonClickedForApp(table->appAtRow(1));
    table->setDelegate(&delegate);
    table->infoButtonClickedForApp(table->appAtRow(1));
    EXPECT_THAT(delegate.shown, ElementsAre(table->appAtRow(1)));
}

TEST_F(KAAppTableDelegateTest, ASharedDelegateIsRetainedAndAPlainOneIsNot)
{
    const auto table = tableFor(accountFor({}));
    auto shared = std::make_shared<RecordingDelegate>();
    const std::weak_ptr<QObject> seen = shared;
    table->setDelegate(shared);
    shared.reset();
    EXPECT_EQ(table->delegate(), seen.lock().get());
    {
        QObject plain;
        table->setDelegate(&plain);
        EXPECT_TRUE(seen.expired());
        EXPECT_EQ(table->delegate(), &plain);
    }
    EXPECT_EQ(table->delegate(), nullptr);
}

}  // namespace
