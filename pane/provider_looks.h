// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How providers look: name and icon, from the plug-in where there is one. User-interface thread only.

#ifndef KAVELL_PANE_PROVIDER_LOOKS_H
#define KAVELL_PANE_PROVIDER_LOOKS_H

#include <exception>
#include <memory>

#include <QtCore/QString>
#include <QtGui/QIcon>

class KAAListPlugin;
class KAAccount;
class KAPlugin;

namespace kavell::pane {

/// What the user knows a provider by: the plug-in's name, else the name of a well-known type, else the type itself.
[[nodiscard]] QString providerTitle(const QString &providerType, const KAAListPlugin *plugin);

/// What the user is told when a plug-in's own code failed: its name and the reason.
[[nodiscard]] QString pluginFailure(const KAPlugin &plugin, const std::exception &error);

/// The brand icon: the icon file of the plug-in's bundle, else a generic network icon. Never null. Kept after the first
/// call for a plug-in.
[[nodiscard]] QIcon brandIcon(const KAAListPlugin *plugin);

/// What the plug-in shows for one account; its brand icon when it shows nothing, or fails.
[[nodiscard]] QIcon accountIcon(KAAListPlugin *plugin, const std::shared_ptr<KAAccount> &account);

}  // namespace kavell::pane

#endif
