// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAExtras.h>

#include <limits>
#include <stdexcept>

#include <QtCore/QTimer>
#include <QtWidgets/QLineEdit>

#include <gtest/gtest.h>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAFieldList.h>

using namespace KAExtras;

namespace {

/// A class of a program of its own, with a field of each kind.
class Example : public KAObject {
public:
    void describeFields(KAFieldList &fields) const override
    {
        fields.add("_flag", true);
        fields.add("_small", static_cast<short>(-3));
        fields.add("_count", 7);
        fields.add("_long", 8L);
        fields.add("_huge", ~0ULL);
        fields.add("_ratio", 1.5);
        fields.add("_word", "text");
        fields.add("_name", QStringLiteral("Anna"));
        fields.add("_PassWord", QStringLiteral("secret"));
        fields.add("PASSWORD", QStringLiteral("secret"));
        fields.add("_passwordHint", QStringLiteral("a river"));
        fields.add("_where", static_cast<const void *>(nullptr));
        KAObject::describeFields(fields);
    }
};

/// The fields of a dump without the addresses, which mean nothing: "NAME <ENCODING>: VALUE".
QStringList linesOf(const QString &dump)
{
    QStringList lines = dump.split(u'\n', Qt::SkipEmptyParts);
    for (QString &line : lines) {
        const qsizetype comma = line.indexOf(QStringLiteral(", 0x"));
        line.remove(comma, line.indexOf(u'>', comma) - comma);
    }
    return lines;
}

}  // namespace

TEST(KAExtras, TrimmingDropsBlanksOnly)
{
    EXPECT_EQ(stringByTrimmingWhitespace("\tanna "), "\tanna");
    EXPECT_EQ(stringByTrimmingWhitespace("  a b\n"), "a b\n");
    EXPECT_EQ(stringByTrimmingWhitespace("anna"), "anna");
}

TEST(KAExtras, TrimmingOnlyBlanksLeavesAnEmptyText)
{
    const QString trimmed = stringByTrimmingWhitespace("   ");
    EXPECT_TRUE(trimmed.isEmpty());
    EXPECT_FALSE(trimmed.isNull());
}

TEST(KAExtras, NullTextsStayNull)
{
    EXPECT_TRUE(stringByTrimmingWhitespace({}).isNull());
    EXPECT_TRUE(emailUserName({}).isNull());
    EXPECT_TRUE(emailHostName({}).isNull());
    EXPECT_TRUE(urlDomain({}).isNull());
    EXPECT_TRUE(otherNimbrelOrDorvexEmail({}).isNull());
    EXPECT_FALSE(serverAddrIsInDomain({}, "example."));
    EXPECT_FALSE(serverAddrIsInDomain("example.net", {}));
    EXPECT_TRUE(validatedEmailAddressStringValue(nullptr).isNull());
}

TEST(KAExtras, AnAddressFallsIntoUserAndHostInLowerCase)
{
    EXPECT_EQ(emailUserName("Anna.B@Example.NET"), "anna.b");
    EXPECT_EQ(emailHostName("Anna.B@Example.NET"), "example.net");
    EXPECT_EQ(emailUserName("a@b@C"), "a");
    EXPECT_EQ(emailHostName("a@b@C"), "b@c");
}

TEST(KAExtras, ATextWithoutAtIsUserAndHostUnchanged)
{
    EXPECT_EQ(emailUserName("Anna"), "Anna");
    EXPECT_EQ(emailHostName("Anna"), "Anna");
}

TEST(KAExtras, NothingBehindTheAtIsNoHost)
{
    EXPECT_TRUE(emailHostName("anna@").isNull());
    EXPECT_EQ(emailUserName("anna@"), "anna");
    EXPECT_FALSE(emailUserName("@host").isNull());
    EXPECT_TRUE(emailUserName("@host").isEmpty());
}

TEST(KAExtras, TheDomainOfAServerAddressIsItsHost)
{
    EXPECT_EQ(urlDomain("Mail.Example.NET"), "mail.example.net");
    EXPECT_EQ(urlDomain("dav.example.net/home/anna"), "dav.example.net");
    EXPECT_EQ(urlDomain("  dav.example.net/x"), "dav.example.net");
    EXPECT_EQ(urlDomain("://dav.example.net/x"), "dav.example.net");
    EXPECT_EQ(urlDomain(" :// dav.example.net/x"), "dav.example.net");
    EXPECT_EQ(urlDomain("dav.example.net/?back=http://other.example"), "dav.example.net");
}

TEST(KAExtras, NothingBeforeASlashIsAnEmptyDomain)
{
    EXPECT_FALSE(urlDomain("/home").isNull());
    EXPECT_TRUE(urlDomain("/home").isEmpty());
    EXPECT_FALSE(urlDomain("").isNull());
}

TEST(KAExtras, TheDomainOfAWholeUrlIsItsSchemeWithTheColon)
{
    EXPECT_EQ(urlDomain("HTTP://example.net/x"), "http:");
    EXPECT_EQ(urlDomain("https://example.net"), "https:");
}

TEST(KAExtras, AnAddressIsInADomainThatItBeginsWithOrHoldsBehindADot)
{
    EXPECT_TRUE(serverAddrIsInDomain("Example.net", "example."));
    EXPECT_TRUE(serverAddrIsInDomain("mail.example.org", "EXAMPLE."));
    EXPECT_FALSE(serverAddrIsInDomain("notexample.net", "example."));
    EXPECT_FALSE(serverAddrIsInDomain("example", "example."));
}

TEST(KAExtras, AUserOfOneOnlineServiceHasAnAddressAtTheOther)
{
    EXPECT_EQ(otherNimbrelOrDorvexEmail("Anna@Nimbrel.example"), "anna@dorvex.example");
    EXPECT_EQ(otherNimbrelOrDorvexEmail("anna@dorvex.example"), "anna@nimbrel.example");
    EXPECT_TRUE(otherNimbrelOrDorvexEmail("anna@example.net").isNull());
    EXPECT_TRUE(otherNimbrelOrDorvexEmail("anna@").isNull());
    EXPECT_TRUE(otherNimbrelOrDorvexEmail("anna@mail.nimbrel.example").isNull());
    EXPECT_EQ(otherNimbrelOrDorvexEmail("@nimbrel.example"), "@dorvex.example");
}

TEST(KAExtras, AFieldGivesATrimmedAddressInLowerCase)
{
    QLineEdit field;
    field.setText("  Anna@Example.NET ");
    EXPECT_EQ(validatedEmailAddressStringValue(&field), "anna@example.net");
    field.clear();
    EXPECT_FALSE(validatedEmailAddressStringValue(&field).isNull());
}

TEST(KAExtras, TheHashIsWhatFollowsTheNumberSign)
{
    EXPECT_EQ(_hash(QUrl("http://example.net/p?q=1#a=b")), "a=b");
    EXPECT_TRUE(_hash(QUrl("http://example.net/p?q=1")).isNull());
}

TEST(KAExtras, NothingBehindTheNumberSignIsAnEmptyHashAndNotANullOne)
{
    const QString hash = _hash(QUrl("http://example.net/#"));
    EXPECT_TRUE(hash.isEmpty());
    EXPECT_FALSE(hash.isNull());
}

TEST(KAExtras, AQuestionMarkBehindTheNumberSignIsARangeError)
{
    EXPECT_THROW((void)_hash(QUrl("http://example.net/#a?b")), std::out_of_range);
    EXPECT_THROW((void)hashArguments(QUrl("http://example.net/#a=1?b=2")), std::out_of_range);
}

TEST(KAExtras, QueryArgumentsAreSetApartByQuestionMarks)
{
    const QMap<QString, QString> arguments = queryArguments(QUrl("http://example.net/?a=1?b=x%20y?c?d=1=2?a=3"));
    EXPECT_EQ(arguments, (QMap<QString, QString>{{"a", "3"}, {"b", "x y"}, {"d", "1"}}));
}

TEST(KAExtras, AnAmpersandDoesNotSetQueryArgumentsApart)
{
    EXPECT_EQ(queryArguments(QUrl("http://example.net/?a=1&b=2")), (QMap<QString, QString>{{"a", "1&b"}}));
}

TEST(KAExtras, HashArgumentsHaveExactlyOneEqualsSign)
{
    const QMap<QString, QString> arguments = hashArguments(QUrl("http://example.net/#a=1&b=2=3&c&d=%C3%A4"));
    EXPECT_EQ(arguments, (QMap<QString, QString>{{"a", "1"}, {"d", QStringLiteral(u"ä")}}));
}

TEST(KAExtras, AnUrlWithoutArgumentsHasNone)
{
    EXPECT_TRUE(queryArguments(QUrl("http://example.net/")).isEmpty());
    EXPECT_TRUE(hashArguments(QUrl("http://example.net/")).isEmpty());
}

TEST(KAExtras, TheFirstDictionaryWithAKeyIsFound)
{
    const QVariantList list{"a", QVariantMap{{"b", 1}}, QVariantMap{{"a", 2}}, QVariantMap{{"a", 3}}};
    EXPECT_TRUE(containsDictionaryWithKey(list, "a"));
    EXPECT_FALSE(containsDictionaryWithKey(list, "c"));
    EXPECT_EQ(dictionaryWithKey(list, "a"), (QVariantMap{{"a", 2}}));
    EXPECT_FALSE(dictionaryWithKey(list, "c").has_value());
}

TEST(KAExtras, ANullKeyNamesNothingNotEvenTheEmptyKey)
{
    QVariantList list{QVariantMap{{"", 1}}};
    EXPECT_TRUE(containsDictionaryWithKey(list, ""));
    EXPECT_FALSE(containsDictionaryWithKey(list, {}));
    EXPECT_FALSE(dictionaryWithKey(list, {}).has_value());
    removeDictionaryWithKey(list, {});
    EXPECT_EQ(list.size(), 1);
}

TEST(KAExtras, AKeyWithoutAValueIsNoKey)
{
    QVariantList list{QVariantMap{{"a", QVariant()}}, QVariantMap{{"a", QString()}}, QVariantMap{{"a", ""}}};
    EXPECT_EQ(dictionaryWithKey(list, "a"), (QVariantMap{{"a", ""}}));
    EXPECT_FALSE(dictionaryWithKey(list, "a")->value("a").toString().isNull());
    list.removeLast();
    EXPECT_FALSE(containsDictionaryWithKey(list, "a"));
}

TEST(KAExtras, ADictionaryThatIsNotEvenEqualToItselfIsRemovedToo)
{
    QVariantList list{QVariantMap{{"a", std::numeric_limits<double>::quiet_NaN()}}, QVariantMap{{"a", 1}}};
    removeDictionaryWithKey(list, "a");
    EXPECT_EQ(list, (QVariantList{QVariantMap{{"a", 1}}}));
}

TEST(KAExtras, RemovingADictionaryRemovesItsEqualsToo)
{
    QVariantList list{QVariantMap{{"a", 1}}, QVariantMap{{"a", 2}}, QVariantMap{{"a", 1}}};
    removeDictionaryWithKey(list, "a");
    EXPECT_EQ(list, (QVariantList{QVariantMap{{"a", 2}}}));
}

TEST(KAExtras, NumbersTextsAndFlagsAreNotEqualWhenRemoving)
{
    QVariantList list{QVariantMap{{"a", 1}}, QVariantMap{{"a", true}}, QVariantMap{{"a", "1"}}};
    removeDictionaryWithKey(list, "a");
    ASSERT_EQ(list.size(), 2);
    EXPECT_EQ(list.at(0).toMap().value("a").metaType().id(), QMetaType::Bool);
    EXPECT_EQ(list.at(1).toMap().value("a").metaType().id(), QMetaType::QString);
}

TEST(KAExtras, RemovingAnUnknownKeyChangesNothing)
{
    QVariantList list{"a", QVariantMap{{"b", 1}}};
    removeDictionaryWithKey(list, "a");
    EXPECT_EQ(list.size(), 2);
}

TEST(KAExtras, ADescriptionMasksThePasswordOfTheTopLevelOnly)
{
    const QVariantMap settings{{"password", "secret"}, {"inner", QVariantMap{{"password", "deep"}}}};
    EXPECT_EQ(descriptionNoPasswords(settings), "{inner = {password = deep;}; password = ***;}");
    EXPECT_EQ(descriptionNoPasswords(QVariantMap{{"a", 1}}), "{a = 1;}");
    EXPECT_EQ(descriptionNoPasswords("secret"), "secret");
    EXPECT_EQ(descriptionNoPasswords({}), "(null)");
}

TEST(KAExtras, AnObjectDescribesItself)
{
    const Example example;
    EXPECT_EQ(descriptionNoPasswords(&example), example.description());
    QTimer timer;
    EXPECT_TRUE(descriptionNoPasswords(&timer).startsWith("<QTimer: 0x"));
    EXPECT_EQ(descriptionNoPasswords(static_cast<const Example *>(nullptr)), "(null)");
}

TEST(KAExtras, ADumpHasALineForEachFieldInItsOrder)
{
    const Example example;
    EXPECT_EQ(
        linesOf(_ivarDump(&example)),
        (QStringList{"\t_flag <c>: true", "\t_small <s>: -3", "\t_count <i>: 7", "\t_long <l>: 8", "\t_huge <Q>: -1",
                     "\t_ratio <d>: 1.500000", "\t_word <*>: text", "\t_name <@\"QString\">: Anna",
                     "\t_PassWord <@\"QString\">: secret", "\tPASSWORD <@\"QString\">: secret",
                     "\t_passwordHint <@\"QString\">: a river", "\t_where <^v>: 0x0"}));
}

TEST(KAExtras, ADumpWithoutPasswordsMasksThemInAnyCaseOfLetters)
{
    const Example example;
    const QStringList lines = linesOf(_ivarDumpNoPasswords(&example));
    EXPECT_TRUE(lines.contains("\t_PassWord <@\"QString\">: ***"));
    EXPECT_TRUE(lines.contains("\tPASSWORD <@\"QString\">: ***"));
    EXPECT_TRUE(lines.contains("\t_passwordHint <@\"QString\">: a river"));
    EXPECT_TRUE(lines.contains("\t_name <@\"QString\">: Anna"));
}

TEST(KAExtras, ADumpWalksFromTheOwnClassToItsBases)
{
    KACalDAVAccountSetupInput input;
    input.setPassword("secret");
    QStringList names;
    for (const QString &line : linesOf(_ivarDumpNoPasswords(&input)))
        names += line.section(u' ', 0, 0).trimmed();
    EXPECT_EQ(names, (QStringList{"_serverAddress", "_emailAddress", "_password", "_description", "_userName",
                                  "_autoconfigDefaults", "_context", "_continueThroughError", "_continueWithoutSSL"}));
    EXPECT_FALSE(_ivarDumpNoPasswords(&input).contains("secret"));
    EXPECT_TRUE(_ivarDump(&input).contains("secret"));
}

TEST(KAExtras, ADumpOfNothingIsNull)
{
    EXPECT_TRUE(_ivarDump(static_cast<const Example *>(nullptr)).isNull());
}

TEST(KAExtras, ADumpOfAToolkitObjectShowsItsProperties)
{
    QTimer timer;
    timer.setInterval(250);
    timer.setObjectName("clock");
    const QString dump = _ivarDump(&timer);
    EXPECT_TRUE(dump.contains("interval")) << dump.toStdString();
    EXPECT_TRUE(dump.contains(": 250\n"));
    EXPECT_TRUE(dump.indexOf("interval") < dump.indexOf("objectName"));
}

TEST(KAExtras, ADumpShowsTheObjectsAddress)
{
    struct Holder : KAObject {
        std::shared_ptr<KAObject> inner = std::make_shared<KAObject>();
        void describeFields(KAFieldList &fields) const override { fields.add("_inner", inner); }
    } holder;
    const QString address = QStringLiteral("0x") + QString::number(reinterpret_cast<quintptr>(holder.inner.get()), 16);
    EXPECT_EQ(_ivarDump(&holder), QStringLiteral("\t_inner <@\"KAObject\", %1>: <KAObject: %1>\n").arg(address));
}
