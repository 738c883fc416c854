// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A client of the store as a process of its own, linked with the shared library like any other. The tests start several
// at once:
//
//     store_probe set LOGIN KEY NUMBER     one commit of one provider attribute
//     store_probe count LOGIN KEY TIMES    commits KEY = 1, 2, … TIMES with one record
//     store_probe resize LOGIN TIMES       commits texts of changing lengths, each with its length beside it
//     store_probe watch COUNT              prints "ready", then the login name of each of COUNT notifications
//
// With KAVELL_HOLD_LOG set it also writes down each time it held the data file's semaphore (hold_recorder.h).

#include <cstdio>
#include <cstdlib>
#include <poll.h>
#include <string>

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

using namespace kavell;

namespace {

Ref<CSKavellAccountRef> openAccount(const char *loginName)
{
    return adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderMail, makeString(loginName).get()));
}

/// Commits one provider attribute; whether it was saved.
bool save(const Ref<CSKavellAccountRef> &account, const char *key, const Ref<CSKavellTypeRef> &value)
{
    _CSKavellAccountSetProviderAttribute(account.get(), makeString(key).get(), value.get());
    _CSKavellAccountCommitChanges(account.get());
    return !_CSKavellAccountHasPendingChanges(account.get());
}

Ref<CSKavellTypeRef> number(int64_t value)
{
    return adopt(CSKavellNumberCreateWithInt64(value));
}

int set(char **arguments)
{
    return save(openAccount(arguments[0]), arguments[1], number(std::atoi(arguments[2]))) ? 0 : 1;
}

int count(char **arguments)
{
    const auto account = openAccount(arguments[0]);
    for (int round = 1; round <= std::atoi(arguments[2]); ++round) {
        if (!save(account, arguments[1], number(round)))
            return 1;
    }
    return 0;
}

int resize(char **arguments)
{
    const auto account = openAccount(arguments[0]);
    for (int round = 0; round < std::atoi(arguments[1]); ++round) {
        const auto length = static_cast<size_t>(round * 7919 % 20011);
        _CSKavellAccountSetProviderAttribute(account.get(), makeString("text").get(),
                                             makeString(std::string(length, 'x')).get());
        if (!save(account, "length", number(static_cast<int64_t>(length))))
            return 1;
    }
    return 0;
}

int watch(char **arguments)
{
    const auto observer = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    if (!observer)
        return 1;
    std::puts("ready");
    std::fflush(stdout);
    for (int left = std::atoi(arguments[0]); left > 0;) {
        const auto notification = adopt(CSKavellNotificationObserverCopyNext(observer.get()));
        pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
        if (!notification && poll(&waiting, 1, 30000) == 0)
            return 2;
        if (!notification)
            continue;
        const auto information = CSKavellNotificationGetUserInformation(notification.get());
        std::puts(CSKavellStringGetUTF8(cast<CSKavellStringRef>(
            CSKavellDictionaryGetValue(information, kCSKavellAccountUserLoginName), CSKavellStringGetTypeID())));
        --left;
    }
    return 0;
}

struct Command {
    const char *name;
    int arguments;
    int (*run)(char **arguments);
};

constexpr Command kCommands[] = {{"set", 3, set}, {"count", 3, count}, {"resize", 2, resize}, {"watch", 1, watch}};

}  // namespace

int main(int argumentCount, char **arguments)
{
    for (const Command &command : kCommands) {
        if (argumentCount == command.arguments + 2 && std::string_view(arguments[1]) == command.name)
            return command.run(arguments + 2);
    }
    std::fprintf(stderr, "usage: store_probe set|count|resize|watch …\n");
    return 64;
}
