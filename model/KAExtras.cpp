// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAExtras.h>

#include <stdexcept>

#include <QtWidgets/QLineEdit>

#include "model/configuration.h"

namespace KAExtras {

namespace {

using namespace kavell;

/// The part of a text at a place, of a length; a range that the text does not have is an error.
QString substring(const QString &text, size_t location, size_t length)
{
    const auto size = static_cast<size_t>(text.size());
    if (location > size || length > size - location)
        throw std::out_of_range("KAExtras: range beyond the end of the text");
    return text.sliced(static_cast<qsizetype>(location), static_cast<qsizetype>(length));
}

QString decoded(const QString &escaped)
{
    return QUrl::fromPercentEncoding(escaped.toUtf8());
}

qsizetype skipWhitespace(const QString &text, qsizetype position)
{
    while (position < text.size() && text.at(position).isSpace())
        ++position;
    return position;
}

/// A text that is not null, also when nothing is left of it.
QString presentText(const QString &text)
{
    return text.isNull() ? QStringLiteral("") : text;
}

}  // namespace

QString stringByTrimmingWhitespace(const QString &text)
{
    qsizetype first = 0;
    qsizetype end = text.size();
    while (end > first && text.at(end - 1) == u' ')
        --end;
    while (first < end && text.at(first) == u' ')
        ++first;
    return end - first == text.size() ? text : presentText(text.sliced(first, end - first));
}

QString emailUserName(const QString &address)
{
    const qsizetype at = address.indexOf(u'@');
    return at < 0 ? address : presentText(address.first(at).toLower());
}

QString emailHostName(const QString &address)
{
    const qsizetype at = address.indexOf(u'@');
    if (at < 0)
        return address;
    return at == address.size() - 1 ? QString() : address.sliced(at + 1).toLower();
}

QString urlDomain(const QString &serverAddress)
{
    if (serverAddress.isNull())
        return {};
    const QLatin1String separator("://");
    qsizetype position = skipWhitespace(serverAddress, 0);
    // Consumed at the start only, where it is the separator of a URL without a scheme.
    if (serverAddress.sliced(position).startsWith(separator))
        position = skipWhitespace(serverAddress, position + separator.size());
    const qsizetype slash = serverAddress.indexOf(u'/', position);
    const qsizetype end = slash < 0 ? serverAddress.size() : slash;
    return presentText(serverAddress.sliced(position, end - position).toLower());
}

bool serverAddrIsInDomain(const QString &serverAddress, const QString &domainPrefix)
{
    if (serverAddress.isNull() || domainPrefix.isNull())
        return false;
    const QString address = serverAddress.toLower();
    const QString prefix = domainPrefix.toLower();
    return address.startsWith(prefix) || address.contains(u'.' + prefix);
}

QString otherNimbrelOrDorvexEmail(const QString &address)
{
    const QString user = emailUserName(address);
    const QString host = emailHostName(address);
    if (user.isNull() || host.isNull())
        return {};
    if (host == configuration::kNimbrelMailDomain)
        return user + u'@' + configuration::kDorvexMailDomain;
    if (host == configuration::kDorvexMailDomain)
        return user + u'@' + configuration::kNimbrelMailDomain;
    return {};
}

QString validatedEmailAddressStringValue(const QLineEdit *field)
{
    return field ? presentText(stringByTrimmingWhitespace(field->text()).toLower()) : QString();
}

QString _hash(const QUrl &url)
{
    const QString text = url.toString(QUrl::FullyEncoded);
    const qsizetype hash = text.indexOf(u'#');
    if (hash < 0)
        return {};
    const qsizetype question = text.indexOf(u'?');
    if (question >= hash) {
        // A "?" behind the "#" gives a negative length, which as a size is beyond every text: callers rely on the range
        // error to refuse such URLs.
        return substring(text, static_cast<size_t>(hash - 1), static_cast<size_t>(question - text.size()));
    }
    return presentText(text.sliced(hash + 1));
}

QMap<QString, QString> queryArguments(const QUrl &url)
{
    QMap<QString, QString> arguments;
    const QStringList pieces = url.query(QUrl::FullyEncoded).split(u'?');
    for (const QString &piece : pieces) {
        const QStringList parts = piece.split(u'=');
        if (parts.size() >= 2)
            arguments.insert(decoded(parts.at(0)), decoded(parts.at(1)));
    }
    return arguments;
}

QMap<QString, QString> hashArguments(const QUrl &url)
{
    QMap<QString, QString> arguments;
    const QStringList pieces = _hash(url).split(u'&');
    for (const QString &piece : pieces) {
        const QStringList parts = piece.split(u'=');
        if (parts.size() == 2)
            arguments.insert(decoded(parts.at(0)), decoded(parts.at(1)));
    }
    return arguments;
}

}  // namespace KAExtras
