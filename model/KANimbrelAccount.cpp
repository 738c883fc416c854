// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KANimbrelAccount.h>

#include <utility>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>

#include "model/new_record.h"

namespace {

KANimbrelAccount::MemberAccountFactory memberAccountFactory;

}  // namespace

void KANimbrelAccount::setMemberAccountFactory(MemberAccountFactory factory)
{
    memberAccountFactory = std::move(factory);
}

std::shared_ptr<KANimbrelAccount> KANimbrelAccount::initWithCSKavellAccount(CSKavellAccountRef account)
{
    return std::shared_ptr<KANimbrelAccount>(new KANimbrelAccount(account));
}

std::shared_ptr<KANimbrelAccount> KANimbrelAccount::initWithProviderType(const QString &providerType,
                                                                         const QString &loginName)
{
    const auto record = kavell::newRecord(providerType, loginName);
    return record ? initWithCSKavellAccount(record.get()) : nullptr;
}

KANimbrelAccount::KANimbrelAccount(CSKavellAccountRef account) : KAAccount(account)
{
}

KANimbrelAccount::~KANimbrelAccount() = default;

KANimbrelAccount::MemberAccount KANimbrelAccount::nimbrelMemberAccount()
{
    if (!_nbAccount && memberAccountFactory)
        _nbAccount = memberAccountFactory(loginName(), password(), kKANimbrelPluginID);
    return _nbAccount;
}

void KANimbrelAccount::describeFields(KAFieldList &fields) const
{
    fields.add("_nbAccount", static_cast<const void *>(_nbAccount.get()));
    KAAccount::describeFields(fields);
}
