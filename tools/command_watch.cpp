// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts watch: a line for each notification as it arrives, until it is interrupted.

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <cmath>
#include <csignal>
#include <cstring>
#include <ctime>
#include <optional>
#include <poll.h>
#include <sys/signalfd.h>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellNotification.h>

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"
#include "tools/value_forms.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "watch", "[PROVIDER [LOGIN]]",
    "Print a line for every change of an account, by whichever program, until interrupted: the time, what happened, "
    "the provider and the login name. With --json each line is a JSON object. The word 'watching' on standard error "
    "says that from now on nothing is missed.",
    "  kavell-accounts watch\n"
    "  kavell-accounts watch google --json\n"
    "  kavell-accounts watch --count 1 --timeout 60 && echo changed"};

using Clock = std::chrono::steady_clock;

/// What to wait for, and when to stop.
struct Wanted {
    std::string providerType;  ///< empty for any
    std::string login;         ///< empty for any
    std::optional<uint64_t> count;
    std::optional<Clock::time_point> end;
    bool json = false;
};

struct Kind {
    CSKavellStringRef const *object;
    std::string_view word;
};

constexpr std::array<Kind, 3> kinds{{{&kCSKavellAccountProviderSettingsChangedNotification, "changed"},
                                     {&kCSKavellAccountCreatedNotification, "created"},
                                     {&kCSKavellAccountRemovedNotification, "removed"}}};

std::string_view kindOf(CSKavellStringRef object)
{
    for (const Kind &kind : kinds)
        if (CSKavellEqual(*kind.object, object))
            return kind.word;
    return toStringView(object);
}

std::string informationText(CSKavellNotificationRef notification, CSKavellStringRef key)
{
    const CSKavellTypeRef value = CSKavellDictionaryGetValue(CSKavellNotificationGetUserInformation(notification), key);
    return toStdString(cast<CSKavellStringRef>(value, CSKavellStringGetTypeID()));
}

/// Prints the notification unless it is about another account; whether it was printed.
bool printIfWanted(CSKavellNotificationRef notification, const Wanted &wanted)
{
    const Address address{informationText(notification, kCSKavellAccountProviderName),
                          informationText(notification, kCSKavellAccountUserLoginName)};
    if ((!wanted.providerType.empty() && wanted.providerType != address.providerType) ||
        (!wanted.login.empty() && wanted.login != address.login))
        return false;
    const std::string time = formatDate(std::time(nullptr));
    const std::string_view kind = kindOf(CSKavellNotificationGetObject(notification));
    if (!wanted.json) {
        print(time + " " + escaped(kind) + " " + address.text() + "\n");
        return true;
    }
    Json json = Json::object();
    json["time"] = time;
    json["event"] = std::string(kind);
    json.update(addressJson(address));
    print(textOf(json, true));
    return true;
}

int remainingMilliseconds(const Wanted &wanted)
{
    if (!wanted.end)
        return -1;
    const auto remaining = std::chrono::ceil<std::chrono::milliseconds>(*wanted.end - Clock::now()).count();
    return static_cast<int>(std::clamp<int64_t>(remaining, 0, INT32_MAX));
}

/// A descriptor that becomes readable when the program is asked to end; from here on such a signal does nothing else.
int endingSignalDescriptor()
{
    sigset_t ending;
    sigemptyset(&ending);
    sigaddset(&ending, SIGINT);
    sigaddset(&ending, SIGTERM);
    sigprocmask(SIG_BLOCK, &ending, nullptr);
    return signalfd(-1, &ending, SFD_CLOEXEC);
}

ExitCode watchUntilDone(CSKavellNotificationObserverRef observer, int signals, const Wanted &wanted)
{
    uint64_t seen = 0;
    while (true) {
        std::array<pollfd, 2> waiting{
            {{CSKavellNotificationObserverGetFileDescriptor(observer), POLLIN, 0}, {signals, POLLIN, 0}}};
        const int ready = poll(waiting.data(), waiting.size(), remainingMilliseconds(wanted));
        if (ready < 0 && errno != EINTR)
            throw Failure(ExitCode::Failed, std::string("cannot wait for notifications: ") + std::strerror(errno));
        while (const auto notification = adopt(CSKavellNotificationObserverCopyNext(observer)))
            if (printIfWanted(notification.get(), wanted) && ++seen == wanted.count)
                return ExitCode::Done;
        if (waiting[1].revents != 0)
            return ExitCode::Done;
        if (wanted.end && Clock::now() >= *wanted.end)
            return wanted.count ? ExitCode::Failed : ExitCode::Done;
    }
}

Wanted wantedOf(CommandLine &line, std::optional<double> count, std::optional<double> seconds)
{
    Wanted wanted;
    wanted.json = line.json;
    if (count && (*count < 1 || *count != std::floor(*count) || *count > 1e15))
        refuse("--count is a whole number of notifications, at least 1");
    if (seconds && !(*seconds >= 0 && *seconds <= 1e6))
        refuse("--timeout is a number of seconds from 0 to 1000000");
    if (count)
        wanted.count = static_cast<uint64_t>(*count);
    if (seconds)
        wanted.end = Clock::now() + std::chrono::milliseconds(static_cast<int64_t>(std::ceil(*seconds * 1000)));
    const bool wholeAddress =
        line.positionals().size() > 1 ||
        (!line.positionals().empty() && line.positionals().front().find('/') != std::string::npos);
    if (wholeAddress) {
        const Address address = line.takeAccount();
        wanted.providerType = address.providerType;
        wanted.login = address.login;
    } else if (!line.positionals().empty()) {
        wanted.providerType = providerTypeOf(line.takeWord("the provider is missing"));
    }
    line.expectNoMore();
    return wanted;
}

}  // namespace

ExitCode runWatch(const Words &words)
{
    CommandLine line(help);
    std::optional<double> count;
    std::optional<double> seconds;
    line.addNumber("-n,--count", count, "N", "End after N lines");
    line.addNumber("-t,--timeout", seconds, "S", "End after S seconds; with --count that is a failure (exit code 1)");
    line.parse(words);
    const Wanted wanted = wantedOf(line, count, seconds);
    const FileDescriptor signals(endingSignalDescriptor());
    const auto observer = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    if (!observer)
        throw Failure(ExitCode::Failed, std::string("cannot receive notifications: ") + std::strerror(errno) +
                                            "; XDG_RUNTIME_DIR names the directory for them");
    if (!line.quiet)
        complain("watching; press Ctrl-C to end");
    return watchUntilDone(observer.get(), signals.get(), wanted);
}

}  // namespace kavell::tools
