// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which store a process uses, and how a persistent reference names its store.

#include "tests/platform/credential_fixture.h"

namespace kavell::test {

namespace {

constexpr const char *kIdentifier = "0123456789abcdef0123456789abcdef";

class CredentialStoreTest : public CredentialTest {};

TEST_F(CredentialStoreTest, WithoutABusTheVaultIsChosen)
{
    ASSERT_NE(defaultCredentialStore(), nullptr);
    EXPECT_EQ(defaultCredentialStore()->name(), "vault");
}

TEST_F(CredentialStoreTest, ABusThatNobodyListensOnCountsAsNone)
{
    setenv("DBUS_SESSION_BUS_ADDRESS", ("unix:path=" + scratchPath("run/nobody")).c_str(), 1);
    const Stopwatch watch;
    EXPECT_EQ(defaultCredentialStore()->name(), "vault");
    EXPECT_LT(watch.elapsed(), 2s);
}

TEST_F(CredentialStoreTest, ABusWithoutTheServiceCountsAsNone)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    EXPECT_EQ(defaultCredentialStore()->name(), "vault");
}

TEST_F(CredentialStoreTest, NoBusIsEverStarted)
{
    setenv("DBUS_SESSION_BUS_ADDRESS", "autolaunch:", 1);
    EXPECT_EQ(defaultCredentialStore()->name(), "vault");
    EXPECT_FALSE(std::filesystem::exists(scratchPath("run/bus")));
}

TEST_F(CredentialStoreTest, TheBusOfTheRuntimeDirectoryIsFoundWithoutAnAddress)
{
    const PrivateBus bus(scratchPath("run/bus"));
    const Keyring keyring;
    unsetenv("DBUS_SESSION_BUS_ADDRESS");
    EXPECT_EQ(defaultCredentialStore()->name(), "secret-service");
}

TEST_F(CredentialStoreTest, TheChoiceIsKeptWhenTheServiceGoes)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Keyring keyring;
    ASSERT_EQ(defaultCredentialStore()->name(), "secret-service");
    keyring.kill();
    CredentialItem item;
    EXPECT_EQ(defaultCredentialStore()->name(), "secret-service");
    EXPECT_EQ(defaultCredentialStore()->find("com.example.mail", "paul", item), CredentialStatus::unreachable);
}

TEST_F(CredentialStoreTest, AForcedVaultIsUsedBesideARunningServiceAndTheServiceIsLeftAlone)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    const Keyring keyring;
    setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
    EXPECT_EQ(defaultCredentialStore()->name(), "vault");
    EXPECT_EQ(credentialStoreNamed("secret-service"), nullptr);
}

TEST_F(CredentialStoreTest, AForcedServiceThatIsNotThereIsUnreachable)
{
    setenv("KAVELL_CREDENTIAL_STORE", "secret-service", 1);
    ASSERT_EQ(defaultCredentialStore()->name(), "secret-service");
    CredentialItem item;
    EXPECT_EQ(defaultCredentialStore()->find("com.example.mail", "paul", item), CredentialStatus::unreachable);
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::unreachable);
    EXPECT_EQ(credentialStoreNamed("vault"), nullptr);
}

TEST_F(CredentialStoreTest, NoneAndAnUnknownWordUseNoStore)
{
    for (const char *word : {"none", "valut"}) {
        setenv("KAVELL_CREDENTIAL_STORE", word, 1);
        useCredentialStoreForTesting(nullptr);
        EXPECT_EQ(defaultCredentialStore(), nullptr) << word;
        EXPECT_EQ(credentialStoreNamed("vault"), nullptr) << word;
    }
}

TEST_F(CredentialStoreTest, AReferenceNamesItsStoreAndIdentifier)
{
    const CredentialItem item{"vault", kIdentifier, "service", "account"};
    EXPECT_EQ(persistentReference(item), "vault:0123456789abcdef0123456789abcdef");
    std::string storeName;
    std::string identifier;
    ASSERT_TRUE(parsePersistentReference("vault:0123456789abcdef0123456789abcdef", storeName, identifier));
    EXPECT_EQ(storeName, "vault");
    EXPECT_EQ(identifier, kIdentifier);
}

TEST_F(CredentialStoreTest, AnItemWithoutAnIdentifierHasNoReference)
{
    EXPECT_EQ(persistentReference({"vault", "", "service", "account"}), "");
}

TEST_F(CredentialStoreTest, WhatIsNoReferenceIsNotTakenForOne)
{
    for (const char *text :
         {"", "vault", "vault:", ":0123456789abcdef0123456789abcdef", "vault:0123456789abcdef0123456789abcde",
          "vault:0123456789ABCDEF0123456789ABCDEF", "vault:0123456789abcdef0123456789abcdef0"}) {
        std::string storeName = "untouched";
        std::string identifier;
        EXPECT_FALSE(parsePersistentReference(text, storeName, identifier)) << text;
        EXPECT_EQ(storeName, "untouched") << text;
    }
}

TEST_F(CredentialStoreTest, EachStatusHasItsWord)
{
    EXPECT_STREQ(credentialStatusName(CredentialStatus::stored), "stored");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::absent), "absent");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::locked), "locked");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::refused), "refused");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::unreachable), "unreachable");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::failed), "failed");
    EXPECT_STREQ(credentialStatusName(CredentialStatus::unsupported), "unsupported");
    EXPECT_STREQ(credentialStatusName(static_cast<CredentialStatus>(99)), "unknown");
}

}  // namespace

}  // namespace kavell::test
