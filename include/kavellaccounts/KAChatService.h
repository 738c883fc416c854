// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One chat service that a chat plug-in offers, and which fields its form shows. A plain value with getters and setters,
// shared by pointer; used by one thread at a time.

#ifndef KAVELLACCOUNTS_KACHATSERVICE_H
#define KAVELLACCOUNTS_KACHATSERVICE_H

#include <memory>

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

/// A chat service.
class KAVELL_ACCOUNTS_EXPORT KAChatService : public KAObject {
public:
    /// A service whose form shows the user name and the password, and nothing else yet.
    [[nodiscard]] static std::shared_ptr<KAChatService> initWithIdentifier(const QString &identifier);
    ~KAChatService() override;

    /// Identifier of the service.
    [[nodiscard]] QString identifier() const { return _identifier; }
    void setIdentifier(const QString &identifier) { _identifier = identifier; }

    /// Name of the service as the user sees it.
    [[nodiscard]] QString displayName() const { return _displayName; }
    void setDisplayName(const QString &displayName) { _displayName = displayName; }

    /// Label beside the domain part of the login.
    [[nodiscard]] QString domainLabel() const { return _domainLabel; }
    void setDomainLabel(const QString &domainLabel) { _domainLabel = domainLabel; }

    /// Label of the login field.
    [[nodiscard]] QString accountLabel() const { return _accountLabel; }
    void setAccountLabel(const QString &accountLabel) { _accountLabel = accountLabel; }

    /// Which fields the form has.
    [[nodiscard]] bool showUsernameField() const { return _showUsernameField; }
    void setShowUsernameField(bool showUsernameField) { _showUsernameField = showUsernameField; }
    [[nodiscard]] bool showPasswordField() const { return _showPasswordField; }
    void setShowPasswordField(bool showPasswordField) { _showPasswordField = showPasswordField; }
    [[nodiscard]] bool showServerHostField() const { return _showServerHostField; }
    void setShowServerHostField(bool showServerHostField) { _showServerHostField = showServerHostField; }
    [[nodiscard]] bool showServerPortField() const { return _showServerPortField; }
    void setShowServerPortField(bool showServerPortField) { _showServerPortField = showServerPortField; }
    [[nodiscard]] bool showUseSSLCheckbox() const { return _showUseSSLCheckbox; }
    void setShowUseSSLCheckbox(bool showUseSSLCheckbox) { _showUseSSLCheckbox = showUseSSLCheckbox; }
    [[nodiscard]] bool showKerberosCheckbox() const { return _showKerberosCheckbox; }
    void setShowKerberosCheckbox(bool showKerberosCheckbox) { _showKerberosCheckbox = showKerberosCheckbox; }

    void describeFields(KAFieldList &fields) const override;

protected:
    explicit KAChatService(const QString &identifier);

private:
    QString _identifier;
    QString _displayName;
    QString _domainLabel;
    QString _accountLabel;
    bool _showUsernameField = true;
    bool _showPasswordField = true;
    bool _showServerHostField = false;
    bool _showServerPortField = false;
    bool _showUseSSLCheckbox = false;
    bool _showKerberosCheckbox = false;
};

#endif
