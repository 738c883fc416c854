// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/cross_fade_view.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEventLoop>
#include <QtCore/QTimer>
#include <QtCore/QVariantAnimation>
#include <QtGui/QPainter>

namespace kavell {

namespace {

constexpr int kGraceMilliseconds = 1000;

}  // namespace

CrossFadeView::CrossFadeView(const QRect &frame)
{
    setGeometry(frame);
}

CrossFadeView::~CrossFadeView() = default;

void CrossFadeView::setPictures(const QPixmap &source, const QPixmap &destination)
{
    m_source = source;
    m_destination = destination;
    setProgress(0);
}

void CrossFadeView::setProgress(qreal progress)
{
    m_progress = progress;
    update();
}

void CrossFadeView::paintEvent(QPaintEvent *)
{
    // The pictures are opaque: the destination over the source mixes both, and what is alike in both stays as it is.
    QPainter painter(this);
    painter.drawPixmap(0, 0, m_source);
    painter.setOpacity(m_progress);
    painter.drawPixmap(0, 0, m_destination);
}

void runToEnd(QVariantAnimation &animation)
{
    if (!QCoreApplication::instance() || animation.duration() <= 0)
        return;
    QEventLoop loop;
    QObject::connect(&animation, &QAbstractAnimation::finished, &loop, &QEventLoop::quit);
    QTimer::singleShot(animation.duration() + kGraceMilliseconds, &loop, &QEventLoop::quit);
    animation.start();
    loop.exec();
}

std::function<void(QVariantAnimation &)> &sheetAnimationRunner()
{
    static std::function<void(QVariantAnimation &)> runner = runToEnd;
    return runner;
}

}  // namespace kavell
