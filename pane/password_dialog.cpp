// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/password_dialog.h"

#include <QtWidgets/QCheckBox>
#include <QtWidgets/QFormLayout>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QPushButton>

namespace kavell::pane {

namespace {

constexpr int kPasswordLength = 28;  // that can be seen at once

}  // namespace

PasswordDialog::PasswordDialog(const QString &loginName, QWidget *parent) : QDialog(parent), m_password(new QLineEdit)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(qtTrId("SET_PASSWORD_TITLE").arg(loginName));
    m_password->setObjectName(QStringLiteral("newPassword"));
    m_password->setEchoMode(QLineEdit::Password);
    m_password->setMinimumWidth(m_password->fontMetrics().averageCharWidth() * kPasswordLength);
    auto *const visible = new QCheckBox(qtTrId("SHOW_TYPED_PASSWORD"));
    auto *const save = new QPushButton(qtTrId("SAVE_PASSWORD"));
    save->setObjectName(QStringLiteral("savePassword"));
    save->setDefault(true);
    save->setEnabled(false);
    auto *const cancel = new QPushButton(qtTrId("CANCEL"));
    cancel->setAutoDefault(false);
    auto *const buttons = new QHBoxLayout;
    buttons->addStretch();
    buttons->addWidget(cancel);
    buttons->addWidget(save);
    auto *const layout = new QFormLayout(this);
    layout->addRow(qtTrId("PASSWORD_LABEL"), m_password);
    layout->addRow(QString(), visible);
    layout->addRow(buttons);
    connect(visible, &QCheckBox::toggled, this,
            [this](bool isVisible) { m_password->setEchoMode(isVisible ? QLineEdit::Normal : QLineEdit::Password); });
    connect(m_password, &QLineEdit::textChanged, save,
            [save](const QString &text) { save->setEnabled(!text.isEmpty()); });
    connect(save, &QPushButton::clicked, this, &QDialog::accept);
    connect(cancel, &QPushButton::clicked, this, &QDialog::reject);
}

}  // namespace kavell::pane
