// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// account_watcher: a client in C++ that prints the login name of each account that any program changes.

#include <iostream>
#include <poll.h>

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

using namespace kavell;

int main()
{
    const auto observer = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
    while (observer && poll(&waiting, 1, -1) > 0) {
        while (const auto notification = adopt(CSKavellNotificationObserverCopyNext(observer.get()))) {
            CSKavellTypeRef loginName = CSKavellDictionaryGetValue(
                CSKavellNotificationGetUserInformation(notification.get()), kCSKavellAccountUserLoginName);
            std::cout << toStringView(cast<CSKavellStringRef>(loginName, CSKavellStringGetTypeID())) << std::endl;
        }
    }
    return 1;
}
