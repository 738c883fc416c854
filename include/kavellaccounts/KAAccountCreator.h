// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Turns the settings of one account into a new account of one client application, by driving the application's data
// plug-in through discovery and creation. One class for each application; they differ in the input that they make of the
// settings:
//
//     const auto creator = KAMailAccountCreator::initWithSettings(settings, mailPlugin);
//     creator->setProvider(provider);
//     creator->setCorvaneID(name);
//     if (!creator->create())
//         qWarning() << creator->failureReason();
//
// A creator is made, given its provider and its name at the online service, asked to create once, and let go, all on one
// thread, which may be any. It is the data plug-in's delegate while it works. A plug-in has one delegate, so that it serves
// one creator at a time; creators on other threads wait for their turn. The plug-in may report on any thread.

#ifndef KAVELLACCOUNTS_KAACCOUNTCREATOR_H
#define KAVELLACCOUNTS_KAACCOUNTCREATOR_H

#include <atomic>
#include <memory>
#include <mutex>
#include <optional>

#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAAListPlugin;
class KAAccount;
class KAProvider;

/// The base, which holds the flow and makes no input of its own.
class KAVELL_ACCOUNTS_EXPORT KAAccountCreator : public QObject, public KAObject {
    Q_OBJECT

public:
    /// A creator of an account with these settings (keys of KAConstants.h; nil is no dictionary at all, which differs
    /// from an empty one) in the plug-in's application. Both are only kept; the plug-in is borrowed and may be one
    /// outside the registry.
    [[nodiscard]] static std::shared_ptr<KAAccountCreator> initWithSettings(const std::optional<QVariantMap> &settings,
                                                                            KADataPlugin *plugin);

    /// Sets the plug-in's delegate to none, whoever that is except another creator at work, so that no late message
    /// reaches a creator that is gone; waits, without a bound, for one that is under way on another thread.
    ~KAAccountCreator() override;

    /// @name The provider of the account that is copied, and the account's name at the maker's online service, where it
    /// has one. Set before `create`
    /// @{
    [[nodiscard]] std::shared_ptr<KAProvider> provider() const;
    void setProvider(std::shared_ptr<KAProvider> provider);
    [[nodiscard]] QString corvaneID() const;
    void setCorvaneID(const QString &corvaneID);
    /// @}

    /// Makes the account. True when the plug-in made one, and true when the newer online service needs none because its
    /// calendars or contacts were switched on. False after a failure, whose reason failureReason tells.
    ///
    /// Blocks until the plug-in is free and has reported, without a bound, and runs the events of the calling thread
    /// meanwhile, which it asks for again and again without sleeping; a program without an application object has no
    /// events to run. Ends early only when the plug-in is destroyed or the application object goes away. From an event
    /// that a creator of the same plug-in runs while it waits, it fails. A thread of the global thread pool gives its
    /// place there to others for that time. What the plug-in throws comes through.
    ///
    /// The plug-in may be destroyed on another thread while it is waited for, but not while it is being called.
    [[nodiscard]] bool create();

    /// @name What came of `create`. Any thread
    /// @{

    /// Why it failed, a sentence for logs and tools; null before, during and after a success.
    [[nodiscard]] QString failureReason() const;

    /// What the plug-in said of the failure; no error when it said nothing.
    [[nodiscard]] KAError failureError() const;

    /// How the application knows the new account; null when there is none.
    [[nodiscard]] QString createdAccountUID() const;
    /// @}

    /// @name Messages of the data plug-in
    /// @{

    /// Nothing.
    Q_INVOKABLE void pluginAccountSetupUpdate(KADataPlugin *plugin, const std::shared_ptr<KAAccountSetupInput> &input,
                                              const QVariant &status);

    /// Ends the wait; the first of these two that comes decides.
    Q_INVOKABLE void pluginAccountSetupDidFail(KADataPlugin *plugin, const std::shared_ptr<KAAccountSetupInput> &input,
                                               const KAError &error);
    Q_INVOKABLE void pluginAccountSetupDidFinish(KADataPlugin *plugin,
                                                 const std::shared_ptr<KAAccountSetupInput> &input,
                                                 const std::shared_ptr<KAAccountSetupResult> &result);

    /// Asks the user whether to trust the server and answers that. Blocks as KAShowCertificatePanelForError does; a
    /// refusal ends the wait.
    Q_INVOKABLE bool pluginHandleCertificateError(KADataPlugin *plugin, const KAError &error);

    /// Nothing.
    Q_INVOKABLE void pluginDidCreateAccountUID(KADataPlugin *plugin, const QString &uid);
    Q_INVOKABLE void pluginDidDeleteAccountUID(KADataPlugin *plugin, const QString &uid);
    Q_INVOKABLE void pluginDidChangeAccountUID(KADataPlugin *plugin, const QString &uid);
    Q_INVOKABLE void pluginNbsAccountMigrationFinished(KADataPlugin *plugin, const std::shared_ptr<KAAccount> &account);
    /// @}

    void describeFields(KAFieldList &fields) const override;

protected:
    /// Owns a new creator. It lets go of its plug-in before it is destroyed: a message from another thread must not come
    /// while an object is on its way from one class to its base.
    template <typename Creator> [[nodiscard]] static std::shared_ptr<Creator> owned(Creator *creator)
    {
        return std::shared_ptr<Creator>(creator, [](Creator *dying) {
            dying->letGoOfPlugin();
            delete dying;
        });
    }

    KAAccountCreator(const std::optional<QVariantMap> &settings, KADataPlugin *plugin);

    /// What the plug-in is to set up; null in this class.
    [[nodiscard]] virtual std::shared_ptr<KAAccountSetupInput> _input() const;

    /// @name For subclasses: the settings (empty for nil), the text under one of their keys (null for nothing and for
    /// values of other types), whether the provider is of a type, and its account-list plug-in (null when there is none)
    /// @{
    [[nodiscard]] QVariantMap settings() const { return _settings.value_or(QVariantMap()); }
    [[nodiscard]] QString settingsText(const QString &key) const;
    [[nodiscard]] bool providerIs(const QString &providerType) const;
    [[nodiscard]] KAAListPlugin *accountListPlugin() const;
    /// @}

    /// Whether a name is no address. A missing one counts as an address, so that it stays missing.
    [[nodiscard]] static bool isBareName(const QString &name) { return !name.isNull() && !name.contains(u'@'); }

    /// Sets what all inputs have in common: going on through errors, the password, and the description under this key.
    void fillIn(KAAccountSetupInput &input, const QString &descriptionKey) const;

private:
    void letGoOfPlugin();

    [[nodiscard]] QString pluginIdentifier() const;
    [[nodiscard]] bool _warnAboutMigrationSyncIfNecessary() const;
    [[nodiscard]] bool _enableBrondelService();
    [[nodiscard]] std::shared_ptr<KAAccountSetupResult> discover(const std::shared_ptr<KAAccountSetupInput> &input);
    [[nodiscard]] bool waitForTurn();
    void waitForReport();
    void endWait(const QString &reason, const KAError &error = {});
    bool failed(const QString &reason, const KAError &error = {});

    const std::optional<QVariantMap> _settings;
    const QPointer<KADataPlugin> _plugin;
    std::shared_ptr<KAAccountSetupResult> _result;
    std::shared_ptr<KAProvider> _provider;
    QString _corvaneID;
    std::atomic<bool> _waiting = false;  // cleared by whichever thread reports, seen by the one that waits

    mutable std::mutex m_mutex;  // of the result and of what follows
    QString m_failureReason;
    KAError m_failureError;
    QString m_createdAccountUID;
    bool m_hasLetGo = false;  // of the plug-in, on the way out
    /// What tells its turns apart. _plugin is not asked for it: where another thread is just destroying the plug-in, what
    /// is left has no address of this class any more.
    const KADataPlugin *const m_pluginAddress;
};

/// Makes accounts of the mail client.
class KAVELL_ACCOUNTS_EXPORT KAMailAccountCreator : public KAAccountCreator {
    Q_OBJECT

public:
    [[nodiscard]] static std::shared_ptr<KAMailAccountCreator>
    initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin);
    ~KAMailAccountCreator() override;

protected:
    using KAAccountCreator::KAAccountCreator;

    /// A KAMailAccountSetupInput. Without an address in the settings it is made of the user name and the domain that the
    /// provider's account-list plug-in names; when that fails too, a line in the log warns and the input has none.
    [[nodiscard]] std::shared_ptr<KAAccountSetupInput> _input() const override;
};

/// Makes accounts of the calendar client.
class KAVELL_ACCOUNTS_EXPORT KATidewellAccountCreator : public KAAccountCreator {
    Q_OBJECT

public:
    [[nodiscard]] static std::shared_ptr<KATidewellAccountCreator>
    initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin);
    ~KATidewellAccountCreator() override;

protected:
    using KAAccountCreator::KAAccountCreator;

    /// A KACalDAVAccountSetupInput.
    [[nodiscard]] std::shared_ptr<KAAccountSetupInput> _input() const override;
};

/// Makes accounts of the contacts client.
class KAVELL_ACCOUNTS_EXPORT KACardellAccountCreator : public KAAccountCreator {
    Q_OBJECT

public:
    [[nodiscard]] static std::shared_ptr<KACardellAccountCreator>
    initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin);
    ~KACardellAccountCreator() override;

protected:
    using KAAccountCreator::KAAccountCreator;

    /// A KACardDAVAccountSetupInput.
    [[nodiscard]] std::shared_ptr<KAAccountSetupInput> _input() const override;
};

/// Makes accounts of the chat client.
class KAVELL_ACCOUNTS_EXPORT KAParlexAccountCreator : public KAAccountCreator {
    Q_OBJECT

public:
    [[nodiscard]] static std::shared_ptr<KAParlexAccountCreator>
    initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin);
    ~KAParlexAccountCreator() override;

protected:
    using KAAccountCreator::KAAccountCreator;

    /// A KAChatAccountSetupInput.
    [[nodiscard]] std::shared_ptr<KAAccountSetupInput> _input() const override;
};

#endif
