// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How a row of the application table looks: its texts, its pictures and the places of its controls.

#include <kavellaccounts/KAAppTableRow.h>

#include <algorithm>

#include <QtCore/QEvent>
#include <QtGui/QIcon>
#include <QtGui/QPainter>
#include <QtWidgets/QStyle>

#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>

#include "ui/library_text.h"
#include "ui/progress_spinner.h"
#include "ui/row_label.h"

namespace {

const QString kImageType = QStringLiteral("png");

constexpr int kRoomAboveName = 7;
constexpr int kRightMargin = 12;
constexpr int kDarkOutline = 150;  // per cent
const QColor kServiceColour = QColor::fromRgbF(0.6F, 0.6F, 0.6F);

/// The two pictures of the information button, read once for all rows and never released.
struct InfoButtonImages {
    QIcon plain, selected;
};

QIcon libraryIcon(const QString &name)
{
    QIcon icon;
    // Each size is named, so that the sharpest is taken on a screen of any density.
    for (const QString &density : {QString(), QStringLiteral("@2x"), QStringLiteral("@3x")}) {
        const QString path = KABundle::libraryBundle()->pathForResource(name + density, kImageType);
        if (!path.isNull())
            icon.addFile(path);
    }
    return icon;
}

const InfoButtonImages &infoButtonImages()
{
    static const auto *const images = new InfoButtonImages{libraryIcon(QStringLiteral("info-button")),
                                                           libraryIcon(QStringLiteral("info-button-selected"))};
    return *images;
}

}  // namespace

QString KAAppTableRow::nameToShow() const
{
    const std::shared_ptr<KAApplication> shown = application();
    return _appDisplayName.isEmpty() && shown ? shown->displayNameForData() : _appDisplayName;
}

QString KAAppTableRow::labelFor(const QString &name) const
{
    return _serviceDisplayName.isEmpty() ? name
                                         : kavell::libraryText("APP_ROW_LABEL_FORMAT").arg(name, _serviceDisplayName);
}

void KAAppTableRow::textsChanged()
{
    m_textsAreStale = true;
    // Screen readers ask for rows that were never drawn, too.
    showAccessibleTexts();
    if (isVisible())
        showTexts();
}

void KAAppTableRow::showTexts()
{
    m_textsAreStale = false;
    _appDisplayName = nameToShow();
    const QString label = labelFor(_appDisplayName);
    // From right to left the name's end need not be where the service is.
    if (_serviceDisplayName.isEmpty() || layoutDirection() == Qt::RightToLeft)
        _appNameField->setOneToneText(label);
    else
        _appNameField->setTwoToneText(label, _appDisplayName.size(), kServiceColour);
    _secondaryTextField->setText(_secondaryText.isNull() ? QStringLiteral("") : _secondaryText);
}

void KAAppTableRow::showAccessibleTexts()
{
    const std::shared_ptr<KAApplication> shown = application();
    QString label = labelFor(nameToShow());
    // What cannot be seen by its icon still has a name to be read out.
    if (label.isEmpty() && shown)
        label = shown->displayName();
    setAccessibleName(label);
    _checkbox->setAccessibleName(label);
    _checkbox->setAccessibleDescription(_secondaryText);
    _spinner->setAccessibleName(kavell::libraryText("APP_ROW_PROGRESS").arg(label));
    _infoButton->setAccessibleName(kavell::libraryText("APP_ROW_INFO").arg(label));
}

void KAAppTableRow::showIcon()
{
    if (m_iconImage.isNull()) {
        _icon->clear();
        return;
    }
    const qreal density = devicePixelRatioF();
    const QSize size = m_designed.value(_icon).size() * density;
    QImage scaled = m_iconImage.scaled(size, Qt::KeepAspectRatio, Qt::SmoothTransformation);
    scaled.setDevicePixelRatio(density);
    _icon->setPixmap(QPixmap::fromImage(scaled));
}

void KAAppTableRow::showInfoButtonImage()
{
    const InfoButtonImages &images = infoButtonImages();
    _infoButton->setIcon(m_isSelected ? images.selected : images.plain);
}

void KAAppTableRow::place(QWidget *control, const QRect &leftToRight) const
{
    control->setGeometry(QStyle::visualRect(layoutDirection(), rect(), leftToRight));
}

int KAAppTableRow::heightOf(const QLabel *field) const
{
    return std::max(m_designed.value(field).height(), field->fontMetrics().height());
}

void KAAppTableRow::placeControls()
{
    const int wider = width() - m_designedSize.width();
    const auto centred = [this](QRect place) {
        place.moveTop((height() - place.height()) / 2);
        return place;
    };
    for (QWidget *control :
         {static_cast<QWidget *>(_checkbox), static_cast<QWidget *>(_spinner), static_cast<QWidget *>(_icon)})
        place(control, centred(m_designed.value(control)));
    place(_infoButton, centred(m_designed.value(_infoButton).translated(wider, 0)));

    const auto stretched = [this, wider](const QLabel *field) {
        QRect place = m_designed.value(field).adjusted(0, 0, wider, 0);
        if (_infoButton->isHidden())
            place.setRight(width() - kRightMargin);
        place.setHeight(heightOf(field));
        return place;
    };
    const QRect name = centred(stretched(_appNameField));
    QRect secondary = stretched(_secondaryTextField);
    secondary.moveBottom(name.top() + kRoomAboveName - 1);
    place(_appNameField, name.translated(0, m_nameOffset));
    place(_secondaryTextField, secondary);
}

void KAAppTableRow::outlineCheckbox()
{
    // Styles draw a check box's outline darker than the window, which cannot be seen in a dark table.
    QPalette outlined = palette();
    const QColor base = outlined.color(QPalette::Base), text = outlined.color(QPalette::Text);
    if (base.lightness() < text.lightness())
        outlined.setColor(QPalette::Window, text.darker(kDarkOutline));
    _checkbox->setPalette(outlined);
}

QSize KAAppTableRow::sizeHint() const
{
    const int name = heightOf(_appNameField), secondary = heightOf(_secondaryTextField);
    // The name stands in the middle, and the secondary text ends where the name is once moved down.
    const int texts = name + 2 * std::max(secondary - kRoomAboveName, kRoomAboveName);
    return {m_designedSize.width(), std::max(m_designedSize.height(), texts)};
}

bool KAAppTableRow::event(QEvent *event)
{
    switch (event->type()) {
    case QEvent::PaletteChange:
    case QEvent::ParentChange:
        if (_checkbox)
            outlineCheckbox();
        break;
    case QEvent::LayoutDirectionChange:
    case QEvent::FontChange:
        if (_appNameField) {
            placeControls();
            textsChanged();
            updateGeometry();
        }
        break;
    default:
        break;
    }
    return QWidget::event(event);
}

void KAAppTableRow::paintEvent(QPaintEvent *event)
{
    if (m_textsAreStale)
        showTexts();
    // The row may have come to a screen of another density.
    if (!m_iconImage.isNull() && !qFuzzyCompare(_icon->pixmap().devicePixelRatio(), devicePixelRatioF()))
        showIcon();
    QWidget::paintEvent(event);
}

void KAAppTableRow::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    placeControls();
}
