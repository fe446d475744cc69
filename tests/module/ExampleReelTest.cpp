// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Settings.h"
#include "tests/module/HarbourFilm.h"
#include "tests/module/LoadedWindow.h"

#include <gtest/gtest.h>

#include <X11/keysym.h>

#include <algorithm>
#include <string_view>

namespace cadrel::tests {
namespace {

using core::ListKind;

/// The example reel, whose README says what changed.
class ExampleReelTest : public LoadedWindow {
protected:
    void addCut(const std::string& button, const char* file)
    {
        takeFiles({exampleFile(file)});
        click(Main, button);
        click(Files, "Open Files Button");
    }
    void addCuts()
    {
        addCut("Load Old Edl Button", "reel3/reel3_v07.edl");
        m_user.press(XK_Return);
        expectEntry(1, u"Load Old EDL");
        addCut("Load New Edl Button", "reel3/reel3_v12.edl");
        picture("window-add");
        m_user.press(XK_Return);
        expectEntry(2, u"Load New EDL");
        EXPECT_EQ(events(ListKind::Old).size(), 152U);
        EXPECT_EQ(events(ListKind::New).size(), 153U);
    }
    void nameTheVfxShots()
    {
        click(Main, "Settings Button");
        click(Settings, "vfxShotHandlingSelect1");
        click(Settings, "vfxShotHandlingPrefix1");
        m_user.type("VFX_****_v");
        click(Settings, "vfxShotHandlingPostfix1");
        m_user.type("_comp");
        picture("window-settings");
        m_user.press(XK_Escape);
        expectSoon("the settings have changed", [&] {
            const core::VfxPatternEntry entry = model()->settings().vfxPattern(0);
            return entry.enabled && entry.prefix == "VFX_****_v" && entry.postfix == "_comp";
        });
    }
    void chooseVideos()
    {
        click(Main, "m_showNewVideosDialogButton");
        // The new one is the second of the pool.
        const WindowPlaces::Place row = m_places.at(Videos, "VideosTable Row");
        const WindowPlaces::Place use = m_places.at(Videos, "VideosTable Column", "Use as New Video");
        moveTo({use.x, row.y + row.height, use.width, row.height});
        m_user.click();
        expectEntry(4, u"Add New Video");
        picture("window-videos");
        m_user.press(XK_Escape);
    }
    void selectEvent(int row)
    {
        clickRow(ListKind::Change, 0);
        for (int step = 0; step < row; ++step)
            m_user.press(XK_Down);
        expectSoon("the event is selected", [&] { return selection(ListKind::Change) == std::vector{row}; });
    }
    bool hasClip(const std::u16string& track, const std::string& clip)
    {
        const auto clips = clipsOn(track);
        return std::find(clips.begin(), clips.end(), clip) != clips.end();
    }
};

TEST_F(ExampleReelTest, IsConformedInTheWindowAsOnTheCommandLine)
{
    std::string film = contentOf(exampleFile("reel3/reel3.stage"));
    const std::string_view place = "\"pool\": [";
    film.insert(film.find(place) + place.size(), R"(
    {"number": 1000, "kind": "video", "name": "LW_R3_v12", "path": "Video/LW_R3_v12.mov", "length": 907.8333333333334},)");
    writeFile(m_folder / "reel3.stage", film);
    start(m_folder / "reel3.stage");
    picture("window-empty");

    addCuts();
    nameTheVfxShots();
    click(Main, "Generate Button");
    expectEntry(3, u"Generate Change EDL");
    EXPECT_EQ(events(ListKind::Change).size(), 59U);

    chooseVideos();
    // Some of the first shots, so that they are seen in the tables of both cuts.
    selectEvent(2);
    click(Main, "new component", "Preview");
    expectSoon("the preview is on", [&] { return model()->isPreviewActive(); });
    picture("window-preview");
    const int windows = m_windows.windowCount();
    moveTo(rowPlace(ListKind::Change, 2).movedBy(-200, 0));
    m_user.rightClick();
    expectSoon("the menu is open", [&] { return m_windows.windowCount() == windows + 1; });
    m_user.press(XK_Down);
    m_user.press(XK_Right);
    expectSoon("its submenu is open", [&] { return m_windows.windowCount() == windows + 2; });
    picture("window-menu");
    m_user.press(XK_Escape);
    m_user.press(XK_Escape);
    expectSoon("the menu is closed", [&] { return m_windows.windowCount() == windows; });

    click(Main, "Cadrel Button");
    expectSoon("the run is done", [&] { return hasClip(u"DIA 1", "42A-3 Maren 64.875 72.625"); });
    EXPECT_NE(messages().find("[Keep]"), std::string::npos);
    EXPECT_EQ(events(ListKind::Change).size(), 57U) << "With what is kept outside of the list.";
    picture("window-conformed");
}

} // namespace
} // namespace cadrel::tests
