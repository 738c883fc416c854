// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Settings dictionaries into provider attributes and back.

#include <functional>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>

#include "model/settings_reading.h"
#include "platform/qt/exception_text.h"
#include "platform/qt/log.h"
#include "store/constant_values.h"

namespace {

/// What an application's settings can hold that the library knows. The password among them is deliberate: settings
/// carry it in plain text under a key that they share with the contacts application.
const QStringList &knownKeys()
{
    static const QStringList keys{
        KAMailEmailAddressKey,
        KAMailUserNameKey,
        KAMailAccountDescriptionKey,
        KAMailIncomingMailServerKey,
        KAMailIncomingUseSSLKey,
        KAMailOutgoingMailServerKey,
        KAMailOutgoingUseSSLKey,
        KAMailInactiveAccountKey,
        KACardellServerAddressKey,
        KACardellPortKey,
        KACardellUseSSLKey,
        KACardellAccountType,
        KAAccountTypeKey,
        KACardellSearchBaseKey,
        KACardellScopeKey,
        KACardellAuthenticationKey,
        KACardellPasswordKey,
        KAChatAccountTypeKey,
        KAChatLoginNameKey,
        KAChatServerKey,
        KAChatServerPortKey,
        KAChatUseSSLKey,
        KAChatUseKerberosV5Key,
    };
    return keys;
}

/// Runs a change of several attributes; whether it came to its end. An exception ends it and is logged, and what was
/// changed before it stays.
bool loggingExceptions(const std::function<void()> &change)
{
    try {
        change();
        return true;
    } catch (...) {
        kavell::log(QStringLiteral("*** Caught exception: ") + kavell::currentExceptionText());
        return false;
    }
}

}  // namespace

QVariantMap KAAccount::dictionaryRepresentationMergedWithChildDict(const std::optional<QVariantMap> &child) const
{
    QVariantMap flat = providerAttributes();
    flat.remove(kKAAccountSettingChildAccounts);
    const QString fullNameKey = QLatin1String(kavell::values::kUserFullName);
    if (const QVariant fullName = flat.take(fullNameKey); !kavell::isNothing(fullName))
        flat.insert(KAMailFullNameKey, fullName);
    const auto insert = [&](const char *key, const QString &text) {
        if (!text.isNull())
            flat.insert(QString::fromUtf8(key), text);
    };
    insert("provider", provider());
    insert("loginName", loginName());
    insert("password", password());
    for (const auto &[key, value] : child.value_or(QVariantMap()).asKeyValueRange()) {
        if (!kavell::isNothing(value))
            flat.insert(key, value);
    }
    return flat;
}

void KAAccount::replacePropertiesWithSettingDictionary(const QVariantMap &settings)
{
    const bool removed = loggingExceptions([&] {
        const QStringList keys = providerAttributes().keys();
        for (const QString &key : keys)
            removeProviderAttributeForKey(key);
    });
    if (removed)
        mergePropertiesWithSettingDictionary(settings);
}

void KAAccount::mergePropertiesWithSettingDictionary(const QVariantMap &settings)
{
    loggingExceptions([&] {
        for (auto setting = settings.begin(); setting != settings.end(); ++setting) {
            if (kavell::isNothing(providerAttributeForKey(setting.key())))
                setProviderAttribute(setting.value(), setting.key());
        }
    });
}

void KAAccount::updateWithKnownSettingsFromDictionary(const QVariantMap &settings)
{
    updateWithSettingsDict(settings, knownKeys());
}

void KAAccount::updateWithSettingsDict(const QVariantMap &settings, const QStringList &keys)
{
    for (const QString &key : keys) {
        if (kavell::hasValueForKey(settings, key))
            setProviderAttribute(settings.value(key), key);
    }
}
