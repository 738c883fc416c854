// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <filesystem>
#include <system_error>

#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/Ref.h>

#include "platform/home_directory.h"
#include "platform/qt/log.h"
#include "platform/qt/main_thread.h"

namespace {

/// Whether the provider type is one name below the accounts' directory, and not that directory or something elsewhere.
bool isOneName(const QString &providerType)
{
    return !providerType.isEmpty() && !providerType.contains(u'/') && !providerType.contains(QChar::Null) &&
           providerType != QLatin1String(".") && providerType != QLatin1String("..");
}

void resetData(const QString &providerType)
{
    // The bare provider name, without ".plist": the directory of the provider's data, not a data file.
    const std::string path = kavell::homeDirectory() + "/Library/Kavell Accounts/V1/" + providerType.toStdString();
    std::error_code ignored;
    std::filesystem::remove_all(path, ignored);
    CSKavellNotificationPost(kavell::makeString(KADidResetDataNotification.toStdString()).get(),
                             kavell::makeString(providerType.toStdString()).get(), nullptr);
}

}  // namespace

void KAResetDataForProviderID(const QString &providerType)
{
    if (!isOneName(providerType)) {
        kavell::log(QStringLiteral("*** Not resetting the data of provider %1: it is not the name of a provider type")
                        .arg(KADescription(providerType)));
        return;
    }
    kavell::runOnMainThread([&] { resetData(providerType); });
}
