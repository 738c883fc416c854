// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/question.h"

#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>

namespace kavell::pane {

void ask(QWidget *window, const QString &question, const QString &details, const QString &actionText, QObject *context,
         std::function<void()> agreed, std::function<void()> refused)
{
    auto *const box =
        new QMessageBox(QMessageBox::Question, qtTrId("PANE_TITLE"), question, QMessageBox::NoButton, window);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->setTextFormat(Qt::PlainText);
    box->setInformativeText(details);
    QPushButton *const action = box->addButton(actionText, QMessageBox::DestructiveRole);
    action->setObjectName(QStringLiteral("agree"));
    action->setAutoDefault(false);
    QPushButton *const cancel = box->addButton(qtTrId("CANCEL"), QMessageBox::RejectRole);
    cancel->setObjectName(QStringLiteral("disagree"));
    box->setDefaultButton(cancel);
    box->setEscapeButton(cancel);
    QObject::connect(box, &QDialog::finished, context,
                     [box, action, agreed = std::move(agreed), refused = std::move(refused)] {
                         if (box->clickedButton() == action)
                             agreed();
                         else if (refused)
                             refused();
                     });
    box->open();
}

}  // namespace kavell::pane
