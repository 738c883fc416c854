// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/plugin_directory.h"

#include <filesystem>
#include <stdexcept>

#include <QtCore/QFile>

#include <kavellaccounts/KADataPlugin.h>

#include "plugins/KAPluginManager_p.h"

namespace kavell::test {

namespace {

QString xmlStrings(const QStringList &texts)
{
    QString xml;
    for (const QString &text : texts)
        xml += QStringLiteral("<string>%1</string>").arg(text.toHtmlEscaped());
    return QStringLiteral("<array>%1</array>").arg(xml);
}

QString xmlEntry(const char *key, const QString &value)
{
    return QStringLiteral("<key>%1</key>%2").arg(QLatin1String(key), value);
}

QString xmlText(const QString &text)
{
    return QStringLiteral("<string>%1</string>").arg(text.toHtmlEscaped());
}

void writePropertyList(const QString &path, const QString &entries)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate))
        throw std::runtime_error("cannot write " + path.toStdString());
    file.write(QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                              "<plist version=\"1.0\"><dict>%1</dict></plist>\n")
                   .arg(entries)
                   .toUtf8());
}

void makeFreshRegistry()
{
    delete gSharedKAPluginManager;
    gSharedKAPluginManager = nullptr;
}

}  // namespace

PluginDirectory::PluginDirectory()
{
    qputenv("VESK_FRAMEWORK_PATH", m_directory.path().toUtf8());
    makeFreshRegistry();
}

PluginDirectory::~PluginDirectory()
{
    makeFreshRegistry();
    qunsetenv("VESK_FRAMEWORK_PATH");
}

void PluginDirectory::addListPlugin(const PluginDescription &description)
{
    addBundle("ConfigurableList", description);
}

void PluginDirectory::addDataPlugin(const PluginDescription &description)
{
    addBundle("ConfigurableData", description);
}

void PluginDirectory::addBundle(const char *original, const PluginDescription &description)
{
    const std::string source = std::string(KAVELL_CONFIGURABLE_BUNDLES "/").append(original).append(".kaplugin");
    const QString target = QStringLiteral("%1/%2").arg(path(), description.identifier);
    const QString bundle = target.endsWith(QLatin1String(".kaplugin")) ? target : target + QLatin1String(".kaplugin");
    std::filesystem::copy(source, bundle.toStdString(), std::filesystem::copy_options::recursive);

    QString information =
        xmlEntry("KABundleIdentifier", xmlText(description.identifier)) +
        xmlEntry("KABundleExecutable", xmlText(QStringLiteral("lib%1.so").arg(QLatin1String(original)))) +
        xmlEntry("KABundlePrincipalClass", xmlText(QLatin1String(original) + QLatin1String("Plugin"))) +
        xmlEntry("KAPluginVersion", QStringLiteral("<integer>1</integer>")) +
        xmlEntry("TestServiceTypes", xmlStrings(description.serviceTypes));
    if (!description.providerType.isNull())
        information += xmlEntry("TestProviderType", xmlText(description.providerType));
    writePropertyList(bundle + QLatin1String("/Contents/Info.plist"), information);

    QString domains = xmlEntry("domains", xmlStrings(description.domains));
    if (description.exact)
        domains += xmlEntry("match", QStringLiteral("<string>exact</string>"));
    writePropertyList(bundle + QLatin1String("/Contents/Resources/domains.plist"), domains);
}

void PluginDirectory::setSettings(KADataPlugin *plugin, const QString &accountUID, const QVariantMap &settings)
{
    QVariantMap all = plugin->property("settingsByUID").toMap();
    all.insert(accountUID, settings);
    plugin->setProperty("settingsByUID", all);
}

}  // namespace kavell::test
