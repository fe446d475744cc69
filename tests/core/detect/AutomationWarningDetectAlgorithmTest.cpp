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
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::AutomationState;
using core::AutomationWarningDetectAlgorithm;
using core::Framerate;
using core::MarkerEntry;
using core::SecondsRange;
using util::Result;

using Automation = std::map<std::int32_t, AutomationState>;
using Entries = std::vector<MarkerEntry>;

constexpr std::int32_t Volume = 7;
constexpr std::int32_t Pan = -2;

// No point at all; -1.0 in both fields of a side means that there is none.
constexpr AutomationState NoPoints{-1.0, -1.0, -1.0, -1.0};

/// A curve that has the value everywhere.
AutomationState constant(double value)
{
    return {0.0, value, -1.0, -1.0};
}

Automation volume(const AutomationState& state)
{
    return {{Volume, state}};
}

/// A cut event that tells the automation given for its two ends in the source, whatever its track would be like.
class TellingCutEvent : public core::CutEventBase {
public:
    TellingCutEvent(std::wstring trackName, SecondsRange source, SecondsRange destination, Automation atStart,
                    Automation atEnd)
        : m_trackName(std::move(trackName)), m_atStart(std::move(atStart)), m_atEnd(std::move(atEnd))
    {
        setSrcIn(source.start);
        setSrcOut(source.end);
        setDstIn(destination.start);
        setDstOut(destination.end);
    }

    core::CutEventSpans update(double time) override
    {
        core::CutEventSpans spans;
        if (time == srcIn())
            spans.automation = m_atStart;
        if (time == srcOut())
            spans.automation = m_atEnd;
        return spans;
    }
    std::wstring getTrackName() override { return m_trackName; }
    bool isAudio() override { return false; }

private:
    std::wstring m_trackName;
    Automation m_atStart;
    Automation m_atEnd;
};

// Two ranges meet at 01:00:10:00, which is 3610 seconds. The first ends at 110 seconds of the source, the second starts
// at 300.
struct AutomationFilm : CutFilm {
    using CutFilm::CutFilm;

    static std::shared_ptr<core::CutEventBase> first(const std::wstring& track, const Automation& atEnd,
                                                     double dstOut = 3610.0)
    {
        return std::make_shared<TellingCutEvent>(track, SecondsRange{100.0, 110.0}, SecondsRange{3600.0, dstOut},
                                                 volume(constant(0.99)), atEnd);
    }
    static std::shared_ptr<core::CutEventBase> second(const std::wstring& track, const Automation& atStart,
                                                      double dstIn = 3610.0)
    {
        return std::make_shared<TellingCutEvent>(track, SecondsRange{300.0, 310.0}, SecondsRange{dstIn, 3620.0},
                                                 atStart, volume(constant(0.99)));
    }
    void carryBoth(core::Cut::CutEvents firsts, core::Cut::CutEvents seconds)
    {
        carryOver("01:00:00:00", "01:00:10:00", std::move(firsts));
        carryOver("01:00:10:00", "01:00:20:00", std::move(seconds));
    }
    Entries detect(core::ProgressHandlerBase* progress = nullptr) const
    {
        return detectBy(AutomationWarningDetectAlgorithm(), progress);
    }
};

bool isJump(const Automation& atEnd, const Automation& atStart)
{
    AutomationFilm film;
    film.carryBoth({film.first(L"Dialogue", atEnd)}, {film.second(L"Dialogue", atStart)});
    const Entries entries = film.detect();
    EXPECT_LE(entries.size(), 1U);
    return !entries.empty();
}

/// Closes in on the value that a curve has where the first range ends, at 110 seconds of the source, and, with its
/// points moved by 190 seconds, where the second starts: 0.009 beside it is no jump yet, 0.011 is one.
void expectValueAt110(const AutomationState& state, double value)
{
    const auto moved = [](double time) { return time == -1.0 ? time : time + 190.0; };
    const AutomationState stateAt300{moved(state.leftTime), state.leftValue, moved(state.rightTime), state.rightValue};
    for (const double difference : {-0.011, -0.009, 0.0, 0.009, 0.011}) {
        const bool expected = difference < -0.01 || difference > 0.01;
        const Automation beside = volume(constant(value + difference));
        EXPECT_EQ(isJump(volume(state), beside), expected) << "at the end, " << difference << " beside " << value;
        EXPECT_EQ(isJump(beside, volume(stateAt300)), expected)
            << "at the start, " << difference << " beside " << value;
    }
}

MarkerEntry warningAt(double start, double end, const std::string& tracks)
{
    return {start, end, "Automation warning in " + tracks, 3};
}

TEST(AutomationWarningDetectAlgorithm, CurveThatJumpsWhereTwoRangesMeetIsMarkedAtTheSeam)
{
    AutomationFilm film;
    film.carryBoth({film.first(L"Dialogue", volume(constant(0.2)))}, {film.second(L"Dialogue", volume(constant(0.7)))});

    EXPECT_EQ(film.detect(), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, CurveThatGoesOnWithOneValueIsNotMarked)
{
    AutomationFilm film;
    film.carryBoth({film.first(L"Dialogue", volume(constant(0.2)))}, {film.second(L"Dialogue", volume(constant(0.2)))});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, ValuesThatDifferByAHundredthAreNoJump)
{
    for (int hundredth = 0; hundredth < 100; ++hundredth) {
        const double lower = hundredth / 100.0;
        const double upper = (hundredth + 1) / 100.0;
        EXPECT_FALSE(isJump(volume(constant(lower)), volume(constant(upper)))) << lower;
        EXPECT_FALSE(isJump(volume(constant(upper)), volume(constant(lower)))) << lower;
    }
}

TEST(AutomationWarningDetectAlgorithm, ValuesThatDifferByMoreThanAHundredthAreAJumpUpAndDown)
{
    EXPECT_FALSE(isJump(volume(constant(0.5)), volume(constant(0.5099))));
    EXPECT_TRUE(isJump(volume(constant(0.5)), volume(constant(0.5101))));
    EXPECT_FALSE(isJump(volume(constant(0.5)), volume(constant(0.4901))));
    EXPECT_TRUE(isJump(volume(constant(0.5)), volume(constant(0.4899))));
}

TEST(AutomationWarningDetectAlgorithm, HundredthOfValuesThatWereRoundedToShortFloatsIsNoJump)
{
    for (int hundredth = 0; hundredth < 100; ++hundredth) {
        const double lower = static_cast<float>(hundredth) / 100.0F;
        const double upper = static_cast<float>(hundredth + 1) / 100.0F;
        EXPECT_FALSE(isJump(volume(constant(lower)), volume(constant(upper)))) << lower;
    }
}

TEST(AutomationWarningDetectAlgorithm, ValueBetweenTwoPointsLiesOnTheLineBetweenThem)
{
    // Half the way from 108 to 112: 0.2 + 0.4 x 2 x 1/4 = 0.4.
    expectValueAt110({108.0, 0.2, 112.0, 0.6}, 0.4);
    // A quarter of the way from 100 to 140, falling: 1 - 1 x 10 x 1/40 = 0.75.
    expectValueAt110({100.0, 1.0, 140.0, 0.0}, 0.75);
    // Nine tenths of the way from 101 to 111: 0.1 + 0.5 x 9 x 1/10 = 0.55.
    expectValueAt110({101.0, 0.1, 111.0, 0.6}, 0.55);
}

TEST(AutomationWarningDetectAlgorithm, ValueAtAPointIsThatOfThePoint)
{
    expectValueAt110({110.0, 0.2, 112.0, 0.6}, 0.2);
    expectValueAt110({108.0, 0.2, 110.0, 0.6}, 0.6);
}

TEST(AutomationWarningDetectAlgorithm, ValueBeforeTheFirstPointIsThatOfTheFirst)
{
    expectValueAt110({115.0, 0.3, 120.0, 0.8}, 0.3);
}

TEST(AutomationWarningDetectAlgorithm, ValueBehindTheLastPointIsThatOfTheLast)
{
    expectValueAt110({105.0, 0.3, 107.0, 0.8}, 0.8);
}

TEST(AutomationWarningDetectAlgorithm, CurveWithOnePointHasItsValueEverywhere)
{
    expectValueAt110({105.0, 0.7, -1.0, -1.0}, 0.7);
    expectValueAt110({110.0, 0.7, -1.0, -1.0}, 0.7);
    expectValueAt110({115.0, 0.7, -1.0, -1.0}, 0.7);
    expectValueAt110({-1.0, -1.0, 105.0, 0.7}, 0.7);
    expectValueAt110({-1.0, -1.0, 110.0, 0.7}, 0.7);
    expectValueAt110({-1.0, -1.0, 115.0, 0.7}, 0.7);
}

TEST(AutomationWarningDetectAlgorithm, PointsAreTakenInTheOrderOfTheirTimes)
{
    // From 0.2 at 108 to 0.6 at 112, as above.
    expectValueAt110({112.0, 0.6, 108.0, 0.2}, 0.4);
    expectValueAt110({107.0, 0.8, 105.0, 0.3}, 0.8);
    expectValueAt110({120.0, 0.8, 115.0, 0.3}, 0.3);
}

TEST(AutomationWarningDetectAlgorithm, OfTwoPointsAtOneTimeTheLeftOneComesFirst)
{
    expectValueAt110({110.0, 0.2, 110.0, 0.6}, 0.2);
    expectValueAt110({115.0, 0.2, 115.0, 0.6}, 0.2);
    expectValueAt110({105.0, 0.2, 105.0, 0.6}, 0.6);
}

TEST(AutomationWarningDetectAlgorithm, CurveWithoutPointsHasNoValueThatCouldJump)
{
    EXPECT_FALSE(isJump(volume(NoPoints), volume(constant(0.7))));
    EXPECT_FALSE(isJump(volume(constant(0.7)), volume(NoPoints)));
    EXPECT_FALSE(isJump(volume(NoPoints), volume(NoPoints)));
    EXPECT_FALSE(isJump(volume(NoPoints), volume(constant(-1.0))));
}

TEST(AutomationWarningDetectAlgorithm, SideIsNoPointOnlyWhenBothItsFieldsSaySo)
{
    expectValueAt110({-1.0, 0.5, -1.0, -1.0}, 0.5);
    expectValueAt110({-1.0, -1.0, -1.0, 0.5}, 0.5);
    // Between -1 at 90 and -1 at 130 there is -1.
    expectValueAt110({90.0, -1.0, 130.0, -1.0}, -1.0);
    expectValueAt110({90.0, -1.0, -1.0, -1.0}, -1.0);
    expectValueAt110({-1.0, -1.0, 130.0, -1.0}, -1.0);
    // Half the way from -1 to 1.
    expectValueAt110({90.0, -1.0, 130.0, 1.0}, 0.0);
}

TEST(AutomationWarningDetectAlgorithm, CurvesThatOnlyOneSideHasAreNotCompared)
{
    EXPECT_FALSE(isJump({{Volume, constant(0.2)}}, {{Pan, constant(0.7)}}));
    EXPECT_FALSE(isJump({{Volume, constant(0.2)}}, {}));
    EXPECT_FALSE(isJump({}, {{Volume, constant(0.2)}}));
    EXPECT_FALSE(isJump({}, {}));
}

TEST(AutomationWarningDetectAlgorithm, OneCurveOfManyIsEnoughForAJump)
{
    const auto steady = constant(0.5);

    EXPECT_TRUE(isJump({{Pan, steady}, {Volume, constant(0.2)}}, {{Pan, steady}, {Volume, constant(0.7)}}));
    EXPECT_TRUE(isJump({{Pan, constant(0.2)}, {Volume, steady}}, {{Pan, constant(0.7)}, {Volume, steady}}));
    EXPECT_TRUE(isJump({{Pan, NoPoints}, {Volume, constant(0.2)}}, {{Pan, steady}, {Volume, constant(0.7)}}));
    EXPECT_FALSE(isJump({{Pan, steady}, {Volume, steady}}, {{Pan, steady}, {Volume, steady}}));
}

TEST(AutomationWarningDetectAlgorithm, TrackIsNamedOnceHoweverManyOfItsCurvesJump)
{
    AutomationFilm film;
    film.carryBoth({film.first(L"Dialogue", {{Pan, constant(0.1)}, {Volume, constant(0.1)}})},
                   {film.second(L"Dialogue", {{Pan, constant(0.9)}, {Volume, constant(0.9)}})});

    EXPECT_EQ(film.detect(), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
}

//     volume        0.2         0.2          0.7
//     cuts      |-- first --|---------|-- second --|         held over the gap, it jumps at the end of it
TEST(AutomationWarningDetectAlgorithm, CurveThatJumpsAfterAGapIsMarkedWhereTheGapEnds)
{
    const auto detectedAfter = [](const char* dstOut, double value) {
        AutomationFilm film;
        film.carryOver("01:00:00:00", dstOut, {film.first(L"Dialogue", volume(constant(0.2)), 3605.0)});
        film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", volume(constant(value)))});
        return film.detect();
    };

    EXPECT_EQ(detectedAfter("01:00:09:24", 0.7), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
    EXPECT_EQ(detectedAfter("01:00:05:00", 0.7), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
    EXPECT_EQ(detectedAfter("01:00:05:00", 0.2101), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
    EXPECT_EQ(detectedAfter("01:00:05:00", 0.21), Entries{});
    EXPECT_EQ(detectedAfter("01:00:05:00", 0.2), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, TracksOfAGapShareOneEntryThatHoldsAllItsEnds)
{
    const Automation low = volume(constant(0.2));
    const Automation high = volume(constant(0.7));
    AutomationFilm film;
    film.carryOver("01:00:00:00", "01:00:05:00",
                   {film.first(L"Dialogue", low, 3605.0), film.first(L"Music", low, 3605.5)});
    film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", high), film.second(L"Music", high, 3610.5)});

    EXPECT_EQ(film.detect(), Entries{warningAt(3610.0, 3610.5, "Dialogue Music ")});
}

TEST(AutomationWarningDetectAlgorithm, CurveThatIsLedOverGapsJumpsOnlyWhereRangesMeet)
{
    const Automation low = volume(constant(0.2));
    AutomationFilm film;
    film.model.settings().setCreateVirginTerritories(true);
    film.carryOver("01:00:00:00", "01:00:09:24", {film.first(L"Dialogue", low)});
    film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", volume(constant(0.7)))});
    EXPECT_EQ(film.detect(), Entries{});

    film.carryOver("01:00:20:00", "01:00:30:00", {film.second(L"Dialogue", low, 3620.0)});
    EXPECT_EQ(film.detect(), Entries{warningAt(3620.0, 3620.0, "Dialogue ")});
}

//     cuts      |-------- long --------|     |-- second --|        what is before the gap is the end of the long one
//                    |-- short --|
TEST(AutomationWarningDetectAlgorithm, BeforeAGapStandsTheCutThatEndsLast)
{
    const auto detectedWith = [](double ofLong, double ofShort) {
        AutomationFilm film;
        film.carryOver("01:00:00:00", "01:00:08:00", {film.first(L"Dialogue", volume(constant(ofLong)), 3608.0)});
        film.carryOver(
            "01:00:01:00", "01:00:05:00",
            {std::make_shared<TellingCutEvent>(L"Dialogue", SecondsRange{100.0, 104.0}, SecondsRange{3601.0, 3605.0},
                                               volume(constant(ofShort)), volume(constant(ofShort)))});
        film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", volume(constant(0.7)))});
        return film.detect();
    };

    EXPECT_EQ(detectedWith(0.7, 0.2), Entries{});
    EXPECT_EQ(detectedWith(0.2, 0.7), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, CutThatBeginsWithinALongerOneHasNoGapBeforeIt)
{
    const auto within = [](double dstIn, double value) {
        return std::make_shared<TellingCutEvent>(L"Dialogue", SecondsRange{100.0, 101.0},
                                                 SecondsRange{dstIn, dstIn + 1.0}, volume(constant(value)),
                                                 volume(constant(value)));
    };
    AutomationFilm film;
    film.carryOver("01:00:00:00", "01:00:10:00", {film.first(L"Dialogue", volume(constant(0.2)))});
    film.carryOver("01:00:02:00", "01:00:03:00", {within(3602.0, 0.4)});
    film.carryOver("01:00:05:00", "01:00:06:00", {within(3605.0, 0.7)});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, RangesThatOverlapByOneFrameDoNotMeet)
{
    AutomationFilm film;
    film.carryOver("01:00:00:00", "01:00:10:01", {film.first(L"Dialogue", volume(constant(0.2)))});
    film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", volume(constant(0.7)))});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(AutomationWarningDetectAlgorithm, NumbersLeftOutInDropFrameAreNoFramesBetweenRanges)
{
    // 00:01:00;02 is the frame behind 00:00:59;29.
    const auto countForEnd = [](const char* dstOut) {
        AutomationFilm film(Framerate(30, true, 1));
        film.model.settings().setCreateVirginTerritories(true);
        film.carryOver("00:00:00:00", dstOut, {film.first(L"Dialogue", volume(constant(0.2)))});
        film.carryOver("00:01:00:02", "00:02:00:02", {film.second(L"Dialogue", volume(constant(0.7)))});
        return film.detect().size();
    };

    EXPECT_EQ(countForEnd("00:00:59:29"), 0U);
    EXPECT_EQ(countForEnd("00:01:00:02"), 1U);
}

TEST(AutomationWarningDetectAlgorithm, ChangeEventsDecideWhetherRangesMeetAndCutEventsWhereTheMarkerStands)
{
    //  cut events   -------|3609.5      3610.25|-------
    AutomationFilm apart;
    apart.carryBoth({apart.first(L"Dialogue", volume(constant(0.2)), 3609.5)},
                    {apart.second(L"Dialogue", volume(constant(0.7)), 3610.25)});
    EXPECT_EQ(apart.detect(), Entries{warningAt(3609.5, 3610.25, "Dialogue ")});

    AutomationFilm overlapping;
    overlapping.carryBoth({overlapping.first(L"Dialogue", volume(constant(0.2)), 3610.25)},
                          {overlapping.second(L"Dialogue", volume(constant(0.7)), 3609.5)});
    EXPECT_EQ(overlapping.detect(), Entries{warningAt(3609.5, 3610.25, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, TracksOfAPairShareOneEntryThatHoldsAllTheirSeams)
{
    const Automation low = volume(constant(0.2));
    const Automation high = volume(constant(0.7));
    AutomationFilm film;
    film.carryBoth({film.first(L"Quiet", low, 3600.0), film.first(L"Dialogue", low, 3610.0),
                    film.first(L"Music", low, 3609.5), film.first(L"Effects", low, 3610.5)},
                   {film.second(L"Quiet", low, 3630.0), film.second(L"Dialogue", high, 3610.0),
                    film.second(L"Music", high, 3610.0), film.second(L"Effects", high, 3610.75)});

    EXPECT_EQ(film.detect(), Entries{warningAt(3609.5, 3610.75, "Dialogue Music Effects ")});
}

TEST(AutomationWarningDetectAlgorithm, SeamsInsideTheRangeSoFarDoNotNarrowIt)
{
    const Automation low = volume(constant(0.2));
    const Automation high = volume(constant(0.7));
    AutomationFilm film;
    film.carryBoth({film.first(L"Dialogue", low, 3609.0), film.first(L"Music", low, 3610.0)},
                   {film.second(L"Dialogue", high, 3611.0), film.second(L"Music", high, 3610.0)});

    EXPECT_EQ(film.detect(), Entries{warningAt(3609.0, 3611.0, "Dialogue Music ")});
}

TEST(AutomationWarningDetectAlgorithm, TrackIsNamedAfterTheRangeThatStandsFirst)
{
    AutomationFilm film;
    film.carryBoth({film.first(L"Ger\u00E4usche", volume(constant(0.2)))},
                   {film.second(L"Other", volume(constant(0.7)))});

    EXPECT_EQ(film.detect().at(0).name, "Automation warning in Ger\xC3\xA4usche ");
}

TEST(AutomationWarningDetectAlgorithm, NeighboursAreThoseOfTheProgrammeAndNotOfTheList)
{
    AutomationFilm film;
    film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"Dialogue", volume(constant(0.7)))});
    film.carryOver("01:00:00:00", "01:00:10:00", {film.first(L"Dialogue", volume(constant(0.2)))});

    EXPECT_EQ(film.detect(), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, EachPairThatMeetsIsLookedAtForItself)
{
    const auto range = [](double dstIn, double value) {
        return std::make_shared<TellingCutEvent>(L"Dialogue", SecondsRange{100.0, 110.0},
                                                 SecondsRange{dstIn, dstIn + 10.0}, volume(constant(value)),
                                                 volume(constant(value)));
    };
    AutomationFilm film;
    film.carryOver("01:00:00:00", "01:00:10:00", {range(3600.0, 0.2)});
    film.carryOver("01:00:10:00", "01:00:20:00", {range(3610.0, 0.7)});
    film.carryOver("01:00:20:00", "01:00:30:00", {range(3620.0, 0.7)});
    film.carryOver("01:00:30:00", "01:00:40:00", {range(3630.0, 0.2)});

    EXPECT_EQ(film.detect(), (Entries{warningAt(3610.0, 3610.0, "Dialogue "), warningAt(3630.0, 3630.0, "Dialogue ")}));
}

TEST(AutomationWarningDetectAlgorithm, TracksAreWalkedAsFarAsBothCutsHaveThem)
{
    const Automation low = volume(constant(0.2));
    const Automation high = volume(constant(0.7));
    AutomationFilm fewerBehind;
    fewerBehind.carryBoth({fewerBehind.first(L"Dialogue", low), fewerBehind.first(L"Music", low)},
                          {fewerBehind.second(L"Dialogue", high)});
    EXPECT_EQ(fewerBehind.detect(), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});

    AutomationFilm fewerBefore;
    fewerBefore.carryBoth({fewerBefore.first(L"Dialogue", low)},
                          {fewerBefore.second(L"Dialogue", high), fewerBefore.second(L"Music", high)});
    EXPECT_EQ(fewerBefore.detect(), Entries{warningAt(3610.0, 3610.0, "Dialogue ")});
}

TEST(AutomationWarningDetectAlgorithm, PointsOfARealTrackAreReadAroundBothEnds)
{
    //  volume    1.0 at 100 ------ 0.0 at 120        0.5 at 290 ------ 0.5 at 310
    //  source    100|----------|110                         300|----------|310
    // Half the way down at 110 there is 0.5, which the second range goes on with at 300; the third comes from behind
    // all points and goes on with the value of the last, 0.5, while the fourth starts at 102: 1 - 1 x 2 x 1/20 = 0.9.
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    track.addPoint(Volume, 100.0, 1.0);
    track.addPoint(Volume, 120.0, 0.0);
    track.addPoint(Volume, 290.0, 0.5);
    track.addPoint(Volume, 310.0, 0.5);
    film.carryOver("01:00:00:00", "01:00:10:00", {cutEvent(track, {100.0, 110.0}, {3600.0, 3610.0})});
    film.carryOver("01:00:10:00", "01:00:20:00", {cutEvent(track, {300.0, 310.0}, {3610.0, 3620.0})});
    film.carryOver("01:00:20:00", "01:00:30:00", {cutEvent(track, {400.0, 410.0}, {3620.0, 3630.0})});
    film.carryOver("01:00:30:00", "01:00:40:00", {cutEvent(track, {102.0, 112.0}, {3630.0, 3640.0})});

    EXPECT_EQ(film.detect(), Entries{warningAt(3630.0, 3630.0, "Dialogue ")});
}

/// A pair of cuts on so many tracks each, with a jump on those below `jumps`.
void carryTracks(AutomationFilm& film, int firsts, int seconds, int jumps)
{
    core::Cut::CutEvents firstEvents;
    core::Cut::CutEvents secondEvents;
    for (int track = 0; track < firsts; ++track)
        firstEvents.push_back(film.first(L"Track", volume(constant(0.2))));
    for (int track = 0; track < seconds; ++track)
        secondEvents.push_back(film.second(L"Track", volume(constant(track < jumps ? 0.7 : 0.2))));
    film.carryBoth(firstEvents, secondEvents);
}

TEST(AutomationWarningDetectAlgorithm, PairWithAWarningReportsAStepForEachTrackAndOneMore)
{
    AutomationFilm film;
    carryTracks(film, 3, 3, 2);
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress).size(), 1U);
    EXPECT_EQ(progress.steps(), 4U);
}

TEST(AutomationWarningDetectAlgorithm, PairWithoutAWarningReportsAStepForEachTrackAndThenAllTracksOfTheSecond)
{
    AutomationFilm film;
    carryTracks(film, 3, 3, 0);
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress), Entries{});
    EXPECT_EQ(progress.steps(), 6U);
}

TEST(AutomationWarningDetectAlgorithm, StepsPerTrackEndWithTheShorterCutAndTheLastReportIsOfTheSecond)
{
    AutomationFilm longerSecond;
    carryTracks(longerSecond, 1, 4, 0);
    RecordingProgress one;
    EXPECT_EQ(longerSecond.detect(&one), Entries{});
    EXPECT_EQ(one.steps(), 5U);

    AutomationFilm longerFirst;
    carryTracks(longerFirst, 4, 1, 0);
    RecordingProgress other;
    EXPECT_EQ(longerFirst.detect(&other), Entries{});
    EXPECT_EQ(other.steps(), 2U);
}

TEST(AutomationWarningDetectAlgorithm, PairThatOverlapsReportsAllTracksOfTheSecondAndAPairWithAGapWhatOneThatMeetsDoes)
{
    const auto low = volume(constant(0.2));
    const auto stepsAfter = [&](const char* dstOut) {
        AutomationFilm film;
        film.carryOver("01:00:00:00", dstOut, {film.first(L"A", low), film.first(L"B", low)});
        film.carryOver("01:00:10:00", "01:00:20:00", {film.second(L"A", low), film.second(L"B", low)});
        RecordingProgress progress;
        EXPECT_EQ(film.detect(&progress), Entries{});
        return progress.steps();
    };

    EXPECT_EQ(stepsAfter("01:00:11:00"), 2U);
    EXPECT_EQ(stepsAfter("01:00:10:00"), 4U);
    EXPECT_EQ(stepsAfter("01:00:09:00"), 4U);
}

TEST(AutomationWarningDetectAlgorithm, StopsBehindThePairDuringWhichTheUserCancels)
{
    AutomationFilm film;
    carryTracks(film, 2, 2, 1);
    film.carryOver("01:00:30:00", "01:00:40:00",
                   {std::make_shared<TellingCutEvent>(L"Track", SecondsRange{0.0, 10.0}, SecondsRange{3630.0, 3640.0},
                                                      Automation{}, Automation{})});
    RecordingProgress progress(1);

    EXPECT_EQ(thrownBy([&] { film.detect(&progress); }), Result::Cancelled);
    EXPECT_EQ(progress.steps(), 3U);
}

TEST(AutomationWarningDetectAlgorithm, WithoutTwoCutsThereIsNothingToReport)
{
    AutomationFilm film;
    RecordingProgress cancelled(0);

    EXPECT_EQ(film.detect(&cancelled), Entries{});
    film.carryOver("01:00:00:00", "01:00:10:00", {film.first(L"Dialogue", volume(constant(0.2)))});
    EXPECT_EQ(film.detect(&cancelled), Entries{});
    EXPECT_EQ(cancelled.steps(), 0U);
}

TEST(AutomationWarningDetectAlgorithm, CutWithoutCutEventsIsOutOfRange)
{
    AutomationFilm film;
    film.addCut({});

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::OutOfRange);
}

TEST(AutomationWarningDetectAlgorithm, NamingAMarkerNeedsAStringConverter)
{
    AutomationFilm film;
    carryTracks(film, 1, 1, 1);
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::NotAvailable);
}

TEST(AutomationWarningDetectAlgorithm, EstimatesAStepForEachEventOnEachTrack)
{
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(0, 64), 0U);
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(1000, 64), 64000U);
    EXPECT_EQ(AutomationWarningDetectAlgorithm().estimateSteps(3000000000, 4), 12000000000U);
}

double tenths(int from, int to)
{
    return *rc::gen::inRange(from, to) / 10.0;
}

RC_GTEST_PROP(AutomationWarningDetectAlgorithm, TimesBeforeBetweenAndBehindTwoPointsHaveTheWeightedMeanOfBoth, ())
{
    const double time = 110.0;
    const double left = 110.0 + tenths(-100, 100);
    const double right = left + tenths(1, 200);
    const double leftValue = tenths(0, 11);
    const double rightValue = tenths(0, 11);
    const double held = std::clamp(time, left, right);
    const double mean = (leftValue * (right - held) + rightValue * (held - left)) / (right - left);
    const Automation curve = volume({left, leftValue, right, rightValue});

    RC_ASSERT(!isJump(curve, volume(constant(mean))));
    RC_ASSERT(!isJump(curve, volume(constant(mean + 0.0099))));
    RC_ASSERT(isJump(curve, volume(constant(mean + 0.0101))));
}

RC_GTEST_PROP(AutomationWarningDetectAlgorithm, RangesThatAlreadyFollowedOneAnotherInTheSourceNeverWarn, ())
{
    AutomationFilm film;
    MemoryTrack& track = film.addTrack(L"Dialogue");
    for (const std::int32_t curve : *rc::gen::container<std::vector<std::int32_t>>(rc::gen::inRange(0, 4)))
        track.addPoint(curve, tenths(0, 200), tenths(0, 11));
    const double seam = tenths(0, 200);
    film.carryBoth({cutEvent(track, {seam - 5.0, seam}, {3605.0, 3610.0})},
                   {cutEvent(track, {seam, seam + 5.0}, {3610.0, 3615.0})});

    RC_ASSERT(film.detect() == Entries{});
}

} // namespace
} // namespace cadrel::tests
