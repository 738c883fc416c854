// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The stores' private files: one directory below the user's data directory, file locks with a bound, whole-file reads
// and atomic replacement. Used by the stores; safe from any thread.

#ifndef KAVELL_PLATFORM_SERVICES_USER_FILES_H
#define KAVELL_PLATFORM_SERVICES_USER_FILES_H

#include <optional>
#include <string>
#include <string_view>

#include "platform/file_io.h"
#include "platform/services/deadline.h"

namespace kavell {

/// The directory "kavell-accounts" below $XDG_DATA_HOME, else below ~/.local/share. It need not exist.
[[nodiscard]] std::string credentialDirectory();

/// Makes that directory, open to its owner only; whether it stands.
[[nodiscard]] bool makeCredentialDirectory();

/// A lock between processes and threads, held for the object's life. A file of its own is locked, because the file that
/// it guards is replaced.
class FileLock {
public:
    /// Takes the lock on the file of that name in the credential directory, waiting until the deadline.
    FileLock(const std::string &name, const Deadline &deadline);
    ~FileLock();
    FileLock(const FileLock &) = delete;
    FileLock &operator=(const FileLock &) = delete;

    enum class State { held, timedOut, failed };
    [[nodiscard]] State state() const noexcept { return m_state; }

private:
    FileDescriptor m_file;
    State m_state = State::failed;
};

/// A file's contents, or why there are none.
struct StoredFile {
    enum class State { read, absent, failed };
    State state = State::failed;
    std::string bytes;
};

/// Reads a regular file of at most `most` bytes.
[[nodiscard]] StoredFile readWholeFile(const std::string &path, size_t most);

/// Replaces a file in the credential directory so that a crash at any moment leaves the old or the new one, readable by
/// its owner only. For holders of the lock that guards it; false leaves the old file as it was.
[[nodiscard]] bool replaceFile(const std::string &name, std::string_view bytes);

}  // namespace kavell

#endif
