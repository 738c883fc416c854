// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of matching share: a home without accounts, a directory of plug-ins that each have a provider, a name
// server that knows nothing, and short ways to make an account and to tell which one an answer is. One thread.

#ifndef KAVELL_TESTS_PLUGINS_MATCHING_FIXTURE_H
#define KAVELL_TESTS_PLUGINS_MATCHING_FIXTURE_H

#include <kavellaccounts/KAProvider.h>

#include "tests/model/plugin_fixture.h"

namespace kavell::test {

class MatchingTest : public AccountWithPluginsTest {
protected:
    /// An account of that provider, which the first call makes the registry load the plug-ins for.
    static void addAccount(const QString &providerType, const QString &loginName)
    {
        const auto provider = manager().providerOfType(providerType);
        ASSERT_TRUE(provider);
        ASSERT_TRUE(provider->createAccountWithLoginName(loginName));
    }

    static KAPluginManager &manager() { return *KAPluginManager::shared(); }

    /// "login at provider type", or "none".
    static QString named(const std::shared_ptr<KAAccount> &account)
    {
        return account ? account->loginName() + QStringLiteral(" at ") + account->provider() : QStringLiteral("none");
    }

    static QString mail(const QVariantMap &settings)
    {
        return named(manager()._matchingAlistAccountForMailAccountSettings(settings));
    }
    static QString calendar(const QVariantMap &settings)
    {
        return named(manager()._matchingAlistAccountForCalendarAccountSettings(settings));
    }
    static QString contacts(const QVariantMap &settings)
    {
        return named(manager()._matchingAlistAccountForContactsAccountSettings(settings));
    }
    static QString chat(const QVariantMap &settings)
    {
        return named(manager()._matchingAlistAccountForChatAccountSettings(settings));
    }
};

}  // namespace kavell::test

#endif
