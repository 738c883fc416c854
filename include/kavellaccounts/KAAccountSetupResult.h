// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a data plug-in found out about an account that it is to set up. One class for each kind of account. Plain values
// with getters and setters: what was never set is null, false or 0. Shared by pointer; used by one thread at a time.

#ifndef KAVELLACCOUNTS_KAACCOUNTSETUPRESULT_H
#define KAVELLACCOUNTS_KAACCOUNTSETUPRESULT_H

#include <QtCore/QString>
#include <QtCore/QUrl>
#include <QtCore/QVariant>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

/// The base of all results.
class KAVELL_ACCOUNTS_EXPORT KAAccountSetupResult : public KAObject {
public:
    ~KAAccountSetupResult() override;
};

/// What was found for a mail account.
class KAVELL_ACCOUNTS_EXPORT KAMailAccountSetupResult : public KAAccountSetupResult {
public:
    ~KAMailAccountSetupResult() override;

    /// The mail client's own objects for receiving and sending; opaque here.
    [[nodiscard]] QVariant receivingAccount() const { return _receivingAccount; }
    void setReceivingAccount(const QVariant &receivingAccount) { _receivingAccount = receivingAccount; }
    [[nodiscard]] QVariant sendingAccount() const { return _sendingAccount; }
    void setSendingAccount(const QVariant &sendingAccount) { _sendingAccount = sendingAccount; }

    /// Whether the mail client has them already.
    [[nodiscard]] bool receivingAlreadyExistsInMail() const { return _receivingAlreadyExistsInMail; }
    void setReceivingAlreadyExistsInMail(bool receivingAlreadyExistsInMail)
    {
        _receivingAlreadyExistsInMail = receivingAlreadyExistsInMail;
    }
    [[nodiscard]] bool sendingAlreadyExistsInMail() const { return _sendingAlreadyExistsInMail; }
    void setSendingAlreadyExistsInMail(bool sendingAlreadyExistsInMail)
    {
        _sendingAlreadyExistsInMail = sendingAlreadyExistsInMail;
    }

    /// The base's description, both accounts, and whether they exist in the mail client.
    [[nodiscard]] QString description() const override;

    void describeFields(KAFieldList &fields) const override;

private:
    QVariant _receivingAccount;
    QVariant _sendingAccount;
    bool _receivingAlreadyExistsInMail = false;
    bool _sendingAlreadyExistsInMail = false;
};

/// What was found for a calendar account.
class KAVELL_ACCOUNTS_EXPORT KACalDAVAccountSetupResult : public KAAccountSetupResult {
public:
    ~KACalDAVAccountSetupResult() override;

    /// The calendar home.
    [[nodiscard]] QUrl url() const { return _url; }
    void setUrl(const QUrl &url) { _url = url; }

    void describeFields(KAFieldList &fields) const override;

private:
    QUrl _url;
};

/// What was found for a contacts account.
class KAVELL_ACCOUNTS_EXPORT KACardDAVAccountSetupResult : public KAAccountSetupResult {
public:
    ~KACardDAVAccountSetupResult() override;

    /// Where the contacts are.
    [[nodiscard]] QUrl url() const { return _url; }
    void setUrl(const QUrl &url) { _url = url; }

    void describeFields(KAFieldList &fields) const override;

private:
    QUrl _url;
};

/// A directory account was found; there is nothing more to say.
class KAVELL_ACCOUNTS_EXPORT KALDAPAccountSetupResult : public KAAccountSetupResult {
public:
    ~KALDAPAccountSetupResult() override;
};

/// What was found for a chat account.
class KAVELL_ACCOUNTS_EXPORT KAChatAccountSetupResult : public KAAccountSetupResult {
public:
    ~KAChatAccountSetupResult() override;

    /// The chat client's own object; opaque here.
    [[nodiscard]] QVariant accountObject() const { return _accountObject; }
    void setAccountObject(const QVariant &accountObject) { _accountObject = accountObject; }

    /// Whether the account existed before.
    [[nodiscard]] bool isExistingAccount() const { return _isExistingAccount; }
    void setIsExistingAccount(bool isExistingAccount) { _isExistingAccount = isExistingAccount; }

    /// What went wrong during set-up, if anything.
    [[nodiscard]] KAError setupError() const { return _error; }
    void setSetupError(const KAError &setupError) { _error = setupError; }

    void describeFields(KAFieldList &fields) const override;

private:
    QVariant _accountObject;
    bool _isExistingAccount = false;
    KAError _error;
};

/// What was found for an account on a server.
class KAVELL_ACCOUNTS_EXPORT KAServerAccountSetupResult : public KAAccountSetupResult {
public:
    ~KAServerAccountSetupResult() override;

    /// Whether the account existed before.
    [[nodiscard]] bool isExistingAccount() const { return _isExistingAccount; }
    void setIsExistingAccount(bool isExistingAccount) { _isExistingAccount = isExistingAccount; }

    /// What went wrong during set-up, if anything.
    [[nodiscard]] KAError setupError() const { return _setupError; }
    void setSetupError(const KAError &setupError) { _setupError = setupError; }

    void describeFields(KAFieldList &fields) const override;

private:
    bool _isExistingAccount = false;
    KAError _setupError;
};

/// What a group-ware server says of an account.
class KAVELL_ACCOUNTS_EXPORT KAEWSAccountSetupResult : public KAAccountSetupResult {
public:
    ~KAEWSAccountSetupResult() override;

    /// The user's full name.
    [[nodiscard]] QString fullName() const { return _fullName; }
    void setFullName(const QString &fullName) { _fullName = fullName; }

    /// The primary address.
    [[nodiscard]] QString email() const { return _email; }
    void setEmail(const QString &email) { _email = email; }

    /// The service's endpoint inside the organisation's network.
    [[nodiscard]] QString internalHost() const { return _internalHost; }
    void setInternalHost(const QString &internalHost) { _internalHost = internalHost; }
    [[nodiscard]] QString internalPath() const { return _internalPath; }
    void setInternalPath(const QString &internalPath) { _internalPath = internalPath; }
    [[nodiscard]] bool internalUseSSL() const { return _internalUseSSL; }
    void setInternalUseSSL(bool internalUseSSL) { _internalUseSSL = internalUseSSL; }
    [[nodiscard]] qint64 internalPort() const { return _internalPort; }
    void setInternalPort(qint64 internalPort) { _internalPort = internalPort; }

    /// The endpoint that can be reached from outside.
    [[nodiscard]] QString externalHost() const { return _externalHost; }
    void setExternalHost(const QString &externalHost) { _externalHost = externalHost; }
    [[nodiscard]] QString externalPath() const { return _externalPath; }
    void setExternalPath(const QString &externalPath) { _externalPath = externalPath; }
    [[nodiscard]] bool externalUseSSL() const { return _externalUseSSL; }
    void setExternalUseSSL(bool externalUseSSL) { _externalUseSSL = externalUseSSL; }
    [[nodiscard]] qint64 externalPort() const { return _externalPort; }
    void setExternalPort(qint64 externalPort) { _externalPort = externalPort; }

    /// Both endpoints as whole URLs.
    [[nodiscard]] QUrl internalURL() const { return _internalURL; }
    void setInternalURL(const QUrl &internalURL) { _internalURL = internalURL; }
    [[nodiscard]] QUrl externalURL() const { return _externalURL; }
    void setExternalURL(const QUrl &externalURL) { _externalURL = externalURL; }

    /// Identifier of the mailbox's root folder.
    [[nodiscard]] QString rootFolderID() const { return _rootFolderID; }
    void setRootFolderID(const QString &rootFolderID) { _rootFolderID = rootFolderID; }

    /// The URL that answered to the discovery.
    [[nodiscard]] QUrl autodiscoverURL() const { return _autodiscoverURL; }
    void setAutodiscoverURL(const QUrl &autodiscoverURL) { _autodiscoverURL = autodiscoverURL; }

    void describeFields(KAFieldList &fields) const override;

private:
    QString _fullName;
    QString _email;
    QString _internalHost;
    QString _internalPath;
    bool _internalUseSSL = false;
    qint64 _internalPort = 0;
    QString _externalHost;
    QString _externalPath;
    bool _externalUseSSL = false;
    qint64 _externalPort = 0;
    QUrl _internalURL;
    QUrl _externalURL;
    QString _rootFolderID;
    QUrl _autodiscoverURL;
};

#endif
