// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of the cross-application set-up share: a home without accounts, plug-ins of real bundles whose set-up
// the test writes, and a name server that knows nothing. Main thread.

#ifndef KAVELL_TESTS_SETUP_CROSS_APP_FIXTURE_H
#define KAVELL_TESTS_SETUP_CROSS_APP_FIXTURE_H

#include <mutex>

#include <QtTest/QTest>
#include <QtWidgets/QCheckBox>

#include <QtCore/QThreadPool>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KACrossAppSetupViewController.h>
#include <kavellaccounts/KAPluginManager.h>

#include "tests/model/account_fixture.h"
#include "tests/support/dns_server.h"
#include "tests/support/log_capture.h"
#include "tests/support/plugin_directory.h"
#include "tests/support/scripted_data_plugin.h"

namespace kavell::test {

using Controller = KACrossAppSetupViewController;

inline const QStringList kAllServices{"kKAServiceIMAP", "kKAServiceCalDAV", "kKAServiceCardDAV", "kKAServiceIM"};
inline const QVariantMap kAda{{"emailAddress", "ada@zorbo.example"}};

class CrossAppTest : public AccountTest {
protected:
    /// The set-ups in the pool use the plug-ins until they end.
    ~CrossAppTest() override { QThreadPool::globalInstance()->waitForDone(); }

    /// The account-list plug-in that claims zorbo.example.
    void addProvider(const QStringList &services = kAllServices)
    {
        m_plugins.addListPlugin({.identifier = kKAYahooPluginID,
                                 .providerType = kKAProviderYahoo,
                                 .serviceTypes = services,
                                 .domains = {"zorbo.example"}});
    }

    void addListPlugin(const PluginDescription &description) { m_plugins.addListPlugin(description); }

    /// A registered data plug-in that finds everything at once and makes an account named after it.
    ScriptedDataPlugin &addDataPlugin(const QString &identifier, const QString &providerType = {})
    {
        m_plugins.addDataPlugin({.identifier = identifier, .providerType = providerType});
        auto *const plugin = qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(identifier));
        if (!plugin)
            throw std::runtime_error("no plug-in " + identifier.toStdString());
        auto *const scripted = static_cast<ScriptedDataPlugin *>(plugin);
        scripted->onStart = [this, scripted, identifier](const ScriptedDataPlugin::Input &input) {
            note(identifier, input);
            scripted->accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>());
        };
        scripted->onCreate = [identifier](const auto &, const auto &, KAError *) {
            return "new-" + identifier;
        };
        return *scripted;
    }

    void addAllDataPlugins()
    {
        for (const QString &identifier : {kKAMailPluginID, kKAContactsPluginID, kKACalendarPluginID, kKAChatPluginID})
            addDataPlugin(identifier);
    }

    /// @name What the plug-ins were asked to set up, on any thread
    /// @{
    void note(const QString &pluginID, const ScriptedDataPlugin::Input &input)
    {
        const std::lock_guard lock(m_mutex);
        m_started += pluginID;
        m_lastInput = input;
    }
    [[nodiscard]] QStringList started() const
    {
        const std::lock_guard lock(m_mutex);
        return m_started;
    }
    template <typename Input> [[nodiscard]] std::shared_ptr<Input> lastInput() const
    {
        const std::lock_guard lock(m_mutex);
        return std::dynamic_pointer_cast<Input>(m_lastInput);
    }
    /// @}

    /// The check boxes that are shown: "Contacts" for one that can be clicked, "Contacts (there)" for a disabled one,
    /// and with a minus sign before it for one that is not ticked.
    [[nodiscard]] static QStringList shown(QWidget *view)
    {
        QStringList texts;
        for (const QCheckBox *box : checkboxes(view)) {
            if (!box->isHidden())
                texts += (box->isChecked() ? "" : "-") + box->text() + (box->isEnabled() ? "" : " (there)");
        }
        return texts;
    }

    [[nodiscard]] static QList<QCheckBox *> checkboxes(QWidget *view)
    {
        return {view->findChild<QCheckBox *>("checkbox1"), view->findChild<QCheckBox *>("checkbox2"),
                view->findChild<QCheckBox *>("checkbox3")};
    }

    static void click(QCheckBox *box) { QTest::mouseClick(box, Qt::LeftButton, {}, QPoint(8, box->height() / 2)); }

    /// Waits for something to come true while events run; false after ten seconds.
    template <typename Condition> [[nodiscard]] static bool soon(Condition &&condition)
    {
        return QTest::qWaitFor(condition, 10000);
    }

    DnsServer m_nameServer;
    PluginDirectory m_plugins;

private:
    mutable std::mutex m_mutex;
    QStringList m_started;
    ScriptedDataPlugin::Input m_lastInput;
};

}  // namespace kavell::test

#endif
