// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of account creators share: data plug-ins outside the registry that bear an application's plug-in
// identifier and whose set-up the test writes, and providers. Main thread.

#ifndef KAVELL_TESTS_SETUP_CREATOR_FIXTURE_H
#define KAVELL_TESTS_SETUP_CREATOR_FIXTURE_H

#include <map>

#include <QtCore/QThreadPool>

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/model/plugin_fixture.h"
#include "tests/support/log_capture.h"
#include "tests/support/scripted_data_plugin.h"

namespace kavell::test {

using Input = ScriptedDataPlugin::Input;
using Result = ScriptedDataPlugin::Result;

inline const QVariantMap kSettings{{"emailAddress", "ada@zorbo.example"}};

class CreatorTest : public AccountWithPluginsTest {
protected:
    /// Creators in the pool let go of their plug-ins last of all.
    ~CreatorTest() override { QThreadPool::globalInstance()->waitForDone(); }

    /// The data plug-in of an application, which finds everything at once and makes the account "uid-1".
    ScriptedDataPlugin &plugin(const QString &identifier = kKAMailPluginID)
    {
        std::unique_ptr<ScriptedDataPlugin> &made = m_plugins[identifier];
        if (!made) {
            addDataPlugin(identifier);
            made = std::make_unique<ScriptedDataPlugin>(bundleOf(identifier));
            made->onStart = [this, found = made.get()](const Input &input) {
                ++starts;
                lastInput = input;
                found->accountSetupDidFinish(input, result);
            };
            made->onCreate = [this](const Input &input, const Result &, KAError *) {
                ++creations;
                EXPECT_EQ(input, lastInput);
                return QStringLiteral("uid-1");
            };
        }
        return *made;
    }

    void destroyPlugin(const QString &identifier = kKAMailPluginID) { m_plugins.erase(identifier); }

    [[nodiscard]] static std::shared_ptr<KAProvider> provider(const QString &type)
    {
        return KAProvider::initWithProviderType(type);
    }

    /// What a creator of the class hands to its plug-in for settings and a provider type.
    template <typename Creator, typename Record>
    std::shared_ptr<Record> inputOf(const QVariantMap &settings, const QString &providerType = {})
    {
        const auto creator = Creator::initWithSettings(settings, &plugin());
        if (!providerType.isNull())
            creator->setProvider(provider(providerType));
        EXPECT_TRUE(creator->create());
        auto record = std::dynamic_pointer_cast<Record>(lastInput);
        EXPECT_TRUE(record);
        return record ? record : std::make_shared<Record>();
    }

    int starts = 0;
    int creations = 0;
    Input lastInput;
    const Result result = std::make_shared<KAAccountSetupResult>();

private:
    [[nodiscard]] static std::shared_ptr<KABundle> bundleOf(const QString &identifier)
    {
        return KABundle::bundleWithPath(qEnvironmentVariable("VESK_FRAMEWORK_PATH") + u'/' + identifier);
    }

    std::map<QString, std::unique_ptr<ScriptedDataPlugin>> m_plugins;
};

}  // namespace kavell::test

#endif
