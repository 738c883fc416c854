// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account-list plug-in and a data plug-in that their information dictionary describes (plugin_directory.h).

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAProvider.h>

namespace {

/// The provider that the bundle's information dictionary names; null when it names none.
std::shared_ptr<KAProvider> describedProvider(const KABundle &bundle)
{
    const QVariantMap information = bundle.infoDictionary();
    const QString type = information.value(QStringLiteral("TestProviderType")).toString();
    if (type.isEmpty())
        return nullptr;
    const std::shared_ptr<KAProvider> provider = KAProvider::initWithProviderType(type);
    provider->setServiceTypesProvided(information.value(QStringLiteral("TestServiceTypes")).toStringList());
    return provider;
}

}  // namespace

class ConfigurableListPlugin : public KAAListPlugin {
public:
    using KAAListPlugin::KAAListPlugin;

    void pluginDidLoad() override { setProvider(describedProvider(*bundle())); }

    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &account) override
    {
        QImage image(account ? 2 : 1, 1, QImage::Format_RGB32);
        image.fill(Qt::green);
        return image;
    }
};

class ConfigurableDataPlugin : public KADataPlugin {
public:
    using KADataPlugin::KADataPlugin;

    void pluginDidLoad() override { setProvider(describedProvider(*bundle())); }

    [[nodiscard]] QVariantMap settingsForAccountUID(const QString &uid) override
    {
        return property("settingsByUID").toMap().value(uid).toMap();
    }

    [[nodiscard]] QStringList accountUIDs() override { return property("settingsByUID").toMap().keys(); }
};

#ifdef KAVELL_LIST_BUNDLE
KA_EXPORT_PLUGIN(ConfigurableListPlugin)
#else
KA_EXPORT_PLUGIN(ConfigurableDataPlugin)
#endif
