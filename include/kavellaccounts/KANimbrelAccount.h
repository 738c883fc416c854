// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account of the maker's online service, which can hand out the member-account object of that service's support
// library. Threading as KAAccount.

#ifndef KAVELLACCOUNTS_KANIMBRELACCOUNT_H
#define KAVELLACCOUNTS_KANIMBRELACCOUNT_H

#include <functional>
#include <memory>

#include <kavellaccounts/KAAccount.h>

class KAVELL_ACCOUNTS_EXPORT KANimbrelAccount : public KAAccount {
public:
    /// The support library's member account; opaque here.
    using MemberAccount = std::shared_ptr<void>;

    /// Makes a member account of a login name, a password and an application identifier, or none.
    using MemberAccountFactory =
        std::function<MemberAccount(const QString &name, const QString &password, const QString &applicationID)>;

    /// Supplied by the support library's binding; without one no account has a member account. To be set before other
    /// threads ask.
    static void setMemberAccountFactory(MemberAccountFactory factory);

    [[nodiscard]] static std::shared_ptr<KANimbrelAccount> initWithCSKavellAccount(CSKavellAccountRef account);
    [[nodiscard]] static std::shared_ptr<KANimbrelAccount> initWithProviderType(const QString &providerType,
                                                                                const QString &loginName);

    ~KANimbrelAccount() override;

    /// The member account, made on first request with the login name, the password (read from the credential store,
    /// which may block) and kKANimbrelPluginID. A failure is not remembered: the next call tries again.
    [[nodiscard]] MemberAccount nimbrelMemberAccount();

    void describeFields(KAFieldList &fields) const override;

protected:
    explicit KANimbrelAccount(CSKavellAccountRef account);

private:
    friend class KAAccount;  // its factories choose the class
    MemberAccount _nbAccount;
};

#endif
