// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The place of one row in an application table: the widget that the row stands in without belonging to it, with the
// background of a selected row and the line below. Used by AppTableRows.

#ifndef KAVELL_UI_APP_TABLE_PLACE_H
#define KAVELL_UI_APP_TABLE_PLACE_H

#include <memory>

#include <QtCore/QPointer>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAAppTableRow.h>

namespace kavell {

class AppTablePlace : public QWidget {
    Q_OBJECT

public:
    AppTablePlace(QWidget *table, bool highlightsSelection);

    /// Lets the row go, hidden and without parent.
    ~AppTablePlace() override;

    /// Takes the row in, from wherever it is shown.
    void hold(const std::shared_ptr<KAAppTableRow> &row);

    /// Null when the row has gone, or stands elsewhere meanwhile.
    [[nodiscard]] KAAppTableRow *row() const;

    void setSelected(bool selected);

signals:
    void clicked();
    void rowHeightChanged(int wanted);  ///< perhaps: the row was given another font, or another place

protected:
    bool event(QEvent *event) override;
    void mousePressEvent(QMouseEvent *event) override;
    void mouseReleaseEvent(QMouseEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    QPointer<KAAppTableRow> m_row;
    const bool m_highlightsSelection;
};

}  // namespace kavell

#endif
