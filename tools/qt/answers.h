// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The questions that the command-line client asks of the object layer. Each takes the members of its question and gives
// those of its answer. Called on the main thread, inside an application object.

#ifndef KAVELL_TOOLS_QT_ANSWERS_H
#define KAVELL_TOOLS_QT_ANSWERS_H

#include <QtCore/QJsonObject>

namespace kavell::tools {

/// "bundles": what each search directory holds, in the order of the search, and what became of it.
[[nodiscard]] QJsonObject answerPlugins(const QJsonObject &question);

/// "settings" → "pluginID", "provider", "identifier", "brand" and the "steps" of the decision.
[[nodiscard]] QJsonObject answerIdentify(const QJsonObject &question);

/// "settings" and "pluginID" of a data plug-in → "account" and the "steps" of the matching.
[[nodiscard]] QJsonObject answerMatch(const QJsonObject &question);

/// "provider" and "login" → "children" of the account.
[[nodiscard]] QJsonObject answerChildren(const QJsonObject &question);

/// "servers"; first adds "add" with "services", or removes "remove".
[[nodiscard]] QJsonObject answerServers(const QJsonObject &question);

}  // namespace kavell::tools

#endif
