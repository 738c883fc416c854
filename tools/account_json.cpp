// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/account_json.h"

namespace kavell::tools {

Json addressJson(const Address &address)
{
    Json json = Json::object();
    json["provider"] = address.providerType;
    json["login"] = address.login;
    return json;
}

Json accountJson(const OpenedAccount &account)
{
    Json json = addressJson(account.address);
    json["uuid"] = toStdString(adopt(_CSKavellAccountCopyUUIDString(account.record.get())).get());
    json["attributes"] = plainJson(ownAttributes(account.record.get()).get());
    Json services = Json::object();
    for (const std::string &identifier : serviceIdentifiers(account)) {
        const Ref<CSKavellDictionaryRef> attributes =
            adopt(_CSKavellAccountCopyServiceAttributes(account.record.get(), makeString(identifier).get()));
        services[identifier] = plainJson(attributes.get());
    }
    json["services"] = std::move(services);
    return json;
}

std::string outcomeText(const Address &address, const char *what)
{
    Json json = addressJson(address);
    json[what] = true;
    return textOf(json);
}

}  // namespace kavell::tools
