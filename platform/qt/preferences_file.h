// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The file of one domain of the user's preferences, and the lock of those who write it. The file is always replaced as
// a whole, so that whoever reads it, without a lock, finds the old contents or the new ones; a crash at any moment
// leaves one of them. Beside DOMAIN.plist stand, in the same directory:
//
//     .DOMAIN.plist.lock                 empty, what writers lock; the file itself is replaced under them
//     .DOMAIN.plist.new                  new contents on their way; a leftover means nothing
//     DOMAIN.plist.damaged-TIME          what was found there that was no property list, kept when it was replaced
//
// Used by preferences.cpp. Any thread may call.

#ifndef KAVELL_PLATFORM_QT_PREFERENCES_FILE_H
#define KAVELL_PLATFORM_QT_PREFERENCES_FILE_H

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <sys/types.h>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

#include "platform/file_io.h"

namespace kavell {

/// Where a domain's preferences are now: below $XDG_CONFIG_HOME where that is an absolute path, else ~/.config.
[[nodiscard]] std::string preferencesPath(const std::string &domain);

/// Tells whether a path still has the file that was read. All zero for no file.
struct PreferencesStamp {
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    int64_t modifiedSeconds = 0;
    int64_t modifiedNanoseconds = 0;

    friend bool operator==(const PreferencesStamp &, const PreferencesStamp &) = default;
};

/// The lock of those who write one preferences file, held for the object's life. Making it makes the directory.
class PreferencesLock {
public:
    /// Waits for whoever has the lock, for at most `bound`.
    PreferencesLock(const std::string &path, std::chrono::milliseconds bound);
    ~PreferencesLock();
    PreferencesLock(const PreferencesLock &) = delete;
    PreferencesLock &operator=(const PreferencesLock &) = delete;

    /// 0 when it is held, else the error; ETIMEDOUT after the bound.
    [[nodiscard]] int error() const noexcept { return m_error; }

private:
    FileDescriptor m_file;
    int m_error = 0;
};

struct PreferencesContents {
    PreferencesStamp stamp;
    Ref<CSKavellMutableDictionaryRef> values;  ///< never none; empty for no file and for a damaged one
    bool isDamaged = false;
};

/// The stamp of the file at a path; not set, with errno, when the file cannot be looked at.
[[nodiscard]] std::optional<PreferencesStamp> preferencesStamp(const std::string &path);

/// Reads the file; not set, with errno, when it cannot be read.
[[nodiscard]] std::optional<PreferencesContents> readPreferencesFile(const std::string &path);

/// Gives the file at the path a name that says that it is damaged: the new path; empty, with errno, when that fails.
/// For holders of the lock.
[[nodiscard]] std::string setDamagedFileAside(const std::string &path);

/// Makes the XML text the file's contents, durably, with permissions 0600: the new file's stamp; not set, with errno
/// and the old file in its place, when that fails. For holders of the lock.
[[nodiscard]] std::optional<PreferencesStamp> replacePreferencesFile(const std::string &path, std::string_view xml);

}  // namespace kavell

#endif
