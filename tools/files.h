// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Files that the user names, and the calls on descriptors that every reader needs. One thread.

#ifndef KAVELL_TOOLS_FILES_H
#define KAVELL_TOOLS_FILES_H

#include <string>
#include <string_view>

namespace kavell::tools {

/// Closes a descriptor at the end of its scope.
class FileDescriptor {
public:
    explicit FileDescriptor(int descriptor) noexcept : m_descriptor(descriptor) {}
    ~FileDescriptor();
    FileDescriptor(const FileDescriptor &) = delete;
    FileDescriptor &operator=(const FileDescriptor &) = delete;
    [[nodiscard]] int get() const noexcept { return m_descriptor; }

private:
    int m_descriptor;
};

/// Takes a flock (LOCK_SH or LOCK_EX), waiting for at most ten seconds; false when somebody else still has it then.
[[nodiscard]] bool lockWithinBound(int descriptor, int operation);

/// The whole contents of a file, or of standard input for "-"; refuses what cannot be read or has more than 256 MiB.
[[nodiscard]] std::string readInputFile(const std::string &path);

/// Writes a file whole beside its place, for its owner only, and renames it there, so that a failure leaves what was
/// there before; a device or pipe is written as it is.
void writeOutputFile(const std::string &path, std::string_view contents);

/// While it lives, what the store writes to standard error is thrown away; for asking a question again whose answer
/// was already reported. The program's own complaints wait until it is gone.
class QuietStandardError {
public:
    QuietStandardError();
    ~QuietStandardError();
    QuietStandardError(const QuietStandardError &) = delete;
    QuietStandardError &operator=(const QuietStandardError &) = delete;

private:
    int m_saved;
};

}  // namespace kavell::tools

#endif
