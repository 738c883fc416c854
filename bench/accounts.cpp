// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "bench/accounts.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace kavell::bench {

namespace {

constexpr const char *kServiceKeys[] = {"com.corvane.Server",     "com.corvane.Port",     "com.corvane.path",
                                        "com.corvane.smtpServer", "com.corvane.smtpPort", "com.corvane.uid",
                                        "com.corvane.useSSL"};

void fillService(CSKavellAccountRef account, CSKavellStringRef serviceID, int number)
{
    for (size_t index = 0; index < std::size(kServiceKeys); ++index) {
        const auto key = makeString(kServiceKeys[index]);
        Ref<CSKavellTypeRef> value;
        if (index == 1 || index == 4)
            value = adopt<CSKavellTypeRef>(CSKavellNumberCreateWithInt64(993 + static_cast<int>(index)));
        else if (index == 6)
            value = retain<CSKavellTypeRef>(CSKavellBooleanGetShared(true));
        else
            value = Ref<CSKavellTypeRef>(makeString("server" + std::to_string(number) + ".mail.example.org"));
        _CSKavellAccountSetServiceAttribute(account, serviceID, key.get(), value.get());
    }
}

std::string replaced(std::string text, const std::string &from, const std::string &to)
{
    for (size_t place = 0; (place = text.find(from, place)) != std::string::npos; place += to.size())
        text.replace(place, from.size(), to);
    return text;
}

}  // namespace

void fillAccount(CSKavellAccountRef account, int number)
{
    const std::string person = "Person Number " + std::to_string(number);
    const std::string address = "person" + std::to_string(number) + "@mail.example.org";
    _CSKavellAccountSetProviderAttribute(account, kCSKavellAccountUserFullName, makeString(person).get());
    _CSKavellAccountSetProviderAttribute(account, kCSKavellAccountUserNickname, makeString(person).get());
    _CSKavellAccountSetProviderAttribute(account, makeString("emailAddress").get(), makeString(address).get());
    _CSKavellAccountSetProviderAttribute(account, makeString("accountDescription").get(), makeString(address).get());
    fillService(account, kCSKavellAccountServiceIMAPMail, number);
    fillService(account, kCSKavellAccountServiceCalDAV, number);
}

std::string providerDirectory(CSKavellStringRef providerType)
{
    return std::string(std::getenv("HOME")) + "/Library/Kavell Accounts/V1/" + toStdString(providerType);
}

Ref<CSKavellStringRef> providerWithAccounts(int count)
{
    const auto providerType = makeString("org.example.bench" + std::to_string(count));
    const std::string directory = providerDirectory(providerType.get());
    if (std::filesystem::exists(directory))
        return providerType;
    // One account made by the store is the pattern for all: thousands of durable commits would only take time.
    const auto first = adopt(_CSKavellAccountCreate(nullptr, providerType.get(), makeString("person0").get()));
    fillAccount(first.get(), 1000000);
    _CSKavellAccountCommitChanges(first.get());
    std::ostringstream pattern;
    pattern << std::ifstream(directory + "/person0.plist").rdbuf();
    for (int number = 1; number < count; ++number) {
        const auto uuid = adopt(CSKavellUUIDCopyString(adopt(CSKavellUUIDCreate()).get()));
        const auto ownUUID = adopt(_CSKavellAccountCopyUUIDString(first.get()));
        const std::string text = replaced(replaced(pattern.str(), "1000000", std::to_string(1000000 + number)),
                                          toStdString(ownUUID.get()), toStdString(uuid.get()));
        std::ofstream(directory + "/person" + std::to_string(number) + ".plist") << text;
    }
    return providerType;
}

}  // namespace kavell::bench
