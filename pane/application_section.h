// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The applications that can use the account that is shown. Switching one on or off is the account-list plug-in's work; a
// row's spinner turns until the account says that it is done. User-interface thread only.

#ifndef KAVELL_PANE_APPLICATION_SECTION_H
#define KAVELL_PANE_APPLICATION_SECTION_H

#include <memory>

#include <QtCore/QDeadlineTimer>
#include <QtCore/QHash>
#include <QtCore/QPointer>
#include <QtCore/QTimer>
#include <QtWidgets/QLabel>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KANotificationCenter.h>

class KAAccount;
class KAAppTableController;
class KAApplication;
class QVBoxLayout;

namespace kavell::pane {

class ApplicationSection : public QWidget {
    Q_OBJECT

public:
    explicit ApplicationSection(QWidget *parent = nullptr);
    ~ApplicationSection() override;

    /// Shows the account's applications as they are now. The plug-in works on `pluginsAccount`, a record of its own, since
    /// it may save it on another thread while `account` is being read here. Without a plug-in there is nothing to choose.
    void showAccount(const std::shared_ptr<KAAccount> &account, const std::shared_ptr<KAAccount> &pluginsAccount,
                     KAAListPlugin *plugin);

    /// @name Messages of the table: the user switched an application, or wants to know more about it
    /// @{
    Q_INVOKABLE bool appToggle(const std::shared_ptr<KAApplication> &application);
    Q_INVOKABLE void showInfoForApp(const std::shared_ptr<KAApplication> &application);
    /// @}

    /// Switches an application on or off for the account that is shown, as a click does. False, after `failed`, when the
    /// plug-in failed at once.
    bool setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application);

signals:
    /// Something went wrong: a sentence for the user.
    void failed(const QString &sentence);

    /// The plug-in has done something to the account, which is to be read again.
    void changed();

private:
    void showTable();
    void settle();
    void giveUp();
    void pluginIsDone(const QList<std::shared_ptr<KAAccount>> &accounts);

    struct Expectation {
        std::shared_ptr<KAApplication> application;
        bool isEnabled;
        QDeadlineTimer deadline;
        bool isOver;  // the plug-in says that it is done, whatever came of it
    };

    std::shared_ptr<KAAccount> m_account;
    std::shared_ptr<KAAccount> m_pluginsAccount;
    QPointer<KAAListPlugin> m_plugin;
    std::shared_ptr<KAAppTableController> m_table;
    QVBoxLayout *m_layout;
    QLabel *m_explanation;
    QHash<QString, Expectation> m_expected;  // what the plug-in was told to do, by bundle identifier
    QTimer m_deadline;
    KANotificationCenter::Observation m_observation;
};

}  // namespace kavell::pane

#endif
