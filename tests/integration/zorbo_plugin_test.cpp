// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example plug-in, loaded as the build makes it and used by hand: its sheet is filled in and its buttons are clicked.

#include <gmock/gmock.h>

#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetWindow.h>

#include "tests/model/account_fixture.h"
#include "tests/support/process.h"

namespace kavell::test {

class ZorboPlugin : public AccountTest {
protected:
    void SetUp() override
    {
        AccountTest::SetUp();
        setenv("VESK_FRAMEWORK_PATH", buildPath("examples/plugins").c_str(), 1);
        m_plugin = qobject_cast<KAAListPlugin *>(
            KAPluginManager::shared()->pluginWithIdentifier("com.example.zorbo.kaplugin"));
        ASSERT_TRUE(m_plugin);
    }

    [[nodiscard]] KAAListPlugin &plugin() { return *m_plugin; }

    /// The sheet that is on the screen; null when there is none.
    [[nodiscard]] static KASheetWindow *sheet()
    {
        for (QWidget *window : QApplication::topLevelWidgets()) {
            if (auto *const candidate = qobject_cast<KASheetWindow *>(window); candidate && candidate->isVisible())
                return candidate;
        }
        return nullptr;
    }

    static QPushButton *button(const QString &text)
    {
        for (auto *candidate : sheet()->findChildren<QPushButton *>()) {
            if (candidate->text() == text)
                return candidate;
        }
        return nullptr;
    }

    static void typeAddress(const QString &address)
    {
        auto *const field = sheet()->findChild<QLineEdit *>();
        field->clear();
        QTest::keyClicks(field, address);
    }

private:
    KAAListPlugin *m_plugin = nullptr;  // the registry's
};

TEST_F(ZorboPlugin, ServesItsDomainButNotTheStaff)
{
    EXPECT_EQ(plugin().brandName(), QStringLiteral("Zorbo"));
    EXPECT_TRUE(plugin().supportsDomain("mail.zorbo.example"));
    EXPECT_FALSE(plugin().supportsDomain("x.staff.zorbo.example"));
}

TEST_F(ZorboPlugin, AnAccountIsAddedInItsSheet)
{
    QList<std::shared_ptr<KAAccount>> created;
    const auto observation = KANotificationCenter::shared().addObserver(
        KACreatedAccountsNotification, [&](const KANotification &notification) {
            created = notification.object.value<QList<std::shared_ptr<KAAccount>>>();
        });
    QWidget window;
    window.show();
    plugin().createAccountInWindow(&window);
    ASSERT_TRUE(sheet());

    typeAddress("carla@other.example");
    EXPECT_FALSE(button("Add Account")->isEnabled());
    typeAddress("carla@zorbo.example");
    QTest::mouseClick(button("Add Account"), Qt::LeftButton);

    EXPECT_FALSE(sheet());
    ASSERT_EQ(created.size(), 1);
    EXPECT_EQ(created.first()->loginName(), QStringLiteral("carla@zorbo.example"));
    EXPECT_TRUE(KAProvider::initWithProviderType("com.example.account.zorbo")
                    ->accountForLoginName("carla@zorbo.example", false));
}

TEST_F(ZorboPlugin, CancelMakesNoAccount)
{
    QWidget window;
    window.show();
    plugin().createAccountInWindow(&window);
    typeAddress("carla@zorbo.example");
    QTest::mouseClick(button("Cancel"), Qt::LeftButton);

    EXPECT_FALSE(sheet());
    EXPECT_THAT(KAProvider::initWithProviderType("com.example.account.zorbo")->accounts(), testing::IsEmpty());
}

}  // namespace kavell::test
