// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The flow of every account creator: what the newer online service wants first, then discovery and creation by the data
// plug-in.

#include <kavellaccounts/KAAccountCreator.h>

#include <map>
#include <thread>

#include <QtCore/QCoreApplication>
#include <QtCore/QEventLoop>
#include <QtCore/QScopeGuard>
#include <QtCore/QThread>
#include <QtCore/QThreadPool>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KACertificatePanel.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/NBSShim.h>

#include "model/settings_reading.h"
#include "platform/qt/log.h"
#include "platform/qt/main_thread.h"
#include "platform/qt/value_conversion.h"

using kavell::toSecretString;
using kavell::toStoreString;

namespace {

/// What the newer online service and its alert call the kind of account that a data plug-in makes.
struct OnlineService {
    const QString &pluginID;
    const QString &serviceType;
    const char *constantName;
};

const OnlineService kOnlineServices[] = {
    {kKACalendarPluginID, kKAServiceCalDAV, "kNBServiceIDCalendars"},
    {kKAContactsPluginID, kKAServiceCardDAV, "kNBServiceIDContacts"},
};

const OnlineService *onlineServiceOf(const QString &pluginID)
{
    for (const OnlineService &service : kOnlineServices) {
        if (service.pluginID == pluginID)
            return &service;
    }
    return nullptr;
}

/// So that plug-ins can queue their messages by name.
void registerMessageTypes()
{
    qRegisterMetaType<KADataPlugin *>();
    qRegisterMetaType<std::shared_ptr<KAAccountSetupInput>>();
    qRegisterMetaType<std::shared_ptr<KAAccountSetupResult>>();
    qRegisterMetaType<std::shared_ptr<KAAccount>>();
    qRegisterMetaType<KAError>();
}

/// Which plug-ins creators are at work with, and on which thread. A plug-in reports to its one delegate: were there two
/// creators at a time, one would get the other's report, and the other none.
class PluginsAtWork {
public:
    enum class Answer { Taken, Busy, BusyBelow };

    /// Takes the plug-in unless it is at work, perhaps below the caller on its own thread, whose events it runs.
    Answer take(const KADataPlugin *plugin)
    {
        const std::lock_guard lock(m_mutex);
        const auto [entry, isNew] = m_turns.try_emplace(plugin, Turn{std::this_thread::get_id()});
        if (isNew)
            return Answer::Taken;
        return entry->second.thread == std::this_thread::get_id() ? Answer::BusyBelow : Answer::Busy;
    }

    /// The creator that took it has become its delegate: no message is under way to another one any more.
    void noteDelegate(const KADataPlugin *plugin)
    {
        const std::lock_guard lock(m_mutex);
        m_turns.at(plugin).isDelegate = true;
    }

    [[nodiscard]] bool servesItsDelegate(const KADataPlugin *plugin)
    {
        const std::lock_guard lock(m_mutex);
        const auto entry = m_turns.find(plugin);
        return entry != m_turns.end() && entry->second.isDelegate;
    }

    void giveBack(const KADataPlugin *plugin)
    {
        const std::lock_guard lock(m_mutex);
        m_turns.erase(plugin);
    }

private:
    struct Turn {
        std::thread::id thread;
        bool isDelegate = false;
    };

    std::mutex m_mutex;
    std::map<const KADataPlugin *, Turn> m_turns;
};

PluginsAtWork &pluginsAtWork()
{
    static PluginsAtWork sPlugins;
    return sPlugins;
}

/// Gives the calling thread's place in the global thread pool, if it has one, to another task while it waits for a
/// plug-in. Were it kept, a few creators could fill the pool, and a plug-in that works in the pool could never report.
class PlaceInPoolForOthers {
public:
    PlaceInPoolForOthers()
    {
        if (m_isInPool)
            QThreadPool::globalInstance()->releaseThread();
    }
    ~PlaceInPoolForOthers()
    {
        if (m_isInPool)
            QThreadPool::globalInstance()->reserveThread();
    }
    PlaceInPoolForOthers(const PlaceInPoolForOthers &) = delete;
    PlaceInPoolForOthers &operator=(const PlaceInPoolForOthers &) = delete;

private:
    const bool m_isInPool = QThreadPool::globalInstance()->contains(QThread::currentThread());
};

/// The events of the calling thread, for one that waits. Without sleeping between two looks, deliberately: a plug-in
/// reports by events on this thread's loop, by calls from other threads, or by both, and no single thing could be slept
/// on that wakes up for all of them. It gives way, though: on a busy machine whoever is to report would come to it later.
class EventsMeanwhile {
public:
    EventsMeanwhile()
    {
        if (QCoreApplication::instance())  // without which there must be no loop
            m_loop.emplace();
    }

    void run()
    {
        if (m_loop)
            m_loop->processEvents();
        std::this_thread::yield();
    }

private:
    std::optional<QEventLoop> m_loop;
};

}  // namespace

std::shared_ptr<KAAccountCreator> KAAccountCreator::initWithSettings(const std::optional<QVariantMap> &settings,
                                                                     KADataPlugin *plugin)
{
    return owned(new KAAccountCreator(settings, plugin));
}

KAAccountCreator::KAAccountCreator(const std::optional<QVariantMap> &settings, KADataPlugin *plugin)
    : _settings(settings), _plugin(plugin), m_pluginAddress(plugin)
{
    registerMessageTypes();
}

KAAccountCreator::~KAAccountCreator()
{
    letGoOfPlugin();
}

void KAAccountCreator::letGoOfPlugin()
{
    // To none, whoever the delegate is, but for another creator that is at work: it would wait for ever. One whose turn
    // has only just begun has yet to take this creator's place, to which messages come until it has.
    while (!_plugin.isNull() && !m_hasLetGo) {
        if (pluginsAtWork().take(m_pluginAddress) == PluginsAtWork::Answer::Taken) {
            if (!_plugin.isNull())
                _plugin->setDelegate(nullptr);
            pluginsAtWork().giveBack(m_pluginAddress);
            break;
        }
        // The plug-in itself is not asked: it may be in the midst of a question to the user.
        if (pluginsAtWork().servesItsDelegate(m_pluginAddress))
            break;
        std::this_thread::yield();
    }
    m_hasLetGo = true;
}

std::shared_ptr<KAProvider> KAAccountCreator::provider() const
{
    return _provider;
}

void KAAccountCreator::setProvider(std::shared_ptr<KAProvider> provider)
{
    _provider = std::move(provider);
}

QString KAAccountCreator::corvaneID() const
{
    return _corvaneID;
}

void KAAccountCreator::setCorvaneID(const QString &corvaneID)
{
    _corvaneID = corvaneID;
}

bool KAAccountCreator::create()
{
    const bool isQuillane = providerIs(kKAProviderQuillane);
    if (!_settings) {
        kavell::log(QStringLiteral("*** KAAccountCreator: _settings was nil"));
        return failed(QStringLiteral("There are no settings to make an account of."));
    }
    if (isQuillane) {
        if (!_warnAboutMigrationSyncIfNecessary()) {
            kavell::log(QStringLiteral("*** Canceled at migration/sync alert for plugin %1.")
                            .arg(KADescription(pluginIdentifier())));
            return failed(QStringLiteral("The user chose not to move to the online service."));
        }
        if (!_enableBrondelService())
            return failed(QStringLiteral("The account's name at the online service is not known."));
    }
    if (_plugin.isNull()) {
        kavell::log(QStringLiteral("*** KAAccountCreator: _plugin was nil"));
        return failed(QStringLiteral("The application has no plug-in."));
    }
    // Calendars and contacts are the online service's own work, which was switched on above.
    if (isQuillane && pluginIdentifier() != kKAMailPluginID)
        return true;

    const PlaceInPoolForOthers place;
    const std::shared_ptr<KAAccountSetupInput> input = _input();
    if (!waitForTurn())
        return false;
    const auto turnIsOver = qScopeGuard([this] { pluginsAtWork().giveBack(m_pluginAddress); });
    const std::shared_ptr<KAAccountSetupResult> result = discover(input);
    if (!result)
        return failed(QStringLiteral("The plug-in found nothing to make an account of."));
    KAError error;
    const QString uid = _plugin->createAccountForInput(input, result, &error);
    if (uid.isEmpty())
        return failed(QStringLiteral("The plug-in made no account of what it had found."), error);
    const std::lock_guard lock(m_mutex);
    m_createdAccountUID = uid;
    return true;
}

std::shared_ptr<KAAccountSetupResult> KAAccountCreator::discover(const std::shared_ptr<KAAccountSetupInput> &input)
{
    {
        // What a plug-in reported unasked is no report of this discovery.
        const std::lock_guard lock(m_mutex);
        _result.reset();
        m_failureReason = QString();
        m_failureError = {};
    }
    _waiting = true;
    const auto waitIsOver = qScopeGuard([this] { _waiting = false; });
    _plugin->setDelegate(this);
    pluginsAtWork().noteDelegate(m_pluginAddress);
    _plugin->startAccountSetupWithInput(input);
    waitForReport();
    const std::lock_guard lock(m_mutex);
    return _plugin.isNull() ? nullptr : _result;
}

bool KAAccountCreator::waitForTurn()
{
    EventsMeanwhile events;
    while (!_plugin.isNull() && !QCoreApplication::closingDown()) {
        const PluginsAtWork::Answer answer = pluginsAtWork().take(m_pluginAddress);
        if (answer == PluginsAtWork::Answer::Taken) {
            if (!_plugin.isNull())
                return true;
            pluginsAtWork().giveBack(m_pluginAddress);
            break;
        }
        if (answer == PluginsAtWork::Answer::BusyBelow)
            return failed(QStringLiteral("The plug-in is at work on another account, which this one would hold up."));
        events.run();
    }
    return failed(QStringLiteral("The plug-in or the program ended before the turn of this account came."));
}

void KAAccountCreator::waitForReport()
{
    EventsMeanwhile events;
    while (_waiting) {
        events.run();
        if (_plugin.isNull())
            endWait(QStringLiteral("The plug-in was destroyed while it looked for the account."));
        // Events come no more, and the end of the program waits for the threads of the pool.
        if (QCoreApplication::closingDown())
            endWait(QStringLiteral("The program ended while the plug-in looked for the account."));
    }
}

/// The first report decides, which may be on any thread.
void KAAccountCreator::endWait(const QString &reason, const KAError &error)
{
    {
        const std::lock_guard lock(m_mutex);
        if (!_result && m_failureReason.isNull()) {
            m_failureReason = reason;
            m_failureError = error;
        }
    }
    _waiting = false;
}

/// Keeps the reason unless there is a nearer one; false.
bool KAAccountCreator::failed(const QString &reason, const KAError &error)
{
    const std::lock_guard lock(m_mutex);
    if (m_failureReason.isNull()) {
        m_failureReason = reason;
        m_failureError = error;
    }
    return false;
}

QString KAAccountCreator::failureReason() const
{
    const std::lock_guard lock(m_mutex);
    return m_failureReason;
}

KAError KAAccountCreator::failureError() const
{
    const std::lock_guard lock(m_mutex);
    return m_failureError;
}

QString KAAccountCreator::createdAccountUID() const
{
    const std::lock_guard lock(m_mutex);
    return m_createdAccountUID;
}

std::shared_ptr<KAAccountSetupInput> KAAccountCreator::_input() const
{
    return nullptr;
}

QString KAAccountCreator::settingsText(const QString &key) const
{
    return _settings ? kavell::textForKey(*_settings, key) : QString();
}

bool KAAccountCreator::providerIs(const QString &providerType) const
{
    return _provider && _provider->providerType() == providerType;
}

KAAListPlugin *KAAccountCreator::accountListPlugin() const
{
    KAPluginManager *const manager = KAPluginManager::shared();
    const QString identifier = _provider ? manager->pluginIDForProviderID(_provider->providerType()) : QString();
    return identifier.isNull() ? nullptr : qobject_cast<KAAListPlugin *>(manager->pluginWithIdentifier(identifier));
}

void KAAccountCreator::fillIn(KAAccountSetupInput &input, const QString &descriptionKey) const
{
    input.setContinueThroughError(true);
    input.setAccountDescription(settingsText(descriptionKey));
    input.setPassword(settingsText(KAMailPasswordKey));
}

QString KAAccountCreator::pluginIdentifier() const
{
    return _plugin.isNull() ? QString() : _plugin->identifier();
}

/// Whether to go on: the account-list plug-in may ask the user first whether calendars or contacts shall move.
bool KAAccountCreator::_warnAboutMigrationSyncIfNecessary() const
{
    KAAListPlugin *const listPlugin = accountListPlugin();
    const OnlineService *const service = onlineServiceOf(pluginIdentifier());
    if (!listPlugin || !service)
        return true;
    bool goOn = false;  // also when the program ends before the user could be asked
    kavell::runOnMainThread([&] {
        goOn = !listPlugin->shouldShowMigrationSyncAlertForService(service->serviceType) ||
               listPlugin->showMigrationSyncAlertForService(service->serviceType);
    });
    return goOn;
}

/// Switches the plug-in's service of the account on, logging in first when that is needed and possible; what comes of
/// either is not looked at. False when the account has no name.
bool KAAccountCreator::_enableBrondelService()
{
    if (pluginIdentifier() == kKAMailPluginID)
        return true;
    if (_corvaneID.isNull())
        _corvaneID = settingsText(KAMailEmailAddressKey);
    if (_corvaneID.isNull())
        _corvaneID = settingsText(KAMailUserNameKey);
    if (_corvaneID.isNull()) {
        kavell::log(QStringLiteral("*** KAAccountCreator: couldn't determine Corvane ID"));
        return false;
    }
    const OnlineService *const service = onlineServiceOf(pluginIdentifier());
    const CSKavellStringRef serviceID = service ? NBSShimGetStringConst(service->constantName) : nullptr;
    const auto name = toStoreString(_corvaneID);
    const QString password = settingsText(KAMailPasswordKey);
    if (!NBSShimAccountIsLoggedIn(name.get()) && !password.isNull())
        static_cast<void>(NBSShimAccountLogin(name.get(), toSecretString(password).get()));
    if (serviceID)
        NBSShimServiceSetEnabled(name.get(), serviceID, true);
    return true;
}

void KAAccountCreator::pluginAccountSetupUpdate(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                                const QVariant &)
{
}

void KAAccountCreator::pluginAccountSetupDidFail(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                                 const KAError &error)
{
    endWait(QStringLiteral("The plug-in could not find the account."), error);
}

void KAAccountCreator::pluginAccountSetupDidFinish(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                                   const std::shared_ptr<KAAccountSetupResult> &result)
{
    {
        const std::lock_guard lock(m_mutex);
        if (!_result && m_failureReason.isNull())
            _result = result;
    }
    _waiting = false;
}

bool KAAccountCreator::pluginHandleCertificateError(KADataPlugin *, const KAError &error)
{
    const QString title = KABundle::libraryBundle()->localizedString(QStringLiteral("KAVELL_ACCOUNTS"));
    const bool trusted = KAShowCertificatePanelForError(error, title);
    if (!trusted)
        endWait(QStringLiteral("The server's certificate was not trusted."), error);
    return trusted;
}

void KAAccountCreator::pluginDidCreateAccountUID(KADataPlugin *, const QString &)
{
}

void KAAccountCreator::pluginDidDeleteAccountUID(KADataPlugin *, const QString &)
{
}

void KAAccountCreator::pluginDidChangeAccountUID(KADataPlugin *, const QString &)
{
}

void KAAccountCreator::pluginNbsAccountMigrationFinished(KADataPlugin *, const std::shared_ptr<KAAccount> &)
{
}

void KAAccountCreator::describeFields(KAFieldList &fields) const
{
    const std::lock_guard lock(m_mutex);
    fields.add("_settings", _settings);
    fields.add("_plugin", _plugin);
    fields.add("_result", _result);
    fields.add("_provider", _provider);
    fields.add("_corvaneID", _corvaneID);
    fields.add("_waiting", _waiting.load());
    KAObject::describeFields(fields);
}
