// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAVerticallyCenteredCell.h>

#include <cmath>

#include <QtGui/QFontMetricsF>
#include <QtWidgets/QApplication>
#include <QtWidgets/QStyle>

KAVerticallyCenteredCell::KAVerticallyCenteredCell(QObject *parent)
    : QStyledItemDelegate(parent), m_font(QApplication::font())
{
}

KAVerticallyCenteredCell::~KAVerticallyCenteredCell() = default;

QRectF KAVerticallyCenteredCell::adjustFrameToVerticallyCenterText(const QRectF &frame) const
{
    return adjusted(frame, m_font);
}

QRectF KAVerticallyCenteredCell::adjusted(const QRectF &frame, const QFont &font) const
{
    if (!_verticallyCentered)
        return frame;
    const QFontMetricsF metrics(font);
    const qreal lineHeight = metrics.ascent() + metrics.descent();
    const qreal inset = std::floor(frame.height() * 0.5 - lineHeight * 0.5);
    return frame.adjusted(0, inset, 0, -inset);
}

void KAVerticallyCenteredCell::drawInteriorWithFrame(QPainter *painter, const QRect &frame,
                                                     const QStyleOptionViewItem &option, const QModelIndex &index) const
{
    QStyleOptionViewItem interior = option;
    initStyleOption(&interior, index);
    interior.rect = adjusted(frame, interior.font).toRect();
    const QStyle *style = option.widget ? option.widget->style() : QApplication::style();
    style->drawControl(QStyle::CE_ItemViewItem, &interior, painter, option.widget);
}

void KAVerticallyCenteredCell::paint(QPainter *painter, const QStyleOptionViewItem &option,
                                     const QModelIndex &index) const
{
    if (_verticallyCentered) {
        // The selection fills the whole row, not only the line of text.
        QStyleOptionViewItem panel = option;
        initStyleOption(&panel, index);
        const QStyle *style = option.widget ? option.widget->style() : QApplication::style();
        style->drawPrimitive(QStyle::PE_PanelItemViewItem, &panel, painter, option.widget);
    }
    drawInteriorWithFrame(painter, option.rect, option, index);
}
