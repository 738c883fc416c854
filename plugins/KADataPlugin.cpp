// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADataPlugin.h>

#include <QtCore/QMetaMethod>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KARequiredMethodException.h>

#include "platform/qt/workspace.h"

namespace {

/// The delegate's method of the name that takes exactly these types; an invalid one when its class has none.
template <typename... Arguments> QMetaMethod methodOf(const QObject *delegate, const char *message)
{
    if (!delegate)
        return {};
    QByteArray signature = QByteArray(message) + "(KADataPlugin*";
    ((signature += QByteArray(",") + QMetaType::fromType<Arguments>().name()), ...);
    signature += ')';
    const QMetaObject *const metaObject = delegate->metaObject();
    return metaObject->method(metaObject->indexOfMethod(signature.constData()));
}

/// Calls the delegate's method, when it has one.
template <typename... Arguments>
void send(QObject *delegate, const char *message, KADataPlugin *plugin, const Arguments &...arguments)
{
    const QMetaMethod method = methodOf<Arguments...>(delegate, message);
    if (method.isValid())
        method.invoke(delegate, Qt::DirectConnection, Q_ARG(KADataPlugin *, plugin),
                      QGenericArgument(QMetaType::fromType<Arguments>().name(), &arguments)...);
}

}  // namespace

KADataPlugin::KADataPlugin(std::shared_ptr<KABundle> bundle) : KAPlugin(std::move(bundle))
{
}

KADataPlugin::~KADataPlugin() = default;

QObject *KADataPlugin::delegate() const
{
    const std::lock_guard lock(m_delegateMutex);
    return _delegate;
}

void KADataPlugin::setDelegate(QObject *delegate)
{
    const std::lock_guard lock(m_delegateMutex);
    _delegate = delegate;
}

void KADataPlugin::nbsAccountStartedMigration(const std::shared_ptr<KAAccount> &)
{
}

void KADataPlugin::deactivateAccountUID(const QString &)
{
}

void KADataPlugin::activateAccountUID(const QString &)
{
}

QImage KADataPlugin::imageForAccountUID(const QString &)
{
    return kavell::genericNetworkIcon();
}

void KADataPlugin::configureAccountUID(const QString &)
{
    throw KARequiredMethodException("-[KADataPlugin configureAccountUID:]");
}

QVariantMap KADataPlugin::settingsForAccountUID(const QString &)
{
    throw KARequiredMethodException("-[KADataPlugin settingsForAccountUID:]");
}

QStringList KADataPlugin::accountUIDs()
{
    throw KARequiredMethodException("-[KADataPlugin accountUIDs]");
}

void KADataPlugin::deleteAccountUID(const QString &)
{
    throw KARequiredMethodException("-[KADataPlugin deleteAccountUID:]");
}

QString KADataPlugin::createAccountForInput(const std::shared_ptr<KAAccountSetupInput> &,
                                            const std::shared_ptr<KAAccountSetupResult> &, KAError *)
{
    throw KARequiredMethodException("-[KADataPlugin createAccountForInput:discoveredResult:error:]");
}

void KADataPlugin::cancelAccountSetupForInput(const std::shared_ptr<KAAccountSetupInput> &)
{
    throw KARequiredMethodException("-[KADataPlugin cancelAccountSetupForInput:]");
}

void KADataPlugin::startAccountSetupWithInput(const std::shared_ptr<KAAccountSetupInput> &)
{
    throw KARequiredMethodException("-[KADataPlugin startAccountSetupWithInput:]");
}

void KADataPlugin::describeFields(KAFieldList &fields) const
{
    fields.add("_delegate", delegate());
    KAPlugin::describeFields(fields);
}

void KADataPlugin::accountSetupUpdate(const std::shared_ptr<KAAccountSetupInput> &input, const QVariant &status)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginAccountSetupUpdate", this, input, status);
}

void KADataPlugin::accountSetupDidFinish(const std::shared_ptr<KAAccountSetupInput> &input,
                                         const std::shared_ptr<KAAccountSetupResult> &result)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginAccountSetupDidFinish", this, input, result);
}

void KADataPlugin::accountSetupDidFail(const std::shared_ptr<KAAccountSetupInput> &input, const KAError &error)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginAccountSetupDidFail", this, input, error);
}

bool KADataPlugin::handleCertificateError(const KAError &error)
{
    const std::lock_guard lock(m_delegateMutex);
    const QMetaMethod method = methodOf<KAError>(_delegate, "pluginHandleCertificateError");
    if (!method.isValid())
        return false;
    bool answer = false;
    if (method.returnMetaType() == QMetaType::fromType<bool>())
        method.invoke(_delegate, Qt::DirectConnection, Q_RETURN_ARG(bool, answer), Q_ARG(KADataPlugin *, this),
                      Q_ARG(KAError, error));
    else
        method.invoke(_delegate, Qt::DirectConnection, Q_ARG(KADataPlugin *, this), Q_ARG(KAError, error));
    return answer;
}

void KADataPlugin::didCreateAccountUID(const QString &uid)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginDidCreateAccountUID", this, uid);
}

void KADataPlugin::didChangeAccountUID(const QString &uid)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginDidChangeAccountUID", this, uid);
}

void KADataPlugin::didDeleteAccountUID(const QString &uid)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginDidDeleteAccountUID", this, uid);
}

void KADataPlugin::nbsAccountMigrationFinished(const std::shared_ptr<KAAccount> &account)
{
    const std::lock_guard lock(m_delegateMutex);
    send(_delegate, "pluginNbsAccountMigrationFinished", this, account);
}
