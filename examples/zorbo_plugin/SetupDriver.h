// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Makes an account in a client application by driving its data plug-in, on a thread of the caller's that is not the user
// interface's: starts the set-up, lets the thread's events run until the plug-in has told the end, and has the account
// made.
//
// What to take from it: the driver is the data plug-in's delegate while it lives and no longer, waits for a bounded
// time, and cancels a set-up that it does not wait for any more. One driver for each data plug-in at a time, since a data
// plug-in has one delegate. (KAAccountCreator does the same for settings dictionaries; it does not tell the account's
// UID, which an account-list plug-in has to remember.)

#ifndef EXAMPLES_ZORBO_PLUGIN_SETUPDRIVER_H
#define EXAMPLES_ZORBO_PLUGIN_SETUPDRIVER_H

#include <memory>

#include <QtCore/QEventLoop>
#include <QtCore/QObject>
#include <QtCore/QString>

#include <kavellaccounts/KAError.h>

class KAAccountSetupInput;
class KAAccountSetupResult;
class KADataPlugin;

class SetupDriver : public QObject {
    Q_OBJECT

public:
    /// `title` heads the question whether to trust a server's certificate.
    SetupDriver(KADataPlugin *plugin, QString title);
    ~SetupDriver() override;

    /// The new account's UID, or null with the reason in `error`, which is no error when the plug-in did not answer.
    [[nodiscard]] QString makeAccount(const std::shared_ptr<KAAccountSetupInput> &input, KAError *error);

    /// @name What the plug-in tells
    /// @{
    Q_INVOKABLE void pluginAccountSetupDidFinish(KADataPlugin *plugin,
                                                 const std::shared_ptr<KAAccountSetupInput> &input,
                                                 const std::shared_ptr<KAAccountSetupResult> &result);
    Q_INVOKABLE void pluginAccountSetupDidFail(KADataPlugin *plugin, const std::shared_ptr<KAAccountSetupInput> &input,
                                               const KAError &error);
    Q_INVOKABLE bool pluginHandleCertificateError(KADataPlugin *plugin, const KAError &error);
    /// @}

private:
    KADataPlugin *const m_plugin;  // the registry's
    const QString m_title;
    std::shared_ptr<KAAccountSetupInput> m_input;
    std::shared_ptr<KAAccountSetupResult> m_result;
    KAError m_error;
    QEventLoop m_events;
};

#endif
