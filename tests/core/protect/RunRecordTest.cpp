// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/RunRecord.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <optional>
#include <string>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::EventList;
using core::FrameRange;
using core::NextRun;
using core::PastRuns;
using core::PropertyKey;
using core::ProtectedRun;
using core::Variant;
namespace RunRecord = core::RunRecord;
using Source = ProtectedRun::Source;

/// The first frame of 01:00:10:00 at 25 frames a second.
constexpr std::int32_t TenSecondsIn = 90250;

/// A reel of two shots from 01:00:00:00 on, and what becomes of it.
///
///     first     |---- A ----|---- B ----|         10 s each
///     second    |-- A --|---- B ----|              8 s and 10 s
///     third     |-- A --|---- B ----|-- N --|
class RunRecordTest : public testing::Test {
protected:
    RunRecordTest() { m_earlier.add(makeEvent("X009", "05:00:00:00", "05:00:05:00", "05:00:10:00", "05:00:15:00")); }
    static void setFirst(EventList& list) { setShots(list, "10:00:10:00", "01:00:10:00", "01:00:20:00"); }
    static void setSecond(EventList& list) { setShots(list, "10:00:08:00", "01:00:08:00", "01:00:18:00"); }
    static void setThird(EventList& list)
    {
        setSecond(list);
        list.add(makeEvent("N003", "14:00:00:00", "14:00:05:00", "01:00:18:00", "01:00:23:00"));
    }
    using Cut = void (*)(EventList&);
    void setCuts(Cut from, Cut to)
    {
        from(m_model.oldEdl());
        to(m_model.newEdl());
        ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    }
    void run(Cut from, Cut to)
    {
        setCuts(from, to);
        RunRecord::addRun(m_model, RunRecord::allowedBy(m_model.settings()));
    }
    void setGivenList(const char* dstIn, const char* dstOut)
    {
        m_model.newEdl().clear();
        m_model.changeEdl().clear();
        m_model.changeEdl().add(makeEvent("A001", "01:00:00:00", "01:00:05:00", dstIn, dstOut));
    }
    NextRun nextRun() const { return {m_model, ProtectedRun::sourceOf(m_model)}; }
    PastRuns noted() const { return RunRecord::find(m_model).value(); }
    void setNote(const Variant& note) { m_model.setProperty(PropertyKey::DoneRuns, note); }
    std::string note() const { return property(PropertyKey::DoneRuns); }
    std::string property(PropertyKey::Type key) const
    {
        Variant stored;
        EXPECT_EQ(m_model.getProperty(key, stored), util::Result::Ok);
        return stored.toText();
    }
    void setBadVfxName() { m_model.settings().setVfxPattern({"A/B", "", true}, 0); }
    /// As older versions did: all runs but the last one. Five seconds have moved to 05:00:10:00.
    void noteEarlierRun()
    {
        PastRuns earlier({0, {}, m_project.framerate});
        earlier.add(EventList(), EventList(), m_earlier);
        m_model.setProperty(PropertyKey::EarlierRuns, Variant(earlier.toBytes()));
    }

    TestProject m_project;
    DataModel m_model;
    EventList m_earlier;

private:
    static void setShots(EventList& list, const char* endOfA, const char* cut, const char* end)
    {
        list.clear();
        list.add(makeEvent("A001", "10:00:00:00", endOfA, "01:00:00:00", cut));
        list.add(makeEvent("B002", "12:00:00:00", "12:00:10:00", cut, end));
    }
};

} // namespace

TEST_F(RunRecordTest, WithoutANoteThereIsNone)
{
    setCuts(setFirst, setSecond);

    EXPECT_FALSE(RunRecord::find(m_model));
}

TEST_F(RunRecordTest, TheSameRunAgainDiffersFromTheCutThatTheSoundStandsIn)
{
    run(setFirst, setSecond);

    EXPECT_EQ(nextRun().firstDifference(noted()), TenSecondsIn - 2 * 25);
}

TEST_F(RunRecordTest, TheRunThatGoesOnFromThereDoesNot)
{
    run(setFirst, setSecond);
    setCuts(setSecond, setThird);

    EXPECT_EQ(nextRun().firstDifference(noted()), std::nullopt);
    EXPECT_FALSE(nextRun().hasBeenDone(noted()));
}

TEST_F(RunRecordTest, WhatTheUserDoesToTheListsAfterwardsChangesNoNote)
{
    run(setFirst, setSecond);
    setCuts(setFirst, setThird);

    EXPECT_EQ(nextRun().firstDifference(noted()), TenSecondsIn - 2 * 25);
}

TEST_F(RunRecordTest, ALaterRunIsNotedInThePlaceOfTheOneThatItHides)
{
    run(setFirst, setSecond);
    run(setSecond, setThird);
    setCuts(setThird, setFirst);

    EXPECT_EQ(noted().size(), 1U);
    EXPECT_EQ(nextRun().firstDifference(noted()), std::nullopt);
}

TEST_F(RunRecordTest, AListThatIsCarriedOutOfOneCutAloneCountsAsGiven)
{
    setFirst(m_model.oldEdl());
    setGivenList("01:00:05:00", "01:00:10:00");
    RunRecord::addRun(m_model, PastRuns::AllTime);

    EXPECT_TRUE(nextRun().hasBeenDone(noted()));
    EXPECT_EQ(nextRun().firstDifference(noted()), std::nullopt);
    setGivenList("01:00:06:00", "01:00:11:00");
    EXPECT_FALSE(nextRun().hasBeenDone(noted()));
}

TEST_F(RunRecordTest, ARunOfTheCutsIsDoneAgainByTheListThatTheyMake)
{
    run(setFirst, setSecond);

    EXPECT_TRUE(NextRun(m_model, Source::Given).hasBeenDone(noted()));
    EXPECT_EQ(NextRun(m_model, Source::Given).firstDifference(noted()), std::nullopt);
}

TEST_F(RunRecordTest, ARunCountsWhereTheUserLetItChangeSomethingAlone)
{
    m_model.settings().setRestrictRange(true);
    m_model.settings().setPreserveMaterial(3600.0, 3605.0);
    EXPECT_EQ(RunRecord::allowedBy(m_model.settings()), (FrameRange{90000, 90125}));
    run(setFirst, setSecond);

    // From there on the sound stands in the first cut, so that the rest of the change can follow.
    m_model.settings().setPreserveMaterial(3605.0, 3700.0);
    EXPECT_EQ(nextRun().firstDifference(noted()), std::nullopt);
    setCuts(setSecond, setThird);
    EXPECT_EQ(nextRun().firstDifference(noted()), TenSecondsIn - 2 * 25);
}

TEST_F(RunRecordTest, ARangeThatIsNoneLetsARunChangeEverything)
{
    core::Settings settings;
    EXPECT_EQ(RunRecord::allowedBy(settings), PastRuns::AllTime);
    settings.set(&core::Settings::restrictRange, true);
    settings.set(&core::Settings::preserveMaterialBefore, 20.0);
    settings.set(&core::Settings::preserveMaterialAfter, 10.0);
    EXPECT_EQ(RunRecord::allowedBy(settings), PastRuns::AllTime);
}

TEST_F(RunRecordTest, TheNoteComesAndGoesWithTheStateOfTheModel)
{
    setCuts(setFirst, setSecond);
    core::serialize::ByteArchive before;
    before << m_model;
    run(setFirst, setSecond);
    core::serialize::ByteArchive after;
    after << m_model;

    m_model.restore(before);
    EXPECT_FALSE(RunRecord::find(m_model));
    m_model.restore(after);
    EXPECT_TRUE(RunRecord::find(m_model));
    m_model.reset();
    EXPECT_FALSE(RunRecord::find(m_model));
}

TEST_F(RunRecordTest, ANoteThatCannotBeReadIsNoneAndIsLeftAlone)
{
    run(setFirst, setSecond);
    const std::string bytes = note();
    std::string laterVersion = bytes;
    ++laterVersion.front();
    for (const Variant& bad :
         {Variant(""), Variant("x"), Variant(std::int32_t{7}), Variant(1.5), Variant(true),
          Variant(bytes.substr(0, bytes.size() - 1)), Variant(std::string(300, '\xff')), Variant(laterVersion)}) {
        setNote(bad);
        EXPECT_FALSE(RunRecord::find(m_model));
        run(setFirst, setSecond);
        EXPECT_EQ(note(), bad.toText());
        RunRecord::write(RunRecord::findOrGuess(m_model, PastRuns::AllTime), m_model);
        EXPECT_EQ(note(), bad.toText());
    }
}

TEST_F(RunRecordTest, ANoteIsReadWhateverTheVfxNamesOfTheSettingsAre)
{
    run(setFirst, setSecond);
    const std::string bytes = note();
    setBadVfxName();

    EXPECT_EQ(noted().size(), 1U);
    EXPECT_EQ(noted().toBytes(), bytes);
    // Only the comparison of two cuts needs the names.
    EXPECT_THROW(nextRun().firstDifference(noted()), util::Result::Type);
    EXPECT_TRUE(NextRun(m_model, Source::Given).hasBeenDone(noted()));
}

TEST_F(RunRecordTest, RunsAreNotedWhateverTheVfxNamesOfTheSettingsAre)
{
    run(setFirst, setSecond);
    setBadVfxName();
    m_model.newEdl().clear();
    m_model.changeEdl().clear();
    m_model.changeEdl().add(makeEvent("X009", "05:00:00:00", "05:00:05:00", "05:00:10:00", "05:00:15:00"));
    RunRecord::addRun(m_model, PastRuns::AllTime);
    EXPECT_TRUE(nextRun().hasBeenDone(noted()));
    m_model.settings().setVfxPattern({}, 0);
    setCuts(setFirst, setThird);

    EXPECT_EQ(noted().size(), 2U);
    EXPECT_EQ(nextRun().firstDifference(noted()), TenSecondsIn - 2 * 25);
}

// At another rate a list may have no extent, so that any run would hide it.
TEST_F(RunRecordTest, ReadingForgetsNoRun)
{
    m_model.changeEdl().add(makeEvent("X009", "05:00:00:24", "05:00:05:24", "05:00:10:24", "05:00:15:24"));
    RunRecord::addRun(m_model, PastRuns::AllTime);
    run(setFirst, setSecond);
    const TestProject filmRate(core::Framerate(24, 0));

    EXPECT_EQ(noted().size(), 2U);
}

TEST_F(RunRecordTest, AnEmptyRunIsNotNoted)
{
    RunRecord::addRun(m_model, PastRuns::AllTime);

    EXPECT_FALSE(m_model.hasProperty(PropertyKey::DoneRuns));
}

// Projects of versions that noted no runs.

TEST_F(RunRecordTest, WithoutANoteTheListsAreThoseOfTheLastRun)
{
    setCuts(setFirst, setSecond);
    const PastRuns guessed = RunRecord::findOrGuess(m_model, PastRuns::AllTime);

    EXPECT_EQ(nextRun().firstDifference(guessed), TenSecondsIn - 2 * 25);
}

TEST_F(RunRecordTest, ANoteCountsMoreThanTheLists)
{
    run(setFirst, setSecond);
    setCuts(setSecond, setThird);
    const PastRuns found = RunRecord::findOrGuess(m_model, PastRuns::AllTime);

    EXPECT_EQ(nextRun().firstDifference(found), std::nullopt);
}

TEST_F(RunRecordTest, RunsBeforeTheLastOneAreFoundWhereOlderVersionsKeptThem)
{
    noteEarlierRun();
    setCuts(setFirst, setSecond);

    EXPECT_EQ(noted().size(), 1U);
    EXPECT_TRUE(noted().haveCarriedOut(m_earlier, true));
    const PastRuns guessed = RunRecord::findOrGuess(m_model, PastRuns::AllTime);
    EXPECT_EQ(guessed.size(), 2U);
    EXPECT_TRUE(guessed.haveCarriedOut(m_earlier, true));
    RunRecord::write(guessed, m_model);
    EXPECT_FALSE(m_model.hasProperty(PropertyKey::EarlierRuns));
    EXPECT_EQ(noted().size(), 2U);
}

TEST_F(RunRecordTest, TheNextRunIsNotedAfterThoseThatOlderVersionsKept)
{
    noteEarlierRun();
    run(setFirst, setSecond);

    EXPECT_FALSE(m_model.hasProperty(PropertyKey::EarlierRuns));
    EXPECT_EQ(noted().size(), 2U);
    EXPECT_TRUE(noted().haveCarriedOut(m_earlier, true));
}

TEST_F(RunRecordTest, WhatAnOlderVersionKeptAndCannotBeReadIsLeftAloneBesideANewNote)
{
    m_model.setProperty(PropertyKey::EarlierRuns, Variant("x"));
    run(setFirst, setSecond);

    EXPECT_EQ(property(PropertyKey::EarlierRuns), "x");
    EXPECT_EQ(noted().size(), 1U);
}

} // namespace cadrel::tests
