/* SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
 * SPDX-License-Identifier: LGPL-2.1-or-later
 *
 * The main program of each side. bench/compare runs it; each figure is a line of its name and nanoseconds.
 *
 *     SIDE fill COUNT      makes the accounts 0 to COUNT - 1
 *     SIDE show            prints all values of all accounts
 *     SIDE read COUNT      opens, reads all values, ends; for cold
 *     SIDE cold COUNT      how long a process of SIDE read takes, from its start to its end
 *     SIDE open COUNT N    opening and reading everything, N times in one process
 *     SIDE walk COUNT N    listing what is open with its names, and listing and reading all of it, N times each
 *     SIDE edit N          making, changing and removing N accounts while another process watches; from the start of each
 *                          change to that process's callback, too; each account's first change is told from the others
 *     SIDE memory COUNT    resident memory in bytes with everything open and read
 *     SIDE observe         the watching process of edit: writes the time of each callback to standard output */

#include "bench/side_by_side/side.h"

#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <stdint.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <time.h>
#include <unistd.h>

extern char **environ;

enum { kFirstEdited = 1000000, kLongestWait = 5000, kChanges = 3 };

static int64_t now(void)
{
    struct timespec time;
    clock_gettime(CLOCK_MONOTONIC, &time);
    return (int64_t)time.tv_sec * 1000000000 + time.tv_nsec;
}

static void report(const char *name, int64_t value)
{
    printf("%s %lld\n", name, (long long)value);
}

/** All values of all accounts, which must be as many as were made. */
static void readAll(Registry *registry, size_t expected)
{
    Reading reading = {0};
    readAccounts(registry, &reading);
    if (reading.accounts != expected || reading.values != expected * valuesOfAccount)
        fail("not all accounts, or not all their values, were read");
}

static void fill(int count)
{
    Registry *registry = openRegistry();
    for (int number = 0; number < count; ++number) {
        AccountValues values;
        makeValues(number, &values);
        createAccount(registry, &values);
        settle();
    }
}

static void show(void)
{
    Reading reading = {.isShown = true};
    readAccounts(openRegistry(), &reading);
}

static void readOnce(size_t count)
{
    readAll(openRegistry(), count);
    // As a program that has answered its question does: what is left to destructors and exit handlers is theirs.
    exit(0);
}

static pid_t startSelf(const char *verb, const char *argument, int output)
{
    char path[4096];
    const ssize_t length = readlink("/proc/self/exe", path, sizeof path - 1);
    if (length < 0)
        fail("readlink");
    path[length] = '\0';
    char *words[] = {path, (char *)verb, (char *)argument, NULL};
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    if (output >= 0)
        posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
    pid_t process;
    if (posix_spawn(&process, path, &actions, NULL, words, environ) != 0)
        fail("posix_spawn");
    posix_spawn_file_actions_destroy(&actions);
    return process;
}

static void cold(const char *count)
{
    const int64_t start = now();
    const pid_t process = startSelf("read", count, -1);
    int status;
    if (waitpid(process, &status, 0) != process || status != 0)
        fail("the cold process failed");
    report("cold", now() - start);
}

static void openAgain(size_t count, int rounds)
{
    // The first one is a process's first, which cold measures.
    for (int round = -1; round < rounds; ++round) {
        const int64_t start = now();
        Registry *registry = openRegistry();
        readAll(registry, count);
        const int64_t taken = now() - start;
        if (round >= 0)
            report("open", taken);
        closeRegistry(registry);
        settle();
    }
}

static void walk(size_t count, int rounds)
{
    Registry *registry = openRegistry();
    readAll(registry, count);
    for (int round = 0; round < rounds; ++round) {
        settle();
        Reading names = {0};
        const int64_t start = now();
        listAccounts(registry, &names);
        report("list", now() - start);
        if (names.accounts != count || names.values != count)
            fail("not all accounts were listed");
    }
    for (int round = 0; round < rounds; ++round) {
        settle();
        const int64_t start = now();
        readAll(registry, count);
        report("walk", now() - start);
    }
}

/** The watching process. */
static void sayReady(void)
{
    const int64_t ready = 0;
    if (write(STDOUT_FILENO, &ready, sizeof ready) != sizeof ready)
        exit(1);
}

static void sayWhen(void)
{
    const int64_t when = now();
    if (write(STDOUT_FILENO, &when, sizeof when) != sizeof when)
        exit(1);
}

/** The next time that the watching process tells; -1 when it tells none for so long. */
static int64_t nextTime(int watching, int milliseconds)
{
    struct pollfd waiting = {watching, POLLIN, 0};
    int64_t when;
    if (poll(&waiting, 1, milliseconds) != 1)
        return -1;
    return read(watching, &when, sizeof when) == sizeof when ? when : -1;
}

/** Until it has told all that it will: one save may be several events. */
static void drain(int watching)
{
    settle();
    while (nextTime(watching, 60) >= 0)
        settle();
}

static void edit(int count)
{
    int pipes[2];
    if (pipe(pipes) != 0)
        fail("pipe");
    Registry *registry = openRegistry();
    const pid_t watcher = startSelf("observe", NULL, pipes[1]);
    close(pipes[1]);
    if (nextTime(pipes[0], 10 * kLongestWait) != 0)
        fail("the watching process did not start");
    Account **accounts = calloc((size_t)count, sizeof *accounts);
    for (int index = 0; index < count; ++index) {
        AccountValues values;
        makeValues(kFirstEdited + index, &values);
        const int64_t start = now();
        accounts[index] = createAccount(registry, &values);
        report("create", now() - start);
        drain(pipes[0]);
    }
    for (int index = 0; index < kChanges * count; ++index) {
        const int change = index / count;
        char host[kTextSize];
        makeHost(kFirstEdited + index % count, 1 + change, host);
        const int64_t start = now();
        changeAccount(registry, accounts[index % count], host);
        report(change == 0 ? "first_change" : "change", now() - start);
        const int64_t when = nextTime(pipes[0], kLongestWait);
        if (when < start)
            fail("the watching process was not told of a change");
        report(change == 0 ? "first_callback" : "callback", when - start);
        drain(pipes[0]);
    }
    for (int index = 0; index < count; ++index) {
        const int64_t start = now();
        removeAccount(registry, accounts[index]);
        report("remove", now() - start);
        drain(pipes[0]);
    }
    free(accounts);
    kill(watcher, SIGKILL);
    waitpid(watcher, NULL, 0);
}

static void memory(size_t count)
{
    Registry *registry = openRegistry();
    readAll(registry, count);
    FILE *file = fopen("/proc/self/statm", "r");
    long long size, resident;
    if (!file || fscanf(file, "%lld %lld", &size, &resident) != 2)
        fail("/proc/self/statm");
    fclose(file);
    report("memory", resident * sysconf(_SC_PAGESIZE));
    closeRegistry(registry);
}

int main(int argc, char *argv[])
{
    const char *verb = argc > 1 ? argv[1] : "";
    const int count = argc > 2 ? atoi(argv[2]) : 0, rounds = argc > 3 ? atoi(argv[3]) : 1;
    if (strcmp(verb, "fill") == 0)
        fill(count);
    else if (strcmp(verb, "show") == 0)
        show();
    else if (strcmp(verb, "read") == 0)
        readOnce((size_t)count);
    else if (strcmp(verb, "cold") == 0)
        cold(argv[2]);
    else if (strcmp(verb, "open") == 0)
        openAgain((size_t)count, rounds);
    else if (strcmp(verb, "walk") == 0)
        walk((size_t)count, rounds);
    else if (strcmp(verb, "edit") == 0)
        edit(count);
    else if (strcmp(verb, "memory") == 0)
        memory((size_t)count);
    else if (strcmp(verb, "observe") == 0)
        observe(sayReady, sayWhen);
    else
        fail("no such verb");
    return 0;
}
