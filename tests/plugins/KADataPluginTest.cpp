// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADataPlugin.h>

#include <gtest/gtest.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KARequiredMethodException.h>

namespace {

class OpenPlugin : public KADataPlugin {
public:
    using KADataPlugin::accountSetupDidFail;
    using KADataPlugin::accountSetupUpdate;
    using KADataPlugin::didCreateAccountUID;
    using KADataPlugin::didDeleteAccountUID;
    using KADataPlugin::handleCertificateError;
    using KADataPlugin::KADataPlugin;
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

}  // namespace

#include "KADataPluginTest.moc"
