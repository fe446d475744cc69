// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoRows.h"

#include "core/model/VideoList.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestPool.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <iostream>
#include <limits>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Timecode;
using core::VideoList;
using gui::VideoColumn;
using gui::VideoRows;
using util::Result;
using Entry = VideoList::Entry;

/// At 25 frames a second.
constexpr std::uint32_t Minute = 1500;

class VideoRowsTest : public testing::Test {
protected:
    VideoRowsTest()
    {
        m_pool.videos = {{L"/b/reel2.mov", 2 * Minute}, {L"/a/reel1.mov", Minute}, {L"/c/reel3.mov", 3 * Minute}};
        m_rows.setTimeOrigin(3600.0);
        m_rows.refill();
    }

    /// "name start end length", with a mark for those that are used.
    std::vector<std::string> shown() const
    {
        std::vector<std::string> rows;
        for (std::size_t index = 0; index < m_rows.count(); ++index) {
            const VideoRows::Row& row = m_rows.at(index);
            rows.push_back((row.isUsed ? "*" : "") + row.name + " " + row.start.toString() + " " + row.end.toString() +
                           " " + row.length.toString());
        }
        return rows;
    }
    std::vector<std::string> names() const
    {
        std::vector<std::string> rows;
        for (std::size_t index = 0; index < m_rows.count(); ++index)
            rows.push_back(m_rows.at(index).name);
        return rows;
    }
    std::string startOf(const char* path) const { return m_rows.at(*m_rows.find(path)).start.toString(); }
    void use(const char* path, bool isUsed = true)
    {
        m_rows.setUsed(path, isUsed);
        m_rows.refill();
    }
    void start(const char* path, const char* timecode)
    {
        m_rows.setStart(path, Timecode(timecode));
        m_rows.refill();
    }

    TestProject m_project;
    RecordingUndo m_undo;
    VideoList m_list;
    TestPool m_pool;
    VideoRows m_rows{m_list, &m_pool};
};

using Rows = std::vector<std::string>;
using Names = std::vector<std::wstring>;

TEST_F(VideoRowsTest, ShowsTheVideosOfThePoolByNameFromTheTimeOriginOn)
{
    EXPECT_EQ(shown(),
              (Rows{"reel1.mov 01:00:00:00 01:01:00:00 00:01:00:00", "reel2.mov 01:00:00:00 01:02:00:00 00:02:00:00",
                    "reel3.mov 01:00:00:00 01:03:00:00 00:03:00:00"}));
}

TEST_F(VideoRowsTest, HasNoRowsBeforeItIsFilledAndWithoutAPool)
{
    VideoRows none(m_list, nullptr);
    EXPECT_EQ(none.count(), 0U);
    none.refill();
    EXPECT_EQ(none.count(), 0U);

    m_rows.setMediaPool(nullptr);
    m_rows.refill();
    EXPECT_EQ(m_rows.count(), 0U);
}

TEST_F(VideoRowsTest, AVideoThatIsUsedHasItsPlaceInTheList)
{
    m_list.add(Entry("/a/reel1.mov", Timecode("02:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();

    EXPECT_EQ(shown()[0], "*reel1.mov 02:00:00:00 02:01:00:00 00:01:00:00");
}

TEST_F(VideoRowsTest, AVideoIsTheSameInAnotherFolder)
{
    m_list.add(Entry("/moved/reel1.mov", Timecode("02:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();
    EXPECT_EQ(shown()[0], "*reel1.mov 02:00:00:00 02:01:00:00 00:01:00:00");

    start("/a/reel1.mov", "03:00:00:00");
    EXPECT_EQ(startOf("/a/reel1.mov"), "03:00:00:00");
    use("/a/reel1.mov", false);
    EXPECT_TRUE(m_list.isEmpty());
}

TEST_F(VideoRowsTest, UnusedVideosProposeTheEndOfTheLastThatIsUsed)
{
    m_list.add(Entry("/c/reel3.mov", Timecode("04:00:00:00"), Timecode("00:03:00:00")), false);
    m_list.add(Entry("/a/reel1.mov", Timecode("02:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();

    EXPECT_EQ(startOf("/b/reel2.mov"), "04:03:00:00");
}

TEST_F(VideoRowsTest, UnusedVideosProposeTheTimeOriginWhereTheLastEndsWithTheDay)
{
    m_list.add(Entry("/a/reel1.mov", Timecode("23:59:00:00"), Timecode("00:00:59:24")), false);
    m_rows.refill();
    EXPECT_EQ(startOf("/b/reel2.mov"), "23:59:59:24") << "one frame is left";

    m_list.clear();
    m_list.add(Entry("/a/reel1.mov", Timecode("23:59:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();
    EXPECT_EQ(startOf("/b/reel2.mov"), "01:00:00:00");
}

TEST_F(VideoRowsTest, ProposesTheTimeOriginAndZeroWhereThatIsNoTimeOfTheDay)
{
    const auto proposed = [this](double seconds) {
        m_rows.setTimeOrigin(seconds);
        m_rows.refill();
        return startOf("/a/reel1.mov");
    };
    EXPECT_EQ(proposed(0.0), "00:00:00:00");
    EXPECT_EQ(proposed(36000.0), "10:00:00:00");
    EXPECT_EQ(proposed(86399.96), "23:59:59:24");
    EXPECT_EQ(proposed(86400.0), "00:00:00:00");
    EXPECT_EQ(proposed(-0.04), "00:00:00:00");
    EXPECT_EQ(proposed(1e300), "00:00:00:00");
    EXPECT_EQ(proposed(std::numeric_limits<double>::infinity()), "00:00:00:00");
    EXPECT_EQ(proposed(std::nan("")), "00:00:00:00");
}

TEST_F(VideoRowsTest, AVideoThatRunsPastTheDayEndsWithItsLastTimecode)
{
    start("/a/reel1.mov", "23:58:59:24");
    EXPECT_EQ(shown()[0], "reel1.mov 23:58:59:24 23:59:59:24 00:01:00:00") << "one below";

    start("/a/reel1.mov", "23:59:00:00");
    EXPECT_EQ(shown()[0], "reel1.mov 23:59:00:00 23:59:59:24 00:01:00:00");

    start("/a/reel1.mov", "23:59:59:00");
    EXPECT_EQ(shown()[0], "reel1.mov 23:59:59:00 23:59:59:24 00:01:00:00");
}

TEST_F(VideoRowsTest, ALengthOfMoreThanADayIsTheDay)
{
    m_pool.videos = {{L"/a/day.mov", 24 * 60 * Minute - 1},
                     {L"/a/days.mov", 24 * 60 * Minute},
                     {L"/a/most.mov", std::numeric_limits<std::uint32_t>::max()},
                     {L"/a/none.mov", 0}};
    m_rows.setTimeOrigin(0.0);
    m_rows.refill();

    EXPECT_EQ(shown(),
              (Rows{"day.mov 00:00:00:00 23:59:59:24 23:59:59:24", "days.mov 00:00:00:00 23:59:59:24 23:59:59:24",
                    "most.mov 00:00:00:00 23:59:59:24 23:59:59:24", "none.mov 00:00:00:00 00:00:00:00 00:00:00:00"}));
}

TEST_F(VideoRowsTest, LeavesOutWhatHasNoPathAndWhatItHasAlready)
{
    m_pool.videos = {
        {L"", Minute}, {L"/a/lost.mov", Minute, true}, {L"/a/reel1.mov", Minute}, {L"/a/reel1.mov", Minute}};
    m_rows.refill();

    EXPECT_EQ(names(), (Rows{"reel1.mov"}));
}

TEST_F(VideoRowsTest, HasNoRowsWithoutAProject)
{
    const NoProject none;
    m_rows.refill();
    EXPECT_EQ(m_rows.count(), 0U);
}

TEST_F(VideoRowsTest, UsesAVideoAsOneUndoEntry)
{
    use("/a/reel1.mov");

    ASSERT_EQ(m_list.size(), 1U);
    EXPECT_EQ(m_list.at(0), Entry("/a/reel1.mov", Timecode("01:00:00:00"), Timecode("00:01:00:00")));
    EXPECT_EQ(m_undo.entries, (Names{L"Add New Video"}));
    EXPECT_EQ(shown(),
              (Rows{"*reel1.mov 01:00:00:00 01:01:00:00 00:01:00:00", "reel2.mov 01:01:00:00 01:03:00:00 00:02:00:00",
                    "reel3.mov 01:01:00:00 01:04:00:00 00:03:00:00"}));
}

TEST_F(VideoRowsTest, UsedOneAfterTheOtherTheVideosFollowEachOther)
{
    use("/a/reel1.mov");
    use("/b/reel2.mov");
    use("/c/reel3.mov");

    EXPECT_EQ(shown(),
              (Rows{"*reel1.mov 01:00:00:00 01:01:00:00 00:01:00:00", "*reel2.mov 01:01:00:00 01:03:00:00 00:02:00:00",
                    "*reel3.mov 01:03:00:00 01:06:00:00 00:03:00:00"}));
}

TEST_F(VideoRowsTest, RemovesAVideoAsOneUndoEntry)
{
    use("/a/reel1.mov");
    use("/a/reel1.mov", false);

    EXPECT_TRUE(m_list.isEmpty());
    EXPECT_EQ(m_undo.entries, (Names{L"Add New Video", L"Remove New Video"}));
    EXPECT_EQ(startOf("/a/reel1.mov"), "01:00:00:00");
}

TEST_F(VideoRowsTest, MovesAVideoThatIsUsedAsOneUndoEntry)
{
    use("/a/reel1.mov");
    start("/a/reel1.mov", "02:00:00:00");

    EXPECT_EQ(m_list.at(0), Entry("/a/reel1.mov", Timecode("02:00:00:00"), Timecode("00:01:00:00")));
    EXPECT_EQ(m_undo.entries, (Names{L"Add New Video", L"Move New Video"}));
}

TEST_F(VideoRowsTest, MakesNoUndoEntryWhenNothingChanges)
{
    use("/a/reel1.mov", false);
    use("/nowhere.mov");
    start("/nowhere.mov", "02:00:00:00");
    start("/a/reel1.mov", "01:00:00:00");
    EXPECT_TRUE(m_undo.begun.empty());

    use("/a/reel1.mov");
    use("/a/reel1.mov");
    start("/a/reel1.mov", "01:00:00:00");
    EXPECT_EQ(m_undo.begun.size(), 1U);
}

TEST_F(VideoRowsTest, KeepsTheStartThatAnUnusedVideoWasGivenUntilItIsUsed)
{
    start("/c/reel3.mov", "05:00:00:00");
    use("/a/reel1.mov");
    EXPECT_EQ(startOf("/c/reel3.mov"), "05:00:00:00");
    EXPECT_EQ(startOf("/b/reel2.mov"), "01:01:00:00");

    use("/c/reel3.mov");
    EXPECT_EQ(m_list.at(1).start, Timecode("05:00:00:00"));

    use("/c/reel3.mov", false);
    EXPECT_EQ(startOf("/c/reel3.mov"), "01:01:00:00");
}

TEST_F(VideoRowsTest, RefusesAStartThatIsTaken)
{
    use("/a/reel1.mov");
    start("/b/reel2.mov", "01:00:00:00");

    EXPECT_EQ(thrownBy([this] { m_rows.setUsed("/b/reel2.mov", true); }), Result::PositionOccupied);
    EXPECT_EQ(m_list.size(), 1U);

    start("/b/reel2.mov", "01:00:00:01");
    use("/b/reel2.mov");
    EXPECT_EQ(thrownBy([this] { m_rows.setStart("/b/reel2.mov", Timecode("01:00:00:00")); }), Result::PositionOccupied);
    EXPECT_EQ(m_list.size(), 2U);
    EXPECT_EQ(m_list.at(1).start, Timecode("01:00:00:01"));
    EXPECT_EQ(m_undo.begun, (Names{L"Add New Video", L"Add New Video"}));
}

TEST_F(VideoRowsTest, UsesAVideoThatRunsPastTheDay)
{
    start("/a/reel1.mov", "23:59:59:00");
    use("/a/reel1.mov");

    EXPECT_EQ(m_list.at(0), Entry("/a/reel1.mov", Timecode("23:59:59:00"), Timecode("00:01:00:00")));
}

TEST_F(VideoRowsTest, LeavesTheListAsItWasWhenTheUndoEntryFails)
{
    use("/a/reel1.mov");
    m_undo.failure = Result::HostCallFailed;

    EXPECT_EQ(thrownBy([this] { m_rows.setUsed("/b/reel2.mov", true); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([this] { m_rows.setUsed("/a/reel1.mov", false); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([this] { m_rows.setStart("/a/reel1.mov", Timecode("02:00:00:00")); }), Result::HostCallFailed);

    ASSERT_EQ(m_list.size(), 1U);
    EXPECT_EQ(m_list.at(0).start, Timecode("01:00:00:00"));
}

TEST_F(VideoRowsTest, SortsByNameStartAndLength)
{
    start("/a/reel1.mov", "05:00:00:00");
    start("/c/reel3.mov", "03:00:00:00");

    m_rows.sort(VideoColumn::Name, true);
    EXPECT_EQ(names(), (Rows{"reel3.mov", "reel2.mov", "reel1.mov"}));
    m_rows.sort(VideoColumn::Start, false);
    EXPECT_EQ(names(), (Rows{"reel2.mov", "reel3.mov", "reel1.mov"}));
    m_rows.sort(VideoColumn::Start, true);
    EXPECT_EQ(names(), (Rows{"reel1.mov", "reel3.mov", "reel2.mov"}));
    m_rows.sort(VideoColumn::Length, true);
    EXPECT_EQ(names(), (Rows{"reel3.mov", "reel2.mov", "reel1.mov"}));
    m_rows.sort(VideoColumn::Length, false);
    EXPECT_EQ(names(), (Rows{"reel1.mov", "reel2.mov", "reel3.mov"}));
}

TEST_F(VideoRowsTest, ANumberThatIsNoColumnSortsByStart)
{
    start("/a/reel1.mov", "05:00:00:00");
    for (const int column : {0, 6, -1}) {
        m_rows.sort(VideoColumn::Name, false);
        m_rows.sort(column, false);
        EXPECT_EQ(names(), (Rows{"reel2.mov", "reel3.mov", "reel1.mov"})) << column;
    }
}

TEST_F(VideoRowsTest, StaysSortedWhenItIsFilledAnew)
{
    m_rows.sort(VideoColumn::Length, true);

    m_pool.videos.push_back({L"/a/reel0.mov", Minute + 1});
    m_rows.refill();

    EXPECT_EQ(names(), (Rows{"reel3.mov", "reel2.mov", "reel0.mov", "reel1.mov"}));
}

TEST_F(VideoRowsTest, NamesAreOrderedByTheirBytes)
{
    m_pool.videos = {{L"/a/b.mov", 1}, {L"/a/\u00e4.mov", 1}, {L"/a/B.mov", 1}, {L"/a/a.mov", 1}, {L"/a/a", 1}};
    m_rows.refill();

    EXPECT_EQ(names(), (Rows{"B.mov", "a", "a.mov", "b.mov", "\xc3\xa4.mov"}));
}

TEST_F(VideoRowsTest, HasTheTextsOfItsCells)
{
    EXPECT_EQ(m_rows.text(0, VideoColumn::Name), L"reel1.mov");
    EXPECT_EQ(m_rows.text(0, VideoColumn::Use), L"");
    EXPECT_EQ(m_rows.text(0, VideoColumn::Start), L"");
    EXPECT_EQ(m_rows.text(0, VideoColumn::End), L"01:01:00:00");
    EXPECT_EQ(m_rows.text(0, VideoColumn::Length), L"00:01:00:00");
    EXPECT_EQ(m_rows.text(0, 6), L"");
    EXPECT_EQ(thrownBy([this] { m_rows.text(3, VideoColumn::Name); }), Result::InvalidArgument);
}

TEST_F(VideoRowsTest, HasFiveColumns)
{
    std::vector<std::tuple<int, std::wstring, int, int>> columns;
    for (const VideoColumn& column : VideoColumn::all())
        columns.emplace_back(column.id, column.header, column.width, column.maximumWidth);
    EXPECT_EQ(columns, (std::vector<std::tuple<int, std::wstring, int, int>>{{1, L"Name", 380, 800},
                                                                             {2, L"Use as New Video", 180, 180},
                                                                             {3, L"Start", 100, 100},
                                                                             {4, L"End", 100, 100},
                                                                             {5, L"Length", 100, 100}}));
}

// ---- Videos of the list that have left the pool --------------------------------------------------------------------

TEST_F(VideoRowsTest, AVideoThatIsNotInThePoolAnyMoreIsShownAsMissing)
{
    m_list.add(Entry("/gone/reel0.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    m_list.add(Entry("/a/reel1.mov", Timecode("02:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();

    EXPECT_EQ(shown(),
              (Rows{"*reel0.mov 05:00:00:00 05:01:00:00 00:01:00:00", "*reel1.mov 02:00:00:00 02:01:00:00 00:01:00:00",
                    "reel2.mov 05:01:00:00 05:03:00:00 00:02:00:00", "reel3.mov 05:01:00:00 05:04:00:00 00:03:00:00"}));
    EXPECT_EQ(m_rows.text(0, VideoColumn::Name), L"Missing: reel0.mov");
    EXPECT_EQ(m_rows.text(1, VideoColumn::Name), L"reel1.mov");
    EXPECT_TRUE(m_rows.at(0).isMissing);
    EXPECT_FALSE(m_rows.at(1).isMissing);
    EXPECT_FALSE(m_rows.at(2).isMissing);
}

TEST_F(VideoRowsTest, AVideoThatComesBackIntoThePoolIsMissingNoLonger)
{
    m_list.add(Entry("/gone/reel0.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    m_pool.videos.push_back({L"/elsewhere/reel0.mov", Minute});
    m_rows.refill();

    EXPECT_FALSE(m_rows.at(*m_rows.find("/elsewhere/reel0.mov")).isMissing);
    EXPECT_EQ(m_rows.count(), 4U);
}

TEST_F(VideoRowsTest, RemovesAMissingVideoAsOneUndoEntry)
{
    m_list.add(Entry("/gone/reel0.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();
    use("/gone/reel0.mov", false);

    EXPECT_TRUE(m_list.isEmpty());
    EXPECT_EQ(m_undo.entries, Names{L"Remove New Video"});
    EXPECT_EQ(m_rows.count(), 3U);
    EXPECT_EQ(m_rows.find("/gone/reel0.mov"), std::nullopt);
}

TEST_F(VideoRowsTest, MovesAMissingVideo)
{
    m_list.add(Entry("/gone/reel0.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.refill();
    start("/gone/reel0.mov", "06:00:00:00");

    EXPECT_EQ(startOf("/gone/reel0.mov"), "06:00:00:00");
    EXPECT_EQ(m_undo.entries, Names{L"Move New Video"});
}

TEST_F(VideoRowsTest, EachOfSeveralMissingVideosCanBeRemovedWhateverItsPathIs)
{
    // As no one can add them, but a stored list may hold them.
    const std::vector<std::string> stored{
        "/gone/reel0.mov", "/gone/reel0.mov", "/lost/reel0.mov", "", "\xff\xfe", "/x/"};
    core::serialize::ByteArchive archive;
    archive.writeCount(stored.size());
    for (std::size_t index = 0; index < stored.size(); ++index)
        archive << Entry(stored[index], Timecode(5, 0, 0, static_cast<std::int32_t>(index)), Timecode("00:01:00:00"));
    m_list.readCurrent(archive);
    m_rows.refill();
    EXPECT_EQ(m_rows.count(), 3U + 5U) << "one row for those with the same path";

    for (std::size_t left = stored.size(); left > 0; --left) {
        ASSERT_EQ(m_list.size(), left);
        std::size_t row = 0;
        while (!m_rows.at(row).isMissing)
            ++row;
        EXPECT_EQ(m_rows.text(row, VideoColumn::Name).substr(0, 9), L"Missing: ");
        m_rows.setUsed(std::string(m_rows.at(row).path), false);
        m_rows.refill();
    }
    EXPECT_TRUE(m_list.isEmpty());
    EXPECT_EQ(m_rows.count(), 3U);
}

TEST_F(VideoRowsTest, NothingIsMissingWithoutAPoolOrAProject)
{
    m_list.add(Entry("/gone/reel0.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    m_rows.setMediaPool(nullptr);
    m_rows.refill();
    EXPECT_EQ(m_rows.count(), 0U);

    m_rows.setMediaPool(&m_pool);
    const NoProject none;
    m_rows.refill();
    EXPECT_EQ(m_rows.count(), 0U);
}

TEST_F(VideoRowsTest, TenThousandVideosAreReadInATenthOfASecond)
{
    m_pool.videos.clear();
    for (int number = 0; number < 10000; ++number) {
        const std::wstring path = L"/picture/2026-11-22 reel " + std::to_wstring(number) + L" v12.mov";
        m_pool.videos.push_back({path, Minute});
        if (number % 10 == 0)
            m_list.add(Entry(util::StringUtil::toUtf8(path), Timecode(number * 100), Timecode("00:00:04:00")), false);
    }
    double best = 1e9;
    for (int run = 0; run < 5; ++run)
        best = std::min(best, secondsOf([this] { m_rows.refill(); }));
    std::cout << "refill: " << best * 1000.0 << " ms\n";
    ASSERT_EQ(m_rows.count(), 10000U);
    EXPECT_LT(best, CADREL_ADDRESS_SANITIZER ? 2.0 : 0.1);
}

RC_GTEST_FIXTURE_PROP(VideoRowsTest, NoTwoVideosThatAreUsedStartTogetherWhateverTheUserDoes, ())
{
    const std::vector<const char*> paths{"/a/reel1.mov", "/b/reel2.mov", "/c/reel3.mov", "/nowhere.mov"};
    const int steps = *rc::gen::inRange(1, 30);
    for (int step = 0; step < steps; ++step) {
        const std::string path = *rc::gen::elementOf(paths);
        const Timecode place(0, 0, 0, *rc::gen::inRange(0, 4));
        const std::size_t before = m_list.size();
        const bool isMove = *rc::gen::arbitrary<bool>();
        const bool isUse = !m_list.containsFile(path);
        const Result::Type result =
            thrownBy([&] { isMove ? m_rows.setStart(path, place) : m_rows.setUsed(path, isUse); });
        RC_ASSERT(result == Result::Ok || result == Result::PositionOccupied);
        const bool isInPool = path != paths.back();
        const bool isChanged = !isMove && isInPool && result == Result::Ok;
        RC_ASSERT(m_list.size() == (!isChanged ? before : isUse ? before + 1 : before - 1));
        m_rows.refill();
        std::size_t used = 0;
        for (std::size_t row = 0; row < m_rows.count(); ++row)
            used += m_rows.at(row).isUsed ? 1 : 0;
        RC_ASSERT(used == m_list.size());
        RC_ASSERT(m_undo.begun.size() == m_undo.entries.size());
    }
}

} // namespace
} // namespace cadrel::tests
