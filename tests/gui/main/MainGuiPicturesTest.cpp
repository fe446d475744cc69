// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/gui/main/ShownWindow.h"
#include "tests/support/window/Pictures.h"

namespace cadrel::tests {
namespace {

using core::ListKind;

class MainGuiPicturesTest : public ShownWindow {
protected:
    /// A reel of a cut: twelve shots, some of them of other lengths or in another order than before.
    void showReel()
    {
        const std::vector<std::int32_t> lengths{8, 5, 12, 3, 7, 9, 4, 6, 11, 5, 8, 10};
        std::int32_t oldTime = 0;
        std::int32_t newTime = 0;
        for (std::uint32_t number = 1; number <= lengths.size(); ++number) {
            const std::int32_t length = lengths[number - 1];
            const std::int32_t left = number % 4 == 0 ? length - 2 : length;
            std::string roll("A0");
            roll.append(std::to_string(10 + number / 3)).append("C00").append(std::to_string(number % 10));
            add(ListKind::Old, number, roll, at(10, 7 * oldTime), at(1, oldTime), length);
            add(ListKind::New, number, roll, at(10, 7 * oldTime), at(1, newTime), left);
            add(ListKind::Change, number, roll, at(1, oldTime), at(1, newTime), left);
            oldTime += length;
            newTime += left;
        }
        list(ListKind::New).at(3).addFlaw(core::EventFlaw::RollNameInvalid);
        list(ListKind::Change).at(6).setVfx(true);
        activate();
    }
    static core::Timecode at(std::int32_t hour, std::int32_t seconds) { return {hour, seconds / 60, seconds % 60, 0}; }
    void add(int kind, std::uint32_t number, const std::string& roll, const core::Timecode& source,
             const core::Timecode& destination, std::int32_t length)
    {
        const auto after = [&](core::Timecode timecode) {
            timecode.setFrameCount(timecode.toFrameCount(m_project.framerate) + length * 25, m_project.framerate);
            return timecode;
        };
        auto event = std::make_shared<core::EventBase>();
        event->setRollName(roll);
        std::string clip("SC");
        clip.append(std::to_string(20 + number)).append("_TK").append(std::to_string(number % 3 + 1));
        event->setClipName(clip);
        event->setEdlFileName("reel3.edl");
        event->setTimecodes(source, after(source), destination, after(destination));
        event->setEventNumber(number);
        list(kind).add(std::move(event));
    }
};

TEST_F(MainGuiPicturesTest, LooksEmptyWithoutAProject)
{
    expectPicture(*m_gui, "main-no-project");
}

TEST_F(MainGuiPicturesTest, SaysWhatToDoFirst)
{
    activate();
    expectPicture(*m_gui, "main-empty");
}

TEST_F(MainGuiPicturesTest, ShowsAReel)
{
    showReel();
    expectPicture(*m_gui, "main-loaded");
}

TEST_F(MainGuiPicturesTest, ShowsASelectionAndAPreview)
{
    showReel();
    select("Change", {3, 4});
    click("new component");
    click("Destination Toggle");
    m_window.grabKeyboardFocus();
    expectPicture(*m_gui, "main-preview");
}

TEST_F(MainGuiPicturesTest, ShowsTheFramesOfTheSelectedEvent)
{
    showReel();
    select("Change", {4});
    m_video->deliver();
    table("Change").grabKeyboardFocus();
    expectPicture(*m_gui, "main-selected");
}

TEST_F(MainGuiPicturesTest, IsDimmedDuringARun)
{
    showReel();
    click("Cadrel Button");
    expectPicture(*m_gui, "main-running");
}

TEST_F(MainGuiPicturesTest, LiesBeneathASheet)
{
    showReel();
    click("Load Change Edl Button");
    m_window.grabKeyboardFocus();
    expectPicture(*m_gui, "main-add-edl");
}

} // namespace
} // namespace cadrel::tests
