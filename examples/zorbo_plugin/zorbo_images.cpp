// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "zorbo_images.h"

#include <QtCore/QtMath>
#include <QtGui/QFontMetricsF>
#include <QtGui/QGuiApplication>
#include <QtGui/QPainter>
#include <QtGui/QPainterPath>
#include <QtGui/QPalette>

namespace {

constexpr int kSide = 32;
constexpr int kGap = 8;
constexpr qreal kCornerRadius = 7;
constexpr qreal kStroke = 3.6;
constexpr qreal kNameHeight = 22;
constexpr QRgb kTeal = 0xff0b7d77;

QImage emptyImage(const QSize &points)
{
    const qreal scale = qGuiApp->devicePixelRatio();
    QImage image(points * scale, QImage::Format_ARGB32_Premultiplied);
    image.setDevicePixelRatio(scale);
    image.fill(Qt::transparent);
    return image;
}

void drawSign(QPainter &painter, const QPointF &corner)
{
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(kTeal));
    painter.drawRoundedRect(QRectF(corner, QSizeF(kSide, kSide)), kCornerRadius, kCornerRadius);
    QPainterPath letter(corner + QPointF(9.5, 9.5));
    letter.lineTo(corner + QPointF(22.5, 9.5));
    letter.lineTo(corner + QPointF(9.5, 22.5));
    letter.lineTo(corner + QPointF(22.5, 22.5));
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(Qt::white, kStroke, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.drawPath(letter);
}

}  // namespace

QImage zorboSign()
{
    QImage image = emptyImage({kSide, kSide});
    QPainter painter(&image);
    drawSign(painter, {0, 0});
    return image;
}

QImage zorboBanner(const QString &brandName)
{
    QFont font = QGuiApplication::font();
    font.setPixelSize(qRound(kNameHeight));
    font.setBold(true);
    const qreal nameWidth = QFontMetricsF(font).horizontalAdvance(brandName);
    const int width = kSide + kGap + qCeil(nameWidth);
    const bool isMirrored = QGuiApplication::layoutDirection() == Qt::RightToLeft;

    QImage image = emptyImage({width, kSide});
    QPainter painter(&image);
    drawSign(painter, {qreal(isMirrored ? width - kSide : 0), 0});
    painter.setFont(font);
    painter.setPen(QGuiApplication::palette().color(QPalette::WindowText));
    const QRectF place(isMirrored ? 0 : kSide + kGap, 0, width - kSide - kGap, kSide);
    painter.drawText(place, Qt::AlignCenter | Qt::TextSingleLine, brandName);
    return image;
}
