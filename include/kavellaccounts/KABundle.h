// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A bundle: a directory that carries loadable code with its information and resources.
//
//     Example.kaplugin/Contents/Info.plist                        information dictionary, an XML property list
//     Example.kaplugin/Contents/Linux-x86_64/libExample.so        code, named by "KABundleExecutable"
//     Example.kaplugin/Contents/Resources/                        interface files, images, "domains.plist"
//     Example.kaplugin/Contents/Resources/Localizable_en.qm       string table of a language, looked up by key
//     Example.kaplugin/Contents/Resources/InfoPlist_en.qm         localised values of the information dictionary
//
// Keys of the information dictionary: "KABundleIdentifier", "KABundleName", "KABundleExecutable",
// "KABundlePrincipalClass", "KABundleIconFile" and, for plug-ins, "KAPluginVersion". Any thread may ask.

#ifndef KAVELLACCOUNTS_KABUNDLE_H
#define KAVELLACCOUNTS_KABUNDLE_H

#include <memory>

#include <QtCore/QString>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAError.h>
#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAPlugin;

class KAVELL_ACCOUNTS_EXPORT KABundle : public KAObject {
public:
    /// The bundle at a path; null when there is no readable information dictionary. One that has not changed on the
    /// disk is not parsed again. Reads the disk.
    [[nodiscard]] static std::shared_ptr<KABundle> bundleWithPath(const QString &path);

    /// The library's own resources and string table.
    [[nodiscard]] static std::shared_ptr<KABundle> libraryBundle();

    ~KABundle() override;

    [[nodiscard]] QString bundlePath() const;

    /// "KABundleIdentifier"; null when missing or no text.
    [[nodiscard]] QString bundleIdentifier() const;
    [[nodiscard]] QVariantMap infoDictionary() const;

    /// A value of the information dictionary in the user's language, where the bundle has one; else null.
    [[nodiscard]] QString localizedInfoForKey(const QString &key) const;

    /// The text of a key in the user's language, else in English. Without a translation: `value`, or the key itself
    /// when `value` is null or empty. Null for a null key.
    [[nodiscard]] QString localizedString(const QString &key, const QString &value = {}) const;

    /// The path of a resource file "NAME.TYPE"; null when there is none.
    [[nodiscard]] QString pathForResource(const QString &name, const QString &type) const;

    /// The path of the code, which need not exist; null when the information dictionary names none.
    [[nodiscard]] QString executablePath() const;

    /// Loads the code, once; never unloads it. False, with the reason in `error`, when that fails. Runs the code's
    /// static initialisers.
    bool load(KAError *error = nullptr);

    /// A new object of the bundle's principal class, made by the factory that KA_EXPORT_PLUGIN exports; the caller
    /// owns it. Null when the code is not loaded, names no class, or exports no factory for it, or the factory answers
    /// null. What the factory throws comes through.
    [[nodiscard]] std::unique_ptr<KAPlugin> makePrincipalObject(const std::shared_ptr<KABundle> &self);

    void describeFields(KAFieldList &fields) const override;

private:
    struct Contents;
    explicit KABundle(std::shared_ptr<Contents> contents);
    std::shared_ptr<Contents> m_contents;
};

#endif
