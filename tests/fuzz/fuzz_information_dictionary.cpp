// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A bundle whose information dictionary is any bytes: it is a bundle when the bytes are a dictionary, answers texts or
// nothing, is no plug-in that loads, whatever it says, and its values can be stored again.

#include <fstream>

#include <fcntl.h>
#include <sys/stat.h>

#include <QtCore/QtGlobal>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "platform/qt/value_conversion.h"
#include "plugins/information_dictionary.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

void dropMessage(QtMsgType, const QMessageLogContext &, const QString &)
{
}

/// One bundle, in a directory of its own, that each input describes anew.
class BundleInMaking {
public:
    BundleInMaking() : m_path(m_directory.path() + "/Fuzzed.kaplugin")
    {
        std::filesystem::create_directories(m_path + "/Contents");
        qInstallMessageHandler(dropMessage);
    }

    [[nodiscard]] QString path() const { return QString::fromStdString(m_path); }
    [[nodiscard]] QString informationPath() const { return path() + QLatin1String("/Contents/Info.plist"); }

    /// The file gets a time of its own each time: many of one length are written within one tick of the clock.
    void describe(std::string_view information)
    {
        const std::string file = m_path + "/Contents/Info.plist";
        std::ofstream(file, std::ios::binary) << information;
        ++m_time.tv_sec;
        const timespec times[] = {m_time, m_time};
        require(utimensat(AT_FDCWD, file.c_str(), times, 0) == 0, "a file can be given a time");
    }

private:
    const kavell::fuzz::ScratchDirectory m_directory;
    const std::string m_path;
    timespec m_time{};
};

/// The text of a key, as a reader who knows nothing of bundles finds it.
QString textIn(const QVariantMap &information, const char *key)
{
    const QVariant value = information.value(QString::fromLatin1(key));
    return value.metaType() == QMetaType::fromType<QString>() ? value.toString() : QString();
}

bool areSame(const QString &one, const QString &other)
{
    return one == other && one.isNull() == other.isNull();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static BundleInMaking making;
    making.describe(kavell::fuzz::textOf(data, size));
    const auto bundle = KABundle::bundleWithPath(making.path());
    const auto information = kavell::readPropertyList(making.informationPath());
    require(static_cast<bool>(bundle) == information.has_value(),
            "what has a dictionary is a bundle, and nothing else");
    require(!KAPluginManager::shared()->createKAPluginAtPath(making.path()), "a bundle without code makes no plug-in");
    if (!bundle)
        return 0;
    require(bundle->infoDictionary() == *information, "a bundle that has changed is read again");
    const auto stored = kavell::toStoreDictionary(*information);
    require(stored && kavell::toVariantMap(stored->get()) == *information, "what comes out of a file goes into one");
    require(areSame(bundle->bundleIdentifier(), textIn(*information, "KABundleIdentifier")),
            "an identifier is the text that is there");
    const QString executable = textIn(*information, "KABundleExecutable");
    require(executable.isEmpty() ? bundle->executablePath().isNull() : bundle->executablePath().endsWith(executable),
            "an executable is named by the text that is there");

    const KAPlugin plugin(bundle);
    const QString name = textIn(*information, "KABundleName");
    require(areSame(plugin.userVisibleProviderName(), name.isNull() ? bundle->bundleIdentifier() : name),
            "a plug-in goes by its name, else by its identifier");
    return 0;
}
