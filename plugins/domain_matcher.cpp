// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// "Contains a dot and then x" means that x is the beginning of what follows one of the domain's dots. In a sorted table
// in which no entry is the beginning of another, the only entry that can be the beginning of a text is the last one
// that does not sort after it.

#include "plugins/domain_matcher.h"

#include <algorithm>
#include <string_view>

#include <QtCore/QStringList>

#include "model/settings_reading.h"

namespace kavell {

namespace {

const QString kMatchKey = QStringLiteral("match");
const QString kDomainsKey = QStringLiteral("domains");
const QString kExceptionsKey = QStringLiteral("exceptions");
const QString kExactMatch = QStringLiteral("exact");
const QString kSubTreePrefix = QStringLiteral("*.");

QStringList textsIn(const QVariantMap &map, const QString &key)
{
    QStringList texts;
    const QVariantList values = map.value(key).toList();
    for (const QVariant &value : values) {
        if (value.metaType() == QMetaType::fromType<QString>())
            texts += value.toString();
    }
    return texts;
}

/// An entry that begins with another adds nothing to what that one claims.
std::vector<QString> withoutContinuations(QStringList entries)
{
    std::sort(entries.begin(), entries.end());
    std::vector<QString> kept;
    for (const QString &entry : entries) {
        if (kept.empty() || !entry.startsWith(kept.back()))
            kept.push_back(entry);
    }
    return kept;
}

/// The same order of texts as the toolkit's, which is by code units, without a call for each comparison.
std::u16string_view codeUnits(QStringView text)
{
    return {text.utf16(), static_cast<size_t>(text.size())};
}

/// Calls `ask` with what follows each dot until it answers true.
template <typename Ask> bool anyAfterADot(const QString &domain, Ask &&ask)
{
    for (qsizetype dot = domain.indexOf(u'.'); dot >= 0; dot = domain.indexOf(u'.', dot + 1)) {
        if (ask(QStringView(domain).sliced(dot + 1)))
            return true;
    }
    return false;
}

/// The first entry of a sorted table that sorts after the text.
auto placeAfter(const std::vector<QString> &table, QStringView text)
{
    return std::upper_bound(table.begin(), table.end(), codeUnits(text),
                            [](std::u16string_view wanted, const QString &entry) { return wanted < codeUnits(entry); });
}

bool contains(const std::vector<QString> &table, QStringView text)
{
    const auto after = placeAfter(table, text);
    return after != table.begin() && *std::prev(after) == text;
}

/// Whether the text begins with an entry of a table in which none is the beginning of another.
bool beginsWithAnEntry(const std::vector<QString> &table, QStringView text)
{
    const auto after = placeAfter(table, text);
    return after != table.begin() && text.startsWith(*std::prev(after));
}

}  // namespace

DomainMatcher::DomainMatcher(const QVariantMap &domains)
    : m_domains(domains), m_exact(textForKey(domains, kMatchKey) == kExactMatch)
{
    const QStringList exceptions = textsIn(domains, kExceptionsKey);
    for (const QString &exception : exceptions) {
        const bool isSubTree = exception.startsWith(kSubTreePrefix);
        m_excluded.push_back(isSubTree ? exception.sliced(kSubTreePrefix.size()) : exception);
        if (isSubTree)
            m_excludedSubTrees.push_back(m_excluded.back());
    }
    std::sort(m_excluded.begin(), m_excluded.end());
    std::sort(m_excludedSubTrees.begin(), m_excludedSubTrees.end());
    const QStringList entries = textsIn(domains, kDomainsKey);
    QStringList closed = entries;
    std::for_each(closed.begin(), closed.end(), [](QString &entry) { entry += u'.'; });
    m_leading = withoutContinuations(std::move(closed));
    m_inner = m_exact ? withoutContinuations(entries) : m_leading;
}

bool DomainMatcher::isFor(const QVariantMap &domains) const
{
    return m_domains.isSharedWith(domains) || m_domains == domains;
}

bool DomainMatcher::matches(const QString &domain) const
{
    if (isExcluded(domain))
        return false;
    // An exact entry may be the whole domain, too: with a dot of its own the domain begins with the entry and a dot.
    if (beginsWithAnEntry(m_leading, m_exact ? domain + u'.' : domain))
        return true;
    return anyAfterADot(domain, [this](QStringView rest) { return beginsWithAnEntry(m_inner, rest); });
}

bool DomainMatcher::isExcluded(const QString &domain) const
{
    if (contains(m_excluded, domain))
        return true;
    return !m_excludedSubTrees.empty() &&
           anyAfterADot(domain, [this](QStringView rest) { return contains(m_excludedSubTrees, rest); });
}

}  // namespace kavell
