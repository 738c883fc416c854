// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAError.h>

#include <gtest/gtest.h>

TEST(KAErrorTest, TheDefaultIsNoError)
{
    const KAError error;
    EXPECT_TRUE(error.isNull());
    EXPECT_TRUE(error.domain().isNull());
    EXPECT_EQ(error.code(), 0);
    EXPECT_EQ(error.description(), QStringLiteral("(null)"));
}

TEST(KAErrorTest, KeepsDomainCodeAndInformation)
{
    const KAError error(QStringLiteral("domain"), -5, {{QStringLiteral("key"), 1}});
    EXPECT_FALSE(error.isNull());
    EXPECT_EQ(error.domain(), QStringLiteral("domain"));
    EXPECT_EQ(error.code(), -5);
    EXPECT_EQ(error.userInformation(), QVariantMap({{QStringLiteral("key"), 1}}));
}

TEST(KAErrorTest, IsDescribedByItsSentenceWhereThereIsOne)
{
    const KAError error(QStringLiteral("domain"), 5,
                        {{KAError::localizedDescriptionKey, QStringLiteral("It did not work.")}});
    EXPECT_EQ(error.description(), QStringLiteral("It did not work."));
}

TEST(KAErrorTest, IsDescribedByDomainAndCodeOtherwise)
{
    EXPECT_EQ(KAError(QStringLiteral("domain"), 5).description(), QStringLiteral("Error domain 5"));
    EXPECT_EQ(KAError(QStringLiteral("do%2main"), 5).description(), QStringLiteral("Error do%2main 5"));
    EXPECT_EQ(
        KAError(QStringLiteral("domain"), 5, {{KAError::localizedDescriptionKey, QStringLiteral("")}}).description(),
        QStringLiteral("Error domain 5"));
}

TEST(KAErrorTest, TravelsInAVariant)
{
    const QVariant value = QVariant::fromValue(KAError(QStringLiteral("domain"), 5));
    EXPECT_EQ(value.value<KAError>().code(), 5);
}
