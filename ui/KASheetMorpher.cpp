// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KASheetMorpher.h>

#include <utility>

#include <QtCore/QEasingCurve>
#include <QtCore/QPointer>
#include <QtCore/QVariantAnimation>
#include <QtWidgets/QStyle>

#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KASheetWindow.h>

#include "ui/cross_fade_view.h"

namespace {

/// The sheet's frame around a content of that size: the top edge and the horizontal middle stay.
QRect targetFrame(const QRect &frame, const QSize &size)
{
    const qreal x = frame.x() + (frame.width() - size.width()) * 0.5;
    return {QPoint(qRound(x), frame.y()), size};
}

QRect between(const QRect &from, const QRect &to, qreal progress)
{
    const auto mix = [progress](int a, int b) {
        return qRound(a + (b - a) * progress);
    };
    return {mix(from.x(), to.x()), mix(from.y(), to.y()), mix(from.width(), to.width()),
            mix(from.height(), to.height())};
}

/// The view drawn at the top left of a picture of that size.
QPixmap pictureOf(QWidget *view, const QSize &size)
{
    QPixmap picture(size * view->devicePixelRatioF());
    picture.setDevicePixelRatio(view->devicePixelRatioF());
    picture.fill(view->palette().color(QPalette::Window));
    view->render(&picture);
    return picture;
}

}  // namespace

std::shared_ptr<KASheetMorpher> KASheetMorpher::initWithHostSheet(const std::shared_ptr<KASheetWindow> &hostSheet)
{
    return std::shared_ptr<KASheetMorpher>(new KASheetMorpher(hostSheet));
}

KASheetMorpher::KASheetMorpher(std::shared_ptr<KASheetWindow> hostSheet) : _hostSheet(std::move(hostSheet))
{
}

KASheetMorpher::~KASheetMorpher() = default;

std::shared_ptr<KASheetWindow> KASheetMorpher::hostSheet() const
{
    return std::atomic_load(&_hostSheet);
}

void KASheetMorpher::setHostSheet(std::shared_ptr<KASheetWindow> hostSheet)
{
    std::atomic_store(&_hostSheet, std::move(hostSheet));
}

void KASheetMorpher::setContentView(QWidget *view, bool animate)
{
    const std::shared_ptr<KASheetWindow> sheet = hostSheet();
    if (!sheet || !view || sheet->contentView() == view)
        return;
    m_swap = std::make_shared<int>();
    const QRect target = targetFrame(sheet->geometry(), view->size());
    if (animate) {
        swapAnimated(view, target);
        return;
    }
    sheet->setContentView(nullptr);
    sheet->setGeometry(target);
    sheet->setContentView(view);
}

void KASheetMorpher::prepareCrossFadeView(QWidget *view)
{
    const std::shared_ptr<KASheetWindow> sheet = hostSheet();
    const QWidget *current = sheet->contentView();
    const QRect frame = current ? current->geometry() : sheet->rect();
    const QSize pictureSize = view->width() > frame.width() ? view->size() : frame.size();
    const QPixmap source = sheet->grab(frame);
    const QPixmap destination = pictureOf(view, pictureSize);
    if (_crossFadeImageView)
        _crossFadeImageView->setGeometry(frame);
    else
        _crossFadeImageView = std::make_unique<kavell::CrossFadeView>(frame);
    _crossFadeImageView->setPictures(source, destination);
}

void KASheetMorpher::swapAnimated(QWidget *view, const QRect &target)
{
    const std::shared_ptr<KASheetWindow> sheet = hostSheet();
    const QPointer<QWidget> kept(view);
    const std::weak_ptr<int> swap = m_swap;
    prepareCrossFadeView(view);
    sheet->setContentView(_crossFadeImageView.get());

    QVariantAnimation animation;
    animation.setStartValue(0.0);
    animation.setEndValue(1.0);
    animation.setEasingCurve(QEasingCurve::InOutQuad);
    animation.setDuration(sheet->style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, sheet.get()));
    const QPointer<kavell::CrossFadeView> fade(_crossFadeImageView.get());
    QObject::connect(&animation, &QVariantAnimation::valueChanged, sheet.get(),
                     [&, from = sheet->geometry()](const QVariant &value) {
                         if (swap.expired() || !fade)
                             return;
                         fade->setProgress(value.toReal());
                         sheet->setGeometry(between(from, target, value.toReal()));
                     });
    kavell::sheetAnimationRunner()(animation);

    // An event meanwhile may have swapped again, or deleted the morpher or the view.
    if (swap.expired())
        return;
    _crossFadeImageView->setPictures({}, {});
    sheet->setContentView(nullptr);
    sheet->setGeometry(target);
    sheet->setContentView(kept);
    sheet->update();
}

void KASheetMorpher::describeFields(KAFieldList &fields) const
{
    fields.add("_hostSheet", _hostSheet);
    fields.add("_crossFadeImageView", static_cast<QWidget *>(_crossFadeImageView.get()));
    KAObject::describeFields(fields);
}
