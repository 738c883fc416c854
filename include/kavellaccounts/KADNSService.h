// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which hosts receive the mail of a domain, and is a given provider among them? One object asks once:
//
//     const auto service = KADNSService::initWithServerAddress("example.net");
//     service->beginQuerySync();
//     if (service->hasMailHost("mx.example.com")) …
//
// Answers are cached for the life of the process, empty ones included. An object belongs to one thread at a time; many
// objects may ask at once. No application object is needed.

#ifndef KAVELLACCOUNTS_KADNSSERVICE_H
#define KAVELLACCOUNTS_KADNSSERVICE_H

#include <memory>

#include <QtCore/QSemaphore>
#include <QtCore/QString>
#include <QtCore/QStringList>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAVELL_ACCOUNTS_EXPORT KADNSService : public KAObject, public std::enable_shared_from_this<KADNSService> {
public:
    /// Keeps the domain as it is; the cache is on.
    [[nodiscard]] static std::shared_ptr<KADNSService> initWithServerAddress(const QString &serverAddress);
    ~KADNSService() override;

    [[nodiscard]] QString serverAddress() const;
    void setServerAddress(const QString &serverAddress);

    /// The mail exchangers found, in lower case, each once and with a closing dot, in the order of arrival.
    [[nodiscard]] QStringList mailServers() const;
    void setMailServers(const QStringList &mailServers);

    [[nodiscard]] bool useCache() const;
    void setUseCache(bool useCache);

    /// What the answers are waited for with; null once the object has asked.
    [[nodiscard]] std::shared_ptr<QSemaphore> semaphore() const;

    /// Asks for the domain's mail exchangers, once per object. Blocks for at most 0.5 seconds. A domain of fewer than
    /// two labels is not asked about. What has not arrived by then is missing, in the cache too.
    void beginQuerySync();

    /// Whether a mail exchanger begins with the text (lower case) or holds it after a dot.
    [[nodiscard]] bool hasMailHost(const QString &text) const;

    void describeFields(KAFieldList &fields) const override;

private:
    explicit KADNSService(const QString &serverAddress);
    void query();

    QString _serverAddress;
    QStringList _mailServers;
    std::shared_ptr<QSemaphore> _semaphore;
    bool _useCache = true;
};

#endif
