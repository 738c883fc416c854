// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A text cell for item views that can centre its line of text vertically. User-interface thread only.

#ifndef KAVELLACCOUNTS_KAVERTICALLYCENTEREDCELL_H
#define KAVELLACCOUNTS_KAVERTICALLYCENTEREDCELL_H

#include <QtCore/QRectF>
#include <QtGui/QFont>
#include <QtWidgets/QStyledItemDelegate>

#include <kavellaccounts/KAExport.h>

class KAVELL_ACCOUNTS_EXPORT KAVerticallyCenteredCell : public QStyledItemDelegate {
    Q_OBJECT
    Q_PROPERTY(bool verticallyCentered READ verticallyCentered WRITE setVerticallyCentered)

public:
    explicit KAVerticallyCenteredCell(QObject *parent = nullptr);
    ~KAVerticallyCenteredCell() override;

    /// False at creation: the cell then draws exactly as its base.
    [[nodiscard]] bool verticallyCentered() const { return _verticallyCentered; }
    void setVerticallyCentered(bool verticallyCentered) { _verticallyCentered = verticallyCentered; }

    /// The font that frames are adjusted for; the application's at creation. In a view, the row's font counts.
    [[nodiscard]] const QFont &font() const { return m_font; }
    void setFont(const QFont &font) { m_font = font; }

    /// The rectangle that a line of the font takes in the middle of `frame`; deliberately higher than `frame` where
    /// the line is. `frame` itself when the cell does not centre.
    [[nodiscard]] QRectF adjustFrameToVerticallyCenterText(const QRectF &frame) const;

    /// Draws as the base does, into the adjusted frame.
    void drawInteriorWithFrame(QPainter *painter, const QRect &frame, const QStyleOptionViewItem &option,
                               const QModelIndex &index) const;

    void paint(QPainter *painter, const QStyleOptionViewItem &option, const QModelIndex &index) const override;

private:
    [[nodiscard]] QRectF adjusted(const QRectF &frame, const QFont &font) const;

    bool _verticallyCentered = false;
    QFont m_font;
};

#endif
