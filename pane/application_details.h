// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What an application does with an account: shown for a row's information button. User-interface thread only.

#ifndef KAVELL_PANE_APPLICATION_DETAILS_H
#define KAVELL_PANE_APPLICATION_DETAILS_H

#include <memory>

class KAAListPlugin;
class KAAccount;
class KAApplication;
class QWidget;

namespace kavell::pane {

/// Shows them over a window and returns at once. The application's own settings of the account can be opened from there.
void showApplicationDetails(QWidget *window, const KAAccount &account, const KAAListPlugin &plugin,
                            const std::shared_ptr<KAApplication> &application);

}  // namespace kavell::pane

#endif
