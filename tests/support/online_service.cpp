// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A library of the shape of the maker's online service, for tests. Accounts whose names begin with "brondel" are of the
// newer kind; the account "absent" has no kind, and accounts with "nomail" in their name have no address. What was called
// is counted, and noted line by line.

#include <functional>
#include <string>

#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellType.h>
#include <kavellaccounts/Ref.h>

#define EXPORTED extern "C" __attribute__((visibility("default")))

using kavell::makeString;
using kavell::toStdString;

EXPORTED int testCallCount;
int testCallCount = 0;

/// The calls about the session and about services, each on a line with its arguments. For one thread at a time.
EXPORTED std::string testCalls;
std::string testCalls;

/// What else is to happen when the kind of an account is asked for.
EXPORTED std::function<void()> testOnAccountType;
std::function<void()> testOnAccountType;

EXPORTED bool testServiceEnabled;
bool testServiceEnabled = false;

EXPORTED const CSKavellStringRef kNBAccountTypeBrondel;
const CSKavellStringRef kNBAccountTypeBrondel = makeString("brondel").leak();

EXPORTED const CSKavellStringRef kNBServiceIDMail;
const CSKavellStringRef kNBServiceIDMail = makeString("mail").leak();

/// Variables, so that a test can take one away.
EXPORTED CSKavellStringRef kNBServiceIDCalendars;
CSKavellStringRef kNBServiceIDCalendars = makeString("calendars").leak();
EXPORTED CSKavellStringRef kNBServiceIDContacts;
CSKavellStringRef kNBServiceIDContacts = makeString("contacts").leak();

EXPORTED const CSKavellStringRef kNBPropertyMailEmailAddress;
const CSKavellStringRef kNBPropertyMailEmailAddress = makeString("address").leak();

namespace {

CSKavellStringRef joined(CSKavellStringRef first, CSKavellStringRef second)
{
    return makeString(toStdString(first) + "/" + toStdString(second)).leak();
}

template <typename... Arguments> void note(const char *call, Arguments... arguments)
{
    testCalls += call;
    ((testCalls += " " + toStdString(arguments)), ...);
    testCalls += '\n';
}

}  // namespace

EXPORTED CSKavellTypeRef NBServiceCopyProperty(CSKavellStringRef account, CSKavellStringRef service,
                                               CSKavellStringRef property)
{
    ++testCallCount;
    note("copyProperty", account, service, property);
    if (toStdString(account).find("nomail") != std::string::npos)
        return nullptr;
    const auto accountAndService = kavell::adopt(joined(account, service));
    return joined(accountAndService.get(), property);
}

EXPORTED CSKavellTypeRef NBAccountCopyProperty(CSKavellStringRef account, CSKavellStringRef property)
{
    ++testCallCount;
    return joined(account, property);
}

EXPORTED void NBServiceSetEnabled(CSKavellStringRef account, CSKavellStringRef service, bool enabled)
{
    ++testCallCount;
    note(enabled ? "enable" : "disable", account, service);
    testServiceEnabled = enabled;
}

EXPORTED bool NBServiceIsEnabled(CSKavellStringRef account, CSKavellStringRef service)
{
    ++testCallCount;
    note("isEnabled", account, service);
    return testServiceEnabled;
}

EXPORTED CSKavellStringRef NBCopyAccountIDFromMailAlias(CSKavellStringRef alias)
{
    ++testCallCount;
    return makeString("id-of-" + toStdString(alias)).leak();
}

EXPORTED CSKavellTypeRef NBCopyAccountType(CSKavellStringRef account)
{
    ++testCallCount;
    if (testOnAccountType)
        testOnAccountType();
    const std::string name = toStdString(account);
    if (name == "absent")
        return nullptr;
    return makeString(name.starts_with("brondel") ? "brondel" : "plain").leak();
}

EXPORTED void NBAccountRefreshLoggedIn(CSKavellStringRef account)
{
    ++testCallCount;
    note("refresh", account);
}

EXPORTED bool NBAccountIsLoggedIn(CSKavellStringRef account)
{
    ++testCallCount;
    note("isLoggedIn", account);
    return toStdString(account) == "anna";
}

EXPORTED bool NBAccountLogin(CSKavellStringRef account, CSKavellStringRef password)
{
    ++testCallCount;
    note("login", account, password);
    return toStdString(password) == "right";
}
