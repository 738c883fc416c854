// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Throw-away keys and certificates, made by the openssl command at each run. Blocks while that works.

#ifndef KAVELL_TESTS_UI_TLS_IDENTITY_H
#define KAVELL_TESTS_UI_TLS_IDENTITY_H

#include <QtCore/QFile>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtNetwork/QSslCertificate>
#include <QtNetwork/QSslKey>

#include <gtest/gtest.h>

namespace kavell::test {

/// What a server shows, and the key that proves it.
struct Identity {
    QSslKey key;
    QSslCertificate certificate;
    QList<QSslCertificate> authorities{};

    [[nodiscard]] QList<QSslCertificate> chain() const { return QList{certificate} + authorities; }
};

inline QByteArray contentsOfFile(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

/// Runs the openssl command in a directory; a failed expectation when it fails.
inline void runOpenSsl(const QString &directory, const QStringList &arguments)
{
    QProcess maker;
    maker.setWorkingDirectory(directory);
    maker.start("openssl", arguments);
    EXPECT_TRUE(maker.waitForFinished());
    EXPECT_EQ(maker.exitCode(), 0) << maker.readAllStandardError().toStdString();
}

/// An identity that nobody but itself vouches for.
inline Identity selfSigned(const QString &host)
{
    const QTemporaryDir directory;
    runOpenSsl(directory.path(),
               {"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes", "-days", "2",
                "-subj", "/CN=" + host, "-keyout", "key.pem", "-out", "certificate.pem"});
    Identity identity{QSslKey(contentsOfFile(directory.filePath("key.pem")), QSsl::Ec),
                      QSslCertificate(contentsOfFile(directory.filePath("certificate.pem")))};
    EXPECT_FALSE(identity.key.isNull());
    EXPECT_FALSE(identity.certificate.isNull());
    return identity;
}

}  // namespace kavell::test

#endif
