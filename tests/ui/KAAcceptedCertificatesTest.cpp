// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Accepted chains against a real TLS server on the loopback, with throw-away keys made by each run.

#include <kavellaccounts/KACertificatePanel.h>

#include <thread>
#include <vector>

#include <QtCore/QCoreApplication>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkProxy>
#include <QtNetwork/QNetworkReply>
#include <QtNetwork/QSslSocket>
#include <QtNetwork/QTcpServer>
#include <QtTest/QSignalSpy>

#include <gtest/gtest.h>

#include "tests/ui/tls_identity.h"

namespace {

using kavell::test::contentsOfFile;
using kavell::test::Identity;
using kavell::test::runOpenSsl;
using kavell::test::selfSigned;

/// Servers of one private authority, each with the authority's certificate behind its own. All are called 127.0.0.1 and
/// localhost, so that nothing but the authority is wrong with them.
QList<Identity> ofOneAuthority(int count)
{
    const QTemporaryDir directory;
    const QStringList newKey{"-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes"};
    runOpenSsl(directory.path(), QStringList{"req", "-x509"} + newKey +
                                     QStringList{"-days", "2", "-subj", "/CN=Authority", "-keyout", "authority.key",
                                                 "-out", "authority.pem"});
    QFile names(directory.filePath("names"));
    EXPECT_TRUE(names.open(QIODevice::WriteOnly));
    names.write("subjectAltName=IP:127.0.0.1,DNS:localhost\n");
    names.close();
    QList<Identity> servers;
    for (int number = 0; number < count; ++number) {
        runOpenSsl(directory.path(),
                   QStringList{"req", "-new"} + newKey +
                       QStringList{"-subj", "/CN=localhost", "-keyout", "key.pem", "-out", "request"});
        runOpenSsl(directory.path(),
                   {"x509", "-req", "-in", "request", "-CA", "authority.pem", "-CAkey", "authority.key",
                    "-CAcreateserial", "-days", "2", "-extfile", "names", "-out", "certificate.pem"});
        servers.append({QSslKey(contentsOfFile(directory.filePath("key.pem")), QSsl::Ec),
                        QSslCertificate(contentsOfFile(directory.filePath("certificate.pem"))),
                        {QSslCertificate(contentsOfFile(directory.filePath("authority.pem")))}});
    }
    return servers;
}

/// Answers every request with "hello" behind TLS, and hangs up unless it is to keep its connections.
class TlsServer : public QTcpServer {
public:
    explicit TlsServer(Identity identity, bool keepsConnections = false)
        : m_identity(std::move(identity)), m_keepsConnections(keepsConnections)
    {
        listen(QHostAddress::LocalHost);
    }

    /// From here on, it shows another certificate.
    void become(const Identity &identity) { m_identity = identity; }

    /// From here on, every request is answered with the way to another place.
    void redirectTo(const QString &location) { m_location = location.toUtf8(); }

    [[nodiscard]] int connections() const { return m_connections; }
    [[nodiscard]] int requests() const { return m_requests; }

protected:
    void incomingConnection(qintptr descriptor) override
    {
        ++m_connections;
        auto *socket = new QSslSocket(this);
        socket->setSocketDescriptor(descriptor);
        socket->setPrivateKey(m_identity.key);
        socket->setLocalCertificateChain(m_identity.chain());
        QObject::connect(socket, &QSslSocket::readyRead, socket, [this, socket, keeps = m_keepsConnections] {
            socket->readAll();
            ++m_requests;
            socket->write(m_location.isEmpty()
                              ? QByteArray("HTTP/1.1 200 OK\r\nContent-Length: 5\r\n")
                              : "HTTP/1.1 302 Found\r\nContent-Length: 5\r\nLocation: " + m_location + "\r\n");
            socket->write(keeps ? "\r\nhello" : "Connection: close\r\n\r\nhello");
            if (!keeps)
                socket->disconnectFromHost();
        });
        socket->startServerEncryption();
    }

private:
    Identity m_identity;
    bool m_keepsConnections;
    QByteArray m_location;
    int m_connections = 0;
    int m_requests = 0;
};

/// What the manager gets from the server; empty when the connection is refused.
QByteArray fetchedBy(QNetworkAccessManager &manager, const TlsServer &server, const QString &host)
{
    QNetworkReply *reply =
        manager.get(QNetworkRequest(QUrl(QStringLiteral("https://%1:%2/").arg(host).arg(server.serverPort()))));
    QSignalSpy finished(reply, &QNetworkReply::finished);
    if (!reply->isFinished())
        finished.wait(5000);
    return reply->readAll();
}

/// The same, by a watched manager of its own.
QByteArray fetched(const TlsServer &server, const QString &host)
{
    QNetworkAccessManager manager;
    manager.setProxy(QNetworkProxy::NoProxy);
    KAAcceptedCertificates::watch(&manager);
    return fetchedBy(manager, server, host);
}

// Each test has hosts of its own, as an acceptance lasts as long as the process: names of the loopback network.

TEST(KAAcceptedCertificatesTest, AnAcceptedChainConnects)
{
    const Identity identity = selfSigned("one.example");
    const TlsServer server(identity);
    EXPECT_EQ(fetched(server, "127.0.0.1"), "");
    KAAcceptedCertificates::accept("127.0.0.1", {identity.certificate});
    EXPECT_EQ(fetched(server, "127.0.0.1"), "hello");
}

TEST(KAAcceptedCertificatesTest, AnotherChainAtTheSameHostIsRefused)
{
    KAAcceptedCertificates::accept("127.0.0.1", {selfSigned("two.example").certificate});
    const TlsServer impostor(selfSigned("two.example"));
    EXPECT_EQ(fetched(impostor, "127.0.0.1"), "");
}

TEST(KAAcceptedCertificatesTest, TheSameChainAtAnotherHostIsRefused)
{
    const Identity identity = selfSigned("three.example");
    const TlsServer server(identity);
    KAAcceptedCertificates::accept("127.0.0.1", {identity.certificate});
    EXPECT_EQ(fetched(server, "localhost"), "");
    EXPECT_EQ(fetched(server, "127.0.0.1"), "hello");
}

TEST(KAAcceptedCertificatesTest, AnAcceptanceEndsTheConnectionsThatAManagerKeeps)
{
    const Identity identity = selfSigned("kept.example");
    const TlsServer server(identity, true);
    KAAcceptedCertificates::accept("127.0.0.1", {identity.certificate});
    QNetworkAccessManager manager;
    manager.setProxy(QNetworkProxy::NoProxy);
    KAAcceptedCertificates::watch(&manager);
    KAAcceptedCertificates::watch(&manager);
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "hello");
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "hello");
    EXPECT_EQ(server.connections(), 1);

    KAAcceptedCertificates::accept("127.0.0.1", {selfSigned("other.example").certificate});
    QCoreApplication::processEvents();
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "");
    EXPECT_EQ(server.connections(), 2);
}

TEST(KAAcceptedCertificatesTest, ManagersComeAndGoWhileOtherThreadsAccept)
{
    const QList<QSslCertificate> chain{selfSigned("threads.example").certificate};
    constexpr int rounds = 200;
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number)
        threads.emplace_back([&chain] {
            for (int round = 0; round < rounds; ++round) {
                QNetworkAccessManager manager;
                KAAcceptedCertificates::watch(&manager);
                KAAcceptedCertificates::accept("threads.example", chain);
            }
        });
    for (std::thread &thread : threads)
        thread.join();
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("threads.example", chain));
}

TEST(KAAcceptedCertificatesTest, AWatchedSocketHonoursAcceptance)
{
    const Identity identity = selfSigned("four.example");
    const TlsServer server(identity);
    for (const bool accepted : {false, true}) {
        if (accepted)
            KAAcceptedCertificates::accept("localhost", {identity.certificate});
        QSslSocket socket;
        socket.setProxy(QNetworkProxy::NoProxy);
        KAAcceptedCertificates::watch(&socket);
        QSignalSpy encrypted(&socket, &QSslSocket::encrypted);
        QSignalSpy ended(&socket, &QAbstractSocket::disconnected);
        socket.connectToHostEncrypted("localhost", server.serverPort(), QIODevice::ReadWrite,
                                      QAbstractSocket::IPv4Protocol);
        (accepted ? encrypted : ended).wait(5000);
        EXPECT_EQ(socket.isEncrypted(), accepted);
    }
}

TEST(KAAcceptedCertificatesTest, AnAcceptanceDoesNotFollowARedirectionToAnotherHost)
{
    const Identity identity = selfSigned("redirected.example");
    const TlsServer target(identity);
    TlsServer origin(identity);
    origin.redirectTo(QStringLiteral("https://localhost:%1/").arg(target.serverPort()));
    KAAcceptedCertificates::accept("127.0.0.1", {identity.certificate});
    EXPECT_EQ(fetched(origin, "127.0.0.1"), "");
    EXPECT_EQ(target.connections(), 1);
    EXPECT_EQ(target.requests(), 0);

    KAAcceptedCertificates::accept("localhost", {identity.certificate});
    EXPECT_EQ(fetched(origin, "127.0.0.1"), "hello");
}

TEST(KAAcceptedCertificatesTest, AnotherServerOfTheSameAuthorityIsRefusedAfterARedirection)
{
    const QList<Identity> identities = ofOneAuthority(2);
    const TlsServer target(identities[1]);
    TlsServer origin(identities[0]);
    origin.redirectTo(QStringLiteral("https://localhost:%1/").arg(target.serverPort()));
    KAAcceptedCertificates::accept("127.0.0.1", identities[0].chain());
    EXPECT_EQ(fetched(origin, "127.0.0.1"), "");
    EXPECT_EQ(target.connections(), 1);
    EXPECT_EQ(target.requests(), 0);
}

TEST(KAAcceptedCertificatesTest, AnotherServerOfTheSameAuthorityIsRefusedWhenAManagerConnectsAgain)
{
    const QList<Identity> identities = ofOneAuthority(2);
    TlsServer server(identities[0]);
    KAAcceptedCertificates::accept("127.0.0.1", identities[0].chain());
    QNetworkAccessManager manager;
    manager.setProxy(QNetworkProxy::NoProxy);
    KAAcceptedCertificates::watch(&manager);
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "hello");
    const int requests = server.requests();
    server.become(identities[1]);
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "");
    EXPECT_EQ(server.requests(), requests);
    server.become(identities[0]);
    EXPECT_EQ(fetchedBy(manager, server, "127.0.0.1"), "hello");
}

TEST(KAAcceptedCertificatesTest, AnotherServerOfTheSameAuthorityIsRefusedWhenASocketConnectsAgain)
{
    const QList<Identity> identities = ofOneAuthority(2);
    TlsServer server(identities[0]);
    KAAcceptedCertificates::accept("localhost", identities[0].chain());
    QSslSocket socket;
    socket.setProxy(QNetworkProxy::NoProxy);
    KAAcceptedCertificates::watch(&socket);
    for (const int number : {0, 1, 0}) {
        server.become(identities[number]);
        QSignalSpy encrypted(&socket, &QSslSocket::encrypted);
        QSignalSpy ended(&socket, &QAbstractSocket::disconnected);
        socket.connectToHostEncrypted("localhost", server.serverPort(), QIODevice::ReadWrite,
                                      QAbstractSocket::IPv4Protocol);
        (number == 0 ? encrypted : ended).wait(5000);
        EXPECT_EQ(encrypted.count(), number == 0 ? 1 : 0) << qPrintable(socket.errorString());
        socket.abort();
    }
}

TEST(KAAcceptedCertificatesTest, AnInternationalHostIsOneInBothOfItsForms)
{
    const QList<QSslCertificate> chain{selfSigned("six.example").certificate};
    KAAcceptedCertificates::accept(QUrl("https://xn--bcher-kva.example/").host(), chain);
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("xn--bcher-kva.example", chain));
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted(QStringLiteral(u"B\u00DCcher.example"), chain));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("bucher.example", chain));
}

TEST(KAAcceptedCertificatesTest, AddressesAndUnusualNamesAreHostsToo)
{
    const QList<QSslCertificate> chain{selfSigned("seven.example").certificate};
    for (const char *host : {"::1", "fe80::1%eth0", "mail_host.example"}) {
        EXPECT_FALSE(KAAcceptedCertificates::isAccepted(host, chain)) << host;
        KAAcceptedCertificates::accept(host, chain);
        EXPECT_TRUE(KAAcceptedCertificates::isAccepted(host, chain)) << host;
    }
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("::2", chain));
}

TEST(KAAcceptedCertificatesTest, HostsAreComparedInAnyCase)
{
    const QList<QSslCertificate> chain{selfSigned("five.example").certificate};
    KAAcceptedCertificates::accept("Five.Example", chain);
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("five.EXAMPLE", chain));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("five.example", {chain.first(), chain.first()}));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("five.example", {}));
}

}  // namespace
