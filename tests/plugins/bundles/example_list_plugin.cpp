// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

// A well-behaved account-list plug-in; its bundle has strings, localised information and a domains file.

#include <kavellaccounts/KAAListPlugin.h>

class ExampleListPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    explicit ExampleListPlugin(std::shared_ptr<KABundle> bundle) : KAAListPlugin(std::move(bundle)) {}

    void pluginDidLoad() override { setProperty("didLoadCount", property("didLoadCount").toInt() + 1); }
};

KA_EXPORT_PLUGIN(ExampleListPlugin)

#include "example_list_plugin.moc"
