// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KACertificatePanel.h>

#include <algorithm>
#include <mutex>

#include <QtCore/QCryptographicHash>
#include <QtCore/QHash>
#include <QtCore/QObject>
#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkReply>
#include <QtNetwork/QSslSocket>

#include "ui/acceptance_news.h"

namespace {

/// The property that marks a manager that is watched already.
constexpr char kWatched[] = "_kavellWatchedForAcceptedCertificates";

struct Acceptances {
    std::mutex mutex;
    QHash<QString, QByteArray> chains;  ///< by lower-case host
    kavell::AcceptanceNews news;
};

Acceptances &acceptances()
{
    static auto *const all = new Acceptances;  // never destroyed: managers may outlive the library's statics
    return *all;
}

/// One value for a chain: each certificate counts, with its length, so that no two chains run into the same bytes.
QByteArray fingerprint(const QList<QSslCertificate> &chain)
{
    QCryptographicHash hash(QCryptographicHash::Sha256);
    for (const QSslCertificate &certificate : chain) {
        const QByteArray der = certificate.toDer();
        hash.addData(QByteArray::number(der.size()) + ':');
        hash.addData(der);
    }
    return hash.result();
}

/// A host, and a chain that holds certificates only.
bool isComplete(const QString &host, const QList<QSslCertificate> &chain)
{
    return !host.isEmpty() && !chain.isEmpty() &&
           std::none_of(chain.begin(), chain.end(), [](const auto &certificate) { return certificate.isNull(); });
}

}  // namespace

void KAAcceptedCertificates::accept(const QString &host, const QList<QSslCertificate> &chain)
{
    if (!isComplete(host, chain))
        return;
    Acceptances &all = acceptances();
    {
        const std::lock_guard lock(all.mutex);
        all.chains.insert(host.toLower(), fingerprint(chain));
    }
    // Not under the lock: the toolkit takes locks of its own to reach another thread's objects.
    emit all.news.changed();
}

bool KAAcceptedCertificates::isAccepted(const QString &host, const QList<QSslCertificate> &chain)
{
    if (!isComplete(host, chain))
        return false;
    Acceptances &all = acceptances();
    const std::lock_guard lock(all.mutex);
    const auto found = all.chains.constFind(host.toLower());
    return found != all.chains.constEnd() && *found == fingerprint(chain);
}

void KAAcceptedCertificates::watch(QNetworkAccessManager *manager)
{
    if (manager->property(kWatched).toBool())
        return;
    manager->setProperty(kWatched, true);
    // A kept connection would go on with what was agreed to before.
    QObject::connect(&acceptances().news, &kavell::AcceptanceNews::changed, manager,
                     &QNetworkAccessManager::clearConnectionCache, Qt::QueuedConnection);
    QObject::connect(manager, &QNetworkAccessManager::sslErrors, manager,
                     [](QNetworkReply *reply, const QList<QSslError> &errors) {
                         if (isAccepted(reply->url().host(), reply->sslConfiguration().peerCertificateChain()))
                             reply->ignoreSslErrors(errors);
                     });
}

void KAAcceptedCertificates::watch(QSslSocket *socket)
{
    QObject::connect(socket, &QSslSocket::sslErrors, socket, [socket](const QList<QSslError> &errors) {
        const QString verified = socket->peerVerifyName();
        if (isAccepted(verified.isEmpty() ? socket->peerName() : verified, socket->peerCertificateChain()))
            socket->ignoreSslErrors(errors);
    });
}
