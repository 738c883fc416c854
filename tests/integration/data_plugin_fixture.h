// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example data plug-ins as the build makes them, with a data directory of their own for each test, and a delegate
// that notes what it is told. User-interface thread.

#ifndef KAVELL_TESTS_INTEGRATION_DATA_PLUGIN_FIXTURE_H
#define KAVELL_TESTS_INTEGRATION_DATA_PLUGIN_FIXTURE_H

#include <algorithm>
#include <memory>
#include <string>

#include <QtCore/QCoreApplication>
#include <QtCore/QElapsedTimer>
#include <QtCore/QObject>
#include <QtCore/QStringList>
#include <QtCore/QThread>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "tests/model/account_fixture.h"

namespace kavell::test {

/// Lets the calling thread's events run until `isDone`, for ten seconds at most. Whether it was done.
template <typename Condition> [[nodiscard]] bool runUntil(const Condition &isDone)
{
    constexpr qint64 kBound = 10000;
    QElapsedTimer clock;
    clock.start();
    while (!isDone() && clock.elapsed() < kBound)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents | QEventLoop::AllEvents, 50);
    return isDone();
}

class SetupRecorder : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void pluginAccountSetupUpdate(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                              const QVariant &status)
    {
        messages += "update " + status.toString();
        thread = QThread::currentThread();
    }
    Q_INVOKABLE void pluginAccountSetupDidFinish(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                                 const std::shared_ptr<KAAccountSetupResult> &discovered)
    {
        messages += "finish";
        result = discovered;
        thread = QThread::currentThread();
    }
    Q_INVOKABLE void pluginAccountSetupDidFail(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                               const KAError &reason)
    {
        messages += "fail";
        error = reason;
    }
    Q_INVOKABLE void pluginDidCreateAccountUID(KADataPlugin *, const QString &uid) { messages += "create " + uid; }
    Q_INVOKABLE void pluginDidChangeAccountUID(KADataPlugin *, const QString &uid) { messages += "change " + uid; }
    Q_INVOKABLE void pluginDidDeleteAccountUID(KADataPlugin *, const QString &uid) { messages += "delete " + uid; }
    Q_INVOKABLE void pluginNbsAccountMigrationFinished(KADataPlugin *, const std::shared_ptr<KAAccount> &account)
    {
        messages += "migrated " + account->loginName();
    }

    [[nodiscard]] bool hasEnded() const { return messages.contains("finish") || messages.contains("fail"); }

    QStringList messages;
    std::shared_ptr<KAAccountSetupResult> result;
    KAError error;
    QThread *thread = nullptr;
};

class DataPluginTest : public AccountTest {
protected:
    void SetUp() override
    {
        AccountTest::SetUp();
        setenv("XDG_DATA_HOME", homePath("data").c_str(), 1);
        setenv("VESK_FRAMEWORK_PATH", buildPath("examples/plugins").c_str(), 1);
    }

    void TearDown() override
    {
        for (KADataPlugin *loaded : KAPluginManager::shared()->allDataPlugins())
            loaded->setDelegate(nullptr);
        AccountTest::TearDown();
    }

    [[nodiscard]] static KADataPlugin &plugin(const QString &identifier = kKAMailPluginID)
    {
        auto *const found = qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(identifier));
        if (!found)
            throw std::runtime_error("no plug-in " + identifier.toStdString());
        return *found;
    }

    [[nodiscard]] std::string accountsPath(const QString &identifier = kKAMailPluginID) const
    {
        return homePath("data/kavell-accounts-example/" + identifier.toStdString() + ".json");
    }

    [[nodiscard]] static std::shared_ptr<KAMailAccountSetupInput> mailInput(const QString &address)
    {
        auto input = std::make_shared<KAMailAccountSetupInput>();
        input->setEmailAddress(address);
        input->setFullName("Carla Zorbo");
        input->setAccountDescription("My mail");
        input->setPassword("secret");
        return input;
    }

    /// Discovers on the calling thread and makes the account; its UID.
    static QString makeAccount(KADataPlugin &dataPlugin, const std::shared_ptr<KAAccountSetupInput> &input,
                               KAError *error = nullptr)
    {
        SetupRecorder recorder;
        QObject *const before = dataPlugin.delegate();
        dataPlugin.setDelegate(&recorder);
        dataPlugin.startAccountSetupWithInput(input);
        const bool hasEnded = runUntil([&] { return recorder.hasEnded(); });
        dataPlugin.setDelegate(before);
        EXPECT_TRUE(hasEnded);
        EXPECT_TRUE(recorder.result) << recorder.error.description().toStdString();
        return dataPlugin.createAccountForInput(input, recorder.result, error);
    }
};

}  // namespace kavell::test

#endif
