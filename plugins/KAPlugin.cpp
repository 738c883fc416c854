// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAPlugin.h>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAProvider.h>

#include "model/settings_reading.h"
#include "platform/qt/workspace.h"

namespace {

const QString kBundleNameKey = QStringLiteral("KABundleName");

}  // namespace

KAPlugin::KAPlugin(std::shared_ptr<KABundle> bundle) : _bundle(std::move(bundle))
{
}

KAPlugin::~KAPlugin() = default;

std::shared_ptr<KABundle> KAPlugin::bundle() const
{
    const std::lock_guard lock(m_mutex);
    return _bundle;
}

// The setters let go of the former object outside the lock, since its destructor may ask the plug-in.
void KAPlugin::setBundle(std::shared_ptr<KABundle> bundle)
{
    const std::lock_guard lock(m_mutex);
    _bundle.swap(bundle);
}

std::shared_ptr<KAAccount> KAPlugin::account() const
{
    const std::lock_guard lock(m_mutex);
    return _account;
}

void KAPlugin::setAccount(std::shared_ptr<KAAccount> account)
{
    const std::lock_guard lock(m_mutex);
    _account.swap(account);
}

std::shared_ptr<KAProvider> KAPlugin::provider() const
{
    const std::lock_guard lock(m_mutex);
    return _provider;
}

void KAPlugin::setProvider(std::shared_ptr<KAProvider> provider)
{
    const std::lock_guard lock(m_mutex);
    _provider.swap(provider);
}

std::set<int> KAPlugin::specialPluginBehaviors() const
{
    return {};
}

QImage KAPlugin::imageForAccount(const std::shared_ptr<KAAccount> &account)
{
    if (auto *dataPlugin = qobject_cast<KADataPlugin *>(this))
        return dataPlugin->imageForAccountUID(account ? account->uid() : QString());
    return kavell::genericNetworkIcon();
}

QString KAPlugin::identifier() const
{
    const std::shared_ptr<KABundle> own = bundle();
    return own ? own->bundleIdentifier() : QString();
}

QString KAPlugin::userVisibleProviderName() const
{
    const std::shared_ptr<KABundle> own = bundle();
    if (!own)
        return {};
    if (QString localized = own->localizedInfoForKey(kBundleNameKey); !localized.isNull())
        return localized;
    const QString plain = kavell::textForKey(own->infoDictionary(), kBundleNameKey);
    return plain.isNull() ? identifier() : plain;
}

void KAPlugin::willSelectAccount(const std::shared_ptr<KAAccount> &)
{
}

void KAPlugin::pluginDidLoad()
{
}

void KAPlugin::describeFields(KAFieldList &fields) const
{
    fields.add("_bundle", bundle());
    fields.add("_account", account());
    fields.add("_provider", provider());
    KAObject::describeFields(fields);
}
