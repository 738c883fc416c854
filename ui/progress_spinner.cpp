// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/progress_spinner.h"

#include <algorithm>

#include <QtCore/QTimerEvent>
#include <QtGui/QPainter>
#include <QtWidgets/QStyle>
#include <QtWidgets/QStyleOptionFocusRect>

namespace kavell {

namespace {

constexpr int kSpokes = 12;
constexpr int kMillisecondsPerSpoke = 80;
constexpr qreal kFaintest = 0.15;

}  // namespace

ProgressSpinner::ProgressSpinner(QWidget *parent) : QWidget(parent)
{
}

void ProgressSpinner::startAnimation()
{
    m_isAnimating = true;
    turnWhileVisible();
}

void ProgressSpinner::stopAnimation()
{
    m_isAnimating = false;
    turnWhileVisible();
}

void ProgressSpinner::turnWhileVisible()
{
    const bool styleAnimates = style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, this) > 0;
    if (!m_isAnimating || !isVisible() || !styleAnimates)
        m_timer.stop();
    else if (!m_timer.isActive())
        m_timer.start(kMillisecondsPerSpoke, this);
}

void ProgressSpinner::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    turnWhileVisible();
}

void ProgressSpinner::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    turnWhileVisible();
}

void ProgressSpinner::timerEvent(QTimerEvent *event)
{
    if (event->timerId() != m_timer.timerId()) {
        QWidget::timerEvent(event);
        return;
    }
    m_step = (m_step + 1) % kSpokes;
    update();
}

void ProgressSpinner::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    if (hasFocus()) {
        QStyleOptionFocusRect focus;
        focus.initFrom(this);
        style()->drawPrimitive(QStyle::PE_FrameFocusRect, &focus, &painter, this);
    }
    painter.setRenderHint(QPainter::Antialiasing);
    const qreal radius = std::min(width(), height()) / 2.0 - 1;
    painter.translate(QRectF(rect()).center());
    QColor colour = palette().color(foregroundRole());
    for (int spoke = 0; spoke < kSpokes; ++spoke) {
        // The brightest spoke leads, clockwise.
        const int age = (m_step - spoke + kSpokes) % kSpokes;
        colour.setAlphaF(float(std::max(kFaintest, 1.0 - age / qreal(kSpokes))));
        painter.setPen(QPen(colour, radius * 0.2, Qt::SolidLine, Qt::RoundCap));
        painter.drawLine(QPointF(0, -radius * 0.5), QPointF(0, -radius * 0.9));
        painter.rotate(360.0 / kSpokes);
    }
}

}  // namespace kavell
