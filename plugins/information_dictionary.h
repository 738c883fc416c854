// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Property-list files of bundles as the toolkit's values. Any thread; reads the disk.

#ifndef KAVELL_PLUGINS_INFORMATION_DICTIONARY_H
#define KAVELL_PLUGINS_INFORMATION_DICTIONARY_H

#include <optional>

#include <QtCore/QString>
#include <QtCore/QVariantMap>

namespace kavell {

/// The dictionary in an XML property-list file; nothing when it cannot be read, is no regular file, is larger than any
/// property list, or holds none.
[[nodiscard]] std::optional<QVariantMap> readPropertyList(const QString &path);

}  // namespace kavell

#endif
