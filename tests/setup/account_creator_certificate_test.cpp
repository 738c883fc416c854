// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Creators whose plug-in meets a server that the user must be asked about, with the real panel.

#include <functional>
#include <future>
#include <thread>

#include <QtCore/QTimer>
#include <QtCore/QUrl>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KACertificatePanel.h>

#include "tests/setup/creator_fixture.h"
#include "tests/ui/tls_identity.h"

using namespace kavell::test;

namespace {

KAError certificateError()
{
    static const QList<QSslCertificate> sChain = selfSigned("mail.example").chain();
    return {"Example",
            -1202,
            {{KAError::failingURLKey, QUrl("https://mail.example/")},
             {KAError::peerCertificateChainKey, QVariant::fromValue(sChain)}}};
}

class CreatorWithCertificate : public CreatorTest {
protected:
    /// Presses a button of the panel once it is up.
    void pressWhenShown(const QString &button)
    {
        QTimer::singleShot(0, qApp, [this, button] {
            QWidget *const panel = QApplication::activeModalWidget();
            if (!panel)
                return pressWhenShown(button);
            if (beforePress)
                beforePress();
            message = panel->findChild<QLabel *>("message")->text();
            QTest::mouseClick(panel->findChild<QPushButton *>(button), Qt::LeftButton);
        });
    }

    /// The plug-in's script: it asks, notes the answer, and goes on when it may.
    void ask(const Input &input)
    {
        lastInput = input;
        answer = plugin().handleCertificateError(certificateError());
        if (answer)
            plugin().accountSetupDidFinish(input, result);
    }

    bool answer = false;
    QString message;
    std::function<void()> beforePress;
};

TEST_F(CreatorWithCertificate, ARefusalEndsTheWaitWithoutAnAccount)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
    };
    pressWhenShown("cancel");
    const auto creator = KAMailAccountCreator::initWithSettings(kSettings, &plugin());
    EXPECT_FALSE(creator->create());
    EXPECT_FALSE(answer);
    EXPECT_EQ(creations, 0);
    EXPECT_EQ(creator->failureReason(), "The server's certificate was not trusted.");
    EXPECT_EQ(creator->failureError().code(), -1202);
}

TEST_F(CreatorWithCertificate, AReportAfterTheRefusalCountsNoMore)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
        plugin().accountSetupDidFinish(input, result);
    };
    pressWhenShown("cancel");
    EXPECT_FALSE(KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create());
    EXPECT_EQ(creations, 0);
}

TEST_F(CreatorWithCertificate, ATrustedServerIsTalkedToOn)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
    };
    pressWhenShown("continue");
    EXPECT_TRUE(KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create());
    EXPECT_TRUE(answer);
    EXPECT_EQ(creations, 1);
}

TEST_F(CreatorWithCertificate, ThePanelBearsTheLibrarysTitle)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
    };
    pressWhenShown("continue");
    EXPECT_TRUE(KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create());
    EXPECT_TRUE(message.startsWith("Online Accounts ")) << message.toStdString();
}

TEST_F(CreatorWithCertificate, AWorkersQuestionIsAskedOnTheMainThread)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
    };
    pressWhenShown("continue");
    auto created = std::async(std::launch::async,
                              [&] { return KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create(); });
    ASSERT_TRUE(
        QTest::qWaitFor([&] { return created.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }, 10000));
    EXPECT_TRUE(created.get());
}

TEST_F(CreatorWithCertificate, ACreatorMayGoWhileAnothersQuestionIsUp)
{
    plugin().onStart = [&](const Input &input) {
        ask(input);
    };
    auto other = KAMailAccountCreator::initWithSettings(kSettings, &plugin());
    beforePress = [&] {
        other.reset();
    };
    pressWhenShown("continue");
    auto created = std::async(std::launch::async,
                              [&] { return KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create(); });
    ASSERT_TRUE(
        QTest::qWaitFor([&] { return created.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }, 10000));
    EXPECT_TRUE(created.get());
}

TEST_F(CreatorWithCertificate, AMainThreadThatWaitsForItsCreatorShowsThePanelOfAPluginsThread)
{
    std::thread asker;
    plugin().onStart = [&](const Input &input) {
        asker = std::thread([&, input] { ask(input); });
    };
    pressWhenShown("cancel");
    EXPECT_FALSE(KAMailAccountCreator::initWithSettings(kSettings, &plugin())->create());
    asker.join();
    EXPECT_FALSE(answer);
}

}  // namespace
