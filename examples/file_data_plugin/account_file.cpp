// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "account_file.h"

#include <mutex>

#include <QtCore/QDateTime>
#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QFileInfo>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtCore/QLockFile>
#include <QtCore/QSaveFile>

namespace {

constexpr int kLockMilliseconds = 5000;

const QString kAccountsKey = QStringLiteral("accounts");

/// Threads of this process wait here, without the pauses that a QLockFile makes between two looks at its file.
std::mutex &threadLock()
{
    static std::mutex lock;
    return lock;
}

FileProblem damaged(const QString &reason)
{
    return {FileProblem::Kind::Damaged, reason};
}

FileProblem parse(const QByteArray &text, Accounts *accounts)
{
    QJsonParseError error;
    const QJsonObject root = QJsonDocument::fromJson(text, &error).object();
    if (error.error != QJsonParseError::NoError)
        return damaged(error.errorString());
    const QJsonValue list = root.value(kAccountsKey);
    if (!list.isObject())
        return damaged(QStringLiteral("there is no \"%1\"").arg(kAccountsKey));
    const QJsonObject byUID = list.toObject();
    Accounts read;
    for (auto account = byUID.begin(); account != byUID.end(); ++account) {
        if (!account.value().isObject())
            return damaged(QStringLiteral("%1 is no account").arg(account.key()));
        read.insert(account.key(), account.value().toObject().toVariantMap());
    }
    *accounts = read;
    return {};
}

}  // namespace

AccountFile::AccountFile(QString path) : m_path(std::move(path))
{
}

FileProblem AccountFile::read(Accounts *accounts) const
{
    accounts->clear();
    QFile file(m_path);
    if (!file.exists())
        return {};
    if (!file.open(QIODevice::ReadOnly))
        return {FileProblem::Kind::Unreadable, file.errorString()};
    const QByteArray text = file.readAll();
    if (file.error() != QFileDevice::NoError)
        return {FileProblem::Kind::Unreadable, file.errorString()};
    return parse(text, accounts);
}

FileProblem AccountFile::change(const std::function<void(Accounts &)> &change) const
{
    const std::lock_guard threads(threadLock());
    if (!QDir().mkpath(QFileInfo(m_path).path()))
        return {FileProblem::Kind::Unwritable, QFileInfo(m_path).path()};
    QLockFile processes(m_path + QStringLiteral(".lock"));
    if (!processes.tryLock(kLockMilliseconds)) {
        const bool isHeld = processes.error() == QLockFile::LockFailedError;
        return {isHeld ? FileProblem::Kind::Busy : FileProblem::Kind::Unwritable, m_path};
    }
    Accounts before;
    if (const FileProblem problem = read(&before); problem.kind == FileProblem::Kind::Unreadable)
        return problem;
    else if (problem) {
        if (const FileProblem notCopied = putAside())
            return notCopied;
    }
    Accounts after = before;
    change(after);
    return after == before ? FileProblem() : save(after);
}

/// A copy, so that there is a file at its place at every moment, until the next save replaces it.
FileProblem AccountFile::putAside() const
{
    const QString time = QDateTime::currentDateTimeUtc().toString(QStringLiteral("yyyyMMdd-HHmmss-zzz"));
    const QString aside = QStringLiteral("%1.damaged-%2").arg(m_path, time);
    QFile file(m_path);
    return file.copy(aside) ? FileProblem() : FileProblem{FileProblem::Kind::NotCopied, file.errorString()};
}

FileProblem AccountFile::save(const Accounts &accounts) const
{
    QJsonObject byUID;
    for (auto account = accounts.begin(); account != accounts.end(); ++account)
        byUID.insert(account.key(), QJsonObject::fromVariantMap(account.value()));
    const QByteArray text = QJsonDocument(QJsonObject{{kAccountsKey, byUID}}).toJson();

    QSaveFile file(m_path);
    const bool isSaved = file.open(QIODevice::WriteOnly) &&
                         file.setPermissions(QFileDevice::ReadOwner | QFileDevice::WriteOwner) &&
                         file.write(text) == text.size() && file.commit();
    return isSaved ? FileProblem() : FileProblem{FileProblem::Kind::Unwritable, file.errorString()};
}
