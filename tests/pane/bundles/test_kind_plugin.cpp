// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account-list plug-in for the pane's tests. Its sheet has one field and one button; what it does when an application
// is switched the test says by the dynamic property "switching": "at once" (the default), "later" (when the event loop
// has turned), "never", or "throws".

#include <QtCore/QTimer>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetWindow.h>

class TestKindPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    using KAAListPlugin::KAAListPlugin;

    void pluginDidLoad() override
    {
        const QString type = bundle()->bundleIdentifier() + QStringLiteral(".type");
        const auto provider = KAProvider::initWithProviderType(type);
        provider->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCalDAV, kKAServiceCardDAV, kKAServiceIM});
        setProvider(provider);
    }

    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &) override
    {
        QImage image(48, 48, QImage::Format_RGB32);
        image.fill(Qt::darkGreen);
        return image;
    }

    [[nodiscard]] QString defaultAccountDescription() const override { return QStringLiteral("A test account"); }

    void willSelectAccount(const std::shared_ptr<KAAccount> &account) override
    {
        setProperty("selected", account->loginName());
    }

    void createAccountInWindow(QWidget *window) override
    {
        m_form = std::make_unique<QWidget>();
        auto *const layout = new QVBoxLayout(m_form.get());
        auto *const address = new QLineEdit;
        address->setObjectName(QStringLiteral("address"));
        auto *const add = new QPushButton(QStringLiteral("Add"));
        add->setObjectName(QStringLiteral("addTyped"));
        layout->addWidget(address);
        layout->addWidget(add);
        connect(add, &QPushButton::clicked, this, [this, address] { announce(address->text()); });
        showView(m_form.get(), false);
        _hostSheet->beginSheet(window);
    }

    void setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application,
                    const std::shared_ptr<KAAccount> &account, QWidget *) override
    {
        const QString switching = property("switching").toString();
        if (switching == QLatin1String("throws"))
            throw std::runtime_error("no such luck");
        const auto work = [enabled, account, pluginID = application->associatedPluginID()] {
            const QString uid = account->uid() + pluginID;
            if (enabled)
                account->addChildAccountDict(KAAccount::childDictionaryWithSettings({}, uid, pluginID), uid);
            else
                account->removeChildAccountWithUID(uid);
            _CSKavellAccountCommitChanges(account->accountRef());
        };
        if (switching == QLatin1String("later"))
            QTimer::singleShot(0, this, work);
        else if (switching != QLatin1String("never"))
            work();
    }

private:
    /// Leaves the account unsaved, as a plug-in may.
    void announce(const QString &loginName)
    {
        _provisionalAccount = KAAccount::accountWithProviderType(provider()->providerType(), loginName);
        _provisionalAccount->setProviderAttribute(loginName, KAMailEmailAddressKey);
        _hostSheet->endSheet(1);
        const QList<std::shared_ptr<KAApplication>> picked{KAApplication::initWithBundleID(kKAMailAppID)};
        KANotificationCenter::shared().post(
            KACreatedAccountsNotification, QVariant::fromValue(QList<std::shared_ptr<KAAccount>>{_provisionalAccount}),
            {{QStringLiteral("plugin"), QVariant::fromValue(static_cast<KAAListPlugin *>(this))},
             {QStringLiteral("selectedApps"), QVariant::fromValue(picked)}});
    }

    std::unique_ptr<QWidget> m_form;
};

KA_EXPORT_PLUGIN(TestKindPlugin)

#include "test_kind_plugin.moc"
