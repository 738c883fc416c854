// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A small wheel of spokes that turns while something of unknown length goes on. It costs nothing while it is hidden. Used
// by the rows of the application table.

#ifndef KAVELL_UI_PROGRESS_SPINNER_H
#define KAVELL_UI_PROGRESS_SPINNER_H

#include <QtCore/QBasicTimer>
#include <QtWidgets/QWidget>

namespace kavell {

class ProgressSpinner : public QWidget {
    Q_OBJECT

public:
    explicit ProgressSpinner(QWidget *parent = nullptr);

    /// Turns while it can be seen; a style that animates nothing shows it standing.
    void startAnimation();
    void stopAnimation();
    [[nodiscard]] bool isAnimating() const { return m_isAnimating; }

protected:
    void hideEvent(QHideEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void timerEvent(QTimerEvent *event) override;

private:
    void turnWhileVisible();

    QBasicTimer m_timer;
    int m_step = 0;
    bool m_isAnimating = false;
};

}  // namespace kavell

#endif
