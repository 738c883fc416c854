// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The first page of the sheet: address, password and full name, and what was wrong with them.
//
// What to take from it: the continue button is enabled exactly when there is something to continue with; what is wrong
// stands beside the fields, is read out by screen readers, and the field at fault has the keyboard; and nothing that was
// typed outlives the sheet, least of all the password. User-interface thread only.

#ifndef EXAMPLES_ZORBO_PLUGIN_SIGN_IN_PAGE_H
#define EXAMPLES_ZORBO_PLUGIN_SIGN_IN_PAGE_H

#include <functional>
#include <memory>

#include <QtCore/QString>
#include <QtGui/QImage>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QWidget>

/// Shows a sentence in a label for problems, with a warning sign beside it, and has screen readers say it. An empty one
/// takes both away. Called before the page is shown, which is then made high enough.
void showProblem(QLabel *label, QLabel *icon, const QString &sentence);

class SignInPage {
public:
    enum class Field { Address, Password };

    /// Takes the page over, out of the interface file that it was laid out in. `serves` says whether an address is one
    /// of the plug-in's.
    SignInPage(QWidget *page, std::function<bool(const QString &address)> serves);

    [[nodiscard]] QWidget *view() const { return m_page.get(); }
    [[nodiscard]] QPushButton *continueButton() const { return m_continue; }

    void setBanner(const QImage &banner, const QString &name);
    void setTitle(const QString &title);

    /// A page without a password field for services that ask for it elsewhere, such as on a web page.
    void showPasswordField(bool isShown);

    /// The page of an account that is there already asks for the password alone.
    void setAddressIsFixed(bool isFixed);

    [[nodiscard]] QString address() const;  ///< trimmed and in lower case
    [[nodiscard]] QString password() const;
    [[nodiscard]] QString fullName() const;
    void setAddress(const QString &address);
    void setFullName(const QString &fullName);

    /// Whether there is an address of the plug-in's and, where it is asked for, a password.
    [[nodiscard]] bool isComplete() const;

    void setProblem(const QString &sentence, Field field);

    /// Where the user is to type next.
    [[nodiscard]] QWidget *firstField() const;

    /// Forgets everything that was typed.
    void clear();

private:
    void textChanged();

    std::unique_ptr<QWidget> m_page;
    std::function<bool(const QString &)> m_serves;
    QLabel *m_banner;
    QLabel *m_title;
    QLineEdit *m_address;
    QLabel *m_passwordLabel;
    QLineEdit *m_password;
    QLabel *m_fullNameLabel;
    QLineEdit *m_fullName;
    QLabel *m_problemIcon;
    QLabel *m_problem;
    QPushButton *m_continue;
    QLineEdit *m_fieldAtFault = nullptr;
};

#endif
