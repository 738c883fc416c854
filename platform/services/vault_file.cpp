// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/vault_file.h"

#include <cstring>
#include <sodium.h>

namespace kavell {

namespace {

constexpr std::string_view kMagic = "KavVault";
constexpr uint32_t kVersion = 1;
constexpr size_t kCheckedLength = 40;
constexpr size_t kNonceOffset = 56;
constexpr size_t kHeaderLength = 80;
constexpr uint32_t kMostPasses = 8;
constexpr uint64_t kMostMemory = 512ULL * 1024 * 1024;

constexpr const char *kKeyContext = "KavVault";
constexpr uint64_t kEncryptionKey = 1;
constexpr uint64_t kCheckKey = 2;

static_assert(crypto_aead_xchacha20poly1305_ietf_NPUBBYTES == kHeaderLength - kNonceOffset);
static_assert(crypto_aead_xchacha20poly1305_ietf_KEYBYTES == kVaultKeyLength);
static_assert(crypto_kdf_KEYBYTES == kVaultKeyLength && crypto_pwhash_SALTBYTES == 16);

const unsigned char *bytesOf(std::string_view text)
{
    return reinterpret_cast<const unsigned char *>(text.data());
}

/// Text that holds secrets while it is put together or taken apart.
struct WipedText {
    std::string text;
    ~WipedText() { sodium_memzero(text.data(), text.size()); }
};

/// One of the two keys that the vault's key is the parent of.
class SubKey {
public:
    SubKey(std::string_view key, uint64_t number)
    {
        crypto_kdf_derive_from_key(m_bytes, sizeof m_bytes, number, kKeyContext, bytesOf(key));
    }
    ~SubKey() { sodium_memzero(m_bytes, sizeof m_bytes); }
    SubKey(const SubKey &) = delete;
    SubKey &operator=(const SubKey &) = delete;

    [[nodiscard]] const unsigned char *bytes() const { return m_bytes; }

private:
    unsigned char m_bytes[kVaultKeyLength];
};

template <typename Integer> void putInteger(std::string &text, Integer value)
{
    for (size_t index = 0; index < sizeof value; ++index)
        text += static_cast<char>(value >> (8 * index));
}

void putText(std::string &text, std::string_view value)
{
    putInteger(text, static_cast<uint32_t>(value.size()));
    text += value;
}

/// Takes integers and texts off the front of bytes; once something is missing all that follows is empty.
class Reader {
public:
    explicit Reader(std::string_view bytes) : m_bytes(bytes) {}

    template <typename Integer> Integer integer()
    {
        const std::string_view taken = take(sizeof(Integer));
        Integer value = 0;
        for (size_t index = 0; index < taken.size(); ++index)
            value |=
                static_cast<Integer>(static_cast<Integer>(static_cast<unsigned char>(taken[index])) << (8 * index));
        return value;
    }

    std::string_view text() { return take(integer<uint32_t>()); }

    std::string_view take(size_t length)
    {
        if (length > m_bytes.size()) {
            m_isCut = true;
            m_bytes = {};
            return {};
        }
        const std::string_view taken = m_bytes.substr(0, length);
        m_bytes.remove_prefix(length);
        return taken;
    }

    [[nodiscard]] bool isCut() const { return m_isCut; }
    [[nodiscard]] bool isAtEnd() const { return !m_isCut && m_bytes.empty(); }

private:
    std::string_view m_bytes;
    bool m_isCut = false;
};

/// The part of the header that the key check covers.
std::string checkedPart(const VaultHeader &header)
{
    std::string text(kMagic);
    putInteger(text, kVersion);
    putInteger(text, header.passes);
    putInteger(text, header.memory);
    text.append(reinterpret_cast<const char *>(header.salt.data()), header.salt.size());
    return text;
}

std::array<unsigned char, 16> keyCheckOf(const VaultHeader &header, std::string_view key)
{
    const SubKey checkKey(key, kCheckKey);
    const std::string checked = checkedPart(header);
    std::array<unsigned char, 16> check{};
    crypto_generichash(check.data(), check.size(), bytesOf(checked), checked.size(), checkKey.bytes(), kVaultKeyLength);
    return check;
}

size_t encodedLength(const VaultItem &item)
{
    size_t length = 6 * sizeof(uint32_t) + item.identifier.size() + item.serviceName.size() + item.accountName.size() +
                    item.secret.view().size() + item.access.description.size();
    for (const std::string &group : item.access.groups)
        length += sizeof(uint32_t) + group.size();
    return length;
}

void encodeItems(const std::vector<VaultItem> &items, std::string &text)
{
    // Room for all of it at once: a text that grows leaves copies of its secrets behind.
    size_t length = sizeof(uint32_t);
    for (const VaultItem &item : items)
        length += encodedLength(item);
    text.reserve(length);
    putInteger(text, static_cast<uint32_t>(items.size()));
    for (const VaultItem &item : items) {
        for (const std::string_view part :
             {std::string_view(item.identifier), std::string_view(item.serviceName), std::string_view(item.accountName),
              item.secret.view(), std::string_view(item.access.description)})
            putText(text, part);
        putInteger(text, static_cast<uint32_t>(item.access.groups.size()));
        for (const std::string &group : item.access.groups)
            putText(text, group);
    }
}

bool decodeItems(std::string_view bytes, std::vector<VaultItem> &items)
{
    Reader reader(bytes);
    for (uint32_t left = reader.integer<uint32_t>(); left > 0 && !reader.isCut(); --left) {
        VaultItem item;
        item.identifier = reader.text();
        item.serviceName = reader.text();
        item.accountName = reader.text();
        item.secret = Secret(reader.text());
        item.access.description = reader.text();
        for (uint32_t groups = reader.integer<uint32_t>(); groups > 0 && !reader.isCut(); --groups)
            item.access.groups.emplace_back(reader.text());
        items.push_back(std::move(item));
    }
    return reader.isAtEnd();
}

}  // namespace

VaultHeader newVaultHeader()
{
    // The interactive measure: about 0.2 s and 64 MiB. Where the kernel keeps no keys, every process pays it anew.
    VaultHeader header;
    header.passes = crypto_pwhash_OPSLIMIT_INTERACTIVE;
    header.memory = crypto_pwhash_MEMLIMIT_INTERACTIVE;
    randombytes_buf(header.salt.data(), header.salt.size());
    return header;
}

bool readVaultHeader(std::string_view file, VaultHeader &header)
{
    if (file.size() < kHeaderLength + crypto_aead_xchacha20poly1305_ietf_ABYTES)
        return false;
    Reader reader(file);
    if (reader.take(kMagic.size()) != kMagic || reader.integer<uint32_t>() != kVersion)
        return false;
    header.passes = reader.integer<uint32_t>();
    header.memory = reader.integer<uint64_t>();
    std::memcpy(header.salt.data(), reader.take(header.salt.size()).data(), header.salt.size());
    std::memcpy(header.keyCheck.data(), reader.take(header.keyCheck.size()).data(), header.keyCheck.size());
    return header.passes >= crypto_pwhash_OPSLIMIT_MIN && header.passes <= kMostPasses &&
           header.memory >= crypto_pwhash_MEMLIMIT_MIN && header.memory <= kMostMemory;
}

Secret deriveVaultKey(const VaultHeader &header, std::string_view passphrase)
{
    unsigned char key[kVaultKeyLength];
    const bool isDerived =
        crypto_pwhash(key, sizeof key, passphrase.data(), passphrase.size(), header.salt.data(), header.passes,
                      static_cast<size_t>(header.memory), crypto_pwhash_ALG_ARGON2ID13) == 0;
    Secret derived = isDerived ? Secret({reinterpret_cast<const char *>(key), sizeof key}) : Secret();
    sodium_memzero(key, sizeof key);
    return derived;
}

void setKeyCheck(VaultHeader &header, std::string_view key)
{
    header.keyCheck = keyCheckOf(header, key);
}

bool isKeyRight(const VaultHeader &header, std::string_view key)
{
    if (key.size() != kVaultKeyLength)
        return false;
    const auto check = keyCheckOf(header, key);
    return sodium_memcmp(check.data(), header.keyCheck.data(), check.size()) == 0;
}

bool openVault(std::string_view file, std::string_view key, std::vector<VaultItem> &items)
{
    if (file.size() < kHeaderLength + crypto_aead_xchacha20poly1305_ietf_ABYTES || key.size() != kVaultKeyLength)
        return false;
    const std::string_view header = file.substr(0, kHeaderLength);
    const std::string_view body = file.substr(kHeaderLength);
    const SubKey encryptionKey(key, kEncryptionKey);
    WipedText plain;
    plain.text.resize(body.size() - crypto_aead_xchacha20poly1305_ietf_ABYTES);
    if (crypto_aead_xchacha20poly1305_ietf_decrypt(reinterpret_cast<unsigned char *>(plain.text.data()), nullptr,
                                                   nullptr, bytesOf(body), body.size(), bytesOf(header), header.size(),
                                                   bytesOf(header) + kNonceOffset, encryptionKey.bytes()) != 0)
        return false;
    std::vector<VaultItem> read;
    if (!decodeItems(plain.text, read))
        return false;
    items = std::move(read);
    return true;
}

std::string sealVault(const VaultHeader &header, std::string_view key, const std::vector<VaultItem> &items)
{
    std::string file = checkedPart(header);
    static_assert(kMagic.size() + sizeof(uint32_t) * 2 + sizeof(uint64_t) + 16 == kCheckedLength);
    file.append(reinterpret_cast<const char *>(header.keyCheck.data()), header.keyCheck.size());
    file.resize(kHeaderLength);
    randombytes_buf(file.data() + kNonceOffset, kHeaderLength - kNonceOffset);
    const SubKey encryptionKey(key, kEncryptionKey);
    WipedText plain;
    encodeItems(items, plain.text);
    file.resize(kHeaderLength + plain.text.size() + crypto_aead_xchacha20poly1305_ietf_ABYTES);
    auto *bytes = reinterpret_cast<unsigned char *>(file.data());
    crypto_aead_xchacha20poly1305_ietf_encrypt(bytes + kHeaderLength, nullptr, bytesOf(plain.text), plain.text.size(),
                                               bytes, kHeaderLength, nullptr, bytes + kNonceOffset,
                                               encryptionKey.bytes());
    return file;
}

}  // namespace kavell
