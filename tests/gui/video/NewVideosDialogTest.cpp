// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/NewVideosDialog.h"

#include "core/model/VideoList.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "gui/input/TcInput.h"
#include "gui/look/LookAndFeel.h"
#include "gui/video/VideoListTableModel.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestPool.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/GermanTexts.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/TestVideo.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Timecode;
using core::VideoList;
using gui::NewVideosDialog;
using gui::TcInput;
using gui::VideoColumn;
using gui::VideoListTableModel;
using util::Result;
using Entry = VideoList::Entry;
using Mode = gui::VideoTrackHandlerBase::Mode;
using Texts = std::vector<std::string>;
using Messages = std::vector<std::wstring>;

constexpr std::uint32_t Minute = 1500;
constexpr const char* IsTaken = "Another video starts at this timecode.";

/// The dialog over a window that tells it of changes of the list, as the main window does.
class NewVideosDialogTest : public testing::Test, private core::ChangeContextListenerInterface {
protected:
    NewVideosDialogTest()
    {
        m_window.addAndMakeVisible(m_beneath);
        m_beneath.setBounds(0, 0, 1300, 750);
        m_window.addChildComponent(*m_dialog);
        m_dialog->setBeneath(&m_beneath);
        m_dialog->setBounds(0, 0, 1300, 750);
        m_pool.videos = {{L"/picture/reel3_v12.mov", 2 * Minute},
                         {L"/picture/reel1_v12.mov", Minute},
                         {L"/picture/reel2_v12.mov", 3 * Minute}};
        m_list.addListener(this);
    }
    ~NewVideosDialogTest() override { m_list.removeListener(this); }

    void fill()
    {
        m_dialog->setTrackHandler(&m_video.tracks);
        m_dialog->setVideoList(&m_list, &m_pool);
        m_dialog->setTimeOrigin(3600.0);
    }
    void open()
    {
        fill();
        m_dialog->setVisible(true);
    }
    bool isOpen() const { return m_dialog->isVisible(); }

    std::vector<juce::Component*> allNamed(const std::string& name) const
    {
        std::vector<juce::Component*> found;
        for (juce::Component* const component : m_dialog->getChildren()) {
            if (component->getName() == juce::String(name))
                found.push_back(component);
        }
        return found;
    }
    juce::Component& named(const std::string& name) const
    {
        const auto found = allNamed(name);
        if (found.size() != 1)
            throw std::runtime_error("there is not one " + name);
        return *found.front();
    }
    juce::TableListBox& table() const { return dynamic_cast<juce::TableListBox&>(named("VideosTable")); }
    bool hasModel() const { return table().getModel() != nullptr; }
    juce::ToggleButton& use(int row) const
    {
        return dynamic_cast<juce::ToggleButton&>(*table().getCellComponent(VideoColumn::Use, row));
    }
    TcInput& start(int row) const { return dynamic_cast<TcInput&>(*table().getCellComponent(VideoColumn::Start, row)); }
    juce::ToggleButton& track(const std::string& name) const { return dynamic_cast<juce::ToggleButton&>(named(name)); }
    /// "1Old 1New 2Old 2New", with "x" for what is ticked, "-" for what isn't, and "." for what is disabled.
    std::string ticks() const
    {
        std::string all;
        for (const char* const name :
             {"videoTrack1OldSelect", "videoTrack1NewSelect", "videoTrack2OldSelect", "videoTrack2NewSelect"}) {
            const juce::ToggleButton& box = track(name);
            all += box.getToggleState() ? 'x' : box.isEnabled() ? '-' : '.';
        }
        return all;
    }
    Texts trackNames() const
    {
        Texts names;
        for (juce::Component* const component : allNamed("videoTrackLabel1"))
            names.push_back(dynamic_cast<juce::Label&>(*component).getText().toStdString());
        return names;
    }
    std::string spoken(int row, int column) const
    {
        return dynamic_cast<VideoListTableModel&>(*table().getModel()).getSpokenCell(row, column).toStdString();
    }
    /// "name start", with a mark for what is used.
    Texts shown() const
    {
        Texts rows;
        for (int row = 0; hasModel() && row < table().getModel()->getNumRows(); ++row)
            rows.push_back(std::string(use(row).getToggleState() ? "*" : "") + spoken(row, VideoColumn::Name) + " " +
                           start(row).getValue().toString());
        return rows;
    }
    /// As a user does who types it.
    void enter(int row, const char* value) { start(row).setValue(Timecode(value), juce::sendNotification); }
    std::vector<int> selectedRows() const
    {
        std::vector<int> rows;
        for (int index = 0; index < table().getNumSelectedRows(); ++index)
            rows.push_back(table().getSelectedRow(index));
        return rows;
    }
    bool hasFocus(const juce::Component& component) const { return component.hasKeyboardFocus(true); }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    TestProject m_project;
    RecordingUndo m_undo;
    RecordingAlerts m_alerts;
    VideoList m_list;
    TestPool m_pool;
    TestVideo m_video;
    FocusedWindow m_window{1300, 750};
    juce::Component m_beneath;
    std::unique_ptr<NewVideosDialog> m_dialog = std::make_unique<NewVideosDialog>();
    std::function<void()> m_onChange; ///< called instead of the refreshing

private:
    void onChange(const core::ChangeContext&) override
    {
        if (m_onChange)
            m_onChange();
        else if (m_dialog)
            m_dialog->refresh(&m_pool);
    }
};

const Texts AllUnused{"reel1_v12.mov 01:00:00:00", "reel2_v12.mov 01:00:00:00", "reel3_v12.mov 01:00:00:00"};
const Texts FirstUsed{"*reel1_v12.mov 01:00:00:00", "reel2_v12.mov 01:01:00:00", "reel3_v12.mov 01:01:00:00"};

// ---- Layout --------------------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, CountsItsPlacesFromTheRightAndLowerEdges)
{
    const NewVideosDialog fresh;
    EXPECT_EQ(fresh.getLocalBounds(), juce::Rectangle<int>(0, 0, 1000, 750));

    struct Place {
        const char* name;
        std::size_t index; ///< among those of the same name, in the order below
        int x, y, width, height;
    };
    const std::vector<Place> places{
        {"Unused Videos", 0, 1081, 312, 342, 24},
        {"New Videos", 0, 1080, 393, 472, 24},
        {"HLine1", 0, 1082, 367, 862, 1},
        {"VideosTable", 0, 1080, 281, 860, 210},
        {"descriptionNewVideo", 0, 1080, 350, 853, 24},
        {"trackAssignmentTitle", 0, 1080, 613, 472, 24},
        {"HLine1", 1, 1082, 587, 862, 1},
        {"descriptionNewVideo", 1, 1080, 573, 853, 24},
        {"videoTrackLabel1", 0, 1075, 530, 150, 24},
        {"videoTrackOldTitle", 0, 506, 529, 150, 24},
        {"videoTrackOldTitle", 1, 364, 529, 150, 24},
        {"videoTrackLabel1", 1, 1067, 496, 543, 24},
        {"videoTrackLabel1", 2, 1067, 464, 543, 24},
        {"videoTrack1OldSelect", 0, 502, 496, 112, 24},
        {"videoTrack2OldSelect", 0, 502, 460, 112, 24},
        {"videoTrack2NewSelect", 0, 359, 460, 113, 24},
        {"videoTrack1NewSelect", 0, 359, 496, 113, 24},
    };
    for (const juce::Point<int> size : {juce::Point<int>(1000, 750), {1300, 750}, {1920, 1100}}) {
        m_dialog->setSize(size.x, size.y);
        for (const Place& place : places) {
            const juce::Rectangle<int> expected(size.x - place.x, size.y - place.y, place.width, place.height);
            const auto found = allNamed(place.name);
            ASSERT_LT(place.index, found.size()) << place.name;
            EXPECT_EQ(found[place.index]->getBounds().toString(), expected.toString())
                << place.name << " at " << size.toString();
        }
    }
}

TEST_F(NewVideosDialogTest, HasItsTexts)
{
    const auto text = [this](const char* name, std::size_t index) {
        return dynamic_cast<juce::Label&>(*allNamed(name).at(index)).getText().toStdString();
    };
    EXPECT_EQ(text("Unused Videos", 0), "Available Videos in Pool");
    EXPECT_EQ(text("New Videos", 0), "New Video Track Configuration");
    EXPECT_EQ(text("descriptionNewVideo", 0),
              "Select the video file(s) for the new edit version. This ensures a correct result of the video preview.");
    EXPECT_EQ(text("trackAssignmentTitle", 0), "Video Track Assignment");
    EXPECT_EQ(text("descriptionNewVideo", 1), "Specify which video track contains the old/new edit version.");
    EXPECT_EQ(text("videoTrackOldTitle", 0), "Old Edit Version");
    EXPECT_EQ(text("videoTrackOldTitle", 1), "New Edit Version");
    EXPECT_EQ(trackNames(), (Texts{"Video Track Name", "No track available.", "No track available."}));
}

TEST_F(NewVideosDialogTest, HasATableThatIsNotSortedNorResizedByItsHeader)
{
    open();
    juce::TableHeaderComponent& header = table().getHeader();
    const std::vector<std::pair<std::string, int>> columns{
        {"Name", 380}, {"Use as New Video", 180}, {"Start", 100}, {"End", 100}, {"Length", 100}};
    ASSERT_EQ(header.getNumColumns(true), 5);
    for (int index = 0; index < 5; ++index) {
        const int id = header.getColumnIdOfIndex(index, true);
        EXPECT_EQ(id, index + 1);
        EXPECT_EQ(header.getColumnName(id).toStdString(), columns[static_cast<std::size_t>(index)].first);
        EXPECT_EQ(header.getColumnWidth(id), columns[static_cast<std::size_t>(index)].second);
    }
    EXPECT_EQ(table().getRowHeight(), 30);

    m_window.click(m_window.getLocalPoint(&header, juce::Point<int>(20, 10)));
    EXPECT_EQ(header.getSortColumnId(), 0);
    EXPECT_FALSE(table().getHorizontalScrollBar().isVisible());
}

TEST_F(NewVideosDialogTest, HasNoHorizontalScrollBarWhenThereAreMoreVideosThanFit)
{
    for (int number = 10; number < 40; ++number)
        m_pool.videos.push_back({L"/picture/more" + std::to_wstring(number) + L".mov", Minute});
    open();

    EXPECT_TRUE(table().getVerticalScrollBar().isVisible());
    EXPECT_FALSE(table().getHorizontalScrollBar().isVisible());
}

// ---- Coming and going ----------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, HasItsRowsOnlyWhileItShows)
{
    fill();
    EXPECT_FALSE(hasModel());
    EXPECT_EQ(m_pool.listeners, 0);

    m_dialog->setVisible(true);
    EXPECT_EQ(shown(), AllUnused);
    EXPECT_EQ(m_pool.listeners, 1);

    m_dialog->setVisible(false);
    EXPECT_FALSE(hasModel());
    EXPECT_EQ(m_pool.listeners, 0);
}

TEST_F(NewVideosDialogTest, IsEnabledExactlyWithAList)
{
    EXPECT_FALSE(m_dialog->isEnabled());
    m_dialog->setVideoList(&m_list, nullptr);
    EXPECT_TRUE(m_dialog->isEnabled());
    m_dialog->setVideoList(nullptr, &m_pool);
    EXPECT_FALSE(m_dialog->isEnabled());
}

TEST_F(NewVideosDialogTest, HasNoRowsWithoutAListOrAPool)
{
    m_dialog->setVisible(true);
    EXPECT_FALSE(hasModel());
    m_dialog->setVideoList(&m_list, nullptr);
    EXPECT_FALSE(hasModel());
    m_dialog->setVideoList(nullptr, &m_pool);
    EXPECT_FALSE(hasModel());
    m_dialog->setVideoList(&m_list, &m_pool);
    EXPECT_TRUE(hasModel());
    m_dialog->setVideoList(nullptr, nullptr);
    EXPECT_FALSE(hasModel());
    EXPECT_EQ(m_pool.listeners, 0);
}

TEST_F(NewVideosDialogTest, KeepsPoolAndOriginWhileItIsHidden)
{
    m_dialog->setVideoList(&m_list, nullptr);
    TestPool later({{L"/picture/reel9.mov", Minute}});
    m_dialog->refresh(&later);
    m_dialog->setTimeOrigin(36000.0);
    EXPECT_FALSE(hasModel());

    m_dialog->setVisible(true);

    EXPECT_EQ(shown(), (Texts{"reel9.mov 10:00:00:00"}));
    m_dialog->setVideoList(nullptr, nullptr);
}

TEST_F(NewVideosDialogTest, FollowsPoolAndOriginWhileItShows)
{
    open();
    m_dialog->setTimeOrigin(36000.0);
    EXPECT_EQ(shown().front(), "reel1_v12.mov 10:00:00:00");

    m_pool.videos.erase(m_pool.videos.begin() + 1);
    m_pool.tell();
    EXPECT_EQ(shown(), (Texts{"reel2_v12.mov 10:00:00:00", "reel3_v12.mov 10:00:00:00"}));

    TestPool later({{L"/picture/reel9.mov", Minute}});
    m_dialog->refresh(&later);
    EXPECT_EQ(shown(), (Texts{"reel9.mov 10:00:00:00"}));
    EXPECT_EQ(m_pool.listeners, 0);

    m_dialog->refresh(nullptr);
    EXPECT_FALSE(hasModel());
    EXPECT_EQ(later.listeners, 0);
}

TEST_F(NewVideosDialogTest, ShowsTheListOfAnotherProject)
{
    open();
    VideoList other;
    other.add(Entry("/picture/reel2_v12.mov", Timecode("02:00:00:00"), Timecode("00:03:00:00")), false);

    m_dialog->setVideoList(&other, &m_pool);

    EXPECT_EQ(shown(), (Texts{"reel1_v12.mov 02:03:00:00", "*reel2_v12.mov 02:00:00:00", "reel3_v12.mov 02:03:00:00"}));
    m_dialog->setVideoList(nullptr, nullptr);
}

TEST_F(NewVideosDialogTest, ClosesOnAClickOutsideOfItsPanel)
{
    struct Case {
        int x, y;
        bool closes;
    };
    // The panel reaches from 208 to 1100 and from 119 to 710.
    for (const Case& click : std::vector<Case>{{207, 400, true},
                                               {208, 400, false},
                                               {1100, 690, false},
                                               {1101, 400, true},
                                               {650, 118, true},
                                               {1000, 119, false},
                                               {1000, 710, false},
                                               {650, 711, true}}) {
        open();
        m_window.click(juce::Point<int>(click.x, click.y));
        EXPECT_EQ(isOpen(), !click.closes) << click.x << " " << click.y;
        EXPECT_EQ(hasModel(), !click.closes);
    }
}

TEST_F(NewVideosDialogTest, ClosesOnReturnAndOnEscape)
{
    for (const int key : {juce::KeyPress::returnKey, juce::KeyPress::escapeKey}) {
        open();
        EXPECT_TRUE(hasFocus(track("videoTrack1OldSelect")));
        EXPECT_FALSE(m_beneath.isEnabled());

        EXPECT_TRUE(m_window.press(key));
        EXPECT_FALSE(isOpen());
        EXPECT_TRUE(m_beneath.isEnabled());
    }
}

TEST_F(NewVideosDialogTest, ClosesOnReturnAlsoInItsTable)
{
    open();
    table().selectRow(0);
    table().grabKeyboardFocus();

    m_window.press(juce::KeyPress::returnKey);

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_list.isEmpty());
}

TEST_F(NewVideosDialogTest, HasTheFocusOnItsTableWhereThereAreNoTracks)
{
    for (auto& missing : m_video.tracks.tracks)
        missing.isAvailable = false;
    open();

    EXPECT_TRUE(table().hasKeyboardFocus(false));
}

TEST_F(NewVideosDialogTest, LeavesTracksAndPoolWhenItGoes)
{
    open();
    m_dialog.reset();

    // Nobody is there to be told; under the sanitizer a call would show.
    m_video.tracks.tell();
    m_pool.tell();
    EXPECT_EQ(m_pool.listeners, 0);
}

// ---- Tracks --------------------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, ShowsWhichTrackCarriesWhichPicture)
{
    open();
    EXPECT_EQ(trackNames(), (Texts{"Video Track Name", "VIDEO old", "VIDEO new"}));
    EXPECT_EQ(ticks(), "x--x");

    m_video.tracks.tracks[0].mode = Mode::NewOff;
    m_video.tracks.tracks[1].mode = Mode::OldOff;
    m_video.tracks.tell();
    EXPECT_EQ(ticks(), "----");

    m_video.tracks.tracks[0].mode = Mode::New;
    m_video.tracks.tracks[1].mode = Mode::None;
    m_video.tracks.tracks[1].name = L"VIDEO 2";
    m_video.tracks.tell();
    EXPECT_EQ(ticks(), "-x--");
    EXPECT_EQ(trackNames()[2], "VIDEO 2");
}

TEST_F(NewVideosDialogTest, AProjectWithOneVideoTrackHasNoSecondOne)
{
    m_video.tracks.tracks[1] = {false, L"gone", Mode::New};
    open();

    EXPECT_EQ(trackNames(), (Texts{"Video Track Name", "VIDEO old", "No track available."}));
    EXPECT_EQ(ticks(), "x-..");
}

/// Tells nobody the name of the first.
class FirstTrackNameless : public TestTracks {
public:
    std::wstring getName(std::size_t channel) override
    {
        if (channel == 0)
            throw Result::HostCallFailed;
        return TestTracks::getName(channel);
    }
};

TEST_F(NewVideosDialogTest, ShowsATrackAlsoWhenTheOneBeforeCannotBeRead)
{
    FirstTrackNameless tracks;
    open();
    m_dialog->setTrackHandler(nullptr);
    EXPECT_NO_THROW(m_dialog->setTrackHandler(&tracks));
    EXPECT_EQ(trackNames(), (Texts{"Video Track Name", "No track available.", "VIDEO new"}));
    EXPECT_EQ(ticks(), "..-x");

    tracks.tracks[1].mode = Mode::Old;
    tracks.tell();
    EXPECT_EQ(ticks(), "..x-");
    m_dialog->setTrackHandler(nullptr);
}

TEST_F(NewVideosDialogTest, HasNoTracksWithoutAHandler)
{
    open();
    m_dialog->setTrackHandler(nullptr);
    EXPECT_EQ(ticks(), "....");

    m_video.tracks.tell();
    EXPECT_EQ(ticks(), "....");
}

TEST_F(NewVideosDialogTest, GivesTheTracksTheirPictures)
{
    open();
    const std::vector<std::pair<const char*, const char*>> clicks{
        {"videoTrack1OldSelect", "0:2"}, {"videoTrack1OldSelect", "0:0"}, {"videoTrack1NewSelect", "0:1"},
        {"videoTrack1NewSelect", "0:3"}, {"videoTrack2OldSelect", "1:0"}, {"videoTrack2OldSelect", "1:2"},
        {"videoTrack2NewSelect", "1:1"}, {"videoTrack2NewSelect", "1:3"},
    };
    Texts expected;
    for (const auto& [name, call] : clicks) {
        m_window.click(track(name));
        expected.emplace_back(call);
        EXPECT_EQ(m_video.tracks.calls, expected) << name;
    }
    EXPECT_EQ(ticks(), "----");
}

TEST_F(NewVideosDialogTest, ShowsATrackThatRefusesAsItIs)
{
    open();
    m_video.tracks.failure = Result::HostCallFailed;

    m_window.click(track("videoTrack1NewSelect"));

    EXPECT_EQ(ticks(), "x--x");
    EXPECT_EQ(m_alerts.messages, Messages{L"The workstation has refused this. Check that no track is locked."});
}

// ---- Videos --------------------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, UsesAVideoByAClick)
{
    open();

    m_window.click(use(0));

    EXPECT_EQ(shown(), FirstUsed);
    ASSERT_EQ(m_list.size(), 1U);
    EXPECT_EQ(m_list.at(0), Entry("/picture/reel1_v12.mov", Timecode("01:00:00:00"), Timecode("00:01:00:00")));
    EXPECT_EQ(m_undo.entries, Messages{L"Add New Video"});

    m_window.click(use(0));
    EXPECT_EQ(shown(), AllUnused);
    EXPECT_EQ(m_undo.entries, (Messages{L"Add New Video", L"Remove New Video"}));
}

TEST_F(NewVideosDialogTest, ShowsWhatHasBecomeOfAnEditAlsoWhenNobodyTellsIt)
{
    open();
    m_onChange = [] {};

    m_window.click(use(0));

    EXPECT_EQ(shown(), FirstUsed);
}

TEST_F(NewVideosDialogTest, MovesAVideoThatIsUsed)
{
    open();
    m_window.click(use(0));

    enter(0, "02:00:00:00");

    EXPECT_EQ(m_list.at(0).start, Timecode("02:00:00:00"));
    EXPECT_EQ(shown(), (Texts{"*reel1_v12.mov 02:00:00:00", "reel2_v12.mov 02:01:00:00", "reel3_v12.mov 02:01:00:00"}));
    EXPECT_EQ(m_undo.entries, (Messages{L"Add New Video", L"Move New Video"}));
}

TEST_F(NewVideosDialogTest, ShowsWhereAnUnusedVideoWouldEnd)
{
    open();

    enter(0, "02:00:00:00");

    EXPECT_EQ(spoken(0, VideoColumn::End), "End 02:01:00:00");
    EXPECT_TRUE(m_list.isEmpty());
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(NewVideosDialogTest, AVideoThatRunsPastTheDayShowsItsLastTimecode)
{
    open();

    enter(0, "23:59:59:00");

    EXPECT_EQ(spoken(0, VideoColumn::End), "End 23:59:59:24");
}

TEST_F(NewVideosDialogTest, TakesTheStartThatIsTyped)
{
    open();
    m_window.click(use(0));
    start(0).grabKeyboardFocus();
    ASSERT_TRUE(hasFocus(start(0)));

    m_window.type("02000000");

    EXPECT_EQ(m_list.at(0).start, Timecode("02:00:00:00"));
    EXPECT_TRUE(hasFocus(start(0)));
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_FALSE(isOpen());
}

TEST_F(NewVideosDialogTest, TakesNoStartThatTheRateDoesNotHave)
{
    open();
    m_window.click(use(0));
    start(0).grabKeyboardFocus();

    m_window.type("01000025");
    EXPECT_EQ(m_list.at(0).start, Timecode("01:00:00:00"));

    m_window.type("24");
    EXPECT_EQ(m_list.at(0).start, Timecode("01:00:00:24"));
}

TEST_F(NewVideosDialogTest, TakesTheStartThatWasTypedWhenItIsClosedByAClickOutside)
{
    open();
    m_window.click(use(0));
    start(0).grabKeyboardFocus();
    m_window.type("02");

    m_window.click(juce::Point<int>(10, 10));

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_list.at(0).start, Timecode("02:00:00:00"));
}

TEST_F(NewVideosDialogTest, EscapeRestoresTheStartBeforeItCloses)
{
    open();
    m_window.click(use(0));
    start(0).grabKeyboardFocus();
    m_window.type("02");

    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_TRUE(isOpen());
    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_list.at(0).start, Timecode("01:00:00:00"));
}

TEST_F(NewVideosDialogTest, RefusesAStartThatIsTakenWithAWord)
{
    open();
    m_window.click(use(0));
    enter(1, "01:00:00:00");
    EXPECT_TRUE(m_alerts.messages.empty()) << "it isn't used yet";

    m_window.click(use(1));
    EXPECT_EQ(m_alerts.messages, Messages{juce::String(IsTaken).toWideCharPointer()});
    EXPECT_EQ(shown(), (Texts{"*reel1_v12.mov 01:00:00:00", "reel2_v12.mov 01:00:00:00", "reel3_v12.mov 01:01:00:00"}));

    m_window.click(use(2));
    enter(2, "01:00:00:00");
    EXPECT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_EQ(shown()[2], "*reel3_v12.mov 01:01:00:00");
    EXPECT_EQ(m_undo.entries, (Messages{L"Add New Video", L"Add New Video"}));
}

TEST_F(NewVideosDialogTest, TellsOfAStartThatIsTakenWhenTheKeyboardLeavesIt)
{
    open();
    m_window.click(use(0));
    m_window.click(use(1));
    start(1).grabKeyboardFocus();
    m_window.type("0100");

    m_window.click(use(2));

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(shown()[1], "*reel2_v12.mov 01:01:00:00");
    EXPECT_EQ(shown()[2], "*reel3_v12.mov 01:04:00:00") << "the click counts";
}

TEST_F(NewVideosDialogTest, ShowsWhatIsThereWhenTheUndoEntryFails)
{
    open();
    m_undo.failure = Result::HostCallFailed;

    m_window.click(use(0));

    EXPECT_EQ(shown(), AllUnused);
    EXPECT_EQ(m_alerts.messages.size(), 1U);
}

TEST_F(NewVideosDialogTest, MayBeClosedOrDestroyedByWhoIsToldOfItsChange)
{
    open();
    m_onChange = [this] { m_dialog->setVisible(false); };
    m_window.click(use(0));
    EXPECT_FALSE(isOpen());

    m_onChange = nullptr;
    open();
    m_onChange = [this] { m_dialog.reset(); };
    start(0).grabKeyboardFocus();
    m_window.type("02000000");
    EXPECT_EQ(m_dialog, nullptr);
    EXPECT_EQ(m_list.at(0).start, Timecode("02:00:00:00"));
}

TEST_F(NewVideosDialogTest, MayBeClosedWhileItsAlertIsOpen)
{
    open();
    m_window.click(use(0));
    enter(1, "01:00:00:00");
    m_alerts.meanwhile = [this] { m_dialog.reset(); };

    m_window.click(use(1));

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_dialog, nullptr);
}

TEST_F(NewVideosDialogTest, NothingOfWhatWasTypedReachesAnotherVideo)
{
    open();
    m_window.click(use(0));
    start(0).grabKeyboardFocus();
    m_window.type("0");

    // The pool gets a video before the others, so that all rows move down.
    m_pool.videos.push_back({L"/picture/reel0_v12.mov", Minute});
    m_pool.tell();

    EXPECT_EQ(shown()[0], "reel0_v12.mov 01:01:00:00");
    EXPECT_EQ(shown()[1], "*reel1_v12.mov 01:00:00:00");
    EXPECT_TRUE(hasFocus(start(1)));
    m_window.type("02000000");
    EXPECT_EQ(shown()[0], "reel0_v12.mov 02:01:00:00");
    EXPECT_EQ(shown()[1], "*reel1_v12.mov 02:00:00:00");
}

TEST_F(NewVideosDialogTest, WhatIsBeingTypedStaysWhenTheListIsTold)
{
    open();
    start(1).grabKeyboardFocus();
    m_window.type("0");

    m_dialog->refresh(&m_pool);
    m_window.type("2000000");

    EXPECT_EQ(shown()[1], "reel2_v12.mov 02:00:00:00");
}

TEST_F(NewVideosDialogTest, GivesTheFocusToTheTableWhenTheVideoIsGone)
{
    open();
    start(1).grabKeyboardFocus();

    m_pool.videos.pop_back();
    m_pool.tell();

    EXPECT_TRUE(table().hasKeyboardFocus(false));
}

TEST_F(NewVideosDialogTest, ShowsZerosForAStartThatTheRateDoesNotHave)
{
    m_list.add(Entry("/picture/reel1_v12.mov", Timecode("01:00:00:28"), Timecode("00:01:00:00")), false);
    open();

    EXPECT_EQ(shown()[0], "*reel1_v12.mov 00:00:00:00");
    EXPECT_EQ(spoken(0, VideoColumn::End), "End 23:59:59:24");
}

TEST_F(NewVideosDialogTest, ShowsNothingWithoutAProject)
{
    {
        const NoProject none;
        open();
    }
    EXPECT_EQ(shown(), Texts{});
    m_dialog->refresh(&m_pool);
    EXPECT_EQ(shown().size(), 3U);
}

// ---- The table -----------------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, TheSpaceBarUsesTheSelectedVideosOneAfterTheOther)
{
    open();
    table().grabKeyboardFocus();
    m_window.press(juce::KeyPress::downKey);
    m_window.press(juce::KeyPress::downKey, juce::ModifierKeys(juce::ModifierKeys::shiftModifier));
    ASSERT_EQ(selectedRows(), (std::vector<int>{0, 1}));

    m_window.press(juce::KeyPress::spaceKey);
    EXPECT_EQ(shown(),
              (Texts{"*reel1_v12.mov 01:00:00:00", "*reel2_v12.mov 01:01:00:00", "reel3_v12.mov 01:04:00:00"}));
    EXPECT_EQ(selectedRows(), (std::vector<int>{0, 1}));

    m_window.press(juce::KeyPress::spaceKey);
    EXPECT_EQ(shown(), AllUnused);
}

TEST_F(NewVideosDialogTest, TellsOnceWhenSeveralStartsAreTaken)
{
    open();
    m_window.click(use(0));
    enter(1, "01:00:00:00");
    enter(2, "01:00:00:00");
    table().grabKeyboardFocus();
    table().selectRangeOfRows(1, 2);

    m_window.press(juce::KeyPress::spaceKey);

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_list.size(), 1U);
}

TEST_F(NewVideosDialogTest, SelectedVideosStaySelectedWhenThePoolChanges)
{
    open();
    table().selectRow(1);
    table().selectRow(2, true, false);

    m_pool.videos.push_back({L"/picture/reel0_v12.mov", Minute});
    m_pool.tell();

    EXPECT_EQ(selectedRows(), (std::vector<int>{2, 3}));
}

TEST_F(NewVideosDialogTest, TheFirstSelectedVideoStaysSelectedWhenTheTableIsSorted)
{
    open();
    table().selectRow(0);
    table().selectRow(1, true, false);

    table().getModel()->sortOrderChanged(VideoColumn::Name, true);

    EXPECT_EQ(spoken(0, VideoColumn::Name), "reel3_v12.mov");
    EXPECT_EQ(selectedRows(), (std::vector<int>{2}));
}

TEST_F(NewVideosDialogTest, TheRowThatGetsTheKeyboardComesIntoView)
{
    for (int number = 10; number < 40; ++number)
        m_pool.videos.push_back({L"/picture/more" + std::to_wstring(number) + L".mov", Minute});
    open();
    use(0).grabKeyboardFocus();
    const auto isFocusInView = [this] {
        const juce::Component* const focused = juce::Component::getCurrentlyFocusedComponent();
        const auto place = table().getViewport()->getLocalArea(focused, focused->getLocalBounds());
        return table().getViewport()->getLocalBounds().contains(place);
    };

    for (int press = 0; press < 60; ++press) {
        m_window.press(juce::KeyPress::tabKey);
        EXPECT_TRUE(!hasFocus(table()) || isFocusInView()) << press;
    }
    EXPECT_GT(table().getViewport()->getViewPositionY(), 0);
}

TEST_F(NewVideosDialogTest, TellsByAWordWhichVideoIsMissingAndRemovesItByAClick)
{
    m_list.add(Entry("/gone/reel9_v11.mov", Timecode("05:00:00:00"), Timecode("00:01:00:00")), false);
    open();
    ASSERT_EQ(shown().back(), "*Missing: reel9_v11.mov 05:00:00:00");
    EXPECT_EQ(use(3).getTitle(), "Use as New Video, Missing: reel9_v11.mov");

    m_window.click(use(3));

    EXPECT_TRUE(m_list.isEmpty());
    EXPECT_EQ(shown(), AllUnused);
    EXPECT_EQ(m_undo.entries, Messages{L"Remove New Video"});
}

TEST_F(NewVideosDialogTest, KeepsASelectionOfManyVideosInAShortTime)
{
    m_pool.videos.clear();
    for (int number = 0; number < 10000; ++number)
        m_pool.videos.push_back({L"/picture/reel " + std::to_wstring(number) + L" v12.mov", Minute});
    open();
    juce::SparseSet<int> every;
    every.addRange({0, 10000});
    for (int row = 1; row < 10000; row += 2)
        every.removeRange({row, row + 1});
    table().setSelectedRows(every);
    double best = 1e9;
    for (int run = 0; run < 5; ++run)
        best = std::min(best, secondsOf([this] { m_dialog->refresh(&m_pool); }));
    std::cout << "refresh with every other row selected: " << best * 1000.0 << " ms\n";

    EXPECT_EQ(table().getNumSelectedRows(), 5000);
    EXPECT_LT(best, CADREL_ADDRESS_SANITIZER ? 2.0 : 0.1);
}

TEST_F(NewVideosDialogTest, TellsScreenReadersWhatItsCellsAre)
{
    open();
    EXPECT_EQ(spoken(0, VideoColumn::Name), "reel1_v12.mov");
    EXPECT_EQ(use(0).getTitle(), "Use as New Video, reel1_v12.mov");
    EXPECT_EQ(start(0).getTitle(), "Start, reel1_v12.mov");
    EXPECT_EQ(spoken(0, VideoColumn::End), "End 01:01:00:00");
    EXPECT_EQ(spoken(0, VideoColumn::Length), "Length 00:01:00:00");
    EXPECT_EQ(spoken(3, VideoColumn::Length), "");
    EXPECT_EQ(track("videoTrack1OldSelect").getTitle(), "Old Edit Version, VIDEO old");
    EXPECT_EQ(m_dialog->getTitle(), "Video Preview Settings");
}

TEST_F(NewVideosDialogTest, OwnsTheInputsOfItsCellsOnce)
{
    open();
    const juce::Component::SafePointer<juce::Component> box(&use(0));
    const juce::Component::SafePointer<juce::Component> input(&start(0));

    m_dialog->refresh(&m_pool);
    EXPECT_EQ(box.getComponent(), &use(0)) << "they are used again";
    EXPECT_EQ(input.getComponent(), &start(0));

    m_dialog->setVisible(false);
    EXPECT_EQ(box, nullptr);
    EXPECT_EQ(input, nullptr);
}

TEST_F(NewVideosDialogTest, HasNoTooltipsInItsTable)
{
    open();
    EXPECT_EQ(table().getModel()->getCellTooltip(0, VideoColumn::Name), "");
}

// ---- Looks ---------------------------------------------------------------------------------------------------------

TEST_F(NewVideosDialogTest, HasNoTextThatIsCutInAnyLanguage)
{
    open();
    EXPECT_EQ(cutTextsOf(*m_dialog), Texts{});

    const GermanTexts german;
    const NewVideosDialog dialog;
    EXPECT_EQ(cutTextsOf(dialog), Texts{});
}

TEST_F(NewVideosDialogTest, LooksAsItDoesWithVideos)
{
    open();
    m_window.click(use(0));
    m_window.click(use(1));
    table().selectRow(2);

    expectPicture(*m_dialog, "new-videos");
}

TEST_F(NewVideosDialogTest, LooksAsItDoesWithLongNamesAndOneTrack)
{
    m_video.tracks.tracks[1].isAvailable = false;
    for (int number = 10; number < 40; ++number)
        m_pool.videos.push_back({L"/picture/The very long name of a film that nobody can remember, reel " +
                                     std::to_wstring(number) + L", version 12, without burn-in.mov",
                                 Minute * 23});
    open();
    m_window.click(use(1));
    start(1).grabKeyboardFocus();

    expectPicture(*m_dialog, "new-videos-long-names");
}

TEST_F(NewVideosDialogTest, LooksAsItDoesWithAVideoThatIsMissing)
{
    m_list.add(Entry("/gone/reel2_v11.mov", Timecode("01:01:00:00"), Timecode("00:02:00:00")), false);
    m_list.add(Entry("/picture/reel1_v12.mov", Timecode("01:00:00:00"), Timecode("00:01:00:00")), false);
    open();

    expectPicture(*m_dialog, "new-videos-missing");
}

TEST_F(NewVideosDialogTest, LooksAsItDoesWhenItIsDisabled)
{
    m_dialog->setTrackHandler(&m_video.tracks);
    m_dialog->setVisible(true);

    expectPicture(*m_dialog, "new-videos-disabled");
}

} // namespace
} // namespace cadrel::tests
