// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A text about an account that can be selected and copied. It wraps between words; a word that is wider than the label,
// as login names can be, is elided instead of widening the page, and the tool tip shows it whole. User-interface thread
// only.

#ifndef KAVELL_PANE_TEXT_LABEL_H
#define KAVELL_PANE_TEXT_LABEL_H

#include <QtWidgets/QLabel>

namespace kavell::pane {

class TextLabel : public QLabel {
    Q_OBJECT

public:
    explicit TextLabel(const QString &text = {}, QWidget *parent = nullptr);

    [[nodiscard]] QSize minimumSizeHint() const override;

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    /// Whether a word does not fit.
    [[nodiscard]] bool isElided() const;
};

}  // namespace kavell::pane

#endif
