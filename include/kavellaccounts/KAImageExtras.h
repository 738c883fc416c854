// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Operations on images. They keep no state; any thread may call.

#ifndef KAVELLACCOUNTS_KAIMAGEEXTRAS_H
#define KAVELLACCOUNTS_KAIMAGEEXTRAS_H

#include <QtGui/QImage>

#include <kavellaccounts/KAExport.h>

namespace KAExtras {

/// A washed-out copy for rows that cannot be used, of the same size and device pixel ratio; null of a null image.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QImage disabledImage(const QImage &image);

}  // namespace KAExtras

#endif
