// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <QtCore/QCoreApplication>
#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QScopeGuard>
#include <QtCore/QThread>
#include <algorithm>
#include <dlfcn.h>
#include <memory>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "model/settings_reading.h"
#include "platform/qt/exception_text.h"
#include "platform/qt/log.h"
#include "plugins/plugin_search.h"

using Outcome = KAPluginManager::BundleReport::Outcome;

namespace {

constexpr int kMinimumVersion = 1;
const QString kVersionKey = QStringLiteral("KAPluginVersion");

/// Parts of a number count for nothing, so that no version below 1 passes by being rounded up.
qlonglong versionOf(const KABundle &bundle)
{
    return kavell::integerForKey(bundle.infoDictionary(), kVersionKey);
}

bool hasSupportedVersion(const KABundle &bundle, const QString &path)
{
    const qlonglong version = versionOf(bundle);
    if (version >= kMinimumVersion)
        return true;
    kavell::log(QStringLiteral("*** Unsupported plugin version: %1. Min version: %2. Found version: %3")
                    .arg(path, QString::number(kMinimumVersion), QString::number(version)));
    return false;
}

/// Lets the dynamic loader say why it does not take the code. The handle is of no use and is kept, since closing it
/// would run the code's destructors in the middle of things.
void logLoaderReason(const QString &executable)
{
    if (executable.isNull())
        return;
    dlopen(QFile::encodeName(executable).constData(), RTLD_NOW);
    if (const char *reason = dlerror())
        kavell::log(QStringLiteral("*** dlerror: ") + QString::fromLocal8Bit(reason));
}

/// The bundle's object; null with the error, and its lines in the log, when the code does not load, and without one when
/// the code makes no object.
std::unique_ptr<KAPlugin> makeObject(const std::shared_ptr<KABundle> &bundle, KAError &error)
{
    if (bundle->load(&error))
        return bundle->makePrincipalObject(bundle);
    kavell::log(QStringLiteral("*** Loading bundle at path %1 failed with error: %2\n%3")
                    .arg(bundle->bundlePath(), error.description(), KADescription(QVariant(error.userInformation()))));
    logLoaderReason(bundle->executablePath());
    return nullptr;
}

/// Registered plug-ins belong to the main thread, whichever thread asked for them first.
void moveToMainThread(QObject *plugin)
{
    const QCoreApplication *const application = QCoreApplication::instance();
    if (application && plugin->thread() != application->thread())
        plugin->moveToThread(application->thread());
}

}  // namespace

/// The directories of the search path, kept as long as the path stays the same.
struct KAPluginManager::Search {
    std::vector<std::string> paths;
    std::vector<std::shared_ptr<kavell::PluginDirectory>> directories;
    QStringList identifiersBeingLoaded;  ///< a plug-in may ask questions that search again while it is being made

    void follow(std::vector<std::string> newPaths)
    {
        if (newPaths == paths)
            return;
        paths = std::move(newPaths);
        directories.clear();
        for (const std::string &path : paths)
            directories.push_back(std::make_shared<kavell::PluginDirectory>(path));
    }
};

KAPluginManager::KAPluginManager() : m_search(std::make_unique<Search>())
{
    _plugins.reserve(16);
}

KAPluginManager::~KAPluginManager()
{
    qDeleteAll(_plugins);
}

void KAPluginManager::loadPlugins(const std::optional<QStringList> &identifiers)
{
    const std::lock_guard lock(m_registryLock);
    try {
        _loadPlugins(identifiers);
    } catch (...) {
        kavell::log(QStringLiteral("*** (In %1) Caught exception %2")
                        .arg(QLatin1String("-[KAPluginManager loadPlugins:]"), kavell::currentExceptionText()));
    }
}

void KAPluginManager::_loadPlugins(const std::optional<QStringList> &identifiers)
{
    if (identifiers && std::all_of(identifiers->begin(), identifiers->end(),
                                   [&](const QString &identifier) { return _plugins.contains(identifier); }))
        return;
    m_search->follow(kavell::pluginDirectories());
    // Held, because a plug-in that is being loaded may ask questions that search again, under another path even.
    const auto directories = m_search->directories;
    for (const auto &directory : directories) {
        try {
            directory->forEachUnsettledBundle([&](const std::string &path) {
                const Outcome outcome = loadBundle(QFile::decodeName(path.c_str()), identifiers).outcome;
                return outcome == Outcome::Registered || outcome == Outcome::Shadowed;
            });
        } catch (...) {
            kavell::log(QStringLiteral("*** Caught exception while loading plugin at path %1:%2")
                            .arg(QFile::decodeName(directory->path().c_str()), kavell::currentExceptionText()));
        }
    }
}

void KAPluginManager::_loadPluginAtPath(const QString &path, const std::optional<QStringList> &identifiers)
{
    const std::lock_guard lock(m_registryLock);
    (void)loadBundle(path, identifiers);
}

KAPluginManager::BundleReport KAPluginManager::loadBundle(const QString &path,
                                                          const std::optional<QStringList> &identifiers)
{
    const std::shared_ptr<KABundle> bundle = KABundle::bundleWithPath(path);
    if (!bundle)
        return {path, {}, Outcome::NoBundle, QStringLiteral("There is no readable Contents/Info.plist.")};
    const QString identifier = bundle->bundleIdentifier();
    if (identifier.isNull())
        return {path, {}, Outcome::NoIdentifier, QStringLiteral("Contents/Info.plist has no KABundleIdentifier.")};
    if (identifiers && !identifiers->contains(identifier))
        return {path, identifier, Outcome::NotLoaded, QStringLiteral("It was not asked for.")};
    if (const KAPlugin *registered = _plugins.value(identifier)) {
        const std::shared_ptr<KABundle> itsBundle = registered->bundle();  // which the plug-in may have let go of
        const QString registeredPath = itsBundle ? itsBundle->bundlePath() : QString();
        if (registeredPath == bundle->bundlePath())
            return {path, identifier, Outcome::Registered, {}};
        return {path, identifier, Outcome::Shadowed, QStringLiteral("%1 came first.").arg(registeredPath)};
    }
    if (m_search->identifiersBeingLoaded.contains(identifier))
        return {path, identifier, Outcome::NotLoaded, QStringLiteral("It is being loaded.")};
    if (!hasSupportedVersion(*bundle, path)) {
        return {path, identifier, Outcome::UnsupportedVersion,
                QStringLiteral("KAPluginVersion is %1; at least %2 is needed.")
                    .arg(versionOf(*bundle))
                    .arg(kMinimumVersion)};
    }
    m_search->identifiersBeingLoaded += identifier;
    const auto loaded = qScopeGuard([&] { m_search->identifiersBeingLoaded.removeOne(identifier); });
    KAError error;
    std::unique_ptr<KAPlugin> plugin = makeObject(bundle, error);
    if (!plugin) {
        kavell::log(QStringLiteral("*** Loading bundle at path %1 failed").arg(path));
        if (!error.isNull())
            return {path, identifier, Outcome::NotLoaded, error.description()};
        return {path, identifier, Outcome::NoObject,
                QStringLiteral("Its code makes no object of the class that KABundlePrincipalClass names.")};
    }
    plugin->pluginDidLoad();
    moveToMainThread(plugin.get());
    _plugins.insert(identifier, plugin.release());
    return {path, identifier, Outcome::Registered, {}};
}

std::unique_ptr<KAPlugin> KAPluginManager::_createPluginFromBundle(const std::shared_ptr<KABundle> &bundle)
{
    KAError error;
    return bundle ? makeObject(bundle, error) : nullptr;
}

std::unique_ptr<KAPlugin> KAPluginManager::createKAPluginAtPath(const QString &path)
{
    const std::shared_ptr<KABundle> bundle = KABundle::bundleWithPath(path);
    if (!bundle) {
        kavell::log(
            QStringLiteral("*** KAPluginManager couldn't create bundle from path: %1").arg(KADescription(path)));
        return nullptr;
    }
    if (bundle->bundleIdentifier().isNull() || !hasSupportedVersion(*bundle, path))
        return nullptr;
    return _createPluginFromBundle(bundle);
}

QList<KAPluginManager::BundleReport> KAPluginManager::surveyBundles()
{
    const std::lock_guard lock(m_registryLock);
    QList<BundleReport> reports;
    for (const std::string &path : kavell::pluginDirectories())
        surveyDirectory(path, reports);
    return reports;
}

void KAPluginManager::surveyDirectory(const std::string &path, QList<BundleReport> &reports)
{
    const QString shownPath = QFile::decodeName(path.c_str());
    if (!kavell::isSearchPathTaken(path)) {
        reports += {shownPath, {}, Outcome::DirectoryMissing, QStringLiteral("There is nothing at this path.")};
        return;
    }
    const std::optional<std::string> listed = kavell::listedDirectory(path);
    if (!listed) {
        reports += {shownPath,
                    {},
                    Outcome::DirectoryNotListed,
                    QStringLiteral("Its path has a character that a URL does not allow, such as a blank.")};
        return;
    }
    const QDir directory(QFile::decodeName(listed->c_str()));
    if (!directory.exists() || !directory.isReadable()) {
        reports += {shownPath, {}, Outcome::DirectoryNotListed, QStringLiteral("It cannot be listed.")};
        return;
    }
    const QStringList names =
        directory.entryList(QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot, QDir::Unsorted);
    for (const QString &name : names) {
        const QString bundlePath = directory.filePath(name);
        if (!name.endsWith(QLatin1String(".kaplugin"), Qt::CaseInsensitive))
            continue;
        if (!kavell::hasPluginExtension(name.toStdString())) {
            reports += {bundlePath, {}, Outcome::WrongExtension, QStringLiteral("The extension must be .kaplugin.")};
            continue;
        }
        try {
            reports += loadBundle(bundlePath, std::nullopt);
        } catch (...) {
            reports += {bundlePath,
                        {},
                        Outcome::Threw,
                        QStringLiteral("It threw: %1. The rest of the directory was given up.")
                            .arg(kavell::currentExceptionText())};
            return;
        }
    }
}
