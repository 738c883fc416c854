/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later */

#include "bench/side_by_side/side.h"

#include <stdlib.h>

static void setText(Value *value, const char *form, int number)
{
    snprintf(value->text, sizeof value->text, form, number);
}

void makeHost(int number, int change, char host[kTextSize])
{
    snprintf(host, kTextSize, "server%d-%d.mail.example.org", number, change);
}

void makeValues(int number, AccountValues *values)
{
    memset(values, 0, sizeof *values);
    snprintf(values->loginName, kTextSize, "person%d@mail.example.org", number);
    snprintf(values->displayName, kTextSize, "Person Number %d", number);
    values->isEnabled = number % 3 != 0;
    Value *mail = values->services[0], *calendar = values->services[1];
    makeHost(number, 0, mail[0].text);
    mail[1].number = 993 + number % 7;
    setText(&mail[2], "PLAIN", 0);
    setText(&mail[3], "credential-%d", number);
    setText(&mail[4], "system-proxy", 0);
    mail[5].number = number % 2;
    setText(&calendar[0], "Calendar of person %d", number);
    setText(&calendar[1], "person%d@calendar.example.org", number);
    setText(&calendar[2], "/dav/calendars/person%d/home", number);
    setText(&calendar[3], "owner=person%d", number);
    calendar[4].number = 1 + number % 100;
    calendar[5].number = (number + 1) % 2;
}

void fail(const char *what)
{
    fprintf(stderr, "side by side: %s\n", what);
    exit(1);
}
