// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account-list plug-in to start from: accounts at an imaginary service, Zorbo, with mail, calendars, contacts and
// chat, whose addresses end in zorbo.example. The plug-in adds an account in a sheet and turns it on and off for client
// applications.
//
// What to take from it: the plug-in is one object for the life of the process, while sheets come and go. Everything that
// one sheet is about is an *attempt*; what takes time is done elsewhere (SignInChecker, a worker thread) and comes back
// with the number of the attempt that it was begun for, and is dropped, or taken back, when that one has ended. An attempt
// ends in one place, where the sheet tells that it has ended, whoever ended it: a button, Escape, or the window that went
// away below it.
//
//     sign-in  --continue-->  validation  --accepted-->  applications  --OK-->  validation ("saving")  -->  done
//        ^------- refused, with what is wrong -|   ^---------- back ----|                        (addAccount posts)
//
// The texts are in the string tables, the pages in Sheet.ui. Methods of the sheet belong to the user-interface thread.

#ifndef EXAMPLES_ZORBO_PLUGIN_ZORBOPLUGIN_H
#define EXAMPLES_ZORBO_PLUGIN_ZORBOPLUGIN_H

#include <functional>
#include <memory>

#include <QtCore/QPointer>
#include <QtCore/QThreadPool>
#include <QtWidgets/QLabel>

#include <kavellaccounts/KAAListPlugin.h>

#include "ApplicationSwitch.h"
#include "SignInChecker.h"
#include "sign_in_page.h"

class ZorboPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    explicit ZorboPlugin(std::shared_ptr<KABundle> bundle);
    ~ZorboPlugin() override;

    void pluginDidLoad() override;

    /// @name What a host shows
    /// @{
    [[nodiscard]] std::shared_ptr<KAAccount> accountFromSettings(const QVariantMap &settings) override;
    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &account) override;
    [[nodiscard]] QImage bannerImage() const override;
    [[nodiscard]] bool canSignOutForAccount(const std::shared_ptr<KAAccount> &account) const override;
    /// @}

    /// @name The sheet
    /// @{
    void createAccountInWindow(QWidget *window) override;

    /// Fills in "emailAddress" and "fullName". What a browser hands in is anybody's: only text is taken, of a sensible
    /// length, the user sees it before anything happens, and a password is not among it.
    void createAccountInWindowWithWayfenArgs(QWidget *window, const QVariantMap &arguments) override;

    /// Asks for the password of an account again, tries it and stores it.
    void signInAccount(const std::shared_ptr<KAAccount> &account, QWidget *window) override;
    /// @}

    /// Returns at once; what is to be done is done by ApplicationSwitch.
    void setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application,
                    const std::shared_ptr<KAAccount> &account, QWidget *window) override;

    /// @name Buttons of the sheet, named in Sheet.ui
    /// @{
    Q_INVOKABLE void back(QObject *sender) override;
    Q_INVOKABLE void continueButton(QObject *sender) override;

    /// Stores the password and the account, and then does what the base class does.
    Q_INVOKABLE void addAccount(QObject *sender) override;
    /// @}

    void showView(QWidget *view, bool animate) override;

private:
    /// @name The sheet's life
    /// @{
    bool makePages();
    void translate(QWidget *page) const;
    void beginSheet(QWidget *window);
    void endAttempt(int returnCode);
    [[nodiscard]] bool isShown(const QWidget *page) const;
    /// @}

    /// @name What happens in it, in this order
    /// @{
    void showStatus(const QString &sentence);
    void signInChecked(SignInChecker::Outcome outcome);
    void refuse(const QString &sentence, SignInPage::Field field);
    void makeProvisionalAccount();
    void showApplications(const std::shared_ptr<KAAccount> &account);
    void saved(const std::shared_ptr<KAAccount> &account, const QString &problem);
    void storeNewPassword();
    /// @}

    /// Does `work` on the worker thread and hands what it answers to `done` on this one, unless the attempt has ended
    /// by then; then it calls `undo`, if there is one.
    template <typename Result>
    void doForAttempt(std::function<Result()> work, std::function<void(const Result &)> done,
                      std::function<void(const Result &)> undo = {});
    [[nodiscard]] QString text(const char *key) const;

    quint64 m_attempt = 0;                  // the number of the present attempt; ended ones have smaller numbers
    std::shared_ptr<KAAccount> m_existing;  // the account to sign in again; null where one is to be added

    std::unique_ptr<SignInPage> m_signIn;  // made with the first sheet
    QPointer<QLabel> m_status;
    QPointer<QPushButton> m_validationCancel;
    QPointer<QLabel> m_appSelectionProblem;
    QPointer<QLabel> m_appSelectionProblemIcon;

    // Children of this object as well: whatever thread it was made on, it is moved to the main thread with its children.
    const std::unique_ptr<SignInChecker> m_checker;
    const std::unique_ptr<ApplicationSwitch> m_switch;
    QThreadPool m_worker;  // for the disk and the credential store, one thing after the other
};

#endif
