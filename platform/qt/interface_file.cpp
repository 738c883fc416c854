// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/interface_file.h"

#include <memory>
#include <optional>
#include <utility>

#include <QtCore/QBuffer>
#include <QtCore/QFile>
#include <QtCore/QMetaMethod>
#include <QtCore/QXmlStreamReader>
#include <QtUiTools/QUiLoader>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QLayout>

#include <kavellaccounts/KADescription.h>

#include "platform/qt/log.h"

namespace kavell {

namespace {

// More than any interface has, and far less than the toolkit's reader has stack for, which goes down by recursion.
constexpr int kDeepestElement = 200;
constexpr qint64 kLargestFile = 8 * 1024 * 1024;

/// Whether elements stand too deep in one another. What else may be wrong with a file the toolkit's reader says.
bool isTooDeep(const QByteArray &xml)
{
    QXmlStreamReader reader(xml);
    for (int depth = 0; depth <= kDeepestElement;) {
        switch (reader.readNext()) {
        case QXmlStreamReader::StartElement:
            ++depth;
            break;
        case QXmlStreamReader::EndElement:
            --depth;
            break;
        default:
            if (reader.atEnd())
                return false;
        }
    }
    return true;
}

/// Knows the reader's own classes of widgets besides the toolkit's, and sees to the layouts that the toolkit's reader does
/// not: one of no known class, which it would fill all the same, and one that it finds no place for, which it forgets.
class WidgetLoader : public QUiLoader {
public:
    explicit WidgetLoader(const InterfaceFile::WidgetMakers &makers) : m_makers(makers) {}
    ~WidgetLoader() override
    {
        for (const QPointer<QLayout> &layout : std::as_const(m_layouts)) {
            if (layout && !layout->parent())
                delete layout;
        }
    }

    QWidget *createWidget(const QString &className, QWidget *parent, const QString &name) override
    {
        const auto make = m_makers.value(className);
        if (!make)
            return QUiLoader::createWidget(className, parent, name);
        QWidget *const widget = make(parent);
        widget->setObjectName(name);
        return widget;
    }

    QLayout *createLayout(const QString &className, QObject *parent, const QString &name) override
    {
        QLayout *layout = QUiLoader::createLayout(className, parent, name);
        if (!layout) {
            if (!m_unknownLayout)
                m_unknownLayout = className;
            layout = QUiLoader::createLayout(QStringLiteral("QVBoxLayout"), parent, name);
        }
        m_layouts += layout;
        return layout;
    }

    /// The first class that a layout has and nobody knows; none when all are known.
    [[nodiscard]] const std::optional<QString> &unknownLayout() const { return m_unknownLayout; }

private:
    const InterfaceFile::WidgetMakers &m_makers;
    QList<QPointer<QLayout>> m_layouts;
    std::optional<QString> m_unknownLayout;
};

/// The outermost widget of a file; null, with the reason, when there is none.
QWidget *readWidgets(WidgetLoader &loader, const QString &path, QString &reason)
{
    QFile file(path);
    if (path.isEmpty() || !file.open(QIODevice::ReadOnly)) {
        reason = QStringLiteral("It cannot be opened.");
        return nullptr;
    }
    QByteArray xml = file.size() <= kLargestFile ? file.readAll() : QByteArray();
    if (file.size() > kLargestFile || isTooDeep(xml)) {
        reason = QStringLiteral("It is too large or nested too deeply.");
        return nullptr;
    }
    QBuffer buffer(&xml);
    std::unique_ptr<QWidget> root(loader.load(&buffer));
    reason = loader.errorString();
    if (const std::optional<QString> &unknown = loader.unknownLayout(); root && unknown) {
        reason = unknown->isEmpty() ? QStringLiteral("It has a layout without a class.")
                                    : QStringLiteral("It has a layout of an unknown class, %1.").arg(*unknown);
        return nullptr;
    }
    return root.release();
}

}  // namespace

std::unique_ptr<InterfaceFile> InterfaceFile::load(const QString &path, QString *problem, const WidgetMakers &makers)
{
    WidgetLoader loader(makers);
    QString reason;
    QWidget *const root = readWidgets(loader, path, reason);
    if (!root) {
        if (problem)
            *problem = reason;
        else
            log(QStringLiteral("*** Cannot read the interface file %1: %2").arg(KADescription(path), reason));
        return nullptr;
    }
    return std::unique_ptr<InterfaceFile>(new InterfaceFile(path, root));
}

InterfaceFile::InterfaceFile(QString path, QWidget *root) : m_path(std::move(path)), m_root(root)
{
}

InterfaceFile::~InterfaceFile()
{
    for (const QPointer<QWidget> &widget : std::as_const(m_taken))
        delete widget;
    delete m_root;
}

std::unique_ptr<QWidget> InterfaceFile::takeRoot()
{
    std::unique_ptr<QWidget> root(m_root);
    m_root.clear();
    m_taken.clear();
    return root;
}

bool InterfaceFile::connectActions(QObject *receiver)
{
    bool complete = true;
    const QList<QAbstractButton *> buttons = m_root->findChildren<QAbstractButton *>();
    for (QAbstractButton *button : buttons) {
        const QByteArray action = button->property("action").toByteArray();
        if (action.isEmpty())
            continue;
        const QMetaObject *const metaObject = receiver->metaObject();
        const QMetaMethod method = metaObject->method(metaObject->indexOfMethod(action + "(QObject*)"));
        if (!method.isValid()) {
            log(QStringLiteral("*** The interface file %1 names the action %2, which %3 does not have")
                    .arg(m_path, QString::fromUtf8(action), QString::fromLatin1(metaObject->className())));
            complete = false;
            continue;
        }
        QObject::connect(button, &QAbstractButton::clicked, receiver, [receiver, method, button] {
            method.invoke(receiver, Qt::DirectConnection, Q_ARG(QObject *, button));
        });
    }
    return complete;
}

QWidget *InterfaceFile::widgetNamed(const QString &name)
{
    for (const QPointer<QWidget> &widget : std::as_const(m_taken)) {
        if (widget && widget->objectName() == name)
            return widget;
    }
    QWidget *const widget = m_root->objectName() == name ? m_root.data() : m_root->findChild<QWidget *>(name);
    if (widget && widget != m_root)
        m_taken += widget;
    return widget;
}

void InterfaceFile::logOtherClass(const QWidget *widget, const char *wanted) const
{
    log(QStringLiteral("*** The interface file %1 has a %2 named %3 where a %4 is expected")
            .arg(m_path, QString::fromLatin1(widget->metaObject()->className()), widget->objectName(),
                 QString::fromLatin1(wanted)));
}

}  // namespace kavell
