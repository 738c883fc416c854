// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAImageExtras.h>

#include <QtGui/QColor>
#include <QtGui/QPainter>

namespace {

constexpr float kVeilWhite = 0.95F;
constexpr float kVeilOpacity = 0.5F;

}  // namespace

QImage KAExtras::disabledImage(const QImage &image)
{
    if (image.isNull())
        return {};
    QImage disabled(image.size(), QImage::Format_ARGB32_Premultiplied);
    disabled.setDevicePixelRatio(image.devicePixelRatio());
    disabled.fill(QColor::fromRgbF(kVeilWhite, kVeilWhite, kVeilWhite, kVeilOpacity));
    QPainter painter(&disabled);
    // The veil stays where the image is opaque, and the image shows through it.
    painter.setCompositionMode(QPainter::CompositionMode_DestinationAtop);
    painter.drawImage(QPointF(0, 0), image);
    painter.end();
    return disabled;
}
