// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The accounts of one provider type, as objects. A provider reads its directory when it is made and on reloadData; it
// does not watch it. As thread-safe as the store's provider record; serviceTypesProvided belongs to one thread at a
// time.

#ifndef KAVELLACCOUNTS_KAPROVIDER_H
#define KAVELLACCOUNTS_KAPROVIDER_H

#include <memory>
#include <optional>

#include <QtCore/QList>
#include <QtCore/QString>
#include <QtCore/QStringList>

#include <kavellaccounts/CSKavellAccountProvider.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>
#include <kavellaccounts/Ref.h>

class KAAccount;

class KAVELL_ACCOUNTS_EXPORT KAProvider : public KAObject {
public:
    /// A provider of the type, such as kKAProviderGoogle; reads its accounts from the disk, which may block. Never
    /// null; one whose record cannot be made (a null type) answers every query with nothing.
    [[nodiscard]] static std::shared_ptr<KAProvider> initWithProviderType(const QString &providerType);

    /// @name New providers of the well-known types; each call makes another
    /// @{
    [[nodiscard]] static std::shared_ptr<KAProvider> exchangeProvider();
    [[nodiscard]] static std::shared_ptr<KAProvider> facebookProvider();
    [[nodiscard]] static std::shared_ptr<KAProvider> nimbrelProvider();
    [[nodiscard]] static std::shared_ptr<KAProvider> googleProvider();
    [[nodiscard]] static std::shared_ptr<KAProvider> yahooProvider();
    /// @}

    ~KAProvider() override;

    [[nodiscard]] QString providerType() const;

    /// The object-layer service types (kKAServiceIMAP, …) that accounts of this provider offer; empty until set.
    [[nodiscard]] QStringList serviceTypesProvided() const;
    void setServiceTypesProvided(const QStringList &serviceTypes);

    [[nodiscard]] QString description() const override;

    /// The mail domain of Yahoo, Google, the maker's online service or AOL; null for other providers.
    [[nodiscard]] QString rootHost() const;

    /// Reads directory and data files anew; may block on the disk.
    void reloadData();

    /// New objects on every call, over the provider's records in their order.
    [[nodiscard]] QList<std::shared_ptr<KAAccount>> accounts() const;

    /// Adds the account's record. The account's file is written when the record is committed.
    void addAccount(const std::shared_ptr<KAAccount> &account);

    /// Removes the account of that login name, at once and on the disk.
    void removeAccount(const std::shared_ptr<KAAccount> &account);

    [[nodiscard]] bool hasAccountWithLoginName(const QString &loginName) const;

    /// Null for a null login name, and when there is none and none is to be made.
    [[nodiscard]] std::shared_ptr<KAAccount> accountForLoginName(const QString &loginName, bool createIfMissing);
    [[nodiscard]] std::shared_ptr<KAAccount> createAccountWithLoginName(const QString &loginName);

    /// The first account with that UUID, and the first that holds a child account of that UID; null when there is none.
    [[nodiscard]] std::shared_ptr<KAAccount> accountWithUID(const QString &uid) const;
    [[nodiscard]] std::shared_ptr<KAAccount> aListAccountContainingChildUID(const QString &childUID) const;

    void describeFields(KAFieldList &fields) const override;

protected:
    explicit KAProvider(const QString &providerType);

private:
    kavell::Ref<CSKavellAccountProviderRef> _providerRef;
    std::optional<QStringList> _servicesProvided;
};

#endif
