// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// plugin_client IDENTIFIER [ADDRESS]: says what the account-list plug-in of an identifier says of itself, or makes an
// account of the address in a data plug-in, deactivates and deletes it, and says what became of it.

#include <iostream>

#include <QtCore/QCoreApplication>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

namespace {

int useDataPlugin(KADataPlugin &plugin, const QString &address)
{
    const auto creator = KAMailAccountCreator::initWithSettings(QVariantMap{{KAMailEmailAddressKey, address}}, &plugin);
    creator->setProvider(KAProvider::initWithProviderType("com.example.account.zorbo"));
    if (!creator->create())
        return 1;
    const QString uid = plugin.accountUIDs().value(0);
    const auto setting = [&](const QString &key) {
        return plugin.settingsForAccountUID(uid).value(key);
    };
    std::cout << "made " << setting(KAMailEmailAddressKey).toString().toStdString() << '\n';
    plugin.deactivateAccountUID(uid);
    if (setting(KAMailInactiveAccountKey).toBool())
        std::cout << "inactive\n";
    plugin.deleteAccountUID(uid);
    if (plugin.accountUIDs().isEmpty())
        std::cout << "deleted\n";
    return 0;
}

}  // namespace

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    KAPlugin *const found = KAPluginManager::shared()->pluginWithIdentifier(application.arguments().value(1));
    if (auto *const dataPlugin = qobject_cast<KADataPlugin *>(found))
        return useDataPlugin(*dataPlugin, application.arguments().value(2));
    auto *const plugin = qobject_cast<KAAListPlugin *>(found);
    if (!plugin) {
        std::cout << "no plug-in\n";
        return 0;
    }
    std::cout << plugin->identifier().toStdString() << '\n' << plugin->brandName().toStdString() << '\n';
    if (plugin->supportsDomain("mail.zorbo.example"))
        std::cout << "serves mail.zorbo.example\n";
    std::cout << plugin->bundle()->bundlePath().toStdString() << '\n';
}
