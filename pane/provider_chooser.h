// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Asks which kind of account to add. Deletes itself when it is closed. User-interface thread only.

#ifndef KAVELL_PANE_PROVIDER_CHOOSER_H
#define KAVELL_PANE_PROVIDER_CHOOSER_H

#include <QtCore/QList>
#include <QtWidgets/QDialog>
#include <QtWidgets/QListWidget>

class KAAListPlugin;

namespace kavell::pane {

class ProviderChooser : public QDialog {
    Q_OBJECT

public:
    /// `plugins` in the order of presentation; when there is none, the dialog says what to do.
    ProviderChooser(const QList<KAAListPlugin *> &plugins, QWidget *parent);

signals:
    void chosen(KAAListPlugin *plugin);

private:
    void choose();

    QList<KAAListPlugin *> m_plugins;
    QListWidget *m_list;
};

}  // namespace kavell::pane

#endif
