// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ZorboPlugin.h"

#include <QtGui/QAccessible>
#include <QtWidgets/QLayout>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetMorpher.h>
#include <kavellaccounts/KASheetWindow.h>

#include "zorbo_images.h"

namespace {

// A build for trying things out can stand in for a provider type that the library knows.
#ifdef ZORBO_PROVIDER_TYPE
const QString kProviderType = QStringLiteral(ZORBO_PROVIDER_TYPE);
#else
const QString kProviderType = QStringLiteral("com.example.account.zorbo");
#endif

constexpr qsizetype kLongestArgument = 254;

/// What a web page wants to have filled in, without what no person would type.
QString argument(const QVariantMap &arguments, const QString &key)
{
    QString value = arguments.value(key).toString().left(kLongestArgument);
    value.removeIf([](QChar character) { return !character.isPrint(); });
    return value.trimmed();
}

/// An account with what is known of it. Reads its data file, if there is one.
std::shared_ptr<KAAccount> makeAccount(const QString &address, const QString &fullName, const QString &description)
{
    const auto account = KAAccount::accountWithProviderType(kProviderType, address);
    // One that is in the store already, which it is without anything to commit, is not to be changed.
    if (!account || !account->hasPendingChanges())
        return account;
    account->setProviderAttribute(address, KAMailEmailAddressKey);
    account->setProviderAttribute(description, KAMailAccountDescriptionKey);
    if (!fullName.isEmpty())
        account->setFullName(fullName);
    return account;
}

}  // namespace

ZorboPlugin::ZorboPlugin(std::shared_ptr<KABundle> bundle)
    : KAAListPlugin(std::move(bundle)), m_checker(std::make_unique<SignInChecker>(this)),
      m_switch(std::make_unique<ApplicationSwitch>(this))
{
    m_worker.setMaxThreadCount(1);
    connect(m_checker.get(), &SignInChecker::finished, this, &ZorboPlugin::signInChecked);
}

ZorboPlugin::~ZorboPlugin()
{
    m_worker.waitForDone();
    if (!_hostSheet)
        return;
    _hostSheet->disconnect(this);
    _hostSheet->setContentView(nullptr);  // the pages go before the sheet
}

/// The provider is known from here on; no widget is made yet, since this may not be the user-interface thread.
void ZorboPlugin::pluginDidLoad()
{
    const auto zorbo = KAProvider::initWithProviderType(kProviderType);
    zorbo->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCardDAV, kKAServiceCalDAV, kKAServiceIM});
    setProvider(zorbo);
}

std::shared_ptr<KAAccount> ZorboPlugin::accountFromSettings(const QVariantMap &settings)
{
    return makeAccount(settings.value(KAMailEmailAddressKey).toString(), settings.value(KAMailFullNameKey).toString(),
                       settings.value(KAMailAccountDescriptionKey, defaultAccountDescription()).toString());
}

QImage ZorboPlugin::imageForAccount(const std::shared_ptr<KAAccount> &)
{
    return zorboSign();
}

QImage ZorboPlugin::bannerImage() const
{
    return zorboBanner(brandName());
}

bool ZorboPlugin::canSignOutForAccount(const std::shared_ptr<KAAccount> &account) const
{
    return account && account->provider() == kProviderType;
}

void ZorboPlugin::createAccountInWindow(QWidget *window)
{
    createAccountInWindowWithWayfenArgs(window, {});
}

void ZorboPlugin::createAccountInWindowWithWayfenArgs(QWidget *window, const QVariantMap &arguments)
{
    if (!makePages())
        return;
    cancel(nullptr);  // a sheet that is still open
    m_signIn->setTitle(text("SIGN_IN_TITLE"));
    m_signIn->setAddressIsFixed(false);
    m_signIn->setAddress(argument(arguments, KAMailEmailAddressKey));
    m_signIn->setFullName(argument(arguments, KAMailFullNameKey));
    beginSheet(window);
}

void ZorboPlugin::signInAccount(const std::shared_ptr<KAAccount> &account, QWidget *window)
{
    if (!account || !makePages())
        return;
    cancel(nullptr);
    m_existing = account;
    m_signIn->setTitle(text("SIGN_IN_AGAIN_TITLE"));
    m_signIn->setAddressIsFixed(true);
    m_signIn->setAddress(account->loginName());
    beginSheet(window);
}

void ZorboPlugin::setEnabled(bool enabled, const std::shared_ptr<KAApplication> &application,
                             const std::shared_ptr<KAAccount> &account, QWidget *window)
{
    m_switch->turn(enabled, application, account, window);
}

/// Reads the interface file with the first sheet. False, with the reason in the log, when the bundle is incomplete.
bool ZorboPlugin::makePages()
{
    if (m_signIn)
        return true;
    if (!loadInterfaceFile(QStringLiteral("Sheet")) || !_validationView || !_appSelectionView || !_appTableContainer)
        return false;
    // The outlets are the base class's; what is this plug-in's own is found beside them.
    auto *const signInPage = _validationView->parentWidget()->findChild<QWidget *>(QStringLiteral("signInView"));
    for (QWidget *page : {signInPage, _validationView.data(), _appSelectionView.data()})
        translate(page);
    m_signIn = std::make_unique<SignInPage>(signInPage, [this](const QString &address) {
        return address.indexOf(u'@') > 0 && supportsDomain(KAExtras::emailHostName(address));
    });
    m_signIn->showPasswordField(shouldShowPasswordField());
    m_validationCancel = _validationView->findChild<QPushButton *>(QStringLiteral("validationCancel"));
    m_status = _validationView->findChild<QLabel *>(QStringLiteral("validationStatus"));
    m_appSelectionProblem = _appSelectionView->findChild<QLabel *>(QStringLiteral("appSelectionProblem"));
    m_appSelectionProblemIcon = _appSelectionView->findChild<QLabel *>(QStringLiteral("appSelectionProblemIcon"));
    return true;
}

/// Sets the texts whose keys stand in the interface file.
void ZorboPlugin::translate(QWidget *page) const
{
    for (QLabel *label : page->findChildren<QLabel *>()) {
        if (!label->text().isEmpty())
            label->setText(bundle()->localizedString(label->text()));
    }
    for (QAbstractButton *button : page->findChildren<QAbstractButton *>()) {
        if (!button->text().isEmpty())
            button->setText(bundle()->localizedString(button->text()));
    }
}

void ZorboPlugin::beginSheet(QWidget *window)
{
    ++m_attempt;
    m_signIn->setBanner(bannerImage(), brandName());  // in the colours that windows have now
    showView(m_signIn->view(), false);
    _hostSheet->setWindowTitle(brandName());
    connect(_hostSheet.get(), &QDialog::finished, this, &ZorboPlugin::endAttempt, Qt::UniqueConnection);
    _hostSheet->beginSheet(window);
    m_signIn->firstField()->setFocus();
}

/// Called when the sheet has ended, by whomever: nothing of it is left behind.
void ZorboPlugin::endAttempt(int returnCode)
{
    ++m_attempt;
    m_checker->cancel();
    m_signIn->clear();
    m_existing.reset();
    // What was added is posted after the end of the sheet.
    if (returnCode != QDialog::Accepted) {
        _provisionalAccount.reset();
        _appTableController.reset();
    }
}

/// Shows a page as wide as the widest one, so that the sheet does not jump from side to side, with the button that Return
/// presses and the keyboard where the user goes on.
void ZorboPlugin::showView(QWidget *view, bool animate)
{
    if (!m_signIn || !view || !view->layout()) {
        KAAListPlugin::showView(view, animate);
        return;
    }
    // A page that is not on the screen is not told of what became visible in it.
    view->layout()->invalidate();
    view->layout()->activate();
    int width = view->sizeHint().width();
    for (const QWidget *page : {m_signIn->view(), _validationView.data(), _appSelectionView.data()})
        width = std::max(width, page->sizeHint().width());
    const int height = view->hasHeightForWidth() ? view->heightForWidth(width) : view->sizeHint().height();
    view->resize(width, height);
    const quint64 attempt = m_attempt;
    KAAListPlugin::showView(view, animate);  // with an animation, events run in here
    if (attempt != m_attempt || _hostSheet->contentView() != view)
        return;

    QPushButton *const main = view == m_signIn->view()    ? m_signIn->continueButton()
                              : view == _appSelectionView ? _appSelectionOKButton.data()
                                                          : m_validationCancel.data();
    // The dialog learns of its default button only when that changes while it shows the button.
    main->setDefault(false);
    main->setDefault(true);
    view == m_signIn->view() ? m_signIn->firstField()->setFocus() : main->setFocus();
}

/// Whether the sheet shows the page. Its buttons' methods do nothing otherwise: not for a second press, while one page
/// turns into the next.
bool ZorboPlugin::isShown(const QWidget *page) const
{
    return page && _hostSheet && _hostSheet->isVisible() && _hostSheet->contentView() == page;
}

void ZorboPlugin::showStatus(const QString &sentence)
{
    m_status->setText(sentence);
    QAccessibleEvent news(m_status, QAccessible::Alert);
    QAccessible::updateAccessibility(&news);
    showValidationPanel(true);
}

void ZorboPlugin::continueButton(QObject *)
{
    if (!isShown(m_signIn ? m_signIn->view() : nullptr) || !m_signIn->isComplete())
        return;
    m_checker->check(m_signIn->address(), m_signIn->password());
    showStatus(text("STATUS_SIGNING_IN").arg(m_signIn->address()));
}

void ZorboPlugin::signInChecked(SignInChecker::Outcome outcome)
{
    switch (outcome) {
    case SignInChecker::Outcome::Refused:
        refuse(text("ERROR_REFUSED").arg(m_signIn->address()), SignInPage::Field::Password);
        return;
    case SignInChecker::Outcome::NoAnswer:
        refuse(text("ERROR_NO_ANSWER"), SignInPage::Field::Address);
        return;
    case SignInChecker::Outcome::Accepted:
        m_existing ? storeNewPassword() : makeProvisionalAccount();
    }
}

/// Back to the first page with everything that was typed, and what is wrong with it.
void ZorboPlugin::refuse(const QString &sentence, SignInPage::Field field)
{
    m_signIn->setProblem(sentence, field);
    showView(m_signIn->view(), true);
}

void ZorboPlugin::makeProvisionalAccount()
{
    using Account = std::shared_ptr<KAAccount>;
    doForAttempt<Account>(
        [address = m_signIn->address(), fullName = m_signIn->fullName(), description = defaultAccountDescription()] {
            return makeAccount(address, fullName, description);
        },
        [this](const Account &account) {
            if (account && account->hasPendingChanges())
                showApplications(account);
            else
                refuse(text(account ? "ERROR_EXISTS" : "ERROR_NOT_SAVED").arg(m_signIn->address()),
                       SignInPage::Field::Address);
        });
}

void ZorboPlugin::showApplications(const std::shared_ptr<KAAccount> &account)
{
    _provisionalAccount = account;
    makeAppTable(account);
    _appTableController->selectAllApps();
    showProblem(m_appSelectionProblem, m_appSelectionProblemIcon, {});
    showAppSelectionPanel(true);
}

/// From the applications to what was typed: the validation is over, and there is nothing to see of it.
void ZorboPlugin::back(QObject *)
{
    if (!isShown(_appSelectionView))
        return;
    _provisionalAccount.reset();
    _appTableController.reset();
    showView(m_signIn->view(), true);
}

/// The password and the account's file are stored here and not left to whoever is told of the account: only here is the
/// password known. A host finds nothing left to commit.
void ZorboPlugin::addAccount(QObject *)
{
    if (!isShown(_appSelectionView) || !_provisionalAccount)
        return;
    doForAttempt<QString>(
        [account = _provisionalAccount, password = m_signIn->password(),
         problems = std::pair(text("ERROR_PASSWORD_NOT_STORED"), text("ERROR_NOT_SAVED").arg(m_signIn->address()))] {
            if (!password.isEmpty() && !account->setPassword(password))
                return problems.first;
            _CSKavellAccountCommitChanges(account->accountRef());
            return account->hasPendingChanges() ? problems.second : QString();
        },
        [this, account = _provisionalAccount](const QString &problem) { saved(account, problem); },
        [this, account = _provisionalAccount](const QString &) {
            // Cancelled while it was being saved.
            m_worker.start([account] {
                account->removePassword();
                _CSKavellAccountRemove(account->accountRef());
                _CSKavellAccountCommitChanges(account->accountRef());
            });
        });
    showStatus(text("STATUS_SAVING"));
}

void ZorboPlugin::saved(const std::shared_ptr<KAAccount> &account, const QString &problem)
{
    if (!problem.isNull()) {
        showProblem(m_appSelectionProblem, m_appSelectionProblemIcon, problem);
        showAppSelectionPanel(true);
        return;
    }
    provider()->addAccount(account);  // which has read its directory before there was this one
    KAAListPlugin::addAccount(nullptr);
    _provisionalAccount.reset();
    _appTableController.reset();
}

void ZorboPlugin::storeNewPassword()
{
    doForAttempt<bool>(
        [account = m_existing, password = m_signIn->password()] {
            const bool isStored = account->setPassword(password);
            _CSKavellAccountCommitChanges(account->accountRef());
            return isStored && !account->hasPendingChanges();
        },
        [this](bool isStored) {
            if (!isStored)
                refuse(text("ERROR_PASSWORD_NOT_STORED"), SignInPage::Field::Password);
            else
                _hostSheet->endSheet(QDialog::Accepted);
        });
    showStatus(text("STATUS_SAVING"));
}

template <typename Result>
void ZorboPlugin::doForAttempt(std::function<Result()> work, std::function<void(const Result &)> done,
                               std::function<void(const Result &)> undo)
{
    m_worker.start([this, attempt = m_attempt, work = std::move(work), done = std::move(done), undo = std::move(undo)] {
        const Result result = work();
        const auto comeBack = [this, attempt, result, done, undo] {
            if (attempt == m_attempt)
                done(result);
            else if (undo)
                undo(result);
        };
        QMetaObject::invokeMethod(this, comeBack, Qt::QueuedConnection);
    });
}

QString ZorboPlugin::text(const char *key) const
{
    return bundle()->localizedString(QLatin1String(key));
}

KA_EXPORT_PLUGIN(ZorboPlugin)
