/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * What the programs of bench/compare have in common: the accounts, which are the same on every side, and the operations
 * that a side implements with its own library. measure.c is the main program of each side and calls them, on one thread.
 * C, so that no side's process starts with a runtime library that its own library does not need. */

#ifndef KAVELL_BENCH_SIDE_H
#define KAVELL_BENCH_SIDE_H

#include <stdbool.h>
#include <stddef.h>
#include <stdio.h>
#include <string.h>

/** @name The accounts: login name, display name, enabled flag, provider, and six attributes of each of two services
 *  @{ */
typedef enum Kind { kText, kNumber, kFlag } Kind;

typedef struct Field {
    const char *key;
    Kind kind;
} Field;

enum { kServices = 2, kFields = 6, kTextSize = 80 };

/** What the provider and the services are called where the side's library leaves that open. */
#define EXAMPLE_PROVIDER "org.example.compare"
static const char *const kServiceNames[kServices] = {"compare-mail", "compare-calendar"};

static const Field kServiceFields[kServices][kFields] = {
    {{"host", kText},
     {"port", kNumber},
     {"method", kText},
     {"credentialName", kText},
     {"proxy", kText},
     {"remember", kFlag}},
    {{"displayName", kText},
     {"emailAddress", kText},
     {"path", kText},
     {"query", kText},
     {"order", kNumber},
     {"schedule", kFlag}},
};

typedef struct Value {
    char text[kTextSize];
    int number; /**< of a number; 0 or 1 of a flag */
} Value;

typedef struct AccountValues {
    char loginName[kTextSize];
    char displayName[kTextSize];
    bool isEnabled;
    Value services[kServices][kFields];
} AccountValues;

/** What the account of a number holds when it is made. */
void makeValues(int number, AccountValues *values);

/** The host of an account's mail service after its so-manieth change. */
void makeHost(int number, int change, char host[kTextSize]);
/** @} */

/** @name What was read: enough of each value to be sure that it was touched, or all of it on standard output
 *  @{ */
typedef struct Reading {
    size_t accounts, values, sum;
    bool isShown;
} Reading;

static inline void takeText(Reading *reading, const char *key, const char *text)
{
    ++reading->values;
    reading->sum += text ? strlen(text) : 0;
    if (reading->isShown)
        printf("%s=%s;", key, text ? text : "(none)");
}

static inline void takeNumber(Reading *reading, const char *key, int number)
{
    ++reading->values;
    reading->sum += (size_t)number;
    if (reading->isShown)
        printf("%s=%d;", key, number);
}

static inline void endAccount(Reading *reading)
{
    ++reading->accounts;
    if (reading->isShown)
        printf("\n");
}
/** @} */

/** @name What a side implements; a failure ends the program with a message
 *  @{ */
typedef struct Registry Registry;
typedef struct Account Account;

/** How many values of an account readAccounts reads. */
extern const size_t valuesOfAccount;

/** Opens what is stored and loads every account of it. */
Registry *openRegistry(void);

/** Lists the accounts of an open registry and reads all values of each. */
void readAccounts(Registry *registry, Reading *reading);

/** Lists the accounts of an open registry and reads the name of each. */
void listAccounts(Registry *registry, Reading *reading);

/** Lets go of everything, so that the next openRegistry reads everything anew. */
void closeRegistry(Registry *registry);

/** Makes and saves an account. */
Account *createAccount(Registry *registry, const AccountValues *values);

/** Sets the host of the account's mail service and saves that. */
void changeAccount(Registry *registry, Account *account, const char *host);

/** Removes the account, durably, and lets go of it. */
void removeAccount(Registry *registry, Account *account);

/** Does what an event loop would have to do by now. */
void settle(void);

/** Calls `ready` when changes by other processes are being watched for, then `changed` for each; never returns. */
void observe(void (*ready)(void), void (*changed)(void));
/** @} */

/** Ends the program. */
_Noreturn void fail(const char *what);

#endif
