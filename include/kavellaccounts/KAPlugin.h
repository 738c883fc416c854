// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The base of all plug-ins. A plug-in is a bundle (KABundle.h) whose principal class derives from KAAListPlugin or
// KADataPlugin and is exported with KA_EXPORT_PLUGIN; the plug-in manager makes one object of it, calls pluginDidLoad,
// registers it, and keeps it for the life of the process on the main thread.

#ifndef KAVELLACCOUNTS_KAPLUGIN_H
#define KAVELLACCOUNTS_KAPLUGIN_H

#include <memory>
#include <mutex>
#include <set>

#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtGui/QImage>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAAccount;
class KABundle;
class KAProvider;

/// Exports the factory of a plug-in's principal class, which takes its bundle: once, in one source file, outside any
/// namespace, with the name that "KABundlePrincipalClass" has.
#define KA_EXPORT_PLUGIN(ClassName)                                                                                    \
    extern "C" __attribute__((visibility("default")))                                                                  \
    KAPlugin *KAPluginFactory_##ClassName(const std::shared_ptr<KABundle> &bundle);                                    \
    KAPlugin *KAPluginFactory_##ClassName(const std::shared_ptr<KABundle> &bundle)                                     \
    {                                                                                                                  \
        return new ClassName(bundle);                                                                                  \
    }

class KAVELL_ACCOUNTS_EXPORT KAPlugin : public QObject, public KAObject {
    Q_OBJECT

public:
    explicit KAPlugin(std::shared_ptr<KABundle> bundle);
    ~KAPlugin() override;

    /// @name The bundle, and the account and provider that the plug-in works on, set by whoever drives it. Any thread
    /// @{
    [[nodiscard]] std::shared_ptr<KABundle> bundle() const;
    void setBundle(std::shared_ptr<KABundle> bundle);
    [[nodiscard]] std::shared_ptr<KAAccount> account() const;
    void setAccount(std::shared_ptr<KAAccount> account);
    [[nodiscard]] std::shared_ptr<KAProvider> provider() const;
    void setProvider(std::shared_ptr<KAProvider> provider);
    /// @}

    /// Numbers of special behaviours that the plug-in wants of the application that hosts it, which alone interprets
    /// them; none by default.
    [[nodiscard]] virtual std::set<int> specialPluginBehaviors() const;

    /// The picture of an account: a data plug-in's own for the account's UID, else a generic network icon.
    [[nodiscard]] virtual QImage imageForAccount(const std::shared_ptr<KAAccount> &account);

    /// The bundle's identifier, such as "com.corvane.mail.kaplugin".
    [[nodiscard]] QString identifier() const;

    /// The bundle's name in the user's language, else its plain name, else the identifier.
    [[nodiscard]] virtual QString userVisibleProviderName() const;

    /// For the hosting application to call before it selects one of the plug-in's accounts; does nothing.
    virtual void willSelectAccount(const std::shared_ptr<KAAccount> &account);

    /// Called once the object is made, just before it is registered; does nothing. Plug-ins set their provider here.
    virtual void pluginDidLoad();

    void describeFields(KAFieldList &fields) const override;

private:
    mutable std::mutex m_mutex;  // of the three fields
    std::shared_ptr<KABundle> _bundle;
    std::shared_ptr<KAAccount> _account;
    std::shared_ptr<KAProvider> _provider;
};

#endif
