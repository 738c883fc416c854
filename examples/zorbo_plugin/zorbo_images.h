// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The pictures of the service, drawn rather than read from files: sharp on every screen, since they are made in its
// pixels and say their own scale, and readable on dark and light windows alike. In a program with a QGuiApplication;
// main thread.

#ifndef EXAMPLES_ZORBO_PLUGIN_ZORBO_IMAGES_H
#define EXAMPLES_ZORBO_PLUGIN_ZORBO_IMAGES_H

#include <QtCore/QString>
#include <QtGui/QImage>

/// The sign of the service, 32 points wide.
[[nodiscard]] QImage zorboSign();

/// The sign with the brand's name beside it, on the side where reading goes on.
[[nodiscard]] QImage zorboBanner(const QString &brandName);

#endif
