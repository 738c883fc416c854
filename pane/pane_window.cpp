// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/pane_window.h"

#include <chrono>

#include <QtGui/QShortcut>
#include <QtWidgets/QApplication>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QSplitter>
#include <QtWidgets/QVBoxLayout>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>

#include "pane/account_list.h"
#include "pane/account_page.h"
#include "pane/adding.h"
#include "pane/application_section.h"
#include "pane/notice_bar.h"
#include "pane/progress_strip.h"
#include "pane/provider_looks.h"
#include "pane/removal.h"

namespace kavell::pane {

namespace {

constexpr QSize kSize{880, 640};
constexpr int kListWidth = 280;
constexpr qreal kTitleScale = 1.4;  // of the text around it
// Longer than anything that the event loop does for layout.
constexpr std::chrono::milliseconds kSettling{100};
constexpr int kEmptyPageWidth = 420;

}  // namespace

PaneWindow::PaneWindow(QWidget *parent)
    : QMainWindow(parent), m_registry(m_undertakings), m_list(new AccountList),
      m_add(new QPushButton(qtTrId("ADD_ACCOUNT"))), m_remove(new QPushButton(qtTrId("REMOVE_ACCOUNT"))),
      m_notice(new NoticeBar), m_pages(new QStackedWidget), m_blankPage(new QWidget), m_emptyPage(makeEmptyPage()),
      m_accountPage(new AccountPage(m_undertakings)), m_adding(new Adding(m_registry, m_undertakings, this))
{
    setWindowTitle(qtTrId("PANE_TITLE"));
    auto *const splitter = new QSplitter;
    splitter->addWidget(makeLeftSide());
    splitter->addWidget(makeRightSide());
    splitter->setStretchFactor(1, 1);
    splitter->setSizes({kListWidth, kSize.width() - kListWidth});
    splitter->setChildrenCollapsible(false);
    auto *const central = new QWidget;
    auto *const layout = new QVBoxLayout(central);
    layout->addWidget(splitter, 1);
    layout->addWidget(new ProgressStrip(m_undertakings));
    setCentralWidget(central);
    resize(kSize);
    makeShortcuts();

    connect(m_list, &AccountList::selected, this, &PaneWindow::open);
    connect(&m_registry, &AccountRegistry::read, this, &PaneWindow::accountsWereRead);
    connect(&m_registry, &AccountRegistry::notRead, this, &PaneWindow::accountsWereNotRead);
    const auto tell = [this](const QString &sentence) {
        m_notice->showNotice(sentence);
    };
    connect(m_accountPage, &AccountPage::failed, this, tell);
    connect(m_accountPage, &AccountPage::changed, &m_registry, &AccountRegistry::reload);
    connect(m_adding, &Adding::failed, this, tell);
    connect(m_adding, &Adding::added, this, &PaneWindow::accountWasAdded);
    m_settling.setInterval(kSettling);
    connect(this, &PaneWindow::shown, &m_settling, qOverload<>(&QTimer::start));
    connect(&m_settling, &QTimer::timeout, this, [this] {
        if (!m_undertakings.sentence().isNull())
            return;
        m_settling.stop();
        disconnect(this, &PaneWindow::shown, &m_settling, nullptr);
        emit settled();
    });
    m_registry.reload();
}

PaneWindow::~PaneWindow()
{
    // Children tell this window and its members on their way out.
    delete m_adding;
    delete takeCentralWidget();
}

QWidget *PaneWindow::makeLeftSide()
{
    m_list->setObjectName(QStringLiteral("accounts"));
    m_add->setObjectName(QStringLiteral("addAccount"));
    m_remove->setObjectName(QStringLiteral("removeAccount"));
    m_remove->setEnabled(false);
    connect(m_add, &QPushButton::clicked, m_adding, &Adding::begin);
    connect(m_remove, &QPushButton::clicked, this, &PaneWindow::removeSelected);
    auto *const buttons = new QHBoxLayout;
    buttons->addWidget(m_add);
    buttons->addWidget(m_remove);
    auto *const side = new QWidget;
    auto *const layout = new QVBoxLayout(side);
    layout->setContentsMargins({});
    layout->addWidget(m_list, 1);
    layout->addLayout(buttons);
    return side;
}

QWidget *PaneWindow::makeRightSide()
{
    m_pages->addWidget(m_blankPage);
    m_pages->addWidget(m_emptyPage);
    m_pages->addWidget(m_accountPage);
    auto *const side = new QWidget;
    auto *const layout = new QVBoxLayout(side);
    layout->setContentsMargins({});
    layout->addWidget(m_notice);
    layout->addWidget(m_pages, 1);
    return side;
}

QWidget *PaneWindow::makeEmptyPage()
{
    auto *const title = new QLabel(qtTrId("EMPTY_TITLE"));
    QFont large = title->font();
    large.setPointSizeF(large.pointSizeF() * kTitleScale);
    title->setFont(large);
    title->setAlignment(Qt::AlignCenter);
    auto *const explanation = new QLabel(qtTrId("EMPTY_EXPLANATION"));
    explanation->setWordWrap(true);
    explanation->setAlignment(Qt::AlignCenter);
    explanation->setMaximumWidth(kEmptyPageWidth);
    auto *const add = new QPushButton(qtTrId("ADD_FIRST_ACCOUNT"));
    add->setObjectName(QStringLiteral("addFirstAccount"));
    connect(add, &QPushButton::clicked, this, [this] { m_adding->begin(); });
    auto *const page = new QWidget;
    auto *const layout = new QVBoxLayout(page);
    layout->addStretch();
    for (QWidget *widget :
         {static_cast<QWidget *>(title), static_cast<QWidget *>(explanation), static_cast<QWidget *>(add)})
        layout->addWidget(widget, 0, Qt::AlignHCenter);
    layout->addStretch();
    return page;
}

void PaneWindow::makeShortcuts()
{
    connect(new QShortcut(QKeySequence::New, this), &QShortcut::activated, m_adding, &Adding::begin);
    connect(new QShortcut(QKeySequence::Refresh, this), &QShortcut::activated, &m_registry, &AccountRegistry::reload);
    connect(new QShortcut(QKeySequence::Quit, this), &QShortcut::activated, this, &QWidget::close);
    auto *const remove = new QShortcut(QKeySequence::Delete, m_list);
    remove->setContext(Qt::WidgetShortcut);
    connect(remove, &QShortcut::activated, this, &PaneWindow::removeSelected);
}

void PaneWindow::selectWhenRead(const QString &loginName)
{
    m_wanted = loginName;
}

void PaneWindow::accountsWereRead()
{
    m_list->showAccounts(m_registry.groups());
    if (m_registry.groups().isEmpty()) {
        m_pages->setCurrentWidget(m_emptyPage);
        emit shown();
        return;
    }
    if (!m_selectAfterAdding.isNull() && m_list->selectAccount(m_selectAfterAdding))
        m_selectAfterAdding = {};
    for (const AccountGroup &group : m_registry.groups()) {
        if (!m_wanted.isNull() && m_list->selectAccount({group.providerType, m_wanted}))
            m_wanted = QString();
    }
    if (m_list->selectedAccount().isNull())
        m_list->selectFirst();
    else
        open(m_list->selectedAccount());  // again, since it may have changed
}

void PaneWindow::accountsWereNotRead()
{
    m_notice->showNotice(qtTrId("ACCOUNTS_NOT_READ"), qtTrId("TRY_AGAIN"), [this] { m_registry.reload(); });
}

void PaneWindow::open(const AccountName &name)
{
    m_remove->setEnabled(!name.isNull());
    if (name.isNull())
        return;
    m_undertakings.start<OpenAccount>(
        qtTrId("OPENING_ACCOUNT").arg(name.loginName), this,
        [name](const CancelFlag &) {
            return OpenAccount{openAccount(name), openAccount(name)};
        },
        [this, name](const OpenAccount *account) {
            // Another one may have been selected meanwhile, or this one removed.
            if (account && account->shown && account->forPlugin && m_list->selectedAccount() == name)
                showOpened(name, *account);
        });
}

void PaneWindow::showOpened(const AccountName &name, const OpenAccount &account)
{
    const AccountGroup *const group = m_registry.groupOf(name);
    KAAListPlugin *const plugin = group ? group->plugin : nullptr;
    const bool isAnother = !m_accountPage->account() || !account.shown->isEqual(*m_accountPage->account());
    if (plugin && isAnother)
        plugin->willSelectAccount(account.shown);
    m_accountPage->showAccount(account, plugin);
    m_pages->setCurrentWidget(m_accountPage);
    if (m_added && m_added->name == name)
        switchPickedApplicationsOn();
    emit shown();
}

void PaneWindow::removeSelected()
{
    const std::shared_ptr<KAAccount> account = m_accountPage->account();
    const AccountName name = m_list->selectedAccount();
    if (!account || name.isNull() || account->loginName() != name.loginName || account->provider() != name.providerType)
        return;
    const AccountGroup *const group = m_registry.groupOf(name);
    auto *const removal = new Removal(account, group ? group->plugin : nullptr, m_undertakings, this);
    connect(removal, &Removal::failed, this, [this](const QString &sentence) { m_notice->showNotice(sentence); });
    removal->begin();
}

void PaneWindow::accountWasAdded(const AddedAccount &account)
{
    m_added = std::make_unique<AddedAccount>(account);
    m_selectAfterAdding = account.name;
    if (account.wasThere) {
        m_notice->showNotice(qtTrId("ACCOUNT_WAS_THERE").arg(account.name.loginName));
    } else if (!account.duplicates.isEmpty()) {
        const AccountName other = account.duplicates.first().name;
        const AccountGroup *const group = m_registry.groupOf(other);
        m_notice->showNotice(qtTrId("LIKELY_DUPLICATE")
                                 .arg(account.name.loginName, other.loginName,
                                      providerTitle(other.providerType, group ? group->plugin : nullptr)),
                             qtTrId("SHOW_OTHER_ACCOUNT"), [this, other] { m_list->selectAccount(other); });
    }
    m_registry.reload();
}

void PaneWindow::switchPickedApplicationsOn()
{
    const std::unique_ptr<AddedAccount> added = std::move(m_added);
    for (const std::shared_ptr<KAApplication> &application : added->applications)
        m_accountPage->applications().setEnabled(true, application);
}

}  // namespace kavell::pane
