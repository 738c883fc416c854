// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The string keys under which plug-ins and the library name what an application keeps. Any thread.

#ifndef KAVELL_PLUGINS_DATA_NAMES_H
#define KAVELL_PLUGINS_DATA_NAMES_H

#include <QtCore/QString>

namespace kavell {

/// The key of an application's data, such as "MAIL_DATA_NAME"; null for an application without one.
[[nodiscard]] QString dataNameKey(const QString &appBundleID);

}  // namespace kavell

#endif
