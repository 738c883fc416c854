// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAVerticallyCenteredCell.h>

#include <cmath>

#include <QtGui/QFontMetricsF>
#include <QtGui/QImage>
#include <QtGui/QPainter>
#include <QtGui/QStandardItemModel>

#include <gtest/gtest.h>

namespace {

QImage drawn(const QStyledItemDelegate &delegate, bool selected)
{
    QStandardItemModel model(1, 1);
    model.setData(model.index(0, 0), "Example", Qt::DisplayRole);
    QImage image(160, 60, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::white);
    QStyleOptionViewItem option;
    option.rect = image.rect();
    option.displayAlignment = Qt::AlignTop;
    option.state = QStyle::State_Enabled | QStyle::State_Active;
    option.showDecorationSelected = true;
    if (selected)
        option.state |= QStyle::State_Selected;
    QPainter painter(&image);
    delegate.paint(&painter, option, model.index(0, 0));
    return image;
}

/// The first and last rows of an image with anything but white.
std::pair<int, int> inkedRows(const QImage &image)
{
    int first = -1;
    int last = -1;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            if (image.pixel(x, y) != qRgb(255, 255, 255)) {
                first = first < 0 ? y : first;
                last = y;
            }
    return {first, last};
}

TEST(KAVerticallyCenteredCellTest, ANewCellDoesNotCentre)
{
    EXPECT_FALSE(KAVerticallyCenteredCell().verticallyCentered());
}

TEST(KAVerticallyCenteredCellTest, WithoutCentringTheFrameIsUnchanged)
{
    EXPECT_EQ(KAVerticallyCenteredCell().adjustFrameToVerticallyCenterText(QRectF(1, 2, 30, 41)), QRectF(1, 2, 30, 41));
}

TEST(KAVerticallyCenteredCellTest, TheInsetIsHalfTheFreeHeightRoundedDown)
{
    KAVerticallyCenteredCell cell;
    cell.setVerticallyCentered(true);
    const QFontMetricsF metrics(cell.font());
    const qreal inset = std::floor(61 * 0.5 - (metrics.ascent() - -metrics.descent()) * 0.5);
    ASSERT_GT(inset, 0);
    EXPECT_EQ(cell.adjustFrameToVerticallyCenterText(QRectF(3, 5, 80, 61)), QRectF(3, 5 + inset, 80, 61 - 2 * inset));
}

TEST(KAVerticallyCenteredCellTest, ALineTallerThanTheFrameEnlargesIt)
{
    KAVerticallyCenteredCell cell;
    cell.setVerticallyCentered(true);
    const QRectF adjusted = cell.adjustFrameToVerticallyCenterText(QRectF(0, 10, 50, 2));
    EXPECT_LT(adjusted.top(), 10);
    EXPECT_GT(adjusted.bottom(), 12);
    EXPECT_EQ(adjusted.width(), 50);
}

TEST(KAVerticallyCenteredCellTest, ANegativeInsetIsRoundedDownToo)
{
    KAVerticallyCenteredCell cell;
    cell.setVerticallyCentered(true);
    const QFontMetricsF metrics(cell.font());
    const qreal line = metrics.ascent() + metrics.descent();
    // Of two heights in succession at least one leaves a half, which goes to the line.
    for (const int height : {1, 2}) {
        const QRectF adjusted = cell.adjustFrameToVerticallyCenterText(QRectF(0, 10, 50, height));
        const qreal inset = adjusted.top() - 10;
        EXPECT_EQ(inset, std::floor(inset));
        EXPECT_GE(adjusted.height(), line) << height;
        EXPECT_LT(adjusted.height(), line + 2) << height;
        EXPECT_EQ(adjusted.center().y(), 10 + height * 0.5);
    }
}

TEST(KAVerticallyCenteredCellTest, WithoutCentringItDrawsExactlyAsItsBase)
{
    for (const bool selected : {false, true})
        EXPECT_EQ(drawn(KAVerticallyCenteredCell(), selected), drawn(QStyledItemDelegate(), selected));
}

TEST(KAVerticallyCenteredCellTest, CentringMovesTheTextToTheMiddle)
{
    KAVerticallyCenteredCell cell;
    const auto [topFirst, topLast] = inkedRows(drawn(cell, false));
    cell.setVerticallyCentered(true);
    const auto [first, last] = inkedRows(drawn(cell, false));
    EXPECT_LT(topLast, 30);
    EXPECT_GT(first, topFirst);
    EXPECT_NEAR((first + last) / 2.0, 30, 4);
}

TEST(KAVerticallyCenteredCellTest, TheSelectionFillsTheWholeCentredCell)
{
    KAVerticallyCenteredCell cell;
    cell.setVerticallyCentered(true);
    const QImage image = drawn(cell, true);
    EXPECT_NE(image.pixel(80, 0), qRgb(255, 255, 255));
    EXPECT_NE(image.pixel(80, 59), qRgb(255, 255, 255));
}

}  // namespace
