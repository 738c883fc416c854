// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The library's own domain of the user's preferences, "com.corvane.kavellaccounts": one property-list file below the
// user's configuration directory that all processes share. Written key by key, so two processes that set different keys
// both keep theirs. Single reads and writes are safe from any thread.

#ifndef KAVELLACCOUNTS_KADEFAULTS_H
#define KAVELLACCOUNTS_KADEFAULTS_H

#include <memory>

#include <QtCore/QString>
#include <QtCore/QVariant>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAVELL_ACCOUNTS_EXPORT KADefaults : public KAObject {
public:
    /// The process's instance, made on the first call, which must not be raced.
    [[nodiscard]] static std::shared_ptr<KADefaults> shared();

    /// Reads what is on the disk. Synchronises once more when it goes.
    KADefaults();
    ~KADefaults() override;

    /// Null when there is none.
    [[nodiscard]] QVariant objectForKey(const QString &key) const;

    /// Not on the disk before synchronize. A value that a property list cannot hold is refused with a line in the log.
    void setObject(const QVariant &object, const QString &key);
    void removeObjectForKey(const QString &key);

    /// Writes what was set here since the last time over what the file holds, and reads what others wrote. Blocks on
    /// the disk, and for at most 10 seconds on another process that is writing. False, with a line in the log, when it
    /// could not; what was set is then kept for the next time.
    bool synchronize();
};

#endif
