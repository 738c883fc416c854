// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How the network managers that honour accepted certificates hear of a new acceptance. Any thread emits; a queued
// connection reaches each manager on its own thread.

#ifndef KAVELL_UI_ACCEPTANCE_NEWS_H
#define KAVELL_UI_ACCEPTANCE_NEWS_H

#include <QtCore/QObject>

namespace kavell {

class AcceptanceNews : public QObject {
    Q_OBJECT

signals:
    void changed();
};

}  // namespace kavell

#endif
