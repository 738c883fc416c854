// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/NBSShim.h>

#include <dlfcn.h>
#include <map>
#include <string>

#include <gtest/gtest.h>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/Ref.h>

using kavell::adopt;
using kavell::makeString;
using kavell::toStdString;

namespace kavell::configuration {

extern const char kOnlineServiceLibraryPath[];
const char kOnlineServiceLibraryPath[] = KAVELL_TEST_ONLINE_SERVICE_LIBRARY;

}  // namespace kavell::configuration

namespace {

std::map<std::string, int> lookups;

}  // namespace

// The linker sends the program's own look-ups of symbols here, so that they can be counted.
extern "C" void *__real_dlsym(void *handle, const char *symbol);
extern "C" void *__wrap_dlsym(void *handle, const char *symbol)
{
    ++lookups[symbol];
    return __real_dlsym(handle, symbol);
}

namespace {

std::string textOf(CSKavellTypeRef owned)
{
    const auto value = adopt(owned);
    return toStdString(kavell::cast<CSKavellStringRef>(value.get(), CSKavellStringGetTypeID()));
}

/// A variable of the library.
template <typename Type> Type &variable(const char *name)
{
    return *static_cast<Type *>(__real_dlsym(NBSAccountsFramework(), name));
}

const kavell::Ref<CSKavellStringRef> kAnna = makeString("anna");
const kavell::Ref<CSKavellStringRef> kMail = makeString("mail");

}  // namespace

TEST(NBSShim, PropertiesAreTheLibrarys)
{
    const auto quota = makeString("quota");
    EXPECT_EQ(textOf(NBSShimServiceCopyProperty(kAnna.get(), kMail.get(), quota.get())), "anna/mail/quota");
    EXPECT_EQ(textOf(NBSShimAccountCopyProperty(kAnna.get(), quota.get())), "anna/quota");
    EXPECT_EQ(textOf(NBSShimCopyAccountIDFromMailAlias(kMail.get())), "id-of-mail");
    EXPECT_EQ(textOf(NBSShimCopyAccountType(kAnna.get())), "plain");
}

TEST(NBSShim, AServiceIsSwitched)
{
    NBSShimServiceSetEnabled(kAnna.get(), kMail.get(), true);
    EXPECT_TRUE(NBSShimServiceIsEnabled(kAnna.get(), kMail.get()));
    NBSShimServiceSetEnabled(kAnna.get(), kMail.get(), false);
    EXPECT_FALSE(NBSShimServiceIsEnabled(kAnna.get(), kMail.get()));
}

TEST(NBSShim, LoggingInIsTheLibrarys)
{
    EXPECT_TRUE(NBSShimAccountIsLoggedIn(kAnna.get()));
    EXPECT_FALSE(NBSShimAccountIsLoggedIn(kMail.get()));
    EXPECT_TRUE(NBSShimAccountLogin(kAnna.get(), makeString("right").get()));
    EXPECT_FALSE(NBSShimAccountLogin(kAnna.get(), makeString("wrong").get()));
    const int calls = variable<int>("testCallCount");
    NBSShimAccountRefreshLoggedIn(kAnna.get());
    EXPECT_EQ(variable<int>("testCallCount"), calls + 1);
}

TEST(NBSShim, AConstantIsWhatStandsAtItsSymbol)
{
    EXPECT_EQ(kavell::toStringView(NBSShimGetStringConst("kNBServiceIDMail")), "mail");
    EXPECT_EQ(NBSShimGetStringConst("kNBNothingOfTheKind"), nullptr);
    EXPECT_EQ(NBSShimGetStringConst(nullptr), nullptr);
}

TEST(NBSShim, AFunctionIsLookedUpOnce)
{
    (void)textOf(NBSShimCopyAccountType(kAnna.get()));
    const int before = lookups["NBCopyAccountType"];
    (void)textOf(NBSShimCopyAccountType(kAnna.get()));
    EXPECT_EQ(before, 1);
    EXPECT_EQ(lookups["NBCopyAccountType"], 1);
}

TEST(NBSShim, AConstantIsLookedUpEachTime)
{
    const int before = lookups["kNBServiceIDMail"];
    (void)NBSShimGetStringConst("kNBServiceIDMail");
    (void)NBSShimGetStringConst("kNBServiceIDMail");
    EXPECT_EQ(lookups["kNBServiceIDMail"], before + 2);
}

TEST(NBSShim, TheNewerKindIsToldByTheLibrarysConstant)
{
    EXPECT_TRUE(KAAccount::corvaneIDIsBrondel("brondel@nimbrel.example"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("anna@nimbrel.example"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("absent"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel({}));
}
