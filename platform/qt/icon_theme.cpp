// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Looking an icon's file up in the user's icon theme (freedesktop Icon Theme Specification 0.13). The toolkit gives
// pictures of theme icons but not their files.

#include <cstdlib>
#include <limits>

#include <QtCore/QDir>
#include <QtCore/QFileInfo>
#include <QtCore/QSet>
#include <QtCore/QSettings>
#include <QtCore/QStandardPaths>
#include <QtGui/QIcon>

#include "platform/qt/desktop_entry.h"

namespace kavell {

namespace {

constexpr int kWantedSize = 64;
constexpr qsizetype kMostThemes = 64;
const char *const kExtensions[] = {"png", "svg", "xpm"};

struct Candidate {
    QString path;
    int distance = std::numeric_limits<int>::max();
};

/// How far a theme directory's icons are from the wanted size; scalable ones always fit.
int sizeDistance(QSettings &theme, const QString &directory)
{
    theme.beginGroup(directory);
    const QString type = theme.value(QStringLiteral("Type")).toString();
    const int size = theme.value(QStringLiteral("Size")).toInt() * theme.value(QStringLiteral("Scale"), 1).toInt();
    theme.endGroup();
    return type == QLatin1String("Scalable") ? 0 : std::abs(size - kWantedSize);
}

void considerDirectory(const QString &path, const QString &icon, int distance, Candidate &best)
{
    if (distance >= best.distance)
        return;
    for (const char *extension : kExtensions) {
        const QString file = QStringLiteral("%1/%2.%3").arg(path, icon, QLatin1String(extension));
        if (QFileInfo::exists(file)) {
            best = {file, distance};
            return;
        }
    }
}

/// The best file of one theme in all places where it may be spread, else of the themes that it inherits from. None of a
/// theme that was looked at before, since themes may inherit from each other, many times over, nor of one too many.
QString fileInTheme(const QString &themeName, const QString &icon, QSet<QString> &looked)
{
    if (themeName.isEmpty() || looked.contains(themeName) || looked.size() >= kMostThemes)
        return {};
    looked.insert(themeName);
    Candidate best;
    QStringList parents;
    QStringList directories;
    std::unique_ptr<QSettings> theme;
    const QStringList places = QIcon::themeSearchPaths();
    for (const QString &place : places) {
        const QString index = QStringLiteral("%1/%2/index.theme").arg(place, themeName);
        if (!theme && QFileInfo::exists(index)) {
            theme = std::make_unique<QSettings>(index, QSettings::IniFormat);
            directories = theme->value(QStringLiteral("Icon Theme/Directories")).toStringList();
            parents = theme->value(QStringLiteral("Icon Theme/Inherits")).toStringList();
        }
    }
    for (const QString &directory : directories) {
        const int distance = sizeDistance(*theme, directory);
        for (const QString &place : places)
            considerDirectory(QStringLiteral("%1/%2/%3").arg(place, themeName, directory), icon, distance, best);
    }
    for (const QString &parent : parents) {
        if (best.path.isNull())
            best.path = fileInTheme(parent, icon, looked);
    }
    return best.path;
}

QString fileInPixmaps(const QString &icon)
{
    Candidate best;
    const QStringList places = QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation);
    for (const QString &place : places)
        considerDirectory(place + QLatin1String("/pixmaps"), icon, 0, best);
    return best.path;
}

}  // namespace

QString iconFileForName(const QString &icon)
{
    if (icon.isEmpty())
        return {};
    if (QDir::isAbsolutePath(icon))
        return QFileInfo::exists(icon) ? icon : QString();
    if (icon.contains(u'/'))
        return {};
    QSet<QString> looked;
    QString file = fileInTheme(QIcon::themeName(), icon, looked);
    if (file.isNull())
        file = fileInTheme(QStringLiteral("hicolor"), icon, looked);
    return file.isNull() ? fileInPixmaps(icon) : file;
}

}  // namespace kavell
