// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Data files in a home directory over NFS, where a file that is open for reading only cannot be locked exclusively.

#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/file.h>

#include "platform/data_file.h"
#include "tests/faults/system_calls.h"
#include "tests/support/process.h"

namespace kavell::test {

namespace {

/// Refuses such locks, and counts those that are shared.
class NetworkLocks : public SystemCallObserver {
public:
    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        const bool isReaders = call.kind == CallKind::Lock && (fcntl(call.descriptor, F_GETFL) & O_ACCMODE) == O_RDONLY;
        if (isReaders && (call.flags & LOCK_EX) != 0) {
            errno = EBADF;
            return -1;
        }
        m_shared += isReaders && (call.flags & LOCK_SH) != 0;
        return make();
    }

    [[nodiscard]] int shared() const { return m_shared; }

private:
    int m_shared = 0;
};

TEST(NetworkLock, IsSharedByThoseWhoOnlyRead)
{
    const std::string path = std::string(std::getenv("TMPDIR")) + "/network/ada.plist";
    writeFile(path, "contents");
    NetworkLocks locks;
    FileContents contents;
    {
        const Observation observation(locks);
        EXPECT_EQ(readDataFile(path.c_str(), contents), FileRead::Done);
    }
    EXPECT_EQ(contents.view(), "contents");
    EXPECT_EQ(locks.shared(), 1);
}

}  // namespace

}  // namespace kavell::test
