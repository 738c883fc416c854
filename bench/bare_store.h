// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The bare programs that the store is measured against: the same system calls on the same files, without objects,
// pending changes, checks or locks in the process.

#ifndef KAVELL_BENCH_BARE_STORE_H
#define KAVELL_BENCH_BARE_STORE_H

#include <string>
#include <string_view>

namespace kavell::bench {

/// Takes and gives the System V semaphore of a file around a call, after looking it up.
class BareSemaphore {
public:
    explicit BareSemaphore(const char *path);
    void take() const;
    void give() const;

private:
    int m_set;
};

/// Reads every data file of a directory (stat, semaphore, open, read, close) and parses it with libplist. The number of
/// files, so that nothing is optimised away.
int readDirectoryBare(const std::string &directory);

/// Reads one file under its semaphore.
std::string readFileBare(const char *path, const BareSemaphore &semaphore);

/// Replaces a file's contents in place as durably as the store does where it did so before: a record beside it, written and
/// synced; the contents, permissions and time, synced; the record cut off.
void replaceFileBare(const char *path, std::string_view contents, const BareSemaphore &semaphore);

/// Lists the directory of the observers' sockets and leaves one message with each.
void postBare(std::string_view message);

}  // namespace kavell::bench

#endif
