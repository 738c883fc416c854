// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAViewController.h>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADescription.h>

#include "platform/qt/interface_file.h"
#include "platform/qt/log.h"

namespace {

const QString kInterfaceType = QStringLiteral("ui");

}  // namespace

KAViewController::KAViewController() = default;

KAViewController::~KAViewController() = default;

QWidget *KAViewController::view()
{
    return m_interface ? m_interface->root() : nullptr;
}

bool KAViewController::loadInterface(const QString &name, const std::shared_ptr<KABundle> &bundle)
{
    const std::shared_ptr<KABundle> owner = bundle ? bundle : KABundle::libraryBundle();
    QString reason;  // not told: whoever reads the log looks for the name
    m_interface = kavell::InterfaceFile::load(owner->pathForResource(name, kInterfaceType), &reason);
    if (!m_interface) {
        kavell::log(QStringLiteral("*** Couldn't load nib %1").arg(KADescription(name)));
        return false;
    }
    m_interface->connectActions(this);
    return true;
}

QWidget *KAViewController::widgetNamed(const QString &name, const QMetaObject &wanted) const
{
    if (!m_interface)
        return nullptr;
    auto *const widget = m_interface->view<QWidget>(name);
    if (widget && widget->metaObject()->inherits(&wanted))
        return widget;
    kavell::log(QStringLiteral("*** The interface of %1 has no %2 named %3")
                    .arg(className(), QString::fromLatin1(wanted.className()), name));
    return nullptr;
}
