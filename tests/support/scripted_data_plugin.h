// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A data plug-in whose set-up a test writes: what it does when a discovery starts, and what account it makes. The data
// plug-ins of plugin_directory.h are of this class. A script may call the messages to the delegate on any thread.

#ifndef KAVELL_TESTS_SUPPORT_SCRIPTED_DATA_PLUGIN_H
#define KAVELL_TESTS_SUPPORT_SCRIPTED_DATA_PLUGIN_H

#include <functional>

#include <kavellaccounts/KADataPlugin.h>

namespace kavell::test {

class ScriptedDataPlugin : public KADataPlugin {
public:
    using Input = std::shared_ptr<KAAccountSetupInput>;
    using Result = std::shared_ptr<KAAccountSetupResult>;

    using KADataPlugin::KADataPlugin;

    using KADataPlugin::accountSetupDidFail;
    using KADataPlugin::accountSetupDidFinish;
    using KADataPlugin::accountSetupUpdate;
    using KADataPlugin::didChangeAccountUID;
    using KADataPlugin::didCreateAccountUID;
    using KADataPlugin::didDeleteAccountUID;
    using KADataPlugin::handleCertificateError;
    using KADataPlugin::nbsAccountMigrationFinished;

    /// Without a script, the base's exception.
    std::function<void(const Input &)> onStart;
    std::function<QString(const Input &, const Result &, KAError *)> onCreate;

    void startAccountSetupWithInput(const Input &input) override
    {
        return onStart ? onStart(input) : KADataPlugin::startAccountSetupWithInput(input);
    }

    [[nodiscard]] QString createAccountForInput(const Input &input, const Result &result, KAError *error) override
    {
        return onCreate ? onCreate(input, result, error) : KADataPlugin::createAccountForInput(input, result, error);
    }
};

}  // namespace kavell::test

#endif
