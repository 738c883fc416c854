// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The controller's view and the creation of accounts. What is offered is found in
// KACrossAppSetupViewControllerDiscovery.cpp.

#include <kavellaccounts/KACrossAppSetupViewController.h>

#include <algorithm>

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtCore/QMetaMethod>
#include <QtCore/QThread>
#include <QtCore/QThreadPool>
#include <QtWidgets/QApplication>

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "platform/qt/log.h"

using Outcome = KACrossAppSetupViewController::ApplicationOutcome;

std::shared_ptr<KACrossAppSetupViewController>
KACrossAppSetupViewController::initWithSettings(const QVariantMap &settings, const QString &appBundleID)
{
    auto controller = initWithNibName(QStringLiteral("CrossAppSetup"), nullptr);
    controller->_settings = settings;
    controller->_appBundleID = appBundleID;
    return controller;
}

std::shared_ptr<KACrossAppSetupViewController>
KACrossAppSetupViewController::initWithNibName(const QString &nibName, const std::shared_ptr<KABundle> &bundle)
{
    return {new KACrossAppSetupViewController(nibName, bundle), letGo};
}

/// Deletes the controller where its widgets may be deleted, whichever thread drops the last reference.
void KACrossAppSetupViewController::letGo(KACrossAppSetupViewController *controller)
{
    const bool hasWidgets = controller->KAViewController::view();
    if (!hasWidgets || (QCoreApplication::instance() && QThread::currentThread() == controller->thread()))
        delete controller;
    else if (QCoreApplication::instance())
        controller->deleteLater();
    // Without the application object, the program is ending: widgets cannot be deleted any more and need not be.
}

KACrossAppSetupViewController::KACrossAppSetupViewController(const QString &nibName,
                                                             const std::shared_ptr<KABundle> &bundle)
{
    // Without a QApplication, making a widget would end the program.
    if (!qobject_cast<QApplication *>(QCoreApplication::instance())) {
        kavell::log(QStringLiteral("*** Couldn't load nib %1").arg(KADescription(nibName)));
        return;
    }
    if (!loadInterface(nibName, bundle))
        return;
    _view = outlet<QWidget>(QStringLiteral("view"));
    _checkbox1 = outlet<QCheckBox>(QStringLiteral("checkbox1"));
    _checkbox2 = outlet<QCheckBox>(QStringLiteral("checkbox2"));
    _checkbox3 = outlet<QCheckBox>(QStringLiteral("checkbox3"));
    for (QCheckBox *checkbox : checkboxes()) {
        connect(checkbox, &QCheckBox::toggled, this, [this, checkbox] { noteChoice(checkbox); });
        checkbox->installEventFilter(this);
    }
}

KACrossAppSetupViewController::~KACrossAppSetupViewController() = default;

QString KACrossAppSetupViewController::appBundleID() const
{
    const std::lock_guard lock(m_mutex);
    return _appBundleID;
}

void KACrossAppSetupViewController::setAppBundleID(const QString &appBundleID)
{
    const std::lock_guard lock(m_mutex);
    _appBundleID = appBundleID;
}

QVariantMap KACrossAppSetupViewController::settings() const
{
    const std::lock_guard lock(m_mutex);
    return _settings;
}

void KACrossAppSetupViewController::setSettings(const QVariantMap &settings)
{
    const std::lock_guard lock(m_mutex);
    _settings = settings;
}

QWidget *KACrossAppSetupViewController::view()
{
    if (!initDataIfNeeded())
        return nullptr;
    setUpCheckboxes();
    return _view;
}

/// The outlets that the interface has.
QList<QCheckBox *> KACrossAppSetupViewController::checkboxes() const
{
    QList<QCheckBox *> checkboxes{_checkbox1, _checkbox2, _checkbox3};
    checkboxes.removeAll(nullptr);
    return checkboxes;
}

void KACrossAppSetupViewController::setUpCheckboxes()
{
    QList<QCheckBox *> unused = checkboxes();
    for (QCheckBox *checkbox : unused)
        checkbox->hide();
    _checkboxes.clear();
    QList<Choice> choices;
    for (const Destination &destination : destinations()) {
        const std::shared_ptr<KAApplication> application = _apps.value(destination.appBundleID);
        if (!application)
            continue;
        if (unused.isEmpty()) {
            if (_view)
                kavell::log(QStringLiteral("*** No check box is left for %1").arg(destination.appBundleID));
            continue;
        }
        QCheckBox *const checkbox = unused.takeFirst();
        const bool isThere = _accountIsEnabledForApp(destination.appBundleID);
        checkbox->show();
        checkbox->setText(application->displayNameForData());
        checkbox->setChecked(true);
        checkbox->setEnabled(!isThere);
        _checkboxes.insert(destination.appBundleID, checkbox);
        choices.append({destination.appBundleID, true, !isThere});
    }
    const std::lock_guard lock(m_mutex);
    m_choices = choices;
}

bool KACrossAppSetupViewController::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::EnabledChange)
        noteChoice(qobject_cast<QCheckBox *>(watched));
    return KAViewController::eventFilter(watched, event);
}

/// Keeps what the check box says where the worker can read it. It could not ask the check box, nor have the main thread
/// ask it: a program that ends waits on the main thread for its workers. And the window may be closed by then.
void KACrossAppSetupViewController::noteChoice(QCheckBox *checkbox)
{
    const QString appBundleID = _checkboxes.key(checkbox);
    const std::lock_guard lock(m_mutex);
    for (Choice &choice : m_choices) {
        if (choice.appBundleID != appBundleID)
            continue;
        choice.ticked = checkbox->isChecked();
        // Of its own: a view that is disabled as a whole while accounts are made still says which.
        choice.enabled = checkbox->isEnabledTo(checkbox->parentWidget());
    }
}

bool KACrossAppSetupViewController::createAccounts()
{
    return _createAccounts();
}

void KACrossAppSetupViewController::createAccountsWithDelegate(std::shared_ptr<QObject> delegate, const char *,
                                                               void *contextInfo)
{
    {
        const std::lock_guard lock(m_mutex);
        _delegate.swap(delegate);  // the former one goes after the lock is given back
        _contextInfo = contextInfo;
    }
    const bool hasApplication = QCoreApplication::instance();
    QThreadPool::globalInstance()->start([self = shared_from_this(), hasApplication]() mutable {
        const bool saved = self->_createAccounts();
        if (QCoreApplication *const application = QCoreApplication::instance()) {
            // The reference goes along, so that the last one is dropped on the main thread.
            QMetaObject::invokeMethod(
                application, [controller = std::move(self), saved] { controller->tellDelegate(saved); },
                Qt::QueuedConnection);
        } else if (!hasApplication) {
            self->tellDelegate(saved);
        }
        // Nobody is told once the application object is gone: the program is ending.
    });
}

void KACrossAppSetupViewController::tellDelegate(bool saved)
{
    std::shared_ptr<QObject> delegate;
    void *contextInfo = nullptr;
    {
        const std::lock_guard lock(m_mutex);
        delegate = _delegate;
        contextInfo = _contextInfo;
    }
    if (!delegate)
        return;
    const QMetaObject *const metaObject = delegate->metaObject();
    const QMetaMethod method =
        metaObject->method(metaObject->indexOfMethod("controllerDidSave(KACrossAppSetupViewController*,bool,void*)"));
    if (method.isValid())
        method.invoke(delegate.get(), Qt::DirectConnection, Q_ARG(KACrossAppSetupViewController *, this),
                      Q_ARG(bool, saved), Q_ARG(void *, contextInfo));
}

/// True whatever the single creations report, deliberately.
bool KACrossAppSetupViewController::_createAccounts()
{
    const auto run = std::make_shared<std::vector<Outcome>>();
    {
        const std::lock_guard lock(m_mutex);
        for (const Choice &choice : m_choices) {
            using State = Outcome::State;
            const State state = !choice.enabled ? State::AlreadyThere
                                : choice.ticked ? State::Waiting
                                                : State::NotTicked;
            run->push_back({.appBundleID = choice.appBundleID, .state = state});
        }
        m_latestRun = run;
    }
    for (Outcome &entry : *run) {
        if (entry.state != Outcome::State::Waiting)
            continue;
        setOutcome(entry, {.appBundleID = entry.appBundleID, .state = Outcome::State::InProgress});
        setOutcome(entry, _createAccountForApp(entry.appBundleID));
    }
    return true;
}

void KACrossAppSetupViewController::setOutcome(Outcome &entry, const Outcome &outcome) const
{
    const std::lock_guard lock(m_mutex);
    entry = outcome;
}

QList<Outcome> KACrossAppSetupViewController::applicationOutcomes() const
{
    const std::lock_guard lock(m_mutex);
    return m_latestRun ? QList<Outcome>(m_latestRun->begin(), m_latestRun->end()) : QList<Outcome>();
}

bool KACrossAppSetupViewController::isDestination(const QString &appBundleID)
{
    const auto &all = destinations();
    return std::any_of(all.begin(), all.end(), [&](const Destination &one) { return one.appBundleID == appBundleID; });
}

/// The candidates in the order in which they are offered.
const std::array<KACrossAppSetupViewController::Destination, 4> &KACrossAppSetupViewController::destinations()
{
    using Self = KACrossAppSetupViewController;
    static const std::array<Destination, 4> sDestinations{{
        {kKAMailAppID, &Self::_createMailAccount},
        {kKACardellAppID, &Self::_createCardellAccount},
        {kKATidewellAppID, &Self::_createTidewellAccount},
        {kKAParlexAppID, &Self::_createParlexAccount},
    }};
    return sDestinations;
}

Outcome KACrossAppSetupViewController::_createAccountForApp(const QString &appBundleID) const
{
    Outcome outcome{.appBundleID = appBundleID, .state = Outcome::State::Failed};
    for (const Destination &destination : destinations()) {
        if (destination.appBundleID == appBundleID)
            (this->*destination.create)(outcome);
    }
    return outcome;
}

void KACrossAppSetupViewController::_createMailAccount(Outcome &outcome) const
{
    createWith<KAMailAccountCreator>(kKAMailPluginID, outcome);
}

void KACrossAppSetupViewController::_createTidewellAccount(Outcome &outcome) const
{
    createWith<KATidewellAccountCreator>(kKACalendarPluginID, outcome);
}

void KACrossAppSetupViewController::_createCardellAccount(Outcome &outcome) const
{
    createWith<KACardellAccountCreator>(kKAContactsPluginID, outcome);
}

void KACrossAppSetupViewController::_createParlexAccount(Outcome &outcome) const
{
    createWith<KAParlexAccountCreator>(kKAChatPluginID, outcome);
}

template <typename Creator>
void KACrossAppSetupViewController::createWith(const QString &pluginID, Outcome &outcome) const
{
    KAPluginManager *const manager = KAPluginManager::shared();
    auto *const plugin = qobject_cast<KADataPlugin *>(manager->pluginWithIdentifier(pluginID));
    if (!plugin) {
        kavell::log(QStringLiteral("*** Couldn't find plugin %1").arg(pluginID));
        outcome.failureReason = QStringLiteral("The application's plug-in %1 is not installed.").arg(pluginID);
        return;
    }
    const QVariantMap accountSettings = settings();
    const auto creator = Creator::initWithSettings(accountSettings, plugin);
    creator->setCorvaneID(_possibleCorvaneIDForSettings(accountSettings));
    creator->setProvider(manager->providerOfType(providerID()));
    if (creator->create())
        outcome.state = Outcome::State::Done;
    outcome.accountUID = creator->createdAccountUID();
    outcome.failureReason = creator->failureReason();
    outcome.failureError = creator->failureError();
}

void KACrossAppSetupViewController::describeFields(KAFieldList &fields) const
{
    QVariantMap existing;
    for (auto entry = _existingAccounts.begin(); entry != _existingAccounts.end(); ++entry)
        existing.insert(entry.key(), entry.value());
    QVariantMap boxes;
    for (auto entry = _checkboxes.begin(); entry != _checkboxes.end(); ++entry)
        boxes.insert(entry.key(), KADescription(static_cast<const QObject *>(entry.value().data())));
    QVariantMap applications;
    for (auto entry = _apps.begin(); entry != _apps.end(); ++entry)
        applications.insert(entry.key(), entry.value()->description());
    fields.add("_appBundleID", appBundleID());
    fields.add("_settings", settings());
    {
        const std::lock_guard lock(m_mutex);
        fields.add("_delegate", _delegate);
        fields.add("_contextInfo", _contextInfo);
    }
    fields.add("_providerID", providerID());
    fields.add("_accountID", _accountID);
    fields.add("_existingAccounts", existing);
    fields.add("_checkboxes", boxes);
    fields.add("_apps", applications);
    fields.add("_view", _view);
    fields.add("_checkbox1", _checkbox1);
    fields.add("_checkbox2", _checkbox2);
    fields.add("_checkbox3", _checkbox3);
    KAViewController::describeFields(fields);
}
