// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A library of the shape of the maker's online service, for tests. Accounts whose names begin with "brondel" are of the
// newer kind; the account "absent" has no kind. What was called is counted.

#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellType.h>
#include <kavellaccounts/Ref.h>

#define EXPORTED extern "C" __attribute__((visibility("default")))

using kavell::makeString;
using kavell::toStdString;

EXPORTED int testCallCount;
int testCallCount = 0;

EXPORTED bool testServiceEnabled;
bool testServiceEnabled = false;

EXPORTED const CSKavellStringRef kNBAccountTypeBrondel;
const CSKavellStringRef kNBAccountTypeBrondel = makeString("brondel").leak();

EXPORTED const CSKavellStringRef kNBServiceIDMail;
const CSKavellStringRef kNBServiceIDMail = makeString("mail").leak();

namespace {

CSKavellStringRef joined(CSKavellStringRef first, CSKavellStringRef second)
{
    return makeString(toStdString(first) + "/" + toStdString(second)).leak();
}

}  // namespace

EXPORTED CSKavellTypeRef NBServiceCopyProperty(CSKavellStringRef account, CSKavellStringRef service,
                                               CSKavellStringRef property)
{
    ++testCallCount;
    const auto accountAndService = kavell::adopt(joined(account, service));
    return joined(accountAndService.get(), property);
}

EXPORTED CSKavellTypeRef NBAccountCopyProperty(CSKavellStringRef account, CSKavellStringRef property)
{
    ++testCallCount;
    return joined(account, property);
}

EXPORTED void NBServiceSetEnabled(CSKavellStringRef, CSKavellStringRef, bool enabled)
{
    ++testCallCount;
    testServiceEnabled = enabled;
}

EXPORTED bool NBServiceIsEnabled(CSKavellStringRef, CSKavellStringRef)
{
    ++testCallCount;
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
    const std::string name = toStdString(account);
    if (name == "absent")
        return nullptr;
    return makeString(name.starts_with("brondel") ? "brondel" : "plain").leak();
}

EXPORTED void NBAccountRefreshLoggedIn(CSKavellStringRef)
{
    ++testCallCount;
}

EXPORTED bool NBAccountIsLoggedIn(CSKavellStringRef account)
{
    ++testCallCount;
    return toStdString(account) == "anna";
}

EXPORTED bool NBAccountLogin(CSKavellStringRef, CSKavellStringRef password)
{
    ++testCallCount;
    return toStdString(password) == "right";
}
