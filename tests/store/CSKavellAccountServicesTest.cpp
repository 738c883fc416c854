// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which services an account lists.

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellArray.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using CSKavellAccountServices = StoreTest;

TEST_F(CSKavellAccountServices, TheServicesListedAreThoseWithEffectiveAttributes)
{
    const Account account = openAccount("ada");
    const auto key = text("key");
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, key.get(), key.get());
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceCalDAV, key.get(), key.get());
    commit(account);
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServicePhotos, key.get(), key.get());
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceMail, key.get());
    const auto serviceIDs = adopt(_CSKavellAccountCopyServiceIDs(account.get()));
    ASSERT_EQ(CSKavellArrayGetCount(serviceIDs.get()), 2u);
    EXPECT_TRUE(CSKavellEqual(CSKavellArrayGetValueAtIndex(serviceIDs.get(), 0), kCSKavellAccountServiceCalDAV));
    EXPECT_TRUE(CSKavellEqual(CSKavellArrayGetValueAtIndex(serviceIDs.get(), 1), kCSKavellAccountServicePhotos));
}

TEST_F(CSKavellAccountServices, AnAccountWithoutServicesListsNone)
{
    EXPECT_EQ(CSKavellArrayGetCount(adopt(_CSKavellAccountCopyServiceIDs(openAccount("ada").get())).get()), 0u);
    EXPECT_EQ(_CSKavellAccountCopyServiceIDs(nullptr), nullptr);
}

}  // namespace
