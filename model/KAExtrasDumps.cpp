// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAExtras.h>

#include <QtCore/QMetaProperty>

#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAFieldList.h>

namespace KAExtras {

namespace {

const QString kMask = QStringLiteral("***");

bool namesPassword(const QString &field)
{
    return field.compare(QLatin1String("password"), Qt::CaseInsensitive) == 0 ||
           field.compare(QLatin1String("_password"), Qt::CaseInsensitive) == 0;
}

QString dump(const KAFieldList &fields, bool showPasswords)
{
    QString text;
    for (const KAField &field : fields.fields()) {
        const bool masked = !showPasswords && namesPassword(field.name);
        text += QStringLiteral("\t%1 <%2, 0x%3>: %4\n")
                    .arg(field.name, field.encoding, QString::number(reinterpret_cast<quintptr>(field.pointer), 16),
                         masked ? kMask : field.value);
    }
    return text;
}

/// The properties that a class itself declares, then those of its base classes.
void addProperties(const QObject *object, const QMetaObject *type, KAFieldList &fields)
{
    for (; type; type = type->superClass()) {
        for (int index = type->propertyOffset(); index < type->propertyCount(); ++index) {
            const QMetaProperty property = type->property(index);
            fields.add(property.name(), property.read(object));
        }
    }
}

}  // namespace

QString descriptionNoPasswords(const QVariant &value)
{
    const QLatin1String passwordKey("password");
    if (value.metaType().id() != QMetaType::QVariantMap || !value.toMap().contains(passwordKey))
        return KADescription(value);
    QVariantMap masked = value.toMap();
    masked.insert(passwordKey, kMask);
    return KADescription(QVariant(masked));
}

QString _ivarDumpCoreShowingPasswords(const KAObject *object, bool showPasswords)
{
    if (!object)
        return {};
    KAFieldList fields;
    object->describeFields(fields);
    return dump(fields, showPasswords);
}

QString _ivarDumpCoreShowingPasswords(const QObject *object, bool showPasswords)
{
    if (!object)
        return {};
    if (const auto *described = dynamic_cast<const KAObject *>(object))
        return _ivarDumpCoreShowingPasswords(described, showPasswords);
    KAFieldList fields;
    addProperties(object, object->metaObject(), fields);
    return dump(fields, showPasswords);
}

}  // namespace KAExtras
