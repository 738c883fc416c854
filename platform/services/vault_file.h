// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vault's file format: an encrypted, authenticated list of items. Used by the vault; nothing here touches the disk;
// safe from any thread.
//
//     offset  size  what (integers are little-endian)
//          0     8  "KavVault"
//          8     4  format version, 1
//         12     4  Argon2id passes
//         16     8  Argon2id memory in bytes
//         24    16  salt of the key
//         40    16  key check: a keyed hash of bytes 0 to 39
//         56    24  nonce, fresh with each writing
//         80     …  XChaCha20-Poly1305 of the items, which authenticates bytes 0 to 79 as well
//
//     items: a count, then for each: identifier, service name, account name, secret, access description, a count of
//     groups and each group's name. A count is 4 bytes; a text is its length in 4 bytes and its bytes.
//
// The key check tells a wrong passphrase from a damaged file. It gives a guesser nothing that the encryption itself
// does not give: either takes one Argon2id run a guess.

#ifndef KAVELL_PLATFORM_SERVICES_VAULT_FILE_H
#define KAVELL_PLATFORM_SERVICES_VAULT_FILE_H

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "platform/credential_store.h"

namespace kavell {

/// What stands in the clear at the file's beginning.
struct VaultHeader {
    uint32_t passes = 0;
    uint64_t memory = 0;
    std::array<unsigned char, 16> salt{};
    std::array<unsigned char, 16> keyCheck{};
};

struct VaultItem {
    std::string identifier;
    std::string serviceName;
    std::string accountName;
    Secret secret;
    CredentialAccess access;
};

/// A vault larger than this is not one of ours.
inline constexpr size_t kLargestVault = 16 * 1024 * 1024;

/// A header for a new vault, with a fresh salt; the key check is still to be set.
[[nodiscard]] VaultHeader newVaultHeader();

/// Reads the header; false when the bytes are no vault, of another version, or ask for more work or memory than any
/// honest vault does (8 passes, 512 MiB), so that a forged file cannot keep a process busy.
[[nodiscard]] bool readVaultHeader(std::string_view file, VaultHeader &header);

/// The key that the header's parameters make of a passphrase; empty when there is not enough memory.
[[nodiscard]] Secret deriveVaultKey(const VaultHeader &header, std::string_view passphrase);

/// Makes the header check for this key from now on.
void setKeyCheck(VaultHeader &header, std::string_view key);

/// Whether the key is the one that the header was made with.
[[nodiscard]] bool isKeyRight(const VaultHeader &header, std::string_view key);

/// The items; false when the file was changed by anyone without the key.
[[nodiscard]] bool openVault(std::string_view file, std::string_view key, std::vector<VaultItem> &items);

/// The whole file for the items.
[[nodiscard]] std::string sealVault(const VaultHeader &header, std::string_view key,
                                    const std::vector<VaultItem> &items);

/// The length of a key.
inline constexpr size_t kVaultKeyLength = 32;

}  // namespace kavell

#endif
