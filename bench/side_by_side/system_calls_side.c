/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * The floor: what the kernel takes for files like the store's, without a lock, a parser or an object. It reads the files
 * that our side has made, into memory, and finds no values in them. */

#include "bench/side_by_side/side.h"

#include <dirent.h>
#include <fcntl.h>
#include <stdlib.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

enum { kContents = 2048 };

const size_t valuesOfAccount = 0;

struct Registry {
    int directory;
    size_t count;
    char **contents;
};

struct Account {
    char name[kTextSize + 8];
};

Registry *openRegistry(void)
{
    char path[4096];
    snprintf(path, sizeof path, "%s/Library/Kavell Accounts/V1/" EXAMPLE_PROVIDER, getenv("HOME"));
    Registry *registry = calloc(1, sizeof *registry);
    DIR *directory = opendir(path);
    if (!directory)
        fail("our side has to be filled first");
    registry->directory = dup(dirfd(directory));
    for (const struct dirent *entry; (entry = readdir(directory)) != NULL;) {
        if (entry->d_type != DT_REG)
            continue;
        const int file = openat(registry->directory, entry->d_name, O_RDONLY | O_CLOEXEC);
        char buffer[2 * kContents];
        const ssize_t length = read(file, buffer, sizeof buffer - 1);
        close(file);
        if (length < 0)
            fail("read");
        buffer[length] = '\0';
        if (registry->count % 256 == 0)
            registry->contents = realloc(registry->contents, (registry->count + 256) * sizeof *registry->contents);
        registry->contents[registry->count++] = strdup(buffer);
    }
    closedir(directory);
    return registry;
}

void readAccounts(Registry *registry, Reading *reading)
{
    reading->accounts += registry->count;
}

void listAccounts(Registry *registry, Reading *reading)
{
    readAccounts(registry, reading);
}

void closeRegistry(Registry *registry)
{
    for (size_t index = 0; index < registry->count; ++index)
        free(registry->contents[index]);
    free(registry->contents);
    close(registry->directory);
    free(registry);
}

static void writeAndSync(int file, size_t size)
{
    char contents[2 * kContents];
    memset(contents, 'x', sizeof contents);
    if (file < 0 || pwrite(file, contents, size, 0) != (ssize_t)size || fdatasync(file) != 0)
        fail("write");
    close(file);
}

/** One message for the watching process, if there is one. */
static struct sockaddr_un addressOfWatcher(void)
{
    struct sockaddr_un address = {.sun_family = AF_UNIX};
    snprintf(address.sun_path, sizeof address.sun_path, "%.90s/bare-watcher", getenv("XDG_RUNTIME_DIR"));
    return address;
}

static void tell(void)
{
    const struct sockaddr_un address = addressOfWatcher();
    const int sender = socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    sendto(sender, "changed", 7, 0, (const struct sockaddr *)&address, sizeof address);
    close(sender);
}

Account *createAccount(Registry *registry, const AccountValues *values)
{
    Account *account = malloc(sizeof *account);
    snprintf(account->name, sizeof account->name, "%s.bare", values->loginName);
    writeAndSync(openat(registry->directory, "new", O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600), kContents);
    if (renameat(registry->directory, "new", registry->directory, account->name) != 0 ||
        fsync(registry->directory) != 0)
        fail("rename");
    tell();
    return account;
}

/** What has to survive a power cut where it is has to be on the disk elsewhere first: the old contents and the new. */
void changeAccount(Registry *registry, Account *account, const char *host)
{
    (void)host;
    char record[sizeof account->name + 8];
    snprintf(record, sizeof record, "%s-record", account->name);
    const int flags = O_WRONLY | O_CLOEXEC, made = openat(registry->directory, record, flags | O_CREAT | O_EXCL, 0600);
    writeAndSync(made >= 0 ? made : openat(registry->directory, record, flags), 2 * kContents);
    if (made >= 0 && fsync(registry->directory) != 0)
        fail("fsync");
    writeAndSync(openat(registry->directory, account->name, flags), kContents);
    tell();
}

void removeAccount(Registry *registry, Account *account)
{
    char record[sizeof account->name + 8];
    snprintf(record, sizeof record, "%s-record", account->name);
    unlinkat(registry->directory, record, 0);
    if (unlinkat(registry->directory, account->name, 0) != 0 || fsync(registry->directory) != 0)
        fail("unlink");
    tell();
    free(account);
}

void settle(void)
{
}

void observe(void (*ready)(void), void (*changed)(void))
{
    const struct sockaddr_un address = addressOfWatcher();
    const int receiver = socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    unlink(address.sun_path);
    if (bind(receiver, (const struct sockaddr *)&address, sizeof address) != 0)
        fail("bind");
    ready();
    for (char message[16]; recv(receiver, message, sizeof message, 0) > 0;)
        changed();
}
