// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where the example keeps an application's accounts: one JSON file.
//
//     { "accounts": { "UID": { "emailAddress": "ada@example.net", … }, … } }
//
// What to take from it, whatever your application keeps its accounts in: several processes and threads load a data
// plug-in at once, so that every change reads what is there, alters it and saves it under one lock; a reader never sees
// half a file, since a save makes a new one and renames it; and a file that cannot be understood is never overwritten
// before a copy of it was put aside. Passwords do not belong here but in the credential store. Any thread may call.

#ifndef EXAMPLES_FILE_DATA_PLUGIN_ACCOUNT_FILE_H
#define EXAMPLES_FILE_DATA_PLUGIN_ACCOUNT_FILE_H

#include <functional>

#include <QtCore/QMap>
#include <QtCore/QString>
#include <QtCore/QVariantMap>

/// The settings of each account, by its UID.
using Accounts = QMap<QString, QVariantMap>;

/// Why the file could not be read or saved. `detail` is the system's or the parser's reason.
struct FileProblem {
    enum class Kind {
        None,
        Busy,        ///< somebody else has held the lock for too long
        Unreadable,  ///< it is there, but the system does not let it be read
        Damaged,     ///< it is not what is written here
        NotCopied,   ///< it is damaged, and no copy of it could be made
        Unwritable,
    };
    Kind kind = Kind::None;
    QString detail;

    explicit operator bool() const { return kind != Kind::None; }
};

class AccountFile {
public:
    explicit AccountFile(QString path);

    [[nodiscard]] const QString &path() const { return m_path; }

    /// Reads the accounts; a missing file has none. With a problem, `accounts` is empty.
    [[nodiscard]] FileProblem read(Accounts *accounts) const;

    /// Lets `change` alter the accounts and saves them. A damaged file is put aside as "NAME.damaged-TIME" and begun
    /// anew. With a problem, the file is as it was. Waits five seconds for the lock, at most.
    [[nodiscard]] FileProblem change(const std::function<void(Accounts &)> &change) const;

private:
    [[nodiscard]] FileProblem putAside() const;
    [[nodiscard]] FileProblem save(const Accounts &accounts) const;

    QString m_path;
};

#endif
