// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The name in a row of the application table: one line of plain text whose end may have another colour, cut with an
// ellipsis where it does not fit. Names come from plug-ins and files, so no markup in them is ever read.

#ifndef KAVELL_UI_APP_NAME_LABEL_H
#define KAVELL_UI_APP_NAME_LABEL_H

#include <QtGui/QColor>
#include <QtWidgets/QLabel>

namespace kavell {

class AppNameLabel : public QLabel {
    Q_OBJECT

public:
    explicit AppNameLabel(QWidget *parent = nullptr);

    /// Shows the text; from `index` on in `colour`, or all in the palette's for an index below 0.
    void setTwoToneText(const QString &text, qsizetype index, const QColor &colour);

    /// Where the second colour begins; -1 without one.
    [[nodiscard]] qsizetype secondToneIndex() const { return m_secondToneIndex; }
    [[nodiscard]] QColor secondTone() const { return m_secondTone; }

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    qsizetype m_secondToneIndex = -1;
    QColor m_secondTone;
};

}  // namespace kavell

#endif
