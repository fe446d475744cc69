// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/conform/SnippetAlgorithm.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/CutFilm.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <limits>
#include <memory>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::CutEventBase;
using core::Framerate;
using core::SameInstant;
using core::SecondsRange;
using core::SnippetAlgorithm;
using util::Result;

/// The four times of a cut event, in frames.
struct Times {
    double srcIn = 0.0;
    double srcOut = 0.0;
    double dstIn = 0.0;
    double dstOut = 0.0;

    bool operator==(const Times&) const = default;
};

/// A range of normal speed.
Times range(double srcIn, double srcOut, double dstIn)
{
    return {srcIn, srcOut, dstIn, dstIn + srcOut - srcIn};
}

// Most ranges take the frames 1000 to 2000 to 5000 to 6000, and most clips are 100 frames long, so that a threshold of 5
// frames is far below half a clip. Frames count from about an hour.
struct SnippetFilm : CutFilm {
    explicit SnippetFilm(const Framerate& rate = Framerate(25, 0)) : CutFilm(rate)
    {
        settings().setIncludeOverhangingAudioEvents(true);
        settings().setSnippetThreshold(5);
        settings().setSnippetUsesPercentage(true);
        settings().setSnippetMaxPercentage(50.0);
    }

    double seconds(double frame) const { return (Hour + frame) / project.framerate.rate; }
    double frames(double seconds) const { return seconds * project.framerate.rate - Hour; }

    void clip(double start, double end) { clip(dialogue, start, end); }
    void clip(MemoryTrack& track, double start, double end) { addClip(track, seconds(start), seconds(end)); }

    std::shared_ptr<CutEventBase> on(MemoryTrack& track, const Times& times) const
    {
        return cutEvent(track, {seconds(times.srcIn), seconds(times.srcOut)},
                        {seconds(times.dstIn), seconds(times.dstOut)});
    }
    void carry(const Times& times) { addCut({on(dialogue, times)}); }

    Result::Type process() { return SnippetAlgorithm().process(cuts, previewState()); }

    void expectTimes(const Times& expected, std::size_t cut = 0, std::size_t track = 0) const
    {
        const CutEventBase& found = *cuts.cutAt(cut)->cutEvents().at(track);
        EXPECT_NEAR(frames(found.srcIn()), expected.srcIn, 1e-6) << "SRC IN of cut " << cut << ", track " << track;
        EXPECT_NEAR(frames(found.srcOut()), expected.srcOut, 1e-6) << "SRC OUT of cut " << cut << ", track " << track;
        EXPECT_NEAR(frames(found.dstIn()), expected.dstIn, 1e-6) << "DST IN of cut " << cut << ", track " << track;
        EXPECT_NEAR(frames(found.dstOut()), expected.dstOut, 1e-6) << "DST OUT of cut " << cut << ", track " << track;
    }

    static constexpr double Hour = 90000.0;

    MemoryTrack& dialogue = addTrack(L"Dialogue");
};

template <typename Test>
void atEveryRate(Test test)
{
    for (const Framerate& rate : {Framerate(24, 0), Framerate(25, 0), Framerate(30, true, 1)}) {
        SCOPED_TRACE(rate.rate);
        SnippetFilm film(rate);
        test(film);
    }
}

TEST(SnippetAlgorithm, ShortPieceBeforeTheStartComesAlong)
{
    //  clip           997|---------------|1097
    //  before            | 1000|-----------------------|2000
    //  after          997|-----------------------------|2000
    atEveryRate([](SnippetFilm& film) {
        film.clip(997, 1097);
        film.carry(range(1000, 2000, 5000));

        EXPECT_EQ(film.process(), Result::Ok);

        film.expectTimes({997, 2000, 4997, 6000});
    });
}

TEST(SnippetAlgorithm, ShortPieceInsideTheStartStaysOut)
{
    //  clip    903|---------------|1003
    //  before             1000|---|--------------------|2000
    //  after                  1003|--------------------|2000
    atEveryRate([](SnippetFilm& film) {
        film.clip(903, 1003);
        film.carry(range(1000, 2000, 5000));

        EXPECT_EQ(film.process(), Result::Ok);

        film.expectTimes({1003, 2000, 5003, 6000});
    });
}

TEST(SnippetAlgorithm, ShortPieceBehindTheEndComesAlong)
{
    //  clip                         1903|---------------|2003
    //  before     1000|---------------------------|2000 |
    //  after      1000|---------------------------------|2003
    atEveryRate([](SnippetFilm& film) {
        film.clip(1903, 2003);
        film.carry(range(1000, 2000, 5000));

        EXPECT_EQ(film.process(), Result::Ok);

        film.expectTimes({1000, 2003, 5000, 6003});
    });
}

TEST(SnippetAlgorithm, ShortPieceInsideTheEndStaysOut)
{
    //  clip                                  1997|---------------|2097
    //  before     1000|---------------------------|---|2000
    //  after      1000|---------------------------|1997
    atEveryRate([](SnippetFilm& film) {
        film.clip(1997, 2097);
        film.carry(range(1000, 2000, 5000));

        EXPECT_EQ(film.process(), Result::Ok);

        film.expectTimes({1000, 1997, 5000, 5997});
    });
}

TEST(SnippetAlgorithm, BothEndsAreLookedAtForThemselves)
{
    atEveryRate([](SnippetFilm& film) {
        film.clip(997, 2004);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({997, 2004, 4997, 6004});
    });
    atEveryRate([](SnippetFilm& film) {
        film.clip(902, 1002);
        film.clip(1999, 2099);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({1002, 1999, 5002, 5999});
    });
}

TEST(SnippetAlgorithm, PiecesUpToTheThresholdCountAndOneFrameMoreDoesNot)
{
    for (const int piece : {1, 4, 5, 6}) {
        SCOPED_TRACE(piece);
        const int moved = piece <= 5 ? piece : 0;
        atEveryRate([&](SnippetFilm& film) {
            film.clip(1000 - piece, 1100 - piece);
            film.carry(range(1000, 2000, 5000));
            film.process();
            film.expectTimes({1000.0 - moved, 2000, 5000.0 - moved, 6000});
        });
        atEveryRate([&](SnippetFilm& film) {
            film.clip(900 + piece, 1000 + piece);
            film.carry(range(1000, 2000, 5000));
            film.process();
            film.expectTimes({1000.0 + moved, 2000, 5000.0 + moved, 6000});
        });
        atEveryRate([&](SnippetFilm& film) {
            film.clip(1900 + piece, 2000 + piece);
            film.carry(range(1000, 2000, 5000));
            film.process();
            film.expectTimes({1000, 2000.0 + moved, 5000, 6000.0 + moved});
        });
        atEveryRate([&](SnippetFilm& film) {
            film.clip(2000 - piece, 2100 - piece);
            film.carry(range(1000, 2000, 5000));
            film.process();
            film.expectTimes({1000, 2000.0 - moved, 5000, 6000.0 - moved});
        });
    }
}

// What a few frames are in seconds: at 24 fps 3 frames last 3 / 24 = 0.125 s, 5 frames 0.208333 s and 6 frames 0.25 s;
// at 25 fps 0.12, 0.2 and 0.24 s; at 29.97 fps 3 x 1001 / 30000 = 0.1001, 0.166833 and 0.2002 s.
struct SecondsCase {
    Framerate rate;
    double threeFrames;
    double fiveFrames;
    double sixFrames;
};

TEST(SnippetAlgorithm, MovesSecondsByTheLengthOfThePieceAtTheRateOfTheProject)
{
    for (const SecondsCase& numbers :
         {SecondsCase{Framerate(24, 0), 0.125, 0.625 / 3.0, 0.25}, SecondsCase{Framerate(25, 0), 0.12, 0.2, 0.24},
          SecondsCase{Framerate(30, true, 1), 0.1001, 0.5005 / 3.0, 0.2002}}) {
        SCOPED_TRACE(numbers.rate.rate);
        SnippetFilm film(numbers.rate);
        addClip(film.dialogue, 100.0 - numbers.threeFrames, 105.0);
        addClip(film.dialogue, 195.0, 200.0 + numbers.fiveFrames);
        addClip(film.dialogue, 300.0 - numbers.sixFrames, 305.0);
        addClip(film.dialogue, 395.0, 400.0 + numbers.sixFrames);
        film.addCut({cutEvent(film.dialogue, {100.0, 200.0}, {1100.0, 1200.0})});
        film.addCut({cutEvent(film.dialogue, {300.0, 400.0}, {2300.0, 2400.0})});

        film.process();

        const CutEventBase& grown = *film.cuts.cutAt(0)->cutEvents()[0];
        EXPECT_NEAR(grown.srcIn(), 100.0 - numbers.threeFrames, 1e-9);
        EXPECT_NEAR(grown.srcOut(), 200.0 + numbers.fiveFrames, 1e-9);
        EXPECT_NEAR(grown.dstIn(), 1100.0 - numbers.threeFrames, 1e-9);
        EXPECT_NEAR(grown.dstOut(), 1200.0 + numbers.fiveFrames, 1e-9);
        const CutEventBase& untouched = *film.cuts.cutAt(1)->cutEvents()[0];
        EXPECT_EQ(untouched.srcIn(), 300.0);
        EXPECT_EQ(untouched.srcOut(), 400.0);
        EXPECT_EQ(untouched.dstIn(), 2300.0);
        EXPECT_EQ(untouched.dstOut(), 2400.0);
    }
}

TEST(SnippetAlgorithm, RateIsThatOfTheStateGiven)
{
    // 0.208333 seconds are 5 frames at 24 fps, but 5.208333 at the 25 fps of the project.
    SnippetFilm film(Framerate(25, 0));
    addClip(film.dialogue, 100.0 - 5.0 / 24.0, 110.0);
    film.addCut({cutEvent(film.dialogue, {100.0, 200.0}, {1100.0, 1200.0})});
    const CutEventBase& found = *film.cuts.cutAt(0)->cutEvents()[0];

    SnippetAlgorithm().process(film.cuts, {Framerate(25, 0), &film.settings()});
    EXPECT_EQ(found.srcIn(), 100.0);

    SnippetAlgorithm().process(film.cuts, {Framerate(24, 0), &film.settings()});
    EXPECT_NEAR(found.srcIn(), 100.0 - 5.0 / 24.0, 1e-9);
}

TEST(SnippetAlgorithm, PieceMayPassTheThresholdByATinyPartOfAFrame)
{
    // The tolerance is 1/384000 of a frame, 2.604e-6.
    SnippetFilm justWithin;
    justWithin.clip(1000 - 5 - 2.5e-6, 1100);
    justWithin.carry(range(1000, 2000, 5000));
    justWithin.process();
    justWithin.expectTimes({995 - 2.5e-6, 2000, 4995 - 2.5e-6, 6000});

    SnippetFilm justBeyond;
    justBeyond.clip(1000 - 5 - 2.7e-6, 1100);
    justBeyond.carry(range(1000, 2000, 5000));
    justBeyond.process();
    justBeyond.expectTimes({1000, 2000, 5000, 6000});
}

TEST(SnippetAlgorithm, PieceThatPassesTheThresholdByTheWholeToleranceDoesNotCount)
{
    // At two frames a second, from a clip at 0, the frames of a piece are the very float that twice its length is.
    const auto startAfter = [](double piece) {
        SnippetFilm film(Framerate(2, 0));
        film.settings().setSnippetThreshold(1);
        addClip(film.dialogue, 0.0, 100.0);
        film.addCut({cutEvent(film.dialogue, {piece, 200.0}, {1000.0 + piece, 1200.0})});
        film.process();
        return film.cuts.cutAt(0)->cutEvents()[0]->srcIn();
    };

    const double within = (1.0 + SameInstant * 0.999) / 2.0;
    const double beyond = (1.0 + SameInstant * 1.001) / 2.0;
    EXPECT_EQ(startAfter(within), 0.0);
    EXPECT_EQ(startAfter(beyond), beyond);
}

TEST(SnippetAlgorithm, LessThanAnInstantIsNothingAndAnInstantIsLeftOver)
{
    // At one frame a second and from 0, so that nothing is rounded. At the start the range begins so far into a clip; at
    // the end the clip begins so far before the end of the range.
    const auto movedBy = [](double piece) {
        SnippetFilm film(Framerate(1, 0));
        addClip(film.dialogue, 0.0, 100.0);
        film.addCut({cutEvent(film.dialogue, {piece, 50.0}, {1000.0, 1050.0 - piece})});
        film.process();
        return piece - film.cuts.cutAt(0)->cutEvents()[0]->srcIn();
    };

    EXPECT_EQ(movedBy(std::nextafter(SameInstant, 0.0)), 0.0);
    EXPECT_EQ(movedBy(SameInstant), SameInstant);
    EXPECT_EQ(movedBy(1.6e-14), 0.0);
}

TEST(SnippetAlgorithm, RoundingOfAClipsEndLetsNoFollowerGiveWay)
{
    // 1.6e-14 s of a clip stand behind the end of the range, and a range of another speed follows.
    SnippetFilm film(Framerate(1, 0));
    addClip(film.dialogue, 0.0, 10.0 + 1.6e-14);
    film.addCut({cutEvent(film.dialogue, {0.0, 10.0}, {0.0, 10.0})});
    film.addCut({cutEvent(film.dialogue, {50.0, 60.0}, {10.0, 20.0})});

    film.process();

    EXPECT_EQ(film.cuts.cutAt(0)->cutEvents()[0]->srcOut(), 10.0);
    EXPECT_EQ(film.cuts.cutAt(0)->cutEvents()[0]->dstOut(), 10.0);
    EXPECT_EQ(film.cuts.cutAt(1)->cutEvents()[0]->srcIn(), 50.0);
    EXPECT_EQ(film.cuts.cutAt(1)->cutEvents()[0]->dstIn(), 10.0);
}

TEST(SnippetAlgorithm, RangeThatMeetsAClipExactlyHasNothingLeftOver)
{
    for (const auto& [start, end] : {std::pair(1000, 1100), std::pair(900, 1000), std::pair(1900, 2000),
                                     std::pair(2000, 2100), std::pair(1000, 2000)}) {
        SCOPED_TRACE(start);
        atEveryRate([start = start, end = end](SnippetFilm& film) {
            film.clip(start, end);
            film.carry(range(1000, 2000, 5000));
            const double srcIn = film.cuts.cutAt(0)->cutEvents()[0]->srcIn();

            film.process();

            EXPECT_EQ(film.cuts.cutAt(0)->cutEvents()[0]->srcIn(), srcIn);
            film.expectTimes({1000, 2000, 5000, 6000});
        });
    }
}

TEST(SnippetAlgorithm, RangeInEmptyTrackSpaceStaysUntouched)
{
    atEveryRate([](SnippetFilm& film) {
        film.clip(500, 997);
        film.clip(1003, 1997);
        film.clip(2003, 2500);
        film.carry(range(1000, 2000, 5000));

        EXPECT_EQ(film.process(), Result::Ok);

        film.expectTimes({1000, 2000, 5000, 6000});
    });
}

TEST(SnippetAlgorithm, PieceOutsideTakesPrecedenceWhereBothAreShort)
{
    //  clips   998|--|--|1002                1998|--|--|2002
    //  before    1000|-----------------------------|2000
    //  after  998|------------------------------------|2002
    atEveryRate([](SnippetFilm& film) {
        film.settings().setSnippetUsesPercentage(false);
        film.clip(998, 1002);
        film.clip(1998, 2002);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({998, 2002, 4998, 6002});
    });
}

TEST(SnippetAlgorithm, PieceOfMoreThanItsShareOfTheClipDoesNotCountSoThatTheOtherPieceMay)
{
    // A clip of 4 frames: 3 of them are 75 percent, the rest 25 percent.
    //  clips   997|---|-|1001                1999|-|---|2003
    //  before    1000|-----------------------------|2000
    //  after        1001|----------------------|1999
    atEveryRate([](SnippetFilm& film) {
        film.clip(997, 1001);
        film.clip(1999, 2003);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({1001, 1999, 5001, 5999});
    });
}

TEST(SnippetAlgorithm, ShareOfTheClipDoesNotMatterWhenItIsNotAskedFor)
{
    atEveryRate([](SnippetFilm& film) {
        film.settings().setSnippetUsesPercentage(false);
        film.settings().setSnippetMaxPercentage(0.0);
        film.clip(997, 1001);
        film.clip(1999, 2003);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({997, 2003, 4997, 6003});
    });
}

TEST(SnippetAlgorithm, PieceOfExactlyItsShareOfTheClipCounts)
{
    // At 24 fps the 2 seconds before the range are 48 frames, and half of a clip from 98 to 102 seconds. Where half is
    // too much it is so for the piece inside as well.
    const auto startWithShare = [](double percent) {
        SnippetFilm film(Framerate(24, 0));
        film.settings().setSnippetThreshold(48);
        film.settings().setSnippetMaxPercentage(percent);
        addClip(film.dialogue, 98.0, 102.0);
        film.addCut({cutEvent(film.dialogue, {100.0, 200.0}, {1100.0, 1200.0})});
        film.process();
        return film.cuts.cutAt(0)->cutEvents()[0]->srcIn();
    };

    EXPECT_EQ(startWithShare(50.0), 98.0);
    EXPECT_EQ(startWithShare(50.001), 98.0);
    EXPECT_EQ(startWithShare(49.999), 100.0);
}

TEST(SnippetAlgorithm, ShareIsThatOfTheWholeClip)
{
    // 3 frames of 12 are 25 percent, wherever the range cuts the clip.
    for (const auto& [percent, moved] : {std::pair(24.9, 0), std::pair(25.1, 3)}) {
        SnippetFilm film;
        film.settings().setSnippetMaxPercentage(percent);
        film.clip(997, 1009);
        film.clip(1991, 2003);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({1000.0 - moved, 2000.0 + moved, 5000.0 - moved, 6000.0 + moved});
    }
}

TEST(SnippetAlgorithm, ShortClipThatOnlyTouchesTheRangeComesAlongWholeWithoutAShare)
{
    //  clips   997|---|1000               2000|----|2004
    //  before     1000|-----------------------|2000
    const auto film = [](bool usesPercentage) {
        auto made = std::make_unique<SnippetFilm>();
        made->settings().setSnippetUsesPercentage(usesPercentage);
        made->clip(997, 1000);
        made->clip(2000, 2004);
        made->carry(range(1000, 2000, 5000));
        made->process();
        return made;
    };

    film(false)->expectTimes({997, 2004, 4997, 6004});
    film(true)->expectTimes({1000, 2000, 5000, 6000});
}

TEST(SnippetAlgorithm, ThresholdOfZeroOrLessLetsNothingMove)
{
    for (const std::int32_t threshold : {0, -1, std::numeric_limits<std::int32_t>::min()}) {
        SnippetFilm film;
        film.settings().setSnippetThreshold(threshold);
        film.clip(999, 2001);
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({1000, 2000, 5000, 6000});
    }
}

TEST(SnippetAlgorithm, RangeThatIsAsShortAsASnippetMayBecomeEmpty)
{
    //  clip     903|---------------|1003
    //  before            1000|--|1002
    //  after                    1003|  from start and end both
    SnippetFilm film;
    film.clip(903, 1003);
    film.carry(range(1000, 1002, 5000));

    film.process();

    film.expectTimes({1003, 1003, 5003, 5003});
}

TEST(SnippetAlgorithm, RangeThatIsExactlyOneShortClipLosesItAtBothEnds)
{
    // Nothing is left over outside, so that the whole clip is the piece inside the start and the piece inside the end.
    //  clip     1000|---|1003
    //  before   1000|---|1003
    //  after        |   1003 is the start, and 1000 the end
    SnippetFilm film;
    film.settings().setSnippetUsesPercentage(false);
    film.clip(1000, 1003);
    film.carry(range(1000, 1003, 5000));

    film.process();

    film.expectTimes({1003, 1000, 5003, 5000});
}

TEST(SnippetAlgorithm, NothingMovesUnlessOverhangingEventsAreIncluded)
{
    SnippetFilm film;
    film.settings().setIncludeOverhangingAudioEvents(false);
    film.clip(997, 2003);
    film.carry(range(1000, 2000, 5000));
    film.carry(range(10000, 10100, 6000));

    EXPECT_EQ(film.process(), Result::Ok);

    film.expectTimes({1000, 2000, 5000, 6000}, 0);
    film.expectTimes({10000, 10100, 6000, 6100}, 1);
}

TEST(SnippetAlgorithm, ListWithoutCutsAndCutsWithoutTracksAreFine)
{
    SnippetFilm film;
    EXPECT_EQ(film.process(), Result::Ok);

    film.addCut({});
    film.clip(997, 2003);
    film.carry(range(1000, 2000, 5000));
    film.addCut({});
    EXPECT_EQ(film.process(), Result::Ok);
    film.expectTimes({997, 2003, 4997, 6003}, 1);
}

TEST(SnippetAlgorithm, TracksOfAnyKindAreTrimmed)
{
    SnippetFilm film;
    MemoryTrack& picture = film.addTrack(L"Picture", false);
    film.clip(picture, 997, 1097);
    film.addCut({film.on(picture, range(1000, 2000, 5000))});

    film.process();

    film.expectTimes({997, 2000, 4997, 6000});
}

class FailingCutEvent : public CutEventBase {
public:
    core::CutEventSpans update(double /*time*/) override { throw Result::HostObjectMissing; }
    std::wstring getTrackName() override { return L"Gone"; }
    bool isAudio() override { return true; }
};

TEST(SnippetAlgorithm, FailureOfATrackPassesThrough)
{
    SnippetFilm film;
    film.addCut({std::make_shared<FailingCutEvent>()});

    EXPECT_EQ(thrownBy([&] { film.process(); }), Result::HostObjectMissing);
    film.settings().setIncludeOverhangingAudioEvents(false);
    EXPECT_EQ(thrownBy([&] { film.process(); }), Result::Ok);
}

// From here on the first range has a piece of 3 frames behind it, unless told otherwise, and grows from 5000 to 6003.

void carryGrowing(SnippetFilm& film)
{
    film.clip(1903, 2003);
    film.carry(range(1000, 2000, 5000));
}

TEST(SnippetAlgorithm, FollowingRangeGivesWayByWhatIsTakenFromIt)
{
    //  before   5000|------------|6000|-----------|6100
    //  after    5000|--------------|6003|---------|6100
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.carry(range(10000, 10100, 6000));

        film.process();

        film.expectTimes({1000, 2003, 5000, 6003}, 0);
        film.expectTimes({10003, 10100, 6003, 6100}, 1);
    });
}

TEST(SnippetAlgorithm, GapBehindTheRangeIsUsedUpFirst)
{
    for (const auto& [gap, lost] : {std::pair(1, 2), std::pair(2, 1), std::pair(3, 0), std::pair(4, 0)}) {
        SCOPED_TRACE(gap);
        atEveryRate([gap = gap, lost = lost](SnippetFilm& film) {
            carryGrowing(film);
            film.carry(range(10000, 10100, 6000 + gap));

            film.process();

            film.expectTimes({1000, 2003, 5000, 6003}, 0);
            film.expectTimes({10000.0 + lost, 10100, 6000.0 + gap + lost, 6100.0 + gap}, 1);
        });
    }
}

TEST(SnippetAlgorithm, FollowingRangeOfAnotherSpeedLosesAsMuchOfItsSource)
{
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.carry({10000, 10200, 6000, 6100});

        film.process();

        film.expectTimes({10003, 10200, 6003, 6100}, 1);
    });
}

TEST(SnippetAlgorithm, RangeThatIsGrownOverBecomesEmptyAtItsEndAndTheNextGivesWay)
{
    //  before   5000|------------|6000|2|6002|-------------|6102
    //  after    5000|--------------------|6003|------------|6102
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.carry(range(10000, 10002, 6000));
        film.carry(range(11000, 11100, 6002));

        film.process();

        film.expectTimes({1000, 2003, 5000, 6003}, 0);
        film.expectTimes({10002, 10002, 6002, 6002}, 1);
        film.expectTimes({11001, 11100, 6003, 6102}, 2);
    });
}

TEST(SnippetAlgorithm, AllFollowingRangesMayBeGrownOver)
{
    atEveryRate([](SnippetFilm& film) {
        film.clip(1904, 2004);
        film.carry(range(1000, 2000, 5000));
        film.carry(range(10000, 10001, 6000));
        film.carry(range(11000, 11001, 6001));
        film.carry(range(12000, 12001, 6002));

        film.process();

        film.expectTimes({1000, 2004, 5000, 6004}, 0);
        film.expectTimes({10001, 10001, 6001, 6001}, 1);
        film.expectTimes({11001, 11001, 6002, 6002}, 2);
        film.expectTimes({12001, 12001, 6003, 6003}, 3);
    });
}

// 3 frames at 24 fps are 0.125 seconds, so all of these times are exact in floats.
struct ExactFilm : SnippetFilm {
    ExactFilm() : SnippetFilm(Framerate(24, 0))
    {
        addClip(dialogue, 95.0, 100.125);
        addCut({cutEvent(dialogue, {50.0, 100.0}, {200.0, 250.0})});
    }
    void carryTo(SecondsRange destination)
    {
        addCut({cutEvent(dialogue, {500.0, 500.0 + destination.end - destination.start}, destination)});
    }
    SecondsRange destination(std::size_t cut) const
    {
        const CutEventBase& found = *cuts.cutAt(cut)->cutEvents()[0];
        return {found.dstIn(), found.dstOut()};
    }
};

TEST(SnippetAlgorithm, RangeThatIsCoveredToItsVeryEndGivesWayAsTheLastOne)
{
    //  grown        200|-------------------|250.125
    //  second                  250|--------|250.125      gives way to its end
    //  third                   250|-------------|260     is not reached
    ExactFilm film;
    film.carryTo({250.0, 250.125});
    film.carryTo({250.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(0), (SecondsRange{200.0, 250.125}));
    EXPECT_EQ(film.destination(1), (SecondsRange{250.125, 250.125}));
    EXPECT_EQ(film.cuts.cutAt(1)->cutEvents()[0]->srcIn(), 500.125);
    EXPECT_EQ(film.destination(2), (SecondsRange{250.0, 260.0}));
}

TEST(SnippetAlgorithm, RangeThatEndsBeforeTheGrownOneLetsTheNextGiveWayToo)
{
    ExactFilm film;
    film.carryTo({250.0, 250.0625});
    film.carryTo({250.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(1), (SecondsRange{250.0625, 250.0625}));
    EXPECT_EQ(film.destination(2), (SecondsRange{250.125, 260.0}));
}

TEST(SnippetAlgorithm, RangeThatStartsWhereTheGrownOneEndsIsTheEndOfGivingWay)
{
    ExactFilm film;
    film.carryTo({250.125, 260.0});
    film.carryTo({250.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(1), (SecondsRange{250.125, 260.0}));
    EXPECT_EQ(film.destination(2), (SecondsRange{250.0, 260.0}));
}

TEST(SnippetAlgorithm, OnlyTheFirstRangeThatIsNotGrownOverGivesWay)
{
    ExactFilm film;
    film.carryTo({250.0, 260.0});
    film.carryTo({250.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(1), (SecondsRange{250.125, 260.0}));
    EXPECT_EQ(film.destination(2), (SecondsRange{250.0, 260.0}));
}

TEST(SnippetAlgorithm, RangesThatStandBeforeTheGrownOneArePassedOver)
{
    //  list          1st 200|---------|250      2nd 100|----|110      3rd 199.875|------|260      4th 250|------|260
    //  after         1st 200|----------|250.125                                          4th 250.125|-----|260
    ExactFilm film;
    film.carryTo({100.0, 110.0});
    film.carryTo({199.875, 260.0});
    film.carryTo({250.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(0), (SecondsRange{200.0, 250.125}));
    EXPECT_EQ(film.destination(1), (SecondsRange{100.0, 110.0}));
    EXPECT_EQ(film.destination(2), (SecondsRange{199.875, 260.0}));
    EXPECT_EQ(film.destination(3), (SecondsRange{250.125, 260.0}));
}

TEST(SnippetAlgorithm, RangeThatStartsWithTheGrownOneGivesWayToItsEnd)
{
    ExactFilm film;
    film.carryTo({200.0, 260.0});

    film.process();

    EXPECT_EQ(film.destination(1), (SecondsRange{250.125, 260.0}));
    EXPECT_EQ(film.cuts.cutAt(1)->cutEvents()[0]->srcIn(), 550.125);
}

/// A range of 50 seconds that grows by 0.125 seconds to an end, and others that follow it. Beside 0 nothing is rounded.
struct InstantFilm : SnippetFilm {
    explicit InstantFilm(double end) : SnippetFilm(Framerate(24, 0))
    {
        addClip(dialogue, 95.0, 100.125);
        addCut({cutEvent(dialogue, {50.0, 100.0}, {end - 50.125, end - 0.125})});
    }
    CutEventBase& carryTo(SecondsRange destination)
    {
        addCut({cutEvent(dialogue, {500.0, 510.0}, destination)});
        return *cuts.cutAt(cuts.size() - 1)->cutEvents()[0];
    }
};

TEST(SnippetAlgorithm, NoRangeGivesWayToLessThanAnInstant)
{
    const auto startAfter = [](double overlap) {
        InstantFilm film(0.0);
        const CutEventBase& follower = film.carryTo({-overlap, 10.0});
        film.process();
        return follower.dstIn();
    };

    EXPECT_EQ(startAfter(1.6e-14), -1.6e-14);
    EXPECT_EQ(startAfter(std::nextafter(SameInstant, 0.0)), -std::nextafter(SameInstant, 0.0));
    EXPECT_EQ(startAfter(SameInstant), 0.0);
    EXPECT_EQ(startAfter(std::nextafter(SameInstant, 1.0)), 0.0);
}

TEST(SnippetAlgorithm, RangeThatIsPassedByLessThanAnInstantGivesWayToItsEndAsTheLastOne)
{
    for (const double passed : {1.6e-14, std::nextafter(SameInstant, 0.0), SameInstant}) {
        SCOPED_TRACE(passed);
        InstantFilm film(0.0);
        const CutEventBase& covered = film.carryTo({-0.0625, -passed});
        const CutEventBase& next = film.carryTo({-0.03125, 10.0});

        film.process();

        EXPECT_EQ(covered.dstIn(), -passed);
        EXPECT_EQ(covered.dstOut(), -passed);
        EXPECT_EQ(next.dstIn(), passed < SameInstant ? -0.03125 : 0.0);
    }
}

TEST(SnippetAlgorithm, RangeThatStartsLessThanAnInstantBeforeTheGrownOneStartsWithIt)
{
    for (const double earlier : {1.6e-14, std::nextafter(SameInstant, 0.0), SameInstant}) {
        SCOPED_TRACE(earlier);
        InstantFilm film(50.125);
        const CutEventBase& follower = film.carryTo({-earlier, 60.0});

        film.process();

        EXPECT_EQ(follower.dstIn(), earlier < SameInstant ? 50.125 : -earlier);
    }
}

/// Tells of one clip at any time.
class CutEventOnClip : public CutEventBase {
public:
    explicit CutEventOnClip(SecondsRange clip) : m_clip(clip) {}
    core::CutEventSpans update(double /*time*/) override
    {
        core::CutEventSpans spans;
        spans.across = m_clip;
        return spans;
    }
    std::wstring getTrackName() override { return L"Dialogue"; }
    bool isAudio() override { return true; }

private:
    SecondsRange m_clip;
};

TEST(SnippetAlgorithm, ClipShorterThanAnInstantIsNone)
{
    for (const double length : {1.6e-14, std::nextafter(SameInstant, 0.0), SameInstant}) {
        SCOPED_TRACE(length);
        SnippetFilm film;
        film.settings().setSnippetUsesPercentage(false);
        const auto range = std::make_shared<CutEventOnClip>(SecondsRange{0.0, length});
        range->setSrcIn(0.125);
        range->setSrcOut(-0.125);
        film.addCut({range});

        film.process();

        EXPECT_EQ(range->srcIn(), length < SameInstant ? 0.125 : 0.0);
        EXPECT_EQ(range->srcOut(), length < SameInstant ? -0.125 : length);
    }
}

TEST(SnippetAlgorithm, WhatStandsBeforeIsToldByTheStartAsItHasBecome)
{
    //  piece of 3 frames before the start as well: the grown range starts at 199.875
    ExactFilm film;
    addClip(film.dialogue, 49.875, 60.0);
    film.carryTo({199.875, 260.0});

    film.process();

    EXPECT_EQ(film.destination(0), (SecondsRange{199.875, 250.125}));
    EXPECT_EQ(film.destination(1), (SecondsRange{250.125, 260.0}));
}

TEST(SnippetAlgorithm, CutsBeforeInTheListNeverGiveWay)
{
    SnippetFilm film;
    film.carry(range(10000, 10100, 6000));
    carryGrowing(film);

    film.process();

    film.expectTimes({10000, 10100, 6000, 6100}, 0);
    film.expectTimes({1000, 2003, 5000, 6003}, 1);
}

TEST(SnippetAlgorithm, PrecedingRangeDoesNotGiveWayWhenAStartGrows)
{
    //  before    4000|-----------|5000|-------------|6000
    //  after     4000|-----------|5000
    //                        4997|------------------|6000
    atEveryRate([](SnippetFilm& film) {
        film.clip(997, 1097);
        film.carry(range(20000, 21000, 4000));
        film.carry(range(1000, 2000, 5000));

        film.process();

        film.expectTimes({20000, 21000, 4000, 5000}, 0);
        film.expectTimes({997, 2000, 4997, 6000}, 1);
    });
}

TEST(SnippetAlgorithm, FollowingRangesStayWhereAnEndShrinks)
{
    atEveryRate([](SnippetFilm& film) {
        film.clip(1997, 2097);
        film.carry(range(1000, 2000, 5000));
        film.carry(range(10000, 10100, 6000));

        film.process();

        film.expectTimes({1000, 1997, 5000, 5997}, 0);
        film.expectTimes({10000, 10100, 6000, 6100}, 1);
    });
}

TEST(SnippetAlgorithm, FollowingRangesGiveWayOnTheSameTrackAlone)
{
    atEveryRate([](SnippetFilm& film) {
        MemoryTrack& music = film.addTrack(L"Music");
        film.clip(music, 1903, 2003);
        film.addCut({film.on(film.dialogue, range(1000, 2000, 5000)), film.on(music, range(1000, 2000, 5000))});
        film.addCut({film.on(film.dialogue, range(10000, 10100, 6000)), film.on(music, range(10000, 10100, 6000))});

        film.process();

        film.expectTimes({1000, 2000, 5000, 6000}, 0, 0);
        film.expectTimes({10000, 10100, 6000, 6100}, 1, 0);
        film.expectTimes({1000, 2003, 5000, 6003}, 0, 1);
        film.expectTimes({10003, 10100, 6003, 6100}, 1, 1);
    });
}

TEST(SnippetAlgorithm, CutWithoutTheTrackIsTheEndOfGivingWay)
{
    SnippetFilm film;
    MemoryTrack& music = film.addTrack(L"Music");
    film.clip(music, 1903, 2003);
    film.addCut({film.on(film.dialogue, range(1000, 2000, 5000)), film.on(music, range(1000, 2000, 5000))});
    film.addCut({film.on(film.dialogue, range(10000, 10100, 6000))});
    film.addCut({film.on(film.dialogue, range(11000, 11100, 6000)), film.on(music, range(11000, 11100, 6000))});

    film.process();

    film.expectTimes({1000, 2003, 5000, 6003}, 0, 1);
    film.expectTimes({11000, 11100, 6000, 6100}, 2, 1);
}

TEST(SnippetAlgorithm, RangeThatGaveWayIsLookedAtFromItsNewStart)
{
    //  clip of the second   10000|--------------|10100
    //  gives way to             10003|----------|10100      leaves 3 frames of its own clip behind, so they come along
    //  again                10000|--------------|10100      and both now want 6000 to 6003
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.clip(10000, 10100);
        film.carry(range(10000, 10100, 6000));

        film.process();

        film.expectTimes({1000, 2003, 5000, 6003}, 0);
        film.expectTimes({10000, 10100, 6000, 6100}, 1);
    });
}

TEST(SnippetAlgorithm, RangeThatGaveWayInTheMiddleOfAClipLosesItsStart)
{
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.clip(9000, 11000);
        film.carry(range(10000, 10100, 6000));

        film.process();

        film.expectTimes({10003, 10100, 6003, 6100}, 1);
    });
}

TEST(SnippetAlgorithm, RangeThatWasGrownOverStaysEmptyInTheMiddleOfAClip)
{
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.clip(9000, 11000);
        film.carry(range(10000, 10002, 6000));

        film.process();

        film.expectTimes({10002, 10002, 6002, 6002}, 1);
    });
}

TEST(SnippetAlgorithm, RangeThatWasGrownOverMovesToTheEndOfAClipWithBothItsEnds)
{
    //  clip     9000|----------------------|10004
    //  empty                     10002|               the piece inside its start and the one behind its end are one
    SnippetFilm film;
    carryGrowing(film);
    film.clip(9000, 10004);
    film.carry(range(10000, 10002, 6000));

    film.process();

    film.expectTimes({10004, 10004, 6004, 6004}, 1);
}

TEST(SnippetAlgorithm, RangeThatGaveWayMakesTheNextGiveWayToItsOwnGrowth)
{
    atEveryRate([](SnippetFilm& film) {
        carryGrowing(film);
        film.clip(10002, 10102);
        film.carry(range(10000, 10100, 6000));
        film.carry(range(11000, 11100, 6100));

        film.process();

        // The second starts at 10003, one frame behind the start of its clip, which comes along.
        film.expectTimes({1000, 2003, 5000, 6003}, 0);
        film.expectTimes({10002, 10102, 6002, 6102}, 1);
        film.expectTimes({11002, 11100, 6102, 6200}, 2);
    });
}

/// At 32 fps all frames are exact in floats, and so are sums and differences of them.
struct GridFilm : CutFilm {
    GridFilm() : CutFilm(Framerate(32, 0))
    {
        settings().setIncludeOverhangingAudioEvents(true);
        settings().setSnippetThreshold(*rc::gen::inRange(0, 8));
        settings().setSnippetUsesPercentage(*rc::gen::arbitrary<bool>());
        settings().setSnippetMaxPercentage(*rc::gen::inRange(0, 101));
        for (const wchar_t* name : {L"Dialogue", L"Music"}) {
            MemoryTrack& track = addTrack(name);
            double frame = 100;
            const auto gapsAndClips = *rc::gen::container<std::vector<std::pair<std::int32_t, std::int32_t>>>(
                rc::gen::pair(rc::gen::inRange(0, 8), rc::gen::inRange(1, 20)));
            for (const auto& [gap, length] : gapsAndClips) {
                addClip(track, (frame + gap) / 32.0, (frame + gap + length) / 32.0);
                frame += gap + length;
            }
        }
    }

    void carry(double srcIn, double srcLength, double dstIn, double dstLength)
    {
        core::Cut::CutEvents cutEvents;
        for (MemoryTrack& track : tracks()) {
            cutEvents.push_back(cutEvent(track, {srcIn / 32.0, (srcIn + srcLength) / 32.0},
                                         {dstIn / 32.0, (dstIn + dstLength) / 32.0}));
        }
        addCut(cutEvents);
    }
    void carrySome(bool anySpeed)
    {
        const auto count = *rc::gen::inRange(1, 12);
        for (int i = 0; i < count; ++i) {
            const double length = *rc::gen::inRange(0, 40);
            const double srcLength = anySpeed ? *rc::gen::inRange(0, 80) : length;
            carry(*rc::gen::inRange(90, 300), srcLength, *rc::gen::inRange(1000, 1200), length);
        }
    }
    std::vector<Times> times() const
    {
        std::vector<Times> all;
        for (std::size_t i = 0; i < cuts.size(); ++i) {
            for (const auto& cutEvent : cuts.cutAt(i)->cutEvents())
                all.push_back({cutEvent->srcIn() * 32.0, cutEvent->srcOut() * 32.0, cutEvent->dstIn() * 32.0,
                               cutEvent->dstOut() * 32.0});
        }
        return all;
    }
    void process() { SnippetAlgorithm().process(cuts, previewState()); }
};

RC_GTEST_PROP(SnippetAlgorithm, ChangesNothingWhereItIsNotAskedFor, (bool isOff))
{
    GridFilm film;
    film.carrySome(true);
    if (isOff)
        film.settings().setIncludeOverhangingAudioEvents(false);
    else
        film.settings().setSnippetThreshold(0);
    const auto before = film.times();

    film.process();

    RC_ASSERT(film.times() == before);
}

RC_GTEST_PROP(SnippetAlgorithm, KeepsTheDifferenceOfSourceAndDestinationLengthUnlessARangeIsGrownOver, ())
{
    GridFilm film;
    film.carrySome(true);
    const auto before = film.times();

    film.process();

    const auto after = film.times();
    for (std::size_t i = 0; i < before.size(); ++i) {
        const auto difference = [](const Times& t) { return (t.srcOut - t.srcIn) - (t.dstOut - t.dstIn); };
        RC_ASSERT(difference(after[i]) == difference(before[i]) || difference(after[i]) == 0.0);
    }
}

RC_GTEST_PROP(SnippetAlgorithm, KeepsRangesOfNormalSpeedAtNormalSpeed, ())
{
    GridFilm film;
    film.carrySome(false);

    film.process();

    for (const Times& times : film.times())
        RC_ASSERT(times.srcOut - times.srcIn == times.dstOut - times.dstIn);
}

RC_GTEST_PROP(SnippetAlgorithm, MovesAnEndOfASingleRangeOnlyToTheEdgeOfAClipWithinTheThreshold, ())
{
    GridFilm film;
    const double length = *rc::gen::inRange(0, 60);
    film.carry(*rc::gen::inRange(90, 300), length, 1000, length);
    const auto before = film.times();

    film.process();

    const auto after = film.times();
    for (std::size_t track = 0; track < after.size(); ++track) {
        std::vector<double> edges{before[track].srcIn, before[track].srcOut};
        bool isOneClip = false;
        for (const MemoryClip& clip : film.tracks()[track].clips()) {
            edges.insert(edges.end(), {clip.start * 32.0, clip.end * 32.0});
            isOneClip |= clip.start * 32.0 == before[track].srcIn && clip.end * 32.0 == before[track].srcOut;
        }
        RC_ASSERT(std::count(edges.begin(), edges.end(), after[track].srcIn) > 0);
        RC_ASSERT(std::count(edges.begin(), edges.end(), after[track].srcOut) > 0);
        RC_ASSERT(std::abs(after[track].srcIn - before[track].srcIn) <= film.settings().snippetThreshold());
        RC_ASSERT(std::abs(after[track].srcOut - before[track].srcOut) <= film.settings().snippetThreshold());
        RC_ASSERT(after[track].srcIn <= after[track].srcOut || isOneClip);
        RC_ASSERT(after[track].dstIn - before[track].dstIn == after[track].srcIn - before[track].srcIn);
    }
}

} // namespace
} // namespace cadrel::tests
