// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The pane without a mouse: where the focus goes, and what keys do.

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

using testing::ElementsAre;

class Keyboard : public PaneTest {
protected:
    /// The named controls that Tab reaches, from the list on, once round.
    [[nodiscard]] QStringList tabOrder()
    {
        QStringList names;
        list().setFocus();
        for (int step = 0; step < 100; ++step) {
            const QString name = QApplication::focusWidget()->objectName();
            if (step > 0 && QApplication::focusWidget() == &list())
                return names;
            if (!name.isEmpty())
                names += name;
            QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        }
        return {};
    }
};

TEST_F(Keyboard, TabGoesFromTheListThroughThePageFromTopToBottom)
{
    const auto account = storedAccount("ada");
    ASSERT_TRUE(account->setPassword("secret"));
    commit(account);
    openPane();
    waitForPage("ada");
    waitFor([] { return visible<QPushButton>("removePassword")->isEnabled(); }, "the password's state");
    QApplication::setActiveWindow(&window());
    EXPECT_THAT(tabOrder(), ElementsAre("accounts", "addAccount", "removeAccount", "accountEnabled",
                                        "accountDescription", "scrollView", "checkbox", "checkbox", "checkbox",
                                        "checkbox", "setPassword", "showPassword", "removePassword"));
}

TEST_F(Keyboard, DeleteInTheListAsksAndEscapeKeepsTheAccount)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    QApplication::setActiveWindow(&window());
    list().setFocus();
    QTest::keyClick(&list(), Qt::Key_Delete);
    waitFor([] { return visible<QPushButton>("disagree") != nullptr; }, "the question");
    QTest::keyClick(QApplication::activeModalWidget(), Qt::Key_Escape);
    waitFor([] { return visible<QPushButton>("disagree") == nullptr; }, "the question's end");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada"));
}

TEST_F(Keyboard, DeleteWhileTypingDeletesALetter)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    QApplication::setActiveWindow(&window());
    auto *const field = visible<QLineEdit>("accountDescription");
    field->setFocus();
    QTest::keyClicks(field, "Work");
    QTest::keyClick(field, Qt::Key_Home);
    QTest::keyClick(field, Qt::Key_Delete);
    EXPECT_EQ(field->text(), "ork");
    EXPECT_FALSE(QApplication::activeModalWidget());
}

TEST_F(Keyboard, EmptyPaneBeginsAtTheButtonThatAdds)
{
    openPane();
    QApplication::setActiveWindow(&window());
    EXPECT_EQ(window().focusWidget(), visible<QPushButton>("addFirstAccount"));
}

TEST_F(Keyboard, FocusGoesToTheAddedAccount)
{
    openPane();
    click("addFirstAccount");
    click("continue");
    waitFor([] { return visible<QLineEdit>("address") != nullptr; }, "the plug-in's sheet");
    QTest::keyClicks(visible<QLineEdit>("address"), "ada");
    click("addTyped");
    waitForPage("ada");
    EXPECT_EQ(window().focusWidget(), &list());
}

TEST_F(Keyboard, FocusStaysOnTheButtonAfterARemoval)
{
    storedAccount("ada", kKAProviderGoogle);
    storedAccount("bob");
    openPane();
    waitForPage("bob");
    auto *const remove = visible<QPushButton>("removeAccount");
    remove->setFocus();
    click("removeAccount");
    click("agree");
    waitForPage("ada");
    EXPECT_EQ(window().focusWidget(), remove);
}

TEST_F(Keyboard, NoTwoControlsOfAPageShareAMnemonic)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    QStringList mnemonics;
    for (QWidget *widget : window().findChildren<QWidget *>()) {
        const QKeySequence mnemonic = QKeySequence::mnemonic(widget->property("text").toString());
        if (widget->isVisible() && !mnemonic.isEmpty())
            mnemonics += mnemonic.toString();
    }
    const qsizetype count = mnemonics.size();
    EXPECT_GE(count, 6);
    mnemonics.removeDuplicates();
    EXPECT_EQ(mnemonics.size(), count);
}

}  // namespace

}  // namespace kavell::test
