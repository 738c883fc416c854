// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One row of the application table (KAAppTableController.h): a check box, an application's icon and name with the
// service that it uses, an optional line above it, a spinner in the check box's place while the application is being set
// up, and an optional information button. Its controls come from the library's interface file KAAppTableRow.ui.
//
// A row is owned by its application, whose user information keeps it under "rowView"; a table only shows it. The last
// reference may go on any thread: the row is deleted on the user-interface thread. Everything else belongs to that
// thread.

#ifndef KAVELLACCOUNTS_KAAPPTABLEROW_H
#define KAVELLACCOUNTS_KAAPPTABLEROW_H

#include <memory>

#include <QtCore/QHash>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtGui/QImage>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAAppTableController;
class KAApplication;

namespace kavell {
class RowLabel;
class InterfaceFile;
class ProgressSpinner;
}  // namespace kavell

class KAVELL_ACCOUNTS_EXPORT KAAppTableRow : public QWidget, public KAObject {
    Q_OBJECT

public:
    /// A row of its own, with information button and spinner on; null, with a line in the log, when the interface file
    /// cannot be read.
    [[nodiscard]] static std::shared_ptr<KAAppTableRow> createFromNib();

    ~KAAppTableRow() override;

    /// The application shown, which the row does not keep alive; null when there is none or it has gone.
    [[nodiscard]] std::shared_ptr<KAApplication> application() const;

    /// Shows another application: its icon, and the check box on exactly when it is enabled, without spinner. Where the
    /// row's controls are disabled, the application's enabled flag is cleared.
    void setApplication(const std::shared_ptr<KAApplication> &application);

    /// @name Texts. Without a name for the application the row takes the application's displayNameForData
    /// @{
    [[nodiscard]] QString serviceDisplayName() const;
    void setServiceDisplayName(const QString &serviceDisplayName);
    [[nodiscard]] QString appDisplayName() const;
    void setAppDisplayName(const QString &appDisplayName);

    /// The line above the name. Each text that is not empty moves the name 7 points down, and no text moves it back:
    /// a row that said something once keeps the place for it.
    [[nodiscard]] QString secondaryText() const;
    void setSecondaryText(const QString &secondaryText);
    /// @}

    /// The controller that is told of clicks; null when there is none or it has gone.
    [[nodiscard]] KAAppTableController *delegate() const;
    void setDelegate(KAAppTableController *delegate);

    [[nodiscard]] bool showInfoButton() const;
    void setShowInfoButton(bool showInfoButton);

    /// Whether the spinner starts when the user turns the check box on.
    [[nodiscard]] bool spinOnSelection() const;
    void setSpinOnSelection(bool spinOnSelection);

    /// Whether the application cannot be used. The first true greys the row out, clears its check box and the
    /// application's enabled flag; that is never undone, false later only lets the application be enabled again.
    [[nodiscard]] bool disableControls() const;
    void setDisableControls(bool disableControls);

    /// Whether the table has this row selected, which the information button shows.
    [[nodiscard]] bool isSelected() const;
    void setSelected(bool selected);

    void select();    ///< turns the check box on, unless the controls are disabled
    void deselect();  ///< turns the check box off

    /// Shows the spinner in place of the check box, and the other way round.
    void startSpinner();
    void stopSpinner();
    [[nodiscard]] bool isSpinning() const;

    /// @name Actions of the check box and of the information button; `sender` is the control, or null
    /// @{
    Q_INVOKABLE void checkboxClicked(QObject *sender);
    Q_INVOKABLE void appInfo(QObject *sender);
    /// @}

    /// Makes the controls agree with the application and the properties.
    void syncUI();

    [[nodiscard]] QSize sizeHint() const override;
    void describeFields(KAFieldList &fields) const override;

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    friend class KAAppTableRowLoader;
    class Action;
    explicit KAAppTableRow(QWidget *parent);
    static void letGo(KAAppTableRow *row);

    bool connectOutlets(kavell::InterfaceFile &interface);
    void greyOut();
    void showInfoButtonIf(bool isNeeded);
    void showIcon();
    void outlineCheckbox();
    void placeControls();
    [[nodiscard]] int heightOf(const QLabel *field) const;
    void place(QWidget *control, const QRect &leftToRight) const;
    [[nodiscard]] QString nameToShow() const;
    [[nodiscard]] QString labelFor(const QString &name) const;
    void textsChanged();
    void showTexts();
    void showAccessibleTexts();
    void showInfoButtonImage();

    QPointer<QCheckBox> _checkbox;
    QPointer<kavell::RowLabel> _appNameField;
    QPointer<kavell::RowLabel> _secondaryTextField;
    QPointer<QLabel> _icon;
    QPointer<kavell::ProgressSpinner> _spinner;
    QPointer<QAbstractButton> _infoButton;
    std::weak_ptr<KAApplication> _application;
    QString _serviceDisplayName;
    QString _appDisplayName;
    QString _secondaryText;
    QPointer<KAAppTableController> _delegate;
    bool _showInfoButton = true;
    bool _spinOnSelection = true;
    bool _disableControls = false;
    bool _controlsAreDisabled = false;

    QHash<const QWidget *, QRect>
        m_designed;  // the controls' places in the interface file, for a row of m_designedSize
    QSize m_designedSize;
    QImage m_iconImage;
    int m_nameOffset = 0;  // how far the secondary texts moved the name down
    int m_actions = 0;     // handlers that are running
    bool m_isSelected = false;
    bool m_textsAreStale = true;
};

#endif
