// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TracksView.h"

#include "core/edl/EventList.h"
#include "desktop/tracks/Stills.h"
#include "desktop/tracks/TimeRuler.h"
#include "desktop/tracks/TrackHeaders.h"
#include "standin/edit/EditService.h"
#include "standin/project/ClipEvent.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/Pictures.h"
#include "util/StringUtil.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

using cadrel::core::EventList;
using cadrel::core::ListKind;
using cadrel::tests::expectPicture;
using cadrel::tests::makeEvent;
using cadrel::tests::treePath;
using desktop::ChangeMap;
using desktop::RowLayout;
using desktop::TimeRuler;
using desktop::TrackHeaders;
using desktop::TracksView;
using standin::tests::TestHost;
using Velmark::TypeWord;

namespace {

constexpr int Width = 1300;
constexpr int Height = 640;
/// Of the view without the names and the bar at the right.
constexpr int LaneWidth = Width - TrackHeaders::Width - 12;

/// Gives a picture for each frame at once.
class FakeStills : public desktop::Stills {
public:
    juce::Image still(standin::MediaClip&, std::uint32_t frame, int height) override
    {
        frames.insert(frame);
        juce::Image image(juce::Image::RGB, height * 16 / 9, height, false);
        image.clear(image.getBounds(), juce::Colour(frame % 2 == 0 ? 0xff3f5f4fU : 0xff6f5f3fU));
        return image;
    }
    void startAsking() override {}
    bool poll() override { return false; }

    std::set<std::uint32_t> frames;
};

/// A view of an empty project of 25 frames a second, whose clock begins at one hour, in a window with the focus.
class TracksViewTest : public testing::Test {
protected:
    TracksViewTest()
    {
        m_host.setClock(3600.0);
        m_window.emplace(Width, Height);
        m_view.emplace(m_host.project, m_host.application.edits(), nullptr);
        m_view->setBounds(0, 0, Width, Height);
        m_window->addAndMakeVisible(*m_view);
        m_view->grabKeyboardFocus();
    }

    juce::Image drawn() { return m_view->createComponentSnapshot(m_view->getLocalBounds(), true, 1.0F); }
    /// The place in the window of a time, on a row.
    juce::Point<int> placeOf(double seconds, std::size_t row)
    {
        return {TrackHeaders::Width + static_cast<int>(m_view->scale().pixelAt(seconds)),
                TimeRuler::Height + m_view->rows().top(row) - m_view->rowOffset() + 5};
    }
    void wheel(float deltaY, int modifiers, juce::Point<int> place = {700, 300})
    {
        juce::MouseWheelDetails details{};
        details.deltaY = deltaY;
        const juce::MouseEvent event(juce::Desktop::getInstance().getMainMouseSource(), place.toFloat(),
                                     juce::ModifierKeys(modifiers), 0.0F, 0.0F, 0.0F, 0.0F, 0.0F, &*m_view, &*m_view,
                                     {}, place.toFloat(), {}, 1, false);
        m_view->mouseWheelMove(event, details);
    }
    /// A shot of ten seconds that went from ten seconds to where one of twenty was.
    ChangeMap change(ChangeMap::State state) const
    {
        EventList events;
        EventList cut(ListKind::New);
        events.add(makeEvent("A", "01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00"));
        events.add(makeEvent("B", "01:00:10:00", "01:00:20:00", "01:00:20:00", "01:00:30:00"));
        cut.add(makeEvent("A", "01:00:00:00", "01:00:30:00", "01:00:00:00", "01:00:30:00"));
        return {events, cut, cut, m_rate.framerate, 3600.0, state};
    }

    cadrel::tests::TestProject m_rate{cadrel::core::Framerate(25, 0)};
    juce::ScopedJuceInitialiser_GUI m_juce;
    TestHost m_host;
    std::optional<cadrel::tests::FocusedWindow> m_window;
    std::optional<TracksView> m_view;
};

/// The example reel, as it is before a run.
class ReelViewTest : public testing::Test {
protected:
    ReelViewTest() : m_project(m_application.openProject(treePath("examples/reel3/reel3.stage")))
    {
        m_application.activateProject(&m_project);
        m_view.emplace(m_project, m_application.edits(), nullptr);
        m_view->setSize(Width, Height);
    }

    cadrel::tests::TestProject m_rate{cadrel::core::Framerate(24, 0)};
    juce::ScopedJuceInitialiser_GUI m_juce;
    standin::Application m_application;
    standin::Project& m_project;
    std::optional<TracksView> m_view;
};

} // namespace

TEST_F(ReelViewTest, ShowsAllOfTheProgrammeAtFirst)
{
    expectPicture(*m_view, "tracks-reel");
}

TEST_F(ReelViewTest, ShowsClipsWithTheirNamesWhenItIsClose)
{
    m_view->zoomBy(12.0);
    m_view->scrollTo(100.0);
    expectPicture(*m_view, "tracks-reel-close");
}

TEST_F(ReelViewTest, ShowsMoreTracksWhereTheyAreLow)
{
    m_view->setRowSize(RowLayout::Size::Small);
    m_view->zoomBy(3.0);
    expectPicture(*m_view, "tracks-reel-small");
}

TEST_F(ReelViewTest, ShowsThePreviewPlaceADayLater)
{
    m_view->fitAll();
    m_view->scrollTo(m_view->scale().left() + m_view->previewOffset());
    expectPicture(*m_view, "tracks-reel-preview");
}

TEST_F(TracksViewTest, ShowsAProjectWithoutTracks)
{
    expectPicture(*m_view, "tracks-empty");
}

TEST_F(TracksViewTest, ShowsAKindOfMarkerInEachOfItsTracks)
{
    const std::vector<std::pair<int, const char16_t*>> roles{
        {0, u"Scenes"}, {1, u"Destination"},        {3, u"Insert"},        {2, u"Dissolve/Wipe"},
        {7, u"Memos"},  {4, u"Automation Warning"}, {5, u"Audio Snippet"}, {6, u"Overlap"}};
    for (const auto& [role, name] : roles) {
        const auto track = m_host.addTrack(TypeWord::Marker, name);
        if (role > 0)
            track->setAttribute(Velmark::AttributeKey::MarkerType, Velmark::FVariant::integer(role), true);
        m_host.addPointMarker(track, u"look here", 10.0);
        m_host.addRangeMarker(track, u"from here to there", 30.0, 60.0);
        for (int at = 0; at < 40; ++at)
            m_host.addPointMarker(track, u"dense", 70.0 + 0.3 * at);
        m_host.addRangeMarker(track, u"around", 90.0, 99.0);
        m_host.addRangeMarker(track, u"within", 92.0, 94.0);
    }
    m_view->projectChanged();
    m_view->setSize(Width, 300);
    expectPicture(*m_view, "tracks-markers");
}

TEST_F(TracksViewTest, ShowsPartsWithWhatTheyHoldAndClipsOverEachOther)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"FX 1");
    const auto part = m_host.addPart(track, u"steps on gravel", 2.0, 20.0);
    for (int at = 0; at < 6; ++at)
        m_host.addClip(part, u"step", 2.5 + 3.0 * at, 4.0 + 3.0 * at);
    const auto outer = m_host.addPart(track, u"outer", 22.0, 38.0);
    const auto inner = m_host.addPart(outer, u"inner", 24.0, 34.0);
    m_host.addClip(inner, u"deep", 25.0, 33.0);
    m_host.addPart(track, u"empty part", 40.0, 48.0);

    const auto overlapping = m_host.addTrack(TypeWord::Audio, u"FX 2");
    m_host.addClip(overlapping, u"long one below", 2.0, 30.0);
    m_host.addClip(overlapping, u"on top", 8.0, 14.0);
    m_host.addClip(overlapping, u"no length", 20.0, 20.0);
    m_host.addClip(overlapping, u"one sample", 25.0, 25.0 + 1.0 / 48000.0);
    for (int at = 0; at < 300; ++at)
        m_host.addClip(overlapping, u"tiny", 34.0 + at * 0.04, 34.03 + at * 0.04);

    const auto names = m_host.addTrack(TypeWord::Audio, u"\U0001F3AC names \u05D0\u05D1\u05D2");
    m_host.addClip(names, u"\U0001F50A loud \U0001F680", 2.0, 12.0);
    m_host.addClip(names, u"\u05E9\u05DC\u05D5\u05DD right to left", 14.0, 26.0);
    m_host.addClip(names, u"Gew\u00E4sser, \u00C9tude, \u0141\u00F3d\u017A", 28.0, 40.0);
    m_host.addClip(names, u"", 42.0, 46.0);
    m_host.addTrack(TypeWord::Audio, u"nothing on this one");
    m_view->projectChanged();
    m_view->setRowSize(RowLayout::Size::Large);
    m_view->setSize(Width, 380);
    m_view->fitAll();
    expectPicture(*m_view, "tracks-parts");
}

TEST_F(TracksViewTest, ShowsWhereClipsStoodAndNewPictureWithoutSound)
{
    const auto one = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(one, u"stays", 1.0, 8.0);
    m_host.addClip(one, u"moved", 21.0, 27.0);
    m_host.addClip(one, u"moved too", 28.0, 29.5);
    const auto two = m_host.addTrack(TypeWord::Audio, u"FX 1");
    m_host.addClip(two, u"laid anew", 12.0, 16.0);
    m_host.addClip(two, u"moved", 22.0, 24.0);
    m_host.addPoint(two, 1, 5.0, 0.9F);
    m_host.addPoint(two, 1, 15.0, 0.2F);
    m_view->projectChanged();
    m_view->setSize(Width, 240);
    m_view->fitAll();
    m_view->setChange(change(ChangeMap::State::Carried));
    m_view->setGhosts(true);
    m_view->showEvent(1);
    expectPicture(*m_view, "tracks-change");
}

TEST_F(TracksViewTest, ShowsSelectedClipsAndLockedTracks)
{
    const auto one = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(one, u"selected", 1.0, 8.0);
    m_host.addClip(one, u"not selected", 8.0, 12.0);
    const auto two = m_host.addTrack(TypeWord::Audio, u"locked");
    m_host.addClip(two, u"can't be moved", 1.0, 8.0);
    auto* const track = m_host.project.allTracks()[0];
    track->firstChild()->setSelected(true);
    track->setSelected(true);
    m_host.project.allTracks()[1]->setLocked(true);
    m_view->projectChanged();
    m_view->setSize(Width, 200);
    expectPicture(*m_view, "tracks-selected");
}

TEST_F(TracksViewTest, FitsTheProgrammeWithoutThePreview)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_host.addClip(track, u"copy", 86400.0, 86500.0);
    m_view->projectChanged();
    m_view->fitAll();
    EXPECT_NEAR(m_view->scale().pixelAt(100.0) - m_view->scale().pixelAt(0.0), 0.98 * LaneWidth, 1e-6);
}

TEST_F(TracksViewTest, GoesToTheSamePlaceOfThePreviewAndBackWithOneKey)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_host.addClip(track, u"copy", 86400.0, 86500.0);
    m_view->projectChanged();
    m_view->fitAll();
    const double left = m_view->scale().left();
    EXPECT_TRUE(m_window->press('p'));
    EXPECT_NEAR(m_view->scale().left(), left + 86400.0, 1e-6);
    EXPECT_TRUE(m_view->showsPreviewPlace());
    EXPECT_TRUE(m_window->press('p'));
    EXPECT_NEAR(m_view->scale().left(), left, 1e-6);
}

TEST_F(TracksViewTest, PutsThePreviewOfAFilmPastMidnightOnTheDayAfterIt)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 86400.0);
    m_view->projectChanged();
    EXPECT_NEAR(m_view->previewOffset(), 2.0 * 86400.0, 1e-6);
}

TEST_F(TracksViewTest, ZoomsAndScrollsByKeys)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_view->projectChanged();
    m_view->fitAll();
    const auto fitted = m_view->scale();
    EXPECT_TRUE(m_window->press('+'));
    EXPECT_NEAR(m_view->scale().secondsPerPixel() * 1.5, fitted.secondsPerPixel(), 1e-9);
    // Around the playhead, which is at the start.
    EXPECT_NEAR(m_view->scale().pixelAt(0.0), fitted.pixelAt(0.0), 1e-6);
    EXPECT_TRUE(m_window->press('-'));
    EXPECT_NEAR(m_view->scale().left(), fitted.left(), 1e-9);
    EXPECT_TRUE(m_window->press(juce::KeyPress::rightKey));
    EXPECT_NEAR(m_view->scale().pixelAt(fitted.left()), -0.1 * LaneWidth, 1e-6);
    EXPECT_TRUE(m_window->press(juce::KeyPress::leftKey));
    EXPECT_NEAR(m_view->scale().left(), fitted.left(), 1e-9);
    EXPECT_TRUE(m_window->press(juce::KeyPress::endKey));
    EXPECT_NEAR(m_view->scale().pixelAt(100.0), 0.99 * LaneWidth, 1e-6);
    EXPECT_TRUE(m_window->press(juce::KeyPress::homeKey));
    EXPECT_NEAR(m_view->scale().pixelAt(0.0), 0.01 * LaneWidth, 1e-6);
    m_view->zoomBy(7.0);
    EXPECT_TRUE(m_window->press('f'));
    EXPECT_EQ(m_view->scale(), fitted);
    EXPECT_FALSE(m_window->press('x'));
    EXPECT_FALSE(m_window->press('f', juce::ModifierKeys::ctrlModifier));
}

TEST_F(TracksViewTest, ZoomsAndScrollsByTheWheel)
{
    for (int at = 0; at < 40; ++at)
        m_host.addTrack(TypeWord::Audio, u"track");
    m_view->projectChanged();
    m_view->rows();
    wheel(-0.5F, 0);
    EXPECT_EQ(m_view->rowOffset(), 120);
    wheel(10.0F, 0);
    EXPECT_EQ(m_view->rowOffset(), 0);
    wheel(-1000.0F, 0);
    EXPECT_EQ(m_view->rowOffset(), 40 * 40 - (Height - TimeRuler::Height - 12));

    const double place = m_view->scale().secondsAt(500.0);
    const double before = m_view->scale().secondsPerPixel();
    wheel(1.0F, juce::ModifierKeys::ctrlModifier);
    EXPECT_NEAR(m_view->scale().secondsPerPixel() * 4.0, before, 1e-9);
    EXPECT_NEAR(m_view->scale().secondsAt(500.0), place, 1e-6);

    const double left = m_view->scale().left();
    wheel(-1.0F, juce::ModifierKeys::shiftModifier);
    EXPECT_NEAR(m_view->scale().pixelAt(left), -0.75 * LaneWidth, 1e-6);

    wheel(1.0F, juce::ModifierKeys::altModifier);
    EXPECT_EQ(m_view->rowSize(), RowLayout::Size::Large);
    wheel(1.0F, juce::ModifierKeys::altModifier);
    EXPECT_EQ(m_view->rowSize(), RowLayout::Size::Large);
    wheel(-1.0F, juce::ModifierKeys::altModifier);
    EXPECT_EQ(m_view->rowSize(), RowLayout::Size::Medium);
}

TEST_F(TracksViewTest, SetsThePlayheadOnAFrameWhereTheRulerIsClicked)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_view->projectChanged();
    m_view->fitAll();
    std::vector<double> located;
    m_view->onLocate = [&](double seconds) { located.push_back(seconds); };
    m_window->click({TrackHeaders::Width + 500, 30});
    ASSERT_FALSE(located.empty());
    const double expected = m_view->scale().secondsAt(500.0);
    EXPECT_LE(located.back(), expected + 1e-6);
    EXPECT_GT(located.back(), expected - 0.04);
    EXPECT_NEAR(located.back() * 25.0, std::round(located.back() * 25.0), 1e-6);
    EXPECT_EQ(m_host.project.position().getValue(), located.back());
}

TEST_F(TracksViewTest, TellsTheEventThatHasMovedTheClipThatIsClicked)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"stays", 1.0, 8.0);
    m_host.addClip(track, u"moved", 21.0, 27.0);
    m_view->projectChanged();
    m_view->fitAll();
    std::vector<std::size_t> clicked;
    std::vector<double> located;
    m_view->onClipClicked = [&](std::size_t event) { clicked.push_back(event); };
    m_view->onLocate = [&](double seconds) { located.push_back(seconds); };
    m_window->click(placeOf(24.0, 0));
    EXPECT_TRUE(clicked.empty());
    m_view->setChange(change(ChangeMap::State::Carried));
    m_window->click(placeOf(24.0, 0));
    m_window->click(placeOf(4.0, 0));
    EXPECT_EQ(clicked, (std::vector<std::size_t>{1, 0}));
    EXPECT_TRUE(located.empty());
    // Beside the clips the playhead is set.
    m_window->click(placeOf(15.0, 0));
    EXPECT_EQ(clicked.size(), 2U);
    EXPECT_FALSE(located.empty());
}

TEST_F(TracksViewTest, MarksAnEventWithoutScrollingWhereThatIsNotWanted)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"moved", 21.0, 27.0);
    m_view->projectChanged();
    m_view->fitAll();
    m_view->setChange(change(ChangeMap::State::Carried));
    m_view->scrollTo(5000.0);
    m_view->showEvent(1, false);
    EXPECT_EQ(m_view->scale().left(), 5000.0);
    EXPECT_TRUE(m_view->isShown(m_view->index().rows()[0], {21.0, 27.0}));
    m_view->showEvent(1);
    EXPECT_LT(m_view->scale().left(), 5000.0);
}

TEST_F(TracksViewTest, TellsTheEventOfACopyInThePreview)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 11.0, 18.0);
    m_host.addClip(track, u"film", 86400.0 + 21.0, 86400.0 + 28.0);
    m_view->projectChanged();
    m_view->fitAll();
    m_view->setChange(change(ChangeMap::State::Planned));
    std::vector<std::size_t> clicked;
    m_view->onClipClicked = [&](std::size_t event) { clicked.push_back(event); };
    m_window->click(placeOf(15.0, 0));
    m_view->scrollTo(86400.0 + 20.0);
    m_window->click(placeOf(86400.0 + 22.0, 0));
    EXPECT_EQ(clicked, (std::vector<std::size_t>{1, 1}));
}

TEST_F(TracksViewTest, HasNoGhostsOnALockedTrackWhichNoRunTouches)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"moved", 21.0, 27.0);
    m_view->projectChanged();
    m_view->setChange(change(ChangeMap::State::Carried));
    EXPECT_EQ(m_view->ghostsOf(0).size(), 1U);
    m_view->toggleLock(0);
    EXPECT_EQ(m_view->ghostsOf(0).size(), 0U);
}

TEST_F(TracksViewTest, JoinsTheGhostsOfPiecesThatWereOneClip)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"wind", 20.0, 23.0);
    m_host.addClip(track, u"wind", 23.0, 25.0);
    m_host.addClip(track, u"gulls", 25.0, 26.0);
    m_view->projectChanged();
    m_view->setChange(change(ChangeMap::State::Carried));
    const auto& ghosts = m_view->ghostsOf(0);
    ASSERT_EQ(ghosts.size(), 2U);
    EXPECT_NEAR(ghosts[0].start, 10.0, 1e-9);
    EXPECT_NEAR(ghosts[0].end, 15.0, 1e-9);
    EXPECT_NEAR(ghosts[1].end, 16.0, 1e-9);
}

TEST_F(TracksViewTest, AsksForAStillAtEachCutThatIsSeen)
{
    const auto track = m_host.addTrack(TypeWord::Video, u"VIDEO");
    m_host.addClip(track, u"reel", 0.0, 30.0);
    auto& event = static_cast<standin::ClipEvent&>(*m_host.project.allTracks()[0]->firstChild());
    event.setClip(Velmark::Counted<standin::MediaClip>::share(&m_host.addVideo(u"/reel.mov", 60.0)));
    event.setSourceOffset(2.0);
    EventList cut(ListKind::New);
    cut.add(makeEvent("A", "01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00"));
    cut.add(makeEvent("B", "01:00:00:00", "01:00:18:00", "01:00:12:00", "01:00:30:00"));
    FakeStills stills;
    TracksView view(m_host.project, m_host.application.edits(), &stills);
    view.setSize(Width, 200);
    view.fitAll();
    view.setChange({EventList(), EventList(), cut, m_rate.framerate, 3600.0, ChangeMap::State::Carried});
    expectPicture(view, "tracks-stills");
    // Two seconds into the file, at 25 frames a second.
    EXPECT_EQ(stills.frames, (std::set<std::uint32_t>{50, 350}));

    stills.frames.clear();
    view.scrollTo(15.0);
    view.createComponentSnapshot(view.getLocalBounds());
    EXPECT_EQ(stills.frames, (std::set<std::uint32_t>{350}));
}

TEST_F(TracksViewTest, ScrollsToAnEventThatIsOutOfSight)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 30.0);
    m_view->projectChanged();
    m_view->fitAll();
    m_view->setChange(change(ChangeMap::State::Carried));
    const auto fitted = m_view->scale();
    m_view->showEvent(1);
    EXPECT_EQ(m_view->scale(), fitted);
    m_view->zoomBy(4.0);
    m_view->scrollTo(-10.0);
    m_view->showEvent(1);
    EXPECT_NEAR(m_view->scale().pixelAt(20.0), 0.2 * LaneWidth, 1e-6);
    m_view->showEvent(std::nullopt);
    m_view->showEvent(77);
    EXPECT_NEAR(m_view->scale().pixelAt(20.0), 0.2 * LaneWidth, 1e-6);
}

TEST_F(TracksViewTest, StaysInThePreviewWhenTheNextEventIsSelected)
{
    const double day = 24.0 * 60.0 * 60.0;
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 30.0);
    m_view->projectChanged();
    m_view->fitAll();
    const auto fitted = m_view->scale();
    m_view->showPreviewPlace();
    EXPECT_EQ(m_view->scale(), fitted) << "There is no preview yet.";

    m_host.addClip(track, u"preview", day + 2.0, day + 5.0);
    m_host.project.cycleLeft().setValue(0, day + 2.0);
    m_view->projectChanged();
    m_view->setChange(change(ChangeMap::State::Planned));
    m_view->fitAll();
    m_view->zoomBy(4.0);
    m_view->scrollTo(-10.0);
    m_view->showPreviewPlace();
    ASSERT_TRUE(m_view->showsPreviewPlace());
    m_view->showEvent(1);
    EXPECT_NEAR(m_view->scale().pixelAt(day + 20.0), 0.2 * LaneWidth, 1e-3) << "where the event will be";

    // The source is played in the film.
    m_host.project.cycleLeft().setValue(0, 2.0);
    m_view->showEvent(1);
    EXPECT_FALSE(m_view->showsPreviewPlace());
}

TEST_F(TracksViewTest, LocksATrackAsAnEntryOfTheUndoList)
{
    m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_view->projectChanged();
    const auto place = m_view->rows();
    int changes = 0;
    m_view->onTrackChanged = [&] { ++changes; };
    // Both buttons stand at the right of the name, the lock last.
    const juce::Point<int> lock(TrackHeaders::Width - 16, TimeRuler::Height + 12);
    standin::Track& track = *m_host.project.allTracks()[0];
    m_window->click(lock);
    EXPECT_TRUE(track.isLocked());
    EXPECT_EQ(m_host.project.undoList().nameAt(m_host.project.undoList().doneCount() - 1), u"Lock Track");
    EXPECT_TRUE(m_host.undo());
    EXPECT_FALSE(track.isLocked());
    m_window->click(lock);
    m_window->click(lock);
    EXPECT_FALSE(track.isLocked());
    EXPECT_EQ(m_host.project.undoList().nameAt(m_host.project.undoList().doneCount() - 1), u"Unlock Track");
    EXPECT_EQ(changes, 3);
}

TEST_F(TracksViewTest, LocksNothingWhileAnEditIsOpen)
{
    m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_view->projectChanged();
    m_host.edit(u"Edit", [&] {
        m_view->toggleLock(0);
        EXPECT_FALSE(m_host.project.allTracks()[0]->isLocked());
    });
}

TEST_F(TracksViewTest, SelectsATrackAloneByItsNameAndBesideOthersByItsButton)
{
    for (const char16_t* const name : {u"DIA 1", u"DIA 2"})
        m_host.addTrack(TypeWord::Audio, name);
    m_view->projectChanged();
    const auto tracks = m_host.project.allTracks();
    const std::size_t entries = m_host.project.undoList().size();
    m_window->click({40, TimeRuler::Height + 12});
    m_window->click({TrackHeaders::Width - 36, TimeRuler::Height + 40 + 12});
    EXPECT_TRUE(tracks[0]->selected() && tracks[1]->selected());
    m_window->click({40, TimeRuler::Height + 40 + 12});
    EXPECT_TRUE(!tracks[0]->selected() && tracks[1]->selected());
    m_window->click({TrackHeaders::Width - 36, TimeRuler::Height + 40 + 12});
    EXPECT_FALSE(tracks[1]->selected());
    EXPECT_EQ(m_host.project.undoList().size(), entries);
}

TEST_F(TracksViewTest, KeepsWhatIsSeenWhenTheProjectChanges)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_view->projectChanged();
    m_view->fitAll();
    m_view->zoomBy(3.0);
    const auto before = m_view->scale();
    m_host.addClip(track, u"more", 200.0, 300.0);
    m_view->projectChanged();
    drawn();
    EXPECT_EQ(m_view->scale(), before);
    EXPECT_EQ(m_view->index().rows()[0].lane.size(), 2U);
}

TEST_F(TracksViewTest, LooksAtTheProjectAgainOnlyWhenItIsTold)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_view->projectChanged();
    const auto* const rows = &m_view->index().rows()[0];
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_view->scrollTo(5.0);
    m_view->zoomBy(2.0);
    drawn();
    EXPECT_EQ(m_view->index().rows()[0].lane.size(), 0U);
    EXPECT_EQ(rows, &m_view->index().rows()[0]);
}

TEST_F(TracksViewTest, IsDrawnAtEverySizeAndPlace)
{
    const auto track = m_host.addTrack(TypeWord::Audio, u"DIA 1");
    m_host.addClip(track, u"film", 0.0, 100.0);
    m_host.addPoint(track, 1, 5.0, 0.9F);
    m_view->projectChanged();
    m_view->setChange(change(ChangeMap::State::Carried));
    m_view->setGhosts(true);
    for (const int side : {1, 13, 60, 250}) {
        m_view->setSize(side, side);
        for (const double left : {-1e9, -100.0, 0.0, 86400.0 * 3.0, 1e9}) {
            m_view->scrollTo(left);
            for (const double factor : {1e12, 1e-15}) {
                m_view->zoomBy(factor);
                drawn();
            }
        }
        m_view->fitAll();
    }
}

TEST_F(TracksViewTest, DrawsWhateverAProjectMayHold)
{
    for (std::uint64_t seed = 1; seed <= 40; ++seed) {
        standin::tests::SeededChance chance(seed);
        standin::ChangeLog log;
        const auto project = standin::tests::randomProject(chance, log);
        FakeStills stills;
        TracksView view(*project, m_host.application.edits(), &stills);
        view.setSize(600, 400);
        view.setChange(change(ChangeMap::State::Carried));
        view.setGhosts(true);
        view.showEvent(chance.below(3));
        for (const RowLayout::Size size : {RowLayout::Size::Small, RowLayout::Size::Large}) {
            view.setRowSize(size);
            view.createComponentSnapshot(view.getLocalBounds());
            for (std::size_t row = 0; row < view.rows().count(); ++row)
                view.clicked(row, static_cast<int>(chance.below(400)));
            view.zoomBy(3.0);
        }
        EXPECT_EQ(view.rows().count(), project->allTracks().size()) << seed;
    }
}

TEST_F(TracksViewTest, TurnsGhostsOnAndOffWithAKey)
{
    std::vector<bool> told;
    m_view->onGhosts = [&](bool shown) { told.push_back(shown); };
    EXPECT_TRUE(m_window->press('g'));
    EXPECT_TRUE(m_view->showsGhosts());
    EXPECT_TRUE(m_window->press('g'));
    EXPECT_EQ(told, (std::vector<bool>{true, false}));
}
