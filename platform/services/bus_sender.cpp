// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/bus_sender.h"

#include "platform/services/session_bus.h"

namespace kavell {

namespace {

constexpr const char *kObjectPath = "/com/corvane/KavellAccounts";
constexpr const char *kInterface = "com.corvane.KavellAccounts";
constexpr const char *kSignal = "Posted";

// The worker may wait this long for a bus; what is posted meanwhile queues.
constexpr std::chrono::seconds kConnectBound{5};

struct ToVariant {
    GVariant *operator()(const std::string &text) const { return g_variant_new_string(text.c_str()); }
    GVariant *operator()(int64_t number) const { return g_variant_new_int64(number); }
    GVariant *operator()(uint64_t number) const { return g_variant_new_uint64(number); }
    GVariant *operator()(double number) const { return g_variant_new_double(number); }
    GVariant *operator()(bool truth) const { return g_variant_new_boolean(truth); }
};

GVariant *argumentsOf(const BusSignal &signal)
{
    GVariantBuilder information;
    g_variant_builder_init(&information, G_VARIANT_TYPE_VARDICT);
    for (const auto &[key, value] : signal.information)
        g_variant_builder_add(&information, "{sv}", key.c_str(), std::visit(ToVariant{}, value));
    return g_variant_new("(ssa{sv})", signal.name.c_str(), signal.object.c_str(), &information);
}

class SessionBusSender final : public BusSender {
public:
    [[nodiscard]] bool send(const BusSignal &signal) override
    {
        return connect() && g_dbus_connection_emit_signal(m_connection.get(), nullptr, kObjectPath, kInterface, kSignal,
                                                          argumentsOf(signal), nullptr);
    }

    void flush() override
    {
        if (m_connection && !g_dbus_connection_is_closed(m_connection.get()))
            g_dbus_connection_flush_sync(m_connection.get(), nullptr, nullptr);
    }

private:
    bool connect()
    {
        if (m_connection && !g_dbus_connection_is_closed(m_connection.get()))
            return true;
        m_connection.reset();
        return connectToSessionBus(Deadline(kConnectBound), m_connection) == BusState::connected;
    }

    SharedConnection m_connection;
};

}  // namespace

BusSender *makeBusSender()
{
    return new SessionBusSender;
}

}  // namespace kavell
