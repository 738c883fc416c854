// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAApplication.h>

#include <algorithm>

#include <gmock/gmock.h>

#include <QtCore/QTemporaryDir>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>

#include "tests/support/process.h"

namespace {

using testing::ElementsAre;

const QString kOther = QStringLiteral("org.example.other");

std::shared_ptr<KAApplication> application(const QString &bundleID)
{
    return KAApplication::initWithBundleID(bundleID);
}

/// An application bundle in a directory that is searched for applications, until the test ends.
class InstalledApplication : public testing::Test {
protected:
    InstalledApplication() { qputenv("KAVELL_APPLICATION_PATH", scratch.path().toUtf8()); }
    ~InstalledApplication() override { qunsetenv("KAVELL_APPLICATION_PATH"); }

    void install(const QString &name, const std::string &visibleName) const
    {
        kavell::test::writeFile(scratch.filePath(name + ".app/Contents/Info.plist").toStdString(),
                                "<plist version=\"1.0\"><dict><key>KABundleName</key><string>" + visibleName +
                                    "</string><key>KABundleIconFile</key><string>icon.png</string></dict></plist>");
    }

    const QTemporaryDir scratch;
    KAPluginManager manager;
};

TEST(KAApplication, NewOneHasItsIdentifierAndNothingElse)
{
    const auto fresh = application(kOther);
    EXPECT_EQ(fresh->bundleID(), kOther);
    EXPECT_TRUE(fresh->displayName().isNull());
    EXPECT_TRUE(fresh->imagePath().isNull());
    EXPECT_FALSE(fresh->enabled());
    ASSERT_TRUE(fresh->userInfo());
    EXPECT_TRUE(fresh->userInfo()->isEmpty());
}

TEST(KAApplication, UserInformationThatGoesMayAskTheApplication)
{
    const auto mail = application(kKAMailAppID);
    QString asked;
    std::shared_ptr<int> guest(new int(0), [&](int *number) {
        delete number;
        asked = mail->bundleID();
        static_cast<void>(mail->enabled());
    });
    mail->setUserInfo(std::make_shared<QVariantMap>(QVariantMap{{"guest", QVariant::fromValue(guest)}}));
    guest.reset();
    mail->setUserInfo(nullptr);
    EXPECT_EQ(asked, kKAMailAppID);
}

TEST(KAApplication, UserInformationIsSharedByItsHolders)
{
    const auto shared = application(kOther);
    shared->userInfo()->insert("key", 1);
    EXPECT_EQ(shared->userInfo()->value("key"), 1);
    EXPECT_FALSE(application(kOther)->userInfo()->contains("key"));
}

TEST(KAApplication, SortsMailContactsCalendarChatAndThenAllOthers)
{
    EXPECT_EQ(application("com.corvane.mail")->sortValue(), 100);
    EXPECT_EQ(application("com.corvane.Cardell")->sortValue(), 200);
    EXPECT_EQ(application("com.corvane.Tidewell")->sortValue(), 300);
    EXPECT_EQ(application("com.corvane.Parlex")->sortValue(), 400);
    EXPECT_EQ(application("com.corvane.Luminel")->sortValue(), 1000);
    EXPECT_EQ(application(kOther)->sortValue(), 1000);
    EXPECT_EQ(application({})->sortValue(), 1000);
}

TEST(KAApplication, SortedBySortValueTheyStandInTheirOrder)
{
    QList<std::shared_ptr<KAApplication>> all{application(kKAMailAppID), application(kKAParlexAppID),
                                              application(kOther), application(kKACardellAppID)};
    std::stable_sort(all.begin(), all.end(),
                     [](const auto &first, const auto &second) { return first->sortValue() < second->sortValue(); });
    QStringList order;
    for (const auto &one : all)
        order += one->bundleID();
    EXPECT_THAT(order, ElementsAre(kKAMailAppID, kKACardellAppID, kKAParlexAppID, kOther));
}

TEST(KAApplication, IsServedByItsDataPlugin)
{
    EXPECT_EQ(application("com.corvane.mail")->associatedPluginID(), "com.corvane.mail.kaplugin");
    EXPECT_EQ(application("com.corvane.Cardell")->associatedPluginID(), "com.corvane.contacts.kaplugin");
    EXPECT_EQ(application("com.corvane.Tidewell")->associatedPluginID(), "com.corvane.calendar.kaplugin");
    EXPECT_EQ(application("com.corvane.Parlex")->associatedPluginID(), "com.corvane.chat.kaplugin");
    EXPECT_TRUE(application("com.corvane.Luminel")->associatedPluginID().isNull());
}

TEST(KAApplication, DataIsNamedInTheUsersLanguage)
{
    EXPECT_EQ(application("com.corvane.mail")->displayNameForData(), "Mail");
    EXPECT_EQ(application("com.corvane.Cardell")->displayNameForData(), "Contacts");
    EXPECT_EQ(application("com.corvane.Tidewell")->displayNameForData(), "Calendars");
    EXPECT_EQ(application("com.corvane.Parlex")->displayNameForData(), "Messages");
    EXPECT_TRUE(application(kOther)->displayNameForData().isNull());
}

TEST(KAApplication, ImageIsReadOnceAndKept)
{
    const QTemporaryDir scratch;
    QImage picture(3, 5, QImage::Format_RGB32);
    picture.fill(Qt::red);
    ASSERT_TRUE(picture.save(scratch.filePath("icon.png")));
    const auto one = application(kOther);
    one->setImagePath(scratch.filePath("icon.png"));
    EXPECT_EQ(one->image().size(), QSize(3, 5));
    ASSERT_TRUE(QFile::remove(scratch.filePath("icon.png")));
    EXPECT_EQ(one->image().size(), QSize(3, 5));
}

TEST(KAApplication, GenericImageIsNotKept)
{
    const QTemporaryDir scratch;
    const auto one = application(kOther);
    EXPECT_FALSE(one->image().isNull());
    one->setImagePath(scratch.filePath("icon.png"));
    EXPECT_FALSE(one->image().isNull());
    EXPECT_NE(one->image().size(), QSize(3, 5));
    ASSERT_TRUE(QImage(3, 5, QImage::Format_RGB32).save(scratch.filePath("icon.png")));
    EXPECT_EQ(one->image().size(), QSize(3, 5));
}

TEST_F(InstalledApplication, NameAndIconComeFromThePlatform)
{
    install("Cardell Book", "Address Book");
    const auto contacts = manager.cardellApp();
    EXPECT_EQ(contacts->displayName(), "Address Book");
    EXPECT_EQ(contacts->imagePath(), scratch.filePath("Cardell Book.app/Contents/Resources/icon.png"));
}

TEST_F(InstalledApplication, NameAndIconAreAskedForOnce)
{
    install("Mail", "Letters");
    EXPECT_EQ(manager.mailApp()->displayName(), "Letters");
    install("Mail", "Renamed");
    EXPECT_EQ(manager.mailApp()->displayName(), "Letters");
    EXPECT_EQ(manager.mailApp()->imagePath(), scratch.filePath("Mail.app/Contents/Resources/icon.png"));
    EXPECT_EQ(manager.cachedDisplayNameForApp(kKAMailAppID), "Letters");
    EXPECT_EQ(manager.cachedImagePathForApp(kKAMailAppID), scratch.filePath("Mail.app/Contents/Resources/icon.png"));
}

TEST_F(InstalledApplication, WhatIsInTheCachesIsUsed)
{
    install("Mail", "Letters");
    manager.setCachedDisplayName("Cached", kKAMailAppID);
    manager.setCachedImagePath("/cached.png", kKAMailAppID);
    EXPECT_EQ(manager.mailApp()->displayName(), "Cached");
    EXPECT_EQ(manager.mailApp()->imagePath(), "/cached.png");
}

TEST_F(InstalledApplication, WithoutANameItGoesByTheOneItIsFoundBy)
{
    install("Tidewell", "");
    EXPECT_EQ(manager.tidewellApp()->displayName(), "Tidewell");
    EXPECT_EQ(manager.parlexApp()->displayName(), "Parlex");  // not installed at all
    EXPECT_TRUE(manager.parlexApp()->imagePath().isNull());
    EXPECT_EQ(manager.applicationWithBundleID("com.corvane.Luminel")->displayName(), "Luminel");
    EXPECT_EQ(manager.cardellApp()->displayName(), "Cardell Book");
}

TEST_F(InstalledApplication, EachRequestMakesANewOne)
{
    const auto first = manager.mailApp();
    first->setEnabled(true);
    first->userInfo()->insert("key", 1);
    const auto second = manager.mailApp();
    EXPECT_NE(first, second);
    EXPECT_FALSE(second->enabled());
    EXPECT_TRUE(second->userInfo()->isEmpty());
}

TEST_F(InstalledApplication, UnknownIdentifiersHaveNone)
{
    EXPECT_FALSE(manager.applicationWithBundleID(kOther));
    EXPECT_FALSE(manager.applicationWithBundleID({}));
}

TEST_F(InstalledApplication, MissingIconPathIsNotCached)
{
    manager.setCachedImagePath("/cached.png", kKAMailAppID);
    manager.setCachedImagePath({}, kKAMailAppID);
    EXPECT_EQ(manager.cachedImagePathForApp(kKAMailAppID), "/cached.png");
}

}  // namespace
