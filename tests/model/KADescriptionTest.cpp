// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADescription.h>

#include <QtCore/QDateTime>
#include <QtCore/QObject>
#include <QtCore/QRect>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantMap>

#include <gtest/gtest.h>
#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAObject.h>

namespace {

class Named : public KAObject {
public:
    [[nodiscard]] QString description() const override { return QStringLiteral("a name"); }
};

class Both : public QObject, public KAObject {
public:
    [[nodiscard]] QString description() const override { return QStringLiteral("both"); }
};

class Plain : public KAObject {};

QString addressOf(const void *object)
{
    return QStringLiteral("0x") + QString::number(reinterpret_cast<quintptr>(object), 16);
}

std::string described(const QVariant &value)
{
    return KADescription(value).toStdString();
}

}  // namespace

TEST(KADescriptionTest, NothingIsNull)
{
    EXPECT_EQ(KADescription(nullptr), QStringLiteral("(null)"));
    EXPECT_EQ(KADescription(QString()), QStringLiteral("(null)"));
    EXPECT_EQ(KADescription(static_cast<const KAObject *>(nullptr)), QStringLiteral("(null)"));
    EXPECT_EQ(KADescription(static_cast<const QObject *>(nullptr)), QStringLiteral("(null)"));
    EXPECT_EQ(described(QVariant()), "(null)");
    EXPECT_EQ(described(QString()), "(null)");
    EXPECT_EQ(described(QVariant::fromValue<QObject *>(nullptr)), "(null)");
}

TEST(KADescriptionTest, TextIsItself)
{
    EXPECT_EQ(KADescription(QStringLiteral("a \"b\"")), QStringLiteral("a \"b\""));
    EXPECT_EQ(KADescription(QStringLiteral("")), QStringLiteral(""));
    EXPECT_EQ(described(QStringLiteral("")), "");
}

TEST(KADescriptionTest, NumbersAreDecimalAndBooleansOneAndZero)
{
    EXPECT_EQ(described(-42), "-42");
    EXPECT_EQ(described(qulonglong{18446744073709551615u}), "18446744073709551615");
    EXPECT_EQ(described(1.5), "1.5");
    EXPECT_EQ(described(true), "1");
    EXPECT_EQ(described(false), "0");
}

TEST(KADescriptionTest, ADictionaryHasSortedKeys)
{
    EXPECT_EQ(described(QVariantMap{{QStringLiteral("b"), 2}, {QStringLiteral("a"), QStringLiteral("x")}}),
              "{a = x; b = 2;}");
    EXPECT_EQ(described(QVariantMap()), "{}");
}

TEST(KADescriptionTest, AListIsInParentheses)
{
    EXPECT_EQ(described(QVariantList{1, QStringLiteral("b"), QVariant()}), "(1, b, (null))");
    EXPECT_EQ(described(QVariantList()), "()");
    EXPECT_EQ(described(QStringList{QStringLiteral("a"), QStringLiteral("b")}), "(a, b)");
    EXPECT_EQ(described(QVariant::fromValue(QList<QVariantMap>{{{QStringLiteral("a"), 1}}})), "({a = 1;})");
}

TEST(KADescriptionTest, ContainersAreDescribedWithinContainers)
{
    EXPECT_EQ(described(QVariantMap{{QStringLiteral("a"), QVariantList{QVariantMap{{QStringLiteral("b"), true}}}}}),
              "{a = ({b = 1;});}");
}

TEST(KADescriptionTest, PercentSignsOfValuesAreNoPlaceholders)
{
    EXPECT_EQ(described(QVariantMap{{QStringLiteral("%2"), QStringLiteral("%1")}}), "{%2 = %1;}");
}

TEST(KADescriptionTest, AURLIsItsTextAndADateIsInUTC)
{
    EXPECT_EQ(described(QUrl(QStringLiteral("https://example.org/a b"))), "https://example.org/a%20b");
    EXPECT_EQ(described(QDateTime::fromSecsSinceEpoch(0, Qt::UTC)), "1970-01-01T00:00:00Z");
}

TEST(KADescriptionTest, AnObjectSaysWhatItSaysOfItself)
{
    const Named named;
    EXPECT_EQ(KADescription(&named), QStringLiteral("a name"));
    Both both;
    EXPECT_EQ(KADescription(static_cast<const QObject *>(&both)), QStringLiteral("both"));
    EXPECT_EQ(described(QVariant::fromValue<QObject *>(&both)), "both");
}

TEST(KADescriptionTest, AnObjectWithoutADescriptionIsItsClassAndAddress)
{
    const Plain plain;
    EXPECT_TRUE(KADescription(&plain).endsWith(QStringLiteral("Plain: ") + addressOf(&plain) + u'>'));
    const QObject object;
    EXPECT_EQ(KADescription(&object), QStringLiteral("<QObject: ") + addressOf(&object) + u'>');
}

TEST(KADescriptionTest, AnErrorIsDescribedByItsSentence)
{
    EXPECT_EQ(described(QVariant::fromValue(KAError(QStringLiteral("domain"), 7))), "Error domain 7");
}

TEST(KADescriptionTest, ValuesWithoutTextAreTheirTypeAndAddress)
{
    const QVariant rectangle = QRect(1, 2, 3, 4);
    EXPECT_EQ(KADescription(rectangle), QStringLiteral("<QRect: ") + addressOf(rectangle.constData()) + u'>');
}
