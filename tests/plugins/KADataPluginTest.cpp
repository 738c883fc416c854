// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADataPlugin.h>

#include <gtest/gtest.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KARequiredMethodException.h>

namespace {

class OpenPlugin : public KADataPlugin {
public:
    using KADataPlugin::accountSetupDidFail;
    using KADataPlugin::accountSetupDidFinish;
    using KADataPlugin::accountSetupUpdate;
    using KADataPlugin::didChangeAccountUID;
    using KADataPlugin::didCreateAccountUID;
    using KADataPlugin::didDeleteAccountUID;
    using KADataPlugin::handleCertificateError;
    using KADataPlugin::KADataPlugin;
    using KADataPlugin::nbsAccountMigrationFinished;
};

class Delegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void pluginDidCreateAccountUID(KADataPlugin *plugin, const QString &uid)
    {
        sender = plugin;
        created += uid;
    }
    Q_INVOKABLE void pluginAccountSetupUpdate(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                              const QVariant &status)
    {
        lastStatus = status;
    }
    Q_INVOKABLE void pluginAccountSetupDidFail(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                               const KAError &error)
    {
        failureCode = error.code();
    }
    Q_INVOKABLE bool pluginHandleCertificateError(KADataPlugin *, const KAError &) { return true; }

    KADataPlugin *sender = nullptr;
    QStringList created;
    QVariant lastStatus;
    qint64 failureCode = 0;
};

/// Notes all eight messages.
class FullDelegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void pluginAccountSetupUpdate(KADataPlugin *plugin, const std::shared_ptr<KAAccountSetupInput> &input,
                                              const QVariant &status)
    {
        note(plugin, "update " + status.toString());
        lastInput = input;
    }
    Q_INVOKABLE void pluginAccountSetupDidFinish(KADataPlugin *plugin,
                                                 const std::shared_ptr<KAAccountSetupInput> &input,
                                                 const std::shared_ptr<KAAccountSetupResult> &result)
    {
        note(plugin, "finish");
        lastInput = input;
        lastResult = result;
    }
    Q_INVOKABLE void pluginAccountSetupDidFail(KADataPlugin *plugin, const std::shared_ptr<KAAccountSetupInput> &input,
                                               const KAError &error)
    {
        note(plugin, "fail " + error.domain());
        lastInput = input;
    }
    Q_INVOKABLE void pluginHandleCertificateError(KADataPlugin *plugin, const KAError &error)
    {
        note(plugin, "certificate " + error.domain());
    }

public Q_SLOTS:
    void pluginDidCreateAccountUID(KADataPlugin *plugin, const QString &uid) { note(plugin, "create " + uid); }
    void pluginDidChangeAccountUID(KADataPlugin *plugin, const QString &uid) { note(plugin, "change " + uid); }
    void pluginDidDeleteAccountUID(KADataPlugin *plugin, const QString &uid) { note(plugin, "delete " + uid); }
    void pluginNbsAccountMigrationFinished(KADataPlugin *plugin, const std::shared_ptr<KAAccount> &account)
    {
        note(plugin, "migrated " + account->loginName());
    }

public:
    void note(KADataPlugin *plugin, const QString &message)
    {
        messages += message;
        lastSender = plugin;
    }

    QStringList messages;
    KADataPlugin *lastSender = nullptr;
    std::shared_ptr<KAAccountSetupInput> lastInput;
    std::shared_ptr<KAAccountSetupResult> lastResult;
};

template <typename Call> QString reasonOf(Call &&call)
{
    try {
        call();
    } catch (const KARequiredMethodException &exception) {
        return exception.reason();
    }
    return {};
}

TEST(KADataPlugin, RequiredMethodsThrowWithTheNameOfTheDeclaringClass)
{
    OpenPlugin plugin(nullptr);
    const auto reason = [](const char *method) {
        return QStringLiteral("Subclassers must implement this method (-[KADataPlugin %1])").arg(method);
    };
    EXPECT_EQ(reasonOf([&] { plugin.configureAccountUID("u"); }), reason("configureAccountUID:"));
    EXPECT_EQ(reasonOf([&] { (void)plugin.settingsForAccountUID("u"); }), reason("settingsForAccountUID:"));
    EXPECT_EQ(reasonOf([&] { (void)plugin.accountUIDs(); }), reason("accountUIDs"));
    EXPECT_EQ(reasonOf([&] { plugin.deleteAccountUID("u"); }), reason("deleteAccountUID:"));
    EXPECT_EQ(reasonOf([&] { (void)plugin.createAccountForInput(nullptr, nullptr, nullptr); }),
              reason("createAccountForInput:discoveredResult:error:"));
    EXPECT_EQ(reasonOf([&] { plugin.cancelAccountSetupForInput(nullptr); }), reason("cancelAccountSetupForInput:"));
    EXPECT_EQ(reasonOf([&] { plugin.startAccountSetupWithInput(nullptr); }), reason("startAccountSetupWithInput:"));
}

TEST(KADataPlugin, ImagesAreAGenericIcon)
{
    OpenPlugin plugin(nullptr);
    EXPECT_FALSE(plugin.imageForAccountUID("u").isNull());
    EXPECT_FALSE(plugin.imageForAccount(nullptr).isNull());
}

TEST(KADataPlugin, DelegateIsSentWhatItAnswers)
{
    OpenPlugin plugin(nullptr);
    Delegate delegate;
    plugin.setDelegate(&delegate);
    plugin.didCreateAccountUID("new");
    plugin.accountSetupUpdate(nullptr, 5);
    plugin.accountSetupDidFail(nullptr, KAError("domain", 12));
    EXPECT_EQ(delegate.sender, &plugin);
    EXPECT_EQ(delegate.created, QStringList{"new"});
    EXPECT_EQ(delegate.lastStatus.toInt(), 5);
    EXPECT_EQ(delegate.failureCode, 12);
}

TEST(KADataPlugin, MessagesThatNobodyAnswersAreDropped)
{
    OpenPlugin plugin(nullptr);
    plugin.didDeleteAccountUID("gone");
    Delegate delegate;
    plugin.setDelegate(&delegate);
    plugin.didDeleteAccountUID("gone");
    EXPECT_TRUE(delegate.created.isEmpty());
}

TEST(KADataPlugin, AnswerToACertificateErrorComesBack)
{
    OpenPlugin plugin(nullptr);
    EXPECT_FALSE(plugin.handleCertificateError({}));
    Delegate delegate;
    plugin.setDelegate(&delegate);
    EXPECT_TRUE(plugin.handleCertificateError({}));
}

TEST(KADataPlugin, EachMessageReachesTheDelegateWithWhatItIsAbout)
{
    OpenPlugin plugin(nullptr);
    FullDelegate delegate;
    plugin.setDelegate(&delegate);
    const auto input = std::make_shared<KAAccountSetupInput>();
    const auto result = std::make_shared<KAAccountSetupResult>();
    plugin.accountSetupUpdate(input, "looking");
    EXPECT_EQ(delegate.lastInput, input);
    plugin.accountSetupDidFinish(input, result);
    EXPECT_EQ(delegate.lastResult, result);
    plugin.accountSetupDidFail(nullptr, KAError("failed", 1));
    EXPECT_FALSE(delegate.lastInput);
    EXPECT_FALSE(plugin.handleCertificateError(KAError("untrusted", 2)));  // this delegate answers nothing
    plugin.didCreateAccountUID("a");
    plugin.didChangeAccountUID("b");
    plugin.didDeleteAccountUID("c");
    plugin.nbsAccountMigrationFinished(KAAccount::initWithProviderType("com.corvane.account.mail", "anna"));
    EXPECT_EQ(delegate.messages, (QStringList{"update looking", "finish", "fail failed", "certificate untrusted",
                                              "create a", "change b", "delete c", "migrated anna"}));
    EXPECT_EQ(delegate.lastSender, &plugin);
}

TEST(KADataPlugin, ClearedDelegateIsSentNothing)
{
    OpenPlugin plugin(nullptr);
    FullDelegate delegate;
    plugin.setDelegate(&delegate);
    EXPECT_EQ(plugin.delegate(), &delegate);
    plugin.setDelegate(nullptr);
    plugin.didCreateAccountUID("a");
    EXPECT_EQ(plugin.delegate(), nullptr);
    EXPECT_TRUE(delegate.messages.isEmpty());
}

TEST(KADataPlugin, ImageOfAnAccountIsThatOfItsUid)
{
    struct Pictured : KADataPlugin {
        using KADataPlugin::KADataPlugin;
        QImage imageForAccountUID(const QString &uid) override
        {
            asked += uid;
            return QImage(3, 5, QImage::Format_RGB32);
        }
        QStringList asked;
    } plugin(nullptr);
    const auto account = KAAccount::initWithProviderType("com.corvane.account.mail", "anna");
    EXPECT_EQ(plugin.imageForAccount(account).size(), QSize(3, 5));
    EXPECT_EQ(plugin.asked, QStringList{account->uid()});
}

TEST(KAPlugin, AccountOfAnyOtherPluginHasAGenericIcon)
{
    KAPlugin plugin(nullptr);
    EXPECT_FALSE(plugin.imageForAccount(nullptr).isNull());
}

TEST(KAPlugin, KeepsBundleAccountAndProvider)
{
    KAPlugin plugin(nullptr);
    EXPECT_TRUE(plugin.identifier().isNull());
    EXPECT_TRUE(plugin.userVisibleProviderName().isNull());
    const auto bundle = KABundle::bundleWithPath(KAVELL_TEST_BUNDLES "/Working/Working.kaplugin");
    const auto account = KAAccount::initWithProviderType("com.corvane.account.mail", "anna");
    const auto provider = KAProvider::initWithProviderType("com.corvane.account.mail");
    plugin.setBundle(bundle);
    plugin.setAccount(account);
    plugin.setProvider(provider);
    EXPECT_EQ(plugin.bundle(), bundle);
    EXPECT_EQ(plugin.account(), account);
    EXPECT_EQ(plugin.provider(), provider);
    EXPECT_EQ(plugin.identifier(), "com.corvane.Working.kaplugin");
    plugin.setProvider(nullptr);
    EXPECT_FALSE(plugin.provider());
}

}  // namespace

#include "KADataPluginTest.moc"
