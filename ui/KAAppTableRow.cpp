// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAppTableRow.h>

#include <QtCore/QEvent>
#include <QtCore/QThread>

#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRowLoader.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAImageExtras.h>

#include "platform/qt/interface_file.h"
#include "ui/progress_spinner.h"
#include "ui/row_label.h"

namespace {

const QString kInterfaceName = QStringLiteral("KAAppTableRow");
constexpr int kNameStep = 7;

}  // namespace

/// Stands for a handler that runs: a row whose last reference goes meanwhile is deleted after it.
class KAAppTableRow::Action {
public:
    explicit Action(KAAppTableRow &row) : m_row(row) { ++m_row.m_actions; }
    ~Action() { --m_row.m_actions; }
    Action(const Action &) = delete;
    Action &operator=(const Action &) = delete;

private:
    KAAppTableRow &m_row;
};

std::shared_ptr<KAAppTableRow> KAAppTableRow::createFromNib()
{
    KAAppTableRowLoader loader;
    loader.loadNib(kInterfaceName);
    return loader.rowView();
}

KAAppTableRow::KAAppTableRow(QWidget *parent) : QWidget(parent)
{
}

KAAppTableRow::~KAAppTableRow() = default;

void KAAppTableRow::letGo(KAAppTableRow *row)
{
    if (QThread::currentThread() == row->thread() && row->m_actions == 0)
        delete row;
    else
        row->deleteLater();
}

bool KAAppTableRow::connectOutlets(kavell::InterfaceFile &interface)
{
    _checkbox = interface.view<QCheckBox>(QStringLiteral("checkbox"));
    _appNameField = interface.view<kavell::RowLabel>(QStringLiteral("appNameField"));
    _secondaryTextField = interface.view<kavell::RowLabel>(QStringLiteral("secondaryTextField"));
    _icon = interface.view<QLabel>(QStringLiteral("icon"));
    _spinner = interface.view<kavell::ProgressSpinner>(QStringLiteral("spinner"));
    _infoButton = interface.view<QAbstractButton>(QStringLiteral("infoButton"));
    if (!_checkbox || !_appNameField || !_secondaryTextField || !_icon || !_spinner || !_infoButton)
        return false;
    m_designedSize = size();
    for (const QWidget *control : {static_cast<QWidget *>(_checkbox), static_cast<QWidget *>(_appNameField),
                                   static_cast<QWidget *>(_secondaryTextField), static_cast<QWidget *>(_icon),
                                   static_cast<QWidget *>(_spinner), static_cast<QWidget *>(_infoButton)})
        m_designed.insert(control, control->geometry());
    showInfoButtonImage();
    placeControls();
    return interface.connectActions(this);
}

std::shared_ptr<KAApplication> KAAppTableRow::application() const
{
    return _application.lock();
}

void KAAppTableRow::setApplication(const std::shared_ptr<KAApplication> &application)
{
    if (application == _application.lock())
        return;
    _application = application;
    if (application && _disableControls)
        application->setEnabled(false);
    m_iconImage = application ? application->image() : QImage();
    showIcon();
    _checkbox->setChecked(application && application->enabled());
    _spinner->stopAnimation();
    _spinner->hide();
    _checkbox->show();
    textsChanged();
    syncUI();
}

QString KAAppTableRow::serviceDisplayName() const
{
    return _serviceDisplayName;
}

void KAAppTableRow::setServiceDisplayName(const QString &serviceDisplayName)
{
    _serviceDisplayName = serviceDisplayName;
    textsChanged();
}

QString KAAppTableRow::appDisplayName() const
{
    return _appDisplayName;
}

void KAAppTableRow::setAppDisplayName(const QString &appDisplayName)
{
    _appDisplayName = appDisplayName;
    textsChanged();
}

QString KAAppTableRow::secondaryText() const
{
    return _secondaryText;
}

void KAAppTableRow::setSecondaryText(const QString &secondaryText)
{
    _secondaryText = secondaryText;
    if (!secondaryText.isEmpty()) {
        m_nameOffset += kNameStep;
        placeControls();
    }
    textsChanged();
    syncUI();
}

KAAppTableController *KAAppTableRow::delegate() const
{
    return _delegate;
}

void KAAppTableRow::setDelegate(KAAppTableController *delegate)
{
    _delegate = delegate;
}

bool KAAppTableRow::showInfoButton() const
{
    return _showInfoButton;
}

void KAAppTableRow::setShowInfoButton(bool showInfoButton)
{
    _showInfoButton = showInfoButton;
    syncUI();
}

bool KAAppTableRow::spinOnSelection() const
{
    return _spinOnSelection;
}

void KAAppTableRow::setSpinOnSelection(bool spinOnSelection)
{
    _spinOnSelection = spinOnSelection;
}

bool KAAppTableRow::disableControls() const
{
    return _disableControls;
}

void KAAppTableRow::setDisableControls(bool disableControls)
{
    _disableControls = disableControls;
    syncUI();
}

bool KAAppTableRow::isSelected() const
{
    return m_isSelected;
}

void KAAppTableRow::setSelected(bool selected)
{
    m_isSelected = selected;
    showInfoButtonImage();
}

void KAAppTableRow::select()
{
    if (!_disableControls)
        _checkbox->setChecked(true);
    syncUI();
}

void KAAppTableRow::deselect()
{
    _checkbox->setChecked(false);
    syncUI();
}

void KAAppTableRow::startSpinner()
{
    _spinner->show();
    _spinner->startAnimation();
    // The focus stays in the row; a hidden control hands it to whatever the Tab key finds next.
    if (_checkbox->hasFocus())
        _spinner->setFocus();
    _checkbox->hide();
    syncUI();
}

void KAAppTableRow::stopSpinner()
{
    _spinner->stopAnimation();
    _checkbox->show();
    if (_spinner->hasFocus())
        _checkbox->setFocus();
    _spinner->hide();
    syncUI();
}

bool KAAppTableRow::isSpinning() const
{
    return !_spinner->isHidden();
}

void KAAppTableRow::checkboxClicked(QObject *)
{
    const Action action(*this);
    if (_spinOnSelection && _checkbox->isChecked())
        startSpinner();
    if (_delegate)
        _delegate->checkboxClickedForApp(_checkbox, application());
    syncUI();
}

void KAAppTableRow::appInfo(QObject *)
{
    const Action action(*this);
    if (_delegate)
        _delegate->infoButtonClickedForApp(application());
}

void KAAppTableRow::syncUI()
{
    const std::shared_ptr<KAApplication> shown = application();
    showInfoButtonIf(_showInfoButton && !isSpinning() && shown && shown->enabled());
    _secondaryTextField->setVisible(!_secondaryText.isEmpty());
    if (_disableControls && !_controlsAreDisabled)
        greyOut();
}

void KAAppTableRow::showInfoButtonIf(bool isNeeded)
{
    if (_infoButton->isHidden() == !isNeeded)
        return;
    _infoButton->setVisible(isNeeded);
    placeControls();  // the texts reach as far as there is room
}

void KAAppTableRow::greyOut()
{
    _controlsAreDisabled = true;
    if (const std::shared_ptr<KAApplication> shown = application())
        shown->setEnabled(false);
    QPalette grey = _appNameField->palette();
    for (const QPalette::ColorRole role : {QPalette::WindowText, QPalette::Text})  // the table decides which
        grey.setColor(role, Qt::gray);
    _appNameField->setPalette(grey);
    _checkbox->setChecked(false);
    _checkbox->setEnabled(false);
    showInfoButtonIf(false);
    m_iconImage = KAExtras::disabledImage(m_iconImage);
    showIcon();
}

void KAAppTableRow::describeFields(KAFieldList &fields) const
{
    fields.add("_checkbox", _checkbox);
    fields.add("_appNameField", _appNameField);
    fields.add("_secondaryTextField", _secondaryTextField);
    fields.add("_icon", _icon);
    fields.add("_spinner", _spinner);
    fields.add("_infoButton", _infoButton);
    fields.add("_application", application());
    fields.add("_serviceDisplayName", _serviceDisplayName);
    fields.add("_appDisplayName", _appDisplayName);
    fields.add("_secondaryText", _secondaryText);
    fields.add("_delegate", _delegate);
    fields.add("_showInfoButton", _showInfoButton);
    fields.add("_spinOnSelection", _spinOnSelection);
    fields.add("_disableControls", _disableControls);
    fields.add("_controlsAreDisabled", _controlsAreDisabled);
    KAObject::describeFields(fields);
}
