// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account-list plug-in and a data plug-in that their information dictionary describes (plugin_directory.h).

#include <QtCore/QThread>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/support/scripted_data_plugin.h"

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

    /// The property "autodiscoverDomain", else the bundle's text.
    [[nodiscard]] QString autodiscoverDomain() const override
    {
        const QVariant domain = property("autodiscoverDomain");
        return domain.isValid() ? domain.toString() : KAAListPlugin::autodiscoverDomain();
    }

    /// For the services of the property "alertServices".
    [[nodiscard]] bool shouldShowMigrationSyncAlertForService(const QString &service) const override
    {
        return property("alertServices").toStringList().contains(service);
    }

    /// The property "alertAnswer"; adds the service to "alertsShown", on which thread to "alertThread".
    [[nodiscard]] bool showMigrationSyncAlertForService(const QString &service) override
    {
        setProperty("alertsShown", property("alertsShown").toStringList() + QStringList{service});
        setProperty("alertThread", QVariant::fromValue(QThread::currentThread()));
        return property("alertAnswer").toBool();
    }
};

class ConfigurableDataPlugin : public kavell::test::ScriptedDataPlugin {
public:
    using ScriptedDataPlugin::ScriptedDataPlugin;

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
