// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/workspace.h"

#include <cstdlib>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QFileInfo>
#include <QtCore/QSet>
#include <QtCore/QStandardPaths>
#include <QtCore/QThread>
#include <QtGui/QGuiApplication>
#include <QtGui/QIcon>

#include <kavellaccounts/KABundle.h>

#include "platform/qt/desktop_entry.h"

// Outside the namespace, as the toolkit's macro wants it. The static library's linker would drop the icons otherwise.
static void makeIconsAvailable()
{
    Q_INIT_RESOURCE(kavell_icons);
}

namespace kavell {

namespace {

constexpr int kIconSize = 64;
const QString kBundleNameKey = QStringLiteral("KABundleName");
const QString kBundleIconKey = QStringLiteral("KABundleIconFile");
const QString kIconExtension = QStringLiteral(".icns");

QStringList entryDirectories()
{
    return QStandardPaths::standardLocations(QStandardPaths::ApplicationsLocation);
}

QStringList bundleDirectories()
{
    const char *const named = secure_getenv("KAVELL_APPLICATION_PATH");
    return QFile::decodeName(named).split(u':', Qt::SkipEmptyParts) + entryDirectories();
}

bool isEntry(const QString &path)
{
    return path.endsWith(QLatin1String(".desktop"));
}

QString bundlePath(const QString &name)
{
    const QStringList directories = bundleDirectories();
    for (const QString &directory : directories) {
        const QString path = QDir::cleanPath(QStringLiteral("%1/%2.app").arg(directory, name));
        if (QFileInfo(path).isDir())
            return path;
    }
    return {};
}

bool isShown(const QString &path)
{
    const std::optional<DesktopEntry> entry = readDesktopEntry(path);
    return entry && !entry->hidden;
}

QString entryPathByFileName(const QString &name)
{
    const QStringList directories = entryDirectories();
    for (const QString &directory : directories) {
        const QString path = QStringLiteral("%1/%2.desktop").arg(directory, name);
        if (QFileInfo::exists(path))
            return isShown(path) ? path : QString();
    }
    return {};
}

QString entryPathByName(const QString &name)
{
    QSet<QString> seen;  // the user's file takes the place of the system's of the same name, when it is hidden too
    const QStringList directories = entryDirectories();
    for (const QString &directory : directories) {
        const QFileInfoList files =
            QDir(directory).entryInfoList({QStringLiteral("*.desktop")}, QDir::Files, QDir::Name);
        for (const QFileInfo &file : files) {
            if (seen.contains(file.fileName()))
                continue;
            seen.insert(file.fileName());
            const std::optional<DesktopEntry> entry = readDesktopEntry(file.filePath());
            if (entry && !entry->hidden && entry->name == name)
                return file.filePath();
        }
    }
    return {};
}

/// The picture of the theme's first known icon, where the theme may be asked; else the library's own.
QImage genericIcon(const QStringList &themeNames, const QString &ownFile)
{
    const auto *application = qobject_cast<QGuiApplication *>(QCoreApplication::instance());
    if (application && QThread::currentThread() == application->thread()) {
        for (const QString &name : themeNames) {
            const QImage image = QIcon::fromTheme(name).pixmap(kIconSize).toImage();
            if (!image.isNull())
                return image;
        }
    }
    makeIconsAvailable();
    return QImage(ownFile);
}

}  // namespace

QString pathForApplication(const QString &name)
{
    if (name.isEmpty() || name.contains(u'/'))
        return {};
    QString path = bundlePath(name);
    if (path.isNull())
        path = entryPathByFileName(name);
    return path.isNull() ? entryPathByName(name) : path;
}

QString displayNameAtPath(const QString &path)
{
    if (isEntry(path)) {
        const std::optional<DesktopEntry> entry = readDesktopEntry(path);
        return entry ? entry->localizedName : QString();
    }
    const std::shared_ptr<KABundle> bundle = KABundle::bundleWithPath(path);
    if (!bundle)
        return {};
    const QString localized = bundle->localizedInfoForKey(kBundleNameKey);
    return localized.isEmpty() ? bundle->infoDictionary().value(kBundleNameKey).toString() : localized;
}

QString iconFileAtPath(const QString &path)
{
    if (isEntry(path)) {
        const std::optional<DesktopEntry> entry = readDesktopEntry(path);
        return entry ? iconFileForName(entry->icon) : QString();
    }
    const std::shared_ptr<KABundle> bundle = KABundle::bundleWithPath(path);
    QString name = bundle ? bundle->infoDictionary().value(kBundleIconKey).toString() : QString();
    if (name.isEmpty())
        return {};
    if (!name.contains(u'.'))
        name += kIconExtension;
    return QDir::cleanPath(QStringLiteral("%1/Contents/Resources/%2").arg(path, name));
}

QImage genericNetworkIcon()
{
    return genericIcon(
        {QStringLiteral("network-workgroup"), QStringLiteral("network-server"), QStringLiteral("folder-remote")},
        QStringLiteral(":/kavellaccounts/icons/network.png"));
}

QImage genericApplicationIcon()
{
    return genericIcon({QStringLiteral("application-x-executable"), QStringLiteral("application-default-icon")},
                       QStringLiteral(":/kavellaccounts/icons/application.png"));
}

}  // namespace kavell
