// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// account_editor LOGIN: a long-lived client in C. It opens one mail account and keeps it open; each line KEY=VALUE on
// standard input sets an attribute and saves it, over whatever other programs have saved meanwhile.

#include <stdio.h>
#include <string.h>

#include <kavellaccounts/KavellStore.h>

static int save(CSKavellAccountRef account, const char *keyText, const char *valueText)
{
    CSKavellStringRef key = CSKavellStringCreateWithUTF8(keyText);
    CSKavellStringRef value = CSKavellStringCreateWithUTF8(valueText);
    _CSKavellAccountSetProviderAttribute(account, key, value);
    CSKavellRelease(key);
    CSKavellRelease(value);
    _CSKavellAccountCommitChanges(account);
    // What is still pending was not saved; the store has said why on standard error.
    return _CSKavellAccountHasPendingChanges(account) ? -1 : 0;
}

int main(int argumentCount, char **arguments)
{
    if (argumentCount != 2) {
        fprintf(stderr, "usage: account_editor LOGIN\n");
        return 2;
    }
    CSKavellStringRef loginName = CSKavellStringCreateWithUTF8(arguments[1]);
    CSKavellAccountRef account = _CSKavellAccountCreate(NULL, kCSKavellAccountProviderMail, loginName);
    CSKavellRelease(loginName);
    if (!account)
        return 1;
    int result = 0;
    for (char line[4096]; result == 0 && fgets(line, sizeof line, stdin);) {
        line[strcspn(line, "\n")] = '\0';
        char *separator = strchr(line, '=');
        if (!separator)
            continue;
        *separator = '\0';
        result = save(account, line, separator + 1);
        printf("%s %s=%s\n", result == 0 ? "saved" : "could not save", line, separator + 1);
        fflush(stdout);
    }
    CSKavellRelease(account);
    return result == 0 ? 0 : 1;
}
