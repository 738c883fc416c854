// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The process's one plug-in manager, for tests that want a fresh registry. Made by KAPluginManager::shared.

#ifndef KAVELL_PLUGINS_KAPLUGINMANAGER_P_H
#define KAVELL_PLUGINS_KAPLUGINMANAGER_P_H

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAPluginManager.h>

KAVELL_ACCOUNTS_EXPORT extern KAPluginManager *gSharedKAPluginManager;

#endif
