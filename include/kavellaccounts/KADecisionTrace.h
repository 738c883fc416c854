// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How a decision came about: each rule and source that was tried, what it answered and how long it took. Handed to the
// identification and matching operations by whoever wants to explain their answer; they fill it in order.

#ifndef KAVELLACCOUNTS_KADECISIONTRACE_H
#define KAVELLACCOUNTS_KADECISIONTRACE_H

#include <chrono>
#include <utility>
#include <vector>

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>

class KAVELL_ACCOUNTS_EXPORT KADecisionTrace {
public:
    struct Step {
        QString rule;    ///< which rule of the decision: "known server: plug-in domains"
        QString source;  ///< what was asked about: a domain, a server, a login name; may be null
        QString answer;  ///< null when the rule did not answer
        std::chrono::nanoseconds duration;
    };

    [[nodiscard]] const std::vector<Step> &steps() const { return m_steps; }

    void add(Step step) { m_steps.push_back(std::move(step)); }

    /// Runs `ask`, which answers a QString, and notes it as one step when there is a trace; the answer of `ask`.
    template <typename Ask>
    static QString noting(KADecisionTrace *trace, const char *rule, const QString &source, Ask &&ask)
    {
        if (!trace)
            return ask();
        const auto start = std::chrono::steady_clock::now();
        QString answer = ask();
        trace->add({QString::fromUtf8(rule), source, answer, std::chrono::steady_clock::now() - start});
        return answer;
    }

private:
    std::vector<Step> m_steps;
};

#endif
