// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A Secret Service that has one locked collection and a person in front of it, for what a keyring daemon without a
// display cannot show. "prompting_service silent" never gets an answer to its prompt, "dismiss" has it dismissed,
// "unlock" answered; "vanish" ends while it is shown, and a process number kills that process (the bus) meanwhile. Runs
// until it is killed. It ends with 3 when its prompt is told to go away by a call, which aborts real services, and with
// 4 when the asker leaves the bus.

#include <csignal>
#include <cstdlib>
#include <string>

#include <gio/gio.h>
#include <unistd.h>

namespace {

constexpr const char *kInterfaces = R"(
<node>
  <interface name="org.freedesktop.Secret.Service">
    <method name="ReadAlias"><arg type="s" direction="in"/><arg type="o" direction="out"/></method>
    <method name="Unlock">
      <arg type="ao" direction="in"/><arg type="ao" direction="out"/><arg type="o" direction="out"/>
    </method>
  </interface>
  <interface name="org.freedesktop.Secret.Collection"><property name="Locked" type="b" access="read"/></interface>
  <interface name="org.freedesktop.Secret.Prompt">
    <method name="Prompt"><arg type="s" direction="in"/></method>
    <method name="Dismiss"/>
    <signal name="Completed"><arg type="b"/><arg type="v"/></signal>
  </interface>
</node>)";

constexpr const char *kCollection = "/org/freedesktop/secrets/collection/only";
constexpr const char *kPrompt = "/org/freedesktop/secrets/prompt/p1";

std::string behaviour;
bool isLocked = true;

void askerGone(GDBusConnection *, const char *, const char *, const char *, const char *, GVariant *parameters,
               gpointer asker)
{
    const char *name = nullptr;
    const char *newOwner = nullptr;
    g_variant_get(parameters, "(&s&s&s)", &name, nullptr, &newOwner);
    if (static_cast<std::string *>(asker)->compare(name) == 0 && !*newOwner)
        _exit(4);
}

void complete(GDBusConnection *connection, const char *asker, bool isDismissed)
{
    isLocked = isDismissed;
    g_dbus_connection_emit_signal(connection, asker, kPrompt, "org.freedesktop.Secret.Prompt", "Completed",
                                  g_variant_new("(bv)", isDismissed, g_variant_new_string("")), nullptr);
}

/// Ends this service, or the bus whose process number was given, in front of the person.
void endDuringPrompt()
{
    const int bus = std::atoi(behaviour.c_str());
    if (bus > 1)
        kill(bus, SIGKILL);
    else
        _exit(0);
}

void called(GDBusConnection *connection, const char *sender, const char *, const char *, const char *method, GVariant *,
            GDBusMethodInvocation *invocation, gpointer)
{
    const std::string name = method;
    if (name == "ReadAlias")
        return g_dbus_method_invocation_return_value(invocation, g_variant_new("(o)", kCollection));
    if (name == "Unlock")
        return g_dbus_method_invocation_return_value(invocation,
                                                     g_variant_new("(@aoo)", g_variant_new_objv(nullptr, 0), kPrompt));
    if (name == "Dismiss")
        _exit(3);
    static std::string asker;
    asker = sender;
    g_dbus_connection_signal_subscribe(connection, "org.freedesktop.DBus", "org.freedesktop.DBus", "NameOwnerChanged",
                                       nullptr, sender, G_DBUS_SIGNAL_FLAGS_NONE, askerGone, &asker, nullptr);
    g_dbus_method_invocation_return_value(invocation, nullptr);
    if (behaviour == "unlock" || behaviour == "dismiss")
        complete(connection, sender, behaviour == "dismiss");
    else if (behaviour != "silent") {
        g_dbus_connection_flush_sync(connection, nullptr, nullptr);
        endDuringPrompt();
    }
}

GVariant *lockedProperty(GDBusConnection *, const char *, const char *, const char *, const char *, GError **, gpointer)
{
    return g_variant_new_boolean(isLocked);
}

void registerObjects(GDBusConnection *connection, const char *, gpointer)
{
    static const GDBusInterfaceVTable table = {called, lockedProperty, nullptr, {}};
    GDBusNodeInfo *interfaces = g_dbus_node_info_new_for_xml(kInterfaces, nullptr);
    const char *const paths[] = {"/org/freedesktop/secrets", kCollection, kPrompt};
    for (int index = 0; index < 3; ++index)
        g_dbus_connection_register_object(connection, paths[index], interfaces->interfaces[index], &table, nullptr,
                                          nullptr, nullptr);
}

}  // namespace

int main(int count, char **words)
{
    behaviour = count > 1 ? words[1] : "silent";
    GMainLoop *loop = g_main_loop_new(nullptr, FALSE);
    g_bus_own_name(G_BUS_TYPE_SESSION, "org.freedesktop.secrets", G_BUS_NAME_OWNER_FLAGS_NONE, registerObjects, nullptr,
                   nullptr, nullptr, nullptr);
    g_main_loop_run(loop);
    return 0;
}
