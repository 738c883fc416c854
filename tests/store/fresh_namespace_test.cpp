// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The first file of a fresh IPC namespace. A program of its own: the library takes the identifier 0 out of the way once
// a process, and here that has not happened before.

#include <sched.h>
#include <sys/ipc.h>
#include <sys/sem.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using FreshNamespace = StoreTest;

TEST_F(FreshNamespace, TheFirstSetOfAFileIsNotZero)
{
    if (unshare(CLONE_NEWIPC) != 0 && unshare(CLONE_NEWUSER | CLONE_NEWIPC) != 0)
        GTEST_SKIP() << "no IPC namespace can be made here";
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>"));
    const Account account = openAccount("ada");
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    const int set = semget(ftok(fileOf("ada").c_str(), 0), 0, 0);
    EXPECT_GT(set, 0);
    EXPECT_EQ(semctl(set, 0, GETVAL), 1);
}

}  // namespace
