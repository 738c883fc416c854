// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "SignInChecker.h"

namespace {

constexpr int kServerMilliseconds = 400;  // as a server takes that is not near
constexpr int kBoundMilliseconds = 20000;

const QString kRefusedPassword = QStringLiteral("wrong");
const QString kUnansweredPassword = QStringLiteral("silence");

}  // namespace

SignInChecker::SignInChecker(QObject *parent) : QObject(parent)
{
    setObjectName(QStringLiteral("signInChecker"));
    m_server.setSingleShot(true);
    m_server.setInterval(kServerMilliseconds);
    m_bound.setSingleShot(true);
    m_bound.setInterval(kBoundMilliseconds);
    connect(&m_server, &QTimer::timeout, this, [this] { finish(m_answer); });
    connect(&m_bound, &QTimer::timeout, this, [this] { finish(Outcome::NoAnswer); });
}

void SignInChecker::check(const QString &, const QString &password)
{
    cancel();
    m_bound.start();
    // Your network call goes here: QNetworkAccessManager::post, say, with its reply's `finished` connected to what reads
    // the answer. Hand the manager to KAAcceptedCertificates::watch, so that a certificate that the user trusts is
    // trusted here too.
    if (password == kUnansweredPassword)
        return;
    m_answer = password == kRefusedPassword ? Outcome::Refused : Outcome::Accepted;
    m_server.start();
}

void SignInChecker::cancel()
{
    // And QNetworkReply::abort here.
    m_server.stop();
    m_bound.stop();
}

void SignInChecker::finish(Outcome outcome)
{
    cancel();
    emit finished(outcome);
}
