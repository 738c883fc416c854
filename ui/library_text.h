// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The library's own texts in the user's language, for what the application table shows and tells screen readers. Any
// thread.

#ifndef KAVELL_UI_LIBRARY_TEXT_H
#define KAVELL_UI_LIBRARY_TEXT_H

#include <QtCore/QString>

#include <kavellaccounts/KABundle.h>

namespace kavell {

/// The text of a key of the library's string table; the key itself where there is none.
[[nodiscard]] inline QString libraryText(const char *key)
{
    return KABundle::libraryBundle()->localizedString(QString::fromLatin1(key));
}

}  // namespace kavell

#endif
