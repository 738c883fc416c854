// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/app_table_rows.h"

#include <algorithm>

#include <QtCore/QElapsedTimer>
#include <QtCore/QEvent>
#include <QtWidgets/QApplication>
#include <QtWidgets/QScrollBar>

#include <kavellaccounts/KAAppTableRow.h>

#include "ui/app_table_place.h"

namespace kavell {

namespace {

constexpr int kHeightBeforeTheFirstRow = 48;

// Rows of a table that is used meanwhile are made a few at a time: a quarter of a frame at 60 frames a second.
constexpr int kIdleMilliseconds = 4;

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
    connect(scrollView->verticalScrollBar(), &QScrollBar::valueChanged, this, &AppTableRows::showRowsInView);
    connect(&m_idleTime, &QTimer::timeout, this, &AppTableRows::showRowsInIdleTime);
    connect(qApp, &QApplication::focusChanged, this, [this](QWidget *, QWidget *now) { selectPlaceOf(now); });
}

AppTableRows::~AppTableRows()
{
    for (AppTablePlace *place : m_places)
        delete place;
}

void AppTableRows::setHighlightsSelection(bool highlightsSelection)
{
    m_highlightsSelection = highlightsSelection;
}

void AppTableRows::reload(int count)
{
    if (!m_table)
        return;
    for (AppTablePlace *place : m_places)
        delete place;
    m_places.assign(size_t(count), nullptr);
    m_table->setMinimumHeight(count * m_rowHeight);
    m_idleTime.start(0);
    if (m_table->isVisible())
        showRowsInView();
}

void AppTableRows::showRow(int row)
{
    if (m_places[size_t(row)])
        return;
    const std::shared_ptr<KAAppTableRow> view = m_rowAt(row);
    auto *const place = new AppTablePlace(m_table, m_highlightsSelection);
    m_places[size_t(row)] = place;
    connect(place, &AppTablePlace::clicked, this, [this, place] { selectPlaceOf(place); });
    if (view) {
        if (const int height = view->sizeHint().height(); height != m_rowHeight) {
            m_rowHeight = height;
            m_table->setMinimumHeight(int(m_places.size()) * height);
            placeRows();
        }
    }
    place->setGeometry(0, row * m_rowHeight, m_table->width(), m_rowHeight);
    if (view)
        place->hold(view);
    place->show();
    chainFocus(row);
}

void AppTableRows::showRowsInView()
{
    if (!m_table || m_places.empty())
        return;
    const int top = m_scrollView->verticalScrollBar()->value();
    const int last = (top + m_scrollView->viewport()->height()) / m_rowHeight;
    for (int row = top / m_rowHeight; row <= std::min(last, int(m_places.size()) - 1); ++row)
        showRow(row);
}

void AppTableRows::showRowsInIdleTime()
{
    showRowsInView();
    QElapsedTimer clock;
    clock.start();
    for (size_t row = 0; m_table && row < m_places.size(); ++row) {
        if (clock.elapsed() >= kIdleMilliseconds)
            return;
        showRow(int(row));
    }
    m_idleTime.stop();
}

void AppTableRows::placeRows()
{
    for (size_t row = 0; row < m_places.size(); ++row) {
        if (m_places[row])
            m_places[row]->setGeometry(0, int(row) * m_rowHeight, m_table->width(), m_rowHeight);
    }
}

void AppTableRows::chainFocus(int row)
{
    // Rows are made in any order; Tab walks them from top to bottom.
    QWidget *last = nullptr;
    const auto append = [&last](const KAAppTableRow &next) {
        for (QWidget *control : focusControls(next)) {
            if (last)
                QWidget::setTabOrder(last, control);
            last = control;
        }
    };
    const auto rowOf = [this](int index) -> KAAppTableRow * {
        const bool exists = index >= 0 && index < int(m_places.size()) && m_places[size_t(index)];
        return exists ? m_places[size_t(index)]->row() : nullptr;
    };
    for (int before = row - 1; before >= 0 && !last; --before) {
        if (const KAAppTableRow *const view = rowOf(before))
            last = focusControls(*view).last();
    }
    if (const KAAppTableRow *const view = rowOf(row))
        append(*view);
    for (int after = row + 1; after < int(m_places.size()); ++after) {
        if (const KAAppTableRow *const view = rowOf(after))
            return append(*view);
    }
}

void AppTableRows::selectPlaceOf(QWidget *widget)
{
    if (!m_table || !widget || !m_table->isAncestorOf(widget))
        return;
    for (AppTablePlace *place : m_places) {
        if (!place)
            continue;
        const bool isSelected = place == widget || place->isAncestorOf(widget);
        place->setSelected(isSelected);
        if (isSelected)
            m_scrollView->ensureWidgetVisible(place, 0, 0);
    }
}

bool AppTableRows::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::Show || event->type() == QEvent::Resize) {
        if (watched == m_table)
            placeRows();
        showRowsInView();
    }
    return QObject::eventFilter(watched, event);
}

}  // namespace kavell
