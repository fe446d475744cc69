// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/VideoList.h"
#include "core/settings/Settings.h"
#include "gui/table/EventColumn.h"
#include "gui/table/StoredTable.h"
#include "host/track/TrackRole.h"
#include "standin/project/Track.h"
#include "tests/module/HarbourFilm.h"
#include "tests/module/LoadedWindow.h"

#include <gtest/gtest.h>

#include <X11/keysym.h>

#include <optional>
#include <utility>

namespace cadrel::tests {
namespace {

using core::ListKind;
using Texts = std::vector<std::string>;

/// What the two cuts of the film make of each shot: PIER, LAMP, BOAT, STAIRS and DOOR.
const Texts ChangeEvents = {
    "T01 01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00", "T02 01:00:10:00 01:00:20:00 01:00:14:00 01:00:24:00",
    "T03 01:00:22:00 01:00:32:00 01:00:26:00 01:00:36:00", "T04 02:00:00:00 02:00:10:00 02:00:00:00 02:00:10:00",
    "T05 02:00:12:00 02:00:20:00 02:00:10:00 02:00:18:00"};

/// The sound of the film before and after, in seconds of the project. Its clock begins at 00:59:00:00.
const Texts Effects = {"leader 52 57",     "2-pop 58 58.5",           "pier 60 70",
                       "lamp 70 80",       "lamp goes out 80.5 81.5", "boat 82 92",
                       "tail pop 94 94.5", "leader 2 3652 3657",      "2-pop 2 3658 3658.5",
                       "stairs 3660 3670", "door 3670 3680",          "tail pop 2 3682 3682.5"};
const Texts ConformedEffects = {"leader 52 57",     "2-pop 58 58.5",           "pier 60 70",
                                "lamp 74 84",       "lamp goes out 84.5 85.5", "boat 86 96",
                                "tail pop 98 98.5", "leader 2 3652 3657",      "2-pop 2 3658 3658.5",
                                "stairs 3660 3670", "door 3670 3678",          "tail pop 2 3680 3680.5"};
const Texts Wind = {"wind 60 96", "wind 2 3660 3684"};
const Texts ConformedWind = {"wind 60 70", "wind 74 100", "wind 2 3660 3670", "wind 2 3670 3682"};

/// Each step of the job goes on from the one before.
class WholeJobTest : public LoadedWindow {
protected:
    WholeJobTest() { writeHarbourFilm(m_file); }

    // ---- Steps

    void addCuts();
    void generate();
    void sortAndEdit();
    void sortBack();
    void heal();
    void extend();
    void deleteEvent();
    void undoEdits();
    void previewAnEvent();
    void goThroughEvents();
    void goToDestination();
    void endPreview();
    void changeSettings();
    void chooseVideos();
    void saveList();
    void conform();
    void undoAndRedoTheRun();
    void saveAndReopen();

    // ---- What came of them

    static Texts with(Texts texts, const Texts& more)
    {
        texts.insert(texts.end(), more.begin(), more.end());
        return texts;
    }
    std::size_t stepsDone() const { return m_project->undoList().doneCount(); }
    void undo(std::size_t stepsLeft)
    {
        m_user.press('z', XK_Control_L);
        expectSoon("a step is undone", [&] { return stepsDone() == stepsLeft; });
    }
    std::pair<double, double> cycle()
    {
        return {m_project->cycleLeft().getValue(), m_project->cycleRight().getValue()};
    }
    void expectCycleSoon(double left, double right)
    {
        expectSoon("the cycle is set", [&] { return cycle() == std::pair(left, right); });
    }
    std::optional<gui::SortKey> sortKey() { return gui::StoredTable(*model(), ListKind::Change).sortKey(); }

    const std::filesystem::path m_file = m_folder / "Harbour.stage";
};

void WholeJobTest::addCuts()
{
    takeFiles({exampleFile("tworeels/old.edl")});
    click(Main, "Load Old Edl Button");
    click(Files, "Open Files Button");
    picture("job-01-add");
    m_user.press(XK_Return);
    expectEntry(1, u"Load Old EDL");
    EXPECT_EQ(events(ListKind::Old).size(), 5U);
    EXPECT_EQ(events(ListKind::Old).front(), "T01 10:00:00:00 10:00:10:00 01:00:00:00 01:00:10:00");

    takeFiles({exampleFile("tworeels/new.edl")});
    click(Main, "Load New Edl Button");
    click(Files, "Open Files Button");
    click(Files, "Ok Button");
    expectEntry(2, u"Load New EDL");
    EXPECT_EQ(events(ListKind::New).size(), 6U);
    EXPECT_EQ(events(ListKind::New).back(), "T05 10:40:02:00 10:40:10:00 02:00:10:00 02:00:18:00");
}

void WholeJobTest::generate()
{
    click(Main, "Generate Button");
    expectEntry(3, u"Generate Change EDL");
    EXPECT_EQ(events(ListKind::Change), ChangeEvents);
    picture("job-02-generated");
}

void WholeJobTest::sortAndEdit()
{
    // The first click on a title lets the names fall: STAIRS, PIER, LAMP, DOOR, BOAT.
    constexpr int Door = 3;
    clickColumn(ListKind::Change, "Clip Name");
    expectSoon("the list is sorted", [&] { return sortKey() == gui::SortKey{gui::EventColumn::ClipName, true}; });
    EXPECT_EQ(events(ListKind::Change), ChangeEvents) << "The list keeps its order.";

    doubleClickRow(ListKind::Change, Door);
    expectSoon("the event is selected", [&] { return selection(ListKind::Change) == std::vector{Door}; });
    clickHours(inEditDialog(ListKind::Change, Door, "m_copyInEdit"));
    m_user.type("02001100");
    picture("job-03-edit");
    m_user.press(XK_Return);
    expectEntry(4, u"Edit EDL Event");
    EXPECT_EQ(events(ListKind::Change).back(), "T05 02:00:11:00 02:00:19:00 02:00:10:00 02:00:18:00");
}

void WholeJobTest::sortBack()
{
    clickColumn(ListKind::Change, "DST IN");
    expectSoon("the list is sorted", [&] { return sortKey() == gui::SortKey{gui::EventColumn::DstIn, true}; });
    clickColumn(ListKind::Change, "DST IN");
    expectSoon("the list is sorted", [&] { return sortKey() == gui::SortKey{gui::EventColumn::DstIn, false}; });
}

void WholeJobTest::heal()
{
    clickRow(ListKind::Change, 1);
    clickRow(ListKind::Change, 2, XK_Control_L);
    expectSoon("LAMP and BOAT are selected", [&] { return selection(ListKind::Change) == std::vector{1, 2}; });
    // Between the two there is black in both cuts. So the first way to heal that is offered is "Gaps without Inserts".
    chooseInMenu(ListKind::Change, 2, {XK_Down, XK_Right, XK_Return});
    expectEntry(5, u"Heal EDL Events");
    ASSERT_EQ(events(ListKind::Change).size(), 4U);
    EXPECT_TRUE(events(ListKind::Change)[1].ends_with("01:00:10:00 01:00:32:00 01:00:14:00 01:00:36:00"));
}

void WholeJobTest::extend()
{
    // The healed event begins four seconds after the end of PIER.
    clickRow(ListKind::Change, 1);
    expectSoon("the event is selected", [&] { return selection(ListKind::Change) == std::vector{1}; });
    chooseInMenu(ListKind::Change, 1, {XK_Down, XK_Down, XK_Right, XK_Return});
    expectEntry(6, u"Extend EDL Event");
    EXPECT_TRUE(events(ListKind::Change)[1].ends_with("01:00:06:00 01:00:32:00 01:00:10:00 01:00:36:00"));
}

void WholeJobTest::deleteEvent()
{
    clickRow(ListKind::Change, 3);
    expectSoon("DOOR is selected", [&] { return selection(ListKind::Change) == std::vector{3}; });
    m_user.press(XK_Delete);
    expectEntry(7, u"Delete EDL Events");
    EXPECT_EQ(events(ListKind::Change).size(), 3U);
    EXPECT_EQ(events(ListKind::Change).back(), ChangeEvents[3]);
    EXPECT_EQ(selection(ListKind::Change), std::vector{2});
}

void WholeJobTest::undoEdits()
{
    undo(6);
    EXPECT_EQ(events(ListKind::Change).back(), "T05 02:00:11:00 02:00:19:00 02:00:10:00 02:00:18:00");
    undo(5);
    EXPECT_TRUE(events(ListKind::Change)[1].ends_with("01:00:10:00 01:00:32:00 01:00:14:00 01:00:36:00"));
    undo(4);
    EXPECT_EQ(events(ListKind::Change).size(), 5U);
    undo(3);
    EXPECT_EQ(events(ListKind::Change), ChangeEvents);
    EXPECT_EQ(sortKey(), (gui::SortKey{gui::EventColumn::ClipName, true})) << "As it was before the first edit.";
}

void WholeJobTest::previewAnEvent()
{
    clickRow(ListKind::Change, 1);
    click(Main, "new component", "Preview");
    expectEntry(4, u"Preview");
    EXPECT_TRUE(model()->isPreviewActive());
    // LAMP with its neighbours, a day after their places in the new cut.
    EXPECT_EQ(clipsOn(u"FX"), with(Effects, {"pier 86460 86470", "lamp 86474 86484", "boat 86486 86496"}));
    EXPECT_EQ(clipsOn(u"Wind"), with(Wind, {"wind 86460 86470", "wind 86474 86484", "wind 86486 86496"}));
    expectCycleSoon(70, 80);
    picture("job-04-preview");
}

void WholeJobTest::goThroughEvents()
{
    m_user.press(XK_Down);
    expectSoon("BOAT is selected", [&] { return selection(ListKind::Change) == std::vector{2}; });
    expectCycleSoon(82, 92);
    EXPECT_EQ(clipsOn(u"FX"), with(Effects, {"lamp 86474 86484", "boat 86486 86496", "stairs 90060 90070"}));
    m_user.press(XK_Up);
    expectSoon("LAMP is selected", [&] { return selection(ListKind::Change) == std::vector{1}; });
    expectCycleSoon(70, 80);
}

void WholeJobTest::goToDestination()
{
    click(Main, "Destination Toggle");
    expectCycleSoon(86474, 86484);
    picture("job-05-destination");
    click(Main, "Source Toggle");
    expectCycleSoon(70, 80);
}

void WholeJobTest::endPreview()
{
    click(Main, "new component", "Preview");
    expectSoon("the preview is off", [&] { return !model()->isPreviewActive(); });
    expectSoon("the copies are gone", [&] { return clipsOn(u"FX") == Effects; });
    EXPECT_EQ(clipsOn(u"Wind"), Wind);
    expectCycleSoon(0, 0);
    EXPECT_EQ(events(ListKind::Change), ChangeEvents);
}

void WholeJobTest::changeSettings()
{
    click(Main, "Settings Button");
    click(Settings, "Destination Marker Select");
    const int windows = m_windows.windowCount();
    click(Settings, "m_matchNameSelect");
    expectSoon("the choices are open", [&] { return m_windows.windowCount() > windows; });
    m_user.press(XK_Down);
    m_user.press(XK_Return);
    expectSoon("the choices are closed", [&] { return m_windows.windowCount() == windows; });
    click(Settings, "vfxShotHandlingPrefix1");
    m_user.type("vfx.");
    picture("job-06-settings");
    // Beside the sheet, which closes it.
    click(Main, "videodisplay");
    expectSoon("the settings have changed", [&] { return model()->settings().vfxPattern(0).prefix == "vfx."; });
    EXPECT_FALSE(model()->settings().createDestinationMarkers());
    EXPECT_EQ(model()->settings().matchBy(), core::MatchBy::ClipName);
}

void WholeJobTest::chooseVideos()
{
    const std::size_t before = stepsDone();
    click(Main, "m_showNewVideosDialogButton");
    click(Videos, "videoTrack1OldSelect");
    const WindowPlaces::Place row = m_places.at(Videos, "VideosTable Row");
    const auto inSecondRow = [&](const char* column) {
        const WindowPlaces::Place title = m_places.at(Videos, "VideosTable Column", column);
        return WindowPlaces::Place{title.x, row.y + row.height, title.width, row.height};
    };
    moveTo(inSecondRow("Use as New Video"));
    m_user.click();
    expectSoon("the video is used", [&] { return model()->videoList().size() == 1; });
    EXPECT_EQ(model()->videoList().at(0).start.toString(), "00:59:00:00") << "Where the project begins.";
    clickHours(inSecondRow("Start"));
    m_user.type("01000000");
    expectSoon("the video has its start", [&] { return model()->videoList().at(0).start.toString() == "01:00:00:00"; });
    EXPECT_EQ(model()->videoList().at(0).path, "/pix/harbour_v2.mov");
    EXPECT_EQ(model()->videoList().at(0).length.toString(), "00:01:40:00");
    Velmark::FVariant role;
    m_project->allTracks().front()->getAttribute(Velmark::AttributeKey::VideoType, role);
    EXPECT_EQ(role.asInteger(), host::TrackRole::OldVideo);
    EXPECT_GE(stepsDone(), before + 2);
    picture("job-07-videos");
    m_user.press(XK_Escape);
}

void WholeJobTest::saveList()
{
    const std::filesystem::path list = m_folder / "change.edl";
    takeFiles({list});
    click(Main, "Save Change Edl Button");
    expectSoon("the list is written", [&] { return std::filesystem::exists(list); });
    const std::string text = contentOf(list);
    for (const std::string& event : ChangeEvents)
        EXPECT_NE(text.find(event.substr(4)), std::string::npos) << event;
}

void WholeJobTest::conform()
{
    EXPECT_EQ(messages(), "");
    const std::size_t before = stepsDone();
    click(Main, "Cadrel Button");
    expectSoon("the run is done", [&] { return clipsOn(u"FX") != Effects; });
    expectEntry(before + 1, u"Apply Cadrel");
    EXPECT_NE(events(ListKind::Change), ChangeEvents) << "What stays in its place has left the list.";
    EXPECT_EQ(clipsOn(u"FX"), ConformedEffects);
    EXPECT_EQ(clipsOn(u"Wind"), ConformedWind);
    const std::string told = messages();
    EXPECT_NE(told.find("of sound, markers or automation would be taken away"), std::string::npos) << told;
    EXPECT_NE(told.find("[Keep]"), std::string::npos) << told;
    picture("job-08-conformed");
}

void WholeJobTest::undoAndRedoTheRun()
{
    const std::size_t done = stepsDone();
    const Texts carriedOut = events(ListKind::Change);
    undo(done - 1);
    EXPECT_EQ(events(ListKind::Change), ChangeEvents);
    EXPECT_EQ(clipsOn(u"FX"), Effects);
    EXPECT_EQ(clipsOn(u"Wind"), Wind);
    m_user.press('z', XK_Control_L, XK_Shift_L);
    expectSoon("the run is made again", [&] { return stepsDone() == done; });
    EXPECT_EQ(events(ListKind::Change), carriedOut);
    EXPECT_EQ(clipsOn(u"FX"), ConformedEffects);
    EXPECT_EQ(clipsOn(u"Wind"), ConformedWind);
}

void WholeJobTest::saveAndReopen()
{
    const Texts list = events(ListKind::Change);
    m_application.saveProject(*m_project, m_file);
    const StoredModel stored = StoredModel::in(*m_project).value();
    EXPECT_EQ(StoredModel::inFile(m_file), stored);
    m_application.closeProject(*m_project);
    turn();

    m_project = &open(m_file);
    EXPECT_EQ(clipsOn(u"FX"), ConformedEffects);
    EXPECT_EQ(clipsOn(u"Wind"), ConformedWind);
    EXPECT_EQ(events(ListKind::Change), list);
    EXPECT_EQ(events(ListKind::Old).size(), 5U);
    EXPECT_EQ(StoredModel::in(*m_project), stored);
    EXPECT_EQ(messages(), "");
    picture("job-09-reopened");
    // The window works on the project that has come.
    click(Main, "Clear Old Edl Button");
    expectEntry(1, u"Delete Old EDL");
    EXPECT_TRUE(events(ListKind::Old).empty());
}

TEST_F(WholeJobTest, IsDoneByMouseAndKeys)
{
    start(m_file);

    addCuts();
    generate();
    sortAndEdit();
    sortBack();
    heal();
    extend();
    deleteEvent();
    undoEdits();
    sortBack();
    previewAnEvent();
    goThroughEvents();
    goToDestination();
    endPreview();
    changeSettings();
    chooseVideos();
    saveList();
    conform();
    undoAndRedoTheRun();
    saveAndReopen();
}

} // namespace
} // namespace cadrel::tests
