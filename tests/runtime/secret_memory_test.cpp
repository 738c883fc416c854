// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Objects that hold a password are overwritten before their memory is given back. What freed memory holds nobody may
// look at, so this program's own explicit_bzero stands before the C library's and notes what it is given.

#include <cstring>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/Ref.h>

namespace {

struct Overwritten {
    const void *memory;
    std::string contents;
};

std::vector<Overwritten> overwritten;

/// Whether memory that held the text was overwritten.
bool wasOverwritten(std::string_view text)
{
    for (const Overwritten &each : overwritten) {
        if (each.contents.find(text) != std::string::npos)
            return true;
    }
    return false;
}

}  // namespace

extern "C" [[gnu::visibility("default")]] void explicit_bzero(void *memory, size_t length) noexcept
{
    overwritten.push_back({memory, std::string(static_cast<const char *>(memory), length)});
    std::memset(memory, 0, length);
}

namespace kavell::test {

class SecretMemory : public testing::Test {
protected:
    SecretMemory() { overwritten.clear(); }
};

TEST_F(SecretMemory, OfAStringIsOverwrittenWithItsLastReference)
{
    auto secret = adopt(CSKavellStringCreateSecret("hunter2", 7));
    auto copy = secret;
    EXPECT_STREQ(CSKavellStringGetUTF8(secret.get()), "hunter2");
    EXPECT_EQ(CSKavellStringGetLength(secret.get()), 7u);
    secret = nullptr;
    EXPECT_FALSE(wasOverwritten("hunter2"));
    copy = nullptr;
    EXPECT_TRUE(wasOverwritten("hunter2"));
}

TEST_F(SecretMemory, OfDataIsOverwrittenWithItsLastReference)
{
    auto secret = adopt(CSKavellDataCreateSecret("hunter3", 7));
    EXPECT_EQ(std::memcmp(CSKavellDataGetBytes(secret.get()), "hunter3", 7), 0);
    secret = nullptr;
    EXPECT_TRUE(wasOverwritten("hunter3"));
}

TEST_F(SecretMemory, ASecretEqualsAStringOfTheSameText)
{
    const auto secret = adopt(CSKavellStringCreateSecret("hunter2", 7));
    EXPECT_TRUE(CSKavellEqual(secret.get(), makeString("hunter2").get()));
}

TEST_F(SecretMemory, IsMadeOfTextOnly)
{
    EXPECT_FALSE(adopt(CSKavellStringCreateSecret("\xff", 1)));
    EXPECT_FALSE(adopt(CSKavellStringCreateSecret(nullptr, 0)));
    EXPECT_FALSE(adopt(CSKavellDataCreateSecret(nullptr, 1)));
}

TEST_F(SecretMemory, OfOtherStringsIsLeftAlone)
{
    static_cast<void>(makeString("no secret"));
    EXPECT_TRUE(overwritten.empty());
}

}  // namespace kavell::test
