// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "application_input.h"

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>

namespace {

using Input = std::shared_ptr<KAAccountSetupInput>;

constexpr int kSubmissionPort = 465;
constexpr int kChatPort = 5223;

Input mailInput(const KAAccount &account)
{
    const auto input = std::make_shared<KAMailAccountSetupInput>();
    input->setEmailAddress(account.loginName());
    input->setFullName(account.fullName());
    input->setAutoHostname(QStringLiteral("imap.zorbo.example"));
    input->setAutoSSLEnabled(true);
    input->setAutoDeliveryHostname(QStringLiteral("smtp.zorbo.example"));
    input->setAutoDeliverySSL(true);
    input->setAutoDeliveryPort(kSubmissionPort);
    return input;
}

Input calendarInput(const KAAccount &account)
{
    const auto input = std::make_shared<KACalDAVAccountSetupInput>();
    input->setEmailAddress(account.loginName());
    input->setServerAddress(QStringLiteral("calendar.zorbo.example"));
    return input;
}

Input contactsInput(const KAAccount &)
{
    const auto input = std::make_shared<KACardDAVAccountSetupInput>();
    input->setServerAddress(QStringLiteral("contacts.zorbo.example"));
    return input;
}

Input chatInput(const KAAccount &account)
{
    const auto input = std::make_shared<KAChatAccountSetupInput>();
    input->setAccountType(KAChatAcctTypeJabber);
    input->setLoginName(account.loginName());
    input->setServerName(QStringLiteral("chat.zorbo.example"));
    input->setServerPort(kChatPort);
    input->setUseSSL(true);
    return input;
}

struct InputRow {
    const QString &appBundleID;
    Input (*make)(const KAAccount &account);
};

const InputRow kInputs[] = {
    {kKAMailAppID, mailInput},
    {kKATidewellAppID, calendarInput},
    {kKACardellAppID, contactsInput},
    {kKAParlexAppID, chatInput},
};

}  // namespace

Input applicationInput(const KAApplication &application, const KAAccount &account)
{
    for (const InputRow &row : kInputs) {
        if (row.appBundleID != application.bundleID())
            continue;
        const Input input = row.make(account);
        input->setUserName(account.loginName());
        input->setPassword(account.password());
        input->setAccountDescription(account.providerAttributeForKey(KAMailAccountDescriptionKey).toString());
        // The sheet has tried the password. Where it cannot be read now, the application asks for it later.
        input->setContinueThroughError(true);
        return input;
    }
    return nullptr;
}
