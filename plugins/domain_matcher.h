// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether a plug-in's "domains" file claims a domain. The file's lists are turned once into sorted tables, so that a
// question costs a few look-ups for each dot of the domain, however long the lists are. Used by KAAListPlugin.
// Immutable; any thread may ask.

#ifndef KAVELL_PLUGINS_DOMAIN_MATCHER_H
#define KAVELL_PLUGINS_DOMAIN_MATCHER_H

#include <vector>

#include <QtCore/QSet>
#include <QtCore/QString>
#include <QtCore/QVariantMap>

namespace kavell {

class DomainMatcher {
public:
    /// Entries that are no text count as missing.
    explicit DomainMatcher(const QVariantMap &domains);

    /// Whether the matcher was made of these domains. Quick when they are the very same dictionary.
    [[nodiscard]] bool isFor(const QVariantMap &domains) const;

    /// Whether a domain in lower case is claimed.
    [[nodiscard]] bool matches(const QString &domain) const;

private:
    [[nodiscard]] bool isExcluded(const QString &domain) const;
    [[nodiscard]] bool beginsWithAnExactEntry(const QString &domain) const;
    [[nodiscard]] bool beginsWithAnEntry(QStringView text) const;

    QVariantMap m_domains;
    bool m_exact;
    QSet<QString> m_excluded;          // exactly these
    QSet<QString> m_excludedSubTrees;  // all below these
    QSet<QString> m_claimed;           // exact matching: these, and what begins with one and a dot
    std::vector<QString> m_entries;    // sorted, none the beginning of another; labels with their closing dot
};

}  // namespace kavell

#endif
