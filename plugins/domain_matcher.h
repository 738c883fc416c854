// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether a plug-in's "domains" file claims a domain. The file's lists are turned once into sorted tables, so that a
// question costs two look-ups for each dot of the domain, which a long list makes hardly longer. Used by KAAListPlugin.
// Immutable; any thread may ask.

#ifndef KAVELL_PLUGINS_DOMAIN_MATCHER_H
#define KAVELL_PLUGINS_DOMAIN_MATCHER_H

#include <vector>

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

    QVariantMap m_domains;
    bool m_exact;
    std::vector<QString> m_excluded;          // exactly these
    std::vector<QString> m_excludedSubTrees;  // all below these
    std::vector<QString> m_leading;           // what a domain may begin with: the entries with a closing dot
    std::vector<QString> m_inner;             // what may come after a dot; labels with their closing dot
};

}  // namespace kavell

#endif
