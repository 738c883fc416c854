// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "sign_in_page.h"

#include <QtGui/QAccessible>
#include <QtGui/QPixmap>
#include <QtWidgets/QStyle>

#include <kavellaccounts/KAExtras.h>

namespace {

constexpr int kCharacters = 32;  // of a field that can be seen at once

}  // namespace

void showProblem(QLabel *label, QLabel *icon, const QString &sentence)
{
    const QStyle *const style = label->style();
    const int side = style->pixelMetric(QStyle::PM_SmallIconSize, nullptr, label);
    icon->setPixmap(style->standardIcon(QStyle::SP_MessageBoxWarning, nullptr, label).pixmap(side));
    icon->setVisible(!sentence.isEmpty());
    label->setText(sentence);
    label->setVisible(!sentence.isEmpty());
    if (!sentence.isEmpty()) {
        QAccessibleEvent news(label, QAccessible::Alert);
        QAccessible::updateAccessibility(&news);
    }
}

SignInPage::SignInPage(QWidget *page, std::function<bool(const QString &address)> serves)
    : m_page(page), m_serves(std::move(serves)), m_banner(page->findChild<QLabel *>("banner")),
      m_title(page->findChild<QLabel *>("signInTitle")), m_address(page->findChild<QLineEdit *>("addressField")),
      m_passwordLabel(page->findChild<QLabel *>("passwordLabel")),
      m_password(page->findChild<QLineEdit *>("passwordField")),
      m_fullNameLabel(page->findChild<QLabel *>("fullNameLabel")),
      m_fullName(page->findChild<QLineEdit *>("fullNameField")),
      m_problemIcon(page->findChild<QLabel *>("signInProblemIcon")),
      m_problem(page->findChild<QLabel *>("signInProblem")),
      m_continue(page->findChild<QPushButton *>("signInContinue"))
{
    for (QLineEdit *field : {m_address, m_password, m_fullName}) {
        field->setMinimumWidth(field->fontMetrics().averageCharWidth() * kCharacters);
        QObject::connect(field, &QLineEdit::textChanged, m_page.get(), [this] { textChanged(); });
    }
    clear();
}

void SignInPage::setBanner(const QImage &banner, const QString &name)
{
    m_banner->setPixmap(QPixmap::fromImage(banner));
    m_banner->setAccessibleName(name);
}

void SignInPage::setTitle(const QString &title)
{
    m_title->setText(title);
}

void SignInPage::showPasswordField(bool isShown)
{
    m_passwordLabel->setVisible(isShown);
    m_password->setVisible(isShown);
    textChanged();
}

void SignInPage::setAddressIsFixed(bool isFixed)
{
    m_address->setReadOnly(isFixed);
    m_fullNameLabel->setVisible(!isFixed);
    m_fullName->setVisible(!isFixed);
}

QString SignInPage::address() const
{
    return KAExtras::validatedEmailAddressStringValue(m_address);
}

QString SignInPage::password() const
{
    return m_password->text();
}

QString SignInPage::fullName() const
{
    return m_fullName->text().trimmed();
}

void SignInPage::setAddress(const QString &address)
{
    m_address->setText(address);
}

void SignInPage::setFullName(const QString &fullName)
{
    m_fullName->setText(fullName);
}

bool SignInPage::isComplete() const
{
    // isHidden and not isVisible: whether the field belongs to the page, not whether the page is on the screen.
    return m_serves(address()) && (m_password->isHidden() || !password().isEmpty());
}

void SignInPage::setProblem(const QString &sentence, Field field)
{
    showProblem(m_problem, m_problemIcon, sentence);
    m_fieldAtFault = field == Field::Password && !m_password->isHidden() ? m_password : m_address;
    m_fieldAtFault->setAccessibleDescription(sentence);
    m_fieldAtFault->selectAll();
}

QWidget *SignInPage::firstField() const
{
    if (m_fieldAtFault)
        return m_fieldAtFault;
    return m_address->text().isEmpty() || m_password->isHidden() ? m_address : m_password;
}

void SignInPage::clear()
{
    for (QLineEdit *field : {m_address, m_password, m_fullName})
        field->setText({});  // unlike QLineEdit::clear, which "undo" takes back
    textChanged();
}

/// What was said of the former text is said no more.
void SignInPage::textChanged()
{
    if (m_fieldAtFault)
        m_fieldAtFault->setAccessibleDescription({});
    m_fieldAtFault = nullptr;
    showProblem(m_problem, m_problemIcon, {});
    m_continue->setEnabled(isComplete());
}
