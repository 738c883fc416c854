// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The user's secret store behind one interface, and the choice of the one that this process uses: the desktop's Secret
// Service, else an encrypted vault file. The stores themselves live in the services module (services/), which is loaded
// by the first question, so everything that crosses this interface is a plain C++ type.
//
// Called by the credential items (store/CSKavellCofferel.cpp) and the account's password. Any thread may call. Every
// operation ends within the question's bound (credentialTimeout) and unlocking within the prompt's (unlockTimeout); no
// operation but unlock ever asks the user anything.

#ifndef KAVELL_PLATFORM_CREDENTIAL_STORE_H
#define KAVELL_PLATFORM_CREDENTIAL_STORE_H

#include <algorithm>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <string.h>

namespace kavell {

/// What became of a question; the same values as CSKavellCofferelStatus, which says what each means.
enum class CredentialStatus { stored, absent, locked, refused, unreachable, failed, unsupported };

/// The status as one lower-case English word, borrowed for ever.
[[nodiscard]] const char *credentialStatusName(CredentialStatus status) noexcept;

/// A secret's bytes, overwritten before their memory is given back. Moved, never copied.
class Secret {
public:
    Secret() noexcept = default;
    explicit Secret(std::string_view bytes)
        : m_bytes(std::make_unique<char[]>(bytes.size() + 1)), m_length(bytes.size())
    {
        std::copy(bytes.begin(), bytes.end(), m_bytes.get());
    }
    ~Secret() { wipe(); }
    Secret(Secret &&other) noexcept : m_bytes(std::move(other.m_bytes)), m_length(std::exchange(other.m_length, 0)) {}
    Secret &operator=(Secret &&other) noexcept
    {
        wipe();
        m_bytes = std::move(other.m_bytes);
        m_length = std::exchange(other.m_length, 0);
        return *this;
    }

    [[nodiscard]] std::string_view view() const noexcept { return {m_bytes ? m_bytes.get() : "", m_length}; }

private:
    void wipe() noexcept
    {
        if (m_bytes)
            explicit_bzero(m_bytes.get(), m_length);
    }

    std::unique_ptr<char[]> m_bytes;
    size_t m_length = 0;
};

/// Names one item: the store that holds it, and the random 128-bit identifier (32 hexadecimal digits) that was attached
/// to it there. The identifier is empty when none could be attached; such an item can be named to nobody else.
struct CredentialItem {
    std::string storeName;
    std::string identifier;
    std::string serviceName;
    std::string accountName;
};

/// Who may read an item: a description and the names of application groups.
struct CredentialAccess {
    std::string description;
    std::vector<std::string> groups;
};

/// One store. Results are left alone unless the status is stored.
class CredentialStore {
public:
    virtual ~CredentialStore() = default;

    /// "secret-service" or "vault"; part of every persistent reference.
    [[nodiscard]] virtual std::string_view name() const noexcept = 0;

    /// Whether the store can be had: stored, absent (certainly not), or another status when that cannot be told.
    [[nodiscard]] virtual CredentialStatus probe() = 0;

    /// Makes the store (or the part of it that holds `item`, unless null) ready for reading and writing, asking the
    /// user if need be.
    [[nodiscard]] virtual CredentialStatus unlock(const CredentialItem *item) = 0;

    [[nodiscard]] virtual CredentialStatus find(std::string_view serviceName, std::string_view accountName,
                                                CredentialItem &item) = 0;
    [[nodiscard]] virtual CredentialStatus resolve(std::string_view identifier, CredentialItem &item) = 0;
    [[nodiscard]] virtual CredentialStatus list(std::vector<CredentialItem> &items) = 0;

    /// Adds an item. When another process has added one of the same names meanwhile, that one gets the secret instead:
    /// two adders make one item.
    [[nodiscard]] virtual CredentialStatus add(std::string_view serviceName, std::string_view accountName,
                                               std::string_view secret, CredentialItem &item) = 0;

    [[nodiscard]] virtual CredentialStatus readSecret(const CredentialItem &item, Secret &secret) = 0;
    [[nodiscard]] virtual CredentialStatus replaceSecret(const CredentialItem &item, std::string_view secret) = 0;
    [[nodiscard]] virtual CredentialStatus remove(const CredentialItem &item) = 0;

    [[nodiscard]] virtual CredentialStatus readAccess(const CredentialItem &item, CredentialAccess &access) = 0;
    [[nodiscard]] virtual CredentialStatus writeAccess(const CredentialItem &item, const CredentialAccess &access) = 0;
};

inline constexpr std::string_view kSecretServiceStoreName = "secret-service";
inline constexpr std::string_view kVaultStoreName = "vault";
inline constexpr const char *kNoStoreName = "none";

/// The persistent reference of an item, valid in any process and after a restart: "store:identifier". Empty when none
/// can be made.
[[nodiscard]] std::string persistentReference(const CredentialItem &item);

/// Takes a persistent reference apart into the store's name and the identifier; false when it is not one.
[[nodiscard]] bool parsePersistentReference(std::string_view reference, std::string &storeName,
                                            std::string &identifier);

/// The store of this process, chosen on the first call as KAVELL_CREDENTIAL_STORE says and then kept; null for none. A
/// Secret Service that does not answer in time is chosen all the same: that it is silent does not mean it is not there.
[[nodiscard]] std::shared_ptr<CredentialStore> defaultCredentialStore();

/// The store of a name, for an item that belongs to it whichever store is chosen; null when this process may not use
/// it.
[[nodiscard]] std::shared_ptr<CredentialStore> credentialStoreNamed(std::string_view name);

/// Puts a store in the place of all others; null forgets it and the choice made. For tests of what a real store cannot
/// be made to do.
void useCredentialStoreForTesting(std::shared_ptr<CredentialStore> store);

}  // namespace kavell

#endif
