// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A view that shows a picture turning into another, and the animation that drives it while its window is resized. Used
// by the sheet morpher. User-interface thread only.

#ifndef KAVELL_UI_CROSS_FADE_VIEW_H
#define KAVELL_UI_CROSS_FADE_VIEW_H

#include <functional>

#include <QtGui/QPixmap>
#include <QtWidgets/QWidget>

class QVariantAnimation;

namespace kavell {

class CrossFadeView : public QWidget {
public:
    explicit CrossFadeView(const QRect &frame);
    ~CrossFadeView() override;

    /// Both lie at the view's top left corner; null pictures give back their memory.
    void setPictures(const QPixmap &source, const QPixmap &destination);

    /// 0: only the source shows; 1: only the destination.
    void setProgress(qreal progress);
    [[nodiscard]] qreal progress() const { return m_progress; }

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QPixmap m_source;
    QPixmap m_destination;
    qreal m_progress = 0;
};

/// Runs an animation to its end, with the event loop, and never longer than a second more than it takes.
void runToEnd(QVariantAnimation &animation);

/// What runs the sheet's animations: runToEnd, unless a test puts a step-by-step one in its place.
[[nodiscard]] std::function<void(QVariantAnimation &)> &sheetAnimationRunner();

}  // namespace kavell

#endif
