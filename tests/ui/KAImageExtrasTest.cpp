// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAImageExtras.h>

#include <gtest/gtest.h>

namespace {

QImage onePixel(QRgb colour)
{
    QImage image(1, 1, QImage::Format_ARGB32);
    image.setPixel(0, 0, colour);
    return image;
}

// The veil is white 242 (0.95) at alpha 128 (0.5), 121 premultiplied. An opaque pixel S becomes 121 + S * 127 / 255.

TEST(KAImageExtrasTest, AnOpaquePixelIsWashedOut)
{
    const QColor colour = KAExtras::disabledImage(onePixel(qRgb(255, 0, 0))).pixelColor(0, 0);
    EXPECT_NEAR(colour.red(), 248, 1);
    EXPECT_NEAR(colour.green(), 121, 1);
    EXPECT_NEAR(colour.blue(), 121, 1);
    EXPECT_EQ(colour.alpha(), 255);
}

TEST(KAImageExtrasTest, ATransparentPixelStaysTransparent)
{
    EXPECT_EQ(KAExtras::disabledImage(onePixel(qRgba(0, 0, 0, 0))).pixel(0, 0), qRgba(0, 0, 0, 0));
}

TEST(KAImageExtrasTest, AHalfTransparentPixelKeepsItsOpacity)
{
    // Premultiplied: veil 121 * 128 / 255 = 61; image 128 * 127 / 255 = 64 of blue.
    const QImage image = KAExtras::disabledImage(onePixel(qRgba(0, 0, 255, 128)));
    const QRgb raw = reinterpret_cast<const QRgb *>(image.constScanLine(0))[0];
    EXPECT_NEAR(qRed(raw), 61, 1);
    EXPECT_NEAR(qGreen(raw), 61, 1);
    EXPECT_NEAR(qBlue(raw), 125, 1);
    EXPECT_EQ(qAlpha(raw), 128);
}

TEST(KAImageExtrasTest, SizeAndPixelRatioAreKeptAndTheSourceIsUntouched)
{
    QImage image(6, 4, QImage::Format_RGB32);
    image.fill(Qt::red);
    image.setDevicePixelRatio(2);
    const QImage disabled = KAExtras::disabledImage(image);
    EXPECT_EQ(disabled.size(), QSize(6, 4));
    EXPECT_EQ(disabled.devicePixelRatio(), 2);
    EXPECT_EQ(disabled.format(), QImage::Format_ARGB32_Premultiplied);
    EXPECT_EQ(disabled.pixel(5, 3), disabled.pixel(0, 0));
    EXPECT_EQ(image.pixel(0, 0), qRgb(255, 0, 0));
}

TEST(KAImageExtrasTest, ANullImageGivesANullImage)
{
    EXPECT_TRUE(KAExtras::disabledImage(QImage()).isNull());
}

}  // namespace
