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

#include "ui/app_name_label.h"
#include "ui/progress_spinner.h"

namespace {

const QString kImageType = QStringLiteral("png");

constexpr int kRoomAboveName = 7;
constexpr float kServiceWhite = 0.6F;

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

QString libraryText(const char *key)
{
    return KABundle::libraryBundle()->localizedString(QString::fromLatin1(key));
}

}  // namespace

void KAAppTableRow::textsChanged()
{
    m_textsAreStale = true;
    if (isVisible())
        showTexts();
}

void KAAppTableRow::showTexts()
{
    m_textsAreStale = false;
    const std::shared_ptr<KAApplication> shown = application();
    if (_appDisplayName.isEmpty() && shown)
        _appDisplayName = shown->displayNameForData();
    if (_serviceDisplayName.isEmpty()) {
        _appNameField->setTwoToneText(_appDisplayName, -1, {});
    } else {
        const QString format = libraryText("APP_ROW_LABEL_FORMAT");
        const bool isTwoTone = layoutDirection() == Qt::LeftToRight;
        _appNameField->setTwoToneText(format.arg(_appDisplayName, _serviceDisplayName),
                                      isTwoTone ? _appDisplayName.size() : -1,
                                      QColor::fromRgbF(kServiceWhite, kServiceWhite, kServiceWhite));
    }
    _secondaryTextField->setText(_secondaryText.isNull() ? QStringLiteral("") : _secondaryText);

    _checkbox->setAccessibleName(_appNameField->text());
    _checkbox->setAccessibleDescription(_secondaryText);
    _spinner->setAccessibleName(_appNameField->text());
    _infoButton->setAccessibleName(_appNameField->text());
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

    QRect name = m_designed.value(_appNameField).adjusted(0, 0, wider, 0);
    name.setHeight(std::max(name.height(), _appNameField->fontMetrics().height()));
    name = centred(name);
    QRect secondary = m_designed.value(_secondaryTextField).adjusted(0, 0, wider, 0);
    secondary.setHeight(std::max(secondary.height(), _secondaryTextField->fontMetrics().height()));
    secondary.moveBottom(name.top() + kRoomAboveName - 1);
    place(_appNameField, name.translated(0, m_nameOffset));
    place(_secondaryTextField, secondary);
}

QSize KAAppTableRow::sizeHint() const
{
    const int texts =
        _appNameField->fontMetrics().height() + _secondaryTextField->fontMetrics().height() + 2 * kRoomAboveName;
    return {m_designedSize.width(), std::max(m_designedSize.height(), texts)};
}

bool KAAppTableRow::event(QEvent *event)
{
    switch (event->type()) {
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
    QWidget::paintEvent(event);
}

void KAAppTableRow::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    placeControls();
}
