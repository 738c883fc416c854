// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The dialog that shows a server's certificate chain and asks whether to go on. Accepted means to go on. User-interface
// thread only.

#ifndef KAVELL_UI_CERTIFICATE_PANEL_H
#define KAVELL_UI_CERTIFICATE_PANEL_H

#include <QtCore/QList>
#include <QtNetwork/QSslCertificate>
#include <QtWidgets/QDialog>

class QTextEdit;
class QTreeWidget;

namespace kavell {

/// All that the panel says, in the user's language.
struct CertificatePanelTexts {
    QString message;
    QString informative;  ///< none when empty
    QString continueButton;
    QString cancelButton;
    QString helpButton;
    QString help;
    QString chainName;    ///< of the list of certificates, for screen readers
    QString detailsName;  ///< of their details
    QString subject, issuer, validFrom, validUntil, names, fingerprint;
};

class CertificatePanel : public QDialog {
public:
    CertificatePanel(const CertificatePanelTexts &texts, const QList<QSslCertificate> &chain);
    ~CertificatePanel() override;

private:
    void addMessages();
    void addChain();
    void addButtons();
    void addDetails();
    void showDetails(const QSslCertificate &certificate);

    const CertificatePanelTexts m_texts;
    const QList<QSslCertificate> m_chain;
    QTreeWidget *m_tree = nullptr;
    QTextEdit *m_details = nullptr;
};

}  // namespace kavell

#endif
