// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An online-service library that is installed while the program runs.

#include <kavellaccounts/NBSShim.h>

#include <filesystem>

#include <gtest/gtest.h>

#include <kavellaccounts/Ref.h>

namespace kavell::configuration {

extern const char kOnlineServiceLibraryPath[];
const char kOnlineServiceLibraryPath[] = "./online-service-library.so";  // in the scratch directory of the test

}  // namespace kavell::configuration

TEST(NBSShimLate, AFailedLoadIsTriedAgainByTheNextCall)
{
    EXPECT_EQ(NBSAccountsFramework(), nullptr);
    EXPECT_EQ(NBSShimGetStringConst("kNBServiceIDMail"), nullptr);
    EXPECT_FALSE(NBSShimAccountIsLoggedIn(kavell::makeString("anna").get()));

    std::filesystem::copy(KAVELL_TEST_ONLINE_SERVICE_LIBRARY, kavell::configuration::kOnlineServiceLibraryPath);
    EXPECT_EQ(kavell::toStringView(NBSShimGetStringConst("kNBServiceIDMail")), "mail");
    void *const library = NBSAccountsFramework();
    EXPECT_NE(library, nullptr);

    // What is loaded stays, whatever becomes of its file.
    std::filesystem::remove(kavell::configuration::kOnlineServiceLibraryPath);
    EXPECT_EQ(NBSAccountsFramework(), library);
}
