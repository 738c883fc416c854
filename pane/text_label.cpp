// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/text_label.h"

#include <algorithm>

#include <QtGui/QGuiApplication>
#include <QtGui/QHelpEvent>
#include <QtGui/QPainter>
#include <QtGui/QTextDocument>
#include <QtWidgets/QStyle>
#include <QtWidgets/QToolTip>

namespace kavell::pane {

namespace {

constexpr int kFewestCharacters = 12;  // that can still be told apart

}  // namespace

TextLabel::TextLabel(const QString &text, QWidget *parent) : QLabel(text, parent)
{
    setTextFormat(Qt::PlainText);
    setWordWrap(true);
    // Selectable text is aligned by its own direction otherwise, which an address has from left to right.
    setAlignment(QStyle::visualAlignment(QGuiApplication::layoutDirection(), Qt::AlignLeft | Qt::AlignVCenter) |
                 Qt::AlignAbsolute);
    setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
}

QSize TextLabel::minimumSizeHint() const
{
    const QSize whole = QLabel::minimumSizeHint();
    return {std::min(whole.width(), fontMetrics().averageCharWidth() * kFewestCharacters), whole.height()};
}

bool TextLabel::isElided() const
{
    return QLabel::minimumSizeHint().width() > width();
}

bool TextLabel::event(QEvent *event)
{
    if (event->type() != QEvent::ToolTip || !isElided())
        return QLabel::event(event);
    QToolTip::showText(static_cast<QHelpEvent *>(event)->globalPos(), Qt::convertFromPlainText(text()), this);
    return true;
}

void TextLabel::paintEvent(QPaintEvent *event)
{
    if (!isElided() || hasSelectedText()) {
        QLabel::paintEvent(event);
        return;
    }
    QPainter painter(this);
    // In the middle: an address is told by its beginning and by its domain.
    style()->drawItemText(&painter, contentsRect(), static_cast<int>(alignment()), palette(), isEnabled(),
                          fontMetrics().elidedText(text(), Qt::ElideMiddle, contentsRect().width()), foregroundRole());
}

}  // namespace kavell::pane
