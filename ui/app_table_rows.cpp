// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/app_table_rows.h"

#include <algorithm>

#include <QtCore/QEvent>
#include <QtWidgets/QApplication>
#include <QtWidgets/QScrollBar>

#include <kavellaccounts/KAAppTableRow.h>

#include "ui/app_table_place.h"

namespace kavell {

namespace {

constexpr int kHeightBeforeTheFirstRow = 48;

// Rows are made a few at a time: a quarter of a frame at 60 frames a second, which leaves the rest to the row that
// takes longest (an icon is read) and to painting.
constexpr int kMillisecondsAtATime = 4;

QList<QWidget *> focusControls(const KAAppTableRow &row)
{
    QList<QWidget *> controls = row.findChildren<QWidget *>(Qt::FindDirectChildrenOnly);
    controls.removeIf([](const QWidget *control) { return !(control->focusPolicy() & Qt::TabFocus); });
    return controls;
}

}  // namespace

AppTableRows::AppTableRows(QScrollArea *scrollView, QWidget *table, RowAt rowAt)
    : m_scrollView(scrollView), m_table(table), m_rowAt(std::move(rowAt)), m_rowHeight(kHeightBeforeTheFirstRow)
{
    if (!scrollView || !table)
        return;
    table->setBackgroundRole(QPalette::Base);
    scrollView->viewport()->setBackgroundRole(QPalette::Base);
    table->installEventFilter(this);
    scrollView->viewport()->installEventFilter(this);
    connect(scrollView->verticalScrollBar(), &QScrollBar::valueChanged, this, &AppTableRows::showRowsNow);
    connect(&m_idleTime, &QTimer::timeout, this, &AppTableRows::showRowsInIdleTime);
    connect(qApp, &QApplication::focusChanged, this, [this](QWidget *, QWidget *now) { selectPlaceOf(now); });
}

AppTableRows::~AppTableRows()
{
    for (const Slot &slot : m_slots)
        delete slot.place;
}

void AppTableRows::setHighlightsSelection(bool highlightsSelection)
{
    m_highlightsSelection = highlightsSelection;
}

void AppTableRows::reload(int count)
{
    if (!m_table)
        return;
    for (size_t row = size_t(count); row < m_slots.size(); ++row)
        delete m_slots[row].place;
    m_slots.resize(size_t(count));
    for (Slot &slot : m_slots)
        slot.isCurrent = false;
    m_table->setMinimumHeight(count * m_rowHeight);
    m_idleTime.start(0);
    if (m_table->isVisible())
        showRowsNow();
}

void AppTableRows::showRow(int row)
{
    Slot &slot = m_slots[size_t(row)];
    if (slot.isCurrent)
        return;
    slot.isCurrent = true;
    const std::shared_ptr<KAAppTableRow> view = m_rowAt(row);
    if (slot.place && slot.place->row() == view.get())
        return;
    delete slot.place;
    auto *const place = new AppTablePlace(m_table, m_highlightsSelection);
    slot.place = place;
    connect(place, &AppTablePlace::clicked, this, [this, place] { selectPlaceOf(place); });
    connect(place, &AppTablePlace::rowHeightChanged, this, &AppTableRows::adoptRowHeight);
    if (view) {
        place->hold(view);  // with the table's font, which its height depends on
        adoptRowHeight(view->sizeHint().height());
    }
    place->setGeometry(0, row * m_rowHeight, m_table->width(), m_rowHeight);
    place->show();
    chainFocus(row);
}

bool AppTableRows::showRows(int first, int end, const QElapsedTimer &clock)
{
    for (int row = first; row < end; ++row) {
        if (clock.elapsed() >= kMillisecondsAtATime)
            return false;
        showRow(row);
    }
    return true;
}

bool AppTableRows::showRowsInView(const QElapsedTimer &clock)
{
    const QScrollArea *const view = scrollView();
    if (!m_table || !view)
        return true;
    const int top = view->verticalScrollBar()->value();
    const int end = (top + view->viewport()->height()) / m_rowHeight + 1;
    return showRows(top / m_rowHeight, std::min(end, int(m_slots.size())), clock);
}

void AppTableRows::showRowsNow()
{
    QElapsedTimer clock;
    clock.start();
    (void)showRowsInView(clock);  // what is missing, idle time brings
}

void AppTableRows::showRowsInIdleTime()
{
    QElapsedTimer clock;
    clock.start();
    if (showRowsInView(clock) && (!m_table || showRows(0, int(m_slots.size()), clock)))
        m_idleTime.stop();
}

void AppTableRows::adoptRowHeight(int height)
{
    if (height == m_rowHeight)
        return;
    m_rowHeight = height;
    m_table->setMinimumHeight(int(m_slots.size()) * height);
    placeRows();
}

void AppTableRows::placeRows()
{
    for (size_t row = 0; row < m_slots.size(); ++row) {
        if (m_slots[row].place)
            m_slots[row].place->setGeometry(0, int(row) * m_rowHeight, m_table->width(), m_rowHeight);
    }
}

KAAppTableRow *AppTableRows::rowInSlot(int row) const
{
    const AppTablePlace *const place = m_slots[size_t(row)].place;
    return place ? place->row() : nullptr;
}

void AppTableRows::chainFocus(int row)
{
    // Rows are made in any order; Tab walks them from top to bottom.
    QList<QWidget *> chain;
    for (int before = row - 1; before >= 0 && chain.isEmpty(); --before) {
        if (const KAAppTableRow *const view = rowInSlot(before))
            chain += focusControls(*view).last();
    }
    if (const KAAppTableRow *const view = rowInSlot(row))
        chain += focusControls(*view);
    for (int after = row + 1; after < int(m_slots.size()); ++after) {
        if (const KAAppTableRow *const view = rowInSlot(after)) {
            chain += focusControls(*view).first();
            break;
        }
    }
    for (qsizetype place = 1; place < chain.size(); ++place)
        QWidget::setTabOrder(chain.at(place - 1), chain.at(place));
}

void AppTableRows::selectPlaceOf(QWidget *widget)
{
    QScrollArea *const view = scrollView();
    if (!m_table || !view || !widget || !m_table->isAncestorOf(widget))
        return;
    for (const Slot &slot : m_slots) {
        if (!slot.place)
            continue;
        const bool isSelected = slot.place == widget || slot.place->isAncestorOf(widget);
        slot.place->setSelected(isSelected);
        if (isSelected)
            view->ensureWidgetVisible(slot.place, 0, 0);
    }
}

bool AppTableRows::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::Show || event->type() == QEvent::Resize) {
        if (watched == m_table)
            placeRows();
        showRowsNow();
    }
    return QObject::eventFilter(watched, event);
}

}  // namespace kavell
