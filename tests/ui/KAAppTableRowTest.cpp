// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a row of the application table does: its application, check box, spinner and information button.

#include <kavellaccounts/KAAppTableRow.h>

#include <gmock/gmock.h>

#include <QtCore/QAbstractEventDispatcher>
#include <QtTest/QTest>

#include <kavellaccounts/KAAppTableRowLoader.h>
#include <kavellaccounts/KAFieldList.h>

#include "tests/support/log_capture.h"
#include "tests/ui/app_table_fixture.h"
#include "ui/progress_spinner.h"

using namespace kavell::test;

namespace {

class KAAppTableRowTest : public AppTableRowTest {};

TEST_F(KAAppTableRowTest, ANewRowShowsInformationButtonsAndSpins)
{
    EXPECT_TRUE(row->showInfoButton());
    EXPECT_TRUE(row->spinOnSelection());
    EXPECT_FALSE(row->disableControls());
    EXPECT_FALSE(row->isSpinning());
    EXPECT_EQ(row->application(), nullptr);
    EXPECT_EQ(row->delegate(), nullptr);
    EXPECT_TRUE(row->secondaryText().isNull());
}

TEST_F(KAAppTableRowTest, TheLoaderHasNoRowWhenTheFileCannotBeRead)
{
    const LogCapture log;
    KAAppTableRowLoader loader;
    EXPECT_FALSE(loader.loadNib("NoSuchRow"));
    EXPECT_EQ(loader.rowView(), nullptr);
    EXPECT_THAT(log.messages(), testing::SizeIs(1));
}

TEST_F(KAAppTableRowTest, TheLoaderTakesNoOtherInterfaceForARow)
{
    const LogCapture log;
    KAAppTableRowLoader loader;
    EXPECT_FALSE(loader.loadNib("AppTable"));
    EXPECT_EQ(loader.rowView(), nullptr);
    EXPECT_THAT(log.messages(), testing::SizeIs(1));
}

TEST_F(KAAppTableRowTest, TheLoadersRowIsAProperty)
{
    KAAppTableRowLoader loader;
    loader.setRowView(row);
    EXPECT_EQ(loader.rowView(), row);
    ASSERT_TRUE(loader.loadNib("KAAppTableRow"));
    EXPECT_NE(loader.rowView(), row);
    EXPECT_NE(loader.rowView(), nullptr);
}

TEST_F(KAAppTableRowTest, AnEnabledApplicationTurnsTheCheckBoxOn)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_EQ(row->application(), mail);
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    row->setApplication(KAApplication::initWithBundleID(kKAParlexAppID));
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, TheSameApplicationAgainChangesNothing)
{
    row->setApplication(mail);
    mail->setEnabled(true);
    row->startSpinner();
    row->setApplication(mail);
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_TRUE(row->isSpinning());
}

TEST_F(KAAppTableRowTest, AnotherApplicationDoesNotSpin)
{
    row->setApplication(mail);
    row->startSpinner();
    row->setApplication(KAApplication::initWithBundleID(kKAParlexAppID));
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, AnotherApplicationInADisabledRowIsDisabled)
{
    row->setDisableControls(true);
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_FALSE(mail->enabled());
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, EachSecondaryTextMovesTheNameDownBySevenPoints)
{
    const int top = nameOf(*row)->y();
    row->setSecondaryText("One");
    EXPECT_EQ(nameOf(*row)->y(), top + 7);
    row->setSecondaryText("One");
    EXPECT_EQ(nameOf(*row)->y(), top + 14);
}

TEST_F(KAAppTableRowTest, ClearingTheSecondaryTextLeavesTheNameWhereItIs)
{
    const int top = nameOf(*row)->y();
    row->setSecondaryText("One");
    row->setSecondaryText("");
    row->setSecondaryText({});
    EXPECT_EQ(nameOf(*row)->y(), top + 7);
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, TheSecondaryTextIsHiddenWhileItIsEmpty)
{
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
    row->setSecondaryText("Why not");
    (void)drawn();
    EXPECT_FALSE(secondaryOf(*row)->isHidden());
    EXPECT_EQ(secondaryOf(*row)->text(), "Why not");
    row->setSecondaryText({});
    (void)drawn();
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
    EXPECT_EQ(secondaryOf(*row)->text(), "");
}

TEST_F(KAAppTableRowTest, SelectingTurnsTheCheckBoxOnAndDeselectingOff)
{
    row->setApplication(mail);
    row->select();
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(mail->enabled());
    row->deselect();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, ADisabledRowCannotBeSelected)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    row->select();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, TheSpinnerTakesTheCheckBoxsPlace)
{
    row->startSpinner();
    EXPECT_TRUE(row->isSpinning());
    EXPECT_TRUE(checkboxOf(*row)->isHidden());
    EXPECT_TRUE(controlOf<kavell::ProgressSpinner>(*row, "spinner")->isAnimating());
    EXPECT_EQ(spinnerOf(*row)->geometry(), checkboxOf(*row)->geometry());
    row->stopSpinner();
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
    EXPECT_FALSE(controlOf<kavell::ProgressSpinner>(*row, "spinner")->isAnimating());
}

TEST_F(KAAppTableRowTest, TheSpinnerTurnsOnlyWhileItIsSeen)
{
    const auto isTurning = [this] {
        return !QAbstractEventDispatcher::instance()->registeredTimers(spinnerOf(*row)).isEmpty();
    };
    row->startSpinner();
    EXPECT_FALSE(isTurning());
    row->show();
    EXPECT_TRUE(isTurning());
    const QImage before = spinnerOf(*row)->grab().toImage();
    EXPECT_TRUE(QTest::qWaitFor([&] { return spinnerOf(*row)->grab().toImage() != before; }));
    row->hide();
    EXPECT_FALSE(isTurning());
    row->show();
    row->stopSpinner();
    EXPECT_FALSE(isTurning());
}

TEST_F(KAAppTableRowTest, ASpinnerWithTheFocusShowsIt)
{
    row->show();
    row->startSpinner();
    ASSERT_TRUE(QTest::qWaitForWindowActive(row.get()));
    controlOf<kavell::ProgressSpinner>(*row, "spinner")->stopAnimation();
    const QImage before = spinnerOf(*row)->grab().toImage();
    QTest::keyClick(row.get(), Qt::Key_Tab);
    ASSERT_TRUE(spinnerOf(*row)->hasFocus());
    EXPECT_NE(spinnerOf(*row)->grab().toImage(), before);
}

TEST_F(KAAppTableRowTest, TheInformationButtonIsForAnEnabledApplicationThatDoesNotSpin)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_TRUE(hasInfoButton());
    row->startSpinner();
    EXPECT_FALSE(hasInfoButton());
    row->stopSpinner();
    EXPECT_TRUE(hasInfoButton());
    row->setShowInfoButton(false);
    EXPECT_FALSE(hasInfoButton());
    row->setShowInfoButton(true);
    mail->setEnabled(false);
    row->syncUI();
    EXPECT_FALSE(hasInfoButton());
}

TEST_F(KAAppTableRowTest, DisablingGreysTheRowOut)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    row->setDisableControls(true);
    EXPECT_FALSE(mail->enabled());
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(checkboxOf(*row)->isEnabled());
    EXPECT_FALSE(hasInfoButton());
    EXPECT_EQ(nameOf(*row)->palette().color(nameOf(*row)->foregroundRole()), QColor(Qt::gray));
}

TEST_F(KAAppTableRowTest, GreyingOutHappensOnceAndIsNeverUndone)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    const QImage icon = controlOf<QLabel>(*row, "icon")->pixmap().toImage();
    row->setDisableControls(false);
    EXPECT_FALSE(checkboxOf(*row)->isEnabled());
    EXPECT_EQ(nameOf(*row)->palette().color(nameOf(*row)->foregroundRole()), QColor(Qt::gray));
    mail->setEnabled(true);
    row->setDisableControls(true);
    EXPECT_TRUE(mail->enabled());
    EXPECT_EQ(controlOf<QLabel>(*row, "icon")->pixmap().toImage(), icon);
}

TEST_F(KAAppTableRowTest, WithoutADelegateAClickOnlyStartsTheSpinner)
{
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_TRUE(row->isSpinning());
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(mail->enabled());
    row->appInfo(nullptr);
}

TEST_F(KAAppTableRowTest, ARowThatDoesNotSpinOnSelectionKeepsItsCheckBox)
{
    row->setSpinOnSelection(false);
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, ACheckBoxTurnedOffStartsNoSpinner)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(row->isSpinning());
}

TEST_F(KAAppTableRowTest, TheRowDoesNotKeepItsApplication)
{
    const std::weak_ptr<KAApplication> seen = mail;
    row->setApplication(mail);
    mail.reset();
    EXPECT_TRUE(seen.expired());
    EXPECT_EQ(row->application(), nullptr);
    checkboxOf(*row)->click();
    row->syncUI();
    (void)drawn();
}

TEST_F(KAAppTableRowTest, FieldsAreListedInTheirOrder)
{
    KAFieldList list;
    row->describeFields(list);
    QStringList names;
    for (const KAField &field : list.fields())
        names += field.name + ' ' + field.encoding;
    EXPECT_THAT(names, testing::ElementsAre("_checkbox @\"QCheckBox\"", "_appNameField @\"kavell::RowLabel\"",
                                            "_secondaryTextField @\"kavell::RowLabel\"", "_icon @\"QLabel\"",
                                            "_spinner @\"kavell::ProgressSpinner\"", "_infoButton @\"QAbstractButton\"",
                                            "_application @\"KAApplication\"", "_serviceDisplayName @\"QString\"",
                                            "_appDisplayName @\"QString\"", "_secondaryText @\"QString\"",
                                            "_delegate @\"KAAppTableController\"", "_showInfoButton c",
                                            "_spinOnSelection c", "_disableControls c", "_controlsAreDisabled c"));
}

TEST_F(KAAppTableRowTest, TheLoadersFieldIsItsRow)
{
    KAFieldList list;
    KAAppTableRowLoader().describeFields(list);
    ASSERT_EQ(list.fields().size(), 1U);
    EXPECT_EQ(list.fields().front().name, "_rowView");
}

}  // namespace
