// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Absolute URLs, kept as text (RFC 3986), and their conversion from and to paths (RFC 8089). Immutable; safe from any
// thread.

#ifndef KAVELLACCOUNTS_CSKAVELLURL_H
#define KAVELLACCOUNTS_CSKAVELLURL_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellURL *CSKavellURLRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellURLGetTypeID(void);

/// A URL (caller owns) with the given text, which must begin with a scheme and a colon; none otherwise. The text is
/// kept as it is.
CSKAVELL_EXPORT CSKavellURLRef CSKavellURLCreateWithString(CSKavellStringRef string) CSKAVELL_NODISCARD;

/// A file URL (caller owns) of an absolute path given as NUL-terminated bytes; bytes that a URL does not allow are
/// percent-encoded, and a directory's URL ends in "/". None for NULL or a relative path.
CSKAVELL_EXPORT CSKavellURLRef CSKavellURLCreateWithFileSystemPath(const char *path,
                                                                   bool isDirectory) CSKAVELL_NODISCARD;

/// The URL's text, borrowed; none for none.
CSKAVELL_EXPORT CSKavellStringRef CSKavellURLGetString(CSKavellURLRef url);

/// The path of a file URL as NUL-terminated bytes without a closing "/" (caller frees with free()); NULL for none, for
/// a URL that is not a local file's, and for a path with an encoded NUL.
CSKAVELL_EXPORT char *CSKavellURLCopyFileSystemPath(CSKavellURLRef url) CSKAVELL_NODISCARD;

CSKAVELL_END_DECLS

#endif
