// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "standin/Application.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "tests/desktop/shell/DesktopUser.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <X11/keysym.h>

#include <chrono>
#include <csignal>
#include <filesystem>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <sys/wait.h>
#include <unistd.h>

namespace desktop::tests {
namespace {

namespace core = cadrel::core;
namespace fs = std::filesystem;

fs::path exampleFile(const char* name)
{
    return fs::path(cadrel::tests::treePath("examples/reel3")) / name;
}

/// A window manager, which frames the windows and gives them the keyboard.
class WindowManager {
public:
    WindowManager() : m_process(fork())
    {
        if (m_process == 0) {
            execlp("openbox", "openbox", "--sm-disable", static_cast<char*>(nullptr));
            _exit(127);
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(500));
        if (waitpid(m_process, nullptr, WNOHANG) != 0)
            throw std::runtime_error("no window manager; openbox has to be installed");
    }
    WindowManager(const WindowManager&) = delete;
    WindowManager& operator=(const WindowManager&) = delete;
    ~WindowManager()
    {
        kill(m_process, SIGTERM);
        waitpid(m_process, nullptr, 0);
    }

private:
    pid_t m_process;
};

/// The example reel in a folder of its own; with a window manager where the parameter says so.
class WholeDesktopTest : public testing::TestWithParam<bool> {
protected:
    WholeDesktopTest()
    {
        if (GetParam())
            m_manager.emplace();
        for (const char* const name : {"reel3.stage", "reel3_v07.edl", "reel3_v12.edl"})
            fs::copy_file(exampleFile(name), m_folder / name);
        // Where they have been rendered, its videos are seen.
        if (fs::exists(exampleFile("Video")))
            fs::create_directory_symlink(exampleFile("Video"), m_folder / "Video");
    }

    /// For the manual, in which nothing has a frame of a window manager's.
    void picture(const std::string& name)
    {
        if (!GetParam())
            m_user->picture(name);
    }
    void start() { m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}); }
    void addCut(const std::string& button, const char* file)
    {
        m_user->click(DesktopUser::Main, button);
        m_user->click(DesktopUser::Files, "Open Files Button");
        m_user->waitForBox(true);
        m_user->type((m_folder / file).string());
        m_user->press(XK_Return);
        m_user->waitForBox(false);
        m_user->click(DesktopUser::Files, "Ok Button");
    }
    void addCuts()
    {
        addCut("Load Old Edl Button", "reel3_v07.edl");
        m_user->save();
        addCut("Load New Edl Button", "reel3_v12.edl");
        m_user->save();
    }
    std::unique_ptr<core::DataModel> storedModel()
    {
        auto model = std::make_unique<core::DataModel>();
        auto archive = cadrel::tests::archiveOf(cadrel::tests::StoredModel::inFile(m_file).value().block);
        archive >> *model;
        return model;
    }
    /// Where the clip begins on the first dialogue track of the file, in seconds of the project.
    double storedStartOf(const std::u16string& clip)
    {
        standin::Application host;
        standin::Project& project = host.openProject(m_file);
        for (standin::Track* const track : project.allTracks()) {
            if (std::u16string_view(track->getName()) != u"DIA 1")
                continue;
            for (const auto& each : standin::tests::childrenOf(*track)) {
                if (clip == each->getName())
                    return each->getStart(nullptr);
            }
        }
        throw std::runtime_error("there is no such clip");
    }

    cadrel::tests::VirtualScreen m_screen{1400, 1250};
    std::optional<WindowManager> m_manager;
    cadrel::tests::TempFolder m_folder;
    const fs::path m_file = m_folder / "reel3.stage";
    cadrel::tests::TestProject m_timecodes{core::Framerate(24, 0)};
    std::optional<DesktopUser> m_user;
};

/// 03:01:06:05 in the old cut and 03:01:04:21 in the new one; the project begins at 03:00:00:00.
constexpr const char16_t* Clip = u"42A-3 Maren";
constexpr double OldStart = 66.0 + 5.0 / 24.0;
constexpr double NewStart = 64.0 + 21.0 / 24.0;
constexpr double SameInstant = 1.0 / 384000;

TEST_P(WholeDesktopTest, ConformsAReelByMouseAndKeysAndOpensItAgain)
{
    start();
    picture("desktop-open");
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->save();
    m_user->click(DesktopUser::Main, "Change Table List Box Row");
    m_user->press(XK_Down);
    m_user->press(XK_Down);
    picture("desktop-generated");
    m_user->save(); // with what is selected
    const auto generated = storedModel();
    EXPECT_EQ(generated->oldEdl().size(), 152U);
    EXPECT_EQ(generated->newEdl().size(), 153U);
    // As many as `cadrel generate` tells.
    EXPECT_EQ(generated->changeEdl().size(), 60U);
    EXPECT_NEAR(storedStartOf(Clip), OldStart, SameInstant);

    m_user->click(DesktopUser::Main, "Cadrel Button");
    m_user->waitForBox(true);
    picture("desktop-question");
    m_user->press(XK_Return); // Keep
    m_user->waitForBox(false);
    m_user->save();
    EXPECT_NEAR(storedStartOf(Clip), NewStart, SameInstant);
    m_user->press('g');
    picture("desktop-conformed");
    m_user->press('g');

    m_user->press('z', XK_Control_L);
    m_user->save();
    EXPECT_NEAR(storedStartOf(Clip), OldStart, SameInstant);
    m_user->press('z', XK_Control_L, XK_Shift_L);
    m_user->save();
    EXPECT_NEAR(storedStartOf(Clip), NewStart, SameInstant);
    m_user->press('q', XK_Control_L);
    EXPECT_EQ(m_user->status(), 0);

    start();
    m_user->waitForTitle("nothing is unsaved", [](const std::string& text) { return text == "reel3.stage - Cadrel"; });
    m_user->closeWindow();
    EXPECT_EQ(m_user->status(), 0) << "Nothing was changed, so that nothing is asked.";
    EXPECT_NEAR(storedStartOf(Clip), NewStart, SameInstant);
}

TEST_P(WholeDesktopTest, AsksBeforeUnsavedWorkIsLost)
{
    const std::string before = cadrel::tests::contentOf(m_file);
    start();
    addCut("Load Old Edl Button", "reel3_v07.edl");
    m_user->waitForTitle("there is unsaved work", [](const std::string& text) { return text.starts_with("*"); });

    m_user->closeWindow();
    m_user->waitForBox(true);
    m_user->press(XK_Escape); // Cancel
    m_user->waitForBox(false);
    EXPECT_TRUE(m_user->isRunning());

    m_user->closeWindow();
    m_user->waitForBox(true);
    m_user->press(XK_Tab);
    m_user->press(XK_Return); // Close without Saving
    EXPECT_EQ(m_user->status(), 0);
    EXPECT_EQ(cadrel::tests::contentOf(m_file), before);
}

TEST_P(WholeDesktopTest, OffersUnsavedWorkAfterItWasKilled)
{
    start();
    addCut("Load Old Edl Button", "reel3_v07.edl");
    m_user->waitForTitle("there is unsaved work", [](const std::string& text) { return text.starts_with("*"); });
    const fs::path kept = m_file.string() + ".autosave";
    for (int turns = 0; turns < 500 && !fs::exists(kept); ++turns)
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    ASSERT_TRUE(fs::exists(kept));
    m_user.reset(); // kills it

    // Cadrel's window comes when the question has been answered.
    m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}, XK_Return);
    m_user->save();
    EXPECT_EQ(storedModel()->oldEdl().size(), 152U);
    EXPECT_FALSE(fs::exists(kept));
}

INSTANTIATE_TEST_SUITE_P(WithoutAndWithAWindowManager, WholeDesktopTest, testing::Bool(),
                         [](const auto& each) { return each.param ? "WithAWindowManager" : "WithoutAWindowManager"; });

} // namespace
} // namespace desktop::tests
