// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/notice_bar.h"

#include <QtGui/QAccessible>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QStyle>
#include <QtWidgets/QToolButton>

namespace kavell::pane {

NoticeBar::NoticeBar(QWidget *parent) : QFrame(parent), m_sentence(new QLabel), m_button(new QPushButton)
{
    setFrameShape(StyledPanel);
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::ToolTipBase);
    setForegroundRole(QPalette::ToolTipText);
    m_sentence->setWordWrap(true);
    m_sentence->setTextFormat(Qt::PlainText);
    m_sentence->setForegroundRole(QPalette::ToolTipText);
    m_sentence->setTextInteractionFlags(Qt::TextSelectableByMouse);
    m_button->setObjectName(QStringLiteral("noticeAction"));
    auto *const close = new QToolButton;
    close->setIcon(style()->standardIcon(QStyle::SP_TitleBarCloseButton));
    close->setAutoRaise(true);
    close->setFocusPolicy(Qt::TabFocus);
    close->setObjectName(QStringLiteral("closeNotice"));
    close->setAccessibleName(qtTrId("CLOSE_NOTICE"));
    close->setToolTip(qtTrId("CLOSE_NOTICE"));
    auto *const layout = new QHBoxLayout(this);
    layout->addWidget(m_sentence, 1);
    layout->addWidget(m_button);
    layout->addWidget(close);
    connect(close, &QToolButton::clicked, this, &QWidget::hide);
    connect(m_button, &QPushButton::clicked, this, [this] {
        hide();
        if (m_action)
            m_action();
    });
    hide();
}

void NoticeBar::showNotice(const QString &sentence, const QString &actionText, std::function<void()> action)
{
    m_sentence->setText(sentence);
    m_button->setText(actionText);
    m_button->setHidden(actionText.isNull());
    m_action = std::move(action);
    setAccessibleName(sentence);
    show();
    QAccessibleEvent announcement(this, QAccessible::Alert);
    QAccessible::updateAccessibility(&announcement);
}

QString NoticeBar::notice() const
{
    return isHidden() ? QString() : m_sentence->text();
}

}  // namespace kavell::pane
