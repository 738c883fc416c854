// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The base of data plug-ins: one for each client application's kind of data (mail, calendars, contacts, chat). It makes,
// lists, configures and deletes the application's own accounts, known by account UIDs, and reports to a delegate.
// Methods marked "required" throw KARequiredMethodException unless a subclass implements them.
//
// The delegate is any QObject; a plug-in sends it these messages where its class has an invokable method (Q_INVOKABLE
// or slot) of the name, with the sending plug-in first. The helpers of the same names in the protected part do so, on the
// thread that calls them.
//
//     pluginAccountSetupUpdate(plugin, input, status)          news of a set-up; status is a QVariant
//     pluginAccountSetupDidFinish(plugin, input, result)       it succeeded
//     pluginAccountSetupDidFail(plugin, input, error)          it failed
//     pluginHandleCertificateError(plugin, error)              a certificate needs the user's decision
//     pluginDidCreateAccountUID(plugin, uid)                   the application made, changed, deleted an account
//     pluginDidChangeAccountUID(plugin, uid)
//     pluginDidDeleteAccountUID(plugin, uid)
//     pluginNbsAccountMigrationFinished(plugin, account)       a migration told of by nbsAccountStartedMigration ended
//
// Parameter types, as the delegate's methods must declare them: KADataPlugin *, std::shared_ptr<KAAccountSetupInput>,
// std::shared_ptr<KAAccountSetupResult>, KAError, QString, QVariant, std::shared_ptr<KAAccount>.

#ifndef KAVELLACCOUNTS_KADATAPLUGIN_H
#define KAVELLACCOUNTS_KADATAPLUGIN_H

#include <memory>

#include <QtCore/QStringList>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAPlugin.h>

class KAAccountSetupInput;
class KAAccountSetupResult;

class KAVELL_ACCOUNTS_EXPORT KADataPlugin : public KAPlugin {
    Q_OBJECT

public:
    explicit KADataPlugin(std::shared_ptr<KABundle> bundle);
    ~KADataPlugin() override;

    /// Borrowed: whoever set itself as delegate clears it before it goes. Any thread; once setDelegate returned, no
    /// message is under way to the former delegate, except one that the calling thread itself is sending.
    [[nodiscard]] QObject *delegate() const;
    void setDelegate(QObject *delegate);

    virtual void nbsAccountStartedMigration(const std::shared_ptr<KAAccount> &account);  ///< nothing
    virtual void deactivateAccountUID(const QString &uid);                               ///< nothing
    virtual void activateAccountUID(const QString &uid);                                 ///< nothing

    /// A generic network icon.
    [[nodiscard]] virtual QImage imageForAccountUID(const QString &uid);

    /// @name Required
    /// @{
    virtual void configureAccountUID(const QString &uid);
    [[nodiscard]] virtual QVariantMap settingsForAccountUID(const QString &uid);
    [[nodiscard]] virtual QStringList accountUIDs();
    virtual void deleteAccountUID(const QString &uid);

    /// Makes an account of what was typed and what was found; its UID, or null with the reason in `error` (may be
    /// null).
    [[nodiscard]] virtual QString createAccountForInput(const std::shared_ptr<KAAccountSetupInput> &input,
                                                        const std::shared_ptr<KAAccountSetupResult> &discoveredResult,
                                                        KAError *error);
    virtual void cancelAccountSetupForInput(const std::shared_ptr<KAAccountSetupInput> &input);

    /// Starts to look for the account's settings; the plug-in reports to its delegate.
    virtual void startAccountSetupWithInput(const std::shared_ptr<KAAccountSetupInput> &input);
    /// @}

    void describeFields(KAFieldList &fields) const override;

protected:
    /// @name Messages to the delegate, none of which needs to be answered
    /// @{
    void accountSetupUpdate(const std::shared_ptr<KAAccountSetupInput> &input, const QVariant &status);
    void accountSetupDidFinish(const std::shared_ptr<KAAccountSetupInput> &input,
                               const std::shared_ptr<KAAccountSetupResult> &result);
    void accountSetupDidFail(const std::shared_ptr<KAAccountSetupInput> &input, const KAError &error);
    bool handleCertificateError(const KAError &error);  ///< the delegate's bool answer; false without one
    void didCreateAccountUID(const QString &uid);
    void didChangeAccountUID(const QString &uid);
    void didDeleteAccountUID(const QString &uid);
    void nbsAccountMigrationFinished(const std::shared_ptr<KAAccount> &account);
    /// @}

private:
    mutable std::recursive_mutex m_delegateMutex;  // held while a message is being sent
    QObject *_delegate = nullptr;
};

#endif
