// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The list of accounts against a naive model: whatever reading follows whatever other one, the list shows the new one, as
// if it had been filled anew, and the selection stays where it can.

#include "pane/account_list.h"

#include <algorithm>
#include <random>

#include <QtTest/QSignalSpy>

#include <gtest/gtest.h>

#include "tests/model/account_fixture.h"

namespace kavell::pane {

namespace {

class AccountListReadings : public testing::Test {
protected:
    [[nodiscard]] int upTo(int last) { return std::uniform_int_distribution<int>(0, last)(m_random); }

    [[nodiscard]] AccountSummary randomAccount(const QString &type, const QString &loginName)
    {
        const QStringList descriptions{QString(), QStringLiteral("Home"), QStringLiteral("Work")};
        return {{type, loginName}, loginName, descriptions[upTo(2)], QString(), upTo(2) > 0};
    }

    /// Some of the providers in any order, with some accounts each, in the order of their names.
    [[nodiscard]] QList<AccountGroup> randomReading()
    {
        QStringList types{"org.example.a", "org.example.b", "org.example.c", "org.example.d"};
        std::shuffle(types.begin(), types.end(), m_random);
        QList<AccountGroup> groups;
        for (const QString &type : types.first(upTo(4))) {
            AccountGroup group{type, nullptr, {}};
            QStringList names{"ada",        "Ada", "ADA", "a-da", "bob", "Bob", "carla", "dora@example.org",
                              "\u00e9mile", "zoe"};
            std::shuffle(names.begin(), names.end(), m_random);
            names = names.first(1 + upTo(9));
            std::stable_sort(names.begin(), names.end(), [](const QString &first, const QString &second) {
                return QString::localeAwareCompare(first, second) < 0;
            });
            for (const QString &name : std::as_const(names))
                group.accounts += randomAccount(type, name);
            groups += group;
        }
        return groups;
    }

    [[nodiscard]] static QString lineOf(const AccountSummary &account)
    {
        const QString &name = account.name.loginName;
        if (account.description.isEmpty())
            return account.isEnabled ? name : name + QStringLiteral(", Off");
        return account.description + QStringLiteral(", ") + name +
               (account.isEnabled ? QString() : QStringLiteral(" – off"));
    }

    [[nodiscard]] static QStringList expectedLines(const QList<AccountGroup> &groups)
    {
        QStringList lines;
        for (const AccountGroup &group : groups) {
            lines += group.providerType;
            for (const AccountSummary &account : group.accounts)
                lines += QStringLiteral("  ") + lineOf(account);
        }
        return lines;
    }

    [[nodiscard]] static QStringList shownLines(const AccountList &list)
    {
        QStringList lines;
        const QAbstractItemModel *const model = list.model();
        for (int group = 0; group < model->rowCount(); ++group) {
            const QModelIndex parent = model->index(group, 0);
            EXPECT_TRUE(list.isExpanded(parent));
            lines += parent.data().toString();
            for (int row = 0; row < model->rowCount(parent); ++row)
                lines += QStringLiteral("  ") + model->index(row, 0, parent).data(Qt::AccessibleTextRole).toString();
        }
        return lines;
    }

    [[nodiscard]] static bool isIn(const QList<AccountGroup> &groups, const AccountName &name)
    {
        return std::any_of(groups.begin(), groups.end(), [&](const AccountGroup &group) {
            return std::any_of(group.accounts.begin(), group.accounts.end(),
                               [&](const AccountSummary &account) { return account.name == name; });
        });
    }

    void selectAny(AccountList &list, const QList<AccountGroup> &groups)
    {
        if (groups.isEmpty())
            return;
        const AccountGroup &group = groups[upTo(static_cast<int>(groups.size()) - 1)];
        const AccountName name = group.accounts[upTo(static_cast<int>(group.accounts.size()) - 1)].name;
        ASSERT_TRUE(list.selectAccount(name));
        ASSERT_EQ(list.selectedAccount().loginName, name.loginName);
    }

private:
    std::mt19937 m_random{20261121};
};

TEST_F(AccountListReadings, EachIsShownAsItIsWhateverWasShownBefore)
{
    AccountList list;
    list.show();
    AccountName told;
    QObject::connect(&list, &AccountList::selected, [&](const AccountName &name) { told = name; });
    for (int reading = 0; reading < 500; ++reading) {
        const AccountName before = list.selectedAccount();
        const QList<AccountGroup> groups = randomReading();
        list.showAccounts(groups);
        ASSERT_EQ(shownLines(list), expectedLines(groups)) << "reading " << reading;
        if (isIn(groups, before)) {
            ASSERT_TRUE(list.selectedAccount() == before) << "reading " << reading;
        }
        ASSERT_TRUE(told == list.selectedAccount()) << "reading " << reading;
        selectAny(list, groups);
    }
}

TEST_F(AccountListReadings, TheSameAgainChangesNothing)
{
    AccountList list;
    QList<AccountGroup> groups;
    while (groups.isEmpty())
        groups = randomReading();
    list.showAccounts(groups);
    selectAny(list, groups);
    QSignalSpy inserted(list.model(), &QAbstractItemModel::rowsInserted);
    QSignalSpy removed(list.model(), &QAbstractItemModel::rowsRemoved);
    QSignalSpy changed(list.model(), &QAbstractItemModel::dataChanged);
    QSignalSpy selected(&list, &AccountList::selected);
    list.showAccounts(groups);
    EXPECT_EQ(inserted.count() + removed.count() + changed.count() + selected.count(), 0);
}

}  // namespace

}  // namespace kavell::pane
