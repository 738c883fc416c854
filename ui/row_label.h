// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A text in a row of the application table: one line whose end may have another colour, at the side where its window's
// language begins, cut with an ellipsis where it does not fit. Names come from plug-ins and files, so no markup in them
// is ever read.

#ifndef KAVELL_UI_ROW_LABEL_H
#define KAVELL_UI_ROW_LABEL_H

#include <QtGui/QColor>
#include <QtWidgets/QLabel>

namespace kavell {

class RowLabel : public QLabel {
    Q_OBJECT

public:
    explicit RowLabel(QWidget *parent = nullptr);

    /// Shows the text in one colour.
    void setOneToneText(const QString &text);

    /// Shows the text, from `index` on in `colour`.
    void setTwoToneText(const QString &text, qsizetype index, const QColor &colour);

    /// Where the second colour begins; -1 without one.
    [[nodiscard]] qsizetype secondToneIndex() const { return m_secondToneIndex; }
    [[nodiscard]] QColor secondTone() const { return m_secondTone; }

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    [[nodiscard]] QString shownText() const;

    qsizetype m_secondToneIndex = -1;
    QColor m_secondTone;
};

}  // namespace kavell

#endif
