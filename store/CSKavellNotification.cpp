// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Notifications as objects: posting puts one on the wire, an observer takes them off it. The wire form is an XML
// property list of the three parts, so that what a notification may carry is what a data file may hold.

#include <kavellaccounts/CSKavellNotification.h>

#include <kavellaccounts/CSKavellType.h>

#include "platform/bus_mirror.h"
#include "platform/notification_socket.h"
#include "platform/property_list.h"
#include "runtime/object_p.h"
#include "runtime/string_p.h"
#include "store/collection_helpers.h"

using namespace kavell;

struct CSKavellNotification : kavell::Object {
    Ref<CSKavellStringRef> name{};
    Ref<CSKavellStringRef> object{};
    Ref<CSKavellDictionaryRef> userInformation{};
};

struct CSKavellNotificationObserver : kavell::Object {
    /// The name that is observed; none for every name.
    Ref<CSKavellStringRef> name{};
    NotificationSocket socket{};
};

namespace {

constinit ConstantString nameKey("Name");
constinit ConstantString objectKey("Object");
constinit ConstantString userInformationKey("UserInformation");

constinit const TypeOperations notificationOperations{
    .name = "CSKavellNotification",
    .finalise = destroyFields<CSKavellNotification>,
};
constinit LazyType notificationType(notificationOperations);

constinit const TypeOperations observerOperations{
    .name = "CSKavellNotificationObserver",
    .finalise = destroyFields<CSKavellNotificationObserver>,
};
constinit LazyType observerType(observerOperations);

Ref<CSKavellStringRef> stringOf(CSKavellDictionaryRef dictionary, CSKavellStringRef key)
{
    return retain(cast<CSKavellStringRef>(GetDictValue(dictionary, key), CSKavellStringGetTypeID()));
}

/// The notification in a message; none for a message that is not one.
Ref<CSKavellNotificationRef> decodeNotification(std::string_view message)
{
    const auto parts = parsePropertyList(message);
    auto *notification = parts ? makeObject<CSKavellNotification>(nullptr, notificationType.typeID(), 0) : nullptr;
    if (!notification)
        return nullptr;
    const auto result = adopt<CSKavellNotificationRef>(notification);
    notification->name = stringOf(parts.get(), &nameKey.header);
    notification->object = stringOf(parts.get(), &objectKey.header);
    notification->userInformation = retain(cast<CSKavellDictionaryRef>(
        GetDictValue(parts.get(), &userInformationKey.header), CSKavellDictionaryGetTypeID()));
    if (!notification->userInformation)
        notification->userInformation = EmptyDictionary();
    return notification->name ? result : nullptr;
}

bool encodeNotification(CSKavellStringRef name, CSKavellStringRef object, CSKavellDictionaryRef userInformation,
                        std::string &message)
{
    DictionarySlot parts;
    SetDictKey(parts, &nameKey.header, name);
    SetDictKey(parts, &objectKey.header, object);
    SetDictKey(parts, &userInformationKey.header, userInformation);
    return writePropertyList(parts.get(), message);
}

}  // namespace

CSKavellTypeID CSKavellNotificationGetTypeID(void)
{
    return notificationType.typeID();
}

CSKavellTypeID CSKavellNotificationObserverGetTypeID(void)
{
    return observerType.typeID();
}

bool CSKavellNotificationPost(CSKavellStringRef name, CSKavellStringRef object, CSKavellDictionaryRef userInformation)
{
    return guarded(false, [&] {
        std::string message;
        if (!name || !encodeNotification(name, object, userInformation, message))
            return false;
        const bool isDelivered = postToSockets(message);
        mirrorToSessionBus(name, object, userInformation);
        return isDelivered;
    });
}

CSKavellNotificationObserverRef CSKavellNotificationObserverCreate(CSKavellStringRef name)
{
    return guarded(CSKavellNotificationObserverRef{}, [&]() -> CSKavellNotificationObserverRef {
        auto observer = adopt(makeObject<CSKavellNotificationObserver>(nullptr, observerType.typeID(), 0));
        if (!observer || !observer->socket.open())
            return nullptr;
        observer->name = retain(name);
        return observer.leak();
    });
}

int CSKavellNotificationObserverGetFileDescriptor(CSKavellNotificationObserverRef observer)
{
    return observer ? observer->socket.descriptor() : -1;
}

CSKavellNotificationRef CSKavellNotificationObserverCopyNext(CSKavellNotificationObserverRef observer)
{
    if (!observer)
        return nullptr;
    return guarded(CSKavellNotificationRef{}, [&]() -> CSKavellNotificationRef {
        std::string message;
        while (observer->socket.receive(message)) {
            auto notification = decodeNotification(message);
            if (notification && (!observer->name || CSKavellEqual(observer->name.get(), notification->name.get())))
                return notification.leak();
        }
        return nullptr;
    });
}

CSKavellStringRef CSKavellNotificationGetName(CSKavellNotificationRef notification)
{
    return notification ? notification->name.get() : nullptr;
}

CSKavellStringRef CSKavellNotificationGetObject(CSKavellNotificationRef notification)
{
    return notification ? notification->object.get() : nullptr;
}

CSKavellDictionaryRef CSKavellNotificationGetUserInformation(CSKavellNotificationRef notification)
{
    return notification ? notification->userInformation.get() : nullptr;
}
