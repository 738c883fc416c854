// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// When the user has added an account in one client application, the source, this offers the same account to the other
// applications that can use it: one check box each for mail, contacts, calendars and chat, and on request an account in
// every application that is ticked.
//
//     m_setup = KACrossAppSetupViewController::initWithSettings(settings, kKAMailAppID);
//     if (m_setup->numberOfAppsNeedingSetup() > 0)
//         layout->addWidget(m_setup->view());
//     …
//     m_setup->createAccountsWithDelegate(delegate, nullptr, nullptr);
//
// The delegate is any QObject with an invokable method
//
//     controllerDidSave(KACrossAppSetupViewController *controller, bool saved, void *contextInfo)
//
// which is called on the main thread when all is done. `saved` is true whatever became of the single accounts, on
// purpose: the source application has its account all the same. applicationOutcomes tells what became of each.
//
// User-interface thread only, except where a method says otherwise. The last reference may be dropped on any thread: the
// widgets go on the main one. In a program without an application object everything runs on the calling thread.

#ifndef KAVELLACCOUNTS_KACROSSAPPSETUPVIEWCONTROLLER_H
#define KAVELLACCOUNTS_KACROSSAPPSETUPVIEWCONTROLLER_H

#include <array>
#include <memory>
#include <mutex>
#include <vector>

#include <QtCore/QList>
#include <QtCore/QMap>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtCore/QVariantMap>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAViewController.h>

class KAApplication;
class KABundle;
class KADataPlugin;

class KAVELL_ACCOUNTS_EXPORT KACrossAppSetupViewController
    : public KAViewController,
      public std::enable_shared_from_this<KACrossAppSetupViewController> {
    Q_OBJECT

public:
    /// A controller for a new account's settings (keys of KAConstants.h) and the bundle identifier of the application
    /// that has it already. Reads the library's own interface and asks no plug-in yet. Never null.
    ///
    /// The source is one of the four applications as a rule. With another one there can be four candidates for the three
    /// check boxes; the first three are shown, and the log names the fourth.
    [[nodiscard]] static std::shared_ptr<KACrossAppSetupViewController> initWithSettings(const QVariantMap &settings,
                                                                                         const QString &appBundleID);

    /// A controller without settings whose view is NAME.ui of the bundle (null: the library). Its outlets are the
    /// container "view" and the check boxes "checkbox1", "checkbox2" and "checkbox3". When the file cannot be read, which
    /// the log tells, and in a program without a QApplication, it has no view. Never null.
    [[nodiscard]] static std::shared_ptr<KACrossAppSetupViewController>
    initWithNibName(const QString &nibName, const std::shared_ptr<KABundle> &bundle);

    ~KACrossAppSetupViewController() override;

    /// @name The source application, and the settings, which this controller adds to for accounts of the newer online
    /// service. Any thread
    /// @{
    [[nodiscard]] QString appBundleID() const;
    void setAppBundleID(const QString &appBundleID);
    [[nodiscard]] QVariantMap settings() const;
    void setSettings(const QVariantMap &settings);
    /// @}

    /// @name What is offered. The first of these questions finds the candidates and the accounts that applications have
    /// already: it loads the plug-ins, reads the accounts of all data plug-ins and may look up names for half a second
    /// each. It is asked again as long as no provider was found for the settings
    /// @{

    /// How many applications could get the account and have no active one that matches; 0 for settings of nobody.
    [[nodiscard]] int numberOfAppsNeedingSetup();

    /// The container with a ticked check box for each candidate, disabled where the application has the account. Each
    /// call sets the check boxes up anew. Null for settings of nobody.
    [[nodiscard]] QWidget *view() override;
    /// @}

    /// Makes the account in each application whose check box is on and enabled, as of the start, one after another. Any
    /// thread, which is blocked meanwhile as KAAccountCreator::create says. Always true.
    bool createAccounts();

    /// The same on a thread of the global pool, which keeps this controller alive; the delegate is told. It is held
    /// until another takes its place or the controller goes: a delegate that holds the controller lets go of it when
    /// told. A delegate that takes the place of another while accounts are being made is told in its stead. The selector
    /// is ignored, deliberately.
    void createAccountsWithDelegate(std::shared_ptr<QObject> delegate, const char *didCreateSelector,
                                    void *contextInfo);

    /// What was to be done for an application, and what became of it.
    struct ApplicationOutcome {
        enum class State {
            NotTicked,
            AlreadyThere,  ///< the application has the account; its check box was disabled
            Waiting,       ///< ticked; its turn has not come
            InProgress,
            Done,
            Failed,
        };
        QString appBundleID{};
        State state;
        QString accountUID{};     ///< of the new account; null too when the online service needed none
        QString failureReason{};  ///< a sentence for logs and tools; null unless it failed
        KAError failureError{};   ///< what the plug-in said of it, if anything
    };

    /// The outcomes of the latest creation, so far as it has come, in the order of the check boxes; empty before the
    /// first. Any thread.
    [[nodiscard]] QList<ApplicationOutcome> applicationOutcomes() const;

    void describeFields(KAFieldList &fields) const override;

    bool eventFilter(QObject *watched, QEvent *event) override;

protected:
    KACrossAppSetupViewController(const QString &nibName, const std::shared_ptr<KABundle> &bundle);

private:
    /// What a check box says, for threads that must not ask it.
    struct Choice {
        QString appBundleID;
        bool ticked;
        bool enabled;
    };

    /// An application that accounts can be made in.
    struct Destination {
        const QString &appBundleID;
        void (KACrossAppSetupViewController::*create)(ApplicationOutcome &) const;
    };

    static void letGo(KACrossAppSetupViewController *controller);
    [[nodiscard]] static const std::array<Destination, 4> &destinations();
    [[nodiscard]] static bool isDestination(const QString &appBundleID);

    [[nodiscard]] QList<QCheckBox *> checkboxes() const;
    void setUpCheckboxes();
    void noteChoice(QCheckBox *checkbox);

    [[nodiscard]] bool initDataIfNeeded();
    [[nodiscard]] bool _initData();
    [[nodiscard]] QString providerID() const;
    [[nodiscard]] bool _isBrondel() const;
    [[nodiscard]] static QString _providerIDForSettings(const QVariantMap &settings);
    [[nodiscard]] static QString _providerIDForServerAddress(const QString &serverAddress);
    [[nodiscard]] static QString _possibleCorvaneIDForSettings(const QVariantMap &settings);
    void _fillInBrondelInfo();
    void _findAccountsMatchingAccountID(const QString &accountID);
    void findMatchingAccounts(KADataPlugin &plugin, const QString &accountID);
    void _findAppsForServices();
    [[nodiscard]] bool _accountIsEnabledForApp(const QString &appBundleID) const;

    bool _createAccounts();
    void setOutcome(ApplicationOutcome &entry, const ApplicationOutcome &outcome) const;
    [[nodiscard]] ApplicationOutcome _createAccountForApp(const QString &appBundleID) const;
    void _createMailAccount(ApplicationOutcome &outcome) const;
    void _createTidewellAccount(ApplicationOutcome &outcome) const;
    void _createCardellAccount(ApplicationOutcome &outcome) const;
    void _createParlexAccount(ApplicationOutcome &outcome) const;
    template <typename Creator> void createWith(const QString &pluginID, ApplicationOutcome &outcome) const;
    void tellDelegate(bool saved);

    QString _appBundleID;
    QVariantMap _settings;
    std::shared_ptr<QObject> _delegate;
    void *_contextInfo = nullptr;
    QString _providerID;
    QString _accountID;
    QMap<QString, QVariantMap> _existingAccounts;
    QMap<QString, QPointer<QCheckBox>> _checkboxes;
    QMap<QString, std::shared_ptr<KAApplication>> _apps;

    /// @name Outlets of the interface, which belong to the view
    /// @{
    QPointer<QWidget> _view;
    QPointer<QCheckBox> _checkbox1;
    QPointer<QCheckBox> _checkbox2;
    QPointer<QCheckBox> _checkbox3;
    /// @}

    mutable std::mutex m_mutex;  // of what threads share: the fields up to the provider's, and what follows
    QList<Choice> m_choices;
    std::shared_ptr<std::vector<ApplicationOutcome>> m_latestRun;
};

#endif
