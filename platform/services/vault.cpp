// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/vault.h"

#include <functional>
#include <sodium.h>

#include "platform/services/passphrase.h"
#include "platform/services/user_files.h"
#include "platform/services/vault_file.h"
#include "platform/services/vault_key.h"

namespace kavell {

namespace {

constexpr const char *kFileName = "vault";
constexpr const char *kLockName = "vault.lock";

/// A vault that has been read and opened.
struct OpenVault {
    VaultHeader header;
    Secret key;
    std::vector<VaultItem> items;
};

CredentialItem named(const VaultItem &item)
{
    return {std::string(kVaultStoreName), item.identifier, item.serviceName, item.accountName};
}

VaultItem *itemOf(std::vector<VaultItem> &items, std::string_view identifier)
{
    const auto found =
        std::find_if(items.begin(), items.end(), [&](const VaultItem &item) { return item.identifier == identifier; });
    return found == items.end() ? nullptr : &*found;
}

VaultItem *itemOf(std::vector<VaultItem> &items, std::string_view serviceName, std::string_view accountName)
{
    const auto found = std::find_if(items.begin(), items.end(), [&](const VaultItem &item) {
        return item.serviceName == serviceName && item.accountName == accountName;
    });
    return found == items.end() ? nullptr : &*found;
}

std::string makeIdentifier()
{
    unsigned char bits[16];
    char digits[2 * sizeof bits + 1];
    randombytes_buf(bits, sizeof bits);
    return sodium_bin2hex(digits, sizeof digits, bits, sizeof bits);
}

/// Reads the file and its header: stored, absent when there is no file, failed when it is not a vault.
CredentialStatus readFile(StoredFile &file, VaultHeader &header)
{
    file = readWholeFile(credentialDirectory() + "/" + kFileName, kLargestVault);
    if (file.state == StoredFile::State::absent)
        return CredentialStatus::absent;
    return file.state == StoredFile::State::read && readVaultHeader(file.bytes, header) ? CredentialStatus::stored
                                                                                        : CredentialStatus::failed;
}

bool write(const OpenVault &vault)
{
    const std::string bytes = sealVault(vault.header, vault.key.view(), vault.items);
    return bytes.size() <= kLargestVault && replaceFile(kFileName, bytes);
}

class Vault final : public CredentialStore {
public:
    [[nodiscard]] std::string_view name() const noexcept override { return kVaultStoreName; }

    [[nodiscard]] CredentialStatus probe() override
    {
        return sodium_init() < 0 ? CredentialStatus::absent : CredentialStatus::stored;
    }

    [[nodiscard]] CredentialStatus unlock(const CredentialItem *item) override;

    [[nodiscard]] CredentialStatus find(std::string_view serviceName, std::string_view accountName,
                                        CredentialItem &item) override
    {
        return look([&](OpenVault &vault) {
            const VaultItem *found = itemOf(vault.items, serviceName, accountName);
            if (found)
                item = named(*found);
            return found ? CredentialStatus::stored : CredentialStatus::absent;
        });
    }

    [[nodiscard]] CredentialStatus resolve(std::string_view identifier, CredentialItem &item) override
    {
        return lookAt(identifier, [&](const VaultItem &found) { item = named(found); });
    }

    [[nodiscard]] CredentialStatus list(std::vector<CredentialItem> &items) override
    {
        std::vector<CredentialItem> found;
        const CredentialStatus status = look([&](OpenVault &vault) {
            for (const VaultItem &item : vault.items)
                found.push_back(named(item));
            return CredentialStatus::stored;
        });
        // A vault that was never made holds nothing, which is an answer.
        if (status != CredentialStatus::stored && status != CredentialStatus::absent)
            return status;
        items = std::move(found);
        return CredentialStatus::stored;
    }

    [[nodiscard]] CredentialStatus add(std::string_view serviceName, std::string_view accountName,
                                       std::string_view secret, CredentialItem &item) override;

    [[nodiscard]] CredentialStatus readSecret(const CredentialItem &item, Secret &secret) override
    {
        return lookAt(item.identifier, [&](const VaultItem &found) { secret = Secret(found.secret.view()); });
    }

    [[nodiscard]] CredentialStatus replaceSecret(const CredentialItem &item, std::string_view secret) override
    {
        return changeAt(item.identifier, [&](VaultItem &found) { found.secret = Secret(secret); });
    }

    [[nodiscard]] CredentialStatus remove(const CredentialItem &item) override
    {
        return change(false, [&](OpenVault &vault) {
            const size_t removed =
                std::erase_if(vault.items, [&](const VaultItem &each) { return each.identifier == item.identifier; });
            return removed > 0 ? CredentialStatus::stored : CredentialStatus::absent;
        });
    }

    [[nodiscard]] CredentialStatus readAccess(const CredentialItem &item, CredentialAccess &access) override
    {
        return lookAt(item.identifier, [&](const VaultItem &found) { access = found.access; });
    }

    [[nodiscard]] CredentialStatus writeAccess(const CredentialItem &item, const CredentialAccess &access) override
    {
        return changeAt(item.identifier, [&](VaultItem &found) { found.access = access; });
    }

private:
    using Work = std::function<CredentialStatus(OpenVault &)>;

    CredentialStatus open(OpenVault &vault);
    CredentialStatus look(const Work &work);
    CredentialStatus change(bool mayCreate, const Work &work);
    CredentialStatus lookAt(std::string_view identifier, const std::function<void(const VaultItem &)> &work);
    CredentialStatus changeAt(std::string_view identifier, const std::function<void(VaultItem &)> &work);
    CredentialStatus create(std::string_view passphrase, OpenVault &vault);
    CredentialStatus createOrOpen(const Deadline &deadline);

    VaultKey m_key;
    std::mutex m_asking;  ///< one thread at a time asks at the terminal
};

CredentialStatus Vault::open(OpenVault &vault)
{
    if (sodium_init() < 0)
        return CredentialStatus::failed;
    StoredFile file;
    if (const CredentialStatus status = readFile(file, vault.header); status != CredentialStatus::stored)
        return status;
    if (const CredentialStatus status = m_key.find(vault.header, vault.key); status != CredentialStatus::stored)
        return status;
    return openVault(file.bytes, vault.key.view(), vault.items) ? CredentialStatus::stored : CredentialStatus::failed;
}

/// Reading takes no lock: the file is only ever replaced whole.
CredentialStatus Vault::look(const Work &work)
{
    OpenVault vault;
    const CredentialStatus status = open(vault);
    return status == CredentialStatus::stored ? work(vault) : status;
}

CredentialStatus Vault::change(bool mayCreate, const Work &work)
{
    const Deadline deadline = credentialDeadline();
    const FileLock lock(kLockName, deadline);
    if (lock.state() != FileLock::State::held)
        return lock.state() == FileLock::State::timedOut ? CredentialStatus::unreachable : CredentialStatus::failed;
    OpenVault vault;
    CredentialStatus status = open(vault);
    if (status == CredentialStatus::absent && mayCreate) {
        Secret passphrase;
        status = m_key.choosePassphrase(false, deadline, passphrase);
        if (status == CredentialStatus::stored)
            status = create(passphrase.view(), vault);
    }
    if (status == CredentialStatus::stored)
        status = work(vault);
    if (status == CredentialStatus::stored && !write(vault))
        return CredentialStatus::failed;
    return status;
}

CredentialStatus Vault::lookAt(std::string_view identifier, const std::function<void(const VaultItem &)> &work)
{
    return look([&](OpenVault &vault) {
        const VaultItem *found = itemOf(vault.items, identifier);
        if (found)
            work(*found);
        return found ? CredentialStatus::stored : CredentialStatus::absent;
    });
}

CredentialStatus Vault::changeAt(std::string_view identifier, const std::function<void(VaultItem &)> &work)
{
    return change(false, [&](OpenVault &vault) {
        VaultItem *found = itemOf(vault.items, identifier);
        if (found)
            work(*found);
        return found ? CredentialStatus::stored : CredentialStatus::absent;
    });
}

CredentialStatus Vault::add(std::string_view serviceName, std::string_view accountName, std::string_view secret,
                            CredentialItem &item)
{
    CredentialItem added;
    const CredentialStatus status = change(true, [&](OpenVault &vault) {
        VaultItem *found = itemOf(vault.items, serviceName, accountName);
        if (!found) {
            vault.items.push_back({makeIdentifier(), std::string(serviceName), std::string(accountName), {}, {}});
            found = &vault.items.back();
        }
        found->secret = Secret(secret);
        added = named(*found);
        return CredentialStatus::stored;
    });
    if (status == CredentialStatus::stored)
        item = added;
    return status;
}

/// A new vault in memory, with the key that the passphrase makes.
CredentialStatus Vault::create(std::string_view passphrase, OpenVault &vault)
{
    vault.header = newVaultHeader();
    vault.key = deriveVaultKey(vault.header, passphrase);
    vault.items.clear();
    if (vault.key.view().empty())
        return CredentialStatus::failed;
    setKeyCheck(vault.header, vault.key.view());
    m_key.keep(vault.header, vault.key.view());
    return CredentialStatus::stored;
}

/// Asks for a passphrase before the lock is taken: nobody else is to wait while a person types.
CredentialStatus Vault::createOrOpen(const Deadline &deadline)
{
    Secret passphrase;
    if (const CredentialStatus status = m_key.choosePassphrase(true, deadline, passphrase);
        status != CredentialStatus::stored)
        return status;
    const FileLock lock(kLockName, credentialDeadline());
    if (lock.state() != FileLock::State::held)
        return lock.state() == FileLock::State::timedOut ? CredentialStatus::unreachable : CredentialStatus::failed;
    StoredFile file;
    OpenVault vault;
    CredentialStatus status = readFile(file, vault.header);
    // Another process was quicker; its vault is opened with the passphrase given here, or not at all.
    if (status == CredentialStatus::stored)
        return m_key.tryPassphrase(vault.header, passphrase.view(), vault.key);
    if (status != CredentialStatus::absent)
        return status;
    status = create(passphrase.view(), vault);
    return status == CredentialStatus::stored && !write(vault) ? CredentialStatus::failed : status;
}

CredentialStatus Vault::unlock(const CredentialItem *)
{
    if (sodium_init() < 0)
        return CredentialStatus::failed;
    const Deadline deadline = unlockDeadline();
    std::unique_lock asking(m_asking, std::defer_lock);
    if (!waitUntil(deadline, [&] { return asking.try_lock(); }))
        return CredentialStatus::locked;
    StoredFile file;
    OpenVault vault;
    const CredentialStatus status = readFile(file, vault.header);
    if (status == CredentialStatus::absent)
        return createOrOpen(deadline);
    if (status != CredentialStatus::stored)
        return status;
    if (const CredentialStatus asked = m_key.ask(vault.header, deadline, vault.key); asked != CredentialStatus::stored)
        return asked;
    return openVault(file.bytes, vault.key.view(), vault.items) ? CredentialStatus::stored : CredentialStatus::failed;
}

}  // namespace

CredentialStore *makeVault()
{
    return new Vault;
}

}  // namespace kavell
