// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/pane_window.h"

#include <algorithm>
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
#include "pane/application_section.h"
#include "pane/background.h"
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
// How long a page stays while another account is being opened. Opening seldom takes that long.
constexpr std::chrono::milliseconds kPageStays{300};
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
    // Before this object's undertakings go, which cancels what has not been done by then.
    letBackgroundWorkFinish();
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
    // From right to left, a splitter lays its first side out one pixel too far to the right, and cuts that off.
    layout->setContentsMargins(1, 0, 1, 0);
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
    auto *const add = new QPushButton(qtTrId("ADD_FIRST_ACCOUNT"));
    add->setObjectName(QStringLiteral("addFirstAccount"));
    connect(add, &QPushButton::clicked, this, [this] { m_adding->begin(); });
    // A label that wraps has its height by its width only where the layout does not shrink it.
    auto *const column = new QWidget;
    column->setMaximumWidth(kEmptyPageWidth);
    auto *const texts = new QVBoxLayout(column);
    texts->addStretch();
    texts->addWidget(title);
    texts->addWidget(explanation);
    texts->addWidget(add, 0, Qt::AlignHCenter);
    texts->addStretch();
    auto *const page = new QWidget;
    auto *const layout = new QHBoxLayout(page);
    layout->addWidget(column);
    page->setFocusProxy(add);
    return page;
}

void PaneWindow::makeShortcuts()
{
    connect(new QShortcut(QKeySequence::New, this), &QShortcut::activated, m_adding, &Adding::begin);
    auto *const refresh = new QShortcut(QKeySequence::Refresh, this);
    connect(refresh, &QShortcut::activated, &m_registry, &AccountRegistry::reload);
    connect(refresh, &QShortcut::activated, m_accountPage, &AccountPage::askAgain);
    connect(new QShortcut(QKeySequence::Quit, this), &QShortcut::activated, this, &QWidget::close);
    auto *const remove = new QShortcut(QKeySequence::Delete, m_list);
    remove->setContext(Qt::WidgetShortcut);
    connect(remove, &QShortcut::activated, this, &PaneWindow::removeSelected);
}

void PaneWindow::closeEvent(QCloseEvent *event)
{
    m_accountPage->saveDescription();
    QMainWindow::closeEvent(event);
}

void PaneWindow::selectWhenRead(const QString &loginName)
{
    m_wanted = loginName;
}

void PaneWindow::accountsWereRead()
{
    const bool removeHadFocus = focusWidget() == m_remove;
    m_list->showAccounts(m_registry.groups());
    if (m_registry.groups().isEmpty()) {
        showEmptyPage();
        return;
    }
    if (!m_selectAfterAdding.isNull())
        selectAdded(m_selectAfterAdding);
    for (const AccountGroup &group : m_registry.groups()) {
        if (!m_wanted.isNull() && m_list->selectAccount({group.providerType, m_wanted}))
            m_wanted = QString();
    }
    if (m_list->selectedAccount().isNull())
        m_list->selectFirst();
    else
        open(m_list->selectedAccount());  // again, since it may have changed
    if (removeHadFocus)
        m_remove->setFocus();  // lost while no account was selected
}

void PaneWindow::showEmptyPage()
{
    if (m_pages->currentWidget() != m_emptyPage) {
        m_pages->setCurrentWidget(m_emptyPage);
        m_emptyPage->setFocus();
    }
    emit shown();
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
    // Not for long under another account's name in the list.
    QTimer::singleShot(kPageStays, this, [this, name] {
        if (m_list->selectedAccount() == name && !m_accountPage->isShown(name))
            m_pages->setCurrentWidget(m_blankPage);
    });
    m_undertakings.start<OpenAccount>(
        qtTrId("OPENING_ACCOUNT").arg(name.loginName), this,
        [name](const CancelFlag &) {
            return OpenAccount{openAccount(name), openAccount(name)};
        },
        [this, name](const OpenAccount *account) {
            if (!(m_list->selectedAccount() == name))
                return;  // another one has been selected meanwhile
            if (!account)
                wasNotOpened(name);
            else if (account->shown && account->forPlugin)  // and not removed meanwhile
                showOpened(name, *account);
        });
}

void PaneWindow::wasNotOpened(const AccountName &name)
{
    if (!m_accountPage->isShown(name))
        m_pages->setCurrentWidget(m_blankPage);
    m_notice->showNotice(qtTrId("ACCOUNT_NOT_OPENED").arg(name.loginName), qtTrId("TRY_AGAIN"),
                         [this] { open(m_list->selectedAccount()); });
}

void PaneWindow::showOpened(const AccountName &name, const OpenAccount &account)
{
    const AccountGroup *const group = m_registry.groupOf(name);
    KAAListPlugin *const plugin = group ? group->plugin : nullptr;
    if (plugin && !m_accountPage->isShown(name))
        plugin->willSelectAccount(account.shown);
    m_accountPage->showAccount(account, plugin);
    m_pages->setCurrentWidget(m_accountPage);
    switchPickedApplicationsOn(name);
    emit shown();
}

void PaneWindow::removeSelected()
{
    const std::shared_ptr<KAAccount> account = m_accountPage->account();
    const AccountName name = m_list->selectedAccount();
    if (name.isNull() || !m_accountPage->isShown(name))
        return;
    const AccountGroup *const group = m_registry.groupOf(name);
    auto *const removal = new Removal(account, group ? group->plugin : nullptr, m_undertakings, this);
    connect(removal, &Removal::failed, this, [this](const QString &sentence) { m_notice->showNotice(sentence); });
    removal->begin();
}

void PaneWindow::accountWasAdded(const AddedAccount &account)
{
    m_added += account;
    if (m_selectAfterAdding.isNull())
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

void PaneWindow::selectAdded(const AccountName &name)
{
    m_selectAfterAdding = name;
    if (!m_list->selectAccount(name))
        return;
    m_selectAfterAdding = {};
    m_list->setFocus();
}

void PaneWindow::switchPickedApplicationsOn(const AccountName &name)
{
    const auto found = std::find_if(m_added.cbegin(), m_added.cend(),
                                    [&](const AddedAccount &account) { return account.name == name; });
    if (found == m_added.cend())
        return;
    const AddedAccount added = *found;
    m_added.erase(found);
    for (const std::shared_ptr<KAApplication> &application : added.applications)
        m_accountPage->applications().setEnabled(true, application);
    // A plug-in can make several accounts at once.
    if (!m_added.isEmpty())
        selectAdded(m_added.constFirst().name);
}

}  // namespace kavell::pane
