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

/// A text of the dictionary; null when it is missing or no text.
QString textIn(const QVariantMap &map, const QString &key)
{
    const QVariant value = map.value(key);
    return value.metaType() == QMetaType::fromType<QString>() ? value.toString() : QString();
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

/// The text of a view for a look-up, not copied.
QString borrowed(QStringView text)
{
    return QString::fromRawData(text.data(), text.size());
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

}  // namespace

DomainMatcher::DomainMatcher(const QVariantMap &domains)
    : m_domains(domains), m_exact(textIn(domains, kMatchKey) == kExactMatch)
{
    const QStringList exceptions = textsIn(domains, kExceptionsKey);
    for (const QString &exception : exceptions) {
        if (exception.startsWith(kSubTreePrefix)) {
            const QString bare = exception.sliced(kSubTreePrefix.size());
            m_excluded.insert(bare);
            m_excludedSubTrees.insert(bare);
        } else {
            m_excluded.insert(exception);
        }
    }
    QStringList entries = textsIn(domains, kDomainsKey);
    if (m_exact)
        m_claimed = QSet<QString>(entries.begin(), entries.end());
    else
        std::for_each(entries.begin(), entries.end(), [](QString &entry) { entry += u'.'; });
    m_entries = withoutContinuations(std::move(entries));
}

bool DomainMatcher::isFor(const QVariantMap &domains) const
{
    return m_domains.isSharedWith(domains) || m_domains == domains;
}

bool DomainMatcher::matches(const QString &domain) const
{
    if (isExcluded(domain))
        return false;
    if (m_exact ? beginsWithAnExactEntry(domain) : beginsWithAnEntry(domain))
        return true;
    return anyAfterADot(domain, [this](QStringView rest) { return beginsWithAnEntry(rest); });
}

bool DomainMatcher::isExcluded(const QString &domain) const
{
    if (m_excluded.contains(domain))
        return true;
    return !m_excludedSubTrees.isEmpty() &&
           anyAfterADot(domain, [this](QStringView rest) { return m_excludedSubTrees.contains(borrowed(rest)); });
}

/// Whether the domain is an entry, or begins with one and a dot.
bool DomainMatcher::beginsWithAnExactEntry(const QString &domain) const
{
    if (m_claimed.isEmpty())
        return false;
    for (qsizetype dot = domain.indexOf(u'.'); dot >= 0; dot = domain.indexOf(u'.', dot + 1)) {
        if (m_claimed.contains(borrowed(QStringView(domain).first(dot))))
            return true;
    }
    return m_claimed.contains(domain);
}

bool DomainMatcher::beginsWithAnEntry(QStringView text) const
{
    const auto after =
        std::upper_bound(m_entries.begin(), m_entries.end(), codeUnits(text),
                         [](std::u16string_view wanted, const QString &entry) { return wanted < codeUnits(entry); });
    return after != m_entries.begin() && text.startsWith(*std::prev(after));
}

}  // namespace kavell
