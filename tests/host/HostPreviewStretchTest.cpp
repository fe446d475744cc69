// SPDX-License-Identifier: GPL-3.0-or-later

// What a preview and a run that has failed take away again, and what of the user's they leave.

#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "host/border/NumberList.h"
#include "host/project/Project.h"
#include "host/track/TrackRole.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Track.h"
#include "tests/host/PreviewedFilm.h"
#include "tests/host/project/AlteredEdits.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/WatchedProgress.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <initializer_list>
#include <limits>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

/// Two clips of ten seconds that change places, previewed from 86400 s to 86420 s of the film.
class HostPreviewStretchTest : public PreviewedFilm {
protected:
    double previewOffset() { return adapter().getRunState().previewOffset; }
    void reopen(const std::function<void()>& meanwhile = [] {})
    {
        host.project.announceStoring();
        host.disconnect();
        meanwhile();
        host.connect();
    }
    /// Makes a run or preview fail once it has copied something, and lets it happen.
    void failWhile(const std::function<void()>& requested)
    {
        host.settings().setCreateOverlapMarkers(true);
        const auto edits = makeCounted<AlteredEdits>(host.context());
        edits->closes = false;
        host.altered.replace(IEditService::iid, edits);
        requested();
        host.altered.unhide(IEditService::iid);
    }
    void failInAPreview()
    {
        adapter().setPreviewActive(true);
        failWhile([&] { host.preview(changes()); });
        ASSERT_EQ(host.undoNames().back(), u"Preview (incomplete)");
        ASSERT_EQ(host.contentOf(track).size(), 4U);
    }

    /// The track of the memos, with some at a time.
    void addMemos(std::initializer_list<std::pair<const char16_t*, double>> points)
    {
        memos = host.addTrack(TypeWord::Marker, u"Memos");
        memos->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Memos), true);
        for (const auto& [name, time] : points)
            host.addPointMarker(memos, name, host.inHost(time));
    }
    void rename(const Node& event, const char16_t* name)
    {
        host.edit(u"Rename", [&] { event->setName(nullptr, standin::tests::text(name).get(), 0); });
    }

    /// To a time of the preview.
    void moveTo(const Node& event, double time)
    {
        host.edit(u"Move", [&] { requireOk(event->setStart(nullptr, 0, Day + host.inHost(time))); });
    }

    using Curve = standin::Envelope::Curve;
    /// Of that of the preview, in seconds of the film.
    static constexpr double StartOfDay = Day - 3600.0;
    /// In seconds of the film.
    using Points = std::vector<std::pair<double, float>>;
    /// To the thousandth of a second.
    Points pointsOf(int32 curve)
    {
        Points points;
        for (const Node& point : standin::tests::childrenOf(*host.curveOf(track, curve))) {
            const double time = point->getStart(nullptr) - host.inHost(0.0);
            points.emplace_back(std::round(time * 1000.0) / 1000.0, query<IAutomationPoint>(point)->getValue());
        }
        return points;
    }
    /// At a time of the preview.
    void drawPoint(int32 curve, double time, float value)
    {
        host.addPoint(track, curve, Day + host.inHost(time), value);
    }
    /// Of the volume, in the film.
    Points drawFade()
    {
        host.addPoint(track, Curve::Volume, host.inHost(5.0), 0.5F);
        host.addPoint(track, Curve::Volume, host.inHost(7.0), 0.25F);
        return pointsOf(Curve::Volume);
    }

    const Texts film{"one 0-10", "two 10-20"};
    Node memos;
};

INSTANTIATE_TEST_SUITE_P(Origins, HostPreviewStretchTest, testing::Values(0.0, 3600.0));

} // namespace

// What the user lays there while a preview is on.

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasLaidPastIt)
{
    previewAll();
    host.addSound(track, u"late", Day + 20.0, Day + 40.0);
    host.addSound(track, u"later", Day + 1000.0, Day + 1010.0);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "late 86420-86440", "later 87400-87410"}));
}

TEST_P(HostPreviewStretchTest, ARunLeavesWhatTheUserHasLaidThereWhetherThePreviewHasEndedOrNot)
{
    for (const bool hasEnded : {false, true}) {
        SCOPED_TRACE(hasEnded);
        previewAll();
        const std::u16string name = hasEnded ? u"later" : u"late";
        host.addSound(track, name.c_str(), Day + (hasEnded ? 1000.0 : 15.0), Day + (hasEnded ? 1010.0 : 40.0));
        if (hasEnded)
            adapter().setPreviewActive(false);

        ASSERT_EQ(adapter().startCadrel(), Result::Ok);
        host.idle();

        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    }
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "late 86415-86440", "later 87400-87410"}));
}

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasLaidWithinIt)
{
    previewAll();
    host.addSound(track, u"within", Day + 3.0, Day + 7.0);
    host.addSound(track, u"over the start", Day - 5.0, Day + 1.0);
    host.addSound(track, u"over the end", Day + 15.0, Day + 30.0);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "over the start 86395-86401", "within 86403-86407",
                                            "over the end 86415-86430"}));
}

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasMadeOfACopy)
{
    previewAll();
    standin::tests::childrenOf(*track)[2]->setEnd(nullptr, 0, Day + host.inHost(4.0));

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86404"}));
}

TEST_P(HostPreviewStretchTest, LeavesACopyThatTheUserHasRenamedAndOneThatPlaysFromElsewhere)
{
    previewAll();
    const std::vector<Node> copies = standin::tests::childrenOf(*track);
    ASSERT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
    rename(copies[2], u"two, the better take");
    host.edit(u"Slip", [&] { dynamic_cast<standin::ClipEvent&>(*copies[3]).setSourceOffset(0.5); });

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track),
              (Texts{"one 0-10", "two 10-20", "two, the better take 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, LeavesACopyThatTheUserHasGivenAnotherClipAndAPartThatHeHasEdited)
{
    const Node part = host.addPart(track, u"reel", host.inHost(0.0), host.inHost(10.0));
    host.addClip(part, u"take", host.inHost(2.0), host.inHost(4.0));
    previewAll();
    const std::vector<Node> copies = standin::tests::childrenOf(*track);
    ASSERT_EQ(host.contentOf(track),
              (Texts{"one 0-10", "reel 0-10", "two 10-20", "two 86400-86410", "one 86410-86420", "reel 86410-86420"}));
    auto& take = host.addMedia(u"/sound/better take.wav", 60.0);
    host.edit(u"Replace", [&] {
        dynamic_cast<standin::ClipEvent&>(*copies[3]).setClip(Counted<standin::MediaClip>::share(&take));
    });
    host.addClip(copies[5], u"added", Day + host.inHost(15.0), Day + host.inHost(16.0));

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track),
              (Texts{"one 0-10", "reel 0-10", "two 10-20", "two 86400-86410", "reel 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, LeavesOtherTracksAsTheyAre)
{
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);
    dynamic_cast<standin::Track&>(*track).setSelected(true);
    const Node wild = host.addTrack(TypeWord::Audio, u"Wild");
    previewAll();
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    host.addSound(wild, u"take", Day + 2.0, Day + 8.0);
    host.addPoint(wild, volume, Day + host.inHost(3.0), 0.25F);
    host.addPoint(wild, volume, Day + host.inHost(5.0), 0.75F);
    host.addPoint(wild, volume, Day + host.inHost(500.0), 0.5F);
    const auto pointsOf = [&] {
        std::vector<double> times;
        for (const Node& point : standin::tests::childrenOf(*host.curveOf(wild, volume)))
            times.push_back(point->getStart(nullptr));
        return times;
    };
    const std::vector<double> points = pointsOf();

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(wild), Texts{"take 86402-86408"});
    EXPECT_EQ(pointsOf(), points);
    EXPECT_EQ(host.contentOf(track), film);
}

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasLaidOnTopOfOneAnotherInItsOrder)
{
    previewAll();
    // The preview's stretch begins with the day, an hour before the film in it.
    host.addSound(track, u"below", Day - 3605.0, Day - 3599.0);
    host.addSound(track, u"above", Day - 3605.0, Day - 3602.0);
    host.addSound(track, u"within", Day + 1.0, Day + 2.0);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track),
              (Texts{"one 0-10", "two 10-20", "below 82795-82801", "above 82795-82798", "within 86401-86402"}));
}

TEST_P(HostPreviewStretchTest, LeavesTheAutomationThatTheUserDrawsOnACurveOnWhichItHasWrittenNothing)
{
    host.addPoint(track, Curve::Volume, host.inHost(5.0), 0.5F);
    host.addPoint(track, Curve::Volume, host.inHost(7.0), 0.25F);
    const Points before = pointsOf(Curve::Volume);
    for (const auto& [number, isReopened] : {std::pair(Curve::Pan, false), std::pair(Curve::Mute, true)}) {
        SCOPED_TRACE(number);
        previewAll();
        ASSERT_GT(pointsOf(Curve::Volume).size(), before.size());
        const double day = previewOffset() - 86400.0;
        drawPoint(number, day + 3.0, 0.25F);
        drawPoint(number, day + 30.0, 0.75F);
        const Points drawn = pointsOf(number);
        if (isReopened)
            reopen();

        adapter().setPreviewActive(false);

        EXPECT_EQ(pointsOf(number), drawn);
        EXPECT_EQ(pointsOf(Curve::Volume), before);
    }
}

//     film       ..5|``\7__________________|
//     preview                      |_______10|``15\17___ w: what it writes; the user draws at 2, 12, 16 and 300
TEST_P(HostPreviewStretchTest, LeavesTheAutomationThatTheUserDrawsAmongItsOwn)
{
    const Points before = drawFade();
    for (const bool isReopened : {false, true}) {
        SCOPED_TRACE(isReopened);
        previewAll();
        ASSERT_EQ(
            pointsOf(Curve::Volume),
            (Points{{5, 0.5F}, {7, 0.25F}, {Day + 10, 0.25F}, {Day + 10, 0.5F}, {Day + 15, 0.5F}, {Day + 17, 0.25F}}));
        for (const auto& [time, value] : {std::pair(2.0, 0.75F), {12.0, 0.125F}, {16.0, 0.875F}, {300.0, 0.5F}})
            drawPoint(Curve::Volume, time, value);
        if (isReopened)
            reopen();

        adapter().setPreviewActive(false);

        // One at the begin of the day keeps the film level.
        const Points kept{{5, 0.5F},          {7, 0.25F},         {StartOfDay, 0.25F}, {Day + 2, 0.75F},
                          {Day + 12, 0.125F}, {Day + 16, 0.875F}, {Day + 300, 0.5F}};
        EXPECT_EQ(pointsOf(Curve::Volume), kept);
        EXPECT_EQ(host.contentOf(track), film);
        while (pointsOf(Curve::Volume) != before)
            ASSERT_TRUE(host.undo());
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostPreviewStretchTest, LeavesPointsOfItsOwnThatTheUserHasMovedOrGivenAnotherValue)
{
    drawFade();
    const Points rest{{5, 0.5F}, {7, 0.25F}, {StartOfDay, 0.25F}};
    using Change = std::function<void(IProjectNode&)>;
    const std::vector<std::pair<Change, Points>> changes{
        {[](IProjectNode& point) { query<IAutomationPoint>(&point)->setValue(0.625F); }, {{Day + 15, 0.625F}}},
        {[&](IProjectNode& point) { point.setStart(nullptr, 0, Day + host.inHost(15.5)); }, {{Day + 15.5, 0.5F}}}};
    for (const auto& [change, left] : changes) {
        previewAll();
        const Node point = standin::tests::childrenOf(*host.curveOf(track, Curve::Volume))[4];
        host.edit(u"Automation", [&, &edit = change] { edit(*point); });

        adapter().setPreviewActive(false);

        Points expected = rest;
        expected.insert(expected.end(), left.begin(), left.end());
        EXPECT_EQ(pointsOf(Curve::Volume), expected);
        while (pointsOf(Curve::Volume).size() > 2)
            ASSERT_TRUE(host.undo());
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostPreviewStretchTest, KeepsTheFilmLevelAtWhatItsLastPointHasBeenGivenMeanwhile)
{
    drawFade();
    previewAll();
    const Node last = standin::tests::childrenOf(*host.curveOf(track, Curve::Volume))[1];
    host.edit(u"Automation", [&] { requireOk(query<IAutomationPoint>(last)->setValue(0.75F)); });
    drawPoint(Curve::Volume, 12.0, 0.125F);

    adapter().setPreviewActive(false);

    EXPECT_EQ(pointsOf(Curve::Volume), (Points{{5, 0.5F}, {7, 0.75F}, {StartOfDay, 0.75F}, {Day + 12, 0.125F}}));
}

TEST_P(HostPreviewStretchTest, NeedsNoPointToKeepTheFilmLevelWhereItIsSoWithoutOne)
{
    drawFade();
    // What the user draws goes on as the film ends, or the film has no automation any more.
    for (const bool isFilmEmpty : {false, true}) {
        SCOPED_TRACE(isFilmEmpty);
        previewAll();
        drawPoint(Curve::Volume, 12.0, 0.25F);
        drawPoint(Curve::Volume, 13.0, 0.5F);
        Points expected{{5, 0.5F}, {7, 0.25F}, {Day + 12, 0.25F}, {Day + 13, 0.5F}};
        if (isFilmEmpty) {
            host.edit(u"Automation", [&] {
                for (int count = 0; count < 2; ++count) {
                    const Node curve = host.curveOf(track, Curve::Volume);
                    requireOk(host.transaction()->remove(curve.get(), standin::tests::childrenOf(*curve)[0].get()));
                }
            });
            expected.erase(expected.begin(), expected.begin() + 2);
        }

        adapter().setPreviewActive(false);

        EXPECT_EQ(pointsOf(Curve::Volume), expected);
        while (pointsOf(Curve::Volume).size() != 2 || pointsOf(Curve::Volume)[0].first > Day)
            ASSERT_TRUE(host.undo());
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostPreviewStretchTest, KeepsTheFilmLevelBeforeWhatTheUserDrawsAtTheVeryBeginOfItsDay)
{
    drawFade();
    previewAll();
    drawPoint(Curve::Volume, StartOfDay - Day, 0.75F);

    adapter().setPreviewActive(false);

    EXPECT_EQ(pointsOf(Curve::Volume), (Points{{5, 0.5F}, {7, 0.25F}, {StartOfDay, 0.25F}, {StartOfDay, 0.75F}}));
}

TEST_P(HostPreviewStretchTest, KeepsTheUsersAutomationWhenItsEndIsRefusedAtFirst)
{
    drawFade();
    previewAll();
    drawPoint(Curve::Volume, 12.0, 0.125F);
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);
    EXPECT_NE(adapter().endPreview(), Result::Ok);
    host.altered.unhide(IEditService::iid);
    EXPECT_EQ(pointsOf(Curve::Volume).back(), (std::pair{Day + 12, 0.125F}));

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    EXPECT_EQ(pointsOf(Curve::Volume), (Points{{5, 0.5F}, {7, 0.25F}, {StartOfDay, 0.25F}, {Day + 12, 0.125F}}));
    EXPECT_EQ(host.contentOf(track), film);
}

TEST_P(HostPreviewStretchTest, OfAnEarlierProjectLeavesAutomationPastTheEndOfItsOwnTrack)
{
    drawFade();
    previewAll();
    // Another track reaches further.
    const double start = previewOffset() - host.origin;
    const Node other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"copy", Day + 0.0, Day + 60.0);
    const auto store = [&](const Node& node, double end) {
        writeNumbers(host.context(), *node, AttributeKey::Preview, {start, host.inHost(end)});
        node->removeAttribute(AttributeKey::PreviewEvents);
        node->removeAttribute(AttributeKey::PreviewCurves);
    };
    store(other, Day + 60.0);
    store(track, Day + 20.0);
    drawPoint(Curve::Volume, 12.0, 0.125F);
    drawPoint(Curve::Volume, 20.1, 0.75F);
    drawPoint(Curve::Volume, 50.0, 0.125F);

    adapter().setPreviewActive(false);

    EXPECT_EQ(pointsOf(Curve::Volume),
              (Points{{5, 0.5F}, {7, 0.25F}, {StartOfDay, 0.25F}, {Day + 20.1, 0.75F}, {Day + 50, 0.125F}}));
}

TEST_P(HostPreviewStretchTest, GivesWayToWhatTheUserHasLaidSinceThePreviewBefore)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // shown from 10 s to 20 s
    host.addSound(track, u"late", Day, Day + 40.0);

    host.preview(secondChange());

    EXPECT_EQ(previewOffset(), 2.0 * Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "late 86400-86440", "two 172800-172810"}));

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(previewOffset(), Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "late 86400-86440", "one 86410-86420"}));
    ASSERT_TRUE(host.redo());

    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "late 86400-86440"}));
}

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasLaidThereWhenItsEndIsRefusedAtFirst)
{
    previewAll();
    host.addSound(track, u"within", Day + 3.0, Day + 7.0);
    const Texts before = host.contentOf(track);
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);

    EXPECT_EQ(adapter().endPreview(), Result::HostCallFailed);
    EXPECT_EQ(host.undoNames().back(), u"Delete Preview Range (incomplete)");
    EXPECT_EQ(host.contentOf(track), before);

    host.altered.unhide(IEditService::iid);
    EXPECT_EQ(adapter().endPreview(), Result::Ok);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "within 86403-86407"}));
}

TEST_P(HostPreviewStretchTest, EndsWhereItWasWrittenWhenTheTimeOriginHasMovedMeanwhile)
{
    for (const double shift : {Day, 2.0 * Day, 10.0, -host.origin}) {
        SCOPED_TRACE(shift);
        host.disconnect();
        AdaptedHost moved(GetParam());
        const Node dialogue = moved.addTrack(TypeWord::Audio, u"DX");
        moved.addSound(dialogue, u"one", 0.0, 10.0);
        moved.addSound(dialogue, u"two", 10.0, 20.0);
        moved.switchMarkersOff();
        moved.carryOver("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00");
        moved.adapter().setPreviewActive(true);
        moved.preview(moved.model().changeEdl());
        ASSERT_EQ(moved.contentOf(dialogue).size(), 3U);

        moved.project.setTimeOrigin(moved.origin + shift);
        moved.idle();
        moved.preview(moved.model().changeEdl());
        EXPECT_EQ(moved.undoNames().back(), u"Preview");
        moved.adapter().setPreviewActive(false);

        EXPECT_EQ(moved.contentOf(dialogue), film);
    }
}

TEST_P(HostPreviewStretchTest, StandsPastAutomationToo)
{
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    host.addPoint(track, volume, host.inHost(5.0), 0.5F);
    host.addPoint(track, volume, Day + host.inHost(5.0), 0.25F);
    host.addPoint(track, volume, Day + host.inHost(6.0), 0.75F);
    const std::string before = host.dump();

    previewAll();
    EXPECT_EQ(previewOffset(), 2.0 * Day);
    adapter().setPreviewActive(false);

    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, volume));
    EXPECT_EQ(curve.valueBehind(Day + host.inHost(5.0)), 0.25);
    EXPECT_EQ(curve.valueBehind(Day + host.inHost(6.0)), 0.75);
}

TEST_P(HostPreviewStretchTest, LeavesNoPointOfItsOwnWhoseValueIsRounded)
{
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    host.addPoint(track, volume, host.inHost(5.0), 0.5F);
    host.addPoint(track, volume, host.inHost(7.0), 0.1F);
    // Between the two the curve comes to values that no float is.
    changes().clear();
    host.carryOver("01:00:05:08", "01:00:06:09", "01:00:10:00", "01:00:11:01");
    const auto points = [&] { return standin::tests::childrenOf(*host.curveOf(track, volume)).size(); };
    ASSERT_EQ(points(), 2U);

    for (int round = 0; round < 2; ++round) {
        previewAll();
        EXPECT_EQ(previewOffset(), Day);
        adapter().setPreviewActive(false);
        EXPECT_EQ(points(), 2U);
    }

    host.conform();
    // The curve falls by 0.2 in a second.
    const auto left = standin::tests::childrenOf(*host.curveOf(track, volume));
    ASSERT_EQ(left.size(), 2U);
    EXPECT_NEAR(left[0]->getStart(nullptr), host.inHost(10.0), 1e-9);
    EXPECT_NEAR(query<IAutomationPoint>(left[0])->getValue(), 0.436, 1e-6);
    EXPECT_NEAR(left[1]->getStart(nullptr), host.inHost(11.04), 1e-9);
    EXPECT_NEAR(query<IAutomationPoint>(left[1])->getValue(), 0.228, 1e-6);
    adapter().setPreviewActive(true);
    EXPECT_EQ(previewOffset(), Day);
}

// What an edit that failed has left.

TEST_P(HostPreviewStretchTest, EmptiesWhatAFailedPreviewHasLeftOnceItIsSwitchedOff)
{
    failInAPreview();

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), film);
}

TEST_P(HostPreviewStretchTest, EmptiesWhatAFailedRunHasLeftAndNothingElse)
{
    failWhile([&] { host.conform(); });
    ASSERT_EQ(host.undoNames().back(), u"Apply Cadrel (incomplete)");
    const Texts conformed = host.contentOf(track);
    host.addSound(track, u"late", Day + 30.0, Day + 40.0);

    previewAll();
    adapter().setPreviewActive(false);

    Texts expected = conformed;
    std::erase_if(expected, [](const std::string& event) { return event.find(" 864") != std::string::npos; });
    expected.emplace_back("late 86430-86440");
    EXPECT_EQ(host.contentOf(track), expected);
}

TEST_P(HostPreviewStretchTest, KnowsWhatIsLeftAfterAnotherProjectWasActive)
{
    failInAPreview();
    thrownBy([&] { failWhile([&] { adapter().setPreviewActive(false); }); });
    host.application.activateProject(&host.application.createProject());
    host.application.activateProject(&host.project);

    previewAll();

    EXPECT_EQ(previewOffset(), Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, KnowsWhatIsLeftWhenTheFailedEntryIsRedone)
{
    failInAPreview();
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.contentOf(track), film);
    ASSERT_TRUE(host.redo());

    host.preview(changes());

    EXPECT_EQ(previewOffset(), Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, KnowsWhatIsLeftWhenALaterChangeOfTheModelIsUndone)
{
    failInAPreview();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);
    thrownBy([&] { adapter().setPreviewActive(false); });
    host.altered.unhide(IEditService::iid);
    adapter().createCommand(L"Load New EDL");
    ASSERT_TRUE(host.undo());

    previewAll();

    EXPECT_EQ(previewOffset(), Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, KnowsWhatIsLeftWhenTheProjectIsOpenedAgain)
{
    failInAPreview();
    host.model().setPreviewActive(false);
    reopen();

    previewAll();

    EXPECT_EQ(previewOffset(), Day);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewStretchTest, KnowsWhatIsLeftOfAPreviewWhoseModelCannotBeRead)
{
    const double end = host.project.setEndTime();
    previewAll();
    host.project.announceStoring();
    host.project.setAttribute(AttributeKey::StorageChecksum, FVariant::integer(1), true);
    host.disconnect();
    host.project.setAttribute(AttributeKey::StorageChecksum, FVariant::integer(1), true);
    host.connect();
    ASSERT_EQ(host.alerts->messages.size(), 1U);
    ASSERT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(host.project.setEndTime(), end);

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    EXPECT_EQ(host.contentOf(track), film);
    EXPECT_EQ(host.undoNames().back(), u"Delete Preview Range");
}

TEST_P(HostPreviewStretchTest, TakesAwayNothingForAnAttributeThatMakesNoSense)
{
    previewAll();
    host.addSound(track, u"late", Day + 30.0, Day + 40.0);
    const Texts before = host.contentOf(track);
    const auto list = required(create<IAttributeData>(host.context()));
    const std::string bytes = "no numbers";
    requireOk(list->setBinary(AttributeKey::Numbers, bytes.data(), static_cast<int32>(bytes.size()), true));
    for (const FVariant& value : {FVariant::integer(1), FVariant::string("0 1e300"), FVariant::object(list.get())}) {
        requireOk(track->setAttribute(AttributeKey::Preview, value, true));

        EXPECT_EQ(adapter().endPreview(), Result::Ok);

        EXPECT_EQ(host.contentOf(track), before);
        ASSERT_TRUE(host.undo());
    }
}

TEST_P(HostPreviewStretchTest, TakesAwayNothingOfTheFilmForARecordThatIsDamaged)
{
    const Node other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"shot", 12.0, 13.0);
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    host.addPoint(other, volume, host.inHost(3.0), 0.25F);
    host.addPoint(other, volume, host.inHost(15.0), 0.75F);
    const auto contents = [&] {
        Texts all = host.contentOf(track);
        for (const std::string& event : host.contentOf(other))
            all.push_back(event);
        for (const Node& point : standin::tests::childrenOf(*host.curveOf(other, volume)))
            all.push_back(std::to_string(point->getStart(nullptr)));
        return all;
    };
    const Texts before = contents();
    using Numbers = std::vector<double>;
    const double shot = host.inHost(12.0);
    for (const Numbers& numbers :
         {Numbers{0.0}, Numbers{-5.0, 1e9}, Numbers{0.0, 1.0, 25.0, 0.0, 1e9, shot, shot + 1.0, 0.0, 7.0},
          Numbers{Day, 1e9}, Numbers{Day, 1.0, 25.0, 0.0, Day + 20.0, shot, shot + 1.0, 0.0, 7.0},
          Numbers{0.001, 2.0, 25.0, 0.0, Day, 0.0, 7.0}, Numbers{std::numeric_limits<double>::quiet_NaN()},
          Numbers{0.001, std::numeric_limits<double>::infinity()}}) {
        SCOPED_TRACE(testing::PrintToString(numbers));
        previewAll();
        writeNumbers(host.context(), *other, AttributeKey::Preview, numbers);

        adapter().setPreviewActive(false);

        Texts after = contents();
        // Copies on this track may stay.
        std::erase_if(after, [&](const std::string& text) { return text.find(" 864") != std::string::npos; });
        after.resize(std::min(after.size(), before.size()));
        EXPECT_EQ(after, before);
        while (contents() != before)
            ASSERT_TRUE(host.undo());
    }
}

TEST_P(HostPreviewStretchTest, LeavesCopiesOfAMediumThatWasRelinkedUnlessItIsTakenBack)
{
    auto& medium = host.addMedia(u"/sound/take 1.wav", 60.0);
    auto& moved = host.addMedia(u"/other disk/take 1.wav", 60.0);
    const auto link = [&](standin::MediaClip& clip) {
        for (const Node& event : standin::tests::childrenOf(*track)) {
            if (event->getName() == std::u16string(u"one"))
                dynamic_cast<standin::ClipEvent&>(*event).setClip(Counted<standin::MediaClip>::share(&clip));
        }
    };
    link(medium);
    previewAll();
    link(moved);

    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "one 86410-86420"}));

    ASSERT_TRUE(host.undo());
    link(medium);
    EXPECT_EQ(adapter().endPreview(), Result::Ok);
    EXPECT_EQ(host.contentOf(track), film);
}

// The preview of another project from which a track was imported.

TEST_P(HostPreviewStretchTest, LetsMemosFollowWhateverATrackAboveTheirsKeepsOfAnotherPreview)
{
    addMemos({{u"click", 6.0}});
    previewAll();
    host.edit(u"Import", [&] { writeNumbers(host.context(), *track, AttributeKey::Preview, {5000.0}); });

    moveTo(standin::tests::childrenOf(*memos).back(), 11.0);

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "click 86411-86411"}));
}

TEST_P(HostPreviewStretchTest, TakesCopiesAwayThatMemosHaveFollowedWhateverATrackAboveTheirsKeepsOfAnotherPreview)
{
    addMemos({{u"click", 6.0}});
    previewAll();
    moveTo(standin::tests::childrenOf(*memos).back(), 11.0);
    host.edit(u"Import",
              [&] { writeNumbers(host.context(), *track, AttributeKey::Preview, {host.inHost(0.0) + 0.5}); });

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), Texts{"click 1-1"});
}

TEST_P(HostPreviewStretchTest, LeavesTheAutomationOfTheFilmWhereATrackKeepsARecordOfAnotherPreviewThere)
{
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    const Node other = host.addTrack(TypeWord::Audio, u"FX");
    host.addPoint(other, volume, host.inHost(3.0), 0.25F);
    host.addPoint(other, volume, host.inHost(15.0), 0.75F);
    previewAll();
    const double start = host.inHost(12.0);
    host.edit(u"Import", [&] { writeNumbers(host.context(), *track, AttributeKey::Preview, {start, start + 1.0}); });

    adapter().setPreviewActive(false);

    std::vector<double> points;
    for (const Node& point : standin::tests::childrenOf(*host.curveOf(other, volume)))
        points.push_back(point->getStart(nullptr));
    EXPECT_EQ(points, (std::vector<double>{host.inHost(3.0), host.inHost(15.0)}));
}

TEST_P(HostPreviewStretchTest, BendsNoCurveWhereAnotherTrackKeepsAnEarlierRecordOfAnotherPreview)
{
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    const Node other = host.addTrack(TypeWord::Audio, u"FX");
    host.addPoint(other, volume, host.inHost(3.0), 0.25F);
    host.addPoint(other, volume, host.inHost(15.0), 0.75F);
    host.addPoint(other, volume, host.inHost(6000.0), 0.5F);
    const auto points = [&] {
        Texts found;
        for (const Node& point : standin::tests::childrenOf(*host.curveOf(other, volume))) {
            const double time = point->getStart(nullptr) - host.inHost(0.0);
            if (time < StartOfDay)
                found.push_back(std::to_string(time) + " " +
                                std::to_string(query<IAutomationPoint>(point)->getValue()));
        }
        return found;
    };
    const Texts before = points();
    ASSERT_EQ(before.size(), 3U);
    for (const double recordStart : {12.0, 5000.0}) {
        SCOPED_TRACE(recordStart);
        previewAll();
        // After the copies the user lets the curve go on at another value.
        const Node last = standin::tests::childrenOf(*host.curveOf(other, volume)).back();
        host.edit(u"Automation", [&] { requireOk(query<IAutomationPoint>(last)->setValue(0.125F)); });
        host.addPoint(other, volume, Day + host.inHost(100.0), 0.125F);
        const Node imported = host.addTrack(TypeWord::Audio, u"Imported");
        const double start = host.inHost(recordStart);
        host.edit(u"Import", [&] {
            writeNumbers(host.context(), *imported, AttributeKey::Preview, {start, start + 1.0});
        });

        adapter().setPreviewActive(false);

        EXPECT_EQ(points(), before);
        EXPECT_EQ(host.contentOf(track), film);
    }
}

// Memos.

TEST_P(HostPreviewStretchTest, LeavesAMemoThatTheUserHasWrittenWhereTheNewCutHasNothing)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    host.addPointMarker(memos, u"needs sound", Day + host.inHost(4.0));
    host.addPointMarker(memos, u"too loud", Day + host.inHost(12.0));
    host.idle();

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), (Texts{"too loud 2-2", "click 6-6", "needs sound 86404-86404"}));
}

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasTakenToWhereTheNewCutHasNothing)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    const auto move = [&](std::size_t index, double time) {
        const Node copy = standin::tests::childrenOf(*memos)[index];
        host.edit(u"Move", [&] { copy->setStart(nullptr, 0, Day + host.inHost(time)); });
        return copy;
    };
    ASSERT_EQ(host.contentOf(memos), (Texts{"click 6-6", "pop 7-7", "click 86416-86416", "pop 86417-86417"}));
    rename(move(3, 5.0), u"pop is too loud");
    move(3, 4.0); // the other one has taken its place
    // One that was pasted.
    FVariant id;
    requireOk(standin::tests::childrenOf(*memos)[0]->getAttribute(AttributeKey::EventUserId, id));
    const Node pasted = host.addPointMarker(memos, u"pasted", Day + host.inHost(3.0));
    requireOk(pasted->setAttribute(AttributeKey::EventUserId, id, true));
    const Texts all{"click 6-6", "pop 7-7", "pasted 86403-86403", "click 86404-86404", "pop is too loud 86405-86405"};
    ASSERT_EQ(host.contentOf(memos), all);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), all);
}

TEST_P(HostPreviewStretchTest, LetsMemosFollowByTheFrameRateUnderWhichItWasWritten)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    // 01:00:00:00 is 3603.6 s at this rate.
    host.project.setFrameRate({24000.0 / 1001.0, FrameRateInfo::Flag::PulledDown});
    host.idle();
    for (const bool isReopened : {false, true}) {
        SCOPED_TRACE(isReopened);
        if (isReopened)
            reopen();
        const Node click = standin::tests::childrenOf(*memos)[1];

        host.edit(u"Move", [&] { click->setStart(nullptr, 0, Day + host.inHost(17.0)); });
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 7-7", "click 86417-86417"}));
        host.edit(u"Move", [&] { click->setStart(nullptr, 0, Day + host.inHost(11.0)); });
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "click 86411-86411"}));
    }

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), Texts{"click 1-1"});
}

TEST_P(HostPreviewStretchTest, TakesCopiesAwayWhoseMemosHaveFollowedThemAndWereRenamedSince)
{
    const std::vector<std::pair<const char*, std::function<void()>>> ends{
        {"ended", [&] { adapter().setPreviewActive(false); }},
        {"emptied", [&] { EXPECT_EQ(adapter().endPreview(), Result::Ok); }},
        {"replaced", [&] { host.preview(secondChange()); }},
        {"carried over",
         [&] {
             host.conform();
             ASSERT_TRUE(host.undo());
             host.idle();
             adapter().setPreviewActive(false);
         }},
        {"saved",
         [&] {
             reopen();
             adapter().setPreviewActive(false);
         }},
        {"refused at first", [&] {
             const auto edits = makeCounted<AlteredEdits>(host.context());
             edits->deletes = false;
             host.altered.replace(IEditService::iid, edits);
             EXPECT_EQ(adapter().endPreview(), Result::HostCallFailed);
             host.altered.unhide(IEditService::iid);
             EXPECT_EQ(adapter().endPreview(), Result::Ok);
         }}};
    addMemos({{u"click", 6.0}});
    const Node hiss = host.addRangeMarker(memos, u"hiss", host.inHost(2.0), host.inHost(4.0));
    for (const auto& [how, end] : ends) {
        SCOPED_TRACE(how);
        adapter().setPreviewActive(true);
        host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
        host.idle();
        const std::vector<Node> all = standin::tests::childrenOf(*memos);
        ASSERT_EQ(host.contentOf(memos), (Texts{"hiss 2-4", "click 6-6", "hiss 86412-86414", "click 86416-86416"}));
        host.edit(u"Trim", [&] { all[2]->setEnd(nullptr, 0, Day + host.inHost(13.0)); });
        host.edit(u"Move", [&] { all[3]->setStart(nullptr, 0, Day + host.inHost(17.0)); });
        rename(all[0], u"hum");
        rename(all[1], u"tick");
        ASSERT_EQ(host.contentOf(memos), (Texts{"hum 2-3", "tick 7-7", "hiss 86412-86413", "click 86417-86417"}));

        end();

        EXPECT_EQ(host.contentOf(memos), (Texts{"hum 2-3", "tick 7-7"}));
        adapter().setPreviewActive(false);
        while (host.contentOf(memos) != Texts{"hiss 2-4", "click 6-6"})
            ASSERT_TRUE(host.undo());
    }
}

TEST_P(HostPreviewStretchTest, LeavesACopyThatIsMovedWhenNothingFollowsItAnyMoreAsItsEndHasFailed)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);
    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(false); }), Result::HostCallFailed);
    host.altered.unhide(IEditService::iid);
    host.idle();
    const Node click = standin::tests::childrenOf(*memos)[1];
    host.edit(u"Move", [&] { click->setStart(nullptr, 0, Day + host.inHost(17.0)); });
    ASSERT_EQ(host.contentOf(memos), (Texts{"click 6-6", "click 86417-86417"}));

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 6-6", "click 86417-86417"}));
}

// What is edited where nobody follows.

TEST_P(HostPreviewStretchTest, LeavesWhatTheUserHasMadeOfCopiesWhileTheSystemWasNotThere)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}, {u"hiss", 8.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    reopen([&] {
        const std::vector<Node> all = standin::tests::childrenOf(*memos);
        moveTo(all[3], 11.0);
        rename(all[4], u"pop is too loud");
        FVariant id;
        requireOk(all[2]->getAttribute(AttributeKey::EventUserId, id));
        const Node pasted = host.addPointMarker(memos, u"pasted", Day + host.inHost(12.0));
        requireOk(pasted->setAttribute(AttributeKey::EventUserId, id, true));
    });

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 6-6", "pop 7-7", "hiss 8-8", "click 86411-86411",
                                            "pasted 86412-86412", "pop is too loud 86417-86417"}));
}

TEST_P(HostPreviewStretchTest, FollowsWhatTheUserHasMadeOfCopiesMeanwhileOnceAnotherMemoIsEdited)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}, {u"hiss", 8.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    moveTo(standin::tests::childrenOf(*memos)[5], 19.0);
    ASSERT_EQ(host.contentOf(memos)[2], "hiss 9-9");
    moveTo(standin::tests::childrenOf(*memos)[2], 8.5 - Day);
    reopen([&] { moveTo(standin::tests::childrenOf(*memos)[3], 11.0); });

    rename(standin::tests::childrenOf(*memos)[4], u"pop is too loud");

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "pop is too loud 7-7", "hiss 8.5-8.5", "click 86411-86411",
                                            "pop is too loud 86417-86417", "hiss 86419-86419"}))
        << "The last one was followed before, and its memo edited since.";

    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "pop is too loud 7-7", "hiss 8.5-8.5"}));
}

TEST_P(HostPreviewStretchTest, AMemoKeepsTheNameThatItIsGivenWhereItsCopyWasOnlyMovedMeanwhile)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    reopen([&] { moveTo(standin::tests::childrenOf(*memos)[1], 11.0); });

    rename(standin::tests::childrenOf(*memos)[0], u"tick");

    EXPECT_EQ(host.contentOf(memos), (Texts{"tick 1-1", "click 86411-86411"}));
    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(memos), Texts{"tick 1-1"});
}

TEST_P(HostPreviewStretchTest, AMemoStaysWhereItIsTakenWhereItsCopyWasOnlyRenamedMeanwhile)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    reopen([&] { rename(standin::tests::childrenOf(*memos)[1], u"tick"); });

    moveTo(standin::tests::childrenOf(*memos)[0], 8.0 - Day);

    EXPECT_EQ(host.contentOf(memos), (Texts{"tick 8-8", "tick 86416-86416"}));
    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(memos), Texts{"tick 8-8"});
}

TEST_P(HostPreviewStretchTest, WhatIsDoneToAMemoCountsMoreThanWhatWasDoneToItsCopyMeanwhile)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    reopen([&] {
        const std::vector<Node> all = standin::tests::childrenOf(*memos);
        rename(all[2], u"knock");
        moveTo(all[3], 19.0);
    });
    const std::vector<Node> all = standin::tests::childrenOf(*memos);

    host.edit(u"Edit", [&] {
        requireOk(all[0]->setName(nullptr, standin::tests::text(u"tick").get(), 0));
        requireOk(all[1]->setStart(nullptr, 0, host.inHost(8.0)));
    });

    EXPECT_EQ(host.contentOf(memos), (Texts{"tick 6-6", "pop 8-8", "knock 86416-86416", "pop 86419-86419"}));
    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(memos), (Texts{"tick 6-6", "pop 8-8"}));
}

TEST_P(HostPreviewStretchTest, FollowsACopyThatWasTakenBackMeanwhileToWhereItWasWritten)
{
    for (const bool isFollowed : {true, false}) {
        SCOPED_TRACE(isFollowed);
        addMemos({{u"click", 6.0}, {u"pop", 7.0}});
        adapter().setPreviewActive(true);
        host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
        host.idle();
        moveTo(standin::tests::childrenOf(*memos)[2], 11.0);
        ASSERT_EQ(host.contentOf(memos), (Texts{"click 1-1", "pop 7-7", "click 86411-86411", "pop 86417-86417"}));
        reopen([&] { moveTo(standin::tests::childrenOf(*memos)[2], 16.0); });

        if (isFollowed)
            rename(standin::tests::childrenOf(*memos)[3], u"bang");
        adapter().setPreviewActive(false);

        EXPECT_EQ(host.contentOf(memos),
                  isFollowed ? (Texts{"click 6-6", "bang 7-7"}) : (Texts{"click 1-1", "pop 7-7", "click 86416-86416"}));
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), memos.get())); });
    }
}

TEST_P(HostPreviewStretchTest, FollowsACopyThatWasGivenBackItsNameMeanwhile)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    rename(standin::tests::childrenOf(*memos)[2], u"tick");
    ASSERT_EQ(host.contentOf(memos)[0], "tick 6-6");
    reopen([&] { rename(standin::tests::childrenOf(*memos)[2], u"click"); });

    moveTo(standin::tests::childrenOf(*memos)[3], 18.0);
    EXPECT_EQ(host.contentOf(memos), (Texts{"click 6-6", "pop 8-8", "click 86416-86416", "pop 86418-86418"}));
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 6-6", "pop 8-8"}));
}

TEST_P(HostPreviewStretchTest, LeavesTheMemoOfACopyThatWasRemovedWhileTheSystemWasNotThere)
{
    addMemos({{u"click", 6.0}, {u"pop", 7.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    reopen([&] {
        const Node click = standin::tests::childrenOf(*memos)[2];
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), click.get())); });
    });

    rename(standin::tests::childrenOf(*memos)[2], u"pop is too loud");

    EXPECT_EQ(host.contentOf(memos), (Texts{"click 6-6", "pop is too loud 7-7", "pop is too loud 86417-86417"}));
}

TEST_P(HostPreviewStretchTest, FollowsNothingOfAMemoWhoseTrackWasAwayForAWhile)
{
    addMemos({{u"click", 6.0}});
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 s to 10 s, shown from 10 s on
    host.idle();
    host.addPointMarker(memos, u"written meanwhile", host.inHost(3.0));
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), memos.get())); });
    ASSERT_TRUE(host.undo());

    rename(standin::tests::childrenOf(*memos)[2], u"tick");

    EXPECT_EQ(host.contentOf(memos), (Texts{"written meanwhile 3-3", "tick 6-6", "tick 86416-86416"}));
}

TEST_P(HostPreviewStretchTest, TakesCopiesAwayThatWereFollowedPastTheMaterialAndOverItsEnd)
{
    addMemos({{u"click", 6.0}});
    const Node hiss = host.addRangeMarker(memos, u"hiss", host.inHost(2.0), host.inHost(4.0));
    changes().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:10:00", "01:00:15:00");
    host.carryOver("01:00:30:00", "01:00:40:00", "01:00:20:00", "01:00:30:00");
    previewAll();
    host.addPointMarker(memos, u"needs sound", Day + host.inHost(24.0));
    const Node copy = standin::tests::childrenOf(*memos)[3];
    host.edit(u"Trim", [&] { requireOk(copy->setEnd(nullptr, 0, Day + host.inHost(17.0))); });
    const Texts expected{"hiss 2-5", "click 6-6", "needs sound 34-34"};
    Texts all = expected;
    all.insert(all.end(), {"hiss 86412-86417", "needs sound 86424-86424"});
    ASSERT_EQ(host.contentOf(memos), all);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), expected);
}

TEST_P(HostPreviewStretchTest, LetsMemosFollowEventsWhoseTimecodesAreFramesUnderThatRateAlone)
{
    addMemos({{u"click", 6.0}});
    changes().clear();
    host.carryOver("01:00:00:00", "01:00:09:24", "01:00:10:00", "01:00:19:24");
    previewAll();
    host.project.setFrameRate({24.0, 0});
    host.idle();
    for (const bool isReopened : {false, true}) {
        SCOPED_TRACE(isReopened);
        if (isReopened)
            reopen();
        const Node click = standin::tests::childrenOf(*memos)[1];

        moveTo(click, 17.0);
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 7-7", "click 86417-86417"}));
        moveTo(click, 11.0);
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "click 86411-86411"}));
    }
}

TEST_P(HostPreviewStretchTest, LetsMemosFollowBesideAnEventWhoseTimecodesAreNoFramesUnderThatRate)
{
    addMemos({{u"click", 6.0}});
    host.project.setFrameRate({24.0, 0});
    host.idle();
    changes().clear();
    host.carryOver("01:00:00:00", "01:00:09:00", "01:00:10:00", "01:00:19:00");
    host.carryOver("01:00:20:00", "01:00:29:24", "01:00:30:00", "01:00:39:24");
    previewAll();
    host.project.setFrameRate({25.0, 0});
    host.idle();
    for (const bool isReopened : {false, true}) {
        SCOPED_TRACE(isReopened);
        if (isReopened)
            reopen();
        const Node click = standin::tests::childrenOf(*memos)[1];

        moveTo(click, 17.0);
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 7-7", "click 86417-86417"}));
        moveTo(click, 11.0);
        EXPECT_EQ(host.contentOf(memos), (Texts{"click 1-1", "click 86411-86411"}));
    }
}

// The begin of the clock.

class HostPreviewAtTheBeginOfTheClock : public AtEachOrigin {};

INSTANTIATE_TEST_SUITE_P(Origins, HostPreviewAtTheBeginOfTheClock, testing::Values(0.0, 3600.0));

TEST_P(HostPreviewAtTheBeginOfTheClock, TakesAlongWhatThereIsRoomForOfAClipThatHangsOver)
{
    using Spans = std::vector<Span>;
    struct Case {
        const char* dstIn;
        const char* dstOut;
        Span written;
        double sourceOffset;
    };
    // Of the clip, four frames stand before the source.
    for (const Case& at :
         {Case{":00:00:00", ":00:04:21", {0.0, 4.84}, 0.16}, Case{":00:00:03", ":00:04:24", {0.0, 4.96}, 0.04},
          Case{":00:00:04", ":00:05:00", {0.0, 5.0}, 0.0}, Case{":00:00:05", ":00:05:01", {0.04, 5.04}, 0.0}}) {
        SCOPED_TRACE(at.dstIn);
        const auto clock = [](const char* time) { return (GetParam() == 0.0 ? "00" : "01") + std::string(time); };
        AdaptedHost host(GetParam());
        const Node track = host.addTrack(TypeWord::Audio, u"DX");
        host.addClip(track, u"one", 10.0, 20.0);
        host.switchMarkersOff();
        host.settings().setIncludeOverhangingAudioEvents(true);
        host.carryOver(clock(":00:10:04").c_str(), clock(":00:15:00").c_str(), clock(at.dstIn).c_str(),
                       clock(at.dstOut).c_str());
        const auto expectSpans = [&](const Spans& expected) {
            const auto events = standin::tests::childrenOf(*track);
            ASSERT_EQ(events.size(), expected.size());
            for (std::size_t index = 0; index < events.size(); ++index) {
                EXPECT_NEAR(events[index]->getStart(nullptr), expected[index].first, 1e-6);
                EXPECT_NEAR(events[index]->getEnd(nullptr), expected[index].second, 1e-6);
            }
        };

        host.adapter().setPreviewActive(true);
        host.preview(host.model().changeEdl());
        expectSpans({{10.0, 20.0}, {Day + at.written.first, Day + at.written.second}});
        EXPECT_NEAR(standin::tests::childrenOf(*track)[1]->getSourceOffset(nullptr), at.sourceOffset, 1e-6);

        host.adapter().setPreviewActive(false);
        expectSpans({{10.0, 20.0}});

        host.conform();
        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
        expectSpans({at.written});
        EXPECT_NEAR(standin::tests::childrenOf(*track)[0]->getSourceOffset(nullptr), at.sourceOffset, 1e-6);
    }
}

TEST_P(HostPreviewAtTheBeginOfTheClock, WritesNothingBeforeTheBeginOfTheHostsTimeline)
{
    // Where the clock begins later than at 0, an event can lie before it.
    AdaptedHost host(3600.0);
    const Node track = host.addTrack(TypeWord::Audio, u"DX");
    host.addClip(track, u"one", 10.0, 20.0);
    host.switchMarkersOff();
    host.settings().setCreateDestinationMarkers(GetParam() == 0.0);
    host.carryOver("01:00:10:00", "01:00:20:00", "00:59:56:00", "01:00:06:00");
    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());
    EXPECT_EQ(host.undoNames().back(), u"Preview");
    EXPECT_EQ(host.contentOf(track), (Texts{"one 10-20", "one 86400-86406"}));
    host.adapter().setPreviewActive(false);

    host.conform();

    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    EXPECT_EQ(host.contentOf(track), Texts{"one 0-6"});
    EXPECT_EQ(standin::tests::childrenOf(*track)[0]->getSourceOffset(nullptr), 4.0);
}

// Four frames of a clip that hangs over would stand before 00:00:00:00. The last seconds of the day before the preview stretch
// are the user's.
TEST_P(HostPreviewAtTheBeginOfTheClock, WritesNothingBeforeTheDayWhereTheProjectBeginsEarlier)
{
    constexpr double Origin = -10.0;
    AdaptedHost host(Origin);
    const Node track = host.addTrack(TypeWord::Audio, u"DX");
    const auto addSound = [&](const char16_t* name, double start, double end) {
        host.addClip(track, name, start - Origin, end - Origin);
    };
    const auto inFrames = [](double hostSeconds) { return std::round((hostSeconds + Origin) * 25.0) / 25.0; };
    const auto content = [&] {
        std::vector<Span> spans;
        for (const Node& child : standin::tests::childrenOf(*track))
            spans.emplace_back(inFrames(child->getStart(nullptr)), inFrames(child->getEnd(nullptr)));
        return spans;
    };
    using Spans = std::vector<Span>;
    addSound(u"leader", -8.0, -3.0);
    addSound(u"one", 90.0, 105.0);
    addSound(u"late", Day - 4.0, Day - 0.04);
    const Spans film = content();
    const bool isRestricted = GetParam() == 0.0;
    host.switchMarkersOff();
    host.settings().setIncludeOverhangingAudioEvents(true);
    host.settings().setRestrictRange(isRestricted);
    host.settings().setPreserveMaterial(Origin, 300.0);
    host.carryOver("00:01:30:04", "00:01:45:00", "00:00:00:00", "00:00:14:21");

    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());
    EXPECT_EQ(content(), (Spans{{-8.0, -3.0}, {90.0, 105.0}, {Day - 4.0, Day - 0.04}, {Day, Day + 14.84}}));
    host.adapter().setPreviewActive(false);
    EXPECT_EQ(content(), film);
    EXPECT_EQ(host.alerts->messages.size(), 1U) << "The four frames are left out.";

    host.conform();
    Spans conformed{{-8.0, -3.0}, {0.0, 14.84}};
    if (isRestricted)
        conformed.emplace_back(Day - 4.0, Day - 0.04);
    EXPECT_EQ(content(), conformed);
    EXPECT_EQ(host.alerts->messages.size(), 2U);
}

// Locks.

TEST_P(HostPreviewStretchTest, LocksItsTracksAgainWhenItsEmptyingIsUndone)
{
    previewAll();
    ASSERT_EQ(adapter().endPreview(), Result::Ok);
    ASSERT_FALSE(isLocked(track));

    ASSERT_TRUE(host.undo());
    EXPECT_TRUE(isLocked(track));
    ASSERT_TRUE(host.redo());
    EXPECT_FALSE(isLocked(track));
}

TEST_P(HostPreviewStretchTest, LocksItsTracksAgainWhenARunIsUndoneInAHostThatKeepsNoLocks)
{
    for (const bool isRun : {true, false}) {
        SCOPED_TRACE(isRun);
        previewAll();
        if (isRun)
            host.conform();
        else
            ASSERT_EQ(adapter().endPreview(), Result::Ok);
        ASSERT_FALSE(isLocked(track));
        // Before it tells of the undo.
        Texts calls;
        const auto dependent = makeCounted<standin::tests::Recorder>(calls);
        const auto dependencies = service<IDependencyManager>(host.context());
        ASSERT_TRUE(host.undo());
        query<ITrackNode>(track)->setFlag(TrackFlag::Lock, false);
        track->setAttribute(AttributeKey::LockState, FVariant::integer(0), true);
        adapter().getProjectModel()->notifyPreviewState();
        host.adapter().notify(core::DataModelChangeContext(adapter().getProjectModel()));
        ASSERT_EQ(adapter().update(host.document(), 0), ResultOk);

        EXPECT_TRUE(isLocked(track));
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostPreviewStretchTest, LocksTheTracksOfItsTimeWhenItIsRedone)
{
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);
    auto& shown = dynamic_cast<standin::Track&>(*track);
    shown.setSelected(true);
    const Node music = host.addTrack(TypeWord::Audio, u"Music");
    auto& other = dynamic_cast<standin::Track&>(*music);
    previewAll();
    ASSERT_TRUE(isLocked(track));
    ASSERT_FALSE(isLocked(music));
    ASSERT_TRUE(host.undo());
    shown.setSelected(false);
    other.setSelected(true);

    ASSERT_TRUE(host.redo());

    EXPECT_TRUE(isLocked(track));
    EXPECT_FALSE(isLocked(music));
}

TEST_P(HostPreviewStretchTest, LocksATrackToThatItShowsWithNothingOnIt)
{
    const Node empty = host.addTrack(TypeWord::Audio, u"Spare");
    previewAll();
    ASSERT_TRUE(isLocked(empty));
    ASSERT_TRUE(host.undo());
    ASSERT_FALSE(isLocked(empty));

    ASSERT_TRUE(host.redo());

    EXPECT_TRUE(isLocked(empty));
}

TEST_P(HostPreviewStretchTest, LocksItsTracksWhenTheProjectWasSavedWhereTheOldPlaceWasLookedAt)
{
    previewAll();
    ASSERT_EQ(adapter().cycleToEvents(changes(), 0, 0, 0), Result::Ok);
    ASSERT_FALSE(isLocked(track));
    reopen();

    ASSERT_EQ(adapter().cycleToEvents(changes(), 0, 0, 1), Result::Ok);

    EXPECT_TRUE(isLocked(track));
}

// The end of the project.

TEST_P(HostPreviewStretchTest, GivesTheProjectItsOwnEndBack)
{
    for (const double end : {0.0, host.inHost(20.0), host.inHost(50.0), host.inHost(Day + 5.0)}) {
        SCOPED_TRACE(end);
        requireOk(host.document()->setProjectEnd(end));
        previewAll();
        ASSERT_GT(host.project.getEnd(nullptr), Day);

        adapter().setPreviewActive(false);

        EXPECT_EQ(host.project.setEndTime(), end == host.inHost(20.0) ? 0.0 : end)
            << "What the material reaches can't be told from no end.";
    }
}

TEST_P(HostPreviewStretchTest, GivesTheProjectItsOwnEndBackWhereSomethingWasLeft)
{
    failInAPreview();
    host.model().setPreviewActive(false);
    reopen();

    previewAll();
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), film);
    EXPECT_EQ(host.project.getEnd(nullptr), host.inHost(20.0));
}

TEST_P(HostPreviewStretchTest, LeavesAnEndThatTheUserSetsMeanwhile)
{
    for (const double end : {host.inHost(70.0), host.inHost(Day + 1000.0), host.inHost(5.0 * Day)}) {
        SCOPED_TRACE(end);
        requireOk(host.document()->setProjectEnd(0.0));
        previewAll();
        requireOk(host.document()->setProjectEnd(end));
        host.preview(secondChange());

        adapter().setPreviewActive(false);

        EXPECT_EQ(host.project.getEnd(nullptr), end);
    }
}

TEST_P(HostPreviewStretchTest, LeavesAnEndThatTheUserHasSetSinceItsEndWasUndoneAndRedone)
{
    previewAll();
    adapter().setPreviewActive(false);
    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(host.undo());
    const double end = host.inHost(90.0);
    requireOk(host.document()->setProjectEnd(end));

    ASSERT_TRUE(host.redo());
    ASSERT_TRUE(host.redo());
    EXPECT_EQ(host.project.getEnd(nullptr), end);

    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

} // namespace cadrel::host::tests
