// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// GLib's references as owning C++ types. Used inside the module.

#ifndef KAVELL_PLATFORM_SERVICES_GLIB_HANDLES_H
#define KAVELL_PLATFORM_SERVICES_GLIB_HANDLES_H

#include <gio/gio.h>
#include <memory>

namespace kavell {

template <auto release> struct Releaser {
    template <typename T> void operator()(T *object) const noexcept { release(object); }
};

template <typename T> using Owned = std::unique_ptr<T, Releaser<g_object_unref>>;
using OwnedVariant = std::unique_ptr<GVariant, Releaser<g_variant_unref>>;
using OwnedError = std::unique_ptr<GError, Releaser<g_error_free>>;
using OwnedContext = std::unique_ptr<GMainContext, Releaser<g_main_context_unref>>;
using OwnedText = std::unique_ptr<char, Releaser<g_free>>;

/// A connection shared by several users.
using SharedConnection = std::shared_ptr<GDBusConnection>;

/// The calling thread's own main context while it waits for something, so that neither the host's main loop is needed
/// nor its sources run.
class PrivateContext {
public:
    PrivateContext() : m_context(g_main_context_new()) { g_main_context_push_thread_default(m_context.get()); }
    ~PrivateContext() { g_main_context_pop_thread_default(m_context.get()); }
    PrivateContext(const PrivateContext &) = delete;
    PrivateContext &operator=(const PrivateContext &) = delete;

    [[nodiscard]] GMainContext *get() const { return m_context.get(); }

private:
    OwnedContext m_context;
};

}  // namespace kavell

#endif
