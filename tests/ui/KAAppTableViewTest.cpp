// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The application table on the screen: clicks and keys, which rows stand in it, and how long rows live.

#include <algorithm>
#include <thread>

#include <gmock/gmock.h>

#include <QtCore/QPointer>
#include <QtCore/QThread>
#include <QtGui/QAccessible>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QScrollBar>

#include "tests/ui/app_table_fixture.h"

using namespace kavell::test;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

QList<Application> manyApplications(int count)
{
    QList<Application> applications;
    for (int number = 0; number < count; ++number) {
        applications += KAApplication::initWithBundleID("com.example." + QString::number(number));
        applications.last()->setDisplayName("Application " + QString::number(number));
    }
    return applications;
}

std::shared_ptr<KAAppTableRow> keptRow(const Application &application)
{
    return application->userInfo()->value("rowView").value<std::shared_ptr<KAAppTableRow>>();
}

class KAAppTableViewTest : public testing::Test {
protected:
    KAAppTableViewTest()
    {
        table->setDelegate(&delegate);
        table->setSpinOnSelection(false);
    }

    ~KAAppTableViewTest() override { qApp->setLayoutDirection(Qt::LeftToRight); }

    void show(int height = 240)
    {
        table->view()->resize(420, height);
        table->view()->show();
        ASSERT_TRUE(QTest::qWaitForWindowActive(table->view()));
        ASSERT_TRUE(showsAllRows());
    }

    /// Waits for all rows, which are made a few at a time.
    [[nodiscard]] bool showsAllRows() const
    {
        return QTest::qWaitFor([this] {
            return std::ranges::all_of(table->apps(), [this](const Application &application) {
                return keptRow(application) && isShown(*keptRow(application));
            });
        });
    }

    /// Shows that many applications which no plug-in knows.
    void showMany(int count)
    {
        table->setApps(manyApplications(count));
        table->reloadTable();
    }

    void useFontOfSize(int points)
    {
        QFont font = table->view()->font();
        font.setPointSize(points);
        table->view()->setFont(font);
    }

    [[nodiscard]] int rowsMade() const
    {
        int made = 0;
        for (const Application &application : table->apps())
            made += keptRow(application) ? 1 : 0;
        return made;
    }

    [[nodiscard]] QScrollArea *scrollView() const { return qobject_cast<QScrollArea *>(table->view()); }
    [[nodiscard]] KAAppTableRow &row(int index) const { return *table->rowViewForRow(index); }
    [[nodiscard]] bool isShown(const KAAppTableRow &view) const { return scrollView()->widget()->isAncestorOf(&view); }

    OfferingPlugin plugin{allServices()};
    RecordingDelegate delegate;
    std::shared_ptr<KAAppTableController> table = KAAppTableController::initWithAccount(accountFor({}), &plugin);
};

TEST_F(KAAppTableViewTest, AClickOnACheckBoxAsksTheDelegate)
{
    show();
    QTest::mouseClick(checkboxOf(row(2)), Qt::LeftButton);
    EXPECT_THAT(delegate.toggled, ElementsAre(table->appAtRow(2)));
    EXPECT_TRUE(table->appAtRow(2)->enabled());
    EXPECT_TRUE(checkboxOf(row(2))->isChecked());
    EXPECT_TRUE(infoButtonOf(row(2))->isVisible());
}

TEST_F(KAAppTableViewTest, ARefusedClickIsTakenBackOnTheScreen)
{
    delegate.accepts = false;
    show();
    QTest::mouseClick(checkboxOf(row(0)), Qt::LeftButton);
    EXPECT_FALSE(checkboxOf(row(0))->isChecked());
    EXPECT_TRUE(table->appAtRow(0)->enabled());
}

TEST_F(KAAppTableViewTest, AClickedRowSpinsUntilItIsToldToStop)
{
    row(0).setSpinOnSelection(true);
    show();
    QTest::mouseClick(checkboxOf(row(0)), Qt::LeftButton);
    EXPECT_TRUE(row(0).isSpinning());
    EXPECT_FALSE(infoButtonOf(row(0))->isVisible());
    table->stopProgressForAllApps();
    EXPECT_TRUE(checkboxOf(row(0))->isVisible());
    EXPECT_TRUE(infoButtonOf(row(0))->isVisible());
}

TEST_F(KAAppTableViewTest, TheInformationButtonTellsTheDelegate)
{
    show();
    table->selectAllApps();
    QTest::mouseClick(infoButtonOf(row(1)), Qt::LeftButton);
    EXPECT_THAT(delegate.shown, ElementsAre(table->appAtRow(1)));
    EXPECT_THAT(delegate.toggled, IsEmpty());
}

TEST_F(KAAppTableViewTest, AClickOnARowSelectsItAlone)
{
    show();
    QTest::mouseClick(nameOf(row(1)), Qt::LeftButton);
    EXPECT_TRUE(row(1).isSelected());
    QTest::mouseClick(nameOf(row(2)), Qt::LeftButton);
    EXPECT_FALSE(row(1).isSelected());
    EXPECT_TRUE(row(2).isSelected());
}

TEST_F(KAAppTableViewTest, ASelectedRowOfAnAccountsTableHasNoHighlight)
{
    show();
    const auto background = [this] {
        return table->view()->grab().toImage().pixelColor(nameOf(row(3))->mapTo(table->view(), QPoint(-4, 0)));
    };
    const QColor before = background();
    row(3).setSelected(true);
    EXPECT_EQ(background(), before);
}

TEST_F(KAAppTableViewTest, SpaceTogglesAndTabWalksFromTopToBottom)
{
    table->appAtRow(1)->setEnabled(true);
    show();
    for (int index : {3, 1, 0, 2})
        (void)row(index);
    checkboxOf(row(0))->setFocus();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Space);
    EXPECT_THAT(delegate.toggled, ElementsAre(table->appAtRow(0)));
    const QList<QWidget *> expected = {infoButtonOf(row(0)), checkboxOf(row(1)), infoButtonOf(row(1)),
                                       checkboxOf(row(2)), checkboxOf(row(3))};
    for (QWidget *const next : expected) {
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        EXPECT_EQ(QApplication::focusWidget(), next);
    }
    EXPECT_TRUE(row(3).isSelected());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backtab, Qt::ShiftModifier);
    EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(2)));
}

TEST_F(KAAppTableViewTest, TabReachesRowsThatWereOutOfView)
{
    showMany(50);
    show(120);
    checkboxOf(row(0))->setFocus();
    for (int index = 1; index < 50; ++index) {
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        ASSERT_EQ(QApplication::focusWidget(), checkboxOf(row(index)));
        ASSERT_FALSE(row(index).visibleRegion().isEmpty());
    }
}

TEST_F(KAAppTableViewTest, TabWalksFromTopToBottomWhicheverRowWasMadeFirst)
{
    show();
    showMany(50);
    scrollView()->verticalScrollBar()->setValue(scrollView()->verticalScrollBar()->maximum());
    ASSERT_TRUE(QTest::qWaitFor([this] { return isShown(row(49)); }));
    ASSERT_TRUE(showsAllRows());
    for (const int from : {4, 20, 44}) {
        checkboxOf(row(from))->setFocus();
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(from + 1)));
    }
}

TEST_F(KAAppTableViewTest, TheSpinnerKeepsTheFocusInItsRow)
{
    row(0).setSpinOnSelection(true);
    show();
    checkboxOf(row(0))->setFocus();
    QTest::keyClick(checkboxOf(row(0)), Qt::Key_Space);
    EXPECT_TRUE(row(0).isAncestorOf(QApplication::focusWidget()));
    table->stopProgressForApp(table->appAtRow(0));
    EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(0)));
}

TEST_F(KAAppTableViewTest, TabWalksOnFromASpinningRowAndBackToIt)
{
    row(1).setSpinOnSelection(true);
    show();
    checkboxOf(row(1))->setFocus();
    QTest::keyClick(checkboxOf(row(1)), Qt::Key_Space);
    ASSERT_TRUE(row(1).isSpinning());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(2)));
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backtab, Qt::ShiftModifier);
    EXPECT_EQ(QApplication::focusWidget(), spinnerOf(row(1)));
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backtab, Qt::ShiftModifier);
    EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(0)));
}

TEST_F(KAAppTableViewTest, ReloadingKeepsTheFocus)
{
    show();
    checkboxOf(row(1))->setFocus();
    table->selectAllApps();
    EXPECT_EQ(QApplication::focusWidget(), checkboxOf(row(1)));
}

TEST_F(KAAppTableViewTest, RowsStandBelowEachOtherInTheOrderOfTheApplications)
{
    show();
    for (int index = 0; index < 4; ++index) {
        EXPECT_EQ(row(index).mapTo(scrollView()->widget(), QPoint()), QPoint(0, 48 * index));
        EXPECT_EQ(row(index).width(), scrollView()->viewport()->width());
    }
    table->view()->resize(600, 240);
    EXPECT_EQ(row(3).width(), scrollView()->viewport()->width());
}

TEST_F(KAAppTableViewTest, RowsAreAsHighAsTheTablesFontNeeds)
{
    useFontOfSize(40);
    show();
    const int height = row(0).sizeHint().height();
    ASSERT_GT(height, 48);
    for (int index = 0; index < 4; ++index) {
        EXPECT_EQ(row(index).mapTo(scrollView()->widget(), QPoint()), QPoint(0, height * index));
        EXPECT_EQ(row(index).height(), height);
    }
    EXPECT_GE(scrollView()->widget()->height(), 4 * height);
}

TEST_F(KAAppTableViewTest, RowsGrowWithTheFontOfATableThatIsShown)
{
    show();
    useFontOfSize(40);
    const int height = row(0).sizeHint().height();
    ASSERT_GT(height, 48);
    EXPECT_TRUE(QTest::qWaitFor([this, height] { return row(3).height() == height; }));
    EXPECT_EQ(row(3).mapTo(scrollView()->widget(), QPoint()), QPoint(0, height * 3));
}

TEST_F(KAAppTableViewTest, NoRowIsMadeBeforeTheTableIsShown)
{
    EXPECT_EQ(rowsMade(), 0);
    show();
    EXPECT_EQ(rowsMade(), 4);
}

TEST_F(KAAppTableViewTest, RowsInViewAreMadeFirstAndAllOthersInIdleTime)
{
    show();
    showMany(50);
    EXPECT_THAT(rowsMade(), testing::AllOf(testing::Ge(1), testing::Le(5)));
    ASSERT_TRUE(QTest::qWaitFor([this] { return keptRow(table->apps().at(5)) != nullptr; }));
    EXPECT_GE(rowsMade(), 5);
    ASSERT_TRUE(showsAllRows());
    EXPECT_EQ(scrollView()->verticalScrollBar()->maximum(), 50 * 48 - scrollView()->viewport()->height());
}

TEST_F(KAAppTableViewTest, ScrollingMakesTheRowsThatComeIntoView)
{
    show();
    showMany(50);
    scrollView()->verticalScrollBar()->setValue(scrollView()->verticalScrollBar()->maximum());
    ASSERT_TRUE(QTest::qWaitFor([this] { return keptRow(table->apps().last()) != nullptr; }));
    EXPECT_FALSE(keptRow(table->apps().at(30)));
    EXPECT_TRUE(isShown(row(49)));
}

TEST_F(KAAppTableViewTest, OtherApplicationsTakeTheRowsPlaces)
{
    show();
    const QList<Application> former = table->apps();
    table->setApps({former.at(3), former.at(0)});
    table->setPairedServices({kKAServiceIM, kKAServiceIMAP});
    table->reloadTable();
    ASSERT_TRUE(showsAllRows());
    EXPECT_EQ(row(0).mapTo(scrollView()->widget(), QPoint()), QPoint(0, 0));
    EXPECT_EQ(row(1).mapTo(scrollView()->widget(), QPoint()), QPoint(0, 48));
    EXPECT_EQ(row(0).application(), former.at(3));
    EXPECT_FALSE(isShown(*keptRow(former.at(2))));
    EXPECT_FALSE(keptRow(former.at(2))->isVisible());
}

TEST_F(KAAppTableViewTest, PickingAllShowsTheApplicationsThatStandInTheTableNow)
{
    show();
    table->setApps(manyApplications(3));
    table->selectAllApps();
    ASSERT_TRUE(showsAllRows());
    for (int index = 0; index < 3; ++index)
        EXPECT_TRUE(checkboxOf(row(index))->isChecked());
}

TEST_F(KAAppTableViewTest, ARowDiesWithItsApplication)
{
    show();
    QList<QPointer<KAAppTableRow>> rows;
    for (int index = 0; index < 4; ++index)
        rows += &row(index);
    table->setApps({});
    for (const QPointer<KAAppTableRow> &dead : rows)
        EXPECT_FALSE(dead);
    table->reloadTable();
    table->view()->repaint();
}

TEST_F(KAAppTableViewTest, ARowOutlivesTheTableThatShowedIt)
{
    show();
    const Application mail = table->appAtRow(0);
    const QPointer<KAAppTableRow> view = &row(0);
    table.reset();
    ASSERT_TRUE(view);
    EXPECT_EQ(view->parent(), nullptr);
    EXPECT_FALSE(view->isVisible());
    EXPECT_EQ(view->delegate(), nullptr);
    checkboxOf(*view)->click();
    EXPECT_THAT(delegate.toggled, IsEmpty());
}

TEST_F(KAAppTableViewTest, ARowSpinsOnWhenItsTableIsClosedAndCanBeStopped)
{
    row(0).setSpinOnSelection(true);
    show();
    const Application mail = table->appAtRow(0);
    QTest::mouseClick(checkboxOf(row(0)), Qt::LeftButton);
    table.reset();
    const std::shared_ptr<KAAppTableRow> view = keptRow(mail);
    EXPECT_TRUE(view->isSpinning());
    view->stopSpinner();
    EXPECT_FALSE(view->isSpinning());
    EXPECT_FALSE(checkboxOf(*view)->isHidden());
    EXPECT_TRUE(checkboxOf(*view)->isChecked());
}

TEST_F(KAAppTableViewTest, ARowThatIsShownElsewhereMovesThere)
{
    show();
    const auto other = KAAppTableController::initWithAccount(accountFor({}), &plugin);
    other->view()->resize(420, 240);
    other->view()->show();
    other->setApps({table->appAtRow(0)});
    other->reloadTable();
    ASSERT_TRUE(QTest::qWaitFor([&] { return other->view()->isAncestorOf(&row(0)); }));
    EXPECT_EQ(other->rowViewForRow(0).get(), &row(0));
    EXPECT_EQ(row(0).delegate(), table.get());
    table->reloadTable();
    EXPECT_TRUE(showsAllRows());
}

TEST_F(KAAppTableViewTest, ARowWhoseTableIsGoneAnswersToTheNext)
{
    const Application mail = table->appAtRow(0);
    (void)row(0);
    const auto other = KAAppTableController::initWithAccount(accountFor({}), &plugin);
    table.reset();
    EXPECT_EQ(other->rowViewForApp(mail)->delegate(), other.get());
}

TEST_F(KAAppTableViewTest, TheLastReferenceMayGoOnAnotherThread)
{
    show();
    const QPointer<KAAppTableRow> view = &row(0);
    const QThread *deletedOn = nullptr;
    QObject::connect(view, &QObject::destroyed, [&deletedOn] { deletedOn = QThread::currentThread(); });
    Application mail = table->appAtRow(0);
    table->setApps({});
    std::thread([&mail] { mail.reset(); }).join();
    ASSERT_TRUE(QTest::qWaitFor([&view] { return view.isNull(); }));
    EXPECT_EQ(deletedOn, qApp->thread());
}

TEST_F(KAAppTableViewTest, TheApplicationsMayGoWhileTheDelegateIsAsked)
{
    show();
    const QPointer<KAAppTableRow> view = &row(0);
    delegate.whenAsked = [this] {
        delegate.toggled.clear();
        table->setApps({});
    };
    QTest::mouseClick(checkboxOf(*view), Qt::LeftButton);
    ASSERT_TRUE(QTest::qWaitFor([&view] { return view.isNull(); }));
}

TEST_F(KAAppTableViewTest, AViewThatIsDeletedFirstDoesNotHurt)
{
    show();
    const QPointer<KAAppTableRow> view = &row(0);
    delete table->view();
    EXPECT_TRUE(view);
    table->reloadTable();
    table->selectAllApps();
    EXPECT_TRUE(checkboxOf(*view)->isChecked());
}

TEST_F(KAAppTableViewTest, ScreenReadersFindRowsThatWereNeverInView)
{
    show();
    showMany(50);
    ASSERT_TRUE(showsAllRows());
    ASSERT_TRUE(row(49).visibleRegion().isEmpty());
    EXPECT_EQ(QAccessible::queryAccessibleInterface(checkboxOf(row(49)))->text(QAccessible::Name), "Application 49");
}

TEST_F(KAAppTableViewTest, ScreenReadersFindTheTableAndItsControls)
{
    show();
    EXPECT_EQ(scrollView()->widget()->accessibleName(), "Applications");
    QAccessibleInterface *const box = QAccessible::queryAccessibleInterface(checkboxOf(row(0)));
    ASSERT_TRUE(box);
    EXPECT_EQ(box->text(QAccessible::Name), "Letters (Zorbo Mail)");
    EXPECT_EQ(box->role(), QAccessible::CheckBox);
    QAccessibleInterface *ancestor = box;
    while (ancestor && ancestor->object() != scrollView()->widget())
        ancestor = ancestor->parent();
    EXPECT_TRUE(ancestor);
}

}  // namespace
