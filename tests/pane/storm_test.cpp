// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many saves by another process while the pane is shown. A program of its own: the other process is forked from it, and
// must not come into the world with the locks of threads that earlier tests left.

#include <unistd.h>

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

class PaneInAStorm : public PaneTest {};

TEST_F(PaneInAStorm, SavesAreGatheredAndTheLastIsShown)
{
    storedAccount("ada");
    int start[2];
    ASSERT_EQ(pipe(start), 0);
    ChildProcess storm([&] {
        char letter = 0;
        if (read(start[0], &letter, 1) != 1)
            return 1;
        const auto account = newAccount("ada", kKindType);
        for (int save = 1; save <= 300; ++save) {
            account->setProviderAttribute(QString::number(save), KAMailAccountDescriptionKey);
            commit(account);
        }
        return 0;
    });
    openPane();
    waitForPage("ada");
    int readings = 0;
    QObject::connect(&window().registry(), &pane::AccountRegistry::read, [&] { ++readings; });
    ASSERT_EQ(write(start[1], "x", 1), 1);
    waitForPage("300");
    EXPECT_EQ(storm.wait(), 0);
    EXPECT_LT(readings, 200);
    close(start[0]);
    close(start[1]);
}

}  // namespace kavell::test
