// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PreviewRecord.h"
#include "host/project/Project.h"

#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "host/border/HostFailure.h"
#include "host/track/CutEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Track.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/NoMarkers.h"
#include "tests/support/core/RecordingProgress.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/String.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <initializer_list>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::core::MarkerEntry;
using cadrel::core::MarkerKind;
using cadrel::tests::expectNotQuadratic;
using cadrel::tests::makeEvent;
using cadrel::tests::RecordingProgress;
using cadrel::tests::secondsOf;
using cadrel::tests::switchMarkersOff;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using standin::tests::childrenOf;

namespace cadrel::host {

using tests::AlteredContext;
using tests::TrackHost;

namespace {

constexpr double Day = 86400.0;

using Content = std::vector<std::string>;

/// The calls of the host's IEditService, in seconds of the host.
class EditRecorder : public Implements<EditRecorder, FObject, IEditService> {
public:
    static constexpr const char* ClassName = "EditRecorder";

    struct Call {
        int32 tracks;
        double start;
        double end;
        double destination;
    };

    int32 copyRange(IProjectDocument*, IObjectList* tracks, int32, double start, double end,
                    double destination) override
    {
        copies.push_back({tracks->count(), start, end, destination});
        return result;
    }
    int32 closeRange(IProjectDocument*, IObjectList* tracks, double start, double end, double) override
    {
        closed.push_back({tracks->count(), start, end, 0.0});
        return result;
    }

    int32 result = ResultOk;
    std::vector<Call> copies;
    std::vector<Call> closed;
};

/// The film begins at 01:00:00:00, where the clock of the project begins itself or an hour later. The tests give seconds of
/// the film.
class ProjectEditsTest : public testing::TestWithParam<double> {
protected:
    void SetUp() override { host.adapter.computePreviewOffset(); }

    /// In the host's seconds.
    double film(double seconds) const { return 3600.0 + seconds - host.origin; }
    core::Settings& settings() { return host.adapter.model().settings(); }

    TrackHost::Node addTrack(const char16_t* name) { return host.addTrack(TypeWord::Audio, name); }
    TrackHost::Node addClip(const TrackHost::Node& track, const char16_t* name, double start, double end)
    {
        return host.addClip(track, name, film(start), film(end));
    }
    static void select(const TrackHost::Node& track) { dynamic_cast<standin::Track&>(*track).setSelected(true); }
    static void lock(const TrackHost::Node& track)
    {
        requireOk(query<ITrackNode>(track)->setFlag(TrackFlag::Lock, true));
    }

    /// What an edit of the adapter throws.
    Result::Type edit(const std::function<void(Project&, IEditTransaction&)>& edits)
    {
        Result::Type thrown = Result::Ok;
        host.edit(u"Edit", [&] { thrown = thrownBy([&] { edits(host.adapter, *host.transaction()); }); });
        return thrown;
    }
    Result::Type createMarkerTracks()
    {
        return edit([](Project& project, IEditTransaction& transaction) { project.createMarkerTracks(transaction); });
    }
    Result::Type process(core::Cut& cut)
    {
        return edit([&](Project& project, IEditTransaction& transaction) { project.processCut(transaction, cut); });
    }
    Result::Type generate(const std::vector<MarkerEntry>& entries)
    {
        return edit(
            [&](Project& project, IEditTransaction& transaction) { project.generateMarkers(transaction, entries); });
    }
    Result::Type complete()
    {
        return edit([](Project& project, IEditTransaction& transaction) { project.completeApply(transaction); });
    }

    /// What stands in the preview now is the system's, and what will be there.
    void keepAsWritten()
    {
        for (const Track& written : host.adapter.cadrelTracks())
            PreviewRecord::ofContent(written, Day - host.origin, core::Framerate(25, 0))
                .keepOn(host.context(), written);
        host.adapter.startWriting();
    }

    /// The track of that name in the folder of the marker tracks.
    TrackHost::Node markerTrack(const char16_t* name)
    {
        for (const Track& track : host.adapter.tracksOfType(TypeWord::Marker)) {
            if (track.getName() == std::wstring(name, name + std::char_traits<char16_t>::length(name)))
                return query<IProjectNode>(track.node());
        }
        return nullptr;
    }
    /// The events of a track as "name start-end", in seconds of the film or, where they stand in the preview, as "preview: "
    /// and seconds of its copy of the film. To the thousandth, without zeros behind the point.
    Content contentOf(const TrackHost::Node& track) const
    {
        Content content;
        for (const TrackHost::Node& child : childrenOf(*track)) {
            const bool isInPreview = child->getStart(nullptr) + host.origin >= Day;
            const double shift = 3600.0 - host.origin + (isInPreview ? Day : 0.0);
            const auto seconds = [shift](double time) {
                std::ostringstream text;
                text << std::round((time - shift) * 1000.0) / 1000.0 + 0.0;
                return text.str();
            };
            content.push_back((isInPreview ? "preview: " : "") + std::string(ConstString(child->getName()).text8()) +
                              " " + seconds(child->getStart(nullptr)) + "-" + seconds(child->getEnd(nullptr)));
        }
        return content;
    }
    static std::string textOf(const TrackHost::Node& node, const char* key)
    {
        FVariant value;
        return node->getAttribute(key, value) == ResultOk && value.isString() ? value.asString() : "(none)";
    }

    cadrel::tests::TestProject timecodes;
    TrackHost host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, ProjectEditsTest, testing::Values(0.0, 3600.0));

std::shared_ptr<core::EventBase> change(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
{
    return makeEvent("A012", srcIn, srcOut, dstIn, dstOut, 7);
}

/// Ten seconds of the film, from 10 to 20 s, go to 30 s.
std::shared_ptr<core::EventBase> tenSeconds()
{
    return change("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:40:00");
}

std::vector<std::wstring> tracksOf(const core::Cut& cut)
{
    std::vector<std::wstring> names;
    for (const auto& cutEvent : cut.cutEvents())
        names.push_back(cutEvent->getTrackName());
    return names;
}

} // namespace

TEST_P(ProjectEditsTest, ACutHasAnEventForEachTrackAtTheTimesOfTheChangeEvent)
{
    addTrack(u"FX");
    host.addTrack(TypeWord::Folder, u"Folder");
    host.addTrack(TypeWord::Ruler, u"Ruler");
    host.addTrack(TypeWord::Marker, u"Cues");
    const auto event = change("01:00:10:05", "01:00:20:10", "01:00:30:15", "01:00:40:20");

    const auto cut = host.adapter.makeCut(event);

    EXPECT_EQ(cut->event(), event);
    ASSERT_EQ(tracksOf(*cut), (std::vector<std::wstring>{L"FX", L"Cues"}));
    for (const auto& cutEvent : cut->cutEvents()) {
        EXPECT_EQ(cutEvent->srcIn(), 3610.2);
        EXPECT_EQ(cutEvent->srcOut(), 3620.4);
        EXPECT_EQ(cutEvent->dstIn(), 3630.6);
        EXPECT_EQ(cutEvent->dstOut(), 3640.8);
    }
    EXPECT_TRUE(cut->cutEvents()[0]->isAudio());
    EXPECT_FALSE(cut->cutEvents()[1]->isAudio());
}

TEST_P(ProjectEditsTest, ACutHasItsTimesFromDropFrameTimecodes)
{
    host.project.setFrameRate({29.97, FrameRateInfo::Flag::DropFrame | FrameRateInfo::Flag::PulledDown});
    host.adapter.onProjectChanged();
    timecodes.framerate = host.adapter.getFramerate();
    addTrack(u"FX");

    // An hour has 107892 frames, and the numbers ;00 and ;01 of each minute but every tenth are dropped.
    const auto cut = host.adapter.makeCut(change("01:00:59:29", "01:01:00:02", "01:10:00:00", "01:10:00:01"));

    ASSERT_EQ(cut->cutEvents().size(), 1U);
    EXPECT_DOUBLE_EQ(cut->cutEvents()[0]->srcIn(), (107892 + 1799) / 29.97);
    EXPECT_DOUBLE_EQ(cut->cutEvents()[0]->srcOut(), (107892 + 1800) / 29.97);
    EXPECT_DOUBLE_EQ(cut->cutEvents()[0]->dstIn(), (107892 + 17982) / 29.97);
    EXPECT_DOUBLE_EQ(cut->cutEvents()[0]->dstOut(), (107892 + 17983) / 29.97);
}

TEST_P(ProjectEditsTest, ACutLeavesOutLockedTracks)
{
    addTrack(u"FX");
    lock(addTrack(u"Music"));

    EXPECT_EQ(tracksOf(*host.adapter.makeCut(tenSeconds())), std::vector<std::wstring>{L"FX"});
}

TEST_P(ProjectEditsTest, ACutOfSelectedTracksTakesTheMemosAlong)
{
    addTrack(u"FX");
    select(addTrack(u"Music"));
    createMarkerTracks();
    settings().setApplyTo(core::ApplyTo::SelectedTracks);

    EXPECT_EQ(tracksOf(*host.adapter.makeCut(tenSeconds())), (std::vector<std::wstring>{L"Music", L"Memos"}));

    lock(markerTrack(u"Memos"));
    EXPECT_EQ(tracksOf(*host.adapter.makeCut(tenSeconds())), std::vector<std::wstring>{L"Music"});
}

TEST_P(ProjectEditsTest, ACutLeavesOutTheMarkersOfRuns)
{
    addTrack(u"FX");
    createMarkerTracks();
    host.addTrack(TypeWord::Marker, u"Cues");

    const std::vector<std::wstring> tracks = tracksOf(*host.adapter.makeCut(tenSeconds()));

    EXPECT_EQ(tracks, (std::vector<std::wstring>{L"FX", L"Memos", L"Cues"}));
}

TEST_P(ProjectEditsTest, ACutLeavesOutTheMarkersOfRunsThatAreSwitchedOffInAProjectThatWasOpenedAnew)
{
    addTrack(u"FX");
    createMarkerTracks();
    host.addTrack(TypeWord::Marker, u"Cues");
    Project reopened(host.context(), host.document());
    switchMarkersOff(reopened.model().settings());

    EXPECT_EQ(tracksOf(*reopened.makeCut(tenSeconds())), (std::vector<std::wstring>{L"FX", L"Memos", L"Cues"}));
}

TEST_P(ProjectEditsTest, ARunEmptiesTheMarkersThatAreSwitchedOffInAProjectThatWasOpenedAnew)
{
    createMarkerTracks();
    const auto destinations = markerTrack(u"Destination");
    host.addRangeMarker(destinations, u"old", film(2.0), film(8.0));
    Project reopened(host.context(), host.document());
    reopened.computePreviewOffset();
    switchMarkersOff(reopened.model().settings());
    reopened.model().settings().setApplyTo(core::ApplyTo::SelectedTracks);

    host.edit(u"Edit", [&] { reopened.completeApply(*host.transaction()); });

    EXPECT_EQ(contentOf(destinations), Content());
}

TEST_P(ProjectEditsTest, TheEventsOfACutSeeWhatStandsOnTheirTracks)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"door", 8.0, 12.0);
    const auto cut = host.adapter.makeCut(tenSeconds());
    EXPECT_EQ(cut->cutEvents()[0]->update(3610.0).across, (core::SecondsRange{3608.0, 3612.0}));

    // An edit of the system itself, of which nobody tells.
    EXPECT_EQ(process(*cut), Result::NotAvailable) << "There is no track for the destination marker.";
    EXPECT_EQ(cut->cutEvents()[0]->update(Day + 3631.0).across, (core::SecondsRange{Day + 3630.0, Day + 3632.0}));
}

TEST_P(ProjectEditsTest, ACutIsCopiedToThePreview)
{
    switchMarkersOff(settings());
    const auto fx = addTrack(u"FX");
    addClip(fx, u"door", 8.0, 12.0);
    addClip(fx, u"steps", 13.0, 18.0);
    addClip(fx, u"car", 19.0, 25.0);
    const auto cut = host.adapter.makeCut(tenSeconds());

    EXPECT_EQ(process(*cut), Result::Ok);

    EXPECT_EQ(contentOf(fx), (Content{"door 8-12", "steps 13-18", "car 19-25", "preview: door 30-32",
                                      "preview: steps 33-38", "preview: car 39-40"}));
}

// Each cut takes a frame from after 01:00:00:00 to after 00:30:00:00.
TEST(ProjectCuts, ThatWouldStandBeforeTheProjectBeginsAreNotQuadraticInTheirSources)
{
    for (const double origin : {3600.0, 36000.0}) {
        SCOPED_TRACE(origin);
        expectNotQuadratic(1000, [origin](int count) {
            const cadrel::tests::TestProject timecodes;
            TrackHost host(origin);
            switchMarkersOff(host.adapter.model().settings());
            const auto track = host.addTrack(TypeWord::Audio, u"FX");
            const auto timecode = [](const char* begin, int frame) {
                return core::Timecode(core::Timecode(begin).toFrameCount() + frame);
            };
            std::vector<std::shared_ptr<core::EventBase>> changes;
            for (int frame = 0; frame < 2 * count; frame += 2) {
                host.addClip(track, u"shot", frame / 25.0, (frame + 1) / 25.0);
                changes.push_back(std::make_shared<core::EventBase>());
                changes.back()->setTimecodes(timecode("01:00:00:00", frame), timecode("01:00:00:00", frame + 1),
                                             timecode("00:30:00:00", frame), timecode("00:30:00:00", frame + 1));
            }

            double seconds = 0.0;
            host.edit(u"Cuts", [&] {
                host.adapter.startWriting();
                std::vector<std::shared_ptr<core::Cut>> cuts;
                for (const auto& change : changes)
                    cuts.push_back(host.adapter.makeCut(change));
                seconds = secondsOf([&] {
                    for (const auto& cut : cuts)
                        host.adapter.processCut(*host.transaction(), *cut);
                });
                host.adapter.rememberWritten();
            });
            EXPECT_EQ(host.adapter.leftOutEvents().size(), origin > 3600.0 ? 0U : changes.size());
            return seconds;
        });
    }
}

TEST_P(ProjectEditsTest, TracksOfTheSameSourceRangeAreCopiedTogether)
{
    for (const char16_t* name : {u"1", u"2", u"3", u"4"})
        addTrack(name);
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    altered.replace(IEditService::iid, edits);
    Project project(&altered, host.document());
    switchMarkersOff(project.model().settings());
    project.computePreviewOffset();
    const auto cut = project.makeCut(tenSeconds());
    core::Cut::CutEvents& cutEvents = cut->cutEvents();
    cutEvents[0]->setSrcIn(3612.0);
    cutEvents[0]->setDstIn(3632.0);
    cutEvents[2]->setSrcOut(3620.0 + 0.9 / 384000); // the same instant
    cutEvents[3]->setSrcOut(3620.0 + 1.1 / 384000); // another

    project.processCut(*host.transaction(), *cut);

    ASSERT_EQ(edits->copies.size(), 3U);
    EXPECT_EQ(edits->copies[0].tracks, 2);
    EXPECT_EQ(edits->copies[0].start, film(10.0));
    EXPECT_EQ(edits->copies[0].end, film(20.0));
    EXPECT_EQ(edits->copies[0].destination, film(30.0) + Day);
    EXPECT_EQ(edits->copies[1].tracks, 1);
    EXPECT_EQ(edits->copies[1].start, film(10.0));
    EXPECT_GT(edits->copies[1].end, film(20.0));
    EXPECT_EQ(edits->copies[2].tracks, 1);
    EXPECT_EQ(edits->copies[2].start, film(12.0));
    EXPECT_EQ(edits->copies[2].destination, film(32.0) + Day);
}

TEST_P(ProjectEditsTest, AnEmptyOrReversedSourceIsPassedOver)
{
    for (const char16_t* name : {u"1", u"2", u"3"})
        addTrack(name);
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    altered.replace(IEditService::iid, edits);
    Project project(&altered, host.document());
    switchMarkersOff(project.model().settings());
    project.computePreviewOffset();
    const auto cut = project.makeCut(tenSeconds());
    cut->cutEvents()[0]->setSrcIn(3620.0);
    cut->cutEvents()[1]->setSrcIn(3621.0);

    project.processCut(*host.transaction(), *cut);

    ASSERT_EQ(edits->copies.size(), 1U);
    EXPECT_EQ(edits->copies[0].tracks, 1);
}

TEST_P(ProjectEditsTest, ACutFailsWithoutItsHost)
{
    addTrack(u"FX");
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    edits->result = ResultFalse;
    Project project(&altered, host.document());
    switchMarkersOff(project.model().settings());
    const auto cut = project.makeCut(tenSeconds());
    const auto processed = [&] { return thrownBy([&] { project.processCut(*host.transaction(), *cut); }); };

    EXPECT_EQ(processed(), Result::NotAvailable) << "There is no preview offset.";
    project.computePreviewOffset();
    altered.replace(IEditService::iid, edits);
    EXPECT_EQ(processed(), Result::HostCallFailed);
    altered.unhide(IEditService::iid);
    altered.hide(IEditService::iid);
    EXPECT_EQ(processed(), Result::HostObjectMissing);
    altered.unhide(IEditService::iid);
    altered.hide(IObjectList::iid);
    EXPECT_EQ(processed(), Result::HostObjectMissing);
}

TEST_P(ProjectEditsTest, ACutReportsItsProgress)
{
    switchMarkersOff(settings());
    addTrack(u"FX");
    addTrack(u"Music");
    RecordingProgress progress;
    host.adapter.setProgress(&progress);

    process(*host.adapter.makeCut(tenSeconds()));

    EXPECT_EQ(progress.texts, std::vector<std::wstring>{L"Event: 7 - A012 "});
    EXPECT_EQ(progress.steps(), 2U);
}

TEST_P(ProjectEditsTest, MarksTheDestinationWithTheReel)
{
    createMarkerTracks();

    EXPECT_EQ(process(*host.adapter.makeCut(tenSeconds())), Result::Ok);

    const auto destinations = markerTrack(u"Destination");
    EXPECT_EQ(contentOf(destinations), Content{"preview: Event: 7 - A012  30-40"});
    const auto marker = childrenOf(*destinations).front();
    EXPECT_TRUE(marker->isType(TypeWord::Range));
    EXPECT_EQ(textOf(marker, AttributeKey::Reel), "A012");
    EXPECT_NE(marker->hasAttribute(AttributeKey::EventUserId), ResultOk);
}

TEST_P(ProjectEditsTest, NamesTheDestinationByTheClipWhereEventsAreMatchedByIt)
{
    settings().setMatchBy(core::MatchBy::ClipName);
    createMarkerTracks();
    const auto event = tenSeconds();
    event->setClipName("42C-1 OTS MAREN");

    process(*host.adapter.makeCut(event));

    const auto destinations = markerTrack(u"Destination");
    EXPECT_EQ(contentOf(destinations), Content{"preview: Event: 7 - 42C-1 OTS MAREN 30-40"});
    EXPECT_EQ(textOf(childrenOf(*destinations).front(), AttributeKey::Reel), "A012");
}

TEST_P(ProjectEditsTest, TheDestinationIsThatOfTheChangeEventWhateverWasTrimmed)
{
    addTrack(u"FX");
    createMarkerTracks();
    const auto cut = host.adapter.makeCut(tenSeconds());
    for (const auto& cutEvent : cut->cutEvents())
        cutEvent->setDstIn(cutEvent->dstIn() + 2.0);

    process(*cut);

    EXPECT_EQ(contentOf(markerTrack(u"Destination")), Content{"preview: Event: 7 - A012  30-40"});
}

TEST_P(ProjectEditsTest, AReversedDestinationIsMarkedAllTheSame)
{
    addTrack(u"FX");
    createMarkerTracks();

    EXPECT_EQ(process(*host.adapter.makeCut(change("01:00:10:00", "01:00:20:00", "01:00:40:00", "01:00:30:00"))),
              Result::Ok);
    EXPECT_EQ(generate({{3605.0, 3602.0, "Insert: B", MarkerKind::Insert}}), Result::Ok);

    EXPECT_EQ(contentOf(markerTrack(u"Destination")), Content{"preview: Event: 7 - A012  30-40"});
    EXPECT_EQ(contentOf(markerTrack(u"Insert")), Content{"preview: Insert: B 2-5"});
}

TEST_P(ProjectEditsTest, ANameThatIsNoUtf8IsStillReadable)
{
    createMarkerTracks();
    const auto event = tenSeconds();
    event->setRollName("CAF\xC9");

    EXPECT_EQ(process(*host.adapter.makeCut(event)), Result::Ok);

    const auto destinations = markerTrack(u"Destination");
    EXPECT_EQ(contentOf(destinations), Content{"preview: Event: 7 - CAF?  30-40"});
    EXPECT_EQ(textOf(childrenOf(*destinations).front(), AttributeKey::Reel), "CAF?");
}

TEST_P(ProjectEditsTest, WritesEachMarkerOnTheTrackOfItsKind)
{
    createMarkerTracks();
    RecordingProgress progress;
    host.adapter.setProgress(&progress);

    EXPECT_EQ(generate({{3601.0, 3602.0, "Insert: B", MarkerKind::Insert},
                        {3602.0, 3603.0, "Dissolve", MarkerKind::DissolveWipe},
                        {3603.0, 3604.0, "Volume", MarkerKind::AutomationWarning},
                        {3604.0, 3605.0, "Snippet", MarkerKind::AudioSnippet},
                        {3605.0, 3606.0, "Twice", MarkerKind::Overlap}}),
              Result::Ok);

    EXPECT_EQ(contentOf(markerTrack(u"Insert")), Content{"preview: Insert: B 1-2"});
    EXPECT_EQ(contentOf(markerTrack(u"Dissolve/Wipe")), Content{"preview: Dissolve 2-3"});
    EXPECT_EQ(contentOf(markerTrack(u"Automation Warning")), Content{"preview: Volume 3-4"});
    EXPECT_EQ(contentOf(markerTrack(u"Audio Snippet")), Content{"preview: Snippet 4-5"});
    EXPECT_EQ(contentOf(markerTrack(u"Overlap")), Content{"preview: Twice 5-6"});
    EXPECT_TRUE(contentOf(markerTrack(u"Destination")).empty());
    EXPECT_TRUE(contentOf(markerTrack(u"Memos")).empty());
    const auto marker = childrenOf(*markerTrack(u"Insert")).front();
    EXPECT_EQ(textOf(marker, AttributeKey::Reel), "");
    EXPECT_NE(marker->hasAttribute(AttributeKey::EventUserId), ResultOk);
    EXPECT_EQ(progress.steps(), 5U);
}

TEST_P(ProjectEditsTest, AMarkerOfAHundredthOfASecondIsAPoint)
{
    createMarkerTracks();

    EXPECT_EQ(generate({{3601.0, 3601.01, "a hundredth", MarkerKind::Insert},
                        {3602.0, 3602.02, "two hundredths", MarkerKind::Insert}}),
              Result::Ok);

    const auto markers = childrenOf(*markerTrack(u"Insert"));
    ASSERT_EQ(markers.size(), 2U);
    EXPECT_FALSE(markers[0]->isType(TypeWord::Range));
    EXPECT_TRUE(markers[1]->isType(TypeWord::Range));
    EXPECT_EQ(contentOf(markerTrack(u"Insert")),
              (Content{"preview: a hundredth 1-1", "preview: two hundredths 2-2.02"}));
}

TEST_P(ProjectEditsTest, AMarkerWithoutATrackIsPassedOver)
{
    settings().setCreateInsertMarkers(false);
    createMarkerTracks();
    RecordingProgress progress;
    host.adapter.setProgress(&progress);

    EXPECT_EQ(
        generate({{3601.0, 3602.0, "Insert: B", MarkerKind::Insert}, {3605.0, 3606.0, "Twice", MarkerKind::Overlap}}),
        Result::Ok);

    EXPECT_EQ(contentOf(markerTrack(u"Overlap")), Content{"preview: Twice 5-6"});
    EXPECT_EQ(progress.steps(), 1U);
}

TEST_P(ProjectEditsTest, AMarkerOfNoKindFailsAndThoseBeforeItStay)
{
    createMarkerTracks();
    for (const std::int32_t kind : {0, 6, -1}) {
        EXPECT_EQ(generate({{3601.0, 3602.0, "in front", MarkerKind::Insert},
                            {3605.0, 3606.0, "of no kind", kind},
                            {3607.0, 3608.0, "behind", MarkerKind::Insert}}),
                  Result::InvalidArgument);
    }
    EXPECT_EQ(contentOf(markerTrack(u"Insert")),
              (Content{"preview: in front 1-2", "preview: in front 1-2", "preview: in front 1-2"}));
}

TEST_P(ProjectEditsTest, NoMarkersAreWrittenWithoutAnOffset)
{
    createMarkerTracks();
    host.adapter.resetPreviewOffset();

    EXPECT_EQ(generate({{3601.0, 3602.0, "Insert: B", MarkerKind::Insert}}), Result::NotAvailable);
}

TEST_P(ProjectEditsTest, TheEndOfARunBringsThePreviewBack)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"old", 5.0, 15.0);
    addClip(fx, u"new", Day + 20.0, Day + 30.0);

    EXPECT_EQ(complete(), Result::Ok);

    EXPECT_EQ(contentOf(fx), Content{"new 20-30"});
}

TEST_P(ProjectEditsTest, OnlyTheTracksOfTheRunAreReplaced)
{
    const auto selected = addTrack(u"Selected");
    const auto unselected = addTrack(u"Unselected");
    const auto locked = addTrack(u"Locked");
    createMarkerTracks();
    const auto memos = markerTrack(u"Memos");
    for (const auto& track : {selected, unselected, locked})
        addClip(track, u"old", 5.0, 15.0);
    host.addPointMarker(memos, u"memo", film(5.0));
    host.addPointMarker(memos, u"carried", film(Day + 20.0));
    select(selected);
    select(locked);
    lock(locked);
    settings().setApplyTo(core::ApplyTo::SelectedTracks);

    EXPECT_EQ(complete(), Result::Ok);

    EXPECT_EQ(contentOf(selected), Content());
    EXPECT_EQ(contentOf(unselected), Content{"old 5-15"});
    EXPECT_EQ(contentOf(locked), Content{"old 5-15"});
    EXPECT_EQ(contentOf(memos), Content{"carried 20-20"});
}

TEST_P(ProjectEditsTest, ARestrictedRunReplacesItsRangeAlone)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"before", 0.0, 9.0);
    addClip(fx, u"across", 9.0, 12.0);
    addClip(fx, u"within", 13.0, 15.0);
    addClip(fx, u"behind", 20.0, 30.0);
    addClip(fx, u"new", Day + 8.0, Day + 22.0);
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3610.0, 3620.0);

    keepAsWritten();
    EXPECT_EQ(complete(), Result::Ok);

    EXPECT_EQ(contentOf(fx), (Content{"before 0-9", "across 9-10", "new 10-20", "behind 20-30"}));
}

//     range                      10|=============|20
//     before             |--a--|--b--|--c--|  |--d--|--e--|
//                             |----------- f ----------|
//     after              |--a--|-b-|      |new|  |d|--e--|     what stands outside of the range wasn't conformed anew, and
//                             |-f--|             |--f--|       its markers still tell the truth
TEST_P(ProjectEditsTest, ARestrictedRunEmptiesItsRangeOfTheMarkersOfRunsAndCutsThoseThatReachOutOfIt)
{
    createMarkerTracks();
    for (const char16_t* const name : {u"Destination", u"Memos"}) {
        const auto track = markerTrack(name);
        host.addRangeMarker(track, u"a", film(0.0), film(8.0));
        host.addRangeMarker(track, u"b", film(8.0), film(12.0));
        host.addRangeMarker(track, u"c", film(10.0), film(15.0));
        host.addRangeMarker(track, u"d", film(18.0), film(22.0));
        host.addRangeMarker(track, u"e", film(20.0), film(25.0));
        host.addRangeMarker(track, u"f", film(7.0), film(24.0));
        host.addRangeMarker(track, u"new", film(Day + 16.0), film(Day + 20.0));
    }
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3610.0, 3620.0);

    EXPECT_EQ(complete(), Result::Ok);

    for (const char16_t* const name : {u"Destination", u"Memos"}) {
        Content content = contentOf(markerTrack(name));
        std::ranges::sort(content);
        EXPECT_EQ(content, (Content{"a 0-8", "b 8-10", "d 20-22", "e 20-25", "f 20-24", "f 7-10", "new 16-20"}));
    }
}

TEST_P(ProjectEditsTest, ARestrictedRunThatIsMadeAgainPilesUpNoMarkers)
{
    createMarkerTracks();
    const auto destinations = markerTrack(u"Destination");
    host.addRangeMarker(destinations, u"old", film(8.0), film(22.0));
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3610.0, 3620.0);

    for (int run = 0; run < 3; ++run) {
        host.addRangeMarker(destinations, u"new", film(Day + 16.0), film(Day + 24.0));
        keepAsWritten();
        EXPECT_EQ(complete(), Result::Ok);
        Content content = contentOf(destinations);
        std::ranges::sort(content);
        EXPECT_EQ(content, (Content{"new 16-20", "old 20-22", "old 8-10"}));
    }
}

TEST_P(ProjectEditsTest, ARestrictedRunMayBeginBeforeTheClock)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"old", 5.0, 15.0);
    addClip(fx, u"behind", 20.0, 30.0);
    addClip(fx, u"new", Day + 7.0, Day + 25.0);
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(-100.0, 3620.0);

    keepAsWritten();
    EXPECT_EQ(complete(), Result::Ok);

    EXPECT_EQ(contentOf(fx), (Content{"new 7-20", "behind 20-30"}));
}

TEST_P(ProjectEditsTest, ARestrictedRunReadsNothingBeforeThePreviewAndWritesNothingBeforeTheTimeline)
{
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    altered.replace(IEditService::iid, edits);
    Project project(&altered, host.document());
    project.computePreviewOffset();
    project.model().settings().setRestrictRange(true);
    project.model().settings().setPreserveMaterial(-100.0, 3620.0);

    host.edit(u"Edit", [&] { project.completeApply(*host.transaction()); });

    ASSERT_EQ(edits->copies.size(), 1U);
    EXPECT_EQ(edits->copies[0].start, Day);
    EXPECT_EQ(edits->copies[0].end, Day + film(20.0));
    EXPECT_EQ(edits->copies[0].destination, 0.0);
}

TEST_P(ProjectEditsTest, AnEmptyRangeReplacesNothing)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"old", 5.0, 15.0);
    addClip(fx, u"new", Day + 5.0, Day + 25.0);
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3610.0, 3610.0);

    keepAsWritten();
    EXPECT_EQ(complete(), Result::Ok);

    EXPECT_EQ(contentOf(fx), Content{"old 5-15"});
}

TEST_P(ProjectEditsTest, TheEndOfARunNeedsTheOffset)
{
    host.adapter.resetPreviewOffset();

    EXPECT_EQ(complete(), Result::NotAvailable);
}

TEST_P(ProjectEditsTest, TheEndOfARunReportsEachTrack)
{
    addTrack(u"FX");
    addTrack(u"Music");
    RecordingProgress progress;
    host.adapter.setProgress(&progress);

    complete();

    EXPECT_EQ(progress.steps(), 2U);
}

TEST_P(ProjectEditsTest, WritesNoMarkersOnATrackThatTheUserHasLocked)
{
    createMarkerTracks();
    lock(markerTrack(u"Destination"));
    lock(markerTrack(u"Insert"));

    EXPECT_EQ(process(*host.adapter.makeCut(tenSeconds())), Result::Ok);
    EXPECT_EQ(generate({{3601.0, 3602.0, "Insert: B", MarkerKind::Insert},
                        {3602.0, 3603.0, "Dissolve", MarkerKind::DissolveWipe}}),
              Result::Ok);

    EXPECT_TRUE(contentOf(markerTrack(u"Destination")).empty());
    EXPECT_TRUE(contentOf(markerTrack(u"Insert")).empty());
    EXPECT_EQ(contentOf(markerTrack(u"Dissolve/Wipe")), Content{"preview: Dissolve 2-3"});
}

TEST_P(ProjectEditsTest, ClearsThePreviewAndUnlocksTheTracks)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"old", 5.0, 15.0);
    addClip(fx, u"across", Day - 3601.0, Day - 3599.0);
    addClip(fx, u"new", Day + 20.0, Day + 30.0);
    keepAsWritten();
    addClip(fx, u"late", Day + 25.0, Day + 35.0);
    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);

    EXPECT_EQ(edit([](Project& project, IEditTransaction& transaction) { project.clearPreview(transaction); }),
              Result::Ok);

    EXPECT_EQ(contentOf(fx), (Content{"old 5-15", "across 82799-82801", "preview: late 25-35"}));
    EXPECT_FALSE(host.handle(fx).hostLocked());
}

TEST_P(ProjectEditsTest, ClearsTheAutomationOfThePreviewThatReachesFurtherThanAllEvents)
{
    constexpr int32 volume = standin::Envelope::Curve::Volume;
    const auto fx = addTrack(u"FX");
    addClip(fx, u"old", 5.0, 15.0);
    host.addPoint(fx, volume, film(10.0), 0.25F);
    // The project ends at 15 s of the film, and this is the copy of what stands a quarter of an hour behind that.
    host.addPoint(fx, volume, film(Day + 900.0), 0.25F);
    host.addPoint(fx, volume, film(Day + 901.0), 0.75F);
    host.addPoint(fx, volume, film(Day + 902.0), 0.25F);
    keepAsWritten();

    EXPECT_EQ(edit([](Project& project, IEditTransaction& transaction) { project.clearPreview(transaction); }),
              Result::Ok);

    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(fx, volume));
    for (const double time : {10.0, Day + 900.5, Day + 901.0, 2.0 * Day})
        EXPECT_EQ(curve.valueBehind(film(time)), 0.25) << time;
}

TEST_P(ProjectEditsTest, ThePreviewIsClearedInATransactionAloneAndWhereverThePreviewOffsetIs)
{
    const auto fx = addTrack(u"FX");
    addClip(fx, u"new", Day + 20.0, Day + 30.0);
    keepAsWritten();
    EXPECT_EQ(thrownBy([&] { host.adapter.clearPreview(*host.transaction()); }), Result::HostCallFailed);

    host.adapter.resetPreviewOffset();
    EXPECT_EQ(edit([](Project& project, IEditTransaction& transaction) { project.clearPreview(transaction); }),
              Result::Ok);
    EXPECT_EQ(contentOf(fx), Content());
}

TEST_P(ProjectEditsTest, ClosesARangeOnTheTracksOfTheRunInTimesOfTheHost)
{
    addTrack(u"FX");
    select(addTrack(u"Music"));
    const auto locked = addTrack(u"Locked");
    select(locked);
    lock(locked);
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    altered.replace(IEditService::iid, edits);
    Project project(&altered, host.document());

    project.closeRange(false, 3610.0, 3620.0);
    project.closeRange(true, 3610.0, 3620.0);

    ASSERT_EQ(edits->closed.size(), 2U);
    EXPECT_EQ(edits->closed[0].tracks, 2);
    EXPECT_EQ(edits->closed[0].start, film(10.0));
    EXPECT_EQ(edits->closed[0].end, film(20.0));
    EXPECT_EQ(edits->closed[1].tracks, 1);
}

TEST_P(ProjectEditsTest, ClosingARangeFailsOnlyWhereTheHostRefuses)
{
    AlteredContext altered(host.context());
    const auto edits = makeCounted<EditRecorder>();
    altered.replace(IEditService::iid, edits);
    Project project(&altered, host.document());
    const auto closing = [&](int32 result) {
        edits->result = result;
        return thrownBy([&] { project.closeRange(false, 3610.0, 3620.0); });
    };

    EXPECT_EQ(closing(0), Result::Ok);
    EXPECT_EQ(closing(1), Result::Ok);
    EXPECT_EQ(closing(2), Result::HostCallFailed);
    EXPECT_EQ(closing(-1), Result::HostCallFailed);
    altered.unhide(IEditService::iid);
    altered.hide(IEditService::iid);
    EXPECT_EQ(closing(0), Result::HostObjectMissing);
}

//     cuts      |-- 1 --|          |-- 2 --||-- 3 --|
//     film     10      20         30      40       50
class ProjectVirginTerritoryTest : public ProjectEditsTest {
protected:
    void SetUp() override
    {
        ProjectEditsTest::SetUp();
        track = addTrack(u"FX");
        for (const double time : {15.0, 25.0, 35.0, 45.0})
            host.addPoint(track, Volume, film(Day + time), time < 20.0 ? 0.2F : 0.8F);
        cuts.add(host.adapter.makeCut(change("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00")));
        cuts.add(host.adapter.makeCut(change("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:40:00")));
        cuts.add(host.adapter.makeCut(change("01:00:20:00", "01:00:30:00", "01:00:40:00", "01:00:50:00")));
    }

    /// Cuts of these destinations alone, in this order.
    void listCuts(std::initializer_list<std::pair<const char*, const char*>> destinations)
    {
        cuts.clear();
        for (const auto& [dstIn, dstOut] : destinations)
            cuts.add(host.adapter.makeCut(change(dstIn, dstOut, dstIn, dstOut)));
    }

    Result::Type mark()
    {
        return edit(
            [&](Project& project, IEditTransaction& transaction) { project.markVirginTerritories(transaction, cuts); });
    }
    Result::Type hold(bool isWholeProgramme = true)
    {
        return edit([&](Project& project, IEditTransaction& transaction) {
            project.holdAutomation(transaction, cuts, isWholeProgramme);
        });
    }
    /// The times of the points, in seconds of the preview's copy of the film.
    std::vector<double> points(const TrackHost::Node& ofTrack)
    {
        std::vector<double> times;
        for (const auto& point : childrenOf(*host.curveOf(ofTrack, Volume)))
            times.push_back(std::round((point->getStart(nullptr) - film(Day)) * 1000.0) / 1000.0);
        return times;
    }

    static constexpr int32 Volume = standin::Envelope::Curve::Volume;

    TrackHost::Node track;
    core::CutList cuts;
};

INSTANTIATE_TEST_SUITE_P(Origins, ProjectVirginTerritoryTest, testing::Values(0.0, 3600.0));

TEST_P(ProjectVirginTerritoryTest, AutomationRunsStraightBetweenCutsThatDoNotMeet)
{
    EXPECT_EQ(mark(), Result::Ok);

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, CutEventsThatStandAHundredthApartMeet)
{
    cuts.cutAt(0)->cutEvents()[0]->setDstOut(3629.99);
    mark();
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 35.0, 45.0}));

    cuts.cutAt(0)->cutEvents()[0]->setDstOut(3629.98);
    mark();
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 29.98, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, CutsWhoseChangeEventsMeetAreLeftAlone)
{
    cuts.cutAt(2)->cutEvents()[0]->setDstIn(3642.0);

    mark();

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, WhatAnotherCutHasWrittenInAGapStays)
{
    listCuts({{"01:00:10:00", "01:00:20:00"}, {"01:00:30:00", "01:00:40:00"}, {"01:00:20:00", "01:00:30:00"}});

    EXPECT_EQ(mark(), Result::Ok);

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, WhatAnotherCutLeavesOfAGapIsFilled)
{
    listCuts({{"01:00:10:00", "01:00:20:00"}, {"01:00:30:00", "01:00:40:00"}, {"01:00:22:00", "01:00:28:00"}});

    EXPECT_EQ(mark(), Result::Ok);

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 22.0, 25.0, 28.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, WhatALongCutHasWrittenUnderALaterOneStays)
{
    listCuts({{"01:00:10:00", "01:00:40:00"}, {"01:00:12:00", "01:00:20:00"}, {"01:00:40:00", "01:00:50:00"}});

    EXPECT_EQ(mark(), Result::Ok);

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, AGapThatTwoPairsOfCutsShareIsFilledOnce)
{
    // From 40 to 44 s lies between the first two, and between the last two.
    listCuts({{"01:00:10:00", "01:00:20:00"},
              {"01:00:44:00", "01:00:46:00"},
              {"01:00:30:00", "01:00:40:00"},
              {"01:00:48:00", "01:00:50:00"}});

    EXPECT_EQ(mark(), Result::Ok);

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 35.0, 40.0, 44.0, 45.0, 46.0, 48.0}));
}

TEST_P(ProjectVirginTerritoryTest, LockedAndUnselectedTracksAreLeftAlone)
{
    const auto before = points(track);
    settings().setApplyTo(core::ApplyTo::SelectedTracks);
    mark();
    EXPECT_EQ(points(track), before);

    select(track);
    lock(track);
    mark();
    EXPECT_EQ(points(track), before);
}

TEST_P(ProjectVirginTerritoryTest, GapsNeedTheOffset)
{
    host.adapter.resetPreviewOffset();

    EXPECT_EQ(mark(), Result::NotAvailable);
}

TEST_P(ProjectVirginTerritoryTest, AutomationKeepsItsValueBetweenCutsThatDoNotMeet)
{
    EXPECT_EQ(hold(), Result::Ok);

    // Half the way from 0.2 to 0.8 at 20 s, and 0.8 at 30 s.
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, GapsOfHeldAutomationAreThoseOfTheProgrammeInAnyOrderOfTheList)
{
    listCuts({{"01:00:40:00", "01:00:50:00"}, {"01:00:10:00", "01:00:20:00"}, {"01:00:30:00", "01:00:40:00"}});

    hold();

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, AGapShorterThanAnInstantIsNone)
{
    const auto gapOf = [&](double seconds) {
        listCuts({{"01:00:10:00", "01:00:20:00"}, {"01:00:20:00", "01:00:50:00"}});
        cuts.cutAt(1)->cutEvents()[0]->setDstIn(3620.0 + seconds);
        hold();
    };
    const std::vector<double> before = points(track);

    gapOf(0.9 / 384000);
    EXPECT_EQ(points(track), before);

    gapOf(1.1 / 384000);
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 20.0, 20.0, 25.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, AutomationHasItsFirstValueBeforeTheFirstCut)
{
    listCuts({{"01:00:30:00", "01:00:50:00"}});

    hold();

    // From the very beginning of the clock, which is an hour before the film.
    EXPECT_EQ(points(track), (std::vector<double>{-3600.0, -3600.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, AutomationKeepsItsLastValueAfterTheLastCut)
{
    listCuts({{"01:00:10:00", "01:00:20:00"}});

    hold(false);
    // In a preview up to a second before the end of what is cleared.
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, Day - 3601.0, Day - 3601.0}));

    hold(true);
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0}));
}

TEST_P(ProjectVirginTerritoryTest, ARestrictedRunHoldsTheAutomationInItsRange)
{
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3605.0, 3630.0);
    listCuts({{"01:00:10:00", "01:00:20:00"}});

    hold();

    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, ACutIsAsLongAsItsMaterial)
{
    cuts.clear();
    cuts.add(host.adapter.makeCut(change("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:30:00")));
    cuts.add(host.adapter.makeCut(change("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:40:00")));

    hold();

    // From 20 s on there is nothing, though the first one is to last longer.
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 20.0, 30.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, ARestrictedRunKeepsWhatThereIsBeforeItsRange)
{
    // The programme itself has 0.2 up to 15 s, where the preview has 0.8 from 25 s on.
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3626.0, 3640.0);
    listCuts({{"01:00:30:00", "01:00:40:00"}});

    hold();
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 26.0, 26.0, 30.0, 30.0, 35.0, 45.0}));

    // Nothing of a cut before the range comes into the programme.
    listCuts({{"01:00:10:00", "01:00:24:00"}, {"01:00:30:00", "01:00:40:00"}});
    hold();
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 26.0, 26.0, 30.0, 30.0, 35.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, ARestrictedRunWithoutCutsKeepsWhatThereIsBeforeItsRange)
{
    settings().setRestrictRange(true);
    settings().setPreserveMaterial(3630.0, 3640.0);
    cuts.clear();

    hold(false);
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 35.0, 45.0}));

    hold();
    EXPECT_EQ(points(track), (std::vector<double>{15.0, 25.0, 30.0, 30.0, 40.0, 40.0, 45.0}));
}

TEST_P(ProjectVirginTerritoryTest, OfLockedAndUnselectedTracksNoAutomationIsHeld)
{
    const auto before = points(track);
    settings().setApplyTo(core::ApplyTo::SelectedTracks);
    hold();
    EXPECT_EQ(points(track), before);

    select(track);
    lock(track);
    hold();
    EXPECT_EQ(points(track), before);
}

TEST_P(ProjectVirginTerritoryTest, WithoutCutsNoAutomationIsHeld)
{
    const auto before = points(track);
    cuts.clear();

    EXPECT_EQ(hold(), Result::Ok);

    EXPECT_EQ(points(track), before);
    host.adapter.resetPreviewOffset();
    EXPECT_EQ(hold(), Result::NotAvailable);
}

} // namespace cadrel::host
