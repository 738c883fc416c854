// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/account_access.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellURL.h>

#include "tools/failure.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr std::string_view dataFileSuffix = ".plist";

using Directory = std::unique_ptr<DIR, int (*)(DIR *)>;

Directory openDirectory(const std::string &path)
{
    return {opendir(path.c_str()), closedir};
}

/// Whether an entry is of a type (S_IFDIR, S_IFREG) itself; links do not count.
bool isOfType(const Directory &directory, const dirent &entry, mode_t type)
{
    if (entry.d_type != DT_UNKNOWN)
        return entry.d_type == (type == S_IFDIR ? DT_DIR : DT_REG);
    struct stat status;
    return fstatat(dirfd(directory.get()), entry.d_name, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
           (status.st_mode & S_IFMT) == type;
}

std::vector<std::string> entriesOf(const std::string &path, mode_t type)
{
    std::vector<std::string> names;
    const Directory directory = openDirectory(path);
    if (!directory)
        return names;
    while (const dirent *entry = readdir(directory.get()))
        if (std::strcmp(entry->d_name, ".") != 0 && std::strcmp(entry->d_name, "..") != 0 &&
            isOfType(directory, *entry, type))
            names.emplace_back(entry->d_name);
    return names;
}

/// The end of the sentence that an account does not exist: a near one, or how to see all.
std::string hintFor(const Address &address)
{
    const std::vector<Address> known = accountsOnDisk(address.providerType);
    std::vector<std::string_view> logins;
    for (const Address &each : known)
        logins.push_back(each.login);
    const std::string_view near = nearestWord(address.login, logins);
    return near.empty() ? "; 'kavell-accounts list' shows all" : ", did you mean " + inQuotes(near) + "?";
}

}  // namespace

std::string Address::text() const
{
    return escaped(shortProviderType(providerType)) + " " + escaped(login);
}

Address takeAddress(Words &words)
{
    if (words.empty())
        refuse("the account is missing; name it as PROVIDER LOGIN, such as google anna@gmail.com");
    Address address;
    const std::string first = words.front();
    const size_t slash = first.find('/');
    if (slash != first.npos) {
        address.providerType = providerTypeOf(std::string_view(first).substr(0, slash));
        address.login = first.substr(slash + 1);
        words.erase(words.begin());
    } else {
        address.providerType = providerTypeOf(first);
        if (words.size() < 2)
            refuse("the login name is missing; name the account as PROVIDER LOGIN, such as " + escaped(first) +
                   " anna@example.org");
        address.login = words[1];
        words.erase(words.begin(), words.begin() + 2);
    }
    checkName(address.login, "login name");
    return address;
}

std::string dataRoot()
{
    const Ref<CSKavellURLRef> url = adopt(_CSKavellAccountCopyBaseURL(nullptr));
    const std::unique_ptr<char, void (*)(void *)> path(CSKavellURLCopyFileSystemPath(url.get()), std::free);
    if (!path)
        throw Failure(ExitCode::Failed, "the home directory is unknown; set HOME");
    return path.get();
}

std::string providerDirectory(std::string_view providerType)
{
    static const std::string root = dataRoot();
    return root + "/" + std::string(providerType);
}

std::string dataFileOf(const Address &address)
{
    return providerDirectory(address.providerType) + "/" + address.login + std::string(dataFileSuffix);
}

std::optional<std::string> loginOfDataFile(std::string_view name)
{
    if (name.size() <= dataFileSuffix.size() || !name.ends_with(dataFileSuffix))
        return std::nullopt;
    return std::string(name.substr(0, name.size() - dataFileSuffix.size()));
}

std::vector<Address> accountsOnDisk(const std::optional<std::string> &providerType)
{
    std::vector<Address> found;
    const std::vector<std::string> types =
        providerType ? std::vector<std::string>{*providerType} : entriesOf(dataRoot(), S_IFDIR);
    for (const std::string &type : types)
        for (const std::string &name : entriesOf(providerDirectory(type), S_IFREG))
            if (auto login = loginOfDataFile(name); login && isUTF8(name) && isUTF8(type))
                found.push_back({type, std::move(*login)});
    std::sort(found.begin(), found.end());
    return found;
}

bool isOnDisk(const Address &address)
{
    struct stat status;
    return lstat(dataFileOf(address).c_str(), &status) == 0;
}

bool isRegularFile(const Address &address)
{
    struct stat status;
    return stat(dataFileOf(address).c_str(), &status) == 0 && S_ISREG(status.st_mode);
}

OpenedAccount openAccount(const Address &address, Patience patience)
{
    const std::string path = dataFileOf(address);
    OpenedAccount opened;
    opened.address = address;
    const StoreWait waiting(address.text(), path, patience);
    opened.record =
        adopt(_CSKavellAccountCreate(nullptr, makeString(address.providerType).get(), makeString(address.login).get()));
    if (!opened.record)
        throw Failure(ExitCode::Failed, "the store cannot open " + address.text());
    opened.existed = !_CSKavellAccountHasPendingChanges(opened.record.get());
    opened.readable = opened.existed;
    opened.wasBrokenOff = waiting.wasBrokenOff();
    if (opened.existed || opened.wasBrokenOff || !isOnDisk(address))
        return opened;
    // There is a file, but no UUID came from it. That is no error of a readable file; only reading it again tells.
    const QuietStandardError quiet;
    opened.existed = true;
    opened.readable =
        isRegularFile(address) && access(path.c_str(), R_OK) == 0 && CSKavellAccountLoadData(opened.record.get());
    opened.wasBrokenOff = waiting.wasBrokenOff();
    return opened;
}

OpenedAccount openExisting(const Address &address)
{
    if (!isOnDisk(address))
        throw Failure(ExitCode::NoSuchAccount, "there is no account " + address.text() + hintFor(address));
    OpenedAccount opened = openAccount(address);
    if (!opened.existed)
        throw Failure(ExitCode::NoSuchAccount, "the account " + address.text() + " has just been removed");
    if (!opened.readable)
        throw Failure(ExitCode::Failed, "the data file of " + address.text() + " cannot be read or is damaged (" +
                                            escaped(dataFileOf(address)) + "); 'kavell-accounts doctor' says more");
    return opened;
}

void save(const OpenedAccount &account, const std::string &what)
{
    const std::string path = dataFileOf(account.address);
    {
        const StoreWait waiting(account.address.text(), path);
        _CSKavellAccountCommitChanges(account.record.get());
    }
    if (_CSKavellAccountHasPendingChanges(account.record.get()))
        throw Failure(ExitCode::Failed,
                      what + " could not be saved in " + escaped(path) +
                          "; check the disk's space and the directory's permissions, and run 'kavell-accounts doctor'");
}

std::string textAttribute(CSKavellAccountRef account, std::string_view key)
{
    const Ref<CSKavellTypeRef> value = adopt(_CSKavellAccountCopyProviderAttribute(account, makeString(key).get()));
    return toStdString(cast<CSKavellStringRef>(value.get(), CSKavellStringGetTypeID()));
}

Ref<CSKavellDictionaryRef> ownAttributes(CSKavellAccountRef account)
{
    const Ref<CSKavellDictionaryRef> all = adopt(_CSKavellAccountCopyProviderAttributes(account));
    Ref<CSKavellMutableDictionaryRef> own = adopt(CSKavellDictionaryCreateMutableCopy(all.get()));
    CSKavellDictionaryRemoveValue(own.get(), makeString(passwordReferenceKey).get());
    return own;
}

std::vector<std::string> serviceIdentifiers(const OpenedAccount &account)
{
    const auto serviceIDs = adopt(_CSKavellAccountCopyServiceIDs(account.record.get()));
    std::vector<std::string> identifiers;
    for (size_t index = 0; index < CSKavellArrayGetCount(serviceIDs.get()); ++index) {
        CSKavellTypeRef serviceID = CSKavellArrayGetValueAtIndex(serviceIDs.get(), index);
        identifiers.push_back(toStdString(cast<CSKavellStringRef>(serviceID, CSKavellStringGetTypeID())));
    }
    return identifiers;
}

}  // namespace kavell::tools
