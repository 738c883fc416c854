// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A vault file of any bytes is no vault or asks for bounded work, and opens with no key that it was not made with. Any
// bytes sealed as items by someone who has the key: they open as items that can be sealed and opened again, or not at
// all; and one changed bit keeps them from opening.

#include <algorithm>

#include <sodium.h>

#include "platform/checksum.h"
#include "platform/services/vault_file.h"
#include "tests/fuzz/fuzz_target.h"

using namespace kavell;
using kavell::fuzz::require;

namespace {

constexpr std::string_view kKey = "a key of thirty-two bytes length";
static_assert(kKey.size() == kVaultKeyLength);

// As vault_file.h lays the file out; the encryption's key is the first one that the vault's key is the parent of.
constexpr size_t kHeaderLength = 80, kNonceOffset = 56, kTagLength = 16;

void tryFile(std::string_view file)
{
    VaultHeader header;
    if (readVaultHeader(file, header)) {
        require(header.passes <= 8 && header.memory <= 512ULL << 20, "no vault asks for unbounded work");
        require(!isKeyRight(header, kKey), "a key check that was not made with the key is wrong");
    }
    std::vector<VaultItem> items;
    require(!openVault(file, kKey, items) && items.empty(), "what was not made with the key does not open with it");
}

/// A file whose encrypted part is any bytes.
std::string sealedBytes(const VaultHeader &header, std::string_view plain)
{
    std::string file = sealVault(header, kKey, {}).substr(0, kHeaderLength);
    file.resize(kHeaderLength + plain.size() + kTagLength);
    unsigned char key[kVaultKeyLength];
    crypto_kdf_derive_from_key(key, sizeof key, 1, "KavVault", reinterpret_cast<const unsigned char *>(kKey.data()));
    auto *const bytes = reinterpret_cast<unsigned char *>(file.data());
    crypto_aead_xchacha20poly1305_ietf_encrypt(bytes + kHeaderLength, nullptr,
                                               reinterpret_cast<const unsigned char *>(plain.data()), plain.size(),
                                               bytes, kHeaderLength, nullptr, bytes + kNonceOffset, key);
    return file;
}

bool areSame(const VaultItem &one, const VaultItem &other)
{
    return one.identifier == other.identifier && one.serviceName == other.serviceName &&
           one.accountName == other.accountName && one.secret.view() == other.secret.view() &&
           one.access.description == other.access.description && one.access.groups == other.access.groups;
}

void trySealed(std::string_view plain)
{
    static const VaultHeader header = [] {
        VaultHeader made = newVaultHeader();
        setKeyCheck(made, kKey);
        return made;
    }();
    std::string file = sealedBytes(header, plain);
    VaultHeader read;
    require(readVaultHeader(file, read) && isKeyRight(read, kKey), "a vault's header reads as it was written");

    std::vector<VaultItem> items, again;
    if (openVault(file, kKey, items)) {
        const std::string rewritten = sealVault(header, kKey, items);
        require(rewritten.size() == file.size(), "a vault has one form only");
        require(openVault(rewritten, kKey, again), "what was sealed opens");
        require(std::equal(items.begin(), items.end(), again.begin(), again.end(), areSame),
                "items open as they were sealed");
    }
    const uint64_t bit = checksumOf(plain) % (file.size() * 8);
    file[bit / 8] = static_cast<char>(file[bit / 8] ^ (1 << (bit % 8)));
    require(!openVault(file, kKey, items), "a changed vault does not open");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static const bool isReady = sodium_init() >= 0;
    require(isReady, "the cipher library is ready");
    const std::string_view bytes = fuzz::textOf(data, size);
    tryFile(bytes);
    trySealed(bytes);
    return 0;
}
