// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The texts of a bundle in the user's language, by key: compiled catalogues NAME_LANGUAGE.qm with ids, one per
// language, in one directory. Used by KABundle. Any thread may look texts up; the files are read on the first look-up.

#ifndef KAVELL_PLATFORM_QT_STRING_TABLE_H
#define KAVELL_PLATFORM_QT_STRING_TABLE_H

#include <memory>
#include <mutex>
#include <vector>

#include <QtCore/QString>

class QTranslator;

namespace kavell {

class StringTable {
public:
    StringTable(QString directory, QString name);
    ~StringTable();

    /// The text of the first of the user's languages that has one, else the English one; null when there is none.
    [[nodiscard]] QString textForKey(const QString &key) const;

private:
    void readCatalogues() const;

    const QString m_directory;
    const QString m_name;
    mutable std::once_flag m_read;
    mutable std::vector<std::unique_ptr<QTranslator>> m_catalogues;  // best language first
};

}  // namespace kavell

#endif
