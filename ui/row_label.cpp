// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/row_label.h"

#include <cmath>

#include <QtGui/QHelpEvent>
#include <QtGui/QPainter>
#include <QtGui/QTextLayout>
#include <QtWidgets/QStyle>
#include <QtWidgets/QToolTip>

namespace kavell {

RowLabel::RowLabel(QWidget *parent) : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
}

void RowLabel::setOneToneText(const QString &text)
{
    setTwoToneText(text, -1, {});
}

void RowLabel::setTwoToneText(const QString &text, qsizetype index, const QColor &colour)
{
    m_secondToneIndex = index;
    m_secondTone = colour;
    setText(text);
    update();
}

QString RowLabel::shownText() const
{
    QString line = text();
    line.replace(u'\n', u' ');
    return fontMetrics().elidedText(line, Qt::ElideRight, width());
}

bool RowLabel::event(QEvent *event)
{
    if (event->type() != QEvent::ToolTip || shownText() == text())
        return QLabel::event(event);
    // A tool tip guesses whether its text is markup; escaped, it shows what the label says.
    QToolTip::showText(static_cast<QHelpEvent *>(event)->globalPos(),
                       QStringLiteral("<p>%1</p>").arg(text().toHtmlEscaped()), this);
    return true;
}

void RowLabel::paintEvent(QPaintEvent *)
{
    const QString shown = shownText();
    QTextLayout layout(shown, font(), this);
    QTextOption option(QStyle::visualAlignment(layoutDirection(), Qt::AlignLeft));
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
    if (line.isValid())
        line.setLineWidth(width());
    layout.endLayout();

    QPainter painter(this);
    painter.setPen(palette().color(foregroundRole()));
    layout.draw(&painter, QPointF(0, std::floor((height() - layout.boundingRect().height()) / 2)));
}

}  // namespace kavell
