// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What went wrong: a domain, a code within it, and information for programs and people. A value, freely copied; the
// default-constructed one is no error.

#ifndef KAVELLACCOUNTS_KAERROR_H
#define KAVELLACCOUNTS_KAERROR_H

#include <QtCore/QMetaType>
#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAExport.h>

class KAVELL_ACCOUNTS_EXPORT KAError {
public:
    KAError() = default;
    KAError(const QString &domain, qint64 code, const QVariantMap &userInformation = {});

    /// Null for no error.
    [[nodiscard]] const QString &domain() const { return m_domain; }
    [[nodiscard]] qint64 code() const { return m_code; }
    [[nodiscard]] const QVariantMap &userInformation() const { return m_userInformation; }

    /// Whether this is no error.
    [[nodiscard]] bool isNull() const { return m_domain.isNull(); }

    /// The text under `localizedDescriptionKey` when there is one, else "Error DOMAIN CODE"; "(null)" for no error.
    [[nodiscard]] QString description() const;

    /// @name Keys of the user information
    /// @{
    static const QString localizedDescriptionKey;  ///< QString, a sentence for people
    static const QString failingURLKey;            ///< QUrl that could not be loaded
    static const QString peerCertificateChainKey;  ///< QList<QSslCertificate>, the server's own certificate first
    /// @}

private:
    QString m_domain;
    qint64 m_code = 0;
    QVariantMap m_userInformation;
};

Q_DECLARE_METATYPE(KAError)

#endif
