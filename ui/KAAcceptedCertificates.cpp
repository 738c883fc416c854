// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KACertificatePanel.h>

#include <algorithm>
#include <mutex>

#include <QtCore/QCryptographicHash>
#include <QtCore/QHash>
#include <QtCore/QObject>
#include <QtCore/QUrl>
#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkReply>
#include <QtNetwork/QSslSocket>

#include "ui/acceptance_news.h"

namespace {

/// The property that marks a manager that is watched already.
constexpr char kWatched[] = "_kavellWatchedForAcceptedCertificates";

struct Acceptances {
    std::mutex mutex;
    QHash<QByteArray, QByteArray> chains;  ///< by keyOf the host
    kavell::AcceptanceNews news;
};

Acceptances &acceptances()
{
    static auto *const all = new Acceptances;  // never destroyed: managers may outlive the library's statics
    return *all;
}

/// One key for the spellings of a host: URLs show the letters of an international name, while a socket may be given the
/// form that the name system knows. An address, or what is no proper name, stands for itself.
QByteArray keyOf(const QString &host)
{
    const QByteArray wireForm = QUrl::toAce(host);
    return (wireForm.isEmpty() ? host.toUtf8() : wireForm).toLower();
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

/// Which errors a connection goes on through: these when the chain is accepted for the host, else none. The toolkit
/// keeps what was once ignored for as long as a reply is redirected and a connection is made anew, and another chain can
/// have the same errors: those of an unknown authority. So a refusal says so, too, by an error that no connection has;
/// an empty list would leave a reply's connection with what it has.
QList<QSslError> ignorable(const QString &host, const QList<QSslCertificate> &chain, const QList<QSslError> &errors)
{
    return KAAcceptedCertificates::isAccepted(host, chain) ? errors : QList{QSslError(QSslError::NoError)};
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
        all.chains.insert(keyOf(host), fingerprint(chain));
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
    const auto found = all.chains.constFind(keyOf(host));
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
                         const auto chain = reply->sslConfiguration().peerCertificateChain();
                         reply->ignoreSslErrors(ignorable(reply->url().host(), chain, errors));
                     });
}

void KAAcceptedCertificates::watch(QSslSocket *socket)
{
    QObject::connect(socket, &QSslSocket::sslErrors, socket, [socket](const QList<QSslError> &errors) {
        const QString verified = socket->peerVerifyName();
        const QString host = verified.isEmpty() ? socket->peerName() : verified;
        socket->ignoreSslErrors(ignorable(host, socket->peerCertificateChain(), errors));
    });
}
