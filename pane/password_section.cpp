// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/password_section.h"

#include <array>

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QVBoxLayout>

#include "pane/password_dialog.h"
#include "pane/question.h"
#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

struct StateRow {
    CSKavellCofferelStatus status;
    const char *key;
};

const std::array<StateRow, 7> kStates{{
    {kCSKavellCofferelStatusStored, QT_TRID_NOOP("PASSWORD_STORED")},
    {kCSKavellCofferelStatusAbsent, QT_TRID_NOOP("PASSWORD_ABSENT")},
    {kCSKavellCofferelStatusLocked, QT_TRID_NOOP("PASSWORD_LOCKED")},
    {kCSKavellCofferelStatusRefused, QT_TRID_NOOP("PASSWORD_REFUSED")},
    {kCSKavellCofferelStatusUnreachable, QT_TRID_NOOP("PASSWORD_UNREACHABLE")},
    {kCSKavellCofferelStatusFailed, QT_TRID_NOOP("PASSWORD_FAILED")},
    {kCSKavellCofferelStatusUnsupported, QT_TRID_NOOP("PASSWORD_FAILED")},
}};

}  // namespace

PasswordSection::PasswordSection(Undertakings &undertakings, QWidget *parent)
    : QWidget(parent), m_undertakings(undertakings), m_state(new QLabel), m_revealed(new QLineEdit),
      m_set(new QPushButton(qtTrId("SET_PASSWORD"))), m_show(new QPushButton(qtTrId("SHOW_PASSWORD"))),
      m_remove(new QPushButton(qtTrId("REMOVE_PASSWORD")))
{
    m_state->setObjectName(QStringLiteral("passwordState"));
    m_state->setWordWrap(true);
    m_revealed->setObjectName(QStringLiteral("revealedPassword"));
    m_revealed->setReadOnly(true);
    m_revealed->setAccessibleName(qtTrId("PASSWORD"));
    m_revealed->hide();
    m_set->setObjectName(QStringLiteral("setPassword"));
    m_show->setObjectName(QStringLiteral("showPassword"));
    m_remove->setObjectName(QStringLiteral("removePassword"));
    auto *const buttons = new QHBoxLayout;
    for (QPushButton *button : {m_set, m_show, m_remove})
        buttons->addWidget(button);
    buttons->addStretch();
    auto *const layout = new QVBoxLayout(this);
    layout->setContentsMargins({});
    layout->addWidget(m_state);
    layout->addWidget(m_revealed);
    layout->addLayout(buttons);
    connect(m_set, &QPushButton::clicked, this, &PasswordSection::askForNewPassword);
    connect(m_show, &QPushButton::clicked, this, [this] { m_revealed->isHidden() ? reveal() : conceal(); });
    connect(m_remove, &QPushButton::clicked, this, &PasswordSection::askToRemove);
}

PasswordSection::~PasswordSection() = default;

void PasswordSection::showAccount(const AccountName &name, const QVariant &reference)
{
    if (m_name == name && m_reference == reference)
        return;
    m_reference = reference;
    if (!(m_name == name)) {
        m_name = name;
        conceal();
        m_state->setText(qtTrId("PASSWORD_BEING_ASKED"));
        m_show->setEnabled(false);
        m_remove->setEnabled(false);
    }
    askForStatus();
}

void PasswordSection::askForStatus()
{
    m_undertakings.start<CSKavellCofferelStatus>(
        qtTrId("ASKING_FOR_PASSWORD_STATE"), this, [name = m_name](const CancelFlag &) { return passwordStatus(name); },
        [this, question = ++m_lastQuestion](const CSKavellCofferelStatus *status) {
            // The store may answer a later question first.
            if (question == m_lastQuestion)
                showStatus(status ? *status : kCSKavellCofferelStatusUnreachable);
        });
}

void PasswordSection::showStatus(CSKavellCofferelStatus status)
{
    for (const StateRow &row : kStates) {
        if (row.status == status)
            m_state->setText(qtTrId(row.key));
    }
    const bool mayBeRead = status != kCSKavellCofferelStatusAbsent;
    m_show->setEnabled(mayBeRead);
    m_remove->setEnabled(mayBeRead);
    if (!mayBeRead)
        conceal();
}

void PasswordSection::askForNewPassword()
{
    conceal();
    auto *const dialog = new PasswordDialog(m_name.loginName, window());
    // Another account may be shown by the time of the answer, when this one is removed meanwhile.
    connect(dialog, &QDialog::accepted, this, [this, dialog, name = m_name] { store(name, dialog->password()); });
    dialog->open();
}

void PasswordSection::store(const AccountName &name, const QString &password)
{
    m_undertakings.start<ChangeResult>(
        qtTrId("STORING_PASSWORD"), this,
        [name, password](const CancelFlag &isCancelled) { return storePassword(name, password, isCancelled); },
        [this, name](const ChangeResult *result) {
            if (result && *result == ChangeResult::NotSaved)
                emit failed(qtTrId("PASSWORD_NOT_STORED"));
            else if (result && *result == ChangeResult::NoAccount)
                emit failed(qtTrId("ACCOUNT_GONE").arg(name.loginName));
            askForStatus();
        });
}

void PasswordSection::reveal()
{
    m_undertakings.start<QString>(
        qtTrId("READING_PASSWORD"), this, [name = m_name](const CancelFlag &) { return readPassword(name); },
        [this, name = m_name](const QString *password) {
            if (!password || !(name == m_name))
                return;
            if (password->isNull()) {
                emit failed(qtTrId("PASSWORD_NOT_READ"));
                askForStatus();
                return;
            }
            m_revealed->setText(*password);
            m_revealed->show();
            m_show->setText(qtTrId("HIDE_PASSWORD"));
        });
}

void PasswordSection::conceal()
{
    m_revealed->clear();
    m_revealed->hide();
    m_show->setText(qtTrId("SHOW_PASSWORD"));
}

void PasswordSection::askToRemove()
{
    ask(window(), qtTrId("REMOVE_PASSWORD_QUESTION").arg(m_name.loginName), qtTrId("REMOVE_PASSWORD_DETAILS"),
        qtTrId("REMOVE_PASSWORD_NOW"), this, [this, name = m_name] { store(name, QString()); });
}

}  // namespace kavell::pane
