// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Accounts that plug-ins announce: in whatever number, on whatever thread, under whatever name.

#include <filesystem>
#include <thread>

#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class Announcements : public PaneTest {
protected:
    /// As a plug-in announces what its sheet has made, without having saved it.
    static void announce(const QStringList &loginNames)
    {
        QList<std::shared_ptr<KAAccount>> accounts;
        for (const QString &loginName : loginNames) {
            accounts += newAccount(loginName, kKindType);
            accounts.last()->setProviderAttribute(loginName, KAMailEmailAddressKey);
        }
        const QList<std::shared_ptr<KAApplication>> picked{KAApplication::initWithBundleID(kKAMailAppID)};
        KANotificationCenter::shared().post(KACreatedAccountsNotification, QVariant::fromValue(accounts),
                                            {{QStringLiteral("plugin"), QVariant::fromValue(&kind())},
                                             {QStringLiteral("selectedApps"), QVariant::fromValue(picked)}});
    }

    static bool hasMail(const QString &loginName)
    {
        return newAccount(loginName, kKindType)->enabledForApplication(kKAMailAppID);
    }

    [[nodiscard]] int dataFiles() const
    {
        int count = 0;
        for (const auto &entry : std::filesystem::recursive_directory_iterator(homePath("")))
            count += entry.path().extension() == ".plist" ? 1 : 0;
        return count;
    }
};

TEST_F(Announcements, EachOfSeveralAccountsIsSwitchedOnForThePickedApplications)
{
    openPane();
    announce({"ada", "bob", "carla"});
    waitFor([] { return hasMail("ada") && hasMail("bob") && hasMail("carla"); }, "all three to have mail");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada", "  bob", "  carla"));
}

TEST_F(Announcements, TheSameAccountTwiceQuicklyIsOneAccount)
{
    openPane();
    announce({"ada"});
    announce({"ada"});
    waitFor([] { return hasMail("ada"); }, "the account to have mail");
    waitForPage("ada");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada"));
}

TEST_F(Announcements, ThatComeOnAnotherThreadAreTakenToo)
{
    openPane();
    std::thread([] { announce({"ada"}); }).join();
    waitForPage("ada");
    waitFor([] { return hasMail("ada"); }, "the account to have mail");
}

TEST_F(Announcements, AfterTheWindowHasGoneAreNotListenedTo)
{
    openPane();
    std::thread([] { announce({"ada"}); }).join();
    closePane();
    announce({"bob"});
    QCoreApplication::processEvents();
    pane::backgroundThreads().waitForDone();
    EXPECT_EQ(dataFiles(), 0);
}

TEST_F(Announcements, NameThatCannotBeAFilesIsRefusedByName)
{
    openPane();
    for (const QString &name : {QString("."), QString(".."), QString("ada/home"), QString("../ada"), QString("a\nda"),
                                QString("a\x7f"), QString("\u00e9").repeated(125)}) {
        announce({name});
        const QString shown = name.size() > 60 ? name.left(60) + QStringLiteral("…") : name;
        EXPECT_EQ(notice(),
                  QStringLiteral("The account was not saved, because no account can have the login name %1 on "
                                 "this computer. A name is not empty, “.” or “..”, has no “/” and no control "
                                 "character, and at most 249 bytes. Add the account under another name.")
                      .arg(shown));
        click<QToolButton>("closeNotice");
    }
    pane::backgroundThreads().waitForDone();
    EXPECT_EQ(dataFiles(), 0);
    EXPECT_THAT(listed(), IsEmpty());
}

TEST_F(Announcements, LongestPossibleNameIsTaken)
{
    openPane();
    const QString name = QString("\u00e9").repeated(124) + 'e';
    announce({name});
    waitForPage(name);
    EXPECT_TRUE(notice().isNull());
}

}  // namespace

}  // namespace kavell::test
