// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/load/load_log.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace kavell::test {

const char *loadEventName(LoadEvent event)
{
    constexpr std::array kNames = {"unused",  "forgot", "will save", "will remove", "done",    "seen",     "status",
                                   "missing", "take",   "release",   "creating",    "created", "removing", "removed"};
    return kNames.at(static_cast<size_t>(event));
}

LoadLog *mapLoadLog(const char *path)
{
    const int file = path ? open(path, O_RDWR | O_CREAT | O_CLOEXEC, 0600) : -1;
    if (file < 0)
        return nullptr;
    void *memory = MAP_FAILED;
    if (ftruncate(file, sizeof(LoadLog)) == 0)
        memory = mmap(nullptr, sizeof(LoadLog), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
    close(file);
    return memory == MAP_FAILED ? nullptr : static_cast<LoadLog *>(memory);
}

}  // namespace kavell::test
