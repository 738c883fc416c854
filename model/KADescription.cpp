// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADescription.h>

#include <QtCore/QDateTime>
#include <QtCore/QObject>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariant>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAObject.h>

namespace {

const QString kNothing = QStringLiteral("(null)");

QString described(const QVariantMap &map)
{
    QString text = QStringLiteral("{");
    for (auto entry = map.begin(); entry != map.end(); ++entry)  // a map's keys are sorted
        text += QStringLiteral("%1 = %2; ").arg(entry.key(), KADescription(entry.value()));
    if (!map.isEmpty())
        text.chop(1);
    return text + u'}';
}

template <typename List> QString described(const List &list)
{
    QStringList parts;
    for (const auto &value : list)
        parts += KADescription(value);
    return u'(' + parts.join(QStringLiteral(", ")) + u')';
}

QString objectText(const char *className, const void *object)
{
    return QStringLiteral("<%1: 0x%2>")
        .arg(QString::fromUtf8(className), QString::number(reinterpret_cast<quintptr>(object), 16));
}

}  // namespace

QString KADescription(std::nullptr_t)
{
    return kNothing;
}

QString KADescription(const QString &text)
{
    return text.isNull() ? kNothing : text;
}

QString KADescription(const KAObject *object)
{
    return object ? object->description() : kNothing;
}

QString KADescription(const QObject *object)
{
    if (!object)
        return kNothing;
    if (const auto *described = dynamic_cast<const KAObject *>(object))
        return described->description();
    return objectText(object->metaObject()->className(), object);
}

QString KADescription(const QVariant &value)
{
    if (!value.isValid())
        return kNothing;
    const QMetaType type = value.metaType();
    switch (type.id()) {
    case QMetaType::QString:
        return KADescription(value.toString());
    case QMetaType::Bool:
        return value.toBool() ? QStringLiteral("1") : QStringLiteral("0");
    case QMetaType::QVariantMap:
        return described(value.toMap());
    case QMetaType::QVariantList:
        return described(value.toList());
    case QMetaType::QStringList:
        return described(value.toStringList());
    case QMetaType::QUrl:
        return value.toUrl().toString(QUrl::FullyEncoded);
    case QMetaType::QDateTime:
        return value.toDateTime().toUTC().toString(Qt::ISODate);
    default:
        break;
    }
    if (type.flags() & QMetaType::PointerToQObject)
        return KADescription(value.value<QObject *>());
    if (type == QMetaType::fromType<KAError>())
        return value.value<KAError>().description();
    if (type == QMetaType::fromType<QList<QVariantMap>>())
        return described(value.value<QList<QVariantMap>>());
    if (value.canConvert<QString>())
        return value.toString();
    return objectText(type.name(), value.constData());
}
