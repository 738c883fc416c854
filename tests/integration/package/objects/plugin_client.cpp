// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// plugin_client IDENTIFIER: says what the plug-in of an identifier says of itself.

#include <iostream>

#include <QtCore/QCoreApplication>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAPluginManager.h>

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    KAPlugin *const found = KAPluginManager::shared()->pluginWithIdentifier(application.arguments().value(1));
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
