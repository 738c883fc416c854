// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the judge of the load test makes of files that come and go while nobody tells of it: a remover that finds no file
// unlinks by name all the same, without a flock, and whoever tells of something may come to it late, or be killed first.

#include "tests/load/load_judge_fixture.h"

namespace kavell::test {

namespace {

constexpr uint64_t kThirdInode = 300;
constexpr const char *kNotFound = "a file that is there was not found";

class LoadJudgeOfRemovals : public LoadJudgeTest {
protected:
    /// A removal that has a flock and is told of at once.
    std::string remove(int32_t process, uint64_t inode, const LoadValues &values = {})
    {
        isReading = false;
        return inTurn({event(process, LoadEvent::WillRemove), event(process, LoadEvent::Take, values, inode),
                       event(process, LoadEvent::Removing, values, inode),
                       event(process, LoadEvent::Removed, values, inode),
                       event(process, LoadEvent::Release, values, inode), done(process)});
    }
    /// One without it begins. An inode of 0: it sees no file.
    std::string beginToRemove(int32_t process, uint64_t inode = 0)
    {
        return inTurn({event(process, LoadEvent::WillRemove), event(process, LoadEvent::Removing, {}, inode)});
    }
    std::string tellOfRemoval(int32_t process, uint64_t inode = 0)
    {
        return inTurn({event(process, LoadEvent::Removed, {}, inode), done(process)});
    }

    std::string findNone(int32_t process)
    {
        return inTurn({event(process, LoadEvent::Status), event(process, LoadEvent::Missing)});
    }

    std::string beginToCreate(int32_t process, uint64_t inode, uint32_t number)
    {
        return inTurn({willSave(process, number), event(process, LoadEvent::Missing),
                       event(process, LoadEvent::Creating, ownValue(process, number), inode)});
    }
    std::string tellOfCreation(int32_t process, uint64_t inode, uint32_t number)
    {
        return inTurn({event(process, LoadEvent::Created, ownValue(process, number), inode), done(process)});
    }
    std::string create(int32_t process, uint64_t inode, uint32_t number)
    {
        return inTurn({beginToCreate(process, inode, number), tellOfCreation(process, inode, number)});
    }

    /// Whose file was the latest it saved, it needs no reading.
    std::string saveInPlace(int32_t process, uint64_t inode, const LoadValues &before, uint32_t number)
    {
        isReading = false;
        LoadValues after = before;
        after[static_cast<size_t>(process) - 1] = number;
        return inTurn({willSave(process, number), event(process, LoadEvent::Take, before, inode),
                       event(process, LoadEvent::Release, after, inode), done(process)});
    }

    static LoadValues ownValue(int32_t process, uint32_t number)
    {
        LoadValues all{};
        all[static_cast<size_t>(process) - 1] = number;
        return all;
    }
};

}  // namespace

TEST_F(LoadJudgeOfRemovals, AFileMayBeRemovedThatNeitherSawNorTold)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kBob), beginToCreate(kAda, kNewInode, 5), tellOfRemoval(kBob),
                      tellOfCreation(kAda, kNewInode, 5)}),
              "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    EXPECT_EQ(findNone(kCid), "");
}

TEST_F(LoadJudgeOfRemovals, NoticesARemovalWhereThereIsNothingToRemove)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kBob)}), "");
    EXPECT_EQ(tellOfRemoval(kBob), "a file was removed where there is none");
}

TEST_F(LoadJudgeOfRemovals, NoticesANewFileThatIsTheOneThatIsThere)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), event(kAda, LoadEvent::Creating, values(5), kInode)}),
              "a new file is the one that is there");
}

TEST_F(LoadJudgeOfRemovals, ACreationThatFailedIsNotTheOneThatWasUndone)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToCreate(kAda, 201, 5), create(kBob, kNewInode, 6)}), "");
    // Ada's found Bob's file.
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::Take, values(0, 6), kNewInode),
                      event(kAda, LoadEvent::Release, values(5), kNewInode), done(kAda)}),
              "");
    EXPECT_EQ(inTurn({remove(kBob, kNewInode, values(5)), beginToRemove(kBob), beginToCreate(kCid, kThirdInode, 7),
                      tellOfRemoval(kBob), tellOfCreation(kCid, kThirdInode, 7)}),
              "");
    EXPECT_EQ(findNone(kBob), "");
}

TEST_F(LoadJudgeOfRemovals, NoticesTheFileOfACreationThatFailed)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToCreate(kAda, kNewInode, 5), event(kAda, LoadEvent::Done)}), "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(5), kNewInode), "a file that nobody made was opened");
}

TEST_F(LoadJudgeOfRemovals, NoticesTheRemovalOfWhatWasNeverThere)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kBob), beginToCreate(kAda, kNewInode, 5),
                      event(kAda, LoadEvent::Done)}),
              "");
    EXPECT_EQ(tellOfRemoval(kBob), "a file was removed where there is none");
}

TEST_F(LoadJudgeOfRemovals, TheNextFileMayHaveTheNumberOfOneWhoseMakerWasKilled)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kBob), beginToCreate(kAda, kNewInode, 5)}), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(
        inTurn({tellOfRemoval(kBob), create(kCid, kNewInode, 7), saveInPlace(kCid, kNewInode, values(0, 0, 7), 8)}),
        "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(findNone(kBob), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, ARemovalMayBeToldAfterTheNextFile)
{
    EXPECT_EQ(
        inTurn({remove(kBob, kInode), beginToRemove(kBob), create(kAda, kNewInode, 5), create(kCid, kThirdInode, 7),
                tellOfRemoval(kBob), saveInPlace(kCid, kThirdInode, values(0, 0, 7), 8)}),
        "");
    EXPECT_EQ(findNone(kBob), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, ACreationMayBeToldAfterTheNextFile)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kBob), beginToCreate(kAda, kNewInode, 5),
                      create(kCid, kThirdInode, 7), tellOfRemoval(kBob), tellOfCreation(kAda, kNewInode, 5),
                      saveInPlace(kCid, kThirdInode, values(0, 0, 7), 8)}),
              "");
    EXPECT_EQ(findNone(kBob), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, NoticesAFileMadeOverAnotherWhoseRemovalFailed)
{
    EXPECT_EQ(inTurn({beginToRemove(kBob), willSave(kAda, 5), event(kAda, LoadEvent::Creating, values(5), kNewInode),
                      event(kAda, LoadEvent::Created, values(5), kNewInode)}),
              "");
    EXPECT_EQ(event(kBob, LoadEvent::Done), "what failed was done all the same");
}

TEST_F(LoadJudgeOfRemovals, NoticesThatOneRemovalTookTwoFiles)
{
    EXPECT_EQ(inTurn({beginToRemove(kBob, kInode), create(kAda, kNewInode, 5)}), "");
    EXPECT_EQ(findNone(kCid), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, AFileMayBeDeletedUnderASave)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0))}), "");
    isReading = false;
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::Take), beginToRemove(kBob, kInode), tellOfRemoval(kBob, kInode),
                      event(kAda, LoadEvent::Release, values(5)), done(kAda)}),
              "");
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
    isReading = true;
    EXPECT_EQ(inTurn({hold(kCid, values(5), values(5)), event(kCid, LoadEvent::Seen, values(5), 0, true)}), "")
        << "who waited for it meanwhile";
}

TEST_F(LoadJudgeOfRemovals, NoticesASaveIntoAFileThatHadBeenDeleted)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), remove(kBob, kInode)}), "");
    EXPECT_EQ(hold(kAda, values(0), values(5)), "a save went into a file that had been deleted");
}

TEST_F(LoadJudgeOfRemovals, NoticesAChangeThatIsLostInAFileDeletedUnderIt)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0))}), "");
    isReading = false;
    EXPECT_EQ(inTurn({event(kAda, LoadEvent::Take), beginToRemove(kBob, kInode), tellOfRemoval(kBob, kInode)}), "");
    EXPECT_EQ(event(kAda, LoadEvent::Release, values(5, 9)), "a change was lost or made up");
}

TEST_F(LoadJudgeOfRemovals, ARedoRecordOfADeletedFileMayLieBesideTheNext)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), event(kAda, LoadEvent::Take),
                      beginToRemove(kBob, kInode), tellOfRemoval(kBob, kInode), create(kCid, kNewInode, 7),
                      event(kBob, LoadEvent::Take, values(0, 0, 7), kNewInode, true),
                      event(kBob, LoadEvent::Release, values(0, 0, 7), kNewInode, true),
                      event(kAda, LoadEvent::Release, values(5)), done(kAda)}),
              "");
    EXPECT_EQ(event(kBob, LoadEvent::Take, values(0, 0, 7), kNewInode, true),
              "there is a redo record, and nobody was killed");
}

TEST_F(LoadJudgeOfRemovals, WhatAKilledSaveLeftMayBeSettledByItsRemover)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), event(kAda, LoadEvent::Take)}), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(inTurn({event(kBob, LoadEvent::WillRemove), event(kBob, LoadEvent::Take, values(77), kInode, true),
                      event(kBob, LoadEvent::Removing, values(5)), event(kBob, LoadEvent::Removed, values(5)),
                      event(kBob, LoadEvent::Release, values(5)), done(kBob)}),
              "");
    EXPECT_EQ(hold(kCid, values(5), values(5)), "");
    EXPECT_EQ(event(kCid, LoadEvent::Take, values(4)), "a deleted file changed");
}

TEST_F(LoadJudgeOfRemovals, AKilledRemoverMayHaveRemovedItsFileOrNot)
{
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take), event(kAda, LoadEvent::Removing)}),
        "");
    judge.fellSilent(kAda);
    EXPECT_EQ(judge.outcomes(0).size(), 2u);
    EXPECT_EQ(findNone(kBob), "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].inode, 0u);
}

TEST_F(LoadJudgeOfRemovals, NoticesThatAKilledRemoverTookTwoFiles)
{
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take), event(kAda, LoadEvent::Removing)}),
        "");
    judge.fellSilent(kAda);
    EXPECT_EQ(create(kBob, kNewInode, 6), "");
    EXPECT_EQ(findNone(kCid), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, NoticesThatAKilledRemoverTookAFileThatOutlivedIt)
{
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::WillRemove), event(kAda, LoadEvent::Take), event(kAda, LoadEvent::Removing)}),
        "");
    judge.fellSilent(kAda);
    EXPECT_EQ(inTurn({willSave(kBob, 6), hold(kBob, values(0), values(0)), hold(kBob, values(0), values(0, 6))}), "");
    EXPECT_EQ(findNone(kCid), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, ASilentRemoverWithoutAFlockMayStillComeUponAFile)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kAda)}), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(inTurn({create(kBob, kNewInode, 6), saveInPlace(kBob, kNewInode, values(0, 6), 7)}), "");
    EXPECT_EQ(findNone(kCid), "");
}

TEST_F(LoadJudgeOfRemovals, NoticesThatADeadRemoverTookALaterFile)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToRemove(kAda)}), "");
    judge.fellSilent(kAda);
    judge.died(kAda);
    EXPECT_EQ(create(kBob, kNewInode, 6), "");
    EXPECT_EQ(findNone(kCid), kNotFound);
}

TEST_F(LoadJudgeOfRemovals, ASilentMakerMayStillMakeItsFile)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToCreate(kAda, kNewInode, 5)}), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(inTurn({create(kBob, kThirdInode, 6), remove(kBob, kThirdInode, values(0, 6))}), "");
    EXPECT_EQ(event(kCid, LoadEvent::Take, values(5), kNewInode), "");
    EXPECT_EQ(judge.outcomes(0).size(), 1u);
    EXPECT_EQ(judge.outcomes(0)[0].inode, kNewInode);
}

TEST_F(LoadJudgeOfRemovals, NoticesThatADeadMakersFileCameOverAnother)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), beginToCreate(kAda, kNewInode, 5)}), "");
    judge.fellSilent(kAda);
    EXPECT_EQ(create(kBob, kThirdInode, 6), "");
    EXPECT_EQ(event(kCid, LoadEvent::Take, values(5), kNewInode), "a file was made where there is one");
}

TEST_F(LoadJudgeOfRemovals, WhoWantsToWriteMayFindTheNameGoneBeforeThatIsTold)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), create(kBob, kNewInode, 6)}), "");
    EXPECT_EQ(inTurn({beginToRemove(kBob, kNewInode), willSave(kAda, 5), event(kAda, LoadEvent::Missing),
                      event(kAda, LoadEvent::Take, values(0, 6), kNewInode)}),
              "");
    // Its file is made where the name is free again, and holds what the record held before.
    isReading = false;
    EXPECT_EQ(
        inTurn({event(kAda, LoadEvent::Release, values(0, 6), kNewInode),
                event(kAda, LoadEvent::Creating, values(5), kThirdInode),
                event(kAda, LoadEvent::Created, values(5), kThirdInode), done(kAda), tellOfRemoval(kBob, kNewInode)}),
        "");
}

TEST_F(LoadJudgeOfRemovals, NoticesThatAReaderForgetsWhatItRead)
{
    EXPECT_EQ(inTurn({remove(kBob, kInode), create(kBob, kNewInode, 6), beginToRemove(kBob, kNewInode)}), "");
    isReading = true;
    EXPECT_EQ(inTurn({willSave(kAda, 5), event(kAda, LoadEvent::Take, values(0, 6), kNewInode),
                      event(kAda, LoadEvent::Release, values(0, 6), kNewInode),
                      event(kAda, LoadEvent::Creating, values(5), kThirdInode)}),
              "");
    EXPECT_EQ(event(kAda, LoadEvent::Created, values(5), kThirdInode), "a change was lost or made up");
}

TEST_F(LoadJudgeOfRemovals, AReaderOfADeletedFileMayComeUponTheRedoRecordOfTheNext)
{
    EXPECT_EQ(inTurn({willSave(kAda, 5), hold(kAda, values(0), values(0)), hold(kAda, values(0), values(5)),
                      remove(kBob, kInode, values(5))}),
              "");
    isReading = true;
    EXPECT_EQ(inTurn({event(kCid, LoadEvent::Take, values(5), kInode, true),
                      event(kCid, LoadEvent::Release, values(5), kInode, true),
                      event(kCid, LoadEvent::Seen, values(0), 0, true)}),
              "");
    EXPECT_EQ(event(kCid, LoadEvent::Seen, values(4), 0, true), "a record says what its file did not say");
}

}  // namespace kavell::test
