// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/settings/Settings.h"
#include "core/time/Framerate.h"
#include "core/time/Timecode.h"
#include "desktop/document/Autosave.h"
#include "desktop/document/DocumentLock.h"
#include "desktop/tracks/TrackIndex.h"
#include "desktop/x11/ManagedScreen.h"
#include "gui/look/Palette.h"
#include "gui/table/StoredTable.h"
#include "standin/Application.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "tests/desktop/shell/DesktopUser.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/video/TestVideos.h"
#include "tests/support/x11/VirtualScreen.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>

#include <X11/keysym.h>

#include <chrono>
#include <cmath>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <memory>
#include <optional>
#include <random>
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

/// 03:01:06:05 in the old cut and 03:01:04:21 in the new one; the project begins at 03:00:00:00.
constexpr const char16_t* Clip = u"42A-3 Maren";
constexpr double OldStart = 66.0 + 5.0 / 24.0;
constexpr double NewStart = 64.0 + 21.0 / 24.0;
/// Its copy in the preview.
constexpr double PreviewStart = 24.0 * 60.0 * 60.0 + NewStart;
constexpr double SameInstant = 1.0 / 384000;
constexpr const char* VfxPrefix = "VFX_****_v";
constexpr const char* VfxPostfix = "_comp";
/// The name of a clip that the selected event moves.
constexpr unsigned long Marked = cadrel::gui::Palette::selection.argb & 0xffffffUL;

/// The four of each event, in the order of the list.
std::vector<std::string> timecodesOf(const core::EventList& list)
{
    std::vector<std::string> texts;
    for (const auto& event : list.events()) {
        std::string text;
        for (const core::Timecode& each : {event->srcIn(), event->srcOut(), event->dstIn(), event->dstOut()})
            text.append(text.empty() ? "" : " ").append(each.toString());
        texts.push_back(text);
    }
    return texts;
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
        const ManagedScreen screen;
        for (int turn = 0; !screen.hasManager(); ++turn) {
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
            if (turn == 3000 || waitpid(m_process, nullptr, WNOHANG) != 0)
                throw std::runtime_error("no window manager; openbox has to be installed");
        }
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
        fs::create_directory(m_folder / "Video");
        for (const char* const cut : {"v07", "v12"})
            fs::create_symlink(standin::tests::reel3VideoOf(cut), videoFile(cut));
    }

    fs::path videoFile(const std::string& cut) const { return m_folder / ("Video/LW_R3_" + cut + ".mov"); }
    /// For the manual, in which nothing has a frame of a window manager's.
    void picture(const std::string& name)
    {
        if (!GetParam())
            m_user->picture(name);
    }
    void modulePicture(const std::string& name)
    {
        if (!GetParam())
            m_user->modulePicture(name);
    }
    void start() { m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}); }
    /// Takes a picture of the sheet where that has a name.
    void addCut(const std::string& button, const char* file, const std::string& name = "")
    {
        m_user->click(DesktopUser::Main, button);
        m_user->click(DesktopUser::Files, "Open Files Button");
        m_user->waitForBox(true);
        m_user->type((m_folder / file).string());
        m_user->press(XK_Return);
        m_user->waitForBox(false);
        if (!name.empty())
            modulePicture(name);
        m_user->click(DesktopUser::Files, "Ok Button");
    }
    void addCuts()
    {
        addCut("Load Old Edl Button", "reel3_v07.edl");
        m_user->save();
        addCut("Load New Edl Button", "reel3_v12.edl", "window-add");
        m_user->save();
    }
    void nameTheVfxShots()
    {
        // Nobody types before he sees the cursor.
        const auto clickInSettings = [this](const char* name) {
            m_user->click(DesktopUser::Settings, name);
            m_user->waitForRest(10);
        };
        m_user->click(DesktopUser::Main, "Settings Button");
        m_user->waitForRest(10);
        clickInSettings("vfxShotHandlingSelect1");
        clickInSettings("vfxShotHandlingPrefix1");
        m_user->type(VfxPrefix);
        clickInSettings("vfxShotHandlingPostfix1");
        m_user->type(VfxPostfix);
        m_user->press(XK_Tab); // A cursor that blinks never rests.
        modulePicture("window-settings");
        m_user->press(XK_Escape);
        m_user->save();
    }
    /// The project has the video of the old cut alone.
    void addNewVideo()
    {
        constexpr int ProjectMenu = 3;
        constexpr int AddVideo = 1;
        m_user->chooseInMenu(ProjectMenu, AddVideo);
        m_user->waitForBox(true);
        m_user->type(videoFile("v12").string());
        m_user->press(XK_Return);
        m_user->waitForBox(false);
        m_user->save();
        m_user->click(DesktopUser::Main, "m_showNewVideosDialogButton");
        m_user->clickSecondVideo("Use as New Video");
        modulePicture("window-videos");
        // Beside the sheet, which closes it.
        m_user->click(DesktopUser::Main, "videodisplay");
        m_user->save();
    }
    void switchPreview()
    {
        m_user->click(DesktopUser::Main, "new component", "Preview");
        m_user->save();
    }
    /// The change events that the two cuts give where the VFX shots are named, and all else is as usual.
    std::vector<std::string> generatedEvents()
    {
        core::DataModel model;
        model.settings().setVfxPattern({VfxPrefix, VfxPostfix, true}, 0);
        const auto load = [&](core::EventList& list, const char* file) {
            core::Framerate shown;
            list.load(cadrel::util::StringUtil::toWide(exampleFile(file).string()), false, shown,
                      model.settings().bRollRenaming(), false);
        };
        load(model.oldEdl(), "reel3_v07.edl");
        load(model.newEdl(), "reel3_v12.edl");
        model.generateChangeEdl();
        return timecodesOf(model.changeEdl());
    }
    std::unique_ptr<core::DataModel> storedModel() const { return storedModel(m_file); }
    static std::unique_ptr<core::DataModel> storedModel(const fs::path& file)
    {
        auto model = std::make_unique<core::DataModel>();
        auto archive = cadrel::tests::archiveOf(cadrel::tests::StoredModel::inFile(file).value().block);
        archive >> *model;
        return model;
    }
    /// The rows of the change list that are selected in the file.
    std::vector<int> selectedChangeEvents()
    {
        const auto model = storedModel();
        std::vector<int> rows;
        cadrel::gui::StoredTable(*model, core::ListKind::Change)
            .selection(static_cast<int>(model->changeEdl().size()))
            .forEach([&](int row) { rows.push_back(row); });
        return rows;
    }
    /// Selects another event, saves, and clicks into the clip that begins there on the first dialogue track; and saves again, when
    /// the clip is marked.
    void clickClip(double start)
    {
        constexpr double IntoTheClip = 4.0;
        m_user->clickChangeEvent(4);
        m_user->save();
        EXPECT_EQ(selectedChangeEvents(), std::vector<int>{4});
        standin::Application host;
        const standin::Project& project = host.openProject(m_file);
        std::size_t row = 0;
        while (TrackIndex(project).rows().at(row).track->name() != u"DIA 1")
            ++row;
        m_user->waitForRest(20);
        EXPECT_NE(m_user->trackColour(project, row, start + IntoTheClip), Marked);
        m_user->clickTrack(project, row, start + IntoTheClip);
        m_user->save();
        m_user->waitForRest(20);
        EXPECT_EQ(m_user->trackColour(project, row, start + IntoTheClip), Marked);
    }
    /// Whether a take of the clip begins there on the first dialogue track of the file, in seconds of the project.
    bool hasClipAt(double start)
    {
        standin::Application host;
        standin::Project& project = host.openProject(m_file);
        for (standin::Track* const track : project.allTracks()) {
            if (std::u16string_view(track->getName()) != u"DIA 1")
                continue;
            for (const auto& each : standin::tests::childrenOf(*track)) {
                if (std::u16string_view(each->getName()) == Clip &&
                    std::abs(each->getStart(nullptr) - start) < SameInstant)
                    return true;
            }
        }
        return false;
    }
    bool isConformed() { return hasClipAt(NewStart) && !hasClipAt(OldStart); }
    bool isAsBefore() { return hasClipAt(OldStart) && !hasClipAt(NewStart); }

    /// The lists of a content of the file, and how many tracks it has. Throws where it isn't whole.
    std::vector<std::string> stateOf(const std::string& content)
    {
        standin::Application host;
        standin::Project& project = host.openProject(m_file, content);
        std::vector<std::string> state{std::to_string(project.allTracks().size())};
        const auto stored = cadrel::tests::StoredModel::in(project);
        if (!stored)
            return state;
        core::DataModel model;
        auto archive = cadrel::tests::archiveOf(stored->block);
        archive >> model;
        for (const core::EventList* const list : {&model.oldEdl(), &model.newEdl(), &model.changeEdl()}) {
            state.push_back(std::to_string(list->size()));
            for (const std::string& timecodes : timecodesOf(*list))
                state.push_back(timecodes);
        }
        return state;
    }
    /// Adds both cuts and generates; then undoes and redoes that, and saves every now and then.
    void workUntilKilled()
    {
        // After which the program keeps unsaved work.
        constexpr std::chrono::milliseconds Thought(600);
        try {
            addCut("Load Old Edl Button", "reel3_v07.edl");
            addCut("Load New Edl Button", "reel3_v12.edl");
            m_user->click(DesktopUser::Main, "Generate Button");
            for (;;) {
                for (const bool isRedone : {false, true, false}) {
                    m_user->press('z', XK_Control_L, isRedone ? XK_Shift_L : 0);
                    std::this_thread::sleep_for(Thought);
                }
                m_user->save();
                m_user->press('z', XK_Control_L, XK_Shift_L);
                m_user->save();
            }
        } catch (const std::runtime_error&) {
        }
    }
    void killAt(std::chrono::milliseconds moment)
    {
        fs::copy_file(exampleFile("reel3.stage"), m_file, fs::copy_options::overwrite_existing);
        start();
        std::thread killer([&] {
            std::this_thread::sleep_for(moment);
            m_user->killProgram();
        });
        workUntilKilled();
        killer.join();
        EXPECT_EQ(m_user->status(), -1) << "It has ended by the signal.";
    }
    /// Opens the project after the program was killed; returns whether unsaved work was offered and recovered.
    bool recover()
    {
        const std::string stored = cadrel::tests::contentOf(m_file);
        EXPECT_EQ(stateOf(stored).front(), stateOf(cadrel::tests::contentOf(exampleFile("reel3.stage"))).front());
        const auto kept = Autosave::read(m_file);
        EXPECT_EQ(fs::exists(Autosave::pathFor(m_file)), kept.has_value());
        const bool isOffered = kept && kept->content != stored;
        m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}, isOffered ? XK_Return : 0);
        if (isOffered) {
            m_user->save();
            EXPECT_EQ(stateOf(cadrel::tests::contentOf(m_file)), stateOf(kept->content));
        }
        EXPECT_FALSE(fs::exists(Autosave::pathFor(m_file)));
        m_user->press('q', XK_Control_L);
        EXPECT_EQ(m_user->status(), 0);
        return isOffered;
    }

    cadrel::tests::VirtualScreen m_screen{1400, 1250};
    std::optional<WindowManager> m_manager;
    cadrel::tests::TempFolder m_folder;
    const fs::path m_file = m_folder / "reel3.stage";
    cadrel::tests::TestProject m_timecodes{core::Framerate(24, 0)};
    std::optional<DesktopUser> m_user;
};

TEST_P(WholeDesktopTest, ConformsAReelByMouseAndKeysAndOpensItAgain)
{
    start();
    picture("desktop-open");
    addCuts();
    nameTheVfxShots();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->save();
    m_user->clickChangeEvent(2);
    picture("desktop-generated");
    m_user->save(); // with what is selected
    const auto generated = storedModel();
    EXPECT_EQ(generated->oldEdl().size(), 152U);
    EXPECT_EQ(generated->newEdl().size(), 153U);
    const std::vector<std::string> changes = timecodesOf(generated->changeEdl());
    EXPECT_EQ(changes, generatedEvents());
    // As many as `cadrel generate` tells.
    ASSERT_EQ(changes.size(), 59U);
    // After a dissolve to a B-roll, which is found by the name of its roll.
    EXPECT_EQ(std::ranges::count(changes, "03:12:14:17 03:12:33:21 03:11:23:09 03:11:42:13"), 1);
    EXPECT_TRUE(isAsBefore());

    addNewVideo();
    // The selected event is 03:00:33:03 03:01:13:23 03:00:31:19 03:01:12:15.
    m_user->waitForStills(33 * 24 + 3, 31 * 24 + 19);
    switchPreview();
    EXPECT_TRUE(storedModel()->isPreviewActive());
    EXPECT_TRUE(hasClipAt(PreviewStart));
    EXPECT_TRUE(isAsBefore());
    modulePicture("window-preview");
    if (!GetParam())
        m_user->menuPicture(2, "window-menu");
    switchPreview();
    EXPECT_FALSE(storedModel()->isPreviewActive());
    EXPECT_FALSE(hasClipAt(PreviewStart));

    m_user->click(DesktopUser::Main, "Cadrel Button");
    m_user->waitForBox(true);
    picture("desktop-question");
    m_user->press(XK_Return); // Keep
    m_user->waitForBox(false);
    m_user->save();
    EXPECT_TRUE(isConformed());
    m_user->press('g');
    picture("desktop-conformed");
    m_user->press('g');

    m_user->press('z', XK_Control_L);
    m_user->save();
    EXPECT_TRUE(isAsBefore());
    m_user->press('z', XK_Control_L, XK_Shift_L);
    m_user->save();
    EXPECT_TRUE(isConformed());
    m_user->press('q', XK_Control_L);
    EXPECT_EQ(m_user->status(), 0);

    start();
    m_user->waitForTitle("nothing is unsaved", [](const std::string& text) { return text == "reel3.stage - Cadrel"; });
    m_user->closeWindow();
    EXPECT_EQ(m_user->status(), 0) << "Nothing was changed, so that nothing is asked.";
    EXPECT_TRUE(isConformed());
}

TEST_P(WholeDesktopTest, GivesTheKeysToTheTableThatIsClickedAfterABoxWasOpen)
{
    start();
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->save();
    m_user->clickChangeEvent(2);
    m_user->waitForRest(20); // or the window manager hasn't dealt with the click yet
    m_user->press(XK_Down);
    m_user->press(XK_Down);
    m_user->save();
    EXPECT_EQ(selectedChangeEvents(), std::vector<int>{4});
}

TEST_P(WholeDesktopTest, SelectsTheEventThatMovesTheClipThatIsClickedBeforeAndAfterTheRun)
{
    start();
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->save();
    m_user->press('f');
    clickClip(OldStart);
    EXPECT_EQ(selectedChangeEvents(), std::vector<int>{2});
    EXPECT_EQ(timecodesOf(storedModel()->changeEdl())[2], "03:00:33:03 03:01:13:23 03:00:31:19 03:01:12:15");

    m_user->click(DesktopUser::Main, "Cadrel Button");
    m_user->waitForBox(true);
    m_user->press(XK_Return); // Keep
    m_user->waitForBox(false);
    m_user->save();
    m_user->press('f');
    // The run has left out the first event, which moves nothing.
    clickClip(NewStart);
    EXPECT_EQ(selectedChangeEvents(), std::vector<int>{1});
    EXPECT_EQ(timecodesOf(storedModel()->changeEdl())[1], "03:00:33:03 03:01:13:23 03:00:31:19 03:01:12:15");
}

TEST_P(WholeDesktopTest, GivesTheKeysToAQuestionHoweverItWasClickedFor)
{
    start();
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->save();
    int boxes = 0;
    for (const int pause : {0, 30, 90, 200}) {
        SCOPED_TRACE(testing::Message() << pause << " ms between the clicks");
        m_user->doubleClick(DesktopUser::Main, "Cadrel Button", std::chrono::milliseconds(pause));
        m_user->waitForBox(true);
        // The second click may have asked for another one.
        do {
            m_user->waitForRest(10);
            m_user->press(XK_Escape);
            m_user->waitForRest(10);
        } while (m_user->isBoxOpen() && ++boxes < 10);
        m_user->waitForBox(false);
    }
    m_user->click(DesktopUser::Main, "Cadrel Button");
    m_user->waitForBox(true);
    m_user->waitForRest(10);
    m_user->clickBesideTheBox();
    m_user->waitForRest(10);
    m_user->press(XK_Return); // Keep
    m_user->waitForBox(false);
    m_user->save();
    EXPECT_TRUE(isConformed());
}

TEST_P(WholeDesktopTest, ShowsNothingOfABoxBeneathTheNextOne)
{
    start();
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->waitForTitle("there is unsaved work", [](const std::string& text) { return text.starts_with("*"); });
    std::vector<std::vector<char>> pictures;
    for (const bool isRightAfter : {false, true}) {
        m_user->waitForRest(40);
        m_user->click(DesktopUser::Main, "Cadrel Button");
        m_user->waitForBox(true);
        m_user->waitForRest(20);
        if (isRightAfter)
            m_user->closeWindow();
        m_user->press(XK_Escape);
        if (!isRightAfter) {
            m_user->waitForBox(false);
            m_user->waitForRest(40);
            m_user->closeWindow();
            m_user->waitForBox(true);
        }
        m_user->waitForRest(40);
        pictures.push_back(m_user->pixels());
        m_user->press(XK_Escape);
        m_user->waitForBox(false);
    }
    EXPECT_TRUE(pictures[0] == pictures[1]) << "It is the same question.";
    EXPECT_TRUE(m_user->isRunning());
}

TEST_P(WholeDesktopTest, OpensTwoProjectsInTabsOfWhichEachHasAWorkOfItsOwn)
{
    const fs::path other = m_folder / "other.stage";
    fs::copy_file(m_file, other);
    m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string(), other.string()});
    const auto waitForName = [&](const std::string& name) {
        m_user->waitForTitle("it is " + name,
                             [&](const std::string& text) { return text.ends_with(name + " - Cadrel"); });
    };
    waitForName("other.stage");
    addCut("Load Old Edl Button", "reel3_v07.edl");
    m_user->save();
    m_user->clickTab(0);
    waitForName("reel3.stage");
    m_user->waitForRest(20);
    addCut("Load New Edl Button", "reel3_v12.edl");
    m_user->save();
    EXPECT_TRUE(storedModel()->oldEdl().isEmpty());
    EXPECT_EQ(storedModel()->newEdl().size(), 153U);

    m_user->press('w', XK_Control_L);
    waitForName("other.stage");
    EXPECT_TRUE(m_user->isRunning());
    m_user->press('q', XK_Control_L);
    EXPECT_EQ(m_user->status(), 0);
    EXPECT_EQ(storedModel(other)->oldEdl().size(), 152U);
    EXPECT_TRUE(storedModel(other)->newEdl().isEmpty());
}

TEST_P(WholeDesktopTest, TakesADroppedEdlIntoTheTableOverWhichItWasLetGo)
{
    start();
    m_user->dropOnTracks(m_folder / "reel3_v07.edl");
    m_user->waitForBox(true); // It tells where EDLs belong.
    m_user->press(XK_Return);
    m_user->waitForBox(false);

    m_user->dropOn(DesktopUser::Main, "New Table List Box", m_folder / "reel3_v12.edl");
    m_user->click(DesktopUser::Files, "Ok Button");
    m_user->save();
    EXPECT_EQ(storedModel()->newEdl().size(), 153U);
    EXPECT_TRUE(storedModel()->oldEdl().isEmpty());
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

TEST_P(WholeDesktopTest, KeepsUnsavedWorkWhenTheSystemEndsIt)
{
    start();
    addCuts();
    m_user->click(DesktopUser::Main, "Generate Button");
    m_user->waitForTitle("there is unsaved work", [](const std::string& text) { return text.starts_with("*"); });
    if (GetParam()) {
        m_user->closeWindow();
        m_user->waitForBox(true);
    }
    m_user->signalProgram(GetParam() ? SIGHUP : SIGTERM);
    EXPECT_EQ(m_user->status(), -1);
    EXPECT_TRUE(storedModel()->changeEdl().isEmpty());
    EXPECT_FALSE(fs::exists(DocumentLock::pathFor(m_file)));

    EXPECT_TRUE(recover());
    EXPECT_EQ(storedModel()->changeEdl().size(), 60U);
}

// A few times; the variable CADREL_KILLS says how often else.
TEST_P(WholeDesktopTest, LeavesTheFileAndTheUnsavedWorkWholeWhenItIsKilledAtAnyMoment)
{
    constexpr int Longest = 5000;
    const char* const wanted = std::getenv("CADREL_KILLS");
    const int count = wanted ? std::atoi(wanted) : 4;
    std::mt19937 random(GetParam() ? 2 : 1);
    int offered = 0;
    for (int trial = 0; trial < count; ++trial) {
        const auto moment = std::chrono::milliseconds(random() % Longest);
        SCOPED_TRACE(testing::Message() << "killed after " << moment.count() << " ms");
        killAt(moment);
        offered += recover() ? 1 : 0;
        if (HasFailure())
            return;
    }
    std::cout << "unsaved work was offered " << offered << " times of " << count << '\n';
    if (count >= 20) {
        EXPECT_GE(offered, count / 5);
    }
}

TEST_P(WholeDesktopTest, FitsOnTheScreenWithItsFrame)
{
    struct ScreenSize {
        int width;
        int height;
    };
    for (const auto& [width, height] : {ScreenSize{1366, 768}, {1600, 1000}, {1920, 1080}, {2560, 1440}}) {
        SCOPED_TRACE(testing::Message() << width << " x " << height);
        m_user.reset();
        m_manager.reset();
        const cadrel::tests::VirtualScreen screen(width, height);
        if (GetParam())
            m_manager.emplace();
        m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}, 0, DesktopUser::Size::Own);
        m_user->waitForRest(20);
        const DesktopUser::Area frame = m_user->frame();
        EXPECT_GE(frame.x, 0);
        EXPECT_GE(frame.y, 0);
        EXPECT_LE(frame.x + frame.width, width);
        EXPECT_LE(frame.y + frame.height, height);
        const DesktopUser::Area module = m_user->moduleArea();
        EXPECT_LE(module.y + module.height, height);
        EXPECT_GE(module.height, 450) << "most of it is Cadrel's";
        m_user.reset();
        m_manager.reset();
        fs::remove_all(m_folder / "state");
    }
}

TEST_P(WholeDesktopTest, ComesUpAsItWasTheLastTime)
{
    const auto quit = [this] {
        m_user->press('q', XK_Control_L);
        EXPECT_EQ(m_user->status(), 0);
    };
    const auto startAgain = [this] {
        m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string()}, 0, DesktopUser::Size::Own);
        m_user->waitForRest(20);
    };
    start();
    m_user->resizeTo(1100, 900);
    m_user->dragDivider(40);
    const int top = m_user->moduleArea().y - m_user->area().y;
    quit();
    startAgain();
    EXPECT_EQ(m_user->area().width, 1100);
    EXPECT_EQ(m_user->area().height, 900);
    EXPECT_EQ(m_user->moduleArea().y - m_user->area().y, top);
    if (!GetParam())
        return;
    m_user->switchMaximised();
    EXPECT_EQ(m_user->frame().width, 1400);
    quit();
    startAgain();
    EXPECT_EQ(m_user->frame().width, 1400);
    m_user->switchMaximised();
    EXPECT_EQ(m_user->area().width, 1100) << "It is as large as before it was maximised.";
    EXPECT_EQ(m_user->area().height, 900);
}

TEST_P(WholeDesktopTest, CanBeWorkedByTheKeyboardAlone)
{
    start();
    m_user->pressOnTracks('+'); // A project that has just been opened has the keyboard on its tracks.
    m_user->openAndCloseMenus();
    m_user->pressOnTracks('+');
    m_user->openAndCloseMenus();
    m_user->press('o', XK_Control_L);
    m_user->waitForBox(true);
    m_user->press(XK_Escape);
    m_user->waitForBox(false);
    m_user->pressOnTracks('+');

    m_user->press(XK_F6);
    m_user->waitForKeyboardInModule();
    m_user->press(XK_F6);
    m_user->pressOnTracks('+');
    constexpr int ProjectMenu = 3;
    constexpr int CadrelEntry = 0;
    m_user->chooseInMenu(ProjectMenu, CadrelEntry);
    m_user->waitForKeyboardInModule();
    m_user->openAndCloseMenus();
    m_user->press(XK_F6);
    m_user->waitForKeyboardInModule();
}

TEST_P(WholeDesktopTest, GoesFromTabToTabByTheKeyboard)
{
    const fs::path other = m_folder / "other.stage";
    fs::copy_file(m_file, other);
    m_user.emplace(m_folder / "", std::vector<std::string>{m_file.string(), other.string()});
    const auto waitFor = [this](const std::string& name) {
        m_user->waitForTitle(name + " is in front",
                             [&](const std::string& text) { return text == name + " - Cadrel"; });
    };
    waitFor("other.stage");
    m_user->press(XK_Tab, XK_Control_L);
    waitFor("reel3.stage");
    m_user->press(XK_F6);
    m_user->waitForKeyboardInModule();
    m_user->press(XK_Tab, XK_Control_L);
    waitFor("other.stage");
    m_user->press(XK_Tab, XK_Control_L, XK_Shift_L);
    waitFor("reel3.stage");
}

INSTANTIATE_TEST_SUITE_P(WithoutAndWithAWindowManager, WholeDesktopTest, testing::Bool(),
                         [](const auto& each) { return each.param ? "WithAWindowManager" : "WithoutAWindowManager"; });

} // namespace
} // namespace desktop::tests
