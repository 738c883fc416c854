// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "plugins/information_dictionary.h"

#include <QtCore/QFile>
#include <QtCore/QFileInfo>

#include <kavellaccounts/CSKavellPropertyList.h>
#include <kavellaccounts/Ref.h>

#include "platform/property_list_guard.h"
#include "platform/qt/value_conversion.h"

namespace kavell {

std::optional<QVariantMap> readPropertyList(const QString &path)
{
    QFile file(path);
    if (!QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly))
        return std::nullopt;
    if (file.size() > static_cast<qint64>(kLargestPropertyList))
        return std::nullopt;
    const QByteArray bytes = file.readAll();
    const auto dictionary =
        adopt(CSKavellPropertyListCreateDictionary(bytes.constData(), static_cast<size_t>(bytes.size())));
    if (!dictionary)
        return std::nullopt;
    return toVariantMap(dictionary.get());
}

}  // namespace kavell
