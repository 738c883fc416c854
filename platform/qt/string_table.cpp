// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/string_table.h"

#include <QtCore/QFile>
#include <QtCore/QLocale>
#include <QtCore/QStringList>
#include <QtCore/QTranslator>

namespace kavell {

namespace {

/// For each of the user's languages "de_AT" and other long names, then "de"; and English, which every bundle should
/// have, at the end.
QStringList languages()
{
    QStringList names;
    QString base;
    const QStringList wanted = QLocale::system().uiLanguages();
    for (QString language : wanted) {
        language.replace(u'-', u'_');
        // One language's long names ("zh_TW", "zh_Hant_TW") stand together; what they share comes after all of them.
        if (const QString own = language.section(u'_', 0, 0); own != base) {
            names += base;
            base = own;
        }
        for (; language.contains(u'_'); language.truncate(language.lastIndexOf(u'_')))
            names += language;
    }
    names += base;
    names += QStringLiteral("en");
    names.removeAll(QString());
    names.removeDuplicates();
    return names;
}

}  // namespace

StringTable::StringTable(QString directory, QString name) : m_directory(std::move(directory)), m_name(std::move(name))
{
}

StringTable::~StringTable() = default;

QString StringTable::textForKey(const QString &key) const
{
    std::call_once(m_read, [this] { readCatalogues(); });
    const QByteArray id = key.toUtf8();
    for (const std::unique_ptr<QTranslator> &catalogue : m_catalogues) {
        QString text = catalogue->translate(nullptr, id.constData());
        if (!text.isNull())
            return text;
    }
    return {};
}

void StringTable::readCatalogues() const
{
    const QStringList names = languages();
    for (const QString &language : names) {
        const QString path = QStringLiteral("%1/%2_%3.qm").arg(m_directory, m_name, language);
        auto catalogue = std::make_unique<QTranslator>();
        // Asked for first, since the toolkit itself would fall back to a shorter file name.
        if (QFile::exists(path) && catalogue->load(path))
            m_catalogues.push_back(std::move(catalogue));
    }
}

}  // namespace kavell
