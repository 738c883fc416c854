// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/application_details.h"

#include <exception>

#include <QtGui/QPixmap>
#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/provider_looks.h"

namespace kavell::pane {

namespace {

constexpr int kIconSide = 48;

KADataPlugin *dataPluginOf(const KAApplication &application)
{
    return qobject_cast<KADataPlugin *>(
        KAPluginManager::shared()->pluginWithIdentifier(application.associatedPluginID()));
}

/// The UID by which the application knows its account; null when it has none here.
QString childUID(const KAAccount &account, const KAApplication &application)
{
    const auto child = account.childAccountWithPluginID(application.associatedPluginID());
    return child ? child->value(QStringLiteral("uid")).toString() : QString();
}

void configure(KADataPlugin *plugin, const QString &uid, QWidget *window)
{
    try {
        plugin->configureAccountUID(uid);
    } catch (const std::exception &error) {
        auto *const box = new QMessageBox(QMessageBox::Warning, qtTrId("PANE_TITLE"), pluginFailure(*plugin, error),
                                          QMessageBox::Ok, window);
        box->setAttribute(Qt::WA_DeleteOnClose);
        box->setTextFormat(Qt::PlainText);  // the plug-in's words are no markup
        box->open();
    }
}

}  // namespace

void showApplicationDetails(QWidget *window, const KAAccount &account, const KAAListPlugin &plugin,
                            const std::shared_ptr<KAApplication> &application)
{
    const QString data = plugin.displayNameForApplication(application);
    const QString name = application->displayName();
    auto *const box = new QMessageBox(window);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->setWindowTitle(qtTrId("PANE_TITLE"));
    box->setTextFormat(Qt::PlainText);
    box->setIconPixmap(QPixmap::fromImage(application->image())
                           .scaled(kIconSide, kIconSide, Qt::KeepAspectRatio, Qt::SmoothTransformation));
    const QString uid = childUID(account, *application);
    box->setText(uid.isNull() ? qtTrId("APPLICATION_WITHOUT_ACCOUNT").arg(name, data)
                              : qtTrId("APPLICATION_WITH_ACCOUNT").arg(name, data, account.loginName()));
    QPushButton *const close = box->addButton(qtTrId("CLOSE"), QMessageBox::RejectRole);
    box->setDefaultButton(close);
    KADataPlugin *const dataPlugin = dataPluginOf(*application);
    if (!dataPlugin) {
        box->setInformativeText(qtTrId("APPLICATION_NOT_INSTALLED").arg(name));
    } else if (!uid.isNull()) {
        QPushButton *const settings = box->addButton(qtTrId("APPLICATION_SETTINGS"), QMessageBox::ActionRole);
        QObject::connect(settings, &QPushButton::clicked, window,
                         [dataPlugin, uid, window] { configure(dataPlugin, uid, window); });
    }
    box->open();
}

}  // namespace kavell::pane
