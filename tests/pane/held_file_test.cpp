// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account's file in another process's hands, which does not give it back: the pane goes on, says what it waits for,
// can be told to stop waiting, and works again afterwards.

#include <QtCore/QElapsedTimer>
#include <QtCore/QTimer>

#include "tests/pane/pane_fixture.h"
#include "tests/tools/semaphore_holder.h"

namespace kavell::test {

namespace {

using testing::ElementsAre;

/// The longest time for which the event loop did not turn.
class Heartbeat {
public:
    Heartbeat()
    {
        m_sinceBeat.start();
        QObject::connect(&m_timer, &QTimer::timeout,
                         [this] { m_longest = std::max(m_longest, m_sinceBeat.restart()); });
        m_timer.start(5);
    }

    [[nodiscard]] qint64 longestPause() const { return std::max(m_longest, m_sinceBeat.elapsed()); }

private:
    QTimer m_timer;
    QElapsedTimer m_sinceBeat;
    qint64 m_longest = 0;
};

class HeldFile : public PaneTest {
protected:
    // In ms; waiting for the file would last for ever.
    static constexpr qint64 kNoticeablePause = 2000;

    [[nodiscard]] std::string fileOf(const std::string &loginName) const
    {
        return homePath("Library/Kavell Accounts/V1/" + kKindType.toStdString() + "/" + loginName + ".plist");
    }

    static QString progress()
    {
        auto *const label = visible<QLabel>("progressSentence");
        return label ? label->text() : QString();
    }
};

TEST_F(HeldFile, OfTheSelectedAccountIsWaitedForUntilTheUserStops)
{
    storedAccount("ada");
    storedAccount("bob");
    openPane();
    waitForPage("ada");
    SemaphoreHolder holder(fileOf("bob"));
    const Heartbeat heartbeat;
    list().selectAccount({kKindType, "bob"});
    waitFor([] { return progress() == "Opening the account bob…"; }, "the strip");
    EXPECT_FALSE(visible<QLabel>("accountTitle")) << "one account's page under another one's name";
    click("stopWaiting");
    EXPECT_EQ(notice(), "The account bob was not opened, because you stopped waiting for it.");
    EXPECT_FALSE(visible<QPushButton>("stopWaiting"));
    list().selectAccount({kKindType, "ada"});
    waitForPage("ada");
    EXPECT_LT(heartbeat.longestPause(), kNoticeablePause);
    holder.release(fileOf("bob"));
    list().selectAccount({kKindType, "bob"});
    waitForPage("bob");
}

TEST_F(HeldFile, TryAgainOpensTheAccountOnceTheFileIsFree)
{
    storedAccount("ada");
    storedAccount("bob");
    openPane();
    waitForPage("ada");
    SemaphoreHolder holder(fileOf("bob"));
    list().selectAccount({kKindType, "bob"});
    click("stopWaiting");
    holder.release(fileOf("bob"));
    click("noticeAction");
    waitForPage("bob");
}

TEST_F(HeldFile, ChangeThatTheUserStopsWaitingForIsNotMadeLater)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    SemaphoreHolder holder(fileOf("ada"));
    click<QCheckBox>("accountEnabled");
    click("stopWaiting");
    EXPECT_TRUE(visible<QCheckBox>("accountEnabled")->isChecked());
    holder.release(fileOf("ada"));
    pane::backgroundThreads().waitForDone();
    EXPECT_TRUE(newAccount("ada", kKindType)->accountIsEnabled());
    click<QCheckBox>("accountEnabled");
    waitFor([] { return !newAccount("ada", kKindType)->accountIsEnabled(); }, "the account to be off");
}

TEST_F(HeldFile, TypedDescriptionStaysInTheFieldAndIsSavedTheNextTime)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    SemaphoreHolder holder(fileOf("ada"));
    auto *const field = visible<QLineEdit>("accountDescription");
    QTest::keyClicks(field, "Work");
    QTest::keyClick(field, Qt::Key_Return);
    click("stopWaiting");
    holder.release(fileOf("ada"));
    pane::backgroundThreads().waitForDone();
    EXPECT_EQ(newAccount("ada", kKindType)->providerAttributeForKey(KAMailAccountDescriptionKey), QVariant());
    EXPECT_EQ(field->text(), "Work");
    QTest::keyClick(field, Qt::Key_Return);
    waitForPage("Work");
}

TEST_F(HeldFile, WhenThePaneOpensIsWaitedForAndTriedAgain)
{
    storedAccount("ada");
    (void)newAccount("ada", kKindType);  // whose reading makes the semaphore
    SemaphoreHolder holder(fileOf("ada"));
    const Heartbeat heartbeat;
    openPaneWithoutWaiting();
    waitFor([] { return progress() == "Reading the accounts…"; }, "the strip");
    click("stopWaiting");
    EXPECT_EQ(notice(), "The accounts were not read, because you stopped waiting for them. What is shown may be out of "
                        "date.");
    EXPECT_LT(heartbeat.longestPause(), kNoticeablePause);
    holder.release(fileOf("ada"));
    click("noticeAction");
    waitForPage("ada");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada"));
}

TEST_F(HeldFile, DoesNotKeepTheWindowFromClosing)
{
    storedAccount("ada");
    storedAccount("bob");
    openPane();
    waitForPage("ada");
    SemaphoreHolder holder(fileOf("bob"));
    list().selectAccount({kKindType, "bob"});
    waitFor([] { return !progress().isNull(); }, "the strip");
    QElapsedTimer sinceClosing;
    sinceClosing.start();
    closePane();
    EXPECT_LT(sinceClosing.elapsed(), 5000);
    holder.release(fileOf("bob"));
}

}  // namespace

}  // namespace kavell::test
