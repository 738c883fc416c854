// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADefaults.h>

#include "model/configuration.h"
#include "platform/qt/preferences.h"

namespace {

/// All instances show the one domain, which outlives every static object that may still use it.
kavell::Preferences &preferences()
{
    static auto *const domain = new kavell::Preferences(kavell::configuration::kPreferencesDomain);
    return *domain;
}

// Kept to the end of the process. A plain pointer without a lock or a guard: whoever comes first comes alone.
const std::shared_ptr<KADefaults> *sharedDefaults = nullptr;

}  // namespace

std::shared_ptr<KADefaults> KADefaults::shared()
{
    if (!sharedDefaults)
        sharedDefaults = new std::shared_ptr<KADefaults>(std::make_shared<KADefaults>());
    return *sharedDefaults;
}

KADefaults::KADefaults()
{
    synchronize();
}

KADefaults::~KADefaults()
{
    synchronize();
}

QVariant KADefaults::objectForKey(const QString &key) const
{
    return preferences().objectForKey(key);
}

void KADefaults::setObject(const QVariant &object, const QString &key)
{
    preferences().setObject(object, key);
}

void KADefaults::removeObjectForKey(const QString &key)
{
    preferences().setObject({}, key);
}

bool KADefaults::synchronize()
{
    return preferences().synchronize();
}
