// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAExtras.h>

#include "platform/qt/workspace.h"

namespace KAExtras {

QString iconPathForAppName(const QString &appName)
{
    const QString path = kavell::pathForApplication(appName);
    return path.isNull() ? QString() : kavell::iconFileAtPath(path);
}

}  // namespace KAExtras
