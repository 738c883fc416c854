// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KASheetWindow.h>

#include <QtGui/QResizeEvent>

KASheetWindow::KASheetWindow(QWidget *parent) : QDialog(parent)
{
}

KASheetWindow::~KASheetWindow()
{
    setContentView(nullptr);
}

QWidget *KASheetWindow::contentView() const
{
    return m_contentView;
}

void KASheetWindow::setContentView(QWidget *view)
{
    if (m_contentView == view)
        return;
    if (m_contentView) {
        m_contentView->hide();
        m_contentView->setParent(nullptr);
    }
    m_contentView = view;
    if (!view)
        return;
    view->setParent(this);
    view->setGeometry(rect());
    view->show();
}

void KASheetWindow::beginSheet(QWidget *window)
{
    setParent(window, windowFlags() | Qt::Dialog);
    setWindowModality(Qt::WindowModal);
    show();
}

void KASheetWindow::endSheet(int returnCode)
{
    done(returnCode);
}

void KASheetWindow::orderOut()
{
    hide();
}

void KASheetWindow::resizeEvent(QResizeEvent *event)
{
    QDialog::resizeEvent(event);
    if (m_contentView)
        m_contentView->setGeometry(rect());
}
