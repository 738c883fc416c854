// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Accepted chains against a real TLS server on the loopback, with throw-away keys made by each run.

#include <kavellaccounts/KACertificatePanel.h>

#include <thread>
#include <vector>

#include <QtCore/QCoreApplication>
#include <QtCore/QFile>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtNetwork/QNetworkAccessManager>
#include <QtNetwork/QNetworkProxy>
#include <QtNetwork/QNetworkReply>
#include <QtNetwork/QSslKey>
#include <QtNetwork/QSslSocket>
#include <QtNetwork/QTcpServer>
#include <QtTest/QSignalSpy>

#include <gtest/gtest.h>

namespace {

struct Identity {
    QSslKey key;
    QSslCertificate certificate;
};

QByteArray contents(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

Identity selfSigned(const QString &host)
{
    const QTemporaryDir directory;
    const QString key = directory.filePath("key.pem");
    const QString certificate = directory.filePath("certificate.pem");
    QProcess maker;
    maker.start("openssl", {"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes",
                            "-days", "2", "-subj", "/CN=" + host, "-keyout", key, "-out", certificate});
    EXPECT_TRUE(maker.waitForFinished());
    Identity identity{QSslKey(contents(key), QSsl::Ec), QSslCertificate(contents(certificate))};
    EXPECT_FALSE(identity.key.isNull());
    EXPECT_FALSE(identity.certificate.isNull());
    return identity;
}

/// Answers every request with "hello" behind TLS, and hangs up unless it is to keep its connections.
class TlsServer : public QTcpServer {
public:
    explicit TlsServer(Identity identity, bool keepsConnections = false)
        : m_identity(std::move(identity)), m_keepsConnections(keepsConnections)
    {
        listen(QHostAddress::LocalHost);
    }

    [[nodiscard]] int connections() const { return m_connections; }

protected:
    void incomingConnection(qintptr descriptor) override
    {
        ++m_connections;
        auto *socket = new QSslSocket(this);
        socket->setSocketDescriptor(descriptor);
        socket->setPrivateKey(m_identity.key);
        socket->setLocalCertificate(m_identity.certificate);
        QObject::connect(socket, &QSslSocket::readyRead, socket, [socket, keeps = m_keepsConnections] {
            socket->readAll();
            socket->write("HTTP/1.1 200 OK\r\nContent-Length: 5\r\n");
            socket->write(keeps ? "\r\nhello" : "Connection: close\r\n\r\nhello");
            if (!keeps)
                socket->disconnectFromHost();
        });
        socket->startServerEncryption();
    }

private:
    Identity m_identity;
    bool m_keepsConnections;
    int m_connections = 0;
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

TEST(KAAcceptedCertificatesTest, HostsAreComparedInAnyCase)
{
    const QList<QSslCertificate> chain{selfSigned("five.example").certificate};
    KAAcceptedCertificates::accept("Five.Example", chain);
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("five.EXAMPLE", chain));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("five.example", {chain.first(), chain.first()}));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("five.example", {}));
}

}  // namespace
