// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/app_table_place.h"

#include <QtCore/QEvent>
#include <QtGui/QPainter>

namespace kavell {

namespace {

constexpr float kHighlightOpacity = 0.25F;
constexpr float kLineOpacity = 0.15F;

}  // namespace

AppTablePlace::AppTablePlace(QWidget *table, bool highlightsSelection)
    : QWidget(table), m_highlightsSelection(highlightsSelection)
{
}

AppTablePlace::~AppTablePlace()
{
    if (KAAppTableRow *const held = row()) {
        held->hide();
        held->setParent(nullptr);
    }
}

void AppTablePlace::hold(const std::shared_ptr<KAAppTableRow> &row)
{
    m_row = row.get();
    row->setParent(this);
    row->setGeometry(rect());
    row->show();
}

KAAppTableRow *AppTablePlace::row() const
{
    return m_row && m_row->parent() == this ? m_row.data() : nullptr;
}

void AppTablePlace::setSelected(bool selected)
{
    KAAppTableRow *const held = row();
    if (!held || held->isSelected() == selected)
        return;
    held->setSelected(selected);
    update();
}

bool AppTablePlace::event(QEvent *event)
{
    const KAAppTableRow *const held = row();
    if (event->type() == QEvent::LayoutRequest && held)
        emit rowHeightChanged(held->sizeHint().height());
    return QWidget::event(event);
}

void AppTablePlace::mousePressEvent(QMouseEvent *)
{
    emit clicked();
}

void AppTablePlace::mouseReleaseEvent(QMouseEvent *)
{
    // Taken with the press that it ends.
}

void AppTablePlace::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    const KAAppTableRow *const held = row();
    if (m_highlightsSelection && held && held->isSelected()) {
        QColor highlight = palette().color(QPalette::Highlight);
        highlight.setAlphaF(kHighlightOpacity);
        painter.fillRect(rect(), highlight);
    }
    QColor line = palette().color(foregroundRole());
    line.setAlphaF(kLineOpacity);
    painter.fillRect(QRect(0, height() - 1, width(), 1), line);
}

void AppTablePlace::resizeEvent(QResizeEvent *)
{
    if (KAAppTableRow *const held = row())
        held->setGeometry(rect());
}

}  // namespace kavell
