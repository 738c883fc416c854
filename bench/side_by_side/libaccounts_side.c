/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * The same through libaccounts-glib. It has no login name of its own; the account's global settings keep it. */

#include "bench/side_by_side/side.h"

#include <libaccounts-glib.h>

const size_t valuesOfAccount = 4 + kServices * kFields;

struct Registry {
    AgManager *manager;
    AgService *services[kServices];
    /** The manager itself does not keep accounts loaded. */
    GPtrArray *accounts;
};

static AgAccount *accountOf(Account *account)
{
    return (AgAccount *)account;
}

static AgManager *newManager(void)
{
    AgManager *manager = ag_manager_new();
    if (!manager)
        fail("the accounts' database cannot be opened");
    return manager;
}

static AgAccount *load(AgManager *manager, GList *id)
{
    AgAccount *account = ag_manager_load_account(manager, GPOINTER_TO_UINT(id->data), NULL);
    if (!account)
        fail("an account cannot be loaded");
    return account;
}

Registry *openRegistry(void)
{
    Registry *registry = g_new0(Registry, 1);
    registry->manager = newManager();
    registry->accounts = g_ptr_array_new_with_free_func(g_object_unref);
    for (int service = 0; service < kServices; ++service) {
        registry->services[service] = ag_manager_get_service(registry->manager, kServiceNames[service]);
        if (!registry->services[service])
            fail("the services are not installed");
    }
    GList *ids = ag_manager_list(registry->manager);
    for (GList *id = ids; id; id = id->next)
        g_ptr_array_add(registry->accounts, load(registry->manager, id));
    ag_manager_list_free(ids);
    return registry;
}

void closeRegistry(Registry *registry)
{
    g_ptr_array_unref(registry->accounts);
    for (int service = 0; service < kServices; ++service)
        ag_service_unref(registry->services[service]);
    g_object_unref(registry->manager);
    g_free(registry);
}

static void takeValue(Reading *reading, const Field *field, GVariant *value)
{
    if (!value)
        fail("an attribute is missing");
    if (field->kind == kText)
        takeText(reading, field->key, g_variant_get_string(value, NULL));
    else
        takeNumber(reading, field->key,
                   field->kind == kFlag ? g_variant_get_boolean(value) : g_variant_get_int32(value));
}

static void readAccount(Registry *registry, AgAccount *account, Reading *reading)
{
    static const Field loginName = {"login", kText};
    ag_account_select_service(account, NULL);
    takeValue(reading, &loginName, ag_account_get_variant(account, "loginName", NULL));
    takeText(reading, "name", ag_account_get_display_name(account));
    takeNumber(reading, "enabled", ag_account_get_enabled(account));
    takeText(reading, "provider", ag_account_get_provider_name(account));
    for (int service = 0; service < kServices; ++service) {
        ag_account_select_service(account, registry->services[service]);
        for (int field = 0; field < kFields; ++field)
            takeValue(reading, &kServiceFields[service][field],
                      ag_account_get_variant(account, kServiceFields[service][field].key, NULL));
    }
    endAccount(reading);
}

void readAccounts(Registry *registry, Reading *reading)
{
    GList *ids = ag_manager_list(registry->manager);
    for (GList *id = ids; id; id = id->next) {
        AgAccount *account = load(registry->manager, id);
        readAccount(registry, account, reading);
        g_object_unref(account);
    }
    ag_manager_list_free(ids);
}

void listAccounts(Registry *registry, Reading *reading)
{
    GList *ids = ag_manager_list(registry->manager);
    for (GList *id = ids; id; id = id->next) {
        AgAccount *account = load(registry->manager, id);
        takeText(reading, "name", ag_account_get_display_name(account));
        g_object_unref(account);
        endAccount(reading);
    }
    ag_manager_list_free(ids);
}

static GVariant *makeValue(Kind kind, const Value *value)
{
    if (kind == kText)
        return g_variant_new_string(value->text);
    return kind == kNumber ? g_variant_new_int32(value->number) : g_variant_new_boolean(value->number);
}

static void save(AgAccount *account)
{
    GError *error = NULL;
    if (!ag_account_store_blocking(account, &error))
        fail(error->message);
}

Account *createAccount(Registry *registry, const AccountValues *values)
{
    AgAccount *account = ag_manager_create_account(registry->manager, EXAMPLE_PROVIDER);
    ag_account_set_display_name(account, values->displayName);
    ag_account_set_enabled(account, values->isEnabled);
    ag_account_set_variant(account, "loginName", g_variant_new_string(values->loginName));
    for (int service = 0; service < kServices; ++service) {
        ag_account_select_service(account, registry->services[service]);
        for (int field = 0; field < kFields; ++field)
            ag_account_set_variant(account, kServiceFields[service][field].key,
                                   makeValue(kServiceFields[service][field].kind, &values->services[service][field]));
    }
    save(account);
    return (Account *)account;
}

void changeAccount(Registry *registry, Account *account, const char *host)
{
    ag_account_select_service(accountOf(account), registry->services[0]);
    ag_account_set_variant(accountOf(account), kServiceFields[0][0].key, g_variant_new_string(host));
    save(accountOf(account));
}

void removeAccount(Registry *registry, Account *account)
{
    (void)registry;
    ag_account_delete(accountOf(account));
    save(accountOf(account));
    g_object_unref(accountOf(account));
}

void settle(void)
{
    while (g_main_context_iteration(NULL, FALSE))
        ;
}

static void tellUpdated(AgManager *manager, AgAccountId id, gpointer changed)
{
    (void)manager;
    (void)id;
    ((void (*)(void))changed)();
}

void observe(void (*ready)(void), void (*changed)(void))
{
    AgManager *manager = ag_manager_new_for_service_type("compare-mail");
    if (!manager)
        fail("the accounts' database cannot be opened");
    g_signal_connect(manager, "account-updated", G_CALLBACK(tellUpdated), (gpointer)changed);
    settle();
    ready();
    g_main_loop_run(g_main_loop_new(NULL, FALSE));
}
