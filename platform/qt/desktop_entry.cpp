// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/desktop_entry.h"

#include <QtCore/QFile>
#include <QtCore/QFileInfo>
#include <QtCore/QLocale>
#include <QtCore/QStringList>

namespace kavell {

namespace {

constexpr qint64 kLargestEntry = 1024 * 1024;

QString unescaped(const QString &value)
{
    QString text;
    for (qsizetype index = 0; index < value.size(); ++index) {
        if (value.at(index) != u'\\' || index + 1 == value.size()) {
            text += value.at(index);
            continue;
        }
        switch (value.at(++index).unicode()) {
        case 's':
            text += u' ';
            break;
        case 'n':
            text += u'\n';
            break;
        case 't':
            text += u'\t';
            break;
        case 'r':
            text += u'\r';
            break;
        default:
            text += value.at(index);
        }
    }
    return text;
}

/// The keys of the translated Name, best first: "Name[de_AT]", "Name[de]".
QStringList localizedNameKeys()
{
    QStringList keys;
    const QStringList languages = QLocale::system().uiLanguages();
    for (QString language : languages) {
        language.replace(u'-', u'_');
        keys += QStringLiteral("Name[%1]").arg(language);
        keys += QStringLiteral("Name[%1]").arg(language.section(u'_', 0, 0));
    }
    return keys;
}

}  // namespace

std::optional<DesktopEntry> readDesktopEntry(const QString &path)
{
    // To open a pipe would wait for somebody who writes to it.
    QFile file(path);
    if (!QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly) || file.size() > kLargestEntry)
        return std::nullopt;
    const QStringList lines = QString::fromUtf8(file.readAll()).split(u'\n');
    QMap<QString, QString> values;
    bool inGroup = false;
    bool found = false;
    for (const QString &line : lines) {
        const QString trimmed = line.trimmed();
        if (trimmed.startsWith(u'[')) {
            inGroup = trimmed == QLatin1String("[Desktop Entry]");
            found = found || inGroup;
        } else if (const qsizetype equals = trimmed.indexOf(u'='); inGroup && equals > 0 && !trimmed.startsWith(u'#')) {
            values.insert(trimmed.first(equals).trimmed(), unescaped(trimmed.sliced(equals + 1).trimmed()));
        }
    }
    if (!found)
        return std::nullopt;

    DesktopEntry entry;
    entry.name = values.value(QStringLiteral("Name"));
    entry.localizedName = entry.name;
    entry.icon = values.value(QStringLiteral("Icon"));
    entry.hidden = values.value(QStringLiteral("Hidden")) == QLatin1String("true");
    const QStringList keys = localizedNameKeys();
    for (const QString &key : keys) {
        if (values.contains(key)) {
            entry.localizedName = values.value(key);
            break;
        }
    }
    return entry;
}

}  // namespace kavell
