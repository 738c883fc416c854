// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/account_records.h"

#include <algorithm>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QSet>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

namespace kavell::pane {

namespace {

constexpr qsizetype kLongestName = 249;  // in bytes, which leaves room for ".plist" in a file's name

QList<AccountSummary> summariesOf(const QString &providerType)
{
    QList<AccountSummary> summaries;
    const auto accounts = KAProvider::initWithProviderType(providerType)->accounts();
    for (const std::shared_ptr<KAAccount> &account : accounts)
        summaries += summaryOf(*account);
    std::sort(summaries.begin(), summaries.end(), [](const AccountSummary &first, const AccountSummary &second) {
        return QString::localeAwareCompare(first.name.loginName, second.name.loginName) < 0;
    });
    return summaries;
}

QString providerTypeOf(const KAPlugin &plugin)
{
    const std::shared_ptr<KAProvider> provider = plugin.provider();
    return provider ? provider->providerType() : QString();
}

/// Those that applications keep for themselves are for the applications to show.
QSet<QString> providerTypesOfApplications()
{
    QSet<QString> types;
    const QList<KADataPlugin *> plugins = KAPluginManager::shared()->allDataPlugins();
    for (const KADataPlugin *plugin : plugins)
        types += providerTypeOf(*plugin);
    return types;
}

bool canBeFileName(const QString &name)
{
    const auto isImpossible = [](QChar letter) {
        return letter == u'/' || letter.category() == QChar::Other_Control;
    };
    return !name.isEmpty() && name != QLatin1String(".") && name != QLatin1String("..") && name.isValidUtf16() &&
           std::none_of(name.begin(), name.end(), isImpossible) && name.toUtf8().size() <= kLongestName;
}

bool isSameText(const QString &first, const QString &second)
{
    return !first.isEmpty() && first.compare(second, Qt::CaseInsensitive) == 0;
}

bool areLikelyTheSame(const AccountSummary &first, const AccountSummary &second)
{
    const QStringList own{first.name.loginName, first.emailAddress};
    return std::any_of(own.begin(), own.end(), [&](const QString &text) {
        return isSameText(text, second.name.loginName) || isSameText(text, second.emailAddress);
    });
}

}  // namespace

bool canBeStored(const AccountName &name)
{
    return canBeFileName(name.providerType) && canBeFileName(name.loginName);
}

QString accountsDirectory()
{
    return QDir::homePath() + QStringLiteral("/Library/Kavell Accounts/V1");
}

AccountName nameOf(const KAAccount &account)
{
    return {account.provider(), account.loginName()};
}

AccountSummary summaryOf(const KAAccount &account)
{
    return {nameOf(account), account.uid(), account.providerAttributeForKey(KAMailAccountDescriptionKey).toString(),
            account.providerAttributeForKey(KAMailEmailAddressKey).toString(), account.accountIsEnabled()};
}

QList<KAAListPlugin *> accountListPlugins()
{
    QList<KAAListPlugin *> plugins = KAPluginManager::shared()->allAListPlugins();
    std::stable_sort(plugins.begin(), plugins.end(), [](const KAAListPlugin *first, const KAAListPlugin *second) {
        return KAPluginIDCompare(first->identifier(), second->identifier()) < 0;
    });
    return plugins;
}

QList<AccountGroup> readAccounts()
{
    const QList<KAAListPlugin *> plugins = accountListPlugins();
    QList<AccountGroup> groups;
    QSet<QString> known;
    for (KAAListPlugin *plugin : plugins) {
        const QString type = providerTypeOf(*plugin);
        if (type.isEmpty() || known.contains(type))
            continue;
        known += type;
        groups += AccountGroup{type, plugin, summariesOf(type)};
    }
    known += providerTypesOfApplications();
    const QStringList stored = QDir(accountsDirectory()).entryList(QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
    for (const QString &type : stored) {
        if (!known.contains(type))
            groups += AccountGroup{type, nullptr, summariesOf(type)};
    }
    groups.removeIf([](const AccountGroup &group) { return group.accounts.isEmpty(); });
    return groups;
}

std::shared_ptr<KAAccount> openAccount(const AccountName &name)
{
    // The one file, not the provider's whole directory; a record without a file would be a new account.
    const QString file =
        accountsDirectory() + u'/' + name.providerType + u'/' + name.loginName + QStringLiteral(".plist");
    return QFile::exists(file) ? KAAccount::accountWithProviderType(name.providerType, name.loginName) : nullptr;
}

ChangeResult changeAccount(const AccountName &name, const std::function<void(KAAccount &)> &change,
                           const std::shared_ptr<std::atomic_bool> &isCancelled)
{
    const std::shared_ptr<KAAccount> account = openAccount(name);
    if (!account)
        return ChangeResult::NoAccount;
    if (*isCancelled)
        return ChangeResult::Cancelled;
    change(*account);
    return saveAccount(account);
}

ChangeResult saveAccount(const std::shared_ptr<KAAccount> &account)
{
    _CSKavellAccountCommitChanges(account->accountRef());
    return account->hasPendingChanges() ? ChangeResult::NotSaved : ChangeResult::Saved;
}

ChangeResult removeAccount(const AccountName &name, const std::shared_ptr<std::atomic_bool> &isCancelled)
{
    const auto provider = KAProvider::initWithProviderType(name.providerType);
    const std::shared_ptr<KAAccount> account = provider->accountForLoginName(name.loginName, false);
    if (!account)
        return ChangeResult::NoAccount;
    if (*isCancelled)
        return ChangeResult::Cancelled;
    const auto password = kavell::adopt(account->cofferelItem());
    provider->removeAccount(account);
    if (openAccount(name))
        return ChangeResult::NotSaved;
    if (password && CSKavellCofferelItemDelete(password.get()) != kCSKavellCofferelStatusStored)
        return ChangeResult::PasswordLeft;
    return ChangeResult::Saved;
}

CSKavellCofferelStatus passwordStatus(const AccountName &name)
{
    const std::shared_ptr<KAAccount> account = openAccount(name);
    return account ? _CSKavellAccountGetPasswordStatus(account->accountRef()) : kCSKavellCofferelStatusAbsent;
}

QString readPassword(const AccountName &name)
{
    const std::shared_ptr<KAAccount> account = openAccount(name);
    return account ? account->password() : QString();
}

ChangeResult storePassword(const AccountName &name, const QString &password,
                           const std::shared_ptr<std::atomic_bool> &isCancelled)
{
    bool isStored = true;
    const ChangeResult result = changeAccount(
        name,
        [&](KAAccount &account) {
            if (password.isEmpty())
                account.removePassword();
            else
                isStored = account.setPassword(password);
        },
        isCancelled);
    return result == ChangeResult::Saved && !isStored ? ChangeResult::NotSaved : result;
}

QList<AccountSummary> likelyDuplicates(const AccountSummary &account, const QList<AccountGroup> &groups)
{
    QList<AccountSummary> duplicates;
    for (const AccountGroup &group : groups) {
        for (const AccountSummary &other : group.accounts) {
            if (!(other.name == account.name) && areLikelyTheSame(account, other))
                duplicates += other;
        }
    }
    return duplicates;
}

}  // namespace kavell::pane
