// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <cstdlib>
#include <memory>

#include <fcntl.h>
#include <plist/plist.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "tools/account_access.h"
#include "tools/files.h"

namespace kavell::tools {

namespace {

struct FreePlist {
    void operator()(void *node) const noexcept { plist_free(node); }
};

/// The file's contents, read while nobody rewrites it: the store holds this lock around each whole-file read and write.
std::string contentsOf(const std::string &path)
{
    std::string contents;
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    struct stat status;
    if (file.get() < 0 || flock(file.get(), LOCK_SH) != 0 || fstat(file.get(), &status) != 0 ||
        !S_ISREG(status.st_mode))
        return contents;
    contents.resize(static_cast<size_t>(status.st_size));
    const ssize_t count = pread(file.get(), contents.data(), contents.size(), 0);
    contents.resize(count < 0 ? 0 : static_cast<size_t>(count));
    return contents;
}

}  // namespace

// The store's interface answers for a service that is named and lists none, so the names come from the data file. The
// store has just read that file, and has refused it if it could hurt a parser.
std::vector<std::string> serviceIdentifiers(const OpenedAccount &account)
{
    std::vector<std::string> identifiers;
    if (!account.readable)
        return identifiers;
    const std::string contents = contentsOf(dataFileOf(account.address));
    plist_t parsed = nullptr;
    plist_from_xml(contents.data(), static_cast<uint32_t>(contents.size()), &parsed);
    const std::unique_ptr<void, FreePlist> top(parsed);
    const plist_t services = top ? plist_dict_get_item(top.get(), "Services") : nullptr;
    if (!services || plist_get_node_type(services) != PLIST_DICT)
        return identifiers;
    plist_dict_iter begun = nullptr;
    plist_dict_new_iter(services, &begun);
    const std::unique_ptr<void, void (*)(void *)> iterator(begun, std::free);
    char *key = nullptr;
    plist_t value = nullptr;
    for (plist_dict_next_item(services, iterator.get(), &key, &value); value;
         plist_dict_next_item(services, iterator.get(), &key, &value)) {
        const std::unique_ptr<char, void (*)(void *)> owned(key, std::free);
        if (plist_get_node_type(value) == PLIST_DICT && plist_dict_get_size(value) > 0)
            identifiers.emplace_back(key);
    }
    return identifiers;
}

}  // namespace kavell::tools
