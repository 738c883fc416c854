// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Turns an account on and off for client applications. The application holds an account of its own, the child; the
// online account remembers the child's settings, and the application is on while it has a child that is not inactive.
// On means: activate the child, or have the application's data plug-in make one. Off means: deactivate it, so that what
// the application has kept for it is there when it is turned on again.
//
// What to take from it: nothing here blocks the user interface. Data plug-ins and the password are asked on a worker
// thread, one order after the other, so that "on" and "off" clicked in turn end as the last click wants. The online
// account itself is changed and committed on the user-interface thread, where hosts remove accounts: one that was removed
// meanwhile is not brought back. Whatever came of an order, KAChangedAccountsNotification tells hosts that it has ended.
// User-interface thread only.

#ifndef EXAMPLES_ZORBO_PLUGIN_APPLICATIONSWITCH_H
#define EXAMPLES_ZORBO_PLUGIN_APPLICATIONSWITCH_H

#include <memory>

#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QQueue>
#include <QtCore/QThreadPool>
#include <QtCore/QVariantMap>
#include <QtWidgets/QWidget>

class KAAListPlugin;
class KAAccount;
class KAApplication;
class KADataPlugin;

class ApplicationSwitch : public QObject {
    Q_OBJECT

public:
    /// Takes its texts from the plug-in's bundle, and is its child.
    explicit ApplicationSwitch(KAAListPlugin *plugin);

    /// Waits for the order that is being carried out.
    ~ApplicationSwitch() override;

    /// Returns at once. Problems are shown over the window, if it is there by then.
    void turn(bool on, const std::shared_ptr<KAApplication> &application, const std::shared_ptr<KAAccount> &account,
              QWidget *window);

private:
    struct Order {
        bool on = false;
        std::shared_ptr<KAApplication> application;
        std::shared_ptr<KAAccount> account;
        QPointer<QWidget> window;
        bool wasStored = false;  // whether the account's file was there when the order came
        QString childUID;        // what the account said of its child then; null when it had none
    };

    /// What the worker thread did.
    struct Outcome {
        QString childUID;      // null when there is no child
        QVariantMap settings;  // of the child, as the application has them now; empty when it does not say
        QString problem;       // null when all went well
    };

    void startNext();
    [[nodiscard]] Outcome carryOut(const Order &order) const;
    [[nodiscard]] Outcome turnOn(const Order &order, KADataPlugin *dataPlugin) const;
    [[nodiscard]] Outcome turnOff(const Order &order, KADataPlugin *dataPlugin) const;
    void finish(const Order &order, const Outcome &outcome);
    void turnOffAgain(const Order &order, const QString &childUID);
    void end(const Order &order);
    void remember(const Order &order, const Outcome &outcome) const;
    void showProblem(QWidget *window, const QString &sentence) const;
    [[nodiscard]] QString text(const char *key) const;

    KAAListPlugin *const m_plugin;
    QQueue<Order> m_orders;  // the first is being carried out
    QThreadPool m_worker;
};

#endif
