// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/provider_looks.h"

#include <array>
#include <exception>

#include <QtCore/QFileInfo>
#include <QtCore/QHash>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>

namespace kavell::pane {

namespace {

struct TitleRow {
    const QString &providerType;
    const char *key;
};

const std::array<TitleRow, 13> kTitles{{
    {kKAProviderYahoo, QT_TRID_NOOP("PROVIDER_YAHOO")},
    {kKAProviderGoogle, QT_TRID_NOOP("PROVIDER_GOOGLE")},
    {kKAProviderNimbrel, QT_TRID_NOOP("PROVIDER_NIMBREL")},
    {kKAProviderQuillane, QT_TRID_NOOP("PROVIDER_QUILLANE")},
    {kKAProviderFacebook, QT_TRID_NOOP("PROVIDER_FACEBOOK")},
    {kKAProviderExchange, QT_TRID_NOOP("PROVIDER_EXCHANGE")},
    {kKAProviderAOL, QT_TRID_NOOP("PROVIDER_AOL")},
    {kKAProviderMail, QT_TRID_NOOP("PROVIDER_MAIL")},
    {kKAProviderCardell, QT_TRID_NOOP("PROVIDER_CARDELL")},
    {kKAProviderParlex, QT_TRID_NOOP("PROVIDER_PARLEX")},
    {kKAProviderTidewell, QT_TRID_NOOP("PROVIDER_TIDEWELL")},
    {kKAProviderHaldenServer, QT_TRID_NOOP("PROVIDER_HALDEN_SERVER")},
    {kKAProviderTest, QT_TRID_NOOP("PROVIDER_TEST")},
}};

/// The network icon that every plug-in has which shows nothing of its own.
QIcon genericIcon()
{
    static const QIcon icon = [] {
        KAPlugin plain(nullptr);
        return QIcon(QPixmap::fromImage(plain.imageForAccount(nullptr)));
    }();
    return icon;
}

QIcon readBrandIcon(const KAAListPlugin &plugin)
{
    const std::shared_ptr<KABundle> bundle = plugin.bundle();
    const QString file =
        bundle ? bundle->infoDictionary().value(QStringLiteral("KABundleIconFile")).toString() : QString();
    const QString path = file.isEmpty() ? QString() : bundle->pathForResource(file, QString());
    const QIcon icon = path.isNull() ? QIcon() : QIcon(path);
    return icon.availableSizes().isEmpty() && icon.pixmap(16).isNull() ? genericIcon() : icon;
}

}  // namespace

QString providerTitle(const QString &providerType, const KAAListPlugin *plugin)
{
    if (plugin)
        return plugin->userVisibleProviderName();
    for (const TitleRow &row : kTitles) {
        if (row.providerType == providerType)
            return qtTrId(row.key);
    }
    return providerType;
}

QString pluginFailure(const KAPlugin &plugin, const std::exception &error)
{
    return qtTrId("PLUGIN_FAILED").arg(plugin.userVisibleProviderName(), QString::fromUtf8(error.what()));
}

QIcon brandIcon(const KAAListPlugin *plugin)
{
    if (!plugin)
        return genericIcon();
    static QHash<const KAAListPlugin *, QIcon> icons;  // registered plug-ins stay
    auto icon = icons.find(plugin);
    if (icon == icons.end())
        icon = icons.insert(plugin, readBrandIcon(*plugin));
    return *icon;
}

QIcon accountIcon(KAAListPlugin *plugin, const std::shared_ptr<KAAccount> &account)
{
    if (plugin && account) {
        try {
            const QImage image = plugin->imageForAccount(account);
            if (!image.isNull())
                return QIcon(QPixmap::fromImage(image));
        } catch (const std::exception &) {
            // A plug-in without the method is shown by its brand.
        }
    }
    return brandIcon(plugin);
}

}  // namespace kavell::pane
