// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Asks the user whether to trust a server whose certificate failed verification, and makes later connections to that
// server accept exactly the certificate chain that was agreed to, for the life of the process. Any thread may call.

#ifndef KAVELLACCOUNTS_KACERTIFICATEPANEL_H
#define KAVELLACCOUNTS_KACERTIFICATEPANEL_H

#include <QtCore/QList>
#include <QtCore/QString>
#include <QtNetwork/QSslCertificate>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAExport.h>

class QNetworkAccessManager;
class QSslSocket;

/// Shows the prompt for an error that carries KAError::failingURLKey and KAError::peerCertificateChainKey, and waits
/// for the user, without a bound; from another thread than the main one, for the main event loop, too. True when the
/// user chose to continue: the chain is then accepted for the host. False, with a line in the log, for an error without
/// URL or chain, a URL without host, a chain that is empty or has an entry that is no certificate, or in a program
/// without a QApplication. False, too, when the program ends before the main event loop came to it.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT bool KAShowCertificatePanelForError(const KAError &error, const QString &title);

/// The chains that were accepted, and the connections that are to honour them.
class KAVELL_ACCOUNTS_EXPORT KAAcceptedCertificates {
public:
    KAAcceptedCertificates() = delete;

    /// Accepts this chain for this host, in place of one that was accepted before. Watched managers forget their
    /// connections.
    static void accept(const QString &host, const QList<QSslCertificate> &chain);

    /// Whether exactly this chain is accepted for the host (in any case of letters, and with international
    /// letters or their encoded form).
    [[nodiscard]] static bool isAccepted(const QString &host, const QList<QSslCertificate> &chain);

    /// @name From here on, the connection goes on through verification errors when its host and chain are accepted. At
    /// any other it takes back what earlier handlers of the same error ignored; handlers connected later have the last
    /// word. Called on the object's thread.
    /// @{
    static void watch(QNetworkAccessManager *manager);
    static void watch(QSslSocket *socket);
    /// @}
};

#endif
