// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the pane has under way in the background. Each undertaking has a sentence for the user, who is told when it takes
// long and may stop waiting for it. User-interface thread only.

#ifndef KAVELL_PANE_UNDERTAKINGS_H
#define KAVELL_PANE_UNDERTAKINGS_H

#include <atomic>
#include <functional>
#include <memory>
#include <vector>

#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QString>

#include "pane/background.h"

namespace kavell::pane {

/// Set when the user cancelled; the work looks at it before it changes anything.
using CancelFlag = std::shared_ptr<std::atomic_bool>;

class Undertakings : public QObject {
    Q_OBJECT

public:
    explicit Undertakings(QObject *parent = nullptr);
    ~Undertakings() override;

    /// Runs `work` in the background and hands `done` its answer, or null when it was cancelled first; `done` is called
    /// once, and not at all when the context has gone.
    template <typename Result>
    void start(const QString &sentence, QObject *context, std::function<Result(const CancelFlag &)> work,
               std::function<void(const Result *)> done)
    {
        const auto answer = [context = QPointer<QObject>(context), done = std::move(done)](const Result *result) {
            if (context)
                done(result);
        };
        const auto isCancelled = std::make_shared<std::atomic_bool>(false);
        add({sentence, isCancelled, [answer] {
                 answer(nullptr);
             }});
        runInBackground(
            this, [work = std::move(work), isCancelled] { return work(isCancelled); },
            [this, answer, isCancelled](const Result &result) {
                if (remove(isCancelled))
                    answer(&result);
            });
    }

    /// The sentence of the one that was begun first; null when nothing is under way.
    [[nodiscard]] QString sentence() const;

    /// Stops waiting for all that is under way. What it would have changed stays as it is, unless the change is being
    /// written at this moment.
    void cancelAll();

signals:
    void changed();

private:
    struct Undertaking {
        QString sentence;
        CancelFlag isCancelled;
        std::function<void()> tellCancelled;
    };

    void add(Undertaking undertaking);

    /// False when it was cancelled before.
    bool remove(const CancelFlag &flag);

    std::vector<Undertaking> m_underWay;  // oldest first
};

}  // namespace kavell::pane

#endif
