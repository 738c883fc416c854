// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A message of any bytes at an observer's socket: it is a notification with a name or nothing at all, and a
// notification that is posted on arrives as it was.

#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/Ref.h>

#include "platform/notification_socket.h"
#include "tests/fuzz/fuzz_target.h"

using namespace kavell;
using kavell::fuzz::require;

namespace {

using Notification = Ref<CSKavellNotificationRef>;

/// The process's observer, in a meeting place of its own and without a session bus.
CSKavellNotificationObserverRef observer()
{
    static const fuzz::ScratchDirectory runtimeDirectory;
    static const auto observer = [] {
        setenv("XDG_RUNTIME_DIR", runtimeDirectory.path().c_str(), 1);
        unsetenv("DBUS_SESSION_BUS_ADDRESS");
        return adopt(CSKavellNotificationObserverCreate(nullptr));
    }();
    require(observer.get() != nullptr, "an observer can be made");
    return observer.get();
}

Notification next()
{
    return adopt(CSKavellNotificationObserverCopyNext(observer()));
}

/// Whether both parts are missing or equal.
bool areSame(CSKavellTypeRef one, CSKavellTypeRef other)
{
    return one && other ? CSKavellEqual(one, other) : one == other;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static_cast<void>(observer());
    require(postToSockets(fuzz::textOf(data, size)) == (size <= kLargestMessage), "all but too large messages go out");
    const Notification first = next();
    require(!next(), "a message is one notification at most");
    if (!first)
        return 0;
    const CSKavellStringRef name = CSKavellNotificationGetName(first.get());
    const CSKavellStringRef object = CSKavellNotificationGetObject(first.get());
    const CSKavellDictionaryRef information = CSKavellNotificationGetUserInformation(first.get());
    require(name && information, "a notification has a name and information");

    // Written anew it may be longer than the foreign message was, and too large then.
    const bool isPosted = CSKavellNotificationPost(name, object, information);
    const Notification second = next();
    require(isPosted == static_cast<bool>(second), "what was posted arrives, and nothing else");
    if (second)
        require(areSame(name, CSKavellNotificationGetName(second.get())) &&
                    areSame(object, CSKavellNotificationGetObject(second.get())) &&
                    areSame(information, CSKavellNotificationGetUserInformation(second.get())),
                "a notification arrives as it was posted");
    return 0;
}
