// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/credential_store.h"

#include <array>
#include <cstdlib>
#include <mutex>

#include "platform/services_module.h"

namespace kavell {

namespace {

constexpr size_t kIdentifierLength = 32;
constexpr char kReferenceSeparator = ':';

constexpr std::array<const char *, 7> kStatusNames = {"stored",      "absent", "locked",     "refused",
                                                      "unreachable", "failed", "unsupported"};

/// The stores of this process. Never destroyed: a thread may still be asking while the process ends.
struct Stores {
    std::mutex mutex;
    std::shared_ptr<CredentialStore> forTesting;
    std::shared_ptr<CredentialStore> secretService;
    std::shared_ptr<CredentialStore> vault;
    std::shared_ptr<CredentialStore> chosen;
    bool isChosen = false;
};

Stores &stores()
{
    static Stores &instance = *new Stores;
    return instance;
}

/// What KAVELL_CREDENTIAL_STORE asks for. An unknown word means no store: to guess could put a password where its owner
/// does not want it.
enum class Wish { automatic, secretService, vault, none };

Wish wish()
{
    const char *variable = secure_getenv("KAVELL_CREDENTIAL_STORE");
    const std::string_view word = variable ? variable : "";
    if (word.empty() || word == "auto")
        return Wish::automatic;
    if (word == kSecretServiceStoreName)
        return Wish::secretService;
    return word == kVaultStoreName ? Wish::vault : Wish::none;
}

/// The two real stores, made on first use; null when the services module is missing. For holders of the mutex.
const std::shared_ptr<CredentialStore> &secretService(Stores &all)
{
    const ServicesModule *module = servicesModule();
    if (!all.secretService && module)
        all.secretService.reset(module->makeSecretService());
    return all.secretService;
}

const std::shared_ptr<CredentialStore> &vault(Stores &all)
{
    const ServicesModule *module = servicesModule();
    if (!all.vault && module)
        all.vault.reset(module->makeVault());
    return all.vault;
}

std::shared_ptr<CredentialStore> choose(Stores &all)
{
    switch (wish()) {
    case Wish::none:
        return nullptr;
    case Wish::vault:
        return vault(all);
    case Wish::secretService:
        return secretService(all);
    case Wish::automatic:
        break;
    }
    const std::shared_ptr<CredentialStore> service = secretService(all);
    return service && service->probe() != CredentialStatus::absent ? service : vault(all);
}

bool isIdentifier(std::string_view text)
{
    return text.size() == kIdentifierLength && text.find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

}  // namespace

const char *credentialStatusName(CredentialStatus status) noexcept
{
    const auto index = static_cast<size_t>(status);
    return index < kStatusNames.size() ? kStatusNames[index] : "unknown";
}

std::string persistentReference(const CredentialItem &item)
{
    if (!isIdentifier(item.identifier) || item.storeName.empty())
        return {};
    return item.storeName + kReferenceSeparator + item.identifier;
}

bool parsePersistentReference(std::string_view reference, std::string &storeName, std::string &identifier)
{
    const size_t separator = reference.find(kReferenceSeparator);
    if (separator == std::string_view::npos || separator == 0 || !isIdentifier(reference.substr(separator + 1)))
        return false;
    storeName = reference.substr(0, separator);
    identifier = reference.substr(separator + 1);
    return true;
}

std::shared_ptr<CredentialStore> defaultCredentialStore()
{
    Stores &all = stores();
    const std::lock_guard lock(all.mutex);
    if (all.forTesting)
        return all.forTesting;
    if (!all.isChosen) {
        all.chosen = choose(all);
        all.isChosen = true;
    }
    return all.chosen;
}

std::shared_ptr<CredentialStore> credentialStoreNamed(std::string_view name)
{
    Stores &all = stores();
    const std::lock_guard lock(all.mutex);
    if (all.forTesting)
        return all.forTesting;
    // A forced store is the only one: whoever asks for the vault does not want the desktop's keyring woken.
    const Wish wanted = wish();
    if (name == kSecretServiceStoreName && (wanted == Wish::automatic || wanted == Wish::secretService))
        return secretService(all);
    if (name == kVaultStoreName && (wanted == Wish::automatic || wanted == Wish::vault))
        return vault(all);
    return nullptr;
}

void useCredentialStoreForTesting(std::shared_ptr<CredentialStore> store)
{
    Stores &all = stores();
    const std::lock_guard lock(all.mutex);
    all.forTesting = std::move(store);
    all.secretService = nullptr;
    all.vault = nullptr;
    all.chosen = nullptr;
    all.isChosen = false;
}

}  // namespace kavell
