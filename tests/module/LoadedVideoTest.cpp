// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "core/time/Framerate.h"
#include "gui/main/MainLayout.h"
#include "standin/project/Project.h"
#include "standin/video/Videos.h"

#include "tests/module/LoadedModule.h"
#include "tests/module/MainStills.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/video/TestVideos.h"
#include "tests/support/x11/XUser.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>

using namespace Velmark;
using cadrel::core::DataModel;
using cadrel::core::EventBase;
using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::core::VideoList;
using cadrel::gui::MainButton;
using cadrel::gui::MainLayout;
using cadrel::tests::MainStills;
using cadrel::tests::StoredModel;
using cadrel::tests::TempFolder;
using cadrel::tests::treePath;
using cadrel::tests::XUser;
using cadrel::util::StringUtil;

namespace fs = std::filesystem;

namespace {

constexpr std::int32_t ProgrammeStart = 3 * 60 * 60 * 24;
/// Where the host's windows stand on the screen.
constexpr int WindowLeft = 40;
constexpr int WindowTop = 30;
constexpr unsigned long DownKey = 0xff54;

struct WithVideos {
    standin::Videos videos;
};

/// The example reel in the window of the loaded module, with the videos of both cuts.
class LoadedVideoTest : private WithVideos, public cadrel::tests::LoadedModule {
protected:
    LoadedVideoTest() : LoadedModule(&videos) {}

    /// The sound project of the old cut in a folder where its video lies beside it. A session has found the changes.
    fs::path writeReel()
    {
        m_model.oldEdl().load(StringUtil::toWide(treePath("examples/reel3/reel3_v07.edl")), false);
        m_model.newEdl().load(StringUtil::toWide(treePath("examples/reel3/reel3_v12.edl")), false);
        m_model.generateChangeEdl();
        m_model.videoList().add(VideoList::Entry(standin::tests::reel3VideoOf("v12").string(), Timecode("03:00:00:00"),
                                                 Timecode("00:15:07:20")),
                                false);
        standin::Application host;
        standin::Project& project = host.openProject(treePath("examples/reel3/reel3.stage"));
        StoredModel::of(m_model).putInto(project);
        const fs::path file = m_folder / "reel3.stage";
        host.saveProject(project, file);
        fs::create_symlink(standin::tests::reel3VideoOf("v07"), m_folder / "LW_R3_v07.mov");
        return file;
    }

    void openReel()
    {
        const fs::path file = writeReel();
        load();
        m_application.activateProject(&m_application.openProject(file));
        ASSERT_TRUE(openWindow());
        ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
        ViewRect rect;
        window()->view()->getSize(rect);
        m_layout.emplace(rect.right - rect.left, rect.bottom - rect.top);
    }

    void click(const MainLayout::Box& box, int x, int y)
    {
        m_user.moveTo(WindowLeft + box.x + x, WindowTop + box.y + y);
        m_user.click();
        turn(4);
    }
    void push(MainButton button)
    {
        const MainLayout::Box box = m_layout->button(button);
        click(box, box.width / 2, box.height / 2);
    }
    void selectFirstChange() { click(m_layout->table(cadrel::core::ListKind::Change), 60, 30); }

    void expectStills(const Timecode& oldTime, const Timecode& newTime, int shift, std::size_t event)
    {
        const int oldFrame = oldTime.toFrameCount() - ProgrammeStart + shift;
        const int newFrame = newTime.toFrameCount() - ProgrammeStart + shift;
        const MainStills stills(m_windows, *m_layout, WindowLeft, WindowTop);
        if (!turnUntil([&] { return stills.oldNumber() == oldFrame && stills.newNumber() == newFrame; }))
            ADD_FAILURE() << "event " << event << " shows " << stills.oldNumber() << " and " << stills.newNumber()
                          << " in the place of " << oldFrame << " and " << newFrame;
    }

    template <class Check>
    void forEveryChange(Check check)
    {
        const auto& events = m_model.changeEdl();
        ASSERT_GT(events.size(), 50U);
        for (std::size_t index = 0; index < events.size(); ++index) {
            check(events.at(index), index);
            if (HasFailure())
                return;
            m_user.press(DownKey);
        }
    }

    cadrel::tests::TestProject m_timecodes{Framerate(24, 0)};
    DataModel m_model;
    TempFolder m_folder;
    XUser m_user;
    std::optional<MainLayout> m_layout;
};

} // namespace

TEST_F(LoadedVideoTest, ShowsTheFirstFramesOfEveryChangeEventInBothPictures)
{
    openReel();
    selectFirstChange();

    forEveryChange(
        [this](const EventBase& event, std::size_t index) { expectStills(event.srcIn(), event.dstIn(), 0, index); });
}

TEST_F(LoadedVideoTest, ShowsTheLastFramesOfEveryChangeEventInBothPictures)
{
    openReel();
    push(MainButton::Out);
    selectFirstChange();

    forEveryChange(
        [this](const EventBase& event, std::size_t index) { expectStills(event.srcOut(), event.dstOut(), -1, index); });
}
