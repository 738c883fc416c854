// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A sheet: a window-modal window whose whole content is one view, which a sheet morpher swaps. User-interface thread
// only.

#ifndef KAVELLACCOUNTS_KASHEETWINDOW_H
#define KAVELLACCOUNTS_KASHEETWINDOW_H

#include <QtCore/QPointer>
#include <QtWidgets/QDialog>

#include <kavellaccounts/KAExport.h>

class KAVELL_ACCOUNTS_EXPORT KASheetWindow : public QDialog {
    Q_OBJECT

public:
    explicit KASheetWindow(QWidget *parent = nullptr);
    ~KASheetWindow() override;

    /// The view that fills the sheet; null when there is none. A view that is taken out again is hidden and goes back
    /// to its owner, not deleted.
    [[nodiscard]] QWidget *contentView() const;
    void setContentView(QWidget *view);

    /// Shows the sheet over a window (null: on its own), modal to it. Returns at once; `finished` tells the end. The
    /// window does not own the sheet; when it is destroyed first, the sheet ends with 0.
    void beginSheet(QWidget *window);

    /// Ends the sheet with a return code (0: cancelled) and takes it off the screen.
    void endSheet(int returnCode);
    void orderOut();

protected:
    void resizeEvent(QResizeEvent *event) override;

private:
    QPointer<QWidget> m_contentView;
    QMetaObject::Connection m_windowGone;
};

#endif
