// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How a row of the application table looks and is read out: texts, pictures, places and names for screen readers.

#include <kavellaccounts/KAAppTableRow.h>

#include <QtCore/QDir>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtGui/QHelpEvent>
#include <QtWidgets/QToolTip>

#include <kavellaccounts/KAImageExtras.h>

#include "tests/ui/app_table_fixture.h"

using namespace kavell::test;

namespace {

class KAAppTableRowDrawingTest : public AppTableRowTest {};

TEST_F(KAAppTableRowDrawingTest, TheIconShowsTheApplicationsImage)
{
    row->setApplication(mail);
    const QPixmap shown = controlOf<QLabel>(*row, "icon")->pixmap();
    const QImage expected = mail->image().scaled(shown.size(), Qt::KeepAspectRatio, Qt::SmoothTransformation);
    EXPECT_EQ(shown.toImage().convertToFormat(QImage::Format_ARGB32), expected.convertToFormat(QImage::Format_ARGB32));
}

TEST_F(KAAppTableRowDrawingTest, AnIconMadeForAScreenOfAnotherDensityIsMadeAnew)
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

TEST_F(KAAppTableRowDrawingTest, ADisabledRowsIconIsWashedOut)
{
    row->setApplication(mail);
    row->setDisableControls(true);
    const QPixmap shown = controlOf<QLabel>(*row, "icon")->pixmap();
    const QImage expected =
        KAExtras::disabledImage(mail->image()).scaled(shown.size(), Qt::KeepAspectRatio, Qt::SmoothTransformation);
    EXPECT_EQ(shown.toImage().convertToFormat(QImage::Format_ARGB32), expected.convertToFormat(QImage::Format_ARGB32));
}

TEST_F(KAAppTableRowDrawingTest, ResizingKeepsTheNameMovedAndTheTextsWide)
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

TEST_F(KAAppTableRowDrawingTest, ALargerFontMakesRoomForTheSecondaryText)
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

TEST_F(KAAppTableRowDrawingTest, TheTextsDoNotOverlap)
{
    row->setSecondaryText("Why not");
    EXPECT_LT(secondaryOf(*row)->geometry().bottom(), nameOf(*row)->geometry().top());
    EXPECT_TRUE(row->rect().contains(secondaryOf(*row)->geometry()));
    EXPECT_TRUE(row->rect().contains(nameOf(*row)->geometry()));
}

TEST_F(KAAppTableRowDrawingTest, TheCheckBoxIsOutlinedLightlyInADarkTheme)
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

TEST_F(KAAppTableRowDrawingTest, TheNameIsTheApplicationsThenTheServicesInGrey)
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

TEST_F(KAAppTableRowDrawingTest, TheServicesPartIsPaintedInItsGrey)
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

TEST_F(KAAppTableRowDrawingTest, FromRightToLeftTheNameHasOneColour)
{
    qApp->setLayoutDirection(Qt::RightToLeft);
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("Zorbo Mail");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "Letters (Zorbo Mail)");
    EXPECT_EQ(nameField()->secondToneIndex(), -1);
}

TEST_F(KAAppTableRowDrawingTest, FromRightToLeftTheControlsAreMirrored)
{
    const QRect icon = controlOf<QLabel>(*row, "icon")->geometry();
    qApp->setLayoutDirection(Qt::RightToLeft);
    EXPECT_EQ(controlOf<QLabel>(*row, "icon")->geometry().right(), row->width() - 1 - icon.left());
    EXPECT_GT(checkboxOf(*row)->x(), nameOf(*row)->x());
    EXPECT_LT(infoButtonOf(*row)->x(), nameOf(*row)->geometry().right());
}

TEST_F(KAAppTableRowDrawingTest, TheNameStandsWhereReadingBegins)
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

TEST_F(KAAppTableRowDrawingTest, ANameThatDoesNotFitIsToldByItsToolTip)
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

TEST_F(KAAppTableRowDrawingTest, WithoutAServiceTheNameIsPlain)
{
    row->setAppDisplayName("Letters");
    row->setServiceDisplayName("");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "Letters");
    EXPECT_EQ(nameField()->secondToneIndex(), -1);
}

TEST_F(KAAppTableRowDrawingTest, WithoutANameTheApplicationsDataNameIsTaken)
{
    row->setApplication(mail);
    row->setServiceDisplayName("Zorbo Mail");
    (void)drawn();
    EXPECT_EQ(row->appDisplayName(), "Mail");
    EXPECT_EQ(nameOf(*row)->text(), "Mail (Zorbo Mail)");
}

TEST_F(KAAppTableRowDrawingTest, NamesAreNeitherMarkupNorPlaceholders)
{
    row->setAppDisplayName("<b>Let%2ters</b>");
    row->setServiceDisplayName("<img src='x'>&amp; %1");
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "<b>Let%2ters</b> (<img src='x'>&amp; %1)");
    EXPECT_EQ(nameOf(*row)->textFormat(), Qt::PlainText);
    EXPECT_EQ(secondaryOf(*row)->textFormat(), Qt::PlainText);
}

TEST_F(KAAppTableRowDrawingTest, TheInformationButtonShowsWhetherTheRowIsSelected)
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

TEST_F(KAAppTableRowDrawingTest, PicturesExistForThreeDensities)
{
    for (const QString &name : {QStringLiteral("info-button"), QStringLiteral("info-button-selected")}) {
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + ".png").size(), QSize(16, 16));
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + "@2x.png").size(), QSize(32, 32));
        EXPECT_EQ(QImage(":/kavellaccounts/" + name + "@3x.png").size(), QSize(48, 48));
    }
}

TEST_F(KAAppTableRowDrawingTest, PicturesAreThoseThatTheirScriptDraws)
{
    const QTemporaryDir drawnAgain;
    const QString script = qEnvironmentVariable("KAVELL_SOURCE_DIR") + "/resources/make_info_buttons";
    ASSERT_EQ(QProcess::execute(script, {drawnAgain.path()}), 0);
    const QStringList files = QDir(drawnAgain.path()).entryList(QDir::Files);
    EXPECT_EQ(files.size(), 6);
    for (const QString &file : files)
        EXPECT_EQ(QImage(":/kavellaccounts/" + file), QImage(drawnAgain.filePath(file))) << file.toStdString();
}

TEST_F(KAAppTableRowDrawingTest, ControlsHaveNamesForScreenReaders)
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

TEST_F(KAAppTableRowDrawingTest, ScreenReadersFindTheNamesBeforeTheRowIsDrawn)
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

TEST_F(KAAppTableRowDrawingTest, AnApplicationNobodyHasAWordForIsReadOutByItsName)
{
    const Application other = KAApplication::initWithBundleID("com.example.other");
    other->setDisplayName("Other");
    row->setApplication(other);
    (void)drawn();
    EXPECT_EQ(nameOf(*row)->text(), "");
    EXPECT_EQ(checkboxOf(*row)->accessibleName(), "Other");
}

}  // namespace
