// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/provider_chooser.h"

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/KAAListPlugin.h>

#include "pane/provider_looks.h"

namespace kavell::pane {

namespace {

constexpr int kIconSide = 32;
constexpr QSize kSize{420, 360};

}  // namespace

ProviderChooser::ProviderChooser(const QList<KAAListPlugin *> &plugins, QWidget *parent)
    : QDialog(parent), m_plugins(plugins), m_list(new QListWidget)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(qtTrId("ADD_ACCOUNT_TITLE"));
    auto *const explanation = new QLabel(plugins.isEmpty() ? qtTrId("NO_KINDS_OF_ACCOUNT") : qtTrId("CHOOSE_KIND"));
    explanation->setWordWrap(true);
    m_list->setObjectName(QStringLiteral("kindsOfAccount"));
    m_list->setAccessibleName(qtTrId("KINDS_OF_ACCOUNT"));
    m_list->setIconSize({kIconSide, kIconSide});
    for (const KAAListPlugin *plugin : plugins)
        m_list->addItem(new QListWidgetItem(brandIcon(plugin), plugin->userVisibleProviderName()));
    m_list->setCurrentRow(0);
    m_list->setHidden(plugins.isEmpty());
    auto *const next = new QPushButton(qtTrId("CONTINUE"));
    next->setObjectName(QStringLiteral("continue"));
    next->setDefault(true);
    next->setHidden(plugins.isEmpty());
    auto *const cancel = new QPushButton(plugins.isEmpty() ? qtTrId("CLOSE") : qtTrId("CANCEL"));
    cancel->setAutoDefault(plugins.isEmpty());
    auto *const buttons = new QHBoxLayout;
    buttons->addStretch();
    buttons->addWidget(cancel);
    buttons->addWidget(next);
    auto *const layout = new QVBoxLayout(this);
    layout->addWidget(explanation);
    layout->addWidget(m_list, 1);
    layout->addLayout(buttons);
    connect(next, &QPushButton::clicked, this, &ProviderChooser::choose);
    connect(m_list, &QListWidget::itemDoubleClicked, this, &ProviderChooser::choose);
    connect(cancel, &QPushButton::clicked, this, &QDialog::reject);
    resize(plugins.isEmpty() ? sizeHint() : kSize);
}

void ProviderChooser::choose()
{
    const int row = m_list->currentRow();
    if (row < 0)
        return;
    accept();
    emit chosen(m_plugins[row]);
}

}  // namespace kavell::pane
