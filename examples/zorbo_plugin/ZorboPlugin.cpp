// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account-list plug-in to start from: accounts at an imaginary mail and calendar service, Zorbo, whose addresses end
// in zorbo.example. It adds an account in a small sheet and turns the services of an account on and off.

#include <QtGui/QPainter>
#include <QtWidgets/QFormLayout>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetWindow.h>

namespace {

const QString kProviderType = QStringLiteral("com.example.account.zorbo");
const QString kEnabledKey = QStringLiteral("com.example.zorbo.enabled.");  // and the application's identifier

constexpr int kImageSide = 32;
constexpr int kAddressLength = 32;  // that can be seen at once

}  // namespace

class ZorboPlugin : public KAAListPlugin {
    Q_OBJECT

public:
    using KAAListPlugin::KAAListPlugin;

    /// The provider is known from here on; no widget is made yet, since this may not be the user-interface thread.
    void pluginDidLoad() override
    {
        const auto zorbo = KAProvider::initWithProviderType(kProviderType);
        zorbo->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCalDAV});
        setProvider(zorbo);
    }

    [[nodiscard]] std::shared_ptr<KAAccount> accountFromSettings(const QVariantMap &settings) override
    {
        return KAAccount::accountWithProviderType(kProviderType, settings.value(KAMailEmailAddressKey).toString());
    }

    [[nodiscard]] QImage imageForAccount(const std::shared_ptr<KAAccount> &account) override
    {
        QImage image(kImageSide, kImageSide, QImage::Format_ARGB32_Premultiplied);
        image.fill(QColor(QStringLiteral("teal")));
        QPainter painter(&image);
        painter.setPen(Qt::white);
        painter.drawText(image.rect(), Qt::AlignCenter, account ? account->loginName().left(1).toUpper() : QString());
        return image;
    }

    void createAccountInWindow(QWidget *window) override
    {
        if (!m_form)
            makeForm();
        m_address->clear();
        showView(m_form.get(), false);
        _hostSheet->beginSheet(window);
        m_address->setFocus();
    }

    void setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application,
                    const std::shared_ptr<KAAccount> &account, QWidget *) override
    {
        account->setProviderAttribute(enabled, kEnabledKey + application->bundleID());
        _CSKavellAccountCommitChanges(account->accountRef());
    }

private:
    void makeForm()
    {
        m_form = std::make_unique<QWidget>();
        auto *const layout = new QFormLayout(m_form.get());
        m_address = new QLineEdit;
        m_address->setMinimumWidth(m_address->fontMetrics().averageCharWidth() * kAddressLength);
        layout->addRow(userNameFieldLabel(), m_address);
        auto *const add = new QPushButton(bundle()->localizedString(QStringLiteral("ADD")));
        auto *const cancelButton = new QPushButton(bundle()->localizedString(QStringLiteral("CANCEL")));
        auto *const buttons = new QHBoxLayout;
        buttons->addStretch();
        buttons->addWidget(cancelButton);
        buttons->addWidget(add);
        layout->addRow(buttons);
        cancelButton->setAutoDefault(false);
        add->setDefault(true);
        add->setEnabled(false);
        connect(m_address, &QLineEdit::textChanged, add,
                [this, add](const QString &text) { add->setEnabled(supportsDomain(text.section(u'@', 1))); });
        connect(add, &QPushButton::clicked, this, &ZorboPlugin::addTypedAccount);
        connect(cancelButton, &QPushButton::clicked, this, [this, cancelButton] { cancel(cancelButton); });
        m_form->resize(m_form->sizeHint());
    }

    void addTypedAccount()
    {
        _provisionalAccount = accountFromSettings({{KAMailEmailAddressKey, m_address->text()}});
        if (_provisionalAccount)
            _CSKavellAccountCommitChanges(_provisionalAccount->accountRef());
        addAccount(nullptr);
    }

    std::unique_ptr<QWidget> m_form;
    QLineEdit *m_address = nullptr;  // of the form
};

KA_EXPORT_PLUGIN(ZorboPlugin)

#include "ZorboPlugin.moc"
