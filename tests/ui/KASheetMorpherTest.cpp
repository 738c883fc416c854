// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KASheetMorpher.h>

#include <QtCore/QVariantAnimation>
#include <QtGui/QPainter>
#include <QtGui/QWindow>
#include <QtWidgets/QProxyStyle>

#include <gtest/gtest.h>

#include <kavellaccounts/KASheetWindow.h>

#include "ui/cross_fade_view.h"

namespace {

class ColouredView : public QWidget {
public:
    ColouredView(const QColor &colour, const QSize &size) : m_colour(colour) { resize(size); }

protected:
    void paintEvent(QPaintEvent *) override { QPainter(this).fillRect(rect(), m_colour); }

private:
    QColor m_colour;
};

class KASheetMorpherTest : public testing::Test {
protected:
    KASheetMorpherTest() { sheet->setGeometry(100, 80, 200, 200); }
    ~KASheetMorpherTest() override { kavell::sheetAnimationRunner() = kavell::runToEnd; }

    std::shared_ptr<KASheetWindow> sheet = std::make_shared<KASheetWindow>();
    std::shared_ptr<KASheetMorpher> morpher = KASheetMorpher::initWithHostSheet(sheet);
    ColouredView red{Qt::red, {200, 200}};
    ColouredView blue{Qt::blue, {300, 120}};
};

TEST_F(KASheetMorpherTest, TheHostSheetIsTheOneGivenAndCanBeReplaced)
{
    EXPECT_EQ(morpher->hostSheet(), sheet);
    morpher->setHostSheet(nullptr);
    EXPECT_EQ(morpher->hostSheet(), nullptr);
    morpher->setContentView(&red, true);
    EXPECT_EQ(red.parent(), nullptr);
}

TEST_F(KASheetMorpherTest, AWiderViewGrowsTheSheetOnBothSidesBelowItsTopEdge)
{
    morpher->setContentView(&blue, false);
    EXPECT_EQ(sheet->geometry(), QRect(50, 80, 300, 120));
    EXPECT_EQ(sheet->contentView(), &blue);
    EXPECT_EQ(blue.geometry(), QRect(0, 0, 300, 120));
}

TEST_F(KASheetMorpherTest, ATallerNarrowerViewKeepsTheTopEdgeAndTheMiddle)
{
    ColouredView tall(Qt::green, {100, 450});
    morpher->setContentView(&tall, false);
    EXPECT_EQ(sheet->geometry(), QRect(150, 80, 100, 450));
}

TEST_F(KASheetMorpherTest, TheSameViewLeavesTheSheetUntouched)
{
    morpher->setContentView(&red, false);
    sheet->setGeometry(7, 8, 333, 222);
    morpher->setContentView(&red, true);
    morpher->setContentView(&red, false);
    EXPECT_EQ(sheet->geometry(), QRect(7, 8, 333, 222));
}

TEST_F(KASheetMorpherTest, AViewThatIsTakenOutLivesOnWithItsSize)
{
    morpher->setContentView(&red, false);
    for (const bool animate : {false, true}) {
        morpher->setContentView(&blue, animate);
        EXPECT_EQ(red.parent(), nullptr);
        EXPECT_FALSE(red.isVisible());
        EXPECT_EQ(red.size(), QSize(200, 200));
        morpher->setContentView(&red, animate);
    }
}

TEST_F(KASheetMorpherTest, TheAnimatedSwapEndsWithTheViewAtItsFrame)
{
    sheet->show();
    morpher->setContentView(&red, false);
    morpher->setContentView(&blue, true);
    EXPECT_EQ(sheet->geometry(), QRect(50, 80, 300, 120));
    EXPECT_EQ(sheet->contentView(), &blue);
    EXPECT_TRUE(blue.isVisible());
}

TEST_F(KASheetMorpherTest, HalfWayFrameAndPicturesAreHalfWay)
{
    morpher->setContentView(&red, false);
    sheet->show();
    int steps = 0;
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &animation) {
        animation.setEasingCurve(QEasingCurve::Linear);
        animation.setDuration(200);
        // Never started, so that no clock but this test moves it.
        EXPECT_EQ(sheet->contentView()->grab().toImage().pixel(10, 10), qRgb(255, 0, 0));
        animation.setCurrentTime(100);
        EXPECT_EQ(sheet->geometry(), QRect(75, 80, 250, 160));
        const QColor middle = sheet->contentView()->grab().toImage().pixelColor(10, 10);
        EXPECT_NEAR(middle.red(), 128, 1);
        EXPECT_NEAR(middle.blue(), 128, 1);
        EXPECT_EQ(middle.green(), 0);
        animation.setCurrentTime(200);
        EXPECT_EQ(sheet->contentView()->grab().toImage().pixel(10, 10), qRgb(0, 0, 255));
        ++steps;
    };
    morpher->setContentView(&blue, true);
    EXPECT_EQ(steps, 1);
}

TEST_F(KASheetMorpherTest, APictureOfAWiderViewIsAsWideAsTheView)
{
    morpher->setContentView(&red, false);
    sheet->show();
    int steps = 0;
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &animation) {
        animation.setDuration(100);
        animation.setCurrentTime(100);
        EXPECT_EQ(sheet->contentView()->size(), QSize(300, 120));
        EXPECT_EQ(sheet->contentView()->grab().toImage().pixel(299, 119), qRgb(0, 0, 255));
        ++steps;
    };
    morpher->setContentView(&blue, true);
    EXPECT_EQ(steps, 1);
}

TEST_F(KASheetMorpherTest, BesideANarrowerViewTheOldContentFadesIntoTheBackground)
{
    ColouredView narrow(Qt::green, {80, 200});
    const QColor background(10, 20, 200);
    QPalette palette = narrow.palette();
    palette.setColor(QPalette::Window, background);
    narrow.setPalette(palette);
    morpher->setContentView(&red, false);
    sheet->show();
    int steps = 0;
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &animation) {
        animation.setEasingCurve(QEasingCurve::Linear);
        animation.setDuration(100);
        animation.setCurrentTime(50);
        // Half way the sheet is 140 wide, of which the new view takes 80.
        const QImage picture = sheet->contentView()->grab().toImage();
        EXPECT_EQ(picture.width(), 140);
        EXPECT_NEAR(picture.pixelColor(40, 100).green(), 128, 1);
        EXPECT_NEAR(picture.pixelColor(120, 100).red(), (255 + 10) / 2, 1);
        EXPECT_NEAR(picture.pixelColor(120, 100).blue(), 200 / 2, 1);
        ++steps;
    };
    morpher->setContentView(&narrow, true);
    EXPECT_EQ(steps, 1);
    EXPECT_EQ(sheet->geometry(), QRect(160, 80, 80, 200));
}

TEST_F(KASheetMorpherTest, TheSheetMovesByTheToolkitsTimeAndKeepsItsTopEdgeOnTheWay)
{
    morpher->setContentView(&red, false);
    sheet->show();
    QList<int> tops;
    int duration = 0;
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &animation) {
        duration = animation.duration();
        for (int time = 0; time <= duration; time += 10) {
            animation.setCurrentTime(time);
            tops.append(sheet->geometry().top());
        }
    };
    morpher->setContentView(&blue, true);
    EXPECT_EQ(duration, sheet->style()->styleHint(QStyle::SH_Widget_Animation_Duration));
    EXPECT_GT(tops.size(), 1);
    EXPECT_EQ(tops.count(80), tops.size());
}

TEST_F(KASheetMorpherTest, TheCrossFadeViewIsMadeOnceAndReused)
{
    QList<QWidget *> seen;
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &) {
        seen.append(sheet->contentView());
    };
    morpher->setContentView(&red, true);
    morpher->setContentView(&blue, true);
    ASSERT_EQ(seen.size(), 2);
    EXPECT_EQ(seen[0], seen[1]);
    EXPECT_NE(seen[0], &blue);
}

class StillStyle : public QProxyStyle {
    int styleHint(StyleHint hint, const QStyleOption *option, const QWidget *widget,
                  QStyleHintReturn *data) const override
    {
        return hint == SH_Widget_Animation_Duration ? 0 : QProxyStyle::styleHint(hint, option, widget, data);
    }
};

TEST_F(KASheetMorpherTest, AStyleWithoutAnimationsSwapsAtOnce)
{
    StillStyle style;
    sheet->setStyle(&style);
    morpher->setContentView(&blue, true);
    EXPECT_EQ(sheet->contentView(), &blue);
    EXPECT_EQ(sheet->geometry(), QRect(50, 80, 300, 120));
    sheet->setStyle(nullptr);
}

TEST_F(KASheetMorpherTest, ASwapDuringTheAnimationWins)
{
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &) {
        morpher->setContentView(&red, false);
    };
    morpher->setContentView(&blue, true);
    EXPECT_EQ(sheet->contentView(), &red);
}

TEST_F(KASheetMorpherTest, TheMorpherMayGoDuringTheAnimation)
{
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &) {
        morpher.reset();
    };
    morpher->setContentView(&blue, true);
    EXPECT_EQ(sheet->contentView(), nullptr);
}

TEST_F(KASheetMorpherTest, AViewMayBeDeletedDuringTheAnimation)
{
    auto *view = new ColouredView(Qt::green, {50, 60});
    kavell::sheetAnimationRunner() = [&](QVariantAnimation &) {
        delete view;
    };
    morpher->setContentView(view, true);
    EXPECT_EQ(sheet->contentView(), nullptr);
}

TEST(KASheetWindowTest, EndingTheSheetTellsItsCodeAndHidesIt)
{
    QWidget parent;
    parent.show();
    KASheetWindow sheet;
    int code = -1;
    QObject::connect(&sheet, &QDialog::finished, [&](int result) { code = result; });
    sheet.beginSheet(&parent);
    EXPECT_TRUE(sheet.isVisible());
    EXPECT_EQ(sheet.windowModality(), Qt::WindowModal);
    sheet.endSheet(7);
    sheet.orderOut();
    EXPECT_EQ(code, 7);
    EXPECT_FALSE(sheet.isVisible());
}

TEST(KASheetWindowTest, ASheetIsModalToItsWindowAndStandsOverItsCentre)
{
    QWidget parent;
    parent.setGeometry(100, 100, 400, 300);
    parent.show();
    KASheetWindow sheet;
    sheet.resize(200, 100);
    sheet.beginSheet(&parent);
    ASSERT_TRUE(parent.windowHandle());
    EXPECT_EQ(sheet.windowHandle()->transientParent(), parent.windowHandle());
    EXPECT_EQ(sheet.geometry().center(), parent.geometry().center());
}

TEST(KASheetWindowTest, ASheetOutlivesItsWindowAndEnds)
{
    const auto sheet = std::make_shared<KASheetWindow>();
    int endings = 0;
    QObject::connect(sheet.get(), &QDialog::finished, [&](int result) { endings += result == 0 ? 1 : 100; });
    {
        QWidget parent;
        parent.show();
        sheet->beginSheet(&parent);
    }
    EXPECT_EQ(endings, 1);
    EXPECT_FALSE(sheet->isVisible());
}

TEST(KASheetWindowTest, AWindowThatGoesAfterTheSheetEndedIsNoSecondEnd)
{
    const auto sheet = std::make_shared<KASheetWindow>();
    int endings = 0;
    QObject::connect(sheet.get(), &QDialog::finished, [&] { ++endings; });
    {
        QWidget parent;
        parent.show();
        sheet->beginSheet(&parent);
        sheet->reject();
    }
    EXPECT_EQ(endings, 1);
}

}  // namespace
