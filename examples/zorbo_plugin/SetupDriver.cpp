// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "SetupDriver.h"

#include <chrono>

#include <QtCore/QTimer>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KACertificatePanel.h>
#include <kavellaccounts/KADataPlugin.h>

namespace {

// Long enough for servers that have to be looked for, one after another.
constexpr std::chrono::seconds kBound{60};

}  // namespace

SetupDriver::SetupDriver(KADataPlugin *plugin, QString title) : m_plugin(plugin), m_title(std::move(title))
{
    m_plugin->setDelegate(this);
}

SetupDriver::~SetupDriver()
{
    if (m_plugin->delegate() == this)
        m_plugin->setDelegate(nullptr);
}

QString SetupDriver::makeAccount(const std::shared_ptr<KAAccountSetupInput> &input, KAError *error)
{
    m_input = input;
    QTimer bound;
    bound.setSingleShot(true);
    connect(&bound, &QTimer::timeout, &m_events, &QEventLoop::quit);
    bound.start(kBound);
    // Queued, so that the loop runs already for a plug-in that answers before it returns.
    QMetaObject::invokeMethod(
        this, [this] { m_plugin->startAccountSetupWithInput(m_input); }, Qt::QueuedConnection);
    m_events.exec();
    if (m_result)
        return m_plugin->createAccountForInput(m_input, m_result, error);
    if (m_error.isNull())
        m_plugin->cancelAccountSetupForInput(m_input);
    *error = m_error;
    return {};
}

void SetupDriver::pluginAccountSetupDidFinish(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &input,
                                              const std::shared_ptr<KAAccountSetupResult> &result)
{
    if (input != m_input)
        return;
    m_result = result;
    m_events.quit();
}

void SetupDriver::pluginAccountSetupDidFail(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &input,
                                            const KAError &error)
{
    if (input != m_input)
        return;
    m_error = error;
    m_events.quit();
}

bool SetupDriver::pluginHandleCertificateError(KADataPlugin *, const KAError &error)
{
    return KAShowCertificatePanelForError(error, m_title);
}
