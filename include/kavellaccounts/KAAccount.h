// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One online account of the user as an object: a thin face over one account record of the store (accountRef), with the
// questions that client applications ask of it, its child accounts in the client applications, and the decision which
// account-list plug-in a settings dictionary belongs to.
//
// Attribute changes stay pending in the record until the record itself is committed:
//
//     account->setProviderAttribute(KAMailEmailAddressKey, "ada@example.net");
//     _CSKavellAccountCommitChanges(account->accountRef());
//
// No value is kept here; every getter answers a fresh copy of what the record holds. Nothing here takes a lock of its
// own: as thread-safe as the record for attributes, while volatile and stored values belong to one thread at a time.
// "Null" below is a null QString, an invalid QVariant, a null pointer or an empty optional.

#ifndef KAVELLACCOUNTS_KAACCOUNT_H
#define KAVELLACCOUNTS_KAACCOUNT_H

#include <memory>
#include <optional>

#include <QtCore/QList>
#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantMap>
#include <QtGui/QImage>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>
#include <kavellaccounts/Ref.h>

class KAAListPlugin;
class KADecisionTrace;

class KAVELL_ACCOUNTS_EXPORT KAAccount : public KAObject {
public:
    /// @name Making accounts
    /// @{

    /// An account over a new record of the store: a KANimbrelAccount for kKAProviderNimbrel, else a KAAccount. The
    /// record reads its data file, which may block; it is added to no provider. Null when it cannot be made (a null or
    /// empty provider type or login name).
    [[nodiscard]] static std::shared_ptr<KAAccount> accountWithProviderType(const QString &providerType,
                                                                            const QString &loginName);

    /// An account over an existing record, of the class that its provider type asks for; null for a record without a
    /// provider type, and for none.
    [[nodiscard]] static std::shared_ptr<KAAccount> accountWithCSKavellAccount(CSKavellAccountRef account);

    /// Always false: accounts are kept in the store.
    [[nodiscard]] static bool useLocalStorage();

    /// A plain KAAccount over the record, which is retained and must not be none.
    [[nodiscard]] static std::shared_ptr<KAAccount> initWithCSKavellAccount(CSKavellAccountRef account);

    /// A plain KAAccount over a new record; null when it cannot be made.
    [[nodiscard]] static std::shared_ptr<KAAccount> initWithProviderType(const QString &providerType,
                                                                         const QString &loginName);

    ~KAAccount() override;
    /// @}

    /// @name The record
    /// @{

    /// The wrapped record, borrowed from this object.
    [[nodiscard]] CSKavellAccountRef accountRef() const;

    /// The provider type, such as kKAProviderMail.
    [[nodiscard]] QString provider() const;
    [[nodiscard]] QString loginName() const;

    /// The account's UUID as text.
    [[nodiscard]] QString uid() const;
    void setUID(const QString &uid);

    [[nodiscard]] QString fullName() const;
    void setFullName(const QString &fullName);

    /// The full name, deliberately: what setNickname stores is kept under another key, which this does not read.
    [[nodiscard]] QString nickname() const;
    void setNickname(const QString &nickname);
    /// @}

    /// @name Attributes of the account and of its services. Setting a null value removes the key. A URL is kept as its
    /// absolute text; a value that a property list cannot hold is refused with one line in the log. A null key names
    /// nothing, and a null service the account itself; empty ones are names like any other
    /// @{
    [[nodiscard]] QVariantMap providerAttributes() const;
    void setProviderAttributes(const QVariantMap &attributes);
    void removeAllProviderAttributes();
    [[nodiscard]] QVariant providerAttributeForKey(const QString &key) const;
    void setProviderAttribute(const QVariant &value, const QString &key);
    void removeProviderAttributeForKey(const QString &key);

    [[nodiscard]] QVariantMap attributesForService(const QString &service) const;
    void setAttributes(const QVariantMap &attributes, const QString &service);
    void removeAllAttributesForService(const QString &service);
    [[nodiscard]] QVariant attributeForKey(const QString &key, const QString &service) const;
    void setAttribute(const QVariant &value, const QString &key, const QString &service);
    void removeAttributeForKey(const QString &key, const QString &service);
    /// @}

    /// @name Password, in the credential store. Blocks as CSKavellCofferel.h says
    /// @{

    /// Null when there is none or it cannot be read.
    [[nodiscard]] QString password() const;

    /// Whether it was stored. A null or empty password removes the stored one and answers false; one with half of a
    /// character, which would not be read back as it is, leaves the stored one and answers false.
    bool setPassword(const QString &password);
    void removePassword();

    /// The item that the account refers to; the caller releases it. None when there is none.
    [[nodiscard]] CSKavellCofferelItemRef cofferelItem() const;
    void setCofferelItem(CSKavellCofferelItemRef item);
    /// @}

    /// @name Pending changes
    /// @{
    [[nodiscard]] bool hasPendingChanges() const;
    void cancelPendingChanges();

    /// Does nothing, on purpose: a program decides when changes reach the disk, by committing the record (accountRef).
    void commitPendingChanges();

    /// Does nothing: an account is removed through KAProvider::removeAccount.
    void removeAccount();
    /// @}

    /// @name Volatile attributes: values of this object only, never stored
    /// @{
    [[nodiscard]] QVariant volatileAttributeForKey(const QString &key) const;
    void setVolatileAttribute(const QVariant &value, const QString &key);
    /// @}

    /// @name Stored values: a side store in the user's preferences, shared by all accounts of one login name whatever
    /// their provider. Each change is on the disk at once, over what other processes stored before it; of two that
    /// change it at the same moment one change can be lost. What others stored is seen from the next change here on, or
    /// after KADefaults::synchronize
    /// @{
    void storeValue(const QVariant &value, const QString &key);
    [[nodiscard]] QVariant storedValueForKey(const QString &key) const;
    void removeStoredData();

    /// Sets each stored value as provider attribute where the account has none.
    void mergeStoredData();
    /// @}

    /// @name Questions
    /// @{
    [[nodiscard]] bool accountIsEnabled() const;

    /// Enabling removes the mark, disabling sets it; not committed.
    void setAccountEnabled(bool enabled);

    /// Whether the provider is one of those whose accounts the user sees in the account list.
    [[nodiscard]] bool isAList() const;
    [[nodiscard]] bool isExchange() const;

    /// Whether the application, by its bundle identifier, has an active child account here. Loads plug-ins.
    [[nodiscard]] bool enabledForApplication(const QString &appBundleID) const;

    /// Whether both are one account: same provider and same login name, where one user name at the maker's two mail
    /// domains counts as the same login name. Case-sensitive. No hash goes with it.
    [[nodiscard]] bool isEqual(const KAAccount &other) const;

    /// Several lines, with the attribute "password" masked (only that one). Forms the account identifier, which may
    /// block on a DNS lookup for up to half a second.
    [[nodiscard]] QString description() const override;
    /// @}

    /// @name Identity: "USER@HOST-LABEL", equal for all settings and accounts that name one user at one provider. The
    /// host label asks the plug-in manager, which may block on a DNS lookup for up to half a second
    /// @{
    [[nodiscard]] QString accountIdentifier() const;
    [[nodiscard]] static QString accountIdentifierForSettings(const QVariantMap &settings);

    /// The provider type of the account-list plug-in that claims the address's domain, else the domain.
    [[nodiscard]] static QString _hostLabelForServerAddress(const QString &serverAddress);
    /// @}

    /// @name Child accounts: the accounts that client applications hold for this account-list account, at most one for
    /// each data plug-in, by the identifier that the application knows its account by
    /// @{

    /// The settings with "uid" and "pluginID", without "inactive" and "password". A null UID leaves both out, a null
    /// plug-in identifier itself.
    [[nodiscard]] static QVariantMap childDictionaryWithSettings(const QVariantMap &settings, const QString &uid,
                                                                 const QString &pluginID);

    /// Stores a child, in place of any child of the same plug-in. A null UID stores nothing.
    void addChildAccountDict(const QVariantMap &child, const QString &accountUID);

    /// The child of a plug-in or of a UID; null when there is none.
    [[nodiscard]] std::optional<QVariantMap> childAccountWithPluginID(const QString &pluginID) const;
    [[nodiscard]] std::optional<QVariantMap> childAccountWithUID(const QString &uid) const;
    [[nodiscard]] QList<QVariantMap> allChildAccounts() const;
    void removeChildAccountWithUID(const QString &uid);

    /// The bundle identifiers of the applications that have a child account here, each once; without `includeInactive`
    /// only those with an active one. Null for an account without children and for Quillane accounts. Loads plug-ins.
    [[nodiscard]] std::optional<QStringList> enabledApplications(bool includeInactive) const;
    /// @}

    /// @name Settings dictionaries (keys of KAConstants.h). None of these commits
    /// @{

    /// The account as one flat dictionary, the child's settings laid over it. Reads the password, which may block.
    [[nodiscard]] QVariantMap
    dictionaryRepresentationMergedWithChildDict(const std::optional<QVariantMap> &child) const;

    /// Makes the provider attributes exactly the dictionary.
    void replacePropertiesWithSettingDictionary(const QVariantMap &settings);

    /// Adds what the account has no value for.
    void mergePropertiesWithSettingDictionary(const QVariantMap &settings);

    /// Sets the keys that the library knows, where the dictionary has them. A password among them becomes an attribute
    /// in plain text.
    void updateWithKnownSettingsFromDictionary(const QVariantMap &settings);
    void updateWithSettingsDict(const QVariantMap &settings, const QStringList &keys);
    /// @}

    /// @name Which account-list plug-in do settings belong to? At most two DNS lookups of half a second each
    /// @{

    /// The plug-in's identifier; null when nobody claims them. Does not normalise: hand in KAExtras::fixUpSettings.
    [[nodiscard]] static QString aListPluginIDForSettings(const QVariantMap &settings,
                                                          KADecisionTrace *trace = nullptr);

    /// Whether the online-service library says that an account name of the maker's service is of the newer kind.
    [[nodiscard]] static bool corvaneIDIsBrondel(const QString &accountName);

    /// The plug-in of the normalised settings, owned by the registry; null when there is none.
    [[nodiscard]] static KAAListPlugin *_pluginForSettings(const QVariantMap &settings);

    /// What that plug-in says; null without one.
    [[nodiscard]] static QString defaultDescriptionForAccountSettings(const QVariantMap &settings);
    [[nodiscard]] static QUrl supportURLForAccountSettings(const QVariantMap &settings);
    [[nodiscard]] static QImage brandIconForAccountSettings(const QVariantMap &settings);
    [[nodiscard]] static QString brandNameForAccountSettings(const QVariantMap &settings);
    /// @}

    void describeFields(KAFieldList &fields) const override;

protected:
    explicit KAAccount(CSKavellAccountRef account);

private:
    kavell::Ref<CSKavellAccountRef> _accountRef;
    std::optional<QVariantMap> _private;  ///< made on first write
};

#endif
