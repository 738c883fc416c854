// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Notifications between all processes of the user that load this library, whether or not a session bus runs. What a
// process posts reaches every observer that exists at that moment, the poster's own included, also when the poster
// exits right after.
//
//     CSKavellNotificationObserverRef observer = CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender);
//     struct pollfd waiting = {CSKavellNotificationObserverGetFileDescriptor(observer), POLLIN, 0};
//     while (poll(&waiting, 1, -1) > 0) {
//         CSKavellNotificationRef notification;
//         while ((notification = CSKavellNotificationObserverCopyNext(observer)) != NULL) {
//             … CSKavellNotificationGetObject(notification) …
//             CSKavellRelease(notification);
//         }
//     }
//
// Any thread may post. An observer is used by one thread at a time.

#ifndef KAVELLACCOUNTS_CSKAVELLNOTIFICATION_H
#define KAVELLACCOUNTS_CSKAVELLNOTIFICATION_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

/// A notification received: a name, an object that says which kind it is, and a dictionary. Immutable.
typedef const struct CSKavellNotification *CSKavellNotificationRef;

/// A place where notifications arrive.
typedef struct CSKavellNotificationObserver *CSKavellNotificationObserverRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellNotificationGetTypeID(void);
CSKAVELL_EXPORT CSKavellTypeID CSKavellNotificationObserverGetTypeID(void);

/// Posts a notification; `object` and `userInformation` (property-list values only) may be none. Whether it was handed
/// to every observer: one that is stopped with thousands of notifications waiting is given up on, and a notification
/// whose written form is larger than 64 KiB is handed to nobody. Blocks for at most 100 milliseconds. The session bus,
/// where one stands, gets a copy later, as the signal "Posted" (name, object, information) of the interface
/// "com.corvane.KavellAccounts" at "/com/corvane/KavellAccounts".
CSKAVELL_EXPORT bool CSKavellNotificationPost(CSKavellStringRef name, CSKavellStringRef object,
                                              CSKavellDictionaryRef userInformation);

/// An observer (caller owns) of the notifications of one name, or of every name for none. None when the user has no
/// runtime directory to meet in; the reason is then in errno. Releasing it ends the observation.
CSKAVELL_EXPORT CSKavellNotificationObserverRef CSKavellNotificationObserverCreate(CSKavellStringRef name)
    CSKAVELL_NODISCARD;

/// The descriptor to poll for reading; it belongs to the observer and is for polling only. -1 for none.
CSKAVELL_EXPORT int CSKavellNotificationObserverGetFileDescriptor(CSKavellNotificationObserverRef observer);

/// The next notification that has arrived (caller owns), in the order of posting for posts of one thread; none when
/// none is waiting. Does not block.
CSKAVELL_EXPORT CSKavellNotificationRef CSKavellNotificationObserverCopyNext(CSKavellNotificationObserverRef observer)
    CSKAVELL_NODISCARD;

/// The parts of a notification, borrowed. The object may be none; the information is empty when none was given.
CSKAVELL_EXPORT CSKavellStringRef CSKavellNotificationGetName(CSKavellNotificationRef notification);
CSKAVELL_EXPORT CSKavellStringRef CSKavellNotificationGetObject(CSKavellNotificationRef notification);
CSKAVELL_EXPORT CSKavellDictionaryRef CSKavellNotificationGetUserInformation(CSKavellNotificationRef notification);

CSKAVELL_END_DECLS

#endif
