// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a data plug-in is handed when it is to set an account up: what the user typed, and how forgiving the set-up may
// be. One class for each kind of account. Plain values with getters and setters: what was never set is null, false
// or 0. Shared by pointer; used by one thread at a time.

#ifndef KAVELLACCOUNTS_KAACCOUNTSETUPINPUT_H
#define KAVELLACCOUNTS_KAACCOUNTSETUPINPUT_H

#include <memory>
#include <optional>

#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

/// The base of all inputs.
class KAVELL_ACCOUNTS_EXPORT KAAccountSetupInput : public KAObject {
public:
    /// Nothing set, with an empty context of its own.
    KAAccountSetupInput();
    ~KAAccountSetupInput() override;

    [[nodiscard]] QString password() const { return _password; }
    void setPassword(const QString &password) { _password = password; }

    /// How the user sees the account.
    [[nodiscard]] QString accountDescription() const { return _description; }
    void setAccountDescription(const QString &description) { _description = description; }

    /// User name or login.
    [[nodiscard]] QString userName() const { return _userName; }
    void setUserName(const QString &userName) { _userName = userName; }

    /// Defaults of automatic configuration, for the plug-in; empty when none are set.
    [[nodiscard]] QVariantMap autoconfigDefaults() const { return _autoconfigDefaults.value_or(QVariantMap()); }
    void setAutoconfigDefaults(const std::optional<QVariantMap> &defaults) { _autoconfigDefaults = defaults; }

    /// Scratch space that the plug-in fills between discovery and creation; shared with whoever holds it, never null.
    [[nodiscard]] std::shared_ptr<QVariantMap> context() const { return _context; }

    /// Whether the plug-in may go on past errors of discovery that are not fatal.
    [[nodiscard]] bool continueThroughError() const { return _continueThroughError; }
    void setContinueThroughError(bool continueThroughError) { _continueThroughError = continueThroughError; }

    /// Whether the plug-in may fall back to an unencrypted connection.
    [[nodiscard]] bool continueWithoutSSL() const { return _continueWithoutSSL; }
    void setContinueWithoutSSL(bool continueWithoutSSL) { _continueWithoutSSL = continueWithoutSSL; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _password;
    QString _description;
    QString _userName;
    std::optional<QVariantMap> _autoconfigDefaults;
    std::shared_ptr<QVariantMap> _context;
    bool _continueThroughError = false;
    bool _continueWithoutSSL = false;
};

/// A mail account.
class KAVELL_ACCOUNTS_EXPORT KAMailAccountSetupInput : public KAAccountSetupInput {
public:
    ~KAMailAccountSetupInput() override;

    /// The address being set up.
    [[nodiscard]] QString emailAddress() const { return _emailAddress; }
    void setEmailAddress(const QString &emailAddress) { _emailAddress = emailAddress; }

    /// The user's full name.
    [[nodiscard]] QString fullName() const { return _fullName; }
    void setFullName(const QString &fullName) { _fullName = fullName; }

    /// Receiving host that automatic configuration found.
    [[nodiscard]] QString autoHostname() const { return _autoHostname; }
    void setAutoHostname(const QString &autoHostname) { _autoHostname = autoHostname; }

    /// Whether the receiving server uses SSL, by automatic configuration.
    [[nodiscard]] bool autoSSLEnabled() const { return _autoSSLEnabled; }
    void setAutoSSLEnabled(bool autoSSLEnabled) { _autoSSLEnabled = autoSSLEnabled; }

    /// Whether SSL is optional there.
    [[nodiscard]] bool autoSSLOptional() const { return _autoSSLOptional; }
    void setAutoSSLOptional(bool autoSSLOptional) { _autoSSLOptional = autoSSLOptional; }

    /// Scheme, host and path of the enabling address of automatic configuration.
    [[nodiscard]] QString autoEnableSchema() const { return _autoEnableSchema; }
    void setAutoEnableSchema(const QString &autoEnableSchema) { _autoEnableSchema = autoEnableSchema; }
    [[nodiscard]] QString autoEnableHost() const { return _autoEnableHost; }
    void setAutoEnableHost(const QString &autoEnableHost) { _autoEnableHost = autoEnableHost; }
    [[nodiscard]] QString autoEnablePath() const { return _autoEnablePath; }
    void setAutoEnablePath(const QString &autoEnablePath) { _autoEnablePath = autoEnablePath; }

    /// Sending host that automatic configuration found.
    [[nodiscard]] QString autoDeliveryHostname() const { return _autoDeliveryHostname; }
    void setAutoDeliveryHostname(const QString &autoDeliveryHostname) { _autoDeliveryHostname = autoDeliveryHostname; }

    /// Whether the sending host uses SSL.
    [[nodiscard]] bool autoDeliverySSL() const { return _autoDeliverySSL; }
    void setAutoDeliverySSL(bool autoDeliverySSL) { _autoDeliverySSL = autoDeliverySSL; }

    /// The sending port.
    [[nodiscard]] qint64 autoDeliveryPort() const { return _autoDeliveryPort; }
    void setAutoDeliveryPort(qint64 autoDeliveryPort) { _autoDeliveryPort = autoDeliveryPort; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _emailAddress;
    QString _fullName;
    QString _autoHostname;
    bool _autoSSLEnabled = false;
    bool _autoSSLOptional = false;
    QString _autoEnableSchema;
    QString _autoEnableHost;
    QString _autoEnablePath;
    QString _autoDeliveryHostname;
    bool _autoDeliverySSL = false;
    qint64 _autoDeliveryPort = 0;
};

/// A calendar account.
class KAVELL_ACCOUNTS_EXPORT KACalDAVAccountSetupInput : public KAAccountSetupInput {
public:
    ~KACalDAVAccountSetupInput() override;

    /// Calendar server host.
    [[nodiscard]] QString serverAddress() const { return _serverAddress; }
    void setServerAddress(const QString &serverAddress) { _serverAddress = serverAddress; }

    /// The user's address.
    [[nodiscard]] QString emailAddress() const { return _emailAddress; }
    void setEmailAddress(const QString &emailAddress) { _emailAddress = emailAddress; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _serverAddress;
    QString _emailAddress;
};

/// A contacts account.
class KAVELL_ACCOUNTS_EXPORT KACardDAVAccountSetupInput : public KAAccountSetupInput {
public:
    ~KACardDAVAccountSetupInput() override;

    /// Contacts server host.
    [[nodiscard]] QString serverAddress() const { return _serverAddress; }
    void setServerAddress(const QString &serverAddress) { _serverAddress = serverAddress; }

    /// Host that automatic configuration found.
    [[nodiscard]] QString autoHostname() const { return _autoHostname; }
    void setAutoHostname(const QString &autoHostname) { _autoHostname = autoHostname; }

    /// URL scheme that automatic configuration found.
    [[nodiscard]] QString autoSchema() const { return _autoSchema; }
    void setAutoSchema(const QString &autoSchema) { _autoSchema = autoSchema; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _serverAddress;
    QString _autoHostname;
    QString _autoSchema;
};

/// A directory account.
class KAVELL_ACCOUNTS_EXPORT KALDAPAccountSetupInput : public KAAccountSetupInput {
public:
    ~KALDAPAccountSetupInput() override;

    /// Directory server host.
    [[nodiscard]] QString serverAddress() const { return _serverAddress; }
    void setServerAddress(const QString &serverAddress) { _serverAddress = serverAddress; }

    /// Whether to use SSL; empty when the caller did not say, which differs from false.
    [[nodiscard]] std::optional<bool> useSSL() const { return _useSSL; }
    void setUseSSL(std::optional<bool> useSSL) { _useSSL = useSSL; }

    /// Server port; 0 when not specified.
    [[nodiscard]] qint64 port() const { return _port; }
    void setPort(qint64 port) { _port = port; }

    /// Search scope.
    [[nodiscard]] QString scope() const { return _scope; }
    void setScope(const QString &scope) { _scope = scope; }

    /// Search base.
    [[nodiscard]] QString searchBase() const { return _searchBase; }
    void setSearchBase(const QString &searchBase) { _searchBase = searchBase; }

    /// Whether to bind with user name and password.
    [[nodiscard]] bool authenticate() const { return _authenticate; }
    void setAuthenticate(bool authenticate) { _authenticate = authenticate; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _serverAddress;
    std::optional<bool> _useSSL;
    qint64 _port = 0;
    QString _scope;
    QString _searchBase;
    bool _authenticate = false;
};

/// A chat account.
class KAVELL_ACCOUNTS_EXPORT KAChatAccountSetupInput : public KAAccountSetupInput {
public:
    ~KAChatAccountSetupInput() override;

    /// A value of KAChatAccountTypeKey.
    [[nodiscard]] QString accountType() const { return _accountType; }
    void setAccountType(const QString &accountType) { _accountType = accountType; }

    /// Login name on the service.
    [[nodiscard]] QString loginName() const { return _loginName; }
    void setLoginName(const QString &loginName) { _loginName = loginName; }

    /// Chat server host.
    [[nodiscard]] QString serverName() const { return _serverName; }
    void setServerName(const QString &serverName) { _serverName = serverName; }

    /// Chat server port.
    [[nodiscard]] qint64 serverPort() const { return _serverPort; }
    void setServerPort(qint64 serverPort) { _serverPort = serverPort; }

    /// Whether to connect with SSL.
    [[nodiscard]] bool useSSL() const { return _useSSL; }
    void setUseSSL(bool useSSL) { _useSSL = useSSL; }

    /// Whether to authenticate with Kerberos V5.
    [[nodiscard]] bool useKerberosV5() const { return _useKerberosV5; }
    void setUseKerberosV5(bool useKerberosV5) { _useKerberosV5 = useKerberosV5; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _accountType;
    QString _loginName;
    QString _serverName;
    qint64 _serverPort = 0;
    bool _useSSL = false;
    bool _useKerberosV5 = false;
};

/// An account on a server of the maker's server product.
class KAVELL_ACCOUNTS_EXPORT KAServerAccountSetupInput : public KAAccountSetupInput {
public:
    ~KAServerAccountSetupInput() override;

    /// Name of the server as the user sees it.
    [[nodiscard]] QString serverName() const { return _serverName; }
    void setServerName(const QString &serverName) { _serverName = serverName; }

    /// Server host.
    [[nodiscard]] QString serverAddress() const { return _serverAddress; }
    void setServerAddress(const QString &serverAddress) { _serverAddress = serverAddress; }

    /// Which of the server's services to set up.
    [[nodiscard]] bool enableMail() const { return _enableMail; }
    void setEnableMail(bool enableMail) { _enableMail = enableMail; }
    [[nodiscard]] bool enableJabber() const { return _enableJabber; }
    void setEnableJabber(bool enableJabber) { _enableJabber = enableJabber; }
    [[nodiscard]] bool enableCalDAV() const { return _enableCalDAV; }
    void setEnableCalDAV(bool enableCalDAV) { _enableCalDAV = enableCalDAV; }
    [[nodiscard]] bool enableCardDAV() const { return _enableCardDAV; }
    void setEnableCardDAV(bool enableCardDAV) { _enableCardDAV = enableCardDAV; }
    [[nodiscard]] bool enableVPN() const { return _enableVPN; }
    void setEnableVPN(bool enableVPN) { _enableVPN = enableVPN; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _serverName;
    QString _serverAddress;
    bool _enableMail = false;
    bool _enableJabber = false;
    bool _enableCalDAV = false;
    bool _enableCardDAV = false;
    bool _enableVPN = false;
};

#endif
