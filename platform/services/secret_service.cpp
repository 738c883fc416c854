// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An item is named by a random attribute of its own and searched for by it before each use. Its object path would not
// do: services give the path of a deleted item to the next new one.

#include "platform/services/secret_service.h"

#include <array>
#include <cstdint>
#include <cstdio>
#include <map>
#include <sys/random.h>

#include "platform/services/secret_service_connection.h"
#include "platform/services/user_files.h"

namespace kavell {

namespace {

// Searches go by the application and never by the schema: gnome-keyring keeps hashes of a locked collection's
// attributes to search by, but none of the schema.
constexpr const char *kApplicationAttribute = "application";
constexpr const char *kApplication = "com.corvane.KavellAccounts";
constexpr const char *kSchemaAttribute = "xdg:schema";
constexpr const char *kSchema = "com.corvane.KavellAccounts.Password";
constexpr const char *kServiceAttribute = "service";
constexpr const char *kAccountAttribute = "account";
constexpr const char *kIdentifierAttribute = "kavell-reference";
constexpr const char *kLockName = "credentials.lock";
constexpr const char *kNewCollectionLabel = "Default keyring";

using Attributes = std::map<std::string, std::string>;

/// Where an item stands just now.
struct Place {
    std::string path;
    bool isLocked = false;
};

/// 128 random bits as hexadecimal digits; empty when the kernel has none to give.
std::string makeIdentifier()
{
    std::array<unsigned char, 16> bits{};
    if (getrandom(bits.data(), bits.size(), 0) != static_cast<ssize_t>(bits.size()))
        return {};
    std::string text;
    for (const unsigned char byte : bits) {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", byte);
        text += digits;
    }
    return text;
}

GVariant *toVariant(const Attributes &attributes)
{
    GVariantBuilder builder;
    g_variant_builder_init(&builder, G_VARIANT_TYPE("a{ss}"));
    for (const auto &[name, value] : attributes)
        g_variant_builder_add(&builder, "{ss}", name.c_str(), value.c_str());
    return g_variant_builder_end(&builder);
}

Attributes toAttributes(GVariant *dictionary)
{
    Attributes attributes;
    GVariantIter iterator;
    g_variant_iter_init(&iterator, dictionary);
    const char *name = nullptr;
    const char *value = nullptr;
    while (g_variant_iter_next(&iterator, "{&s&s}", &name, &value))
        attributes[name] = value;
    return attributes;
}

/// The structure in which a secret crosses the bus. GLib's copies of the message are beyond reach; they are freed with
/// the call.
GVariant *toVariant(const std::string &session, std::string_view secret)
{
    GVariant *bytes = g_variant_new_fixed_array(G_VARIANT_TYPE_BYTE, secret.data(), secret.size(), 1);
    return g_variant_new("(o@ay@ays)", session.c_str(), g_variant_new_fixed_array(G_VARIANT_TYPE_BYTE, "", 0, 1), bytes,
                         "text/plain; charset=utf8");
}

/// What a new item is made with.
GVariant *propertiesOf(const Attributes &attributes)
{
    const std::string label = "Kavell account " + attributes.at(kAccountAttribute);
    GVariantBuilder properties;
    g_variant_builder_init(&properties, G_VARIANT_TYPE_VARDICT);
    g_variant_builder_add(&properties, "{sv}", "org.freedesktop.Secret.Item.Label",
                          g_variant_new_string(label.c_str()));
    g_variant_builder_add(&properties, "{sv}", "org.freedesktop.Secret.Item.Attributes", toVariant(attributes));
    return g_variant_builder_end(&properties);
}

class SecretService final : public CredentialStore {
public:
    [[nodiscard]] std::string_view name() const noexcept override { return kSecretServiceStoreName; }

    [[nodiscard]] CredentialStatus probe() override { return m_connection.probe(credentialDeadline()); }

    [[nodiscard]] CredentialStatus unlock(const CredentialItem *item) override;

    [[nodiscard]] CredentialStatus find(std::string_view serviceName, std::string_view accountName,
                                        CredentialItem &item) override
    {
        Place place;
        return findPlace(serviceName, accountName, credentialDeadline(), place, item);
    }

    [[nodiscard]] CredentialStatus resolve(std::string_view identifier, CredentialItem &item) override;
    [[nodiscard]] CredentialStatus list(std::vector<CredentialItem> &items) override;
    [[nodiscard]] CredentialStatus add(std::string_view serviceName, std::string_view accountName,
                                       std::string_view secret, CredentialItem &item) override;
    [[nodiscard]] CredentialStatus readSecret(const CredentialItem &item, Secret &secret) override;
    [[nodiscard]] CredentialStatus replaceSecret(const CredentialItem &item, std::string_view secret) override;
    [[nodiscard]] CredentialStatus remove(const CredentialItem &item) override;

    // The protocol knows no access lists: whoever is on the user's bus may read an unlocked item.
    [[nodiscard]] CredentialStatus readAccess(const CredentialItem &, CredentialAccess &) override
    {
        return CredentialStatus::unsupported;
    }
    [[nodiscard]] CredentialStatus writeAccess(const CredentialItem &, const CredentialAccess &) override
    {
        return CredentialStatus::unsupported;
    }

private:
    CredentialStatus search(const Attributes &attributes, const Deadline &deadline, std::vector<Place> &places);
    CredentialStatus placeOf(const CredentialItem &item, const Deadline &deadline, Place &place);
    CredentialStatus readAttributes(const std::string &path, const Deadline &deadline, Attributes &attributes);
    CredentialStatus describe(const Place &place, const Deadline &deadline, CredentialItem &item);
    CredentialStatus findPlace(std::string_view serviceName, std::string_view accountName, const Deadline &deadline,
                               Place &place, CredentialItem &item);
    CredentialStatus create(const Attributes &attributes, std::string_view secret, const Deadline &deadline);
    CredentialStatus setSecret(const std::string &path, std::string_view secret, const Deadline &deadline);
    CredentialStatus defaultCollection(const Deadline &deadline, std::string &path);
    CredentialStatus createDefaultCollection();
    CredentialStatus isLocked(const char *interface, const std::string &path, const Deadline &deadline, bool &locked);
    CredentialStatus unlockObject(const char *interface, const std::string &path);

    SecretServiceConnection m_connection;
};

CredentialStatus SecretService::search(const Attributes &attributes, const Deadline &deadline,
                                       std::vector<Place> &places)
{
    OwnedVariant reply;
    const CredentialStatus status = m_connection.call({kSecretServicePath, kSecretServiceInterface, "SearchItems",
                                                       g_variant_new("(@a{ss})", toVariant(attributes)), "(aoao)"},
                                                      deadline, reply);
    if (status != CredentialStatus::stored)
        // A service that does not know the question has not answered that there is nothing.
        return status == CredentialStatus::absent ? CredentialStatus::failed : status;
    GVariantIter *open = nullptr;
    GVariantIter *locked = nullptr;
    g_variant_get(reply.get(), "(aoao)", &open, &locked);
    const char *path = nullptr;
    while (g_variant_iter_next(open, "&o", &path))
        places.push_back({path, false});
    while (g_variant_iter_next(locked, "&o", &path))
        places.push_back({path, true});
    g_variant_iter_free(open);
    g_variant_iter_free(locked);
    return places.empty() ? CredentialStatus::absent : CredentialStatus::stored;
}

CredentialStatus SecretService::placeOf(const CredentialItem &item, const Deadline &deadline, Place &place)
{
    if (item.identifier.empty())
        return CredentialStatus::absent;
    std::vector<Place> places;
    const CredentialStatus status = search({{kIdentifierAttribute, item.identifier}}, deadline, places);
    if (status == CredentialStatus::stored)
        place = places.front();
    return status;
}

CredentialStatus SecretService::readAttributes(const std::string &path, const Deadline &deadline,
                                               Attributes &attributes)
{
    OwnedVariant reply;
    const CredentialStatus status = m_connection.call(
        {path.c_str(), kPropertiesInterface, "Get", g_variant_new("(ss)", kSecretItemInterface, "Attributes"), "(v)"},
        deadline, reply);
    if (status != CredentialStatus::stored)
        return status;
    GVariant *value = nullptr;
    g_variant_get(reply.get(), "(v)", &value);
    const OwnedVariant owned(value);
    if (!g_variant_is_of_type(value, G_VARIANT_TYPE("a{ss}")))
        return CredentialStatus::failed;
    attributes = toAttributes(value);
    return status;
}

/// Fills in the item at a place. One that has lost its identifier gets a new one, so that it can be referred to.
CredentialStatus SecretService::describe(const Place &place, const Deadline &deadline, CredentialItem &item)
{
    Attributes attributes;
    if (const CredentialStatus status = readAttributes(place.path, deadline, attributes);
        status != CredentialStatus::stored)
        return status;
    std::string &identifier = attributes[kIdentifierAttribute];
    if (identifier.empty() && !place.isLocked) {
        identifier = makeIdentifier();
        OwnedVariant reply;
        // Setting attributes replaces all of them: hence the whole set, with the new one in it.
        GVariant *arguments = g_variant_new("(ssv)", kSecretItemInterface, "Attributes", toVariant(attributes));
        if (m_connection.call({place.path.c_str(), kPropertiesInterface, "Set", arguments, "()"}, deadline, reply) !=
            CredentialStatus::stored)
            identifier.clear();
    }
    item = {std::string(name()), identifier, attributes[kServiceAttribute], attributes[kAccountAttribute]};
    // A collection that was never unlocked keeps its attributes to itself.
    return identifier.empty() && place.isLocked ? CredentialStatus::locked : CredentialStatus::stored;
}

CredentialStatus SecretService::findPlace(std::string_view serviceName, std::string_view accountName,
                                          const Deadline &deadline, Place &place, CredentialItem &item)
{
    std::vector<Place> places;
    CredentialStatus status = search({{kApplicationAttribute, kApplication},
                                      {kServiceAttribute, std::string(serviceName)},
                                      {kAccountAttribute, std::string(accountName)}},
                                     deadline, places);
    if (status != CredentialStatus::stored)
        return status;
    CredentialItem found;
    status = describe(places.front(), deadline, found);
    if (status != CredentialStatus::stored)
        return status;
    place = places.front();
    item = {found.storeName, found.identifier, std::string(serviceName), std::string(accountName)};
    return status;
}

CredentialStatus SecretService::resolve(std::string_view identifier, CredentialItem &item)
{
    const Deadline deadline = credentialDeadline();
    Place place;
    CredentialStatus status = placeOf({{}, std::string(identifier), {}, {}}, deadline, place);
    if (status != CredentialStatus::stored)
        return status;
    CredentialItem found;
    status = describe(place, deadline, found);
    if (status != CredentialStatus::stored && status != CredentialStatus::locked)
        return status;
    item = found;
    // The item is there, even where its names cannot be read before it is unlocked.
    item.identifier = identifier;
    return CredentialStatus::stored;
}

CredentialStatus SecretService::list(std::vector<CredentialItem> &items)
{
    const Deadline deadline = credentialDeadline();
    std::vector<Place> places;
    CredentialStatus status = search({{kApplicationAttribute, kApplication}}, deadline, places);
    if (status == CredentialStatus::absent)
        status = CredentialStatus::stored;
    if (status != CredentialStatus::stored)
        return status;
    std::vector<CredentialItem> found;
    for (const Place &place : places) {
        CredentialItem item;
        status = describe(place, deadline, item);
        if (status == CredentialStatus::stored)
            found.push_back(std::move(item));
        else if (status != CredentialStatus::absent)  // deleted since the search
            return status;
    }
    items = std::move(found);
    return CredentialStatus::stored;
}

CredentialStatus SecretService::add(std::string_view serviceName, std::string_view accountName, std::string_view secret,
                                    CredentialItem &item)
{
    const Deadline deadline = credentialDeadline();
    // The service makes a second item of the same names without a word, so adders search first, one at a time.
    const FileLock lock(kLockName, deadline);
    if (lock.state() != FileLock::State::held)
        return lock.state() == FileLock::State::timedOut ? CredentialStatus::unreachable : CredentialStatus::failed;
    Place place;
    CredentialItem found;
    CredentialStatus status = findPlace(serviceName, accountName, deadline, place, found);
    if (status == CredentialStatus::stored)
        status = place.isLocked ? CredentialStatus::locked : setSecret(place.path, secret, deadline);
    else if (status == CredentialStatus::absent) {
        found = {std::string(name()), makeIdentifier(), std::string(serviceName), std::string(accountName)};
        if (found.identifier.empty())
            return CredentialStatus::failed;
        status = create({{kSchemaAttribute, kSchema},
                         {kApplicationAttribute, kApplication},
                         {kServiceAttribute, found.serviceName},
                         {kAccountAttribute, found.accountName},
                         {kIdentifierAttribute, found.identifier}},
                        secret, deadline);
    }
    if (status == CredentialStatus::stored)
        item = found;
    return status;
}

CredentialStatus SecretService::create(const Attributes &attributes, std::string_view secret, const Deadline &deadline)
{
    std::string collection;
    if (const CredentialStatus status = defaultCollection(deadline, collection); status != CredentialStatus::stored)
        return status == CredentialStatus::absent ? CredentialStatus::locked : status;
    OwnedVariant reply;
    const CredentialStatus status = m_connection.withSession(deadline, [&](const std::string &session) {
        GVariant *arguments =
            g_variant_new("(@a{sv}@(oayays)b)", propertiesOf(attributes), toVariant(session, secret), FALSE);
        return m_connection.call({collection.c_str(), kSecretCollectionInterface, "CreateItem", arguments, "(oo)"},
                                 deadline, reply);
    });
    if (status != CredentialStatus::stored)
        return status == CredentialStatus::absent ? CredentialStatus::failed : status;
    const char *created = nullptr;
    g_variant_get(reply.get(), "(&o&o)", &created, nullptr);
    // A prompt instead of an item: the service wants the collection unlocked first, which is not this question's part.
    return created == kNoObject ? CredentialStatus::locked : CredentialStatus::stored;
}

CredentialStatus SecretService::readSecret(const CredentialItem &item, Secret &secret)
{
    const Deadline deadline = credentialDeadline();
    Place place;
    if (const CredentialStatus status = placeOf(item, deadline, place); status != CredentialStatus::stored)
        return status;
    if (place.isLocked)
        return CredentialStatus::locked;
    OwnedVariant reply;
    const CredentialStatus status = m_connection.withSession(deadline, [&](const std::string &session) {
        return m_connection.call({place.path.c_str(), kSecretItemInterface, "GetSecret",
                                  g_variant_new("(o)", session.c_str()), "((oayays))"},
                                 deadline, reply);
    });
    if (status != CredentialStatus::stored)
        return status;
    const OwnedVariant structure(g_variant_get_child_value(reply.get(), 0));
    const OwnedVariant bytes(g_variant_get_child_value(structure.get(), 2));
    gsize length = 0;
    const void *data = g_variant_get_fixed_array(bytes.get(), &length, 1);
    secret = Secret({static_cast<const char *>(data), length});
    return status;
}

CredentialStatus SecretService::setSecret(const std::string &path, std::string_view secret, const Deadline &deadline)
{
    return m_connection.withSession(deadline, [&](const std::string &session) {
        OwnedVariant reply;
        return m_connection.call({path.c_str(), kSecretItemInterface, "SetSecret",
                                  g_variant_new("(@(oayays))", toVariant(session, secret)), "()"},
                                 deadline, reply);
    });
}

CredentialStatus SecretService::replaceSecret(const CredentialItem &item, std::string_view secret)
{
    const Deadline deadline = credentialDeadline();
    Place place;
    if (const CredentialStatus status = placeOf(item, deadline, place); status != CredentialStatus::stored)
        return status;
    return place.isLocked ? CredentialStatus::locked : setSecret(place.path, secret, deadline);
}

CredentialStatus SecretService::remove(const CredentialItem &item)
{
    const Deadline deadline = credentialDeadline();
    Place place;
    if (const CredentialStatus status = placeOf(item, deadline, place); status != CredentialStatus::stored)
        return status;
    if (place.isLocked)
        return CredentialStatus::locked;
    OwnedVariant reply;
    const CredentialStatus status =
        m_connection.call({place.path.c_str(), kSecretItemInterface, "Delete", nullptr, "(o)"}, deadline, reply);
    if (status != CredentialStatus::stored)
        return status;
    const char *prompt = nullptr;
    g_variant_get(reply.get(), "(&o)", &prompt);
    OwnedVariant result;
    // Some services have the user confirm a deletion.
    return prompt == kNoObject ? status : m_connection.prompt(prompt, unlockDeadline(), result);
}

/// Absent when the service has no default collection, as KWallet and a fresh gnome-keyring.
CredentialStatus SecretService::defaultCollection(const Deadline &deadline, std::string &path)
{
    OwnedVariant reply;
    const CredentialStatus status = m_connection.call(
        {kSecretServicePath, kSecretServiceInterface, "ReadAlias", g_variant_new("(s)", "default"), "(o)"}, deadline,
        reply);
    if (status != CredentialStatus::stored)
        return status == CredentialStatus::absent ? CredentialStatus::failed : status;
    const char *found = nullptr;
    g_variant_get(reply.get(), "(&o)", &found);
    if (found == kNoObject)
        return CredentialStatus::absent;
    path = found;
    return status;
}

CredentialStatus SecretService::createDefaultCollection()
{
    GVariantBuilder properties;
    g_variant_builder_init(&properties, G_VARIANT_TYPE_VARDICT);
    g_variant_builder_add(&properties, "{sv}", "org.freedesktop.Secret.Collection.Label",
                          g_variant_new_string(kNewCollectionLabel));
    OwnedVariant reply;
    CredentialStatus status = m_connection.call({kSecretServicePath, kSecretServiceInterface, "CreateCollection",
                                                 g_variant_new("(a{sv}s)", &properties, "default"), "(oo)"},
                                                credentialDeadline(), reply);
    if (status != CredentialStatus::stored)
        return status;
    const char *prompt = nullptr;
    g_variant_get(reply.get(), "(&o&o)", nullptr, &prompt);
    OwnedVariant result;
    if (prompt != kNoObject)
        status = m_connection.prompt(prompt, unlockDeadline(), result);
    std::string path;
    if (status == CredentialStatus::stored)
        status = defaultCollection(credentialDeadline(), path);
    return status == CredentialStatus::absent ? CredentialStatus::locked : status;
}

CredentialStatus SecretService::isLocked(const char *interface, const std::string &path, const Deadline &deadline,
                                         bool &locked)
{
    OwnedVariant reply;
    const CredentialStatus status = m_connection.call(
        {path.c_str(), kPropertiesInterface, "Get", g_variant_new("(ss)", interface, "Locked"), "(v)"}, deadline,
        reply);
    if (status != CredentialStatus::stored)
        return status;
    GVariant *value = nullptr;
    g_variant_get(reply.get(), "(v)", &value);
    const OwnedVariant owned(value);
    locked = !g_variant_is_of_type(value, G_VARIANT_TYPE_BOOLEAN) || g_variant_get_boolean(value);
    return status;
}

CredentialStatus SecretService::unlockObject(const char *interface, const std::string &path)
{
    bool locked = true;
    CredentialStatus status = isLocked(interface, path, credentialDeadline(), locked);
    if (status != CredentialStatus::stored || !locked)
        return status;
    const char *const paths[] = {path.c_str()};
    OwnedVariant reply;
    status = m_connection.call({kSecretServicePath, kSecretServiceInterface, "Unlock",
                                g_variant_new("(@ao)", g_variant_new_objv(paths, 1)), "(aoo)"},
                               credentialDeadline(), reply);
    if (status != CredentialStatus::stored)
        return status;
    const char *prompt = nullptr;
    g_variant_get(reply.get(), "(ao&o)", nullptr, &prompt);
    OwnedVariant result;
    if (prompt != kNoObject)
        status = m_connection.prompt(prompt, unlockDeadline(), result);
    if (status != CredentialStatus::stored)
        return status;
    // A service that cannot show its prompt says that all went well, with nothing unlocked: hence look again.
    status = isLocked(interface, path, credentialDeadline(), locked);
    return status == CredentialStatus::stored && locked ? CredentialStatus::locked : status;
}

CredentialStatus SecretService::unlock(const CredentialItem *item)
{
    if (item) {
        Place place;
        const CredentialStatus status = placeOf(*item, credentialDeadline(), place);
        if (status != CredentialStatus::stored || !place.isLocked)
            return status;
        return unlockObject(kSecretItemInterface, place.path);
    }
    std::string collection;
    const CredentialStatus status = defaultCollection(credentialDeadline(), collection);
    if (status == CredentialStatus::absent)
        return createDefaultCollection();
    return status == CredentialStatus::stored ? unlockObject(kSecretCollectionInterface, collection) : status;
}

}  // namespace

CredentialStore *makeSecretService()
{
    return new SecretService;
}

}  // namespace kavell
