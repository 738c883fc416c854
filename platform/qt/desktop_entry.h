// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The few keys of a desktop entry that the library shows to the user (freedesktop Desktop Entry Specification 1.5).

#ifndef KAVELL_PLATFORM_QT_DESKTOP_ENTRY_H
#define KAVELL_PLATFORM_QT_DESKTOP_ENTRY_H

#include <optional>

#include <QtCore/QString>

namespace kavell {

struct DesktopEntry {
    QString name;           ///< the untranslated Name
    QString localizedName;  ///< Name in the user's language, else the untranslated one
    QString icon;           ///< a name in the icon theme, or an absolute path; null when missing
    bool hidden = false;    ///< Hidden: as if it were not there
};

/// Reads a file; nothing when it cannot be read, is larger than 1 MiB, or has no group [Desktop Entry].
[[nodiscard]] std::optional<DesktopEntry> readDesktopEntry(const QString &path);

/// The file of an icon of the user's icon theme, its parents and hicolor that suits a size of 64 best, else of the
/// pixmap directories; null when there is none. An absolute path is its own answer when the file exists.
[[nodiscard]] QString iconFileForName(const QString &icon);

}  // namespace kavell

#endif
