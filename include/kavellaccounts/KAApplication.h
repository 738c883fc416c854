// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One client application as an account's list of applications shows it: name, icon, whether the user picked it. A value
// made on request; two requests answer two objects. Properties may be used from any thread; image belongs to the
// user-interface thread.

#ifndef KAVELLACCOUNTS_KAAPPLICATION_H
#define KAVELLACCOUNTS_KAAPPLICATION_H

#include <memory>
#include <mutex>

#include <QtCore/QString>
#include <QtCore/QVariantMap>
#include <QtGui/QImage>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAVELL_ACCOUNTS_EXPORT KAApplication : public KAObject {
public:
    [[nodiscard]] static std::shared_ptr<KAApplication> initWithBundleID(const QString &bundleID);
    ~KAApplication() override;

    [[nodiscard]] QString bundleID() const;
    void setBundleID(const QString &bundleID);
    [[nodiscard]] QString displayName() const;
    void setDisplayName(const QString &displayName);
    [[nodiscard]] QString imagePath() const;
    void setImagePath(const QString &imagePath);

    /// Storage for callers, shared by all who hold it; empty at first, null once set so.
    [[nodiscard]] std::shared_ptr<QVariantMap> userInfo() const;
    void setUserInfo(std::shared_ptr<QVariantMap> userInfo);

    /// Whether the user picked the application; false at first.
    [[nodiscard]] bool enabled() const;
    void setEnabled(bool enabled);

    /// Applications are shown in ascending order of this: mail 100, contacts 200, calendar 300, chat 400, others 1000.
    [[nodiscard]] int sortValue() const;

    /// What the library calls the application's data, in the user's language; null for an unknown application.
    [[nodiscard]] QString displayNameForData() const;

    /// The icon, read from imagePath once; a generic application icon when that fails, which is not kept. Never null.
    [[nodiscard]] QImage image();

    /// The data plug-in that serves the application; null for an unknown one.
    [[nodiscard]] QString associatedPluginID() const;

    void describeFields(KAFieldList &fields) const override;

protected:
    explicit KAApplication(const QString &bundleID);

private:
    mutable std::mutex m_mutex;
    QString _bundleID;
    QString _displayName;
    QString _imagePath;
    QImage _image;
    std::shared_ptr<QVariantMap> _userInfo;
    bool _enabled = false;
};

#endif
