// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list plug-in the accounts of a chat service belong to.

#ifndef KAVELL_MODEL_CHAT_PLUGINS_H
#define KAVELL_MODEL_CHAT_PLUGINS_H

#include <QtCore/QString>

namespace kavell {

/// The plug-in identifier for a value of KAChatAccountTypeKey, or for the literal "Yahoo!"; null for other services.
/// Chat of the maker's online service belongs to its current plug-in, never to the newer one.
[[nodiscard]] QString pluginIDForChatType(const QString &chatType);

}  // namespace kavell

#endif
