// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The right side of the pane: one account with its description, its applications, its password and its details.
// User-interface thread only.

#ifndef KAVELL_PANE_ACCOUNT_PAGE_H
#define KAVELL_PANE_ACCOUNT_PAGE_H

#include <functional>
#include <memory>
#include <vector>

#include <QtWidgets/QCheckBox>
#include <QtWidgets/QFormLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QScrollArea>

#include "pane/account_records.h"

namespace kavell::pane {

class ApplicationSection;
class PasswordSection;
class Undertakings;

/// An account that was opened for showing: one record for the pane to read, one for the plug-in to work on.
struct OpenAccount {
    std::shared_ptr<KAAccount> shown;
    std::shared_ptr<KAAccount> forPlugin;
};

class AccountPage : public QScrollArea {
    Q_OBJECT

public:
    explicit AccountPage(Undertakings &undertakings, QWidget *parent = nullptr);
    ~AccountPage() override;

    /// Shows an account, or the one that is shown as it is now. What the user is typing stays.
    void showAccount(const OpenAccount &account, KAAListPlugin *plugin);

    [[nodiscard]] QSize minimumSizeHint() const override;

    /// Asks what can change without anybody telling: the credential store's state.
    void askAgain();

    /// The account that is shown; null before the first.
    [[nodiscard]] std::shared_ptr<KAAccount> account() const { return m_account; }

    [[nodiscard]] bool isShown(const AccountName &name) const;

    [[nodiscard]] ApplicationSection &applications() { return *m_applications; }

    /// Saves what has been typed as the account's description, if anything has.
    void saveDescription();

signals:
    /// Something went wrong: a sentence for the user.
    void failed(const QString &sentence);

    /// The account is to be read again.
    void changed();

private:
    void makeHeader(QWidget *content);
    void putApplicationsIntoFocusChain();
    void showHeader(KAAListPlugin *plugin);
    void showDetails(KAAListPlugin *plugin);

    struct Change {
        AccountName name;
        QString sentence;
        std::function<void(KAAccount &)> apply;  // in the background
        std::function<void()> takeBack;          // on the page, when it came to nothing and the account is shown
    };
    void makeChange(Change change);
    void startChanges();
    void start(const Change &change);
    void changeIsOver(const AccountName &name, const ChangeResult *result, const std::function<void()> &takeBack);

    struct Detail {
        QString label;
        QString value;
        bool operator==(const Detail &other) const = default;
    };

    Undertakings &m_undertakings;
    std::shared_ptr<KAAccount> m_account;
    QString m_defaultDescription;
    QLabel *m_icon;
    QLabel *m_title;
    QLabel *m_subtitle;
    QCheckBox *m_enabled;
    QLineEdit *m_description;
    ApplicationSection *m_applications;
    PasswordSection *m_password;
    QFormLayout *m_details;
    QList<Detail> m_shownDetails;
    // Of one account, one change at a time: of two at once, the earlier could be the last to be written.
    std::vector<Change> m_waiting;
    QList<AccountName> m_changing;
};

}  // namespace kavell::pane

#endif
