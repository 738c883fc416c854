// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A sentence above the account that needs no answer: what went wrong and the way out, or what to look at. Screen readers
// announce it. User-interface thread only.

#ifndef KAVELL_PANE_NOTICE_BAR_H
#define KAVELL_PANE_NOTICE_BAR_H

#include <functional>

#include <QtWidgets/QFrame>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>

namespace kavell::pane {

class NoticeBar : public QFrame {
    Q_OBJECT

public:
    explicit NoticeBar(QWidget *parent = nullptr);

    /// Shows a sentence, in place of another one. With `actionText`, a button that does something about it.
    void showNotice(const QString &sentence, const QString &actionText = {}, std::function<void()> action = {});

    /// What is shown; null when nothing is.
    [[nodiscard]] QString notice() const;

private:
    QLabel *m_sentence;
    QPushButton *m_button;
    std::function<void()> m_action;
};

}  // namespace kavell::pane

#endif
