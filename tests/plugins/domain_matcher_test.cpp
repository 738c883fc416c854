// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "plugins/domain_matcher.h"

#include <random>

#include <QtCore/QStringList>
#include <gtest/gtest.h>

namespace {

QVariantMap domainsFile(const QStringList &domains, const QStringList &exceptions = {}, const QString &match = {})
{
    QVariantMap file{{"domains", QVariantList(domains.begin(), domains.end())},
                     {"exceptions", QVariantList(exceptions.begin(), exceptions.end())}};
    if (!match.isNull())
        file.insert("match", match);
    return file;
}

/// The rules word by word, entry by entry.
bool naivelyMatches(const QString &domain, const QStringList &entries, const QStringList &exceptions, bool exact)
{
    for (const QString &exception : exceptions) {
        QString bare = exception;
        if (exception.startsWith("*.")) {
            if (domain.endsWith(exception.mid(1)))
                return false;
            bare = exception.mid(2);
        }
        if (domain == bare)
            return false;
    }
    for (const QString &entry : entries) {
        if (exact && (domain == entry || domain.startsWith(entry + ".") || domain.contains("." + entry)))
            return true;
        if (!exact && (domain.startsWith(entry + ".") || domain.contains("." + entry + ".")))
            return true;
    }
    return false;
}

TEST(DomainMatcher, LabelClaimsWhatBeginsWithItOrHoldsItBetweenDots)
{
    const kavell::DomainMatcher matcher(domainsFile({"example"}));
    EXPECT_TRUE(matcher.matches("example.net"));
    EXPECT_TRUE(matcher.matches("mail.example.test"));
    EXPECT_FALSE(matcher.matches("notexample.net"));
    EXPECT_FALSE(matcher.matches("example"));
}

TEST(DomainMatcher, ExactEntryClaimsItselfWhatItBeginsAndWhatHoldsItAfterADot)
{
    const kavell::DomainMatcher matcher(domainsFile({"example.net"}, {}, "exact"));
    EXPECT_TRUE(matcher.matches("example.net"));
    EXPECT_TRUE(matcher.matches("eu.example.net"));
    EXPECT_TRUE(matcher.matches("a.example.network"));
    EXPECT_TRUE(matcher.matches("example.net.other.test"));
    EXPECT_FALSE(matcher.matches("example.network"));
    EXPECT_TRUE(matcher.matches("eu.example.net.other.test"));
    EXPECT_FALSE(matcher.matches("notexample.net"));
}

TEST(DomainMatcher, ExceptionWithAStarExcludesTheDomainAndItsSubTree)
{
    const kavell::DomainMatcher matcher(domainsFile({"example"}, {"*.corp.example.net"}));
    EXPECT_FALSE(matcher.matches("corp.example.net"));
    EXPECT_FALSE(matcher.matches("x.corp.example.net"));
    EXPECT_TRUE(matcher.matches("xcorp.example.net"));
}

TEST(DomainMatcher, ExceptionWithoutAStarExcludesOnlyTheDomainItself)
{
    const kavell::DomainMatcher matcher(domainsFile({"example"}, {"corp.example.net"}));
    EXPECT_FALSE(matcher.matches("corp.example.net"));
    EXPECT_TRUE(matcher.matches("x.corp.example.net"));
}

TEST(DomainMatcher, OnlyTheTextExactSelectsExactMatching)
{
    QVariantMap file = domainsFile({"example"}, {}, "Exact");
    EXPECT_TRUE(kavell::DomainMatcher(file).matches("example.net"));
    EXPECT_FALSE(kavell::DomainMatcher(file).matches("example"));
    file.insert("match", QByteArray("exact"));
    EXPECT_FALSE(kavell::DomainMatcher(file).matches("example"));
}

TEST(DomainMatcher, EntriesWithCapitalsMatchNothing)
{
    EXPECT_FALSE(kavell::DomainMatcher(domainsFile({"Example"})).matches("example.net"));
    EXPECT_TRUE(kavell::DomainMatcher(domainsFile({"example"}, {"Example.net"})).matches("example.net"));
}

TEST(DomainMatcher, AnswersAsTheRulesWordByWord)
{
    std::mt19937 random(20261121);
    const auto text = [&](int longest) {
        QString result;
        for (int length = static_cast<int>(random() % static_cast<unsigned>(longest + 1)); length > 0; --length)
            result += QChar("ab.."[random() % 4]);
        return result;
    };
    int claimed = 0;
    for (int round = 0; round < 20000; ++round) {
        QStringList entries;
        QStringList exceptions;
        for (unsigned count = random() % 5; count > 0; --count)
            entries += text(4);
        for (unsigned count = random() % 3; count > 0; --count)
            exceptions += (random() % 2 ? "*." : "") + text(4);
        const bool exact = random() % 2;
        const kavell::DomainMatcher matcher(domainsFile(entries, exceptions, exact ? "exact" : "label"));
        for (int question = 0; question < 10; ++question) {
            const QString domain = text(9);
            const bool expected = naivelyMatches(domain, entries, exceptions, exact);
            claimed += expected;
            ASSERT_EQ(matcher.matches(domain), expected)
                << domain.toStdString() << " of " << entries.join(' ').toStdString() << " without "
                << exceptions.join(' ').toStdString() << (exact ? " exact" : " label");
        }
    }
    EXPECT_GT(claimed, 1000);
}

}  // namespace
