// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <ctime>
#include <fcntl.h>
#include <filesystem>
#include <optional>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

#include "platform/data_file.h"
#include "tools/doctor.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr mode_t directoryMode = 0700;
constexpr mode_t fileMode = 0600;

/// A new file exists under its temporary name for milliseconds; one older than this was left over.
constexpr time_t longestCreation = 60;

std::vector<std::string> namesIn(const std::string &directory)
{
    std::vector<std::string> names;
    std::error_code error;
    for (std::filesystem::directory_iterator entry(directory, error), end; !error && entry != end;
         entry.increment(error))
        names.push_back(entry->path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

std::string octal(mode_t mode)
{
    std::array<char, 16> buffer;
    std::snprintf(buffer.data(), buffer.size(), "%04o", static_cast<unsigned>(mode));
    return buffer.data();
}

void examineMode(const std::string &path, const struct stat &status, mode_t wanted, Findings &findings)
{
    const mode_t mode = status.st_mode & 07777U;
    if (status.st_uid != geteuid())
        findings.problem("foreign-owner", path, escaped(path) + " belongs to another user; give it back with chown");
    else if (mode != wanted)
        findings.mendable("wrong-permissions", path,
                          escaped(path) + " has the permissions " + octal(mode) + " and should have " + octal(wanted),
                          [&] { return chmod(path.c_str(), wanted) == 0; });
}

/// What tells a redo record from one that has come in its place, and from itself once a save uses it: inodes' numbers are
/// given out again, and void records are used again.
using RecordIdentity = std::pair<ino_t, FileTime>;

/// None when there is no record.
std::optional<RecordIdentity> recordAt(const std::string &path)
{
    struct stat status;
    if (lstat(path.c_str(), &status) != 0)
        return std::nullopt;
    return RecordIdentity{status.st_ino, {status.st_ctim.tv_sec, status.st_ctim.tv_nsec}};
}

/// The account whose data file the redo record bears the name of; none when there is no such file. Looked for anew: an
/// account may have been added since the accounts were listed, and its record be in use.
std::optional<Address> accountOfRedoRecord(const std::string &path)
{
    const std::filesystem::path directory = std::filesystem::path(path).parent_path();
    for (const std::string &name : namesIn(directory.string())) {
        if (auto login = loginOfDataFile(name);
            login && siblingPath((directory / name).string(), kRedoRecordPrefix) == path)
            return Address{directory.filename().string(), std::move(*login)};
    }
    return std::nullopt;
}

/// Whether a redo record is to be settled; void ones stay after each save. Waits, for a bounded time, until nobody is inside
/// the account's data file where that may be: a record that is not void then belongs to nobody.
bool isToBeSettled(const std::string &path, const Address &account, const Findings &findings)
{
    const bool canOpen = !findings.untouchable.contains(account);
    constexpr int flags = O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY;  // whatever stands there, this does not wait
    const FileDescriptor file(canOpen ? open(dataFileOf(account).c_str(), flags) : -1);
    if (file.get() >= 0)
        (void)lockWithinBound(file.get(), LOCK_SH);
    struct stat status;
    return lstat(path.c_str(), &status) == 0 && !isVoidRecord(status);
}

void examineRedoRecord(const std::string &path, Findings &findings)
{
    // Asked before the account is looked for: one that is added after that makes the record its own.
    const std::optional<RecordIdentity> record = recordAt(path);
    const std::optional<Address> account = accountOfRedoRecord(path);
    if (!account) {
        const auto isStillThere = [&] {
            return record && recordAt(path) == record;
        };
        if (isStillThere())
            findings.mendable("left-over-record", path, escaped(path) + " is the record of a save whose file is gone",
                              [&] { return !isStillThere() || unlink(path.c_str()) == 0; });
        return;
    }
    // What is gone or void by now belonged to a save that has come to its end.
    if (!isToBeSettled(path, *account, findings))
        return;
    const bool canOpen = !findings.untouchable.contains(*account);
    findings.mendable("unfinished-save", path, "a save of " + account->text() + " was interrupted and is not finished",
                      [&] {
                          if (canOpen)
                              (void)openForExamination(*account, findings);
                          return !isToBeSettled(path, *account, findings);
                      });
    if (!findings.all.back().mended)
        findings.untouchable.insert(*account);
}

void examineTemporaryFile(const std::string &path, const struct stat &status, Findings &findings)
{
    if (time(nullptr) - status.st_mtime > longestCreation)
        findings.mendable("left-over-file", path, escaped(path) + " was left over when an account was being added",
                          [&] { return unlink(path.c_str()) == 0; });
}

void examineDataFile(const std::string &path, const std::string &login, const struct stat &status, Findings &findings)
{
    if (!S_ISREG(status.st_mode))
        findings.problem("no-regular-file", path,
                         escaped(path) + " is no regular file, so it is not read as an account; move it away");
    else if (const std::string problem = nameProblem(login); !problem.empty())
        findings.problem("unusable-name", path,
                         "the login name of " + escaped(path) + " " + problem + "; rename the file");
    else
        examineMode(path, status, fileMode, findings);
}

void examineEntry(const std::string &directory, const std::string &name, Findings &findings)
{
    const std::string path = directory + "/" + name;
    struct stat status;
    if (lstat(path.c_str(), &status) != 0)
        return;
    if (const auto login = loginOfDataFile(name))
        examineDataFile(path, *login, status, findings);
    else if (name.starts_with(kRedoRecordPrefix))
        examineRedoRecord(path, findings);
    else if (name.starts_with(kNewFilePrefix))
        examineTemporaryFile(path, status, findings);
    else if (name.starts_with(kDamagedCopyPrefix))
        findings.note("damaged-copy", path,
                      escaped(path) + " is a damaged data file that was kept when its account was saved anew; take "
                                      "from it what you need and delete it");
}

void examineDirectory(const std::string &path, Findings &findings)
{
    struct stat status;
    if (lstat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode))
        examineMode(path, status, directoryMode, findings);
}

void notExamined(const Address &address, Findings &findings)
{
    findings.note("not-examined", dataFileOf(address), address.text() + " was not opened because of the problem above");
}

}  // namespace

void examineDirectories(Findings &findings)
{
    const std::string root = dataRoot();
    examineDirectory(std::filesystem::path(root).parent_path().string(), findings);
    examineDirectory(root, findings);
    for (const std::string &provider : namesIn(root)) {
        const std::string directory = root + "/" + provider;
        if (!std::filesystem::is_directory(std::filesystem::symlink_status(directory)))
            continue;
        examineDirectory(directory, findings);
        for (const std::string &name : namesIn(directory))
            examineEntry(directory, name, findings);
    }
}

void examineContents(const std::vector<Address> &accounts, Findings &findings)
{
    for (const Address &address : accounts) {
        const std::string path = dataFileOf(address);
        if (findings.untouchable.contains(address)) {
            notExamined(address, findings);
            continue;
        }
        struct stat status;
        if (lstat(path.c_str(), &status) != 0)
            continue;  // removed meanwhile
        const auto account = openForExamination(address, findings);
        if (!account)
            notExamined(address, findings);
        if (!account || account->readable)
            continue;
        if (access(path.c_str(), R_OK) != 0)
            findings.problem("unreadable-file", path,
                             "the data file of " + address.text() + " cannot be read: " + std::strerror(errno) +
                                 "; check the permissions of " + escaped(path));
        else if (status.st_size > static_cast<off_t>(kLargestDataFile))
            findings.problem("damaged-file", path,
                             "the data file of " + address.text() + " is too large to be one: " + escaped(path));
        else
            findings.problem("damaged-file", path,
                             "the data file of " + address.text() + " is damaged: " + escaped(path) +
                                 "; put a good copy in its place, or remove the account");
    }
}

}  // namespace kavell::tools
