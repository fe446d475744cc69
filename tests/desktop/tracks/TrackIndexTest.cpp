// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TrackIndex.h"

#include "standin/project/ClipEvent.h"
#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <map>

using desktop::Lane;
using desktop::MarkerLook;
using desktop::TrackIndex;
using standin::Node;
using standin::tests::TestHost;
using Velmark::TypeWord;

namespace {

/// All that lies on a track, with times of the project, in any order.
void collect(const standin::Container& container, std::multimap<double, double>& spans)
{
    for (Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        spans.emplace(child->absoluteStart(), child->absoluteEnd());
        collect(static_cast<const standin::Container&>(*child), spans);
    }
}

void collect(const Lane& lane, std::multimap<double, double>& spans)
{
    for (std::size_t at = 0; at < lane.size(); ++at) {
        spans.emplace(lane.spans()[at].start, lane.spans()[at].end);
        if (const Lane* const content = lane.contentOf(at))
            collect(*content, spans);
    }
}

bool areNear(const std::multimap<double, double>& one, const std::multimap<double, double>& other)
{
    return std::equal(one.begin(), one.end(), other.begin(), other.end(), [](const auto& a, const auto& b) {
        return std::abs(a.first - b.first) < 1e-6 && std::abs(a.second - b.second) < 1e-6;
    });
}

} // namespace

TEST(TrackIndex, HasNoRowsForAProjectWithoutTracks)
{
    TestHost host;
    const TrackIndex index(host.project);
    EXPECT_TRUE(index.rows().empty());
    EXPECT_FALSE(index.programme());
    EXPECT_FALSE(index.preview());
}

TEST(TrackIndex, HasARowForATrackWithoutEvents)
{
    TestHost host;
    host.addTrack(TypeWord::Audio, u"DIA 1");
    const TrackIndex index(host.project);
    ASSERT_EQ(index.rows().size(), 1U);
    EXPECT_EQ(index.rows()[0].lane.size(), 0U);
    EXPECT_TRUE(index.rows()[0].curves.empty());
    EXPECT_FALSE(index.programme());
}

TEST(TrackIndex, ListsFoldersBeforeWhatTheyHold)
{
    TestHost host;
    const auto outer = host.addTrack(TypeWord::Folder, u"Sound");
    const auto inner = host.addTrack(TypeWord::Folder, u"Dialogue", outer.get());
    host.addTrack(TypeWord::Audio, u"DIA 1", inner.get());
    host.addTrack(TypeWord::Audio, u"MX");
    const TrackIndex index(host.project);
    ASSERT_EQ(index.rows().size(), 4U);
    EXPECT_EQ(index.rows()[0].depth, 0);
    EXPECT_EQ(index.rows()[1].depth, 1);
    EXPECT_EQ(index.rows()[2].depth, 2);
    EXPECT_EQ(index.rows()[3].depth, 0);
}

TEST(TrackIndex, GivesWhatIsInAPartTimesOfTheProject)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"knocks", 10.0, 20.0);
    host.addClip(part, u"knock", 12.0, 13.0);
    const TrackIndex index(host.project);
    const Lane& lane = index.rows()[0].lane;
    ASSERT_EQ(lane.size(), 1U);
    EXPECT_EQ(lane.item(0).kind, Lane::Kind::Part);
    const Lane* const content = lane.contentOf(0);
    ASSERT_TRUE(content);
    ASSERT_EQ(content->size(), 1U);
    EXPECT_EQ(content->item(0).kind, Lane::Kind::Clip);
    EXPECT_EQ(content->spans()[0].start, 12.0);
    EXPECT_EQ(content->spans()[0].end, 13.0);
    EXPECT_FALSE(content->contentOf(0));
}

TEST(TrackIndex, TellsTheKindsOfMarkersApartByTheRoleOfTheirTrack)
{
    TestHost host;
    const std::map<int, MarkerLook> looks{{1, MarkerLook::Destination},  {2, MarkerLook::DissolveWipe},
                                          {3, MarkerLook::Insert},       {4, MarkerLook::AutomationWarning},
                                          {5, MarkerLook::AudioSnippet}, {6, MarkerLook::Overlap},
                                          {7, MarkerLook::Memo},         {8, MarkerLook::User},
                                          {-3, MarkerLook::User}};
    for (const auto& [role, look] : looks) {
        const auto track = host.addTrack(TypeWord::Marker, u"Markers");
        track->setAttribute(Velmark::AttributeKey::MarkerType, Velmark::FVariant::integer(role), true);
    }
    host.addTrack(TypeWord::Marker, u"Scenes");
    const TrackIndex index(host.project);
    auto row = index.rows().begin();
    for (const auto& [role, look] : looks)
        EXPECT_EQ((row++)->markers, look) << role;
    EXPECT_EQ(row->markers, MarkerLook::User);
}

TEST(TrackIndex, HasTheCurvesWithPoints)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    host.addPoint(track, 1, 4.0, 0.5F);
    host.addPoint(track, 1, 2.0, 1.0F);
    const TrackIndex index(host.project);
    ASSERT_EQ(index.rows()[0].curves.size(), 1U);
    EXPECT_EQ(index.rows()[0].curves[0].number, 1);
    EXPECT_EQ(index.rows()[0].curves[0].times, (std::vector<double>{2.0, 4.0}));
    EXPECT_EQ(index.rows()[0].curves[0].values, (std::vector<float>{1.0F, 0.5F}));
}

TEST(TrackIndex, TellsThePreviewFromTheProgrammeByTheHoursBetweenThem)
{
    TestHost host;
    const auto one = host.addTrack(TypeWord::Audio, u"FX 1");
    const auto two = host.addTrack(TypeWord::Audio, u"FX 2");
    host.addClip(one, u"a", 10.0, 20.0);
    host.addClip(two, u"b", 3000.0, 3600.0);
    host.addClip(one, u"c", 86400.0, 86410.0);
    host.addClip(two, u"d", 86500.0, 86600.0);
    const TrackIndex index(host.project);
    ASSERT_TRUE(index.programme() && index.preview());
    EXPECT_EQ(index.programme()->start, 10.0);
    EXPECT_EQ(index.programme()->end, 3600.0);
    EXPECT_EQ(index.preview()->start, 86400.0);
    EXPECT_EQ(index.preview()->end, 86600.0);
}

TEST(TrackIndex, TakesAFilmWithGapsOfHoursForOneProgramme)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    host.addClip(track, u"a", 0.0, 1.0);
    host.addClip(track, u"b", 12.0 * 3600.0, 12.0 * 3600.0 + 1.0);
    const TrackIndex index(host.project);
    EXPECT_EQ(index.programme()->end, 12.0 * 3600.0 + 1.0);
    EXPECT_FALSE(index.preview());
}

TEST(TrackIndex, KeepsAnEventThatHasBeenTakenOut)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    auto clip = host.addClip(track, u"door", 1.0, 2.0);
    const TrackIndex index(host.project);
    host.edit(u"Remove", [&] { host.transaction()->remove(track.get(), clip.get()); });
    clip.reset();
    host.project.undoList().clear();
    EXPECT_EQ(index.rows()[0].lane.item(0).event->name(), u"door");
}

RC_GTEST_PROP(TrackIndex, HasAllThatLiesOnTheTracks, ())
{
    standin::tests::CheckedChance chance;
    standin::ChangeLog log;
    const auto project = standin::tests::randomProject(chance, log);
    const TrackIndex index(*project);
    const auto tracks = project->allTracks();
    RC_ASSERT(index.rows().size() == tracks.size());
    for (std::size_t row = 0; row < tracks.size(); ++row) {
        RC_ASSERT(index.rows()[row].track == tracks[row]);
        if (tracks[row]->isFolder())
            continue;
        std::multimap<double, double> expected;
        std::multimap<double, double> found;
        collect(*tracks[row], expected);
        collect(index.rows()[row].lane, found);
        RC_ASSERT(areNear(expected, found));
    }
}
