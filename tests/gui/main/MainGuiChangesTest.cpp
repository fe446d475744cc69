// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/TcInput.h"
#include "gui/look/Text.h"
#include "gui/video/VideoRows.h"
#include "gui/video/VideoTable.h"
#include "tests/gui/main/ShownWindow.h"
#include "tests/support/TempFolder.h"
#include "tests/support/window/WindowOnScreen.h"

#include <utility>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::EventListChangeContext;
using core::ListKind;
using core::PropertyKey;
using gui::Palette;
using util::Result;

// ---- A preview that is on while its list changes -------------------------------------------------------------------

class MainGuiPreviewTest : public ShownWindow {
protected:
    void showPreview()
    {
        showThree();
        select("Change", {1});
        click("new component");
        m_engine.calls.clear();
        m_undo.begun.clear();
        m_undo.entries.clear();
    }
    void editEvent(const std::string& tableName, const char* srcIn)
    {
        select(tableName, {1});
        m_engine.calls.clear();
        table(tableName).grabKeyboardFocus();
        m_window.press(juce::KeyPress::returnKey);
        ASSERT_TRUE(editDialog().isVisible());
        find<gui::TcInput>(editDialog(), "m_copyInEdit").setValue(core::Timecode(srcIn), juce::sendNotification);
        m_window.press(juce::KeyPress::returnKey);
    }
    void addEdl(int x, int y)
    {
        const std::string path = m_folder
                                     .write("reel.edl", "001  A001 V     C        10:00:00:00 10:00:05:00 "
                                                        "01:00:00:00 01:00:05:00\n")
                                     .string();
        dynamic_cast<juce::FileDragAndDropTarget&>(controls()).filesDropped({juce::String(path)}, x, y);
        ASSERT_TRUE(fileDialog().isVisible());
        m_window.press(juce::KeyPress::returnKey);
    }
    void addToChangeEdl() { addEdl(200, 500); }
    void addToOldEdl() { addEdl(200, 150); }

    TempFolder m_folder;
};

TEST_F(MainGuiPreviewTest, IsEndedBeforeTheEditBoxMakesItsUndoEntry)
{
    showPreview();
    std::vector<std::wstring> begun{L"not called"};
    m_engine.onPreview = [&] { begun = m_undo.begun; };
    editEvent("Change", "01:00:05:01");

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_EQ(begun, Texts());
    EXPECT_EQ(m_undo.entries, Texts{L"Edit EDL Event"});
    EXPECT_EQ(list(ListKind::Change).at(1).srcIn(), core::Timecode("01:00:05:01"));
    EXPECT_FALSE(m_model.isPreviewActive());
}

TEST_F(MainGuiPreviewTest, KeepsItsEventsAsTheyAreWhenItCannotBeEnded)
{
    showPreview();
    select("Change", {1});
    m_engine.thrown = Result::HostCallFailed;
    m_alerts.messages.clear();
    editEvent("Change", "01:00:05:01");

    EXPECT_EQ(list(ListKind::Change).at(1).srcIn(), core::Timecode("01:00:05:00"));
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_TRUE(editDialog().isVisible());
    EXPECT_EQ(m_alerts.messages, Texts{L"The workstation has refused this. Check that no track is locked."});
    m_engine.thrown = Result::Ok;
}

TEST_F(MainGuiPreviewTest, StaysOnWhenAnEditChangesNothingOrAnotherList)
{
    showPreview();
    editEvent("Change", "01:00:05:00");
    EXPECT_FALSE(editDialog().isVisible());
    editEvent("Old", "10:00:05:01");

    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_undo.entries, Texts{L"Edit EDL Event"});
    EXPECT_TRUE(m_model.isPreviewActive());
}

TEST_F(MainGuiPreviewTest, LetsNoEditHappenWhenTheProjectGoesWithIt)
{
    showPreview();
    m_engine.onPreview = [this] { deactivate(); };
    editEvent("Change", "01:00:05:01");

    EXPECT_EQ(list(ListKind::Change).at(1).srcIn(), core::Timecode("01:00:05:00"));
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_FALSE(editDialog().isVisible());
}

TEST_F(MainGuiPreviewTest, IsEndedBeforeAnEdlIsAddedToItsList)
{
    showPreview();
    std::vector<std::wstring> begun{L"not called"};
    m_engine.onPreview = [&] { begun = m_undo.begun; };
    addToChangeEdl();

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_EQ(begun, Texts());
    EXPECT_EQ(m_undo.entries, Texts{L"Load Change EDL"});
    EXPECT_EQ(list(ListKind::Change).size(), 4U);
}

TEST_F(MainGuiPreviewTest, KeepsItsListWhenItCannotBeEnded)
{
    showPreview();
    m_engine.thrown = Result::HostCallFailed;
    addToChangeEdl();

    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_TRUE(fileDialog().isVisible());
    EXPECT_EQ(m_alerts.messages, Texts{L"The workstation has refused this. Check that no track is locked."});
    m_engine.thrown = Result::Ok;
}

TEST_F(MainGuiPreviewTest, StaysOnWhenAnEdlIsAddedToAnotherList)
{
    showPreview();
    addToOldEdl();

    EXPECT_EQ(list(ListKind::Old).size(), 4U);
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_TRUE(m_model.isPreviewActive());
}

TEST_F(MainGuiPreviewTest, StaysOnWhenNoFileWasTaken)
{
    showPreview();
    click("Load Change Edl Button");
    m_window.press(juce::KeyPress::escapeKey);
    click("Load Change Edl Button");
    m_window.click(find<juce::Button>(fileDialog(), "Ok Button"));

    EXPECT_FALSE(fileDialog().isVisible());
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_TRUE(m_model.isPreviewActive());
}

TEST_F(MainGuiPreviewTest, LetsNoEdlBeAddedWhenTheProjectGoesWithIt)
{
    showPreview();
    m_engine.onPreview = [this] { deactivate(); };
    addToChangeEdl();

    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_FALSE(fileDialog().isVisible());
}

TEST_F(MainGuiPreviewTest, LeavesItsSideWhereItWasWhenARunBeginsWithoutIt)
{
    showPreview();
    click("Destination Toggle");
    click("new component");
    ASSERT_FALSE(m_model.isPreviewActive());
    click("Cadrel Button");

    EXPECT_TRUE(destination().getToggleState());
}

// ---- Menus ---------------------------------------------------------------------------------------------------------

/// Menus are windows of a screen, which comes before everything of JUCE.
struct ScreenOfMenus {
    WindowOnScreen m_screen;
};

class MainGuiMenuTest : private ScreenOfMenus, public ShownWindow {
protected:
    static bool isMenuOpen() { return juce::Component::getNumCurrentlyModalComponents() > 0; }
    bool waitForMenu(bool isOpen)
    {
        return m_screen.serveUntil([=] { return isMenuOpen() == isOpen; });
    }
};

TEST_F(MainGuiMenuTest, ClosesWhenAnotherModelComes)
{
    showThree();
    select("Change", {1});
    tableModel("Change").openMenu();
    ASSERT_TRUE(waitForMenu(true));
    DataModel other;
    notify(core::DataModelChangeContext(&other));

    EXPECT_TRUE(waitForMenu(false));
    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    deactivate();
}

// ---- Models --------------------------------------------------------------------------------------------------------

class MainGuiChangesTest : public ShownWindow {
protected:
    /// Whether a lane of the timeline, counted from above, shows the colour.
    bool shows(std::size_t lane, gui::PaletteColour colour) const
    {
        auto& timeline = find<gui::EventTimeLineView>(controls(), "timelineView");
        const juce::Image image = timeline.createComponentSnapshot(timeline.getLocalBounds());
        const int row = lane == 0 ? 10 : 55;
        for (int column = 0; column < image.getWidth(); ++column) {
            if (image.getPixelAt(column, row) == gui::toColour(colour))
                return true;
        }
        return false;
    }
    /// Of the headers of a table, all in all.
    float brightness(const std::string& name) const
    {
        const juce::Image image = table(name).createComponentSnapshot(table(name).getLocalBounds());
        float sum = 0.0F;
        for (int column = 0; column < image.getWidth(); ++column)
            sum += image.getPixelAt(column, 10).getBrightness();
        return sum;
    }
    std::string timeline() const
    {
        std::string text;
        for (const std::size_t lane : {0U, 1U})
            text += shows(lane, Palette::selection) ? "selected " : shows(lane, Palette::eventBlue) ? "events " : "- ";
        return text;
    }
};

TEST_F(MainGuiChangesTest, BringBackTheOrderOfTheProgrammeWithAModelThatStoresNoOther)
{
    showThree();
    select("Change", {2});
    constexpr int byRoll = 3;
    tableModel("Change").applySort(byRoll, true);
    ASSERT_EQ(selected("Change"), "0");
    // As an undo does that goes back to before the sort.
    m_model.removeProperty(PropertyKey::ChangeTableSortColumn);
    m_model.removeProperty(PropertyKey::ChangeTableSortForward);
    m_model.setProperty(PropertyKey::ChangeTableSelection, core::Variant(std::string("2")));
    activate();

    EXPECT_EQ(selected("Change"), "2");
    EXPECT_EQ(tableModel("Change").getSelectedEvents().at(0)->eventNumber(), 3U);
    EXPECT_EQ(tableModel("Change").getSortColumn(), gui::SortKey().column);
    EXPECT_EQ(table("Change").getHeader().getSortColumnId(), gui::SortKey().column);
    EXPECT_FALSE(m_model.hasProperty(PropertyKey::ChangeTableSortColumn));
}

TEST_F(MainGuiChangesTest, GiveTheFileDialogItsModelAlsoWhenTheProjectHasNoName)
{
    showThree();
    click("Load Old Edl Button");
    ASSERT_TRUE(fileDialog().isVisible());
    m_engine.hasName = false;
    DataModel other;
    other.setNotifier(&m_notifier);
    notify(core::DataModelChangeContext(&other));
    EXPECT_FALSE(fileDialog().isVisible());

    const TempFolder folder;
    const juce::String path = folder
                                  .write("reel.edl", "001  A001 V     C        10:00:00:00 10:00:05:00 "
                                                     "01:00:00:00 01:00:05:00\n")
                                  .string();
    dynamic_cast<juce::FileDragAndDropTarget&>(controls()).filesDropped({path}, 200, 150);
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_EQ(other.oldEdl().size(), 1U);
    EXPECT_EQ(list(ListKind::Old).size(), 3U);
    deactivate();
    other.setNotifier(nullptr);
}

TEST_F(MainGuiChangesTest, LetTheFileDialogStartInTheFolderOfTheProject)
{
    activate();
    click("Load Old Edl Button");
    m_window.click(find<juce::Button>(fileDialog(), "Open Files Button"));

    ASSERT_EQ(m_box.requests.size(), 1U);
    EXPECT_EQ(m_box.requests[0].folder, L"/films");
}

// ---- The timeline --------------------------------------------------------------------------------------------------

TEST_F(MainGuiChangesTest, ShowTheChangeListOnTheTimeline)
{
    EXPECT_EQ(timeline(), "- - ");
    showThree();
    EXPECT_EQ(timeline(), "events events ");
    deactivate();
    EXPECT_EQ(timeline(), "- - ");
}

TEST_F(MainGuiChangesTest, TakeTheTimelineAlong)
{
    showThree();
    list(ListKind::Old).clear();
    EXPECT_EQ(timeline(), "events events ");
    list(ListKind::Change).clear();
    EXPECT_EQ(timeline(), "- - ");
    fill(ListKind::Change, 1);
    EXPECT_EQ(timeline(), "events events ");
}

TEST_F(MainGuiChangesTest, HighlightWhatIsSelectedOnTheTimeline)
{
    showThree();
    select("Change", {1});
    EXPECT_EQ(timeline(), "selected selected ");
    // What is selected stays so when the list changes, and the highlight with it.
    list(ListKind::Change).erase(0, 1);
    EXPECT_EQ(timeline(), "selected selected ");
    table("Change").deselectAllRows();
    EXPECT_EQ(timeline(), "events events ");
}

TEST_F(MainGuiChangesTest, HighlightOnTheTimelineWhatAModelHasSelected)
{
    m_model.setProperty(PropertyKey::ChangeTableSelection, core::Variant(std::string("1")));
    showThree();

    EXPECT_EQ(timeline(), "selected selected ");
}

// ---- The videos ----------------------------------------------------------------------------------------------------

class MainGuiVideosTest : public ShownWindow {
protected:
    MainGuiVideosTest() { m_engine.pool.videos = {{L"/a.mov", 1500}, {L"/b.mov", 1500}}; }

    gui::VideoTable& videos() const { return find<gui::VideoTable>(videosDialog(), "VideosTable"); }
    int rowCount() const { return videos().getModel() ? videos().getModel()->getNumRows() : 0; }
    gui::TcInput& start(int row) const
    {
        return dynamic_cast<gui::TcInput&>(*videos().getCellComponent(gui::VideoColumn::Start, row));
    }
    juce::ToggleButton& use(int row) const
    {
        return dynamic_cast<juce::ToggleButton&>(*videos().getCellComponent(gui::VideoColumn::Use, row));
    }
};

TEST_F(MainGuiVideosTest, AreThoseOfThePoolFromTheStartOfTheProject)
{
    m_engine.origin = 3600.0;
    activate();
    click("m_showNewVideosDialogButton");

    ASSERT_EQ(rowCount(), 2);
    EXPECT_EQ(start(0).getValue(), core::Timecode("01:00:00:00"));
}

TEST_F(MainGuiVideosTest, FollowTheListOfTheModel)
{
    activate();
    click("m_showNewVideosDialogButton");
    EXPECT_FALSE(use(1).getToggleState());
    m_model.videoList().add({"/b.mov", core::Timecode("01:00:00:00"), core::Timecode("00:01:00:00")}, false);

    EXPECT_TRUE(use(1).getToggleState());
    EXPECT_EQ(start(1).getValue(), core::Timecode("01:00:00:00"));
}

TEST_F(MainGuiVideosTest, AreGoneWithTheProject)
{
    activate();
    click("m_showNewVideosDialogButton");
    ASSERT_EQ(rowCount(), 2);
    deactivate();

    EXPECT_EQ(rowCount(), 0);
    EXPECT_EQ(m_engine.pool.listeners, 0);
}

/// Tells nobody its name at first.
class NamelessTracks : public TestTracks {
public:
    std::wstring getName(std::size_t channel) override
    {
        if (isNameless)
            throw Result::HostCallFailed;
        return TestTracks::getName(channel);
    }
    void addListener(Listener* listener) override
    {
        ++listeners;
        TestTracks::addListener(listener);
    }
    void removeListener(Listener* listener) override
    {
        --listeners;
        TestTracks::removeListener(listener);
    }

    bool isNameless = true;
    int listeners = 0;
};

/// A provider of the tracks that a test has.
class VideoOfTracks : public TestVideo {
public:
    VideoOfTracks(NamelessTracks& itsTracks, int& listenersAtEnd)
        : m_tracks(itsTracks), m_listenersAtEnd(listenersAtEnd)
    {
    }
    ~VideoOfTracks() override { m_listenersAtEnd = m_tracks.listeners; }

    gui::VideoTrackHandlerBase& getTrackHandler() override { return m_tracks; }

private:
    NamelessTracks& m_tracks;
    int& m_listenersAtEnd;
};

TEST_F(MainGuiVideosTest, ComeAlsoFromTracksThatCannotBeReadYet)
{
    NamelessTracks tracks;
    int listenersAtEnd = 0;
    EXPECT_NO_THROW(m_gui->setVideoSource(std::make_shared<VideoOfTracks>(tracks, listenersAtEnd)));
    tracks.isNameless = false;
    tracks.tell();

    EXPECT_EQ(find<juce::ToggleButton>(videosDialog(), "videoTrack1OldSelect").getTitle(),
              "Old Edit Version, VIDEO old");
    m_gui->setVideoSource(nullptr);
}

TEST_F(MainGuiVideosTest, AreLeftBeforeTheirSourceGoes)
{
    NamelessTracks tracks;
    int listenersAtEnd = -1;
    tracks.isNameless = false;
    m_gui->setVideoSource(std::make_shared<VideoOfTracks>(tracks, listenersAtEnd));
    EXPECT_EQ(tracks.listeners, 1);
    m_gui->setVideoSource(nullptr);

    EXPECT_EQ(listenersAtEnd, 0);
}

// ---- Controls ------------------------------------------------------------------------------------------------------

TEST_F(MainGuiChangesTest, LayOutEverySheetAtAnySize)
{
    for (const juce::Point<int> size : {juce::Point<int>(1300, 750), {1701, 901}, {2560, 1440}}) {
        m_gui->setSize(size.x, size.y);
        const juce::Rectangle<int> whole(size.x, size.y);
        EXPECT_EQ(settingsDialog().getBounds(), whole);
        EXPECT_EQ(videosDialog().getBounds(), whole);
        EXPECT_EQ(fileDialog().getBounds(), whole);
    }
}

TEST_F(MainGuiChangesTest, DimWhatCannotBeUsed)
{
    showThree();
    EXPECT_EQ(timeline(), "events events ");
    const std::vector<std::string> names{"Old", "New", "Change"};
    std::vector<float> full;
    for (const std::string& name : names)
        full.push_back(brightness(name));
    const auto expectDimmed = [&](bool isDimmed) {
        for (std::size_t index = 0; index < names.size(); ++index)
            EXPECT_EQ(brightness(names[index]) < 0.8F * full[index], isDimmed) << names[index];
        EXPECT_EQ(timeline(), isDimmed ? "- - " : "events events ");
        EXPECT_NEAR(find<juce::ImageComponent>(video(), "Old Image").getAlpha(), isDimmed ? 0.5F : 1.0F, 0.01F);
    };
    click("Load Old Edl Button");
    expectDimmed(true);
    m_window.press(juce::KeyPress::escapeKey);
    expectDimmed(false);
    click("Cadrel Button");
    expectDimmed(true);
}

TEST_F(MainGuiChangesTest, KeepTheColoursOfTheCounters)
{
    for (const std::string list : {"old", "new", "change"}) {
        EXPECT_EQ(label(list + "EdlNoEventsLabel").findColour(juce::Label::textColourId), juce::Colour(0xff797a7b));
        EXPECT_EQ(label(list + "EdlSelectedEventsValue").findColour(juce::Label::textColourId),
                  juce::Colour(0xff797a7b));
    }
}

TEST_F(MainGuiChangesTest, LeaveEveryButtonItsNameForScreenReaders)
{
    const std::vector<std::pair<std::string, std::string>> names{
        {"Load Old Edl Button", "Old EDL, Add EDL"},
        {"Load New Edl Button", "New EDL, Add EDL"},
        {"Load Change Edl Button", "Change EDL, Add EDL"},
        {"Clear Old Edl Button", "Old EDL, Delete EDL"},
        {"Clear New Edl Button", "New EDL, Delete EDL"},
        {"Clear Change Edl Button", "Change EDL, Delete EDL"},
        {"Save Change Edl Button", "Save Change EDL"},
        {"Settings Button", "Open Cadrel Settings"},
        {"m_showNewVideosDialogButton", "Open Video Preview Settings"},
    };
    const auto expectNames = [&](const char* when) {
        for (const auto& [name, title] : names)
            EXPECT_EQ(button(name).getTitle().toStdString(), title) << when;
    };
    expectNames("without a project");
    activate();
    expectNames("without events");
    EXPECT_EQ(button("Clear Old Edl Button").getTooltip(), "The Old EDL is empty.");
    for (const int kind : {0, 1, 2})
        fill(kind, 1);
    expectNames("with events");
    EXPECT_EQ(button("Clear Old Edl Button").getTooltip(), "Delete EDL");
}

TEST_F(MainGuiChangesTest, LeaveAListThatTheWindowDoesNotKnowAlone)
{
    showThree();
    select("Change", {1});
    click("new component");
    m_engine.calls.clear();
    // Nobody tells of these changes, so that it would show if the window took the number for one of its lists.
    m_model.setNotifier(nullptr);
    for (const int kind : {0, 1, 2})
        list(kind).clear();
    m_model.setNotifier(&m_notifier);
    for (const std::int32_t unknown : {-1, 3}) {
        notify(EventListChangeContext(unknown));
        EXPECT_EQ(counters("old") + ", " + counters("new") + ", " + counters("change"), "3 0 0, 3 0 0, 3 1 0");
        EXPECT_EQ(timeline(), "selected selected ");
        EXPECT_TRUE(preview().getToggleState());
    }
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_alerts.messages, Texts());
}

} // namespace
} // namespace cadrel::tests
