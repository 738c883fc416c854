// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KACertificatePanel.h>

#include <algorithm>

#include <QtCore/QUrl>
#include <QtWidgets/QApplication>

#include <kavellaccounts/KABundle.h>

#include "platform/qt/log.h"
#include "platform/qt/main_thread.h"
#include "ui/certificate_panel.h"

namespace {

struct CodeText {
    qint64 code;
    const char *key;
};

/// What each code of a failed load means for the user; of the error, only the code counts.
constexpr CodeText kInformativeTexts[] = {
    {-1204, "CERT_NOT_YET_VALID_ERROR"},
    {-1203, "CERT_UNKNOWN_ROOT_ERROR"},
    {-1202, "CERT_UNTRUSTED_ERROR"},
    {-1201, "CERT_BAD_DATE_ERROR"},
};

QString localized(const char *key)
{
    const auto bundle = KABundle::libraryBundle();
    return bundle ? bundle->localizedString(QString::fromLatin1(key), QLatin1String("")) : QString();
}

/// A format with its arguments, which may hold placeholders of their own; a text without placeholders as it is.
QString formatted(const QString &format, const QString &first, const QString &second)
{
    QString text;
    for (qsizetype at = 0; at < format.size(); ++at) {
        const QStringView rest = QStringView(format).sliced(at);
        if (rest.startsWith(u"%1") || rest.startsWith(u"%2"))
            text += format[++at] == QLatin1Char('1') ? first : second;
        else
            text += format[at];
    }
    return text;
}

kavell::CertificatePanelTexts textsFor(const KAError &error, const QString &title, const QString &host)
{
    kavell::CertificatePanelTexts texts;
    texts.message = formatted(localized("CERT_ERROR_TITLE"), title, host);
    const auto *const row = std::find_if(std::begin(kInformativeTexts), std::end(kInformativeTexts),
                                         [&](const CodeText &one) { return one.code == error.code(); });
    if (row != std::end(kInformativeTexts))
        texts.informative = formatted(localized(row->key), host, {});
    texts.continueButton = localized("CONTINUE");
    texts.cancelButton = localized("CANCEL");
    texts.helpButton = localized("CERT_PANEL_HELP");
    texts.help = localized("CERT_PANEL_HELP_TEXT");
    texts.chainName = localized("CERT_PANEL_CHAIN");
    texts.detailsName = localized("CERT_PANEL_DETAILS");
    texts.subject = localized("CERT_PANEL_SUBJECT");
    texts.issuer = localized("CERT_PANEL_ISSUER");
    texts.validFrom = localized("CERT_PANEL_VALID_FROM");
    texts.validUntil = localized("CERT_PANEL_VALID_UNTIL");
    texts.names = localized("CERT_PANEL_NAMES");
    texts.fingerprint = localized("CERT_PANEL_FINGERPRINT");
    return texts;
}

bool refused(const QString &reason)
{
    kavell::log(reason);
    return false;
}

}  // namespace

bool KAShowCertificatePanelForError(const KAError &error, const QString &title)
{
    const QUrl url = error.userInformation().value(KAError::failingURLKey).toUrl();
    const QVariant peerChain = error.userInformation().value(KAError::peerCertificateChainKey);
    if (url.isEmpty() || !peerChain.canConvert<QList<QSslCertificate>>())
        return refused(QStringLiteral("*** Error object %1 in unexpected format.").arg(error.description()));
    const QString host = url.host();
    if (host.isEmpty())
        return refused(QStringLiteral("*** SSL policy creation failed: the URL names no host."));
    const auto chain = peerChain.value<QList<QSslCertificate>>();
    if (chain.isEmpty())
        return refused(QStringLiteral("*** Trust creation failed: the chain holds no certificate."));
    if (std::any_of(chain.begin(), chain.end(), [](const auto &certificate) { return certificate.isNull(); }))
        return refused(QStringLiteral("*** Trust creation failed: the chain holds what is no certificate."));
    if (!qobject_cast<QApplication *>(QCoreApplication::instance()))
        return refused(QStringLiteral("*** Certificate panel not shown: the program has no user interface."));

    bool accepted = false;
    kavell::runOnMainThread([&] {
        kavell::CertificatePanel panel(textsFor(error, title, host), chain);
        accepted = panel.exec() == QDialog::Accepted;
    });
    if (accepted)
        KAAcceptedCertificates::accept(host, chain);
    return accepted;
}
