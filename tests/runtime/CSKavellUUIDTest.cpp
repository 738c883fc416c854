// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <set>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellUUID, AFreshOneIsRandomAndOfVersionFour)
{
    std::set<std::string> seen;
    for (int round = 0; round < 100; ++round) {
        const auto uuid = adopt(CSKavellUUIDCreate());
        EXPECT_EQ(CSKavellGetTypeID(uuid.get()), CSKavellUUIDGetTypeID());
        const std::string form = toStdString(adopt(CSKavellUUIDCopyString(uuid.get())).get());
        ASSERT_EQ(form.size(), 36u);
        for (size_t index : {8, 13, 18, 23})
            EXPECT_EQ(form[index], '-') << form;
        EXPECT_EQ(form[14], '4') << form;
        EXPECT_NE(std::string("89ab").find(form[19]), std::string::npos) << form;
        seen.insert(form);
    }
    EXPECT_EQ(seen.size(), 100u);
}

TEST(CSKavellUUID, ReadsEitherCaseAndWritesLowerCase)
{
    for (const char *form : {"0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3", "0A1B2C3D-4E5F-4A6B-8C7D-8E9FA0B1C2D3"}) {
        const auto uuid = adopt(CSKavellUUIDCreateFromString(text(form).get()));
        EXPECT_STREQ(CSKavellStringGetUTF8(adopt(CSKavellUUIDCopyString(uuid.get())).get()),
                     "0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3");
    }
}

TEST(CSKavellUUID, TheSameIdentifierIsEqualAndHashesAlike)
{
    const auto lower = adopt(CSKavellUUIDCreateFromString(text("0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3").get()));
    const auto upper = adopt(CSKavellUUIDCreateFromString(text("0A1B2C3D-4E5F-4A6B-8C7D-8E9FA0B1C2D3").get()));
    EXPECT_TRUE(same(lower, upper));
    EXPECT_EQ(CSKavellHash(lower.get()), CSKavellHash(upper.get()));
    EXPECT_FALSE(CSKavellEqual(lower.get(), adopt(CSKavellUUIDCreate()).get()));
}

TEST(CSKavellUUID, IsNoneForAnythingElse)
{
    for (const char *form : {"", "0a1b2c3d", "0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d",
                             "0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3 ", " a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3",
                             "0a1b2c3d4e5f-4a6b-8c7d-8e9fa0b1c2d34-", "0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2dg",
                             "{a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d}", "0a1b2c3d_4e5f_4a6b_8c7d_8e9fa0b1c2d3"})
        EXPECT_FALSE(adopt(CSKavellUUIDCreateFromString(text(form).get()))) << form;
    EXPECT_FALSE(adopt(CSKavellUUIDCreateFromString(nullptr)));
}

TEST(CSKavellUUID, NoneHasNoText)
{
    EXPECT_FALSE(adopt(CSKavellUUIDCopyString(nullptr)));
}
