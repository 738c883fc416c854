// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example's sheet in a language that is written from right to left; a program of its own, since a program's language
// is settled when it starts.

#include <cstdlib>

#include <gmock/gmock.h>

#include "tests/integration/zorbo_fixture.h"

namespace kavell::test {

namespace {

[[maybe_unused]] const bool kLanguageIsSet = setenv("LANGUAGE", "ar_XB", 1) == 0;  // before there is an application

/// A word of the pseudo-language.
QString turned(const QString &word)
{
    return QChar(0x200f) + QString(QChar(0x202e)) + word + QChar(0x202c) + QChar(0x200f);
}

}  // namespace

class ZorboFromRightToLeft : public ZorboTest {
protected:
    void SetUp() override
    {
        QApplication::setLayoutDirection(Qt::RightToLeft);
        ZorboTest::SetUp();
    }
};

TEST_F(ZorboFromRightToLeft, LabelsStandRightOfTheirFields)
{
    openSheet();
    EXPECT_GT(control<QLabel>("addressLabel")->x(), field("addressField")->geometry().right());
    EXPECT_LT(button("signInContinue")->x(), button("signInCancel")->x());
}

TEST_F(ZorboFromRightToLeft, BackIsOnTheRight)
{
    openApplications();
    EXPECT_GT(button("appSelectionBack")->x(), button("appSelectionOKButton")->x());
}

TEST_F(ZorboFromRightToLeft, EveryTextComesFromTheTables)
{
    openApplications();
    EXPECT_EQ(zorbo().brandName(), turned("Zorbo"));
    const QWidget *const host = sheet()->contentView();
    for (const QPushButton *button : host->findChildren<QPushButton *>())
        EXPECT_TRUE(button->text().startsWith(QChar(0x200f))) << button->text().toStdString();
    click("appSelectionBack");
    ASSERT_TRUE(reaches("signInView"));
    EXPECT_EQ(textOf("passwordLabel"), turned("Password:"));
    for (const QLabel *label : sheet()->contentView()->findChildren<QLabel *>()) {
        EXPECT_TRUE(label->text().isEmpty() || label->text().startsWith(QChar(0x200f))) << label->text().toStdString();
    }
    for (const QPushButton *button : sheet()->contentView()->findChildren<QPushButton *>())
        EXPECT_TRUE(button->text().startsWith(QChar(0x200f))) << button->text().toStdString();
    EXPECT_EQ(sheet()->windowTitle(), turned("Zorbo"));
}

TEST_F(ZorboFromRightToLeft, WhatProgramsReadStaysAsItIs)
{
    EXPECT_EQ(zorbo().supportURL(), QUrl("https://help.zorbo.example/en/"));
    EXPECT_EQ(zorbo().autodiscoverDomain(), "zorbo.example");
}

}  // namespace kavell::test
