// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAError.h>

#include <kavellaccounts/KADescription.h>

const QString KAError::localizedDescriptionKey = QStringLiteral("KALocalizedDescription");
const QString KAError::failingURLKey = QStringLiteral("KAFailingURL");
const QString KAError::peerCertificateChainKey = QStringLiteral("KAPeerCertificateChain");

KAError::KAError(const QString &domain, qint64 code, const QVariantMap &userInformation)
    : m_domain(domain), m_code(code), m_userInformation(userInformation)
{
}

QString KAError::description() const
{
    if (isNull())
        return KADescription(nullptr);
    const QString sentence = m_userInformation.value(localizedDescriptionKey).toString();
    return sentence.isEmpty() ? QStringLiteral("Error ") + m_domain + u' ' + QString::number(m_code) : sentence;
}
