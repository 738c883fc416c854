// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A fresh plug-in manager for each test of searching and loading, and directories of its own, named by the real
// variable, which hold links to the bundles that the build makes or bundles that the test describes itself.

#ifndef KAVELL_TESTS_PLUGINS_LOADING_FIXTURE_H
#define KAVELL_TESTS_PLUGINS_LOADING_FIXTURE_H

#include <string>

#include <gtest/gtest.h>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QStringList>
#include <QtCore/QTemporaryDir>

#include <kavellaccounts/KAPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "tests/support/log_capture.h"
#include "tests/support/process.h"

namespace kavell::test {

inline const QString kBundles = QStringLiteral(KAVELL_TEST_BUNDLES);
inline const QString kExampleID = QStringLiteral("com.corvane.examplelist.kaplugin");

class Loading : public testing::Test {
protected:
    ~Loading() override { qunsetenv("VESK_FRAMEWORK_PATH"); }

    static void search(const QString &path) { qputenv("VESK_FRAMEWORK_PATH", path.toUtf8()); }

    /// A directory below the scratch one.
    QString directory(const QString &name)
    {
        const QString path = scratch.filePath(name);
        QDir().mkpath(path);
        return path;
    }

    /// Links a bundle of the build at a place.
    static void link(const QString &bundle, const QString &place)
    {
        ASSERT_TRUE(QFile::link(kBundles + '/' + bundle, place));
    }

    /// Makes a bundle whose code has all classes of troubled_plugin.cpp. The entries are the XML of its information
    /// dictionary but for the executable.
    static void makeBundle(const QString &path, const std::string &entries,
                           const std::string &executable = "libWorking.so")
    {
        const QString code = QStringLiteral("Contents/Linux-" KAVELL_TEST_ARCHITECTURE);
        writeFile((path + "/Contents/Info.plist").toStdString(),
                  "<plist version=\"1.0\"><dict><key>KABundleExecutable</key><string>" + executable + "</string>" +
                      entries + "</dict></plist>");
        ASSERT_TRUE(QFile::link(kBundles + "/Working/Working.kaplugin/" + code, path + '/' + code));
    }

    /// The entries of a bundle that is in order, of the given principal class.
    static std::string entries(const std::string &identifier, const std::string &principalClass = "Working",
                               const std::string &version = "<integer>1</integer>")
    {
        return "<key>KABundleIdentifier</key><string>" + identifier + "</string><key>KAPluginVersion</key>" + version +
               "<key>KABundlePrincipalClass</key><string>" + principalClass + "</string>";
    }

    /// The identifiers of all plug-ins, sorted.
    QStringList identifiers()
    {
        QStringList found;
        for (const KAPlugin *plugin : manager.allPlugins())
            found += plugin->identifier();
        found.sort();
        return found;
    }

    const QTemporaryDir scratch;
    KAPluginManager manager;
    const LogCapture log;
};

}  // namespace kavell::test

#endif
