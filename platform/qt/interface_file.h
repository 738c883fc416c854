// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An interface file: widgets laid out in Qt Designer and read at run time (NAME.ui). Whoever shows them takes its
// outlets by their object names and lets its own methods answer the buttons:
//
//     m_interface = kavell::InterfaceFile::load(bundle->pathForResource("Sheet", "ui"));
//     _okButton = m_interface->view<QPushButton>("okButton");
//     m_interface->connectActions(this);
//
// A button says which method it calls by the dynamic property "action", the method's name; the method is invokable and
// takes the button as QObject *. User-interface thread only.

#ifndef KAVELL_PLATFORM_QT_INTERFACE_FILE_H
#define KAVELL_PLATFORM_QT_INTERFACE_FILE_H

#include <memory>

#include <QtCore/QHash>
#include <QtCore/QList>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtWidgets/QWidget>

namespace kavell {

class InterfaceFile {
public:
    /// Makes the widgets of classes that are not the toolkit's own, by class name.
    using WidgetMakers = QHash<QString, QWidget *(*)(QWidget *parent)>;

    /// Reads a file; null when it is none, has a layout of a class that the toolkit does not know, or is larger or nested
    /// deeper than any interface, with a line in the log or, where `problem` is given, with the reason there. A null path is one that is missing.
    [[nodiscard]] static std::unique_ptr<InterfaceFile> load(const QString &path, QString *problem = nullptr,
                                                             const WidgetMakers &makers = {});

    /// Deletes all its widgets, those too that stand in another window meanwhile.
    ~InterfaceFile();
    InterfaceFile(const InterfaceFile &) = delete;
    InterfaceFile &operator=(const InterfaceFile &) = delete;

    /// The outermost widget, which has no parent until somebody shows it.
    [[nodiscard]] QWidget *root() const { return m_root; }

    /// Hands the outermost widget over to the caller; this object deletes nothing afterwards.
    [[nodiscard]] std::unique_ptr<QWidget> takeRoot();

    /// The widget of an object name; null when there is none, and, with a line in the log, when it is of another class.
    template <typename View> [[nodiscard]] View *view(const QString &name)
    {
        QWidget *const widget = widgetNamed(name);
        auto *const view = qobject_cast<View *>(widget);
        if (widget && !view)
            logOtherClass(widget, View::staticMetaObject.className());
        return view;
    }

    /// Points an outlet at the widget of an object name; leaves it when there is none. False, with a line in the log,
    /// when the widget is of another class.
    template <typename View> bool connectOutlet(QPointer<View> &outlet, const QString &name)
    {
        QWidget *const widget = widgetNamed(name);
        View *const found = widget ? view<View>(name) : nullptr;
        if (found)
            outlet = found;
        return !widget || found;
    }

    /// Lets the receiver answer the buttons that name an action. False, with a line in the log for each, when it has no
    /// such method.
    bool connectActions(QObject *receiver);

private:
    InterfaceFile(QString path, QWidget *root);
    [[nodiscard]] QWidget *widgetNamed(const QString &name);
    void logOtherClass(const QWidget *widget, const char *wanted) const;

    const QString m_path;
    QPointer<QWidget> m_root;
    QList<QPointer<QWidget>> m_taken;  // out of the outermost widget, perhaps
};

}  // namespace kavell

#endif
