// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAFieldList.h>

#include <QtCore/QPointer>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantMap>

#include <gtest/gtest.h>

// Outside any namespace, so that its name is short in the dump.
class KAFieldListTestThing : public KAObject {
public:
    [[nodiscard]] QString description() const override { return QStringLiteral("a thing"); }
};

namespace {

/// The only field of the list that `value` makes, as "ENCODING VALUE".
template <typename T> std::string fieldOf(const T &value)
{
    KAFieldList fields;
    fields.add("_field", value);
    EXPECT_EQ(fields.fields().size(), 1u);
    const KAField &field = fields.fields().front();
    EXPECT_EQ(field.name, QStringLiteral("_field"));
    return field.encoding.toStdString() + ' ' + field.value.toStdString();
}

const void *pointerOf(const auto &value)
{
    KAFieldList fields;
    fields.add("_field", value);
    return fields.fields().front().pointer;
}

}  // namespace

TEST(KAFieldListTest, BooleansAndCharactersShareAnEncoding)
{
    EXPECT_EQ(fieldOf(true), "c true");
    EXPECT_EQ(fieldOf(false), "c false");
    EXPECT_EQ(fieldOf(static_cast<signed char>(5)), "c true");
    EXPECT_EQ(fieldOf(static_cast<signed char>(0)), "c false");
}

TEST(KAFieldListTest, SignedIntegersByTheirWidth)
{
    EXPECT_EQ(fieldOf(static_cast<short>(-2)), "s -2");
    EXPECT_EQ(fieldOf(-2), "i -2");
    EXPECT_EQ(fieldOf(-2L), "l -2");
    EXPECT_EQ(fieldOf(-2LL), "q -2");
}

TEST(KAFieldListTest, UnsignedIntegersInCapitals)
{
    EXPECT_EQ(fieldOf(static_cast<unsigned char>(200)), "C 200");
    EXPECT_EQ(fieldOf(static_cast<unsigned short>(2)), "S 2");
    EXPECT_EQ(fieldOf(2U), "I 2");
    EXPECT_EQ(fieldOf(2UL), "L 2");
    EXPECT_EQ(fieldOf(2ULL), "Q 2");
}

TEST(KAFieldListTest, TheLongUnsignedIntegersAreWrittenAsSignedOnesDeliberately)
{
    EXPECT_EQ(fieldOf(18446744073709551615UL), "L -1");
    EXPECT_EQ(fieldOf(18446744073709551615ULL), "Q -1");
}

TEST(KAFieldListTest, RealsHaveSixPlaces)
{
    EXPECT_EQ(fieldOf(1.5F), "f 1.500000");
    EXPECT_EQ(fieldOf(-0.25), "d -0.250000");
}

TEST(KAFieldListTest, CharacterPointersAreText)
{
    const char *text = "text";
    EXPECT_EQ(fieldOf(text), "* text");
    char letters[] = "letters";
    EXPECT_EQ(fieldOf(static_cast<char *>(letters)), "* letters");
    const char *none = nullptr;
    EXPECT_EQ(fieldOf(none), "* (null)");
}

TEST(KAFieldListTest, ToolkitValuesAreNamedByTheirType)
{
    EXPECT_EQ(fieldOf(QStringLiteral("text")), "@\"QString\" text");
    EXPECT_EQ(fieldOf(QString()), "@\"QString\" (null)");
    EXPECT_EQ(fieldOf(QUrl(QStringLiteral("https://example.org/"))), "@\"QUrl\" https://example.org/");
    EXPECT_EQ(fieldOf(QVariantMap{{QStringLiteral("a"), 1}}), "@\"QVariantMap\" {a = 1;}");
    EXPECT_EQ(fieldOf(QStringList{QStringLiteral("a")}), "@\"QStringList\" (a)");
}

TEST(KAFieldListTest, ObjectsAreNamedByTheirClassHoweverTheyAreHeld)
{
    const auto shared = std::make_shared<KAFieldListTestThing>();
    const auto unique = std::make_unique<KAFieldListTestThing>();
    EXPECT_EQ(fieldOf(shared), "@\"KAFieldListTestThing\" a thing");
    EXPECT_EQ(fieldOf(unique), "@\"KAFieldListTestThing\" a thing");
    EXPECT_EQ(fieldOf(shared.get()), "@\"KAFieldListTestThing\" a thing");
    EXPECT_EQ(pointerOf(shared), shared.get());
    EXPECT_EQ(fieldOf(std::shared_ptr<KAFieldListTestThing>()), "@\"KAFieldListTestThing\" (null)");
}

TEST(KAFieldListTest, ToolkitObjectsAreNamedByTheirClass)
{
    QObject object;
    const QPointer<QObject> guarded(&object);
    const QString address = QString::number(reinterpret_cast<quintptr>(&object), 16);
    EXPECT_EQ(fieldOf(guarded), "@\"QObject\" <QObject: 0x" + address.toStdString() + ">");
    EXPECT_EQ(pointerOf(&object), &object);
    EXPECT_EQ(fieldOf(QPointer<QObject>()), "@\"QObject\" (null)");
}

TEST(KAFieldListTest, OtherPointersAreTheirAddress)
{
    const int number = 7;
    const std::string address = QString::number(reinterpret_cast<quintptr>(&number), 16).toStdString();
    EXPECT_EQ(fieldOf(&number), "^v 0x" + address);
    EXPECT_EQ(pointerOf(&number), &number);
    EXPECT_EQ(fieldOf(static_cast<const void *>(nullptr)), "^v 0x0");
}

TEST(KAFieldListTest, RecordsOfTheStoreArePointers)
{
    const auto record = kavell::makeString("record");
    EXPECT_TRUE(fieldOf(record).starts_with("^v 0x"));
    EXPECT_EQ(pointerOf(record), record.get());
}

TEST(KAFieldListTest, FieldsKeepTheOrderInWhichTheyCame)
{
    KAFieldList fields;
    fields.add("_second", 2);
    fields.add("_first", 1);
    ASSERT_EQ(fields.fields().size(), 2u);
    EXPECT_EQ(fields.fields()[0].name, QStringLiteral("_second"));
    EXPECT_EQ(fields.fields()[1].name, QStringLiteral("_first"));
}
