// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The base of the classes that stand behind one view: it reads the view from an interface file, made in Qt Designer, and
// owns it. The widgets that a subclass works with, its outlets, are taken by their object names; a button whose dynamic
// property "action" names an invokable method of the controller that takes a QObject * calls that method. User-interface
// thread only.

#ifndef KAVELLACCOUNTS_KAVIEWCONTROLLER_H
#define KAVELLACCOUNTS_KAVIEWCONTROLLER_H

#include <memory>

#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtWidgets/QWidget>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KABundle;

namespace kavell {
class InterfaceFile;
}  // namespace kavell

class KAVELL_ACCOUNTS_EXPORT KAViewController : public QObject, public KAObject {
    Q_OBJECT

public:
    /// Deletes the view, wherever it is shown.
    ~KAViewController() override;

    /// The view, which belongs to this controller and has no parent until somebody shows it; null when the interface
    /// file could not be read.
    [[nodiscard]] virtual QWidget *view();

protected:
    KAViewController();

    /// Reads NAME.ui among the bundle's resources (null: the library's own) and connects its buttons with this object.
    /// False, with "*** Couldn't load nib NAME" in the log, when that fails; there is no view then.
    bool loadInterface(const QString &name, const std::shared_ptr<KABundle> &bundle);

    /// The widget of an object name; null, with a line in the log, when there is none of that name and class, and null
    /// without an interface. It belongs to the view.
    template <typename View> [[nodiscard]] View *outlet(const QString &name) const
    {
        return qobject_cast<View *>(widgetNamed(name, View::staticMetaObject));
    }

private:
    [[nodiscard]] QWidget *widgetNamed(const QString &name, const QMetaObject &wanted) const;

    std::unique_ptr<kavell::InterfaceFile> m_interface;
};

#endif
