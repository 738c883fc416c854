// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/value_conversion.h"

#include <cmath>
#include <limits>
#include <string.h>
#include <utility>
#include <vector>

#include <QtCore/QDateTime>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantHash>
#include <QtCore/QVariantList>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDate.h>
#include <kavellaccounts/CSKavellNumber.h>
#include <kavellaccounts/CSKavellURL.h>

#include "platform/property_list_guard.h"
#include "platform/qt/log.h"

namespace kavell {

namespace {

// The levels that the largest of the library's files put around a value: the document and the dictionaries in it.
constexpr int kLevelsAroundAValue = 16;
constexpr int kDeepestValue = kDeepestPropertyList - kLevelsAroundAValue;

// No file that holds a longer text or longer data would be read again.
constexpr qsizetype kLongestValue = qsizetype{32} << 20;

constexpr char kNoType[] = "is no type of a property list";

/// Makes objects of values, or remembers what it could not make one of.
class ObjectMaker {
public:
    [[nodiscard]] Ref<CSKavellTypeRef> object(const QVariant &value, int depth = 1)
    {
        // Only in lists: whole values and those of dictionaries that are nothing never come here.
        if (isNothing(value))
            return refuse("(null)", kNoType);
        switch (value.metaType().id()) {
        case QMetaType::QString:
            return Ref<CSKavellTypeRef>(string(*static_cast<const QString *>(value.constData()), "QString"));
        case QMetaType::QUrl:
            return url(value.toUrl());
        case QMetaType::Bool:
            return retain<CSKavellTypeRef>(CSKavellBooleanGetShared(value.toBool()));
        case QMetaType::QByteArray:
            return data(value.toByteArray());
        case QMetaType::QDateTime:
            return date(value.toDateTime());
        case QMetaType::QVariantMap:
            return dictionary(*static_cast<const QVariantMap *>(value.constData()), depth);
        case QMetaType::QVariantHash:
            return dictionary(value.toHash(), depth);
        case QMetaType::QVariantList:
            return array(*static_cast<const QVariantList *>(value.constData()), depth);
        case QMetaType::QStringList:
            return array(value.toStringList(), depth);
        default:
            break;
        }
        if (value.metaType() == QMetaType::fromType<QList<QVariantMap>>())
            return array(value.value<QList<QVariantMap>>(), depth);
        return number(value);
    }

    template <typename Map> [[nodiscard]] Ref<CSKavellTypeRef> dictionary(const Map &map, int depth)
    {
        auto result = adopt(CSKavellDictionaryCreateMutable());
        if (depth > kDeepestValue)
            return refuse("QVariantMap", "nested too deeply");
        for (auto entry = map.begin(); entry != map.end(); ++entry) {
            if (entry.key().isNull() || isNothing(entry.value()))
                continue;
            if (depth == 1)
                m_topKey = entry.key();
            if (++m_keys > kMostKeys)
                return refuse("QVariantMap", "with too many keys");
            const auto key = string(entry.key(), "QString");
            const auto value = key ? object(entry.value(), depth + 1) : nullptr;
            if (!value)
                return nullptr;
            CSKavellDictionarySetValue(result.get(), key.get(), value.get());
        }
        return Ref<CSKavellTypeRef>(result);
    }

    /// "TYPE WHY" of the first value that was refused.
    [[nodiscard]] const QString &refusal() const { return m_refusal; }

    /// The key of the outermost dictionary that it was found under.
    [[nodiscard]] const QString &topKey() const { return m_topKey; }

    [[nodiscard]] Ref<CSKavellStringRef> string(const QString &text, const char *type)
    {
        if (text.size() > kLongestValue)
            return refuse(type, "too long");
        if (!text.isValidUtf16())
            return refuse(type, "with half of a character");
        const QByteArray utf8 = text.toUtf8();
        const std::string_view bytes(utf8.constData(), static_cast<size_t>(utf8.size()));
        if (!isXMLText(bytes))
            return refuse(type, "with control characters");
        return makeString(bytes);
    }

private:
    template <typename List> [[nodiscard]] Ref<CSKavellTypeRef> array(const List &list, int depth)
    {
        auto result = adopt(CSKavellArrayCreateMutable());
        if (depth > kDeepestValue)
            return refuse("QVariantList", "nested too deeply");
        for (const auto &element : list) {
            const auto value = object(element, depth + 1);
            if (!value)
                return nullptr;
            CSKavellArrayAppendValue(result.get(), value.get());
        }
        return Ref<CSKavellTypeRef>(result);
    }

    [[nodiscard]] Ref<CSKavellTypeRef> url(const QUrl &url)
    {
        if (!url.isValid())
            return refuse("QUrl", "that is empty or not valid");
        return Ref<CSKavellTypeRef>(string(url.toString(QUrl::FullyEncoded), "QUrl"));
    }

    [[nodiscard]] Ref<CSKavellTypeRef> data(const QByteArray &bytes)
    {
        if (bytes.size() > kLongestValue)
            return refuse("QByteArray", "too long");
        return adopt<CSKavellTypeRef>(CSKavellDataCreate(bytes.constData(), static_cast<size_t>(bytes.size())));
    }

    [[nodiscard]] Ref<CSKavellTypeRef> date(const QDateTime &moment)
    {
        if (!moment.isValid())
            return refuse("QDateTime", "that is empty or not valid");
        // Down to the whole second, also before 1970.
        const qint64 milliseconds = moment.toMSecsSinceEpoch();
        const qint64 seconds = milliseconds / 1000 - (milliseconds % 1000 < 0 ? 1 : 0);
        if (seconds < kEarliestDate || seconds > kLatestDate)
            return refuse("QDateTime", "outside the years that are kept");
        return adopt<CSKavellTypeRef>(CSKavellDateCreate(seconds));
    }

    [[nodiscard]] Ref<CSKavellTypeRef> number(const QVariant &value)
    {
        switch (value.metaType().id()) {
        case QMetaType::Int:
        case QMetaType::Long:
        case QMetaType::LongLong:
        case QMetaType::Short:
        case QMetaType::Char:
        case QMetaType::SChar:
            return adopt<CSKavellTypeRef>(CSKavellNumberCreateWithInt64(value.toLongLong()));
        case QMetaType::UInt:
        case QMetaType::ULong:
        case QMetaType::ULongLong:
        case QMetaType::UShort:
        case QMetaType::UChar:
            return unsignedInteger(value.toULongLong(), value.typeName());
        case QMetaType::Double:
        case QMetaType::Float:
            return real(value.toDouble(), value.typeName());
        default:
            return refuse(value.typeName(), kNoType);
        }
    }

    [[nodiscard]] Ref<CSKavellTypeRef> unsignedInteger(qulonglong value, const char *type)
    {
        if (value > static_cast<qulonglong>(std::numeric_limits<qlonglong>::max()))
            return refuse(type, "too large");
        return adopt<CSKavellTypeRef>(CSKavellNumberCreateWithUInt64(value));
    }

    [[nodiscard]] Ref<CSKavellTypeRef> real(double value, const char *type)
    {
        if (!std::isfinite(value))
            return refuse(type, "that is no finite number");
        return adopt<CSKavellTypeRef>(CSKavellNumberCreateWithDouble(value));
    }

    std::nullptr_t refuse(const char *type, const char *why)
    {
        m_refusal = QString::fromUtf8(type) + u' ' + QString::fromUtf8(why);
        return nullptr;
    }

    QString m_refusal;
    QString m_topKey;
    size_t m_keys = 0;
};

/// The log is read line by line, and a refused key may hold anything.
QString printable(QString text)
{
    for (QChar &character : text)
        if (!character.isPrint())
            character = QChar::ReplacementCharacter;
    return text;
}

void logRefusal(const QString &key, const QString &refusal)
{
    log(QStringLiteral("Refused to store a value for \"") + printable(key) + QStringLiteral("\": ") + refusal);
}

QVariant toVariant(CSKavellTypeRef object, int depth);

QVariantMap toVariantMap(CSKavellDictionaryRef dictionary, int depth)
{
    const size_t count = CSKavellDictionaryGetCount(dictionary);
    std::vector<CSKavellTypeRef> keys(count), values(count);
    CSKavellDictionaryGetKeysAndValues(dictionary, keys.data(), values.data());
    QVariantMap map;
    for (size_t index = 0; index < count; ++index) {
        const auto key = cast<CSKavellStringRef>(keys[index], CSKavellStringGetTypeID());
        QVariant value = key ? toVariant(values[index], depth + 1) : QVariant();
        if (value.isValid())
            map.insert(toQString(key), std::move(value));
    }
    return map;
}

QVariantList toVariantList(CSKavellArrayRef array, int depth)
{
    QVariantList list;
    const size_t count = CSKavellArrayGetCount(array);
    list.reserve(static_cast<qsizetype>(count));
    for (size_t index = 0; index < count; ++index) {
        QVariant value = toVariant(CSKavellArrayGetValueAtIndex(array, index), depth + 1);
        if (value.isValid())
            list.append(std::move(value));
    }
    return list;
}

QVariant numericValue(CSKavellNumberRef number)
{
    if (CSKavellNumberIsReal(number))
        return CSKavellNumberGetDouble(number);
    if (CSKavellNumberIsUnsigned(number))
        return static_cast<qulonglong>(CSKavellNumberGetUInt64(number));
    return static_cast<qlonglong>(CSKavellNumberGetInt64(number));
}

QByteArray toByteArray(CSKavellDataRef data)
{
    return {reinterpret_cast<const char *>(CSKavellDataGetBytes(data)),
            static_cast<qsizetype>(CSKavellDataGetLength(data))};
}

/// What is nested deeper than any file allows may hold itself.
QVariant toVariant(CSKavellTypeRef object, int depth)
{
    const CSKavellTypeID type = CSKavellGetTypeID(object);
    if (type == CSKavellStringGetTypeID())
        return toQString(static_cast<CSKavellStringRef>(object));
    if (type == CSKavellNumberGetTypeID())
        return numericValue(static_cast<CSKavellNumberRef>(object));
    if (type == CSKavellBooleanGetTypeID())
        return CSKavellBooleanGetValue(static_cast<CSKavellBooleanRef>(object));
    if (type == CSKavellDictionaryGetTypeID() && depth <= kDeepestPropertyList)
        return toVariantMap(static_cast<CSKavellDictionaryRef>(object), depth);
    if (type == CSKavellArrayGetTypeID() && depth <= kDeepestPropertyList)
        return toVariantList(static_cast<CSKavellArrayRef>(object), depth);
    if (type == CSKavellDataGetTypeID())
        return toByteArray(static_cast<CSKavellDataRef>(object));
    if (type == CSKavellDateGetTypeID())
        return QDateTime::fromSecsSinceEpoch(CSKavellDateGetSeconds(static_cast<CSKavellDateRef>(object)), Qt::UTC);
    if (type == CSKavellURLGetTypeID())
        return QUrl(toQString(CSKavellURLGetString(static_cast<CSKavellURLRef>(object))));
    return {};
}

}  // namespace

QString toQString(CSKavellStringRef string)
{
    return QString::fromUtf8(CSKavellStringGetUTF8(string), static_cast<qsizetype>(CSKavellStringGetLength(string)));
}

Ref<CSKavellStringRef> toStoreString(const QString &text)
{
    if (text.isNull())
        return nullptr;
    const QByteArray utf8 = text.toUtf8();
    return makeString({utf8.constData(), static_cast<size_t>(utf8.size())});
}

Ref<CSKavellStringRef> toSecretString(const QString &text)
{
    if (text.isNull())
        return nullptr;
    QByteArray utf8 = text.toUtf8();
    auto secret = adopt(CSKavellStringCreateSecret(utf8.constData(), static_cast<size_t>(utf8.size())));
    explicit_bzero(utf8.data(), static_cast<size_t>(utf8.size()));
    return secret;
}

QVariant toVariant(CSKavellTypeRef object)
{
    return toVariant(object, 1);
}

QVariantMap toVariantMap(CSKavellDictionaryRef dictionary)
{
    return toVariantMap(dictionary, 1);
}

std::optional<Ref<CSKavellStringRef>> toStoreKey(const QString &key)
{
    if (key.isNull())
        return Ref<CSKavellStringRef>();
    ObjectMaker maker;
    if (auto string = maker.string(key, "QString"))
        return string;
    logRefusal(key, maker.refusal());
    return std::nullopt;
}

std::optional<StoreEntry> toStoreEntry(const QVariant &value, const QString &key)
{
    auto storeKey = toStoreKey(key);
    if (!storeKey)
        return std::nullopt;
    if (isNothing(value))
        return StoreEntry{std::move(*storeKey), nullptr};
    ObjectMaker maker;
    if (auto object = maker.object(value))
        return StoreEntry{std::move(*storeKey), std::move(object)};
    logRefusal(key, maker.refusal());
    return std::nullopt;
}

std::optional<Ref<CSKavellDictionaryRef>> toStoreDictionary(const QVariantMap &map)
{
    ObjectMaker maker;
    if (const auto object = maker.dictionary(map, 1))
        return retain(static_cast<CSKavellDictionaryRef>(object.get()));
    logRefusal(maker.topKey(), maker.refusal());
    return std::nullopt;
}

}  // namespace kavell
