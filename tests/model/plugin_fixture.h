// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of accounts share that ask plug-ins: a home without accounts, a registry that knows the plug-ins of
// the test alone, and a name server that counts what it is asked. Answers of a name server are kept for the life of
// the program, so that each test that wants a look-up has domains of its own. One thread.

#ifndef KAVELL_TESTS_MODEL_PLUGIN_FIXTURE_H
#define KAVELL_TESTS_MODEL_PLUGIN_FIXTURE_H

#include <kavellaccounts/KAPluginManager.h>

#include "tests/model/account_fixture.h"
#include "tests/support/dns_server.h"
#include "tests/support/plugin_directory.h"

namespace kavell::test {

class AccountWithPluginsTest : public AccountTest {
protected:
    /// An account-list plug-in with a provider of the type, which claims these domains.
    void addListPlugin(const QString &identifier, const QString &providerType, const QStringList &domains = {})
    {
        m_plugins.addListPlugin({.identifier = identifier, .providerType = providerType, .domains = domains});
    }

    void addDataPlugin(const QString &identifier) { m_plugins.addDataPlugin({.identifier = identifier}); }

    [[nodiscard]] DnsServer &nameServer() { return m_nameServer; }

    /// How often the name server was asked anything.
    [[nodiscard]] size_t lookupCount() const { return m_nameServer.queries().size(); }

private:
    DnsServer m_nameServer;
    PluginDirectory m_plugins;
};

}  // namespace kavell::test

#endif
