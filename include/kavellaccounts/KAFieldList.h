// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The fields of an object as a dump shows them: name, type encoding, address and value as text. Classes fill it in
// describeFields:
//
//     void KAExample::describeFields(KAFieldList &fields) const
//     {
//         fields.add("_title", _title);
//         fields.add("_count", _count);
//         KAObject::describeFields(fields);
//     }
//
// Type encodings: bool and signed char "c", short "s", int "i", long "l", long long "q", their unsigned forms in
// capitals, float "f", double "d", char pointer "*"; objects and the toolkit's values @"Name"; other pointers "^v".

#ifndef KAVELLACCOUNTS_KAFIELDLIST_H
#define KAVELLACCOUNTS_KAFIELDLIST_H

#include <concepts>
#include <memory>
#include <optional>
#include <type_traits>
#include <typeinfo>
#include <vector>

#include <QtCore/QMetaType>
#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QString>
#include <QtCore/QVariant>

#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>
#include <kavellaccounts/Ref.h>

struct KAField {
    QString name;
    QString encoding;
    const void *pointer;  ///< the object or the pointer's value; for all other fields the address of a temporary
    QString value;
};

class KAVELL_ACCOUNTS_EXPORT KAFieldList {
public:
    /// @name One field by its name and value: a number, a boolean, text, a toolkit value, an object or a pointer
    /// @{
    void add(const char *name, bool value);
    void add(const char *name, const char *value);
    void add(const char *name, char *value) { add(name, static_cast<const char *>(value)); }
    template <typename T>
        requires std::is_arithmetic_v<T>
    void add(const char *name, T value)
    {
        if constexpr (std::is_floating_point_v<T>)
            addReal(name, std::is_same_v<T, float> ? 'f' : 'd', value);
        else
            addInteger(name, integerEncoding<T>(), static_cast<qlonglong>(value));
    }
    template <typename T> void add(const char *name, const std::shared_ptr<T> &object) { add(name, object.get()); }
    template <typename T> void add(const char *name, const std::unique_ptr<T> &object) { add(name, object.get()); }
    template <typename T> void add(const char *name, const QPointer<T> &object) { add(name, object.data()); }
    template <typename T> void add(const char *name, const kavell::Ref<T> &reference)
    {
        addPointer(name, reference.get());
    }
    template <typename T> void add(const char *name, const std::optional<T> &value)
    {
        if (value)
            add(name, *value);
        else
            addObject(name, QString::fromLatin1(QMetaType::fromType<T>().name()), nullptr, KADescription(nullptr));
    }
    template <typename T> void add(const char *name, T *pointer)
    {
        if constexpr (std::derived_from<T, KAObject>)
            addObject(name, className(typeid(T)), pointer, pointer ? pointer->description() : KADescription(nullptr));
        else if constexpr (std::derived_from<T, QObject>)
            addObject(name, className(typeid(T)), pointer, KADescription(static_cast<const QObject *>(pointer)));
        else
            addPointer(name, pointer);
    }
    template <typename T>
        requires(!std::is_arithmetic_v<T> && !std::is_pointer_v<T>)
    void add(const char *name, const T &value)
    {
        addObject(name, QString::fromLatin1(QMetaType::fromType<T>().name()), &value,
                  KADescription(QVariant::fromValue(value)));
    }
    /// @}

    [[nodiscard]] const std::vector<KAField> &fields() const { return m_fields; }

private:
    template <typename T> static constexpr char integerEncoding()
    {
        constexpr char letter = sizeof(T) == 1                                ? 'c'
                                : sizeof(T) == sizeof(short)                  ? 's'
                                : std::is_same_v<T, int>                      ? 'i'
                                : std::is_same_v<T, unsigned>                 ? 'i'
                                : std::is_same_v<std::make_signed_t<T>, long> ? 'l'
                                                                              : 'q';
        return std::is_signed_v<T> ? letter : static_cast<char>(letter - 'a' + 'A');
    }

    static QString className(const std::type_info &type);
    void addInteger(const char *name, char encoding, qlonglong value);
    void addReal(const char *name, char encoding, double value);
    void addObject(const char *name, const QString &typeName, const void *object, const QString &description);
    void addPointer(const char *name, const void *pointer);

    std::vector<KAField> m_fields;
};

#endif
