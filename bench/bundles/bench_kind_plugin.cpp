// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account-list plug-in that pane_bench copies: its provider type is its identifier.

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

class BenchKindPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    using KAAListPlugin::KAAListPlugin;

    void pluginDidLoad() override
    {
        const auto provider = KAProvider::initWithProviderType(bundle()->bundleIdentifier());
        provider->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCalDAV, kKAServiceCardDAV, kKAServiceIM});
        setProvider(provider);
    }

    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &) override
    {
        QImage image(48, 48, QImage::Format_RGB32);
        image.fill(Qt::darkGreen);
        return image;
    }
};

KA_EXPORT_PLUGIN(BenchKindPlugin)

#include "bench_kind_plugin.moc"
