// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Somebody who owns the Secret Service's name and is none. The argument says how it answers: "wrong-types" with a number
// whatever was asked, "nothing" with an empty reply, "crowd" with 50,000 items that do not exist when asked about,
// "heavy" with one item whose secret has 8 MiB and no text, "chatter" with 50,000 signals in place of a reply. Runs
// until it is killed.

#include <string>
#include <string_view>
#include <vector>

#include <gio/gio.h>

namespace {

std::string behaviour;

GVariant *crowdOfPaths(int count)
{
    GVariantBuilder paths;
    g_variant_builder_init(&paths, G_VARIANT_TYPE_OBJECT_PATH_ARRAY);
    for (int index = 0; index < count; ++index)
        g_variant_builder_add(&paths, "o", ("/org/freedesktop/secrets/collection/c/" + std::to_string(index)).c_str());
    return g_variant_new("(@ao@ao)", g_variant_builder_end(&paths), g_variant_new_objv(nullptr, 0));
}

GVariant *heavySecret()
{
    const std::vector<char> bytes(8 << 20, '\xff');
    return g_variant_new("((o@ay@ays))", "/session", g_variant_new_fixed_array(G_VARIANT_TYPE_BYTE, "", 0, 1),
                         g_variant_new_fixed_array(G_VARIANT_TYPE_BYTE, bytes.data(), bytes.size(), 1), "text/plain");
}

GVariant *attributesOfNobody()
{
    GVariantBuilder attributes;
    g_variant_builder_init(&attributes, G_VARIANT_TYPE("a{ss}"));
    return g_variant_new("(v)", g_variant_builder_end(&attributes));
}

/// The body of the reply to a method; none when the answer is an error.
GVariant *bodyFor(std::string_view method)
{
    if (behaviour == "wrong-types")
        return g_variant_new("(u)", 42U);
    if (method == "SearchItems")
        return crowdOfPaths(behaviour == "crowd" ? 50000 : 1);
    if (behaviour == "crowd")
        return nullptr;
    if (method == "OpenSession")
        return g_variant_new("(vo)", g_variant_new_string(""), "/session");
    if (method == "GetSecret")
        return heavySecret();
    return method == "Get" ? attributesOfNobody() : g_variant_new("()");
}

void chatter(GDBusConnection *connection, GDBusMessage *call)
{
    for (int index = 0; index < 50000; ++index)
        g_dbus_connection_emit_signal(connection, g_dbus_message_get_sender(call), "/org/freedesktop/secrets",
                                      "org.freedesktop.Secret.Prompt", "Completed", g_variant_new("(s)", "nonsense"),
                                      nullptr);
}

/// Takes every call before the toolkit looks at it.
GDBusMessage *takeCall(GDBusConnection *connection, GDBusMessage *message, gboolean isIncoming, gpointer)
{
    if (!isIncoming || g_dbus_message_get_message_type(message) != G_DBUS_MESSAGE_TYPE_METHOD_CALL)
        return message;
    if (behaviour == "chatter") {
        chatter(connection, message);
    } else {
        GVariant *body = behaviour == "nothing" ? nullptr : bodyFor(g_dbus_message_get_member(message));
        GDBusMessage *reply = body || behaviour == "nothing"
                                  ? g_dbus_message_new_method_reply(message)
                                  : g_dbus_message_new_method_error_literal(
                                        message, "org.freedesktop.DBus.Error.UnknownObject", "no such object");
        if (body)
            g_dbus_message_set_body(reply, body);
        g_dbus_connection_send_message(connection, reply, G_DBUS_SEND_MESSAGE_FLAGS_NONE, nullptr, nullptr);
        g_object_unref(reply);
    }
    g_object_unref(message);
    return nullptr;
}

void connected(GDBusConnection *connection, const char *, gpointer)
{
    g_dbus_connection_add_filter(connection, takeCall, nullptr, nullptr);
}

}  // namespace

int main(int count, char **words)
{
    behaviour = count > 1 ? words[1] : "nothing";
    GMainLoop *loop = g_main_loop_new(nullptr, FALSE);
    g_bus_own_name(G_BUS_TYPE_SESSION, "org.freedesktop.secrets", G_BUS_NAME_OWNER_FLAGS_NONE, connected, nullptr,
                   nullptr, nullptr, nullptr);
    g_main_loop_run(loop);
    return 0;
}
