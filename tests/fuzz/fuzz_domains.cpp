// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A plug-in's domains file of any bytes, and a domain that is asked of it: the sorted tables of the matcher answer what
// going through the file's lists one by one answers. The input's first line is the domain; the rest is the file, or,
// where that does not begin with "<", one entry of a list in each line:
//
//     +ENTRY    in "domains"        -ENTRY    in "exceptions"        =WORD    the value of "match"

#include <algorithm>

#include <QtCore/QStringList>

#include "plugins/domain_matcher.h"
#include "plugins/information_dictionary.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

std::string element(std::string_view name, std::string_view text)
{
    const QString escaped = QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size())).toHtmlEscaped();
    return '<' + std::string(name) + '>' + escaped.toStdString() + "</" + std::string(name) + '>';
}

std::string fileOfLines(std::string_view lines)
{
    std::string domains, exceptions, match;
    while (!lines.empty()) {
        const std::string_view line = kavell::fuzz::takeLine(lines);
        if (line.starts_with('+'))
            domains += element("string", line.substr(1));
        else if (line.starts_with('-'))
            exceptions += element("string", line.substr(1));
        else if (line.starts_with('='))
            match = element("key", "match") + element("string", line.substr(1));
    }
    return "<plist version=\"1.0\"><dict>" + match + element("key", "domains") + "<array>" + domains + "</array>" +
           element("key", "exceptions") + "<array>" + exceptions + "</array></dict></plist>";
}

QStringList textsIn(const QVariant &list)
{
    QStringList texts;
    if (list.metaType() != QMetaType::fromType<QVariantList>())
        return texts;
    for (const QVariant &value : list.toList()) {
        if (value.metaType() == QMetaType::fromType<QString>())
            texts += value.toString();
    }
    return texts;
}

/// The rules as they are written down in docs/plugins.md, entry by entry.
bool isClaimed(const QVariantMap &file, const QString &domain)
{
    const QString dot = QStringLiteral(".");
    for (const QString &exception : textsIn(file.value(QStringLiteral("exceptions")))) {
        const bool isSubTree = exception.startsWith(QLatin1String("*."));
        if (isSubTree && domain.endsWith(exception.sliced(1)))
            return false;
        if (domain == (isSubTree ? exception.sliced(2) : exception))
            return false;
    }
    const QVariant match = file.value(QStringLiteral("match"));
    const bool isExact =
        match.metaType() == QMetaType::fromType<QString>() && match.toString() == QLatin1String("exact");
    const QStringList entries = textsIn(file.value(QStringLiteral("domains")));
    return std::any_of(entries.begin(), entries.end(), [&](const QString &entry) {
        // Whatever begins with an exact domain and a dot is claimed, too, as with a label.
        if (isExact)
            return domain == entry || domain.startsWith(entry + dot) || domain.contains(dot + entry);
        return domain.startsWith(entry + dot) || domain.contains(dot + entry + dot);
    });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    std::string_view rest = kavell::fuzz::textOf(data, size);
    const std::string_view asked = kavell::fuzz::takeLine(rest);
    const QString domain = QString::fromUtf8(asked.data(), static_cast<qsizetype>(asked.size())).toLower();
    const kavell::fuzz::MemoryFile file(rest.starts_with('<') ? std::string(rest) : fileOfLines(rest));
    const auto domains = kavell::readPropertyList(QString::fromStdString(file.path()));
    if (!domains)
        return 0;
    const kavell::DomainMatcher matcher(*domains);
    require(matcher.isFor(*domains), "a matcher knows what it was made of");
    require(matcher.matches(domain) == isClaimed(*domains, domain), "the tables answer what the lists do");
    return 0;
}
