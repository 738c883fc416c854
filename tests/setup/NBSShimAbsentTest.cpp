// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/NBSShim.h>

#include <gtest/gtest.h>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/Ref.h>

namespace kavell::configuration {

extern const char kOnlineServiceLibraryPath[];
const char kOnlineServiceLibraryPath[] = "/nonexistent/online-service-library.so";

}  // namespace kavell::configuration

TEST(NBSShimWithoutTheLibrary, EveryFunctionAnswersNothing)
{
    const auto text = kavell::makeString("anna");
    EXPECT_EQ(NBSAccountsFramework(), nullptr);
    EXPECT_EQ(NBSShimServiceCopyProperty(text.get(), text.get(), text.get()), nullptr);
    EXPECT_EQ(NBSShimAccountCopyProperty(text.get(), text.get()), nullptr);
    NBSShimServiceSetEnabled(text.get(), text.get(), true);
    EXPECT_FALSE(NBSShimServiceIsEnabled(text.get(), text.get()));
    EXPECT_EQ(NBSShimCopyAccountIDFromMailAlias(text.get()), nullptr);
    EXPECT_EQ(NBSShimCopyAccountType(text.get()), nullptr);
    NBSShimAccountRefreshLoggedIn(text.get());
    EXPECT_FALSE(NBSShimAccountIsLoggedIn(text.get()));
    EXPECT_FALSE(NBSShimAccountLogin(text.get(), text.get()));
    EXPECT_EQ(NBSShimGetStringConst("kNBServiceIDMail"), nullptr);
}

TEST(NBSShimWithoutTheLibrary, NobodyIsOfTheNewerKind)
{
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("brondel@nimbrel.example"));
}
