// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/app_name_label.h"

#include <cmath>

#include <QtGui/QPainter>
#include <QtGui/QTextLayout>

namespace kavell {

AppNameLabel::AppNameLabel(QWidget *parent) : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
}

void AppNameLabel::setTwoToneText(const QString &text, qsizetype index, const QColor &colour)
{
    m_secondToneIndex = index < 0 ? -1 : index;
    m_secondTone = colour;
    setText(text);
    update();
}

void AppNameLabel::paintEvent(QPaintEvent *)
{
    const QString shown = fontMetrics().elidedText(text(), Qt::ElideRight, width());
    QTextLayout layout(shown, font(), this);
    QTextOption option(Qt::AlignLeading | Qt::AlignVCenter);
    option.setTextDirection(layoutDirection());
    option.setWrapMode(QTextOption::NoWrap);
    layout.setTextOption(option);
    if (m_secondToneIndex >= 0 && m_secondToneIndex < shown.size()) {
        QTextLayout::FormatRange end{int(m_secondToneIndex), int(shown.size() - m_secondToneIndex), {}};
        end.format.setForeground(m_secondTone);
        layout.setFormats({end});
    }
    layout.beginLayout();
    QTextLine line = layout.createLine();
    line.setLineWidth(width());
    layout.endLayout();

    QPainter painter(this);
    painter.setPen(palette().color(foregroundRole()));
    layout.draw(&painter, QPointF(0, std::floor((height() - line.height()) / 2)));
}

}  // namespace kavell
