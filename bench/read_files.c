// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// read_files DIRECTORY: reads every file of a directory and prints the names; what listing accounts costs at the least.

#include <dirent.h>
#include <fcntl.h>
#include <stdio.h>
#include <unistd.h>

int main(int argumentCount, char **arguments)
{
    static char buffer[65536];
    DIR *listing = argumentCount > 1 ? opendir(arguments[1]) : NULL;
    if (!listing)
        return 1;
    for (const struct dirent *entry; (entry = readdir(listing)) != NULL;) {
        const int file = openat(dirfd(listing), entry->d_name, O_RDONLY | O_CLOEXEC);
        if (read(file, buffer, sizeof buffer) > 0)
            puts(entry->d_name);
        close(file);
    }
    return closedir(listing);
}
