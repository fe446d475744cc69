// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/CutList.h"

#include "core/cut/CadrelPreviewState.h"
#include "core/cut/CadrelRunState.h"
#include "core/cut/Cut.h"
#include "core/cut/MarkerEntry.h"
#include "core/edl/EventBase.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/MemoryTrack.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <map>
#include <memory>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Cut;
using core::CutList;
using core::EventBase;
using core::ListKind;
using core::SecondsRange;
using util::Result;

/// Makes cuts on one track.
struct Film {
    static std::shared_ptr<EventBase> changeEvent(std::uint32_t number = 0)
    {
        return makeEvent("A012", "01:00:00:00", "01:00:01:00", "01:00:00:00", "01:00:01:00", number);
    }
    std::shared_ptr<core::CutEventBase> at(SecondsRange destination)
    {
        return std::make_shared<MemoryCutEvent>(track, 0.0, 1.0, destination.start, destination.end);
    }
    std::shared_ptr<Cut> cutAt(const std::vector<SecondsRange>& destinations)
    {
        Cut::CutEvents cutEvents;
        for (const SecondsRange& destination : destinations)
            cutEvents.push_back(at(destination));
        return std::make_shared<Cut>(changeEvent(), std::move(cutEvents));
    }

    MemoryTrack track{L"Dialogue"};
    CutList list;
};

TEST(Cut, HoldsItsChangeEventAndItsCutEventsInTheirOrder)
{
    Film film;
    const auto event = film.changeEvent();
    const auto first = film.at({2.0, 3.0});
    const auto second = film.at({1.0, 2.0});

    const Cut cut(event, {first, second});

    EXPECT_EQ(cut.event(), event);
    EXPECT_EQ(cut.cutEvents(), (Cut::CutEvents{first, second}));
}

TEST(Cut, GivesItsCutEventsByReference)
{
    Film film;
    Cut cut(film.changeEvent(), {});
    const auto added = film.at({1.0, 2.0});

    cut.cutEvents().push_back(added);

    EXPECT_EQ(cut.cutEvents(), Cut::CutEvents{added});
    EXPECT_EQ(cut.earliestDstIn(), 1.0);
}

TEST(Cut, ReachesFromTheEarliestStartToTheLatestEndOfItsTracks)
{
    Film film;
    const auto cut = film.cutAt({{5.0, 6.0}, {4.5, 4.75}, {5.5, 8.25}, {7.0, 7.5}});

    EXPECT_EQ(cut->earliestDstIn(), 4.5);
    EXPECT_EQ(cut->latestDstOut(), 8.25);
}

TEST(Cut, ReachesBeforeZeroToo)
{
    Film film;
    const auto cut = film.cutAt({{-3.0, -2.0}, {-2.5, -1.5}});

    EXPECT_EQ(cut->earliestDstIn(), -3.0);
    EXPECT_EQ(cut->latestDstOut(), -1.5);
}

TEST(Cut, FollowsTheMovesOfItsCutEvents)
{
    Film film;
    const auto cut = film.cutAt({{5.0, 6.0}, {5.0, 6.0}});

    cut->cutEvents()[1]->setDstIn(4.0);
    cut->cutEvents()[0]->setDstOut(7.0);

    EXPECT_EQ(cut->earliestDstIn(), 4.0);
    EXPECT_EQ(cut->latestDstOut(), 7.0);
}

TEST(Cut, WithoutCutEventsHasNeitherStartNorEnd)
{
    Film film;
    const auto cut = film.cutAt({});

    EXPECT_EQ(thrownBy([&] { cut->earliestDstIn(); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { cut->latestDstOut(); }), Result::OutOfRange);
}

TEST(CutList, IsEmptyAtFirstWithAChangeListOfNoEvents)
{
    Film film;
    EXPECT_TRUE(film.list.isEmpty());
    EXPECT_EQ(film.list.size(), 0U);
    EXPECT_TRUE(film.list.events().isEmpty());
    EXPECT_EQ(film.list.events().listKind(), ListKind::Change);
    EXPECT_TRUE(film.list.orderedByStart().empty());
}

TEST(CutList, KeepsCutsAndChangeEventsInTheOrderOfTheirComing)
{
    Film film;
    const auto late = film.cutAt({{20.0, 30.0}});
    const auto early = film.cutAt({{10.0, 20.0}});

    film.list.add(late);
    film.list.add(early);
    film.list.add(late);

    EXPECT_FALSE(film.list.isEmpty());
    ASSERT_EQ(film.list.size(), 3U);
    EXPECT_EQ(film.list.cutAt(0), late);
    EXPECT_EQ(film.list.cutAt(1), early);
    EXPECT_EQ(film.list.cutAt(2), late);
    ASSERT_EQ(film.list.events().size(), 3U);
    EXPECT_EQ(film.list.events().eventAt(0), late->event());
    EXPECT_EQ(film.list.events().eventAt(1), early->event());
    EXPECT_EQ(film.list.events().eventAt(2), late->event());
}

TEST(CutList, TakesNoNullCutAndNoCutWithoutAChangeEvent)
{
    Film film;
    EXPECT_EQ(thrownBy([&] { film.list.add(nullptr); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { film.list.add(std::make_shared<Cut>(nullptr, Cut::CutEvents{})); }),
              Result::InvalidArgument);

    EXPECT_TRUE(film.list.isEmpty());
    EXPECT_TRUE(film.list.events().isEmpty());
}

TEST(CutList, LosesCutsAndChangeEventsWhenCleared)
{
    Film film;
    film.list.add(film.cutAt({{10.0, 20.0}}));
    const std::weak_ptr<Cut> cut = film.list.cutAt(0);

    film.list.clear();

    EXPECT_TRUE(film.list.isEmpty());
    EXPECT_EQ(film.list.size(), 0U);
    EXPECT_TRUE(film.list.events().isEmpty());
    EXPECT_TRUE(cut.expired());
}

TEST(CutList, ReachesFromTheEarliestStartToTheLatestEndOfItsCuts)
{
    Film film;
    film.list.add(film.cutAt({{20.0, 30.0}, {21.0, 45.0}}));
    film.list.add(film.cutAt({{10.0, 20.0}, {9.0, 19.0}}));
    film.list.add(film.cutAt({{30.0, 40.0}, {31.0, 41.0}}));

    EXPECT_EQ(film.list.earliestDstIn(), 9.0);
    EXPECT_EQ(film.list.latestDstOut(), 45.0);
}

TEST(CutList, WithoutCutsHasNeitherStartNorEnd)
{
    Film film;
    EXPECT_EQ(thrownBy([&] { film.list.earliestDstIn(); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { film.list.latestDstOut(); }), Result::OutOfRange);
}

TEST(CutList, WithACutWithoutCutEventsHasNoTimesAtAll)
{
    Film film;
    film.list.add(film.cutAt({{10.0, 20.0}}));
    film.list.add(film.cutAt({}));

    EXPECT_EQ(thrownBy([&] { film.list.earliestDstIn(); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { film.list.latestDstOut(); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { film.list.orderedByStart(); }), Result::OutOfRange);
}

TEST(CutList, OrdersItsCutsByTheirEarliestStart)
{
    Film film;
    film.list.add(film.cutAt({{20.0, 30.0}, {18.0, 30.0}}));
    film.list.add(film.cutAt({{5.0, 9.0}, {19.0, 20.0}}));
    film.list.add(film.cutAt({{18.5, 40.0}}));

    const auto ordered = film.list.orderedByStart();

    ASSERT_EQ(ordered.size(), 3U);
    auto entry = ordered.begin();
    EXPECT_EQ(entry->first, 5.0);
    EXPECT_EQ(entry->second.lock(), film.list.cutAt(1));
    EXPECT_EQ((++entry)->first, 18.0);
    EXPECT_EQ(entry->second.lock(), film.list.cutAt(0));
    EXPECT_EQ((++entry)->first, 18.5);
    EXPECT_EQ(entry->second.lock(), film.list.cutAt(2));
}

TEST(CutList, OrdersTheLaterOfTwoCutsWithOneStartAlone)
{
    Film film;
    film.list.add(film.cutAt({{10.0, 20.0}}));
    film.list.add(film.cutAt({{12.0, 14.0}, {10.0, 11.0}}));

    const auto ordered = film.list.orderedByStart();

    ASSERT_EQ(ordered.size(), 1U);
    EXPECT_EQ(ordered.at(10.0).lock(), film.list.cutAt(1));
}

TEST(CutList, OrderDoesNotKeepItsCutsAlive)
{
    Film film;
    film.list.add(film.cutAt({{10.0, 20.0}}));
    const auto ordered = film.list.orderedByStart();

    film.list.clear();

    EXPECT_TRUE(ordered.at(10.0).expired());
}

TEST(CutList, OrderIsThatOfTheMomentAndStandsStillWhenCutsMove)
{
    Film film;
    film.list.add(film.cutAt({{10.0, 20.0}}));
    const auto before = film.list.orderedByStart();

    film.list.cutAt(0)->cutEvents()[0]->setDstIn(11.0);

    EXPECT_TRUE(before.contains(10.0));
    EXPECT_TRUE(film.list.orderedByStart().contains(11.0));
}

RC_GTEST_PROP(CutList, OrderHoldsTheLastCutOfEachStart, ())
{
    Film film;
    const auto starts =
        *rc::gen::container<std::vector<std::vector<std::int8_t>>>(rc::gen::nonEmpty<std::vector<std::int8_t>>());
    std::map<double, std::shared_ptr<Cut>> expected;
    for (const auto& startsOfTracks : starts) {
        std::vector<SecondsRange> destinations;
        double earliest = startsOfTracks.front();
        for (const double start : startsOfTracks) {
            destinations.push_back({start, start + 1.0});
            earliest = std::min(earliest, start);
        }
        film.list.add(film.cutAt(destinations));
        expected[earliest] = film.list.cutAt(film.list.size() - 1);
    }

    std::map<double, std::shared_ptr<Cut>> found;
    for (const auto& [start, cut] : film.list.orderedByStart())
        found[start] = cut.lock();
    RC_ASSERT(found == expected);
}

TEST(MarkerKind, CountsTheMarkerTracksFromOne)
{
    EXPECT_EQ(core::MarkerKind::Insert, 1);
    EXPECT_EQ(core::MarkerKind::DissolveWipe, 2);
    EXPECT_EQ(core::MarkerKind::AutomationWarning, 3);
    EXPECT_EQ(core::MarkerKind::AudioSnippet, 4);
    EXPECT_EQ(core::MarkerKind::Overlap, 5);
}

TEST(RunState, KnowsNothingAtFirst)
{
    const core::CadrelRunState run;
    const core::CadrelPreviewState preview;

    EXPECT_EQ(run.oldEvents, nullptr);
    EXPECT_EQ(run.newEvents, nullptr);
    EXPECT_TRUE(run.framerate.isUnknown());
    EXPECT_EQ(run.settings, nullptr);
    EXPECT_EQ(run.previewOffset, 0.0);
    EXPECT_TRUE(preview.framerate.isUnknown());
    EXPECT_EQ(preview.settings, nullptr);
}

} // namespace
} // namespace cadrel::tests
