// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example account-list plug-in in a registry of each test's own, with the data plug-ins that the test installs, a
// vault for passwords, and hands and eyes for its sheet. User-interface thread.

#ifndef KAVELL_TESTS_INTEGRATION_ZORBO_FIXTURE_H
#define KAVELL_TESTS_INTEGRATION_ZORBO_FIXTURE_H

#include <filesystem>
#include <memory>

#include <QtCore/QDeadlineTimer>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetWindow.h>

#include "tests/integration/data_plugin_fixture.h"
#include "tests/support/plugin_directory.h"

namespace kavell::test {

inline const QString kZorboPluginID = QStringLiteral("com.example.zorbo.kaplugin");
inline const QString kZorboProviderType = QStringLiteral("com.example.account.zorbo");

class ZorboTest : public AccountWithVaultTest {
protected:
    void SetUp() override
    {
        AccountWithVaultTest::SetUp();
        install("Zorbo");
        m_window.resize(640, 480);
        m_window.show();
    }

    void TearDown() override
    {
        for (QWidget *window : QApplication::topLevelWidgets()) {
            if (qobject_cast<QMessageBox *>(window))
                delete window;
        }
        AccountWithVaultTest::TearDown();
    }

    /// Puts a bundle that the build made where the registry looks.
    void install(const std::string &name)
    {
        std::filesystem::create_directory_symlink(buildPath("examples/plugins/" + name + ".kaplugin"),
                                                  m_plugins.path().toStdString() + "/" + name + ".kaplugin");
    }

    void installAllDataPlugins()
    {
        for (const char *name : {"MailData", "CalendarData", "ContactsData", "ChatData"})
            install(name);
    }

    [[nodiscard]] static KAAListPlugin &zorbo()
    {
        auto *const found =
            qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(kZorboPluginID));
        if (!found)
            throw std::runtime_error("no plug-in Zorbo");
        return *found;
    }

    [[nodiscard]] static KADataPlugin &mailData()
    {
        return *qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(kKAMailPluginID));
    }

    [[nodiscard]] QWidget *window() { return &m_window; }

    /// The accounts as another process finds them.
    [[nodiscard]] static QList<std::shared_ptr<KAAccount>> storedAccounts()
    {
        return KAProvider::initWithProviderType(kZorboProviderType)->accounts();
    }

    /// An account that the user has added before.
    [[nodiscard]] static std::shared_ptr<KAAccount> storedAccount(const QString &password = {})
    {
        auto account = newAccount("carla@zorbo.example", kZorboProviderType);
        account->setFullName("Carla Zorbo");
        account->setProviderAttribute("Zorbo account", KAMailAccountDescriptionKey);
        if (!password.isNull()) {
            EXPECT_TRUE(account->setPassword(password));
        }
        commit(account);
        return account;
    }

    /// @name The sheet
    /// @{

    /// The sheet that is on the screen; null when there is none.
    [[nodiscard]] static KASheetWindow *sheet()
    {
        for (QWidget *candidate : QApplication::topLevelWidgets()) {
            if (auto *const found = qobject_cast<KASheetWindow *>(candidate); found && found->isVisible())
                return found;
        }
        return nullptr;
    }

    /// The name of the page that the sheet shows; null without a sheet, and while one page turns into another.
    [[nodiscard]] static QString page()
    {
        const QWidget *const view = sheet() ? sheet()->contentView() : nullptr;
        return view && view->isVisible() && !view->objectName().isEmpty() ? view->objectName() : QString();
    }

    [[nodiscard]] static bool reaches(const QString &name)
    {
        return runUntil([&] { return page() == name; });
    }

    /// Whether nothing changes the condition for longer than the service takes to answer.
    template <typename Condition> [[nodiscard]] static bool staysTrue(const Condition &condition)
    {
        const QDeadlineTimer end(600);
        return runUntil([&] { return !condition() || end.hasExpired(); }) && condition();
    }

    /// A control of the page that is shown.
    template <typename Control> [[nodiscard]] static Control *control(const QString &name)
    {
        return sheet() ? sheet()->findChild<Control *>(name) : nullptr;
    }

    [[nodiscard]] static QPushButton *button(const QString &name) { return control<QPushButton>(name); }
    [[nodiscard]] static QLineEdit *field(const QString &name) { return control<QLineEdit>(name); }
    [[nodiscard]] static QString textOf(const QString &name) { return control<QLabel>(name)->text(); }

    static void click(const QString &name) { QTest::mouseClick(button(name), Qt::LeftButton); }

    static void type(const QString &name, const QString &text)
    {
        field(name)->selectAll();
        QTest::keyClicks(field(name), text);
    }

    void openSheet()
    {
        zorbo().createAccountInWindow(window());
        ASSERT_TRUE(reaches("signInView"));
    }

    static void fillIn(const QString &address = QStringLiteral("carla@zorbo.example"),
                       const QString &password = QStringLiteral("secret"),
                       const QString &fullName = QStringLiteral("Carla Zorbo"))
    {
        type("addressField", address);
        type("passwordField", password);
        type("fullNameField", fullName);
    }

    void openApplications()
    {
        openSheet();
        fillIn();
        click("signInContinue");
        ASSERT_TRUE(reaches("appSelectionView"));
    }

    /// The check box of an application in the table.
    [[nodiscard]] static QCheckBox *checkBox(const QString &appBundleID)
    {
        const auto rows = sheet()->findChildren<KAAppTableRow *>();
        for (const KAAppTableRow *row : rows) {
            if (row->application() && row->application()->bundleID() == appBundleID)
                return row->findChild<QCheckBox *>();
        }
        return nullptr;
    }
    /// @}

private:
    PluginDirectory m_plugins;  // goes last, and the registry with it
    QWidget m_window;
};

}  // namespace kavell::test

#endif
