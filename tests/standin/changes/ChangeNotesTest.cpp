// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/ChangeNotes.h"

#include "velmark/ProjectNode.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

class ChangeNotesTest : public testing::Test {
protected:
    MarkedObject project;
    Counted<MarkedObject> clip = makeCounted<MarkedObject>();
    ChangeNotes notes{project};
};

} // namespace

TEST_F(ChangeNotesTest, HaveNoChangesAtFirst)
{
    EXPECT_FALSE(notes.hasChanges());
}

TEST_F(ChangeNotesTest, ShowNothingBeforeTheyAreAskedTo)
{
    notes.mark(*clip, ChangeFlag::Content);

    EXPECT_TRUE(notes.hasChanges());
    EXPECT_EQ(clip->shownMarks(), 0);
}

TEST_F(ChangeNotesTest, ShowAllMarksOfAnObjectTogether)
{
    notes.mark(*clip, ChangeFlag::Content);
    notes.mark(*clip, ChangeFlag::Removed);
    notes.show();

    EXPECT_EQ(clip->shownMarks(), ChangeFlag::Content | ChangeFlag::Removed);
    EXPECT_TRUE(notes.hasChanges()) << "what is shown isn't told yet";
}

TEST_F(ChangeNotesTest, KeepAChangedObjectAliveOnceUntilItIsTold)
{
    notes.mark(*clip, ChangeFlag::Content);
    notes.mark(*clip, ChangeFlag::Content);
    EXPECT_EQ(clip->refCount(), 2);

    notes.startTelling();
    EXPECT_EQ(clip->refCount(), 2);
    notes.endTelling();
    EXPECT_EQ(clip->refCount(), 1);
    EXPECT_EQ(clip->shownMarks(), 0);
}

TEST_F(ChangeNotesTest, NeverKeepTheProjectAlive)
{
    notes.mark(project, ChangeFlag::Children);
    notes.markProject(ChangeFlag::Content);

    EXPECT_EQ(project.refCount(), 1);
    EXPECT_TRUE(notes.hasChanges());
    notes.startTelling();
    EXPECT_EQ(project.shownMarks(), ChangeFlag::Children | ChangeFlag::Content);
    EXPECT_FALSE(notes.hasChanges());
}

TEST_F(ChangeNotesTest, LeaveWhatChangesDuringTheTellingForAnotherTime)
{
    notes.mark(*clip, ChangeFlag::Content);
    notes.startTelling();
    notes.mark(*clip, ChangeFlag::Removed);
    EXPECT_EQ(clip->shownMarks(), ChangeFlag::Content);
    notes.endTelling();

    EXPECT_TRUE(notes.hasChanges());
    notes.startTelling();
    EXPECT_EQ(clip->shownMarks(), ChangeFlag::Removed);
}

TEST_F(ChangeNotesTest, HideWhatWasShownAheadOfItsTelling)
{
    notes.startTelling();
    notes.mark(*clip, ChangeFlag::Content);
    notes.show();
    notes.endTelling();

    EXPECT_EQ(clip->shownMarks(), 0);
    EXPECT_TRUE(notes.hasChanges());
}

TEST_F(ChangeNotesTest, TellOfThePoolOnceForEachTimeThatItChanges)
{
    notes.markPool();
    EXPECT_TRUE(notes.hasChanges());
    EXPECT_FALSE(notes.tellsOfPool());

    notes.startTelling();
    EXPECT_TRUE(notes.tellsOfPool());
    EXPECT_FALSE(notes.hasChanges());
    notes.endTelling();
    EXPECT_FALSE(notes.tellsOfPool());
}

TEST_F(ChangeNotesTest, ForgetEverythingWhenCleared)
{
    notes.mark(*clip, ChangeFlag::Content);
    notes.markProject(ChangeFlag::Content);
    notes.markPool();
    notes.clear();

    EXPECT_FALSE(notes.hasChanges());
    EXPECT_FALSE(notes.tellsOfPool());
    EXPECT_EQ(clip->refCount(), 1);
    EXPECT_EQ(project.shownMarks(), 0);
}

} // namespace standin::tests
