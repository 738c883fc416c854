// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The applications that are installed for the user, by name: application bundles first (directories "NAME.app" that
// carry Contents/Info.plist and Contents/Resources/), then desktop entries (freedesktop Desktop Entry Specification).
// Bundles are looked for in the directories of KAVELL_APPLICATION_PATH, set apart by ":", and then beside the desktop
// entries, in "applications" below the user's and the system's data directories.
//
// Reads the disk on every call; callers cache. Any thread, except that icons of the desktop's theme need the
// user-interface thread: elsewhere the library's own stand in.

#ifndef KAVELL_PLATFORM_QT_WORKSPACE_H
#define KAVELL_PLATFORM_QT_WORKSPACE_H

#include <QtCore/QString>
#include <QtGui/QImage>

namespace kavell {

/// The full path of the application: of its bundle, or of its desktop entry; null when there is none. A desktop entry
/// goes by its file's name, else by its untranslated Name; hidden ones do not count.
[[nodiscard]] QString pathForApplication(const QString &name);

/// What the user knows the application at a path by, in the user's language; null when it says nothing.
[[nodiscard]] QString displayNameAtPath(const QString &path);

/// The path of the icon file of the application at a path; null when it names none, and for a desktop entry also when
/// the icon is in no theme. A bundle's file need not exist.
[[nodiscard]] QString iconFileAtPath(const QString &path);

/// @name Icons for what has none of its own, from the desktop's theme, else the library's own. Never null
/// @{
[[nodiscard]] QImage genericNetworkIcon();
[[nodiscard]] QImage genericApplicationIcon();
/// @}

}  // namespace kavell

#endif
