// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/transfer_format.h"

#include <algorithm>
#include <array>
#include <set>

#include <kavellaccounts/CSKavellUUID.h>

#include "tools/failure.h"
#include "tools/json_value.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

/// What an account of a document may have. The last is what show adds.
constexpr std::array<std::string_view, 6> memberNames{"provider",   "login",    "uuid",
                                                      "attributes", "services", "passwordState"};

std::string textMember(const Json &json, const char *name, const std::string &place)
{
    const auto member = json.find(name);
    if (member == json.end())
        return {};
    if (!member->is_string())
        refuse(place + " has a " + name + " that is no text");
    return member->get<std::string>();
}

Address addressMember(const Json &json, const std::string &place)
{
    const std::string provider = textMember(json, "provider", place);
    Address address{provider, textMember(json, "login", place)};
    if (provider.empty() || address.login.empty())
        refuse(place + " has no " + (provider.empty() ? "provider" : "login"));
    try {
        address.providerType = providerTypeOf(provider);
        checkName(address.login, "login name");
    } catch (const Failure &failure) {
        refuse(place + ": " + failure.what());
    }
    return address;
}

Ref<CSKavellDictionaryRef> attributesMember(const Json &json, const std::string &place)
{
    Ref<CSKavellDictionaryRef> attributes = dictionaryOf(json, place);
    if (CSKavellDictionaryGetValue(attributes.get(), makeString(passwordReferenceKey).get()))
        refuse(place + " has " + std::string(passwordReferenceKey) +
               ", a reference to a password, which means nothing elsewhere; leave it out");
    return attributes;
}

TransferredAccount accountMember(const Json &json, const std::string &place)
{
    if (!json.is_object())
        refuse(place + " is not a JSON object");
    for (const auto &[name, value] : json.items())
        if (std::find(memberNames.begin(), memberNames.end(), name) == memberNames.end())
            refuse(place + " has " + inQuotes(name) + ", which means nothing; an account has " +
                   joined({memberNames.data(), memberNames.size() - 1}, ", "));
    TransferredAccount account;
    account.address = addressMember(json, place);
    const std::string named = place + " (" + account.address.text() + ")";
    account.uuid = textMember(json, "uuid", named);
    if (!account.uuid.empty() && !adopt(CSKavellUUIDCreateFromString(makeString(account.uuid).get())))
        refuse(named + " has the uuid " + inQuotes(account.uuid) +
               ", which is none; write 36 characters like 123e4567-e89b-42d3-a456-426614174000, or leave it out");
    const Json none = Json::object();
    account.attributes =
        attributesMember(json.contains("attributes") ? json["attributes"] : none, named + " attributes");
    const Json &services = json.contains("services") ? json["services"] : none;
    if (!services.is_object())
        refuse(named + " has services that are not a JSON object");
    for (const auto &[name, attributes] : services.items()) {
        std::string identifier;
        try {
            identifier = serviceOf(name);
        } catch (const Failure &failure) {
            refuse(named + ": " + failure.what());
        }
        account.services[identifier] = dictionaryOf(attributes, named + " " + escaped(name));
    }
    return account;
}

}  // namespace

std::vector<TransferredAccount> readTransferDocument(std::string_view text, const std::string &name)
{
    const Json document = parseJson(text, name);
    const Json *version =
        document.is_object() && document.contains(transferVersionKey) ? &document[transferVersionKey] : nullptr;
    if (!version || !version->is_number_integer())
        refuse(name + " is no export of kavell-accounts: it has no number at \"" + transferVersionKey + "\"");
    if (*version != transferVersion)
        refuse(name + " has the format " + version->dump() + ", and this program knows " +
               std::to_string(transferVersion) + " only; use a newer kavell-accounts");
    if (!document.contains("accounts") || !document["accounts"].is_array())
        refuse(name + " has no array \"accounts\"");
    std::vector<TransferredAccount> accounts;
    std::set<Address> seen;
    for (const Json &json : document["accounts"]) {
        const std::string place = name + ", account " + std::to_string(accounts.size() + 1);
        accounts.push_back(accountMember(json, place));
        if (!seen.insert(accounts.back().address).second)
            refuse(place + ": " + accounts.back().address.text() + " is there twice");
    }
    return accounts;
}

}  // namespace kavell::tools
