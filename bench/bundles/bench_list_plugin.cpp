// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account-list plug-in that plugin_bench copies: the least that a real one has.

#include <kavellaccounts/KAAListPlugin.h>

class BenchListPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    using KAAListPlugin::KAAListPlugin;
};

KA_EXPORT_PLUGIN(BenchListPlugin)

#include "bench_list_plugin.moc"
