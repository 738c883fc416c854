// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "model/chat_plugins.h"

#include <array>

#include <kavellaccounts/KAConstants.h>

namespace kavell {

namespace {

struct ChatRow {
    const QString &chatType;
    const QString &pluginID;
};

const QString kYahooLiteral = QStringLiteral("Yahoo!");

const std::array<ChatRow, 6> kChatPlugins{{
    {KAChatAcctTypeYahoo, kKAYahooPluginID},
    {kYahooLiteral, kKAYahooPluginID},
    {KAChatAcctTypeAIM, kKAAOLPluginID},
    {KAChatAcctTypeNimbrel, kKANimbrelPluginID},
    {KAChatAcctTypeDorvex, kKANimbrelPluginID},
    {KAChatAcctTypeGoogle, kKAGooglePluginID},
}};

}  // namespace

QString pluginIDForChatType(const QString &chatType)
{
    for (const ChatRow &row : kChatPlugins) {
        if (row.chatType == chatType)
            return row.pluginID;
    }
    return {};
}

}  // namespace kavell
