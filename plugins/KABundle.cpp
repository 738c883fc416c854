// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What is known of a bundle is kept once for each path and shared by all handles, and read again when the information
// dictionary has changed on the disk.

#include <kavellaccounts/KABundle.h>

#include <dlfcn.h>
#include <mutex>
#include <sys/stat.h>

#include <QtCore/QFile>
#include <QtCore/QHash>

#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAPlugin.h>

#include "model/settings_reading.h"
#include "platform/qt/string_table.h"
#include "plugins/information_dictionary.h"
#include "plugins/plugin_search.h"

namespace {

const QString kIdentifierKey = QStringLiteral("KABundleIdentifier");
const QString kExecutableKey = QStringLiteral("KABundleExecutable");
const QString kPrincipalClassKey = QStringLiteral("KABundlePrincipalClass");
const QString kLoadErrorDomain = QStringLiteral("KABundleErrorDomain");
const QString kLibraryResources = QStringLiteral(":/kavellaccounts");

enum LoadErrorCode { kNamesNoExecutable = 1, kLoaderRefused = 2 };

using kavell::textForKey;
using Factory = KAPlugin *(*)(const std::shared_ptr<KABundle> &);

/// Of a regular file; nothing for all else.
std::optional<kavell::FileIdentity> identityOfFile(const QString &path)
{
    struct stat status;
    if (stat(QFile::encodeName(path).constData(), &status) != 0 || !S_ISREG(status.st_mode))
        return std::nullopt;
    return kavell::FileIdentity::of(status);
}

}  // namespace

// The library's own code names its resources; a static library's linker would drop them otherwise.
static void makeLibraryResourcesAvailable()
{
    Q_INIT_RESOURCE(kavell_resources);
}

struct KABundle::Contents {
    Contents(QString bundlePath, QString resourceDirectory, QVariantMap info)
        : path(std::move(bundlePath)), resources(std::move(resourceDirectory)), information(std::move(info)),
          strings(resources, QStringLiteral("Localizable")),
          localizedInformation(resources, QStringLiteral("InfoPlist"))
    {
    }

    const QString path;
    const QString resources;
    const QVariantMap information;
    const kavell::StringTable strings;
    const kavell::StringTable localizedInformation;
    std::recursive_mutex loading;  // recursive: the code's static initialisers may ask for their own bundle
    void *handle = nullptr;
};

KABundle::KABundle(std::shared_ptr<Contents> contents) : m_contents(std::move(contents))
{
}

KABundle::~KABundle() = default;

std::shared_ptr<KABundle> KABundle::bundleWithPath(const QString &path)
{
    struct Known {
        kavell::FileIdentity identity;
        std::shared_ptr<Contents> contents;
    };
    static std::mutex mutex;
    static QHash<QString, Known> knownBundles;

    QString bundlePath = path;
    while (bundlePath.size() > 1 && bundlePath.endsWith(u'/'))
        bundlePath.chop(1);
    if (bundlePath.isEmpty())
        return nullptr;
    const QString informationPath = bundlePath + QLatin1String("/Contents/Info.plist");
    const std::optional<kavell::FileIdentity> identity = identityOfFile(informationPath);
    if (!identity)
        return nullptr;

    const std::lock_guard lock(mutex);
    Known &known = knownBundles[bundlePath];
    if (!known.contents || !(known.identity == *identity)) {
        std::optional<QVariantMap> information = kavell::readPropertyList(informationPath);
        if (!information) {
            knownBundles.remove(bundlePath);
            return nullptr;
        }
        known.identity = *identity;
        known.contents = std::make_shared<Contents>(bundlePath, bundlePath + QLatin1String("/Contents/Resources"),
                                                    std::move(*information));
    }
    return std::shared_ptr<KABundle>(new KABundle(known.contents));
}

std::shared_ptr<KABundle> KABundle::libraryBundle()
{
    makeLibraryResourcesAvailable();
    static const std::shared_ptr<KABundle> bundle(new KABundle(
        std::make_shared<Contents>(kLibraryResources, kLibraryResources,
                                   QVariantMap{{kIdentifierKey, QStringLiteral("com.corvane.kavellaccounts")}})));
    return bundle;
}

QString KABundle::bundlePath() const
{
    return m_contents->path;
}

QString KABundle::bundleIdentifier() const
{
    return textForKey(m_contents->information, kIdentifierKey);
}

QVariantMap KABundle::infoDictionary() const
{
    return m_contents->information;
}

QString KABundle::localizedInfoForKey(const QString &key) const
{
    return key.isNull() ? QString() : m_contents->localizedInformation.textForKey(key);
}

QString KABundle::localizedString(const QString &key, const QString &value) const
{
    if (key.isNull())
        return {};
    QString text = m_contents->strings.textForKey(key);
    if (!text.isNull())
        return text;
    return value.isEmpty() ? key : value;
}

QString KABundle::pathForResource(const QString &name, const QString &type) const
{
    if (name.isEmpty())
        return {};
    QString path = m_contents->resources + u'/' + name;
    if (!type.isEmpty())
        path += u'.' + type;
    return QFile::exists(path) ? path : QString();
}

QString KABundle::executablePath() const
{
    const QString name = textForKey(m_contents->information, kExecutableKey);
    if (name.isEmpty())
        return {};
    return m_contents->path + QLatin1String("/Contents/Linux-" KAVELL_ARCHITECTURE "/") + name;
}

bool KABundle::load(KAError *error)
{
    const std::lock_guard lock(m_contents->loading);
    if (m_contents->handle)
        return true;
    const auto refuse = [error](LoadErrorCode code, const QString &reason) {
        if (error)
            *error = KAError(kLoadErrorDomain, code, {{KAError::localizedDescriptionKey, reason}});
        return false;
    };
    const QString path = executablePath();
    if (path.isNull())
        return refuse(kNamesNoExecutable, QStringLiteral("The bundle's information dictionary names no executable."));
    m_contents->handle = dlopen(QFile::encodeName(path).constData(), RTLD_NOW | RTLD_LOCAL);
    if (!m_contents->handle) {
        const char *const reason = dlerror();
        return refuse(kLoaderRefused, reason ? QString::fromLocal8Bit(reason) : QStringLiteral("Unknown reason."));
    }
    return true;
}

std::unique_ptr<KAPlugin> KABundle::makePrincipalObject(const std::shared_ptr<KABundle> &self)
{
    const QString className = textForKey(m_contents->information, kPrincipalClassKey);
    Factory factory = nullptr;
    {
        const std::lock_guard lock(m_contents->loading);
        if (!m_contents->handle || className.isEmpty())
            return nullptr;
        const QByteArray symbol = "KAPluginFactory_" + className.toUtf8();
        factory = reinterpret_cast<Factory>(dlsym(m_contents->handle, symbol.constData()));
    }
    return std::unique_ptr<KAPlugin>(factory ? factory(self) : nullptr);
}

void KABundle::describeFields(KAFieldList &fields) const
{
    fields.add("_path", m_contents->path);
    KAObject::describeFields(fields);
}
