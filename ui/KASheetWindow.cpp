// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KASheetWindow.h>

#include <QtGui/QResizeEvent>
#include <QtGui/QWindow>

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
    QObject::disconnect(m_windowGone);
    setWindowModality(Qt::WindowModal);
    (void)winId();  // makes the handle
    if (window) {
        QWidget *const topLevel = window->window();
        (void)topLevel->winId();
        // Not its child: whoever made the sheet owns it, and the window would delete it.
        windowHandle()->setTransientParent(topLevel->windowHandle());
        m_windowGone = connect(topLevel, &QObject::destroyed, this, [this] {
            if (isVisible())
                endSheet(Rejected);
        });
        QRect centred = geometry();
        centred.moveCenter(topLevel->geometry().center());
        setGeometry(centred);
    } else {
        windowHandle()->setTransientParent(nullptr);
    }
    show();
}

void KASheetWindow::endSheet(int returnCode)
{
    QObject::disconnect(m_windowGone);
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
