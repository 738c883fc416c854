// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The base of account-list plug-ins: one for each kind of online account that the user sees in the account list. It says
// which mail domains it serves, supplies brand and labels, and drives the sheet in which the user makes an account and
// picks the applications that are to use it.
//
// Methods marked "required" throw KARequiredMethodException unless a subclass implements them. The sheet's methods
// belong to the user-interface thread; domains and strings may be asked for from any thread.
//
// The sheet's order: showValidationPanel or showAppSelectionPanel makes the host sheet on first use, appToggle follows
// each check box, addAccount or cancel ends the sheet, back returns from the applications to the validation.

#ifndef KAVELLACCOUNTS_KAALISTPLUGIN_H
#define KAVELLACCOUNTS_KAALISTPLUGIN_H

#include <memory>
#include <mutex>
#include <optional>
#include <vector>

#include <QtCore/QList>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantMap>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAPlugin.h>

class KAAppTableController;
class KAApplication;
class KASheetMorpher;
class KASheetWindow;

namespace kavell {
class DomainMatcher;
class InterfaceFile;
}  // namespace kavell

class KAVELL_ACCOUNTS_EXPORT KAAListPlugin : public KAPlugin {
    Q_OBJECT

public:
    explicit KAAListPlugin(std::shared_ptr<KABundle> bundle);
    ~KAAListPlugin() override;

    /// @name Actions of the sheet's buttons; `sender` is the control that was used, or null
    /// @{

    /// Ends the sheet with return code 0 and hides it.
    Q_INVOKABLE virtual void cancel(QObject *sender);

    /// Shows the validation view again, animated.
    Q_INVOKABLE virtual void back(QObject *sender);

    /// Does nothing.
    Q_INVOKABLE virtual void continueButton(QObject *sender);

    /// Ends and hides the sheet and posts KACreatedAccountsNotification in this process: object a list of the
    /// provisional account (QList<std::shared_ptr<KAAccount>>), information "plugin" (KAAListPlugin *) and
    /// "selectedApps" (QList<std::shared_ptr<KAApplication>>).
    Q_INVOKABLE virtual void addAccount(QObject *sender);
    /// @}

    /// Called for a changed check box: the OK button is enabled while an application is selected. Whether the change
    /// stands; always true.
    Q_INVOKABLE virtual bool appToggle(const std::shared_ptr<KAApplication> &application);

    [[nodiscard]] virtual bool showMigrationSyncAlertForService(const QString &service);              ///< false
    [[nodiscard]] virtual bool shouldShowMigrationSyncAlertForService(const QString &service) const;  ///< false

    /// The plug-in's resource "domains.plist", read once; null when there is none, and then looked for again. Keys:
    /// "match" ("exact", else labels are matched), "domains" and "exceptions" (lists of text in lower case).
    [[nodiscard]] virtual std::optional<QVariantMap> domains();

    /// Whether the plug-in serves a domain, in any case of letters. An exception e excludes exactly e, "*.e" also all
    /// below it; exceptions win. An exact entry x claims x and every domain that begins with "x." or contains ".x", a
    /// label x every domain that begins with "x." or contains ".x.": substrings deliberately, so that country domains
    /// and hosts of hosts belong too.
    [[nodiscard]] virtual bool supportsDomain(const QString &domain);

    [[nodiscard]] virtual bool supportsDataMigration() const;  ///< false

    /// What the plug-in, else the application itself, calls the application's data; null when neither has a name.
    [[nodiscard]] virtual QString displayNameForApplication(const std::shared_ptr<KAApplication> &application) const;

    /// What the plug-in calls a service (kKAServiceIMAP, …), else brand name and the library's text; null for a
    /// service without a name.
    [[nodiscard]] virtual QString serviceDisplayNameForService(const QString &service) const;

    /// @name The plug-in's own strings, each null when its key has no translation
    /// @{
    [[nodiscard]] virtual QUrl supportURL() const;                    ///< "SUPPORT_URL"
    [[nodiscard]] virtual QString brandName() const;                  ///< "BRAND_NAME"
    [[nodiscard]] virtual QString defaultAccountDescription() const;  ///< "DEFAULT_ACCOUNT_DESCRIPTION"
    [[nodiscard]] virtual QString autodiscoverDomain() const;         ///< "AUTO_DISCOVER_DOMAIN"
    [[nodiscard]] virtual QString userNameFieldLabel() const;         ///< "USER_NAME_LABEL"
    /// @}

    [[nodiscard]] virtual bool shouldShowPasswordField() const;  ///< true
    [[nodiscard]] virtual QImage bannerImage() const;            ///< null

    /// Required. A provisional account of settings.
    [[nodiscard]] virtual std::shared_ptr<KAAccount> accountFromSettings(const QVariantMap &settings);

    /// Required.
    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &account) override;

    virtual void signInAccount(const std::shared_ptr<KAAccount> &account, QWidget *window);           ///< nothing
    virtual void createAccountInWindowWithWayfenArgs(QWidget *window, const QVariantMap &arguments);  ///< nothing

    /// Required. Begins the sheet on a window.
    virtual void createAccountInWindow(QWidget *window);
    [[nodiscard]] virtual bool canSignOutForAccount(const std::shared_ptr<KAAccount> &account) const;  ///< true

    /// Required. Enables or disables an account for an application.
    virtual void setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application,
                            const std::shared_ptr<KAAccount> &account, QWidget *window);

    virtual void configViewDidLoad();             ///< nothing
    virtual void configViewWillLoad();            ///< nothing
    [[nodiscard]] virtual QWidget *signInView();  ///< null

    /// Shows the application-selection view; its OK button is enabled while an application is selected.
    virtual void showAppSelectionPanel(bool animate);

    /// Shows the validation view.
    virtual void showValidationPanel(bool animate);

    /// Makes the host sheet (200 by 200 points) and its morpher on first use and shows the view in it.
    virtual void showView(QWidget *view, bool animate);

    void describeFields(KAFieldList &fields) const override;

protected:
    /// Reads the bundle's interface file NAME.ui, made in Qt Designer, and connects it: the outlets below with the
    /// widgets that have their names without the underscore, and the buttons whose dynamic property "action" names a
    /// method of the plug-in that takes a QObject * ("cancel", "addAccount", …) with that method. An outlet without a
    /// widget keeps its value. The widgets belong to the plug-in and go with it. False, with a line in the log, when
    /// there is no such file, a widget is of the wrong class, or an action has no method.
    bool loadInterfaceFile(const QString &name);

    /// Makes the table of the applications that can use the account, for showAppSelectionPanel: fills _appTableContainer
    /// with it, in place of an earlier one, lets appToggle of this plug-in decide, and writes the account's login name
    /// into _appSelectionAccountName. Spinners and information buttons are off: nothing is set up before addAccount.
    void makeAppTable(const std::shared_ptr<KAAccount> &account);

    std::shared_ptr<KAAppTableController> _appTableController;
    std::shared_ptr<KAAccount> _provisionalAccount;  ///< the account being made in the sheet
    std::shared_ptr<KASheetMorpher> _sheetMorpher;
    std::shared_ptr<KASheetWindow> _hostSheet;
    std::optional<QVariantMap> _cachedDomains;

    /// @name Outlets, connected by the plug-in's interface file and not owned here
    /// @{
    QPointer<QWidget> _validationView;
    QPointer<QWidget> _appSelectionView;
    QPointer<QWidget> _appTableContainer;
    QPointer<QLabel> _appSelectionAccountName;
    QPointer<QPushButton> _appSelectionOKButton;
    /// @}

private:
    void enableAppSelectionOKButton();

    mutable std::mutex m_domainsMutex;  // of the cached domains and what was made of them
    std::shared_ptr<const kavell::DomainMatcher> m_domainMatcher;
    std::vector<std::unique_ptr<kavell::InterfaceFile>> m_interfaces;
};

#endif
