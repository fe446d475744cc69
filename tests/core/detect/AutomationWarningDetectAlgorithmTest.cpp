// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/AutomationWarningDetectAlgorithm.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/CutFilm.h"
#include "tests/support/core/RecordingProgress.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::AutomationWarningDetectAlgorithm;
using core::Framerate;
using core::MarkerEntry;
using core::SecondsRange;
using util::Result;

using Entries = std::vector<MarkerEntry>;
using Points = std::vector<MemoryPoint>;

constexpr std::int32_t Volume = 7;
constexpr std::int32_t Pan = -2;
constexpr double Day = 86400.0;

/// The old film has a value of 0.2 up to 200 seconds and one of 0.7 from 250 on. What is written of the new one stands a day
/// later.
struct AutomationFilm : CutFilm {
    AutomationFilm() { previewOffset = Day; }

    static void addPoints(MemoryTrack& track, const Points& points, std::int32_t curve = Volume)
    {
        for (const auto& [time, value] : points)
            track.addPoint(curve, time, value);
    }
    static void write(MemoryTrack& track, const Points& points, std::int32_t curve = Volume)
    {
        for (const auto& [time, value] : points)
            track.addPoint(curve, Day + time, value);
    }
    MemoryTrack& addFilmTrack(const std::wstring& name)
    {
        MemoryTrack& track = addTrack(name);
        addPoints(track, {{0.0, 0.2}, {200.0, 0.2}, {250.0, 0.7}});
        return track;
    }
    /// On all tracks.
    void cut(SecondsRange source, SecondsRange destination)
    {
        core::Cut::CutEvents cutEvents;
        for (MemoryTrack& track : tracks())
            cutEvents.push_back(cutEvent(track, source, destination));
        addCut(std::move(cutEvents));
    }
    void restrictTo(double before, double after)
    {
        settings().setPreserveMaterial(before, after);
        settings().setRestrictRange(true);
    }
    Entries detect(core::ProgressHandlerBase* progress = nullptr) const
    {
        return detectBy(AutomationWarningDetectAlgorithm(), progress);
    }
};

MarkerEntry warningAt(double start, double end, const std::string& tracks)
{
    return {start, end, "Automation warning in " + tracks, 3};
}

//     old film     100 0.2 110        300 0.7 310
//     new film         10 --- 0.2 --- 20 --- 0.7 --- 30
TEST(AutomationWarningDetectAlgorithm, CurveThatJumpsWhereTwoRangesMeetIsMarkedAtTheSeam)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {20.0, 0.2}, {20.0, 0.7}, {30.0, 0.7}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(20.0, 20.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, TheOrderOfTheListDoesNotMatter)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {20.0, 0.2}, {20.0, 0.7}, {30.0, 0.7}});
    film.cut({300.0, 310.0}, {20.0, 30.0});
    film.cut({100.0, 110.0}, {10.0, 20.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(20.0, 20.0, "Dialogue ")});
}

/// Whether a curve that steps from one value to another in the new film is marked.
bool isMarked(double from, double to)
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    AutomationFilm::addPoints(track, {{0.0, from}});
    AutomationFilm::write(track, {{20.0, from}, {20.0, to}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});
    return film.detect() == Entries{warningAt(20.0, 20.0, "Dialogue ")};
}

TEST(AutomationWarningDetectAlgorithm, ValuesThatDifferByAHundredthAreNoJump)
{
    for (int hundredth = 0; hundredth < 100; ++hundredth) {
        const double lower = hundredth / 100.0;
        const double upper = (hundredth + 1) / 100.0;
        EXPECT_FALSE(isMarked(lower, upper)) << lower;
        EXPECT_FALSE(isMarked(upper, lower)) << lower;
        EXPECT_FALSE(isMarked(static_cast<float>(hundredth) / 100.0F, static_cast<float>(hundredth + 1) / 100.0F));
    }
}

TEST(AutomationWarningDetectAlgorithm, ValuesThatDifferByMoreThanAHundredthAreAJumpUpAndDown)
{
    EXPECT_FALSE(isMarked(0.5, 0.5));
    EXPECT_FALSE(isMarked(0.5, 0.5099));
    EXPECT_TRUE(isMarked(0.5, 0.5101));
    EXPECT_FALSE(isMarked(0.5, 0.4901));
    EXPECT_TRUE(isMarked(0.5, 0.4899));
    EXPECT_TRUE(isMarked(0.0, 1.0));
}

//     new film         10 --- 0.2 --- 20 ... 0.2 ... 35 --- 0.7 --- 45
TEST(AutomationWarningDetectAlgorithm, CurveThatIsHeldOverAGapIsMarkedWhereTheGapEnds)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {35.0, 0.2}, {35.0, 0.7}, {45.0, 0.7}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {35.0, 45.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(35.0, 35.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, CurveThatIsLedStraightOverAGapIsNotMarked)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {20.0, 0.2}, {35.0, 0.7}, {45.0, 0.7}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {35.0, 45.0});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, CurveThatJumpsAfterTheLastRangeIsMarkedThere)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {20.0, 0.2}, {20.0, 0.7}});
    film.cut({100.0, 110.0}, {10.0, 20.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(20.0, 20.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, NothingComesBeforeTheBeginningOfTheProgramme)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{0.0, 0.7}, {0.0, 0.2}, {10.0, 0.2}});
    film.cut({100.0, 110.0}, {0.0, 10.0});

    EXPECT_EQ(film.detect(), Entries{});
}

//     old film         ---- 0.3 --- 110 --- 0.9 ---
//     new film     10 --- 0.3 --- 20 --- 0.9 --- 30
TEST(AutomationWarningDetectAlgorithm, JumpOfTheOldProgrammeIsNotMarkedWhereItWasCarriedTo)
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    AutomationFilm::addPoints(track, {{110.0, 0.3}, {110.0, 0.9}});
    AutomationFilm::write(track, {{20.0, 0.3}, {20.0, 0.9}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({110.0, 120.0}, {20.0, 30.0});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, JumpOfTheOldProgrammeIsNotMarkedBehindAnInsertEither)
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    AutomationFilm::addPoints(track, {{110.0, 0.3}, {110.0, 0.9}});
    AutomationFilm::write(track, {{35.0, 0.3}, {35.0, 0.9}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({110.0, 120.0}, {35.0, 45.0});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, AnotherJumpThanThatOfTheOldProgrammeIsMarked)
{
    for (const auto& [from, to] : {std::pair(0.3, 0.7), std::pair(0.5, 0.9), std::pair(0.9, 0.3)}) {
        AutomationFilm film;
        MemoryTrack& track = film.addTrack(L"Dialogue");
        AutomationFilm::addPoints(track, {{110.0, 0.3}, {110.0, 0.9}});
        AutomationFilm::write(track, {{20.0, from}, {20.0, to}});
        film.cut({100.0, 110.0}, {10.0, 20.0});
        film.cut({110.0, 120.0}, {20.0, 30.0});

        EXPECT_EQ(film.detect(), Entries{warningAt(20.0, 20.0, "Dialogue ")}) << from << " to " << to;
    }
}

//     new film     10 ------ 0.2 ------ 30
//     later in the list   15 - 0.7 - 20             the first goes on at 20 where it would have been anyway
TEST(AutomationWarningDetectAlgorithm, BothEdgesOfARangeThatOverwritesAnotherAreMarked)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"),
                          {{10.0, 0.2}, {15.0, 0.2}, {15.0, 0.7}, {20.0, 0.7}, {20.0, 0.2}, {30.0, 0.2}, {31.0, 0.7}});
    film.cut({100.0, 120.0}, {10.0, 30.0});
    film.cut({300.0, 305.0}, {15.0, 20.0});

    EXPECT_EQ(film.detect(), (Entries{warningAt(15.0, 15.0, "Dialogue "), warningAt(20.0, 20.0, "Dialogue ")}));
}

TEST(AutomationWarningDetectAlgorithm, ARangeEndsWithItsMaterialAlsoWhereItIsToLastLonger)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {15.0, 0.2}, {15.0, 0.7}, {30.0, 0.7}});
    film.cut({100.0, 105.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(15.0, 15.0, "Dialogue ")});
}

//     old film        ---- 0.2 ----                        250 0.7
//     new film                 10 |-- 0.7 --| 30                         restricted to 10 up to 30
TEST(AutomationWarningDetectAlgorithm, TheEdgesOfARestrictedRangeAreComparedWithTheProgrammeAroundIt)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{0.0, 0.7}, {50.0, 0.7}});
    film.cut({300.0, 350.0}, {0.0, 50.0});
    film.restrictTo(10.0, 30.0);

    // The second begins a frame before the edge, because the edge itself isn't in the range.
    expectEntries(film.detect(), {warningAt(10.0, 10.0, "Dialogue "), warningAt(30.0 - 1.0 / 25.0, 30.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, TheEdgesOfARestrictedRangeMayBeThoseOfCuts)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{10.0, 0.2}, {10.0, 0.7}, {30.0, 0.7}, {30.0, 0.9}});
    film.cut({100.0, 110.0}, {0.0, 10.0});
    film.cut({300.0, 320.0}, {10.0, 30.0});
    film.cut({320.0, 330.0}, {30.0, 40.0});
    film.restrictTo(10.0, 30.0);

    expectEntries(film.detect(), {warningAt(10.0, 10.0, "Dialogue "), warningAt(30.0 - 1.0 / 25.0, 30.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, AnEdgeOfARestrictedRangeOverWhichTheProgrammeGoesOnIsNotMarked)
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    AutomationFilm::addPoints(track, {{10.0, 0.3}, {10.0, 0.9}, {30.0, 0.9}, {30.0, 0.1}});
    AutomationFilm::write(track, {{10.0, 0.3}, {10.0, 0.9}, {30.0, 0.9}, {30.0, 0.1}});
    film.cut({0.0, 50.0}, {0.0, 50.0});
    film.restrictTo(10.0, 30.0);

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, OutsideOfARestrictedRangeNothingIsMarked)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{20.0, 0.2}, {20.0, 0.7}, {30.0, 0.7}, {30.0, 0.2}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});
    film.cut({100.0, 110.0}, {30.0, 40.0});

    film.restrictTo(21.0, 25.0);
    EXPECT_EQ(film.detect().size(), 2U) << "at its edges";
    film.restrictTo(31.0, 50.0);
    EXPECT_EQ(film.detect(), Entries{});
    film.restrictTo(50.0, 20.0);
    EXPECT_EQ(film.detect(), Entries{}) << "a reversed range is none";
}

TEST(AutomationWarningDetectAlgorithm, TracksOfAnEdgeShareOneEntryThatHoldsAllItsPlaces)
{
    AutomationFilm film;
    MemoryTrack& dialogue = film.addFilmTrack(L"Dialogue");
    MemoryTrack& music = film.addFilmTrack(L"Music");
    MemoryTrack& foley = film.addFilmTrack(L"Foley");
    AutomationFilm::write(dialogue, {{20.5, 0.2}, {20.5, 0.7}});
    AutomationFilm::write(music, {{20.0, 0.7}});
    AutomationFilm::write(foley, {{19.0, 0.2}, {19.0, 0.7}});
    film.addCut({cutEvent(dialogue, {100.0, 110.5}, {10.0, 20.5}), cutEvent(music, {300.0, 310.0}, {10.0, 20.0}),
                 cutEvent(foley, {100.0, 109.0}, {10.0, 19.0})});
    film.addCut({cutEvent(dialogue, {300.5, 310.0}, {20.5, 30.0}), cutEvent(music, {310.0, 320.0}, {20.0, 30.0}),
                 cutEvent(foley, {299.0, 310.0}, {19.0, 30.0})});

    EXPECT_EQ(film.detect(), Entries{warningAt(19.0, 20.5, "Dialogue Foley ")});
}

TEST(AutomationWarningDetectAlgorithm, TrackIsNamedOnceHoweverManyOfItsCurvesJump)
{
    AutomationFilm film;
    MemoryTrack& track = film.addFilmTrack(L"Dialogue");
    AutomationFilm::addPoints(track, {{0.0, 0.5}}, Pan);
    AutomationFilm::write(track, {{20.0, 0.2}, {20.0, 0.7}});
    AutomationFilm::write(track, {{20.0, 0.5}, {20.0, 0.9}}, Pan);
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});

    EXPECT_EQ(film.detect(), Entries{warningAt(20.0, 20.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, TracksWithoutAutomationHaveNothingThatCouldJump)
{
    AutomationFilm film;
    addClip(film.addTrack(L"Dialogue"), 100.0, 400.0);
    film.cut({100.0, 110.0}, {10.0, 20.0});
    film.cut({300.0, 310.0}, {20.0, 30.0});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, ReportsAStepForEachEventOnEachTrack)
{
    AutomationFilm film;
    film.addFilmTrack(L"Dialogue");
    film.addFilmTrack(L"Music");
    for (int cut = 0; cut < 3; ++cut)
        film.cut({100.0, 110.0}, {10.0 * cut, 10.0 * cut + 10.0});
    RecordingProgress progress;

    film.detect(&progress);

    EXPECT_EQ(progress.ticks, (std::vector<std::uint64_t>{3, 3}));
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(3, 2), 6U);
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(0, 64), 0U);
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(3000000000, 4), 12000000000U);
}

TEST(AutomationWarningDetectAlgorithm, StopsAfterTheTrackDuringWhichTheUserCancels)
{
    AutomationFilm film;
    film.addFilmTrack(L"Dialogue");
    film.addFilmTrack(L"Music");
    film.cut({100.0, 110.0}, {10.0, 20.0});
    RecordingProgress progress(1);

    EXPECT_EQ(thrownBy([&] { film.detect(&progress); }), Result::Cancelled);
    EXPECT_EQ(progress.steps(), 1U);
}

TEST(AutomationWarningDetectAlgorithm, WithoutCutsOrTracksThereIsNothingToReport)
{
    AutomationFilm film;
    RecordingProgress cancelled(0);

    EXPECT_EQ(film.detect(&cancelled), Entries{});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    EXPECT_EQ(film.detect(&cancelled), Entries{});
    EXPECT_EQ(cancelled.steps(), 0U);
}

TEST(AutomationWarningDetectAlgorithm, NamingAMarkerNeedsAStringConverter)
{
    AutomationFilm film;
    AutomationFilm::write(film.addFilmTrack(L"Dialogue"), {{20.0, 0.2}, {20.0, 0.7}});
    film.cut({100.0, 110.0}, {10.0, 20.0});
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::NotAvailable);
}

double tenths(int from, int to)
{
    return *rc::gen::inRange(from, to) / 10.0;
}

RC_GTEST_PROP(AutomationWarningDetectAlgorithm, RangesThatAlreadyFollowedOneAnotherInTheSourceNeverWarnWhereTheyMeet,
              ())
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    for (const std::int32_t curve : *rc::gen::container<std::vector<std::int32_t>>(rc::gen::inRange(0, 4)))
        track.addPoint(curve, tenths(0, 200), tenths(0, 11));
    const double seam = tenths(50, 200);
    film.cut({seam - 5.0, seam}, {3605.0, 3610.0});
    film.cut({seam, seam + 5.0}, {3610.0, 3615.0});
    track.copyRange(seam - 5.0, seam, Day + 3605.0);
    track.copyRange(seam, seam + 5.0, Day + 3610.0);

    RC_ASSERT(std::ranges::none_of(film.detect(), [](const MarkerEntry& entry) { return entry.start == 3610.0; }));
}

} // namespace
} // namespace cadrel::tests
