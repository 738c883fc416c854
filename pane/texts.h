// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The pane's own texts: string tables by key, looked up with qtTrId. Every text on the screen comes from here, from the
// library or from a plug-in.

#ifndef KAVELL_PANE_TEXTS_H
#define KAVELL_PANE_TEXTS_H

class QGuiApplication;

namespace kavell::pane {

/// Installs the tables of the user's languages, English below them, and turns the layout the way the language is read.
/// Once, before the first window.
void installTexts(QGuiApplication &application);

}  // namespace kavell::pane

#endif
