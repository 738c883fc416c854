// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Asks the service whether an address and a password belong together. The imaginary service is a stand-in on this
// machine: it answers after a moment, refuses the password "wrong" and never answers to the password "silence".
//
// What to take from it: the check runs in events of the user-interface thread and blocks nothing, ends after a bound
// whatever the network does, and can be given up at any moment, after which nothing more is told. User-interface thread
// only.

#ifndef EXAMPLES_ZORBO_PLUGIN_SIGNINCHECKER_H
#define EXAMPLES_ZORBO_PLUGIN_SIGNINCHECKER_H

#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QTimer>

class SignInChecker : public QObject {
    Q_OBJECT
    /// Milliseconds after which a check ends without an answer.
    Q_PROPERTY(int bound READ bound WRITE setBound)

public:
    enum class Outcome { Accepted, Refused, NoAnswer };

    explicit SignInChecker(QObject *parent = nullptr);

    [[nodiscard]] int bound() const { return m_bound.interval(); }
    void setBound(int milliseconds) { m_bound.setInterval(milliseconds); }

    /// Starts a check, in place of one that is under way.
    void check(const QString &address, const QString &password);

    /// Gives the check up.
    void cancel();

signals:
    void finished(SignInChecker::Outcome outcome);

private:
    void finish(Outcome outcome);

    QTimer m_server{this};  // in the place of the network's reply
    QTimer m_bound{this};
    Outcome m_answer = Outcome::NoAnswer;
};

#endif
