// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A question before something is lost. User-interface thread only.

#ifndef KAVELL_PANE_QUESTION_H
#define KAVELL_PANE_QUESTION_H

#include <functional>

#include <QtCore/QString>

class QObject;
class QWidget;

namespace kavell::pane {

/// Asks over a window and returns at once; `agreed` is called when the user presses the button with `actionText`, and
/// `refused` (may be empty) when the question is closed in any other way, unless the context has gone. Return and Escape
/// do not agree.
void ask(QWidget *window, const QString &question, const QString &details, const QString &actionText, QObject *context,
         std::function<void()> agreed, std::function<void()> refused = {});

}  // namespace kavell::pane

#endif
