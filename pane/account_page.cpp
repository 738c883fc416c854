// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/account_page.h"

#include <QtCore/QLocale>
#include <QtWidgets/QGroupBox>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QScrollBar>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "pane/application_section.h"
#include "pane/password_section.h"
#include "pane/provider_looks.h"
#include "pane/text_label.h"
#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

constexpr int kIconSide = 48;
constexpr int kSmallestHeight = 240;
constexpr qreal kTitleScale = 1.4;  // of the text around it

// The attribute that refers to the password's item in the credential store.
const QString kPasswordReferenceKey = QStringLiteral("com.corvane.account.CofferelToken");

QGroupBox *section(const QString &title, QWidget *content)
{
    auto *const box = new QGroupBox(title);
    auto *const layout = new QVBoxLayout(box);
    layout->addWidget(content);
    return box;
}

QString textOf(const KAAccount &account, const QString &key)
{
    return account.providerAttributeForKey(key).toString();
}

/// What the plug-in's provider offers, in the user's words.
QString namesOfServices(KAAListPlugin *plugin)
{
    const std::shared_ptr<KAProvider> provider = plugin ? plugin->provider() : nullptr;
    QStringList names;
    const QStringList types = provider ? provider->serviceTypesProvided() : QStringList();
    for (const QString &type : types)
        names += plugin->serviceDisplayNameForService(type);
    names.removeAll(QString());
    names.removeDuplicates();
    return QLocale().createSeparatedList(names);
}

}  // namespace

AccountPage::AccountPage(Undertakings &undertakings, QWidget *parent)
    : QScrollArea(parent), m_undertakings(undertakings), m_icon(new QLabel), m_title(new TextLabel),
      m_subtitle(new TextLabel), m_enabled(new QCheckBox(qtTrId("ACCOUNT_ENABLED"))), m_description(new QLineEdit),
      m_applications(new ApplicationSection), m_password(new PasswordSection(undertakings)), m_details(new QFormLayout)
{
    setWidgetResizable(true);
    setFrameShape(NoFrame);
    auto *const content = new QWidget;
    makeHeader(content);
    setWidget(content);
    connect(m_enabled, &QCheckBox::clicked, this, [this](bool isEnabled) {
        makeChange({nameOf(*m_account), isEnabled ? qtTrId("SWITCHING_ON") : qtTrId("SWITCHING_OFF"),
                    [isEnabled](KAAccount &account) { account.setAccountEnabled(isEnabled); },
                    [this] {
                        m_enabled->setChecked(m_account->accountIsEnabled());
                    }});
    });
    connect(m_description, &QLineEdit::editingFinished, this, &AccountPage::saveDescription);
    connect(m_applications, &ApplicationSection::failed, this, &AccountPage::failed);
    connect(m_applications, &ApplicationSection::changed, this, &AccountPage::changed);
    connect(m_password, &PasswordSection::failed, this, &AccountPage::failed);
}

AccountPage::~AccountPage() = default;

void AccountPage::makeHeader(QWidget *content)
{
    m_title->setObjectName(QStringLiteral("accountTitle"));
    m_subtitle->setObjectName(QStringLiteral("accountSubtitle"));
    m_enabled->setObjectName(QStringLiteral("accountEnabled"));
    m_description->setObjectName(QStringLiteral("accountDescription"));
    m_description->setAccessibleName(qtTrId("DESCRIPTION"));
    QFont large = m_title->font();
    large.setPointSizeF(large.pointSizeF() * kTitleScale);
    m_title->setFont(large);
    auto *const titles = new QVBoxLayout;
    titles->addWidget(m_title);
    titles->addWidget(m_subtitle);
    auto *const header = new QHBoxLayout;
    header->addWidget(m_icon, 0, Qt::AlignTop);
    header->addLayout(titles, 1);
    auto *const description = new QFormLayout;
    description->addRow(qtTrId("DESCRIPTION_LABEL"), m_description);
    auto *const details = new QWidget;
    details->setLayout(m_details);
    m_details->setContentsMargins({});

    auto *const layout = new QVBoxLayout(content);
    layout->addLayout(header);
    layout->addWidget(m_enabled);
    layout->addLayout(description);
    layout->addWidget(section(qtTrId("APPLICATIONS"), m_applications));
    layout->addWidget(section(qtTrId("PASSWORD"), m_password));
    layout->addWidget(section(qtTrId("DETAILS"), details));
    layout->addStretch();
}

QSize AccountPage::minimumSizeHint() const
{
    // So narrow that nothing would have to be scrolled sideways.
    return {widget()->minimumSizeHint().width() + verticalScrollBar()->sizeHint().width(), kSmallestHeight};
}

void AccountPage::askAgain()
{
    if (m_account)
        m_password->askForStatus();
}

void AccountPage::showAccount(const OpenAccount &account, KAAListPlugin *plugin)
{
    const bool isAnother = !isShown(nameOf(*account.shown));
    if (isAnother)
        saveDescription();
    m_account = account.shown;
    m_defaultDescription = plugin ? plugin->defaultAccountDescription() : QString();
    if (isAnother)
        verticalScrollBar()->setValue(0);
    showHeader(plugin);
    m_applications->showAccount(account.shown, account.forPlugin, plugin);
    if (isAnother)
        putApplicationsIntoFocusChain();
    m_password->showAccount(nameOf(*m_account), m_account->providerAttributeForKey(kPasswordReferenceKey));
    showDetails(plugin);
}

void AccountPage::putApplicationsIntoFocusChain()
{
    // Their table is made for each account, and so comes last of all by itself.
    QWidgetList inside;
    for (QWidget *next = m_applications->nextInFocusChain(); next != m_applications; next = next->nextInFocusChain()) {
        if (m_applications->isAncestorOf(next) && next->focusPolicy() != Qt::NoFocus)
            inside += next;
    }
    QWidget *previous = m_description;
    for (QWidget *widget : std::as_const(inside)) {
        setTabOrder(previous, widget);
        previous = widget;
    }
}

void AccountPage::showHeader(KAAListPlugin *plugin)
{
    const QString description = textOf(*m_account, KAMailAccountDescriptionKey);
    m_icon->setPixmap(accountIcon(plugin, m_account).pixmap(kIconSide));
    m_title->setText(description.isEmpty() ? m_account->loginName() : description);
    const QString provider = providerTitle(m_account->provider(), plugin);
    m_subtitle->setText(qtTrId("ACCOUNT_SUBTITLE").arg(provider, m_account->loginName()));
    m_enabled->setChecked(m_account->accountIsEnabled());
    if (!m_description->isModified()) {
        m_description->setText(description);
        m_description->setPlaceholderText(m_defaultDescription);
    }
}

void AccountPage::showDetails(KAAListPlugin *plugin)
{
    QList<Detail> details{{qtTrId("LOGIN_NAME_LABEL"), m_account->loginName()},
                          {qtTrId("FULL_NAME_LABEL"), m_account->fullName()},
                          {qtTrId("EMAIL_ADDRESS_LABEL"), textOf(*m_account, KAMailEmailAddressKey)},
                          {qtTrId("PROVIDER_LABEL"), providerTitle(m_account->provider(), plugin)},
                          {qtTrId("SERVICES_LABEL"), namesOfServices(plugin)},
                          {qtTrId("UID_LABEL"), m_account->uid()}};
    details.removeIf([](const Detail &detail) { return detail.value.isEmpty(); });
    if (details == m_shownDetails)
        return;  // new labels would be blank until the next layout
    m_shownDetails = details;
    while (m_details->rowCount() > 0)
        m_details->removeRow(0);
    for (const Detail &detail : std::as_const(details))
        m_details->addRow(detail.label, new TextLabel(detail.value));
}

void AccountPage::saveDescription()
{
    if (!m_description->isModified() || !m_account)
        return;
    m_description->setModified(false);
    const QString description = m_description->text().trimmed();
    const auto change = [description](KAAccount &account) {
        account.setProviderAttribute(description.isEmpty() ? QVariant() : description, KAMailAccountDescriptionKey);
    };
    // What was not saved stays in the field, and is tried again when the user leaves it the next time.
    const auto takeBack = [this, typed = m_description->text()] {
        if (m_description->isModified())
            return;
        m_description->setText(typed);
        m_description->setModified(true);
    };
    makeChange({nameOf(*m_account), qtTrId("SAVING_DESCRIPTION"), change, takeBack});
}

bool AccountPage::isShown(const AccountName &name) const
{
    return m_account && nameOf(*m_account) == name;
}

void AccountPage::makeChange(Change change)
{
    m_waiting.push_back(std::move(change));
    startChanges();
}

void AccountPage::startChanges()
{
    for (auto next = m_waiting.begin(); next != m_waiting.end();) {
        if (m_changing.contains(next->name)) {
            ++next;
            continue;
        }
        start(*next);
        next = m_waiting.erase(next);
    }
}

void AccountPage::start(const Change &change)
{
    m_changing += change.name;
    m_undertakings.start<ChangeResult>(
        change.sentence, this,
        [name = change.name, apply = change.apply](const CancelFlag &isCancelled) {
            return changeAccount(name, apply, isCancelled);
        },
        [this, name = change.name, takeBack = change.takeBack](const ChangeResult *result) {
            m_changing.removeOne(name);
            if (!result)
                std::erase_if(m_waiting, [&](const Change &waiting) { return waiting.name == name; });
            changeIsOver(name, result, takeBack);
            startChanges();
        });
}

void AccountPage::changeIsOver(const AccountName &name, const ChangeResult *result,
                               const std::function<void()> &takeBack)
{
    if (result && *result == ChangeResult::Saved)
        return;  // the registry's notification shows it
    if (result && *result == ChangeResult::NotSaved)
        emit failed(qtTrId("NOT_SAVED").arg(name.loginName));
    else if (result && *result == ChangeResult::NoAccount)
        emit failed(qtTrId("ACCOUNT_GONE").arg(name.loginName));
    if (isShown(name))
        takeBack();
}

}  // namespace kavell::pane
