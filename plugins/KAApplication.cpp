// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAApplication.h>

#include <array>
#include <optional>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>

#include "platform/qt/workspace.h"
#include "plugins/data_names.h"

namespace {

constexpr int kSortValueOfOthers = 1000;

/// What is fixed for each client application.
struct ApplicationRow {
    const QString &bundleID;
    int sortValue;
    const QString &pluginID;
    const char *dataNameKey;
};

const std::array<ApplicationRow, 4> kApplications{{
    {kKAMailAppID, 100, kKAMailPluginID, "MAIL_DATA_NAME"},
    {kKACardellAppID, 200, kKAContactsPluginID, "CD_DATA_NAME"},
    {kKATidewellAppID, 300, kKACalendarPluginID, "CALENDAR_DATA_NAME"},
    {kKAParlexAppID, 400, kKAChatPluginID, "PARLEX_DATA_NAME"},
}};

const ApplicationRow *rowOf(const QString &bundleID)
{
    for (const ApplicationRow &row : kApplications) {
        if (row.bundleID == bundleID)
            return &row;
    }
    return nullptr;
}

}  // namespace

QString kavell::dataNameKey(const QString &appBundleID)
{
    const ApplicationRow *const row = rowOf(appBundleID);
    return row ? QString::fromLatin1(row->dataNameKey) : QString();
}

std::shared_ptr<KAApplication> KAApplication::initWithBundleID(const QString &bundleID)
{
    return std::shared_ptr<KAApplication>(new KAApplication(bundleID));
}

KAApplication::KAApplication(const QString &bundleID) : _bundleID(bundleID), _userInfo(std::make_shared<QVariantMap>())
{
}

KAApplication::~KAApplication() = default;

QString KAApplication::bundleID() const
{
    const std::lock_guard lock(m_mutex);
    return _bundleID;
}

void KAApplication::setBundleID(const QString &bundleID)
{
    const std::lock_guard lock(m_mutex);
    _bundleID = bundleID;
}

QString KAApplication::displayName() const
{
    const std::lock_guard lock(m_mutex);
    return _displayName;
}

void KAApplication::setDisplayName(const QString &displayName)
{
    const std::lock_guard lock(m_mutex);
    _displayName = displayName;
}

QString KAApplication::imagePath() const
{
    const std::lock_guard lock(m_mutex);
    return _imagePath;
}

void KAApplication::setImagePath(const QString &imagePath)
{
    const std::lock_guard lock(m_mutex);
    _imagePath = imagePath;
}

std::shared_ptr<QVariantMap> KAApplication::userInfo() const
{
    const std::lock_guard lock(m_mutex);
    return _userInfo;
}

void KAApplication::setUserInfo(std::shared_ptr<QVariantMap> userInfo)
{
    // The former dictionary goes after the lock is given back: what it held may ask this application.
    const std::lock_guard lock(m_mutex);
    _userInfo.swap(userInfo);
}

bool KAApplication::enabled() const
{
    const std::lock_guard lock(m_mutex);
    return _enabled;
}

void KAApplication::setEnabled(bool enabled)
{
    const std::lock_guard lock(m_mutex);
    _enabled = enabled;
}

int KAApplication::sortValue() const
{
    const ApplicationRow *const row = rowOf(bundleID());
    return row ? row->sortValue : kSortValueOfOthers;
}

QString KAApplication::displayNameForData() const
{
    return KABundle::libraryBundle()->localizedString(kavell::dataNameKey(bundleID()));
}

QImage KAApplication::image()
{
    const QString path = imagePath();
    const std::lock_guard lock(m_mutex);
    if (_image.isNull() && !path.isNull())
        _image = QImage(path);
    return _image.isNull() ? kavell::genericApplicationIcon() : _image;
}

QString KAApplication::associatedPluginID() const
{
    const ApplicationRow *const row = rowOf(bundleID());
    return row ? row->pluginID : QString();
}

void KAApplication::describeFields(KAFieldList &fields) const
{
    const std::lock_guard lock(m_mutex);
    fields.add("_bundleID", _bundleID);
    fields.add("_displayName", _displayName);
    fields.add("_imagePath", _imagePath);
    fields.add("_image", _image);
    fields.add("_userInfo", _userInfo ? std::optional(*_userInfo) : std::nullopt);
    fields.add("_enabled", _enabled);
    KAObject::describeFields(fields);
}
