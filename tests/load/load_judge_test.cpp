// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The judge of the load test, with logs written by hand: it must let pass what the store may do, and notice each thing
// that it may not do.

#include "tests/load/load_judge_fixture.h"

namespace kavell::test {

namespace {

class LoadJudgeAfterKills : public LoadJudgeTest {
protected:
    /// Ada is killed while she writes 5 over nothing.
    void killWriter()
    {
        EXPECT_EQ(
            inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), event(kAda, LoadEvent::Take, values(0))}), "");
        judge.fellSilent(kAda);
    }

    /// A removal from its beginning to its end.
    std::string removal(int32_t process)
    {
        return inTurn({event(process, LoadEvent::WillRemove), event(process, LoadEvent::Take),
                       event(process, LoadEvent::Removing), event(process, LoadEvent::Removed),
                       event(process, LoadEvent::Release), done(process)});
    }

    /// What comes before a new file with a 5 of Ada's has its name.
    std::string beginningOfNewFile()
    {
        return inTurn({willSave(kAda, 5), event(kAda, LoadEvent::Missing),
                       event(kAda, LoadEvent::Creating, values(5), kNewInode)});
    }
};

}  // namespace

TEST_F(LoadJudgeTest, ASaveOverWhatWasReadIsInOrder)
{
    EXPECT_EQ(
        inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), hold(kAda, values(0), values(5)), done(kAda)}),
        "");
    EXPECT_EQ(
        inTurn({willSave(kBob, 6), hold(kBob, values(5), values(5)), hold(kBob, values(5), values(5, 6)), done(kBob)}),
        "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].values, values(5, 6));
    EXPECT_EQ(judge.leastNotifications(0), 2u);
    EXPECT_EQ(judge.mostNotifications(0), 2u);
}

TEST_F(LoadJudgeTest, WhatFallsBetweenReadingAndWritingMayBeOverwritten)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0))}), "");
    EXPECT_EQ(inTurn({willSave(kBob, 6), hold(kBob, values(0), values(0)), hold(kBob, values(0), values(0, 6))}), "");
    EXPECT_EQ(hold(kAda, values(0, 6), values(5)), "");
    EXPECT_EQ(judge.tally().overwritten, 1);
}

TEST_F(LoadJudgeTest, NoticesAChangeThatIsLostAlthoughItWasThere)
{
    EXPECT_EQ(inTurn({willSave(kBob, 6), hold(kBob, values(0), values(0)), hold(kBob, values(0), values(0, 6))}), "");
    EXPECT_EQ(inTurn({willSave(kAda, 7), hold(kAda, values(0, 6), values(0, 6))}), "");
    EXPECT_EQ(hold(kAda, values(0, 6), values(7)), "a change was lost or made up");
}

TEST_F(LoadJudgeTest, NoticesASaveWithoutReading)
{
    EXPECT_EQ(
        inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), hold(kAda, values(0), values(5)), done(kAda)}),
        "");
    EXPECT_EQ(inTurn({willSave(kBob, 6), hold(kBob, values(5), values(5)), hold(kBob, values(5), values(5, 6))}), "");
    EXPECT_EQ(inTurn({willSave(kAda, 7), hold(kAda, values(5, 6), values(7))}),
              "a save was made without reading what another had saved");
}

TEST_F(LoadJudgeTest, ASaveAfterOnesOwnNeedsNoReading)
{
    EXPECT_EQ(
        inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), hold(kAda, values(0), values(5)), done(kAda)}),
        "");
    EXPECT_EQ(inTurn({willSave(kAda, 6), hold(kAda, values(5), values(6)), done(kAda)}), "");
}

TEST_F(LoadJudgeTest, NoticesTwoHoldersAtOnce)
{
    EXPECT_EQ(event(kAda, LoadEvent::Take, values(0)), "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(0)), "two processes hold a file at once");
}

TEST_F(LoadJudgeTest, NoticesAChangeOutsideAHold)
{
    EXPECT_EQ(event(kAda, LoadEvent::Take, values(9)), "a file changed while nobody held it");
}

TEST_F(LoadJudgeTest, NoticesAChangeByAReader)
{
    EXPECT_EQ(hold(kAda, values(0), values(9)), "a hold changed a file without a save");
}

TEST_F(LoadJudgeTest, NoticesARecordThatSaysAnotherThingThanItsFile)
{
    EXPECT_EQ(inTurn({hold(kAda, values(0), values(0)), event(kAda, LoadEvent::Seen, values(0), 0, true)}), "");
    EXPECT_EQ(event(kAda, LoadEvent::Seen, values(3), 0, true), "a record says what its file did not say");
    EXPECT_EQ(event(kAda, LoadEvent::Seen, values(0), 0, false), "an account could not be loaded");
}

TEST_F(LoadJudgeTest, NoticesASaveThatIsInNoFile)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0))}), "");
    EXPECT_EQ(done(kAda), "a save came to its end that is in no file");
}

TEST_F(LoadJudgeTest, AnAccountIsRemovedAndMadeAnew)
{
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take), event(kAda, LoadEvent::Removing),
                event(kAda, LoadEvent::Removed), event(kAda, LoadEvent::Release), done(kAda)}),
        "");
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    EXPECT_EQ(inTurn({willSave(kBob, 6), event(kBob, LoadEvent::Missing),
                      event(kBob, LoadEvent::Creating, values(0, 6), kNewInode),
                      event(kBob, LoadEvent::Created, values(0, 6), kNewInode), done(kBob)}),
              "");
    EXPECT_EQ(judge.outcomes(0)[0].inode, kNewInode);
    EXPECT_EQ(judge.leastNotifications(0), 2u);
}

TEST_F(LoadJudgeTest, AFileMayBeRemovedBeforeItsMakerTellsOfIt)
{
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take), event(kAda, LoadEvent::Removing),
                event(kAda, LoadEvent::Removed), event(kAda, LoadEvent::Release), done(kAda)}),
        "");
    EXPECT_EQ(inTurn({willSave(kBob, 6), event(kBob, LoadEvent::Missing),
                      event(kBob, LoadEvent::Creating, values(0, 6), kNewInode), event(kAda, LoadEvent::WillRemove),
                      event(kAda, LoadEvent::Removing, values(0, 6), kNewInode),
                      event(kAda, LoadEvent::Removed, values(0, 6), kNewInode), done(kAda),
                      event(kBob, LoadEvent::Created, values(0, 6), kNewInode), done(kBob)}),
              "");
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    EXPECT_EQ(inTurn({event(kBob, LoadEvent::Status), event(kBob, LoadEvent::Missing)}), "");
}

TEST_F(LoadJudgeTest, AFileMayComeBetweenARemoversLookAndItsRemoval)
{
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Removing, {}, 0),
                      event(kBob, LoadEvent::Status), event(kBob, LoadEvent::Missing),
                      event(kAda, LoadEvent::Removed, {}, 0), done(kAda)}),
              "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    EXPECT_EQ(judge.leastNotifications(0), 1u);
}

TEST_F(LoadJudgeTest, ARemovalThatFoundNothingExcusesNobodyAfterIt)
{
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Removing, {}, 0), done(kAda)}), "");
    EXPECT_EQ(inTurn({event(kBob, LoadEvent::Status), event(kBob, LoadEvent::Missing)}),
              "a file that is there was not found");
}

TEST_F(LoadJudgeTest, WhoWaitedForAFileThatIsDeletedReadsTheMomentBefore)
{
    EXPECT_EQ(
        inTurn({event(kBob, LoadEvent::Status), event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take),
                event(kAda, LoadEvent::Removing), event(kAda, LoadEvent::Removed), event(kAda, LoadEvent::Release),
                hold(kBob, values(0), values(0)), event(kBob, LoadEvent::Seen, values(0), 0, true)}),
        "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(4)), "a deleted file changed");
}

TEST_F(LoadJudgeTest, WhoWantsToWriteADeletedFileLearnsNothingFromIt)
{
    EXPECT_EQ(inTurn({willSave(kBob, 6), hold(kBob, values(0), values(0))}), "");
    EXPECT_EQ(
        inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), hold(kAda, values(0), values(5)), done(kAda)}),
        "");
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take, values(5)),
                      event(kAda, LoadEvent::Removing, values(5)), event(kAda, LoadEvent::Removed, values(5)),
                      event(kAda, LoadEvent::Release, values(5)), done(kAda)}),
              "");
    isReading = false;
    EXPECT_EQ(inTurn({hold(kBob, values(5), values(5)), event(kBob, LoadEvent::Creating, values(0, 6), kNewInode),
                      event(kBob, LoadEvent::Created, values(0, 6), kNewInode), done(kBob)}),
              "");
}

TEST_F(LoadJudgeTest, NoticesAFileMadeOverAnother)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), event(kAda, LoadEvent::Creating, values(5), kNewInode)}), "");
    EXPECT_EQ(event(kAda, LoadEvent::Created, values(5), kNewInode), "a file was made where there is one");
}

TEST_F(LoadJudgeTest, NoticesARemovalThatNobodyWanted)
{
    EXPECT_EQ(event(kAda, LoadEvent::Removing), "");
    EXPECT_EQ(event(kAda, LoadEvent::Removed), "a file was removed by a process that did not want to");
}

TEST_F(LoadJudgeTest, NoticesAFileThatIsNotFoundAlthoughItIsThere)
{
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::Status), event(kAda, LoadEvent::Missing)}),
              "a file that is there was not found");
}

TEST_F(LoadJudgeTest, NoticesARedoRecordWithoutAKill)
{
    EXPECT_EQ(event(kAda, LoadEvent::Take, values(0), kInode, true), "there is a redo record, and nobody was killed");
}

TEST_F(LoadJudgeAfterKills, AFileMayBeAsBefore)
{
    killWriter();
    EXPECT_EQ(judge.outcomes(0).size(), 2u);
    EXPECT_EQ(hold(kBob, values(0), values(0)), "");
    EXPECT_EQ(judge.tally().settledBefore, 1);
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.leastNotifications(0), 0u);
    EXPECT_EQ(judge.mostNotifications(0), 1u) << "nobody knows";
}

TEST_F(LoadJudgeAfterKills, AFileMayBeAsAfter)
{
    killWriter();
    EXPECT_EQ(hold(kBob, values(5), values(5)), "");
    EXPECT_EQ(judge.tally().settledAfter, 1);
    EXPECT_EQ(judge.outcomes(0)[0].values, values(5));
}

TEST_F(LoadJudgeAfterKills, ARedoRecordMakesItAsAfter)
{
    killWriter();
    EXPECT_EQ(
        inTurn({event(kBob, LoadEvent::Take, values(0, 77), kInode, true),
                event(kBob, LoadEvent::Release, values(0, 77), kInode, true),
                event(kBob, LoadEvent::Take, values(0, 77), kInode, true), event(kBob, LoadEvent::Release, values(5))}),
        "");
    EXPECT_EQ(judge.tally().settledAfter, 1);
}

TEST_F(LoadJudgeAfterKills, NoticesWhatIsNeitherBeforeNorAfter)
{
    killWriter();
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(4)), "a file changed while nobody held it");
}

TEST_F(LoadJudgeAfterKills, NoticesARecordThatIsSettledToAnotherThing)
{
    killWriter();
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(0), kInode, true), "");
    EXPECT_EQ(event(kBob, LoadEvent::Release, values(4)), "a hold changed a file without a save");
}

TEST_F(LoadJudgeAfterKills, AFileThatItsMakerWasKilledOverIsThereOrNot)
{
    EXPECT_EQ(removal(kBob), "");
    EXPECT_EQ(beginningOfNewFile(), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(judge.outcomes(0).size(), 2u);
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(5), kNewInode), "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].inode, kNewInode);
}

TEST_F(LoadJudgeAfterKills, AMakerThatIsKilledLaterStillTellsOfItsFile)
{
    EXPECT_EQ(removal(kBob), "");
    EXPECT_EQ(inTurn({beginningOfNewFile(), event(kBob, LoadEvent::WillRemove),
                      event(kBob, LoadEvent::Removing, values(5), kNewInode),
                      event(kBob, LoadEvent::Removed, values(5), kNewInode), done(kBob),
                      event(kAda, LoadEvent::Created, values(5), kNewInode), done(kAda)}),
              "");
    judge.fellSilent(kAda);
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    EXPECT_EQ(inTurn({event(kBob, LoadEvent::Status), event(kBob, LoadEvent::Missing)}), "");
}

TEST_F(LoadJudgeAfterKills, NoticesAFileInUseWhoseMakerIsYetToTellOfIt)
{
    EXPECT_EQ(removal(kBob), "");
    EXPECT_EQ(beginningOfNewFile(), "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(5), kNewInode), "a file that nobody made was opened");
}

TEST_F(LoadJudgeAfterKills, NoticesTwoHoldersWhoseFirstIsKilledLater)
{
    EXPECT_EQ(event(kAda, LoadEvent::Take, values(0)), "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(0)), "two processes hold a file at once");
    judge.fellSilent(kAda);
}

}  // namespace kavell::test
