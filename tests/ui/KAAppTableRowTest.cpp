// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAppTableRow.h>

#include <gmock/gmock.h>

#include <QtCore/QAbstractEventDispatcher>
#include <QtCore/QDir>
#include <QtCore/QPointer>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtGui/QHelpEvent>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QToolTip>

#include <kavellaccounts/KAAppTableRowLoader.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAImageExtras.h>

#include "tests/support/log_capture.h"
#include "tests/ui/app_table_fixture.h"
#include "ui/progress_spinner.h"
#include "ui/row_label.h"

using namespace kavell::test;

namespace {

class KAAppTableRowTest : public testing::Test {
protected:
    ~KAAppTableRowTest() override { qApp->setLayoutDirection(Qt::LeftToRight); }

    [[nodiscard]] kavell::RowLabel *nameField() const { return controlOf<kavell::RowLabel>(*row, "appNameField"); }
    [[nodiscard]] bool hasInfoButton() const { return !infoButtonOf(*row)->isHidden(); }

    /// What of the row is painted when it is drawn.
    QImage drawn() const { return row->grab().toImage(); }

    std::shared_ptr<KAAppTableRow> row = KAAppTableRow::createFromNib();
    Application mail = KAApplication::initWithBundleID(kKAMailAppID);
};

TEST_F(KAAppTableRowTest, ANewRowShowsInformationButtonsAndSpins)
{
    EXPECT_TRUE(row->showInfoButton());
    EXPECT_TRUE(row->spinOnSelection());
    EXPECT_FALSE(row->disableControls());
    EXPECT_FALSE(row->isSpinning());
    EXPECT_EQ(row->application(), nullptr);
    EXPECT_EQ(row->delegate(), nullptr);
    EXPECT_TRUE(row->secondaryText().isNull());
}

TEST_F(KAAppTableRowTest, TheLoaderHasNoRowWhenTheFileCannotBeRead)
{
    const LogCapture log;
    KAAppTableRowLoader loader;
    EXPECT_FALSE(loader.loadNib("NoSuchRow"));
    EXPECT_EQ(loader.rowView(), nullptr);
    EXPECT_THAT(log.messages(), testing::SizeIs(1));
}

TEST_F(KAAppTableRowTest, TheLoaderTakesNoOtherInterfaceForARow)
{
    const LogCapture log;
    KAAppTableRowLoader loader;
    EXPECT_FALSE(loader.loadNib("AppTable"));
    EXPECT_EQ(loader.rowView(), nullptr);
    EXPECT_THAT(log.messages(), testing::SizeIs(1));
}

TEST_F(KAAppTableRowTest, TheLoadersRowIsAProperty)
{
    KAAppTableRowLoader loader;
    loader.setRowView(row);
    EXPECT_EQ(loader.rowView(), row);
    ASSERT_TRUE(loader.loadNib("KAAppTableRow"));
    EXPECT_NE(loader.rowView(), row);
    EXPECT_NE(loader.rowView(), nullptr);
}

TEST_F(KAAppTableRowTest, AnEnabledApplicationTurnsTheCheckBoxOn)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_EQ(row->application(), mail);
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    row->setApplication(KAApplication::initWithBundleID(kKAParlexAppID));
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, TheSameApplicationAgainChangesNothing)
{
    row->setApplication(mail);
    mail->setEnabled(true);
    row->startSpinner();
    row->setApplication(mail);
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_TRUE(row->isSpinning());
}

TEST_F(KAAppTableRowTest, AnotherApplicationDoesNotSpin)
{
    row->setApplication(mail);
    row->startSpinner();
    row->setApplication(KAApplication::initWithBundleID(kKAParlexAppID));
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, AnotherApplicationInADisabledRowIsDisabled)
{
    row->setDisableControls(true);
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_FALSE(mail->enabled());
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, TheIconShowsTheApplicationsImage)
{
    row->setApplication(mail);
    const QPixmap shown = controlOf<QLabel>(*row, "icon")->pixmap();
    const QImage expected = mail->image().scaled(shown.size(), Qt::KeepAspectRatio, Qt::SmoothTransformation);
    EXPECT_EQ(shown.toImage().convertToFormat(QImage::Format_ARGB32), expected.convertToFormat(QImage::Format_ARGB32));
}

TEST_F(KAAppTableRowTest, AnIconMadeForAScreenOfAnotherDensityIsMadeAnew)
{
    row->setApplication(mail);
    auto *const icon = controlOf<QLabel>(*row, "icon");
    const QImage expected = icon->pixmap().toImage();
    QPixmap otherScreens(64, 64);
    otherScreens.fill(Qt::red);
    otherScreens.setDevicePixelRatio(2 * row->devicePixelRatioF());
    icon->setPixmap(otherScreens);
    (void)drawn();
    EXPECT_EQ(icon->pixmap().toImage(), expected);
}

TEST_F(KAAppTableRowTest, ADisabledRowsIconIsWashedOut)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    const QPixmap shown = controlOf<QLabel>(*row, "icon")->pixmap();
    const QImage expected =
        KAExtras::disabledImage(mail->image()).scaled(shown.size(), Qt::KeepAspectRatio, Qt::SmoothTransformation);
    EXPECT_EQ(shown.toImage().convertToFormat(QImage::Format_ARGB32), expected.convertToFormat(QImage::Format_ARGB32));
}

TEST_F(KAAppTableRowTest, EachSecondaryTextMovesTheNameDownBySevenPoints)
{
    const int top = nameOf(*row)->y();
    row->setSecondaryText("One");
    EXPECT_EQ(nameOf(*row)->y(), top + 7);
    row->setSecondaryText("One");
    EXPECT_EQ(nameOf(*row)->y(), top + 14);
}

TEST_F(KAAppTableRowTest, ClearingTheSecondaryTextLeavesTheNameWhereItIs)
{
    const int top = nameOf(*row)->y();
    row->setSecondaryText("One");
    row->setSecondaryText("");
    row->setSecondaryText({});
    EXPECT_EQ(nameOf(*row)->y(), top + 7);
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, ResizingKeepsTheNameMovedAndTheTextsWide)
{
    (void)drawn();
    const int top = nameOf(*row)->y(), width = nameOf(*row)->width();
    row->setSecondaryText("One");
    row->resize(row->width() + 100, row->height() + 20);
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->y(), top + 7 + 10);
    EXPECT_EQ(nameOf(*row)->width(), width + 100);
    EXPECT_EQ(secondaryOf(*row)->width(), width + 100);
}

TEST_F(KAAppTableRowTest, ALargerFontMakesRoomForTheSecondaryText)
{
    const int height = row->sizeHint().height();
    QFont font = row->font();
    font.setPointSize(40);
    row->setFont(font);
    row->setSecondaryText("One");
    row->resize(row->sizeHint());
    (void)drawn();
    EXPECT_GT(row->height(), height);
    EXPECT_GE(secondaryOf(*row)->height(), secondaryOf(*row)->fontMetrics().height());
    EXPECT_TRUE(row->rect().contains(secondaryOf(*row)->geometry()));
    EXPECT_TRUE(row->rect().contains(nameOf(*row)->geometry()));
}

TEST_F(KAAppTableRowTest, TheSecondaryTextIsHiddenWhileItIsEmpty)
{
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
    row->setSecondaryText("Why not");
    (void)drawn();
    EXPECT_FALSE(secondaryOf(*row)->isHidden());
    EXPECT_EQ(secondaryOf(*row)->text(), "Why not");
    row->setSecondaryText({});
    (void)drawn();
    EXPECT_TRUE(secondaryOf(*row)->isHidden());
    EXPECT_EQ(secondaryOf(*row)->text(), "");
}

TEST_F(KAAppTableRowTest, TheTextsDoNotOverlap)
{
    row->setSecondaryText("Why not");
    EXPECT_LT(secondaryOf(*row)->geometry().bottom(), nameOf(*row)->geometry().top());
    EXPECT_TRUE(row->rect().contains(secondaryOf(*row)->geometry()));
    EXPECT_TRUE(row->rect().contains(nameOf(*row)->geometry()));
}

TEST_F(KAAppTableRowTest, SelectingTurnsTheCheckBoxOnAndDeselectingOff)
{
    row->setApplication(mail);
    row->select();
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(mail->enabled());
    row->deselect();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, ADisabledRowCannotBeSelected)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    row->select();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableRowTest, TheSpinnerTakesTheCheckBoxsPlace)
{
    row->startSpinner();
    EXPECT_TRUE(row->isSpinning());
    EXPECT_TRUE(checkboxOf(*row)->isHidden());
    EXPECT_TRUE(controlOf<kavell::ProgressSpinner>(*row, "spinner")->isAnimating());
    EXPECT_EQ(spinnerOf(*row)->geometry(), checkboxOf(*row)->geometry());
    row->stopSpinner();
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
    EXPECT_FALSE(controlOf<kavell::ProgressSpinner>(*row, "spinner")->isAnimating());
}

TEST_F(KAAppTableRowTest, TheSpinnerTurnsOnlyWhileItIsSeen)
{
    const auto isTurning = [this] {
        return !QAbstractEventDispatcher::instance()->registeredTimers(spinnerOf(*row)).isEmpty();
    };
    row->startSpinner();
    EXPECT_FALSE(isTurning());
    row->show();
    EXPECT_TRUE(isTurning());
    const QImage before = spinnerOf(*row)->grab().toImage();
    EXPECT_TRUE(QTest::qWaitFor([&] { return spinnerOf(*row)->grab().toImage() != before; }));
    row->hide();
    EXPECT_FALSE(isTurning());
    row->show();
    row->stopSpinner();
    EXPECT_FALSE(isTurning());
}

TEST_F(KAAppTableRowTest, ASpinnerWithTheFocusShowsIt)
{
    row->show();
    row->startSpinner();
    ASSERT_TRUE(QTest::qWaitForWindowActive(row.get()));
    controlOf<kavell::ProgressSpinner>(*row, "spinner")->stopAnimation();
    const QImage before = spinnerOf(*row)->grab().toImage();
    QTest::keyClick(row.get(), Qt::Key_Tab);
    ASSERT_TRUE(spinnerOf(*row)->hasFocus());
    EXPECT_NE(spinnerOf(*row)->grab().toImage(), before);
}

TEST_F(KAAppTableRowTest, TheInformationButtonIsForAnEnabledApplicationThatDoesNotSpin)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    EXPECT_TRUE(hasInfoButton());
    row->startSpinner();
    EXPECT_FALSE(hasInfoButton());
    row->stopSpinner();
    EXPECT_TRUE(hasInfoButton());
    row->setShowInfoButton(false);
    EXPECT_FALSE(hasInfoButton());
    row->setShowInfoButton(true);
    mail->setEnabled(false);
    row->syncUI();
    EXPECT_FALSE(hasInfoButton());
}

TEST_F(KAAppTableRowTest, DisablingGreysTheRowOut)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    row->setDisableControls(true);
    EXPECT_FALSE(mail->enabled());
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(checkboxOf(*row)->isEnabled());
    EXPECT_FALSE(hasInfoButton());
    EXPECT_EQ(nameOf(*row)->palette().color(nameOf(*row)->foregroundRole()), QColor(Qt::gray));
}

TEST_F(KAAppTableRowTest, TheCheckBoxIsOutlinedLightlyInADarkTheme)
{
    const auto outline = [this] {
        return checkboxOf(*row)->palette().color(QPalette::Window);
    };
    const QColor light = outline();
    EXPECT_EQ(light, row->palette().color(QPalette::Window));
    QPalette dark = row->palette();
    dark.setColor(QPalette::Base, QColor(30, 30, 30));
    dark.setColor(QPalette::Window, QColor(40, 40, 40));
    dark.setColor(QPalette::Text, QColor(240, 240, 240));
    row->setPalette(dark);
    EXPECT_GT(outline().lightness(), 120);
}

TEST_F(KAAppTableRowTest, GreyingOutHappensOnceAndIsNeverUndone)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    const QImage icon = controlOf<QLabel>(*row, "icon")->pixmap().toImage();
    row->setDisableControls(false);
    EXPECT_FALSE(checkboxOf(*row)->isEnabled());
    EXPECT_EQ(nameOf(*row)->palette().color(nameOf(*row)->foregroundRole()), QColor(Qt::gray));
    mail->setEnabled(true);
    row->setDisableControls(true);
    EXPECT_TRUE(mail->enabled());
    EXPECT_EQ(controlOf<QLabel>(*row, "icon")->pixmap().toImage(), icon);
}

TEST_F(KAAppTableRowTest, TheNameIsTheApplicationsThenTheServicesInGrey)
{
    row->setApplication(mail);
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("Zorbo Mail");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "Letters (Zorbo Mail)");
    EXPECT_EQ(nameField()->secondToneIndex(), 7);
    EXPECT_EQ(nameField()->secondTone(), QColor::fromRgbF(0.6F, 0.6F, 0.6F));
    EXPECT_EQ(nameOf(*row)->font().pointSize(), 13);
}

TEST_F(KAAppTableRowTest, TheServicesPartIsPaintedInItsGrey)
{
    row->setAppDisplayName(QString(u' '));
    row->setServiceDisplayName(QString(8, QChar(0x2588)));  // full blocks
    row->resize(600, 48);
    const QImage picture = drawn();
    const QPoint middle = nameOf(*row)->geometry().center();
    bool isPainted = false;
    for (int x = nameOf(*row)->x(); x < row->width() && !isPainted; ++x)
        isPainted = picture.pixelColor(x, middle.y()) == QColor::fromRgbF(0.6F, 0.6F, 0.6F);
    EXPECT_TRUE(isPainted);
}

TEST_F(KAAppTableRowTest, FromRightToLeftTheNameHasOneColour)
{
    qApp->setLayoutDirection(Qt::RightToLeft);
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("Zorbo Mail");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "Letters (Zorbo Mail)");
    EXPECT_EQ(nameField()->secondToneIndex(), -1);
}

TEST_F(KAAppTableRowTest, FromRightToLeftTheControlsAreMirrored)
{
    const QRect icon = controlOf<QLabel>(*row, "icon")->geometry();
    qApp->setLayoutDirection(Qt::RightToLeft);
    EXPECT_EQ(controlOf<QLabel>(*row, "icon")->geometry().right(), row->width() - 1 - icon.left());
    EXPECT_GT(checkboxOf(*row)->x(), nameOf(*row)->x());
    EXPECT_LT(infoButtonOf(*row)->x(), nameOf(*row)->geometry().right());
}

TEST_F(KAAppTableRowTest, TheNameStandsWhereReadingBegins)
{
    row->setAppDisplayName(QString(2, QChar(0x2588)));  // full blocks
    row->resize(600, 48);
    const auto inked = [this](int x) {
        const QImage picture = nameOf(*row)->grab().toImage();
        const QPoint middle = picture.rect().center();
        return picture.pixelColor(x, middle.y()) != picture.pixelColor(middle);
    };
    (void)drawn();
    const int width = nameOf(*row)->width();
    EXPECT_TRUE(inked(5));
    EXPECT_FALSE(inked(width - 5));
    qApp->setLayoutDirection(Qt::RightToLeft);
    (void)drawn();
    EXPECT_FALSE(inked(5));
    EXPECT_TRUE(inked(width - 5));
}

TEST_F(KAAppTableRowTest, ANameThatDoesNotFitIsToldByItsToolTip)
{
    const auto toolTip = [this] {
        QToolTip::hideText();
        QHelpEvent asked(QEvent::ToolTip, {}, nameOf(*row)->mapToGlobal(QPoint()));
        QApplication::sendEvent(nameOf(*row), &asked);
        return QToolTip::text();
    };
    row->setAppDisplayName("<b>Letters</b>");
    (void)drawn();
    EXPECT_EQ(toolTip(), "");
    row->setAppDisplayName("<b>Letters</b>" + QString(100, u'x'));
    (void)drawn();
    EXPECT_EQ(toolTip(), "<p>&lt;b&gt;Letters&lt;/b&gt;" + QString(100, u'x') + "</p>");
    QToolTip::hideText();
}

TEST_F(KAAppTableRowTest, WithoutAServiceTheNameIsPlain)
{
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "Letters");
    EXPECT_EQ(nameField()->secondToneIndex(), -1);
}

TEST_F(KAAppTableRowTest, WithoutANameTheApplicationsDataNameIsTaken)
{
    row->setApplication(mail);
    row->setServiceDisplayName("Zorbo Mail");
    (void)drawn();
    EXPECT_EQ(row->appDisplayName(), "Mail");
    EXPECT_EQ(nameOf(*row)->text(), "Mail (Zorbo Mail)");
}

TEST_F(KAAppTableRowTest, NamesAreNeitherMarkupNorPlaceholders)
{
    row->setAppDisplayName("<b>Let%2ters</b>");
    row->setServiceDisplayName("<img src='x'>&amp; %1");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "<b>Let%2ters</b> (<img src='x'>&amp; %1)");
    EXPECT_EQ(nameOf(*row)->textFormat(), Qt::PlainText);
    EXPECT_EQ(secondaryOf(*row)->textFormat(), Qt::PlainText);
}

TEST_F(KAAppTableRowTest, TheInformationButtonShowsWhetherTheRowIsSelected)
{
    // Left of the letter a ring is empty and a disc is filled.
    const auto colour = [&] {
        return infoButtonOf(*row)->icon().pixmap({16, 16}, 1.0).toImage().pixelColor(4, 8);
    };
    EXPECT_EQ(colour().alpha(), 0);
    row->setSelected(true);
    EXPECT_TRUE(row->isSelected());
    EXPECT_EQ(colour(), QColor(33, 112, 206));
    row->setSelected(false);
    EXPECT_EQ(colour().alpha(), 0);
}

TEST_F(KAAppTableRowTest, PicturesExistForThreeDensities)
{
    for (const QString &name : {QStringLiteral("info-button"), QStringLiteral("info-button-selected")}) {
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + ".png").size(), QSize(16, 16));
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + "@2x.png").size(), QSize(32, 32));
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + "@3x.png").size(), QSize(48, 48));
    }
}

TEST_F(KAAppTableRowTest, PicturesAreThoseThatTheirScriptDraws)
{
    const QTemporaryDir drawnAgain;
    const QString script = qEnvironmentVariable("KAVELL_SOURCE_DIR") + "/resources/make_info_buttons";
    ASSERT_EQ(QProcess::execute(script, {drawnAgain.path()}), 0);
    const QStringList files = QDir(drawnAgain.path()).entryList(QDir::Files);
    EXPECT_EQ(files.size(), 6);
    for (const QString &file : files)
        EXPECT_EQ(QImage(":/kavellaccounts/" + file), QImage(drawnAgain.filePath(file))) << file.toStdString();
}

TEST_F(KAAppTableRowTest, ControlsHaveNamesForScreenReaders)
{
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("Zorbo Mail");
    row->setSecondaryText("Why not");
    (void)drawn();
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Letters (Zorbo Mail)");
    EXPECT_EQ(checkboxOf(*row)->accessibleDescription(), "Why not");
    EXPECT_EQ(infoButtonOf(*row)->accessibleName(), "Information about Letters (Zorbo Mail)");
    EXPECT_EQ(spinnerOf(*row)->accessibleName(), "Setting up Letters (Zorbo Mail)");
}

TEST_F(KAAppTableRowTest, ScreenReadersFindTheNamesBeforeTheRowIsDrawn)
{
    row->setApplication(mail);
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Mail");
    EXPECT_TRUE(row->appDisplayName().isNull());
    row->setServiceDisplayName("Zorbo Mail");
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Mail (Zorbo Mail)");
    row->setAppDisplayName("Letters");
    row->setSecondaryText("Why not");
    EXPECT_EQ(row->accessibleName(), "Letters (Zorbo Mail)");
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Letters (Zorbo Mail)");
    EXPECT_EQ(checkboxOf(*row)->accessibleDescription(), "Why not");
    EXPECT_EQ(infoButtonOf(*row)->accessibleName(), "Information about Letters (Zorbo Mail)");
    EXPECT_EQ(spinnerOf(*row)->accessibleName(), "Setting up Letters (Zorbo Mail)");
}

TEST_F(KAAppTableRowTest, AnApplicationNobodyHasAWordForIsReadOutByItsName)
{
    const Application other = KAApplication::initWithBundleID("com.example.other");
    other->setDisplayName("Other");
    row->setApplication(other);
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "");
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Other");
}

TEST_F(KAAppTableRowTest, WithoutADelegateAClickOnlyStartsTheSpinner)
{
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_TRUE(row->isSpinning());
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(mail->enabled());
    row->appInfo(nullptr);
}

TEST_F(KAAppTableRowTest, ARowThatDoesNotSpinOnSelectionKeepsItsCheckBox)
{
    row->setSpinOnSelection(false);
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_FALSE(row->isSpinning());
    EXPECT_FALSE(checkboxOf(*row)->isHidden());
}

TEST_F(KAAppTableRowTest, ACheckBoxTurnedOffStartsNoSpinner)
{
    mail->setEnabled(true);
    row->setApplication(mail);
    checkboxOf(*row)->click();
    EXPECT_FALSE(checkboxOf(*row)->isChecked());
    EXPECT_FALSE(row->isSpinning());
}

TEST_F(KAAppTableRowTest, TheRowDoesNotKeepItsApplication)
{
    const std::weak_ptr<KAApplication> seen = mail;
    row->setApplication(mail);
    mail.reset();
    EXPECT_TRUE(seen.expired());
    EXPECT_EQ(row->application(), nullptr);
    checkboxOf(*row)->click();
    row->syncUI();
    (void)drawn();
}

TEST_F(KAAppTableRowTest, FieldsAreListedInTheirOrder)
{
    KAFieldList list;
    row->describeFields(list);
    QStringList names;
    for (const KAField &field : list.fields())
        names += field.name + ' ' + field.encoding;
    EXPECT_THAT(names, testing::ElementsAre("_checkbox @\"QCheckBox\"", "_appNameField @\"kavell::RowLabel\"",
                                            "_secondaryTextField @\"kavell::RowLabel\"", "_icon @\"QLabel\"",
                                            "_spinner @\"kavell::ProgressSpinner\"", "_infoButton @\"QAbstractButton\"",
                                            "_application @\"KAApplication\"", "_serviceDisplayName @\"QString\"",
                                            "_appDisplayName @\"QString\"", "_secondaryText @\"QString\"",
                                            "_delegate @\"KAAppTableController\"", "_showInfoButton c",
                                            "_spinOnSelection c", "_disableControls c", "_controlsAreDisabled c"));
}

TEST_F(KAAppTableRowTest, TheLoadersFieldIsItsRow)
{
    KAFieldList list;
    KAAppTableRowLoader().describeFields(list);
    ASSERT_EQ(list.fields().size(), 1U);
    EXPECT_EQ(list.fields().front().name, "_rowView");
}

}  // namespace
