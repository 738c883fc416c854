// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Shows the rows of an application table below each other. It asks for rows when they come into view, and for all others
// in idle time, never for longer than part of a frame at once, so that a long table keeps nobody waiting. A row belongs
// to its application: a table that goes, or shows other applications, lets it go. Used by KAAppTableController, on the
// user-interface thread.

#ifndef KAVELL_UI_APP_TABLE_ROWS_H
#define KAVELL_UI_APP_TABLE_ROWS_H

#include <functional>
#include <memory>
#include <vector>

#include <QtCore/QElapsedTimer>
#include <QtCore/QPointer>
#include <QtCore/QTimer>
#include <QtWidgets/QScrollArea>
#include <QtWidgets/QWidget>

class KAAppTableRow;

namespace kavell {

class AppTablePlace;

class AppTableRows : public QObject {
    Q_OBJECT

public:
    using RowAt = std::function<std::shared_ptr<KAAppTableRow>(int row)>;

    /// Shows the rows that `rowAt` answers in `table`, which stands in `scrollView`. Either may be null or go first.
    AppTableRows(QScrollArea *scrollView, QWidget *table, RowAt rowAt);
    ~AppTableRows() override;

    /// Whether the selected row has a background of its own; true at first.
    void setHighlightsSelection(bool highlightsSelection);

    /// Shows that many rows, all of them asked for anew: those in view at once in a table that is shown, as far as part
    /// of a frame allows, and all others in the event loop's idle time. A row that stays where it is keeps the focus.
    void reload(int count);

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    struct Slot {
        QPointer<AppTablePlace> place;  // null where the row was not asked for yet
        bool isCurrent = false;         // whether the row was asked for since the last reload
    };

    void showRow(int row);
    [[nodiscard]] bool showRows(int first, int end, const QElapsedTimer &clock);
    [[nodiscard]] bool showRowsInView(const QElapsedTimer &clock);
    void adoptRowHeight(int height);
    [[nodiscard]] KAAppTableRow *rowInSlot(int row) const;
    void showRowsNow();
    void showRowsInIdleTime();
    void placeRows();
    void chainFocus(int row);
    void selectPlaceOf(QWidget *widget);

    /// Null too while it is being destroyed, when its last events come and it is a plain widget already.
    [[nodiscard]] QScrollArea *scrollView() const { return qobject_cast<QScrollArea *>(m_scrollView.data()); }

    const QPointer<QWidget> m_scrollView;  // a QScrollArea
    QPointer<QWidget> m_table;
    RowAt m_rowAt;
    std::vector<Slot> m_slots;  // one for each row
    QTimer m_idleTime;
    int m_rowHeight;
    bool m_highlightsSelection = true;
};

}  // namespace kavell

#endif
