// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A search directory with plug-in bundles of a test's own making, and a fresh registry that searches it alone. The bundles
// are copies of two that the build makes; their information dictionary says which provider and services they have:
//
//     PluginDirectory plugins;
//     plugins.addListPlugin({.identifier = kKAGooglePluginID, .providerType = kKAProviderGoogle, .domains = {"gmail."}});
//     KAPluginManager::shared()->pluginIDForDomain(…)
//
// One at a time; main thread.

#ifndef KAVELL_TESTS_SUPPORT_PLUGIN_DIRECTORY_H
#define KAVELL_TESTS_SUPPORT_PLUGIN_DIRECTORY_H

#include <QtCore/QStringList>
#include <QtCore/QTemporaryDir>
#include <QtCore/QVariantMap>

class KADataPlugin;

namespace kavell::test {

struct PluginDescription {
    QString identifier;
    QString providerType{};      ///< of the provider that the plug-in sets; null for none
    QStringList serviceTypes{};  ///< that this provider offers
    QStringList domains{};       ///< of the "domains" file
    bool exact = true;           ///< whether they are whole domains and not labels
};

class PluginDirectory {
public:
    PluginDirectory();
    ~PluginDirectory();
    PluginDirectory(const PluginDirectory &) = delete;
    PluginDirectory &operator=(const PluginDirectory &) = delete;

    [[nodiscard]] QString path() const { return m_directory.path(); }

    /// Copies a bundle into the directory under its identifier.
    void addListPlugin(const PluginDescription &description);
    void addDataPlugin(const PluginDescription &description);

    /// What a data plug-in of this directory reports for an account of its application.
    static void setSettings(KADataPlugin *plugin, const QString &accountUID, const QVariantMap &settings);

private:
    void addBundle(const char *original, const PluginDescription &description);
    QTemporaryDir m_directory;
};

}  // namespace kavell::test

#endif
