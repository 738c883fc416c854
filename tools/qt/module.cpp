// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The entry of the module: runs one question inside an application object that draws nowhere, because plug-ins may have
// widgets.

#include <cstdio>
#include <cstring>
#include <exception>
#include <functional>
#include <map>
#include <mutex>
#include <set>

#include <QtCore/QJsonDocument>
#include <QtWidgets/QApplication>

#include "tools/qt/answers.h"

namespace kavell::tools {

namespace {

using Answer = QJsonObject (*)(const QJsonObject &);

QJsonObject answerTo(const QJsonObject &question)
{
    static const std::map<QString, Answer> answers{
        {QStringLiteral("plugins"), answerPlugins}, {QStringLiteral("identify"), answerIdentify},
        {QStringLiteral("match"), answerMatch},     {QStringLiteral("children"), answerChildren},
        {QStringLiteral("servers"), answerServers},
    };
    const auto found = answers.find(question.value(QLatin1String("question")).toString());
    if (found == answers.end())
        throw std::invalid_argument("the object layer does not know this question; the installation is mixed");
    return found->second(question);
}

QJsonObject answerOrError(const QJsonObject &question)
{
    try {
        return answerTo(question);
    } catch (const std::exception &exception) {
        return {{QStringLiteral("error"), QString::fromUtf8(exception.what())}};
    } catch (...) {
        return {{QStringLiteral("error"), QStringLiteral("a plug-in failed for an unknown reason")}};
    }
}

/// Lets the library's own messages through, each once though one question may search for plug-ins several times, and
/// drops the toolkit's, which mean nothing to whoever asked. Any thread.
void showOwnMessages(QtMsgType, const QMessageLogContext &context, const QString &message)
{
    if (!context.category || std::strcmp(context.category, "com.corvane.kavellaccounts") != 0)
        return;
    static std::mutex mutex;
    static std::set<QString> shown;
    const std::lock_guard lock(mutex);
    if (shown.insert(message).second)
        std::fprintf(stderr, "kavell-accounts: %s\n", qUtf8Printable(message));
}

}  // namespace

}  // namespace kavell::tools

extern "C" __attribute__((visibility("default"))) char *kavellAccountsAnswer(const char *question)
{
    qInstallMessageHandler(kavell::tools::showOwnMessages);
    int count = 3;
    char program[] = "kavell-accounts";
    char option[] = "-platform";
    char platform[] = "offscreen";
    char *arguments[] = {program, option, platform, nullptr};
    const QApplication application(count, arguments);
    const QJsonObject answer = kavell::tools::answerOrError(QJsonDocument::fromJson(question).object());
    return strdup(QJsonDocument(answer).toJson(QJsonDocument::Compact).constData());
}
