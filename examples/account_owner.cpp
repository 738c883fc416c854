// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// account_owner ADDRESS: which plug-in serves an address, which accounts its provider has, and which of them a mail
// program's account with that address belongs to. Plug-ins are found through VESK_FRAMEWORK_PATH.

#include <QtCore/QTextStream>
#include <QtWidgets/QApplication>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

int main(int argc, char **argv)
{
    const QApplication application(argc, argv);
    QTextStream out(stdout);
    const QStringList arguments = QApplication::arguments();
    if (arguments.size() != 2) {
        out << "usage: account_owner ADDRESS\n";
        return 2;
    }
    KAPluginManager *const manager = KAPluginManager::shared();
    const QVariantMap settings{{KAMailEmailAddressKey, arguments.at(1)}};
    const QString pluginID = KAAccount::aListPluginIDForSettings(settings);
    KAPlugin *const plugin = manager->pluginWithIdentifier(pluginID);
    if (!plugin || !plugin->provider()) {
        out << "no plug-in serves " << arguments.at(1) << "\n";
        return 1;
    }
    out << pluginID << " (" << plugin->userVisibleProviderName() << ")\n";
    const auto match = manager->matchingAListAccountForAccountSettings(settings, kKAMailPluginID);
    for (const auto &account : plugin->provider()->accounts()) {
        const bool matches = match && match->uid() == account->uid();
        out << (matches ? " * " : "   ") << account->loginName() << "  " << account->fullName() << "\n";
    }
    return 0;
}
