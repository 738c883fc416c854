/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * The same through the source registry of Evolution Data Server: one source is an account, whose values stand in its mail
 * account, authentication and WebDAV extensions. The service that keeps the sources is started by the bus. */

#include "bench/side_by_side/side.h"

#include <libedataserver/libedataserver.h>

const size_t valuesOfAccount = 4 + kServices * kFields;

static ESourceRegistry *registryOf(Registry *registry)
{
    return (ESourceRegistry *)registry;
}

static ESource *sourceOf(Account *account)
{
    return (ESource *)account;
}

static void require(gboolean holds, GError *error)
{
    if (!holds)
        fail(error ? error->message : "the source registry refused");
}

Registry *openRegistry(void)
{
    GError *error = NULL;
    ESourceRegistry *registry = e_source_registry_new_sync(NULL, &error);
    require(registry != NULL, error);
    return (Registry *)registry;
}

void closeRegistry(Registry *registry)
{
    g_object_unref(registryOf(registry));
    settle();
}

static void readAccount(ESource *source, Reading *reading)
{
    ESourceAuthentication *mail = e_source_get_extension(source, E_SOURCE_EXTENSION_AUTHENTICATION);
    takeText(reading, "login", e_source_authentication_get_user(mail));
    takeText(reading, "name", e_source_get_display_name(source));
    takeNumber(reading, "enabled", e_source_get_enabled(source));
    takeText(reading, "provider",
             e_source_backend_get_backend_name(e_source_get_extension(source, E_SOURCE_EXTENSION_MAIL_ACCOUNT)));
    takeText(reading, "host", e_source_authentication_get_host(mail));
    takeNumber(reading, "port", e_source_authentication_get_port(mail));
    takeText(reading, "method", e_source_authentication_get_method(mail));
    takeText(reading, "credentialName", e_source_authentication_get_credential_name(mail));
    takeText(reading, "proxy", e_source_authentication_get_proxy_uid(mail));
    takeNumber(reading, "remember", e_source_authentication_get_remember_password(mail));
    ESourceWebdav *calendar = e_source_get_extension(source, E_SOURCE_EXTENSION_WEBDAV_BACKEND);
    takeText(reading, "displayName", e_source_webdav_get_display_name(calendar));
    takeText(reading, "emailAddress", e_source_webdav_get_email_address(calendar));
    takeText(reading, "path", e_source_webdav_get_resource_path(calendar));
    takeText(reading, "query", e_source_webdav_get_resource_query(calendar));
    takeNumber(reading, "order", (int)e_source_webdav_get_order(calendar));
    takeNumber(reading, "schedule", e_source_webdav_get_calendar_auto_schedule(calendar));
    endAccount(reading);
}

/** The sources that every user has from the start are not among those with this extension. */
static GList *listSources(Registry *registry)
{
    return e_source_registry_list_sources(registryOf(registry), E_SOURCE_EXTENSION_WEBDAV_BACKEND);
}

void readAccounts(Registry *registry, Reading *reading)
{
    GList *sources = listSources(registry);
    for (GList *each = sources; each; each = each->next)
        readAccount(each->data, reading);
    g_list_free_full(sources, g_object_unref);
}

void listAccounts(Registry *registry, Reading *reading)
{
    GList *sources = listSources(registry);
    for (GList *each = sources; each; each = each->next) {
        takeText(reading, "name", e_source_get_display_name(each->data));
        endAccount(reading);
    }
    g_list_free_full(sources, g_object_unref);
}

Account *createAccount(Registry *registry, const AccountValues *values)
{
    GError *error = NULL;
    ESource *source = e_source_new(NULL, NULL, &error);
    require(source != NULL, error);
    const Value *mail = values->services[0], *calendar = values->services[1];
    e_source_set_display_name(source, values->displayName);
    e_source_set_enabled(source, values->isEnabled);
    e_source_backend_set_backend_name(e_source_get_extension(source, E_SOURCE_EXTENSION_MAIL_ACCOUNT),
                                      EXAMPLE_PROVIDER);
    ESourceAuthentication *authentication = e_source_get_extension(source, E_SOURCE_EXTENSION_AUTHENTICATION);
    e_source_authentication_set_user(authentication, values->loginName);
    e_source_authentication_set_host(authentication, mail[0].text);
    e_source_authentication_set_port(authentication, (guint16)mail[1].number);
    e_source_authentication_set_method(authentication, mail[2].text);
    e_source_authentication_set_credential_name(authentication, mail[3].text);
    e_source_authentication_set_proxy_uid(authentication, mail[4].text);
    e_source_authentication_set_remember_password(authentication, mail[5].number);
    ESourceWebdav *webdav = e_source_get_extension(source, E_SOURCE_EXTENSION_WEBDAV_BACKEND);
    e_source_webdav_set_display_name(webdav, calendar[0].text);
    e_source_webdav_set_email_address(webdav, calendar[1].text);
    e_source_webdav_set_resource_path(webdav, calendar[2].text);
    e_source_webdav_set_resource_query(webdav, calendar[3].text);
    e_source_webdav_set_order(webdav, (guint)calendar[4].number);
    e_source_webdav_set_calendar_auto_schedule(webdav, calendar[5].number);
    require(e_source_registry_commit_source_sync(registryOf(registry), source, NULL, &error), error);
    // What can be changed and removed is the registry's own object for it.
    ESource *saved = e_source_registry_ref_source(registryOf(registry), e_source_get_uid(source));
    require(saved != NULL, NULL);
    g_object_unref(source);
    return (Account *)saved;
}

void changeAccount(Registry *registry, Account *account, const char *host)
{
    (void)registry;
    GError *error = NULL;
    e_source_authentication_set_host(e_source_get_extension(sourceOf(account), E_SOURCE_EXTENSION_AUTHENTICATION),
                                     host);
    require(e_source_write_sync(sourceOf(account), NULL, &error), error);
}

void removeAccount(Registry *registry, Account *account)
{
    (void)registry;
    GError *error = NULL;
    require(e_source_remove_sync(sourceOf(account), NULL, &error), error);
    g_object_unref(sourceOf(account));
}

void settle(void)
{
    while (g_main_context_iteration(NULL, FALSE))
        ;
}

static void tellChanged(ESourceRegistry *registry, ESource *source, gpointer changed)
{
    (void)registry;
    (void)source;
    ((void (*)(void))changed)();
}

/** A source tells of a change of those extensions only that somebody has asked it for. */
static void watchSource(ESourceRegistry *registry, ESource *source, gpointer unused)
{
    (void)registry;
    (void)unused;
    e_source_get_extension(source, E_SOURCE_EXTENSION_AUTHENTICATION);
}

void observe(void (*ready)(void), void (*changed)(void))
{
    ESourceRegistry *registry = registryOf(openRegistry());
    g_signal_connect(registry, "source-added", G_CALLBACK(watchSource), NULL);
    g_signal_connect(registry, "source-changed", G_CALLBACK(tellChanged), (gpointer)changed);
    settle();
    ready();
    g_main_loop_run(g_main_loop_new(NULL, FALSE));
}
