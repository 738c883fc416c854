// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The strip at the foot of the pane that says what takes long, and lets the user stop waiting. User-interface thread
// only.

#ifndef KAVELL_PANE_PROGRESS_STRIP_H
#define KAVELL_PANE_PROGRESS_STRIP_H

#include <QtCore/QTimer>
#include <QtWidgets/QFrame>
#include <QtWidgets/QLabel>

namespace kavell::pane {

class Undertakings;

class ProgressStrip : public QFrame {
    Q_OBJECT

public:
    explicit ProgressStrip(Undertakings &undertakings, QWidget *parent = nullptr);

private:
    void update();

    Undertakings &m_undertakings;
    QLabel *m_sentence;
    QTimer m_patience;  // runs until waiting is worth a word
    QTimer m_longWait;  // runs until it is worth an explanation
};

}  // namespace kavell::pane

#endif
