// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/model/VideoList.h"
#include "standin/edit/ActionManager.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Track.h"
#include "tests/module/HarbourFilm.h"
#include "tests/module/LoadedWindow.h"
#include "tests/support/standin/RandomProject.h"

#include <gtest/gtest.h>

#include <X11/keysym.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <map>
#include <random>
#include <utility>

namespace cadrel::tests {
namespace {

using standin::tests::SeededChance;
using Velmark::IActionManager;

/// What the environment says, or else `otherwise`.
std::uint64_t setting(const char* name, std::uint64_t otherwise)
{
    const char* const value = std::getenv(name);
    return value ? std::stoull(value) : otherwise;
}

/// A user who clicks and types without any sense, while projects are opened, switched and closed. CADREL_WINDOW_SECONDS says for how
/// long, CADREL_WINDOW_SEED which one. What was done last stands in `window/random-user.txt` of the build.
class RandomUserTest : public LoadedWindow {
protected:
    RandomUserTest()
    {
        writeHarbourFilm(m_folder / "Empty.stage");
        writeFilledFilm(m_folder / "Filled.stage");
        for (const char* const list : {"old.edl", "new.edl"})
            std::filesystem::copy_file(exampleFile(std::string("tworeels/") + list), m_folder / list);
        std::filesystem::create_directories(programPath("../window"));
        m_log.open(programPath("../window/random-user.txt"));
        m_log << "Seed " << m_seed << std::endl;
    }

    /// With both cuts and the change list.
    void writeFilledFilm(const std::filesystem::path& file)
    {
        writeHarbourFilm(file);
        core::DataModel filled;
        filled.oldEdl().load(widePath(exampleFile("tworeels/old.edl")), true);
        filled.newEdl().load(widePath(exampleFile("tworeels/new.edl")), true);
        filled.generateChangeEdl();
        standin::Application host;
        standin::Project& project = host.openProject(file);
        StoredModel::of(filled).putInto(project);
        host.saveProject(project, file);
    }

    // ---- What the user does

    void act();
    void useMouse();
    void useKeys();
    void useMenu();
    void useEditBox();
    void useProjects();
    void chooseFiles();
    void openOne(const char* name);

    /// Each of the open projects, once.
    template <class Action>
    void forEachProject(const Action& action)
    {
        const auto projects = m_application.projects().projects();
        for (const auto& project : projects)
            action(*project);
    }

    // ---- What came of it

    /// What the user's acts have done, so that a test sees whether they reach the window at all.
    struct Effects {
        std::size_t made = 0;    ///< entries of undo lists, also by redo
        std::size_t undone = 0;  ///< not by undoAll()
        std::size_t windows = 0; ///< menus and the like beside the host's window
        std::size_t told = 0;    ///< alerts and other messages

        bool areEnough() const { return made >= 5 && undone >= 1 && windows >= 5; }
    };
    void look();
    void lookAtEntries(standin::Project& project);
    void lookAtMessages();
    void expectNamedEntries();
    /// Takes everything back and expects what there was when the project was opened.
    void undoAll(standin::Project& project);
    std::string contentOf(standin::Project& project);

    const std::uint64_t m_seed = setting("CADREL_WINDOW_SEED", std::random_device()());
    SeededChance m_chance{m_seed};
    std::ofstream m_log;
    std::map<standin::Project*, std::string> m_first;     ///< what was in each project when it was opened
    std::map<standin::Project*, std::size_t> m_doneCount; ///< entries that were done when they were last looked at
    Effects m_effects;
    int m_windowCount = 0;
};

/// The tracks, the pool and the lists. Sorting, selection and settings aren't steps of the undo list, nor is what the transport does.
std::string RandomUserTest::contentOf(standin::Project& project)
{
    const auto current = model(project);
    core::serialize::ByteArchive archive;
    archive << current->oldEdl() << current->newEdl() << current->changeEdl() << current->videoList();
    const std::vector<std::uint8_t> lists = bytesOf(archive);
    const std::string text = standin::ProjectFile::toText(project);
    return text.substr(text.find("\"pool\"")) + std::string(lists.begin(), lists.end());
}

void RandomUserTest::openOne(const char* name)
{
    standin::Project& project = open(m_folder / name);
    turn();
    m_first[&project] = contentOf(project);
    m_doneCount[&project] = project.undoList().doneCount();
}

void RandomUserTest::useMouse()
{
    const std::vector<WindowPlaces::Place> places = m_places.all();
    constexpr std::array<unsigned long, 4> Held{0, 0, XK_Shift_L, XK_Control_L};
    const auto somewhere = [&]() -> WindowPlaces::Place {
        if (m_chance.oneIn(4))
            return rowPlace(core::ListKind::Change, static_cast<int>(m_chance.below(6)));
        if (m_chance.oneIn(4))
            return {static_cast<int>(m_chance.below(Width)), static_cast<int>(m_chance.below(Height)), 1, 1};
        return places[m_chance.below(places.size())];
    };
    const WindowPlaces::Place place = somewhere();
    moveTo(place);
    m_log << "mouse " << place.x << ' ' << place.y;
    switch (m_chance.below(8)) {
    case 0:
        m_log << " right";
        return m_user.rightClick();
    case 1:
        m_log << " double";
        return m_user.doubleClick();
    case 2:
        m_log << " wheel";
        return m_chance.oneIn(2) ? m_user.wheelUp() : m_user.wheelDown();
    case 3:
        m_log << " drag";
        return m_user.dragTo(Left + static_cast<int>(m_chance.below(Width)),
                             Top + static_cast<int>(m_chance.below(Height)));
    default:
        return m_user.click(m_chance.oneOf(Held));
    }
}

void RandomUserTest::useKeys()
{
    constexpr std::array<unsigned long, 22> Keys{XK_Tab,    XK_Return, XK_Escape, XK_Delete,    XK_Up,    XK_Down,
                                                 XK_Left,   XK_Right,  XK_Home,   XK_End,       XK_Prior, XK_Next,
                                                 XK_space,  XK_F10,    XK_Menu,   XK_BackSpace, XK_Down,  XK_Down,
                                                 XK_Return, XK_F5,     XK_minus,  XK_plus};
    constexpr std::array<unsigned long, 5> Letters{'z', 'a', 'c', 'v', 'x'};
    const unsigned long key = m_chance.oneOf(Keys);
    switch (m_chance.below(6)) {
    case 0:
        m_log << "type";
        return m_user.type(std::to_string(m_chance.below(100000000)));
    case 1: {
        const unsigned long letter = m_chance.oneOf(Letters);
        m_log << "control " << letter;
        return m_user.press(letter, XK_Control_L, m_chance.oneIn(3) ? XK_Shift_L : 0);
    }
    case 2:
        m_log << "shift " << key;
        return m_user.press(key, XK_Shift_L);
    default:
        m_log << "key " << key;
        return m_user.press(key);
    }
}

/// Of a table, with any of its items.
void RandomUserTest::useMenu()
{
    m_log << "menu";
    const std::int32_t list = m_chance.oneIn(4) ? core::ListKind::Old : core::ListKind::Change;
    const int row = static_cast<int>(m_chance.below(5));
    clickRow(list, row);
    if (m_chance.oneIn(3))
        clickRow(list, static_cast<int>(m_chance.below(5)), XK_Shift_L);
    m_user.rightClick();
    turn(2);
    for (const unsigned long key : std::array<unsigned long, 3>{XK_Down, XK_Right, XK_Down}) {
        for (std::uint64_t times = m_chance.below(3); times > 0; --times)
            m_user.press(key);
    }
    m_user.press(m_chance.oneIn(5) ? XK_Escape : XK_Return);
}

void RandomUserTest::useEditBox()
{
    m_log << "edit";
    doubleClickRow(core::ListKind::Change, static_cast<int>(m_chance.below(5)));
    turn(2);
    for (std::uint64_t times = m_chance.below(8); times > 0; --times)
        m_user.press(XK_Tab);
    m_user.type("010000" + std::to_string(10 + m_chance.below(20)));
    m_user.press(XK_Return);
}

void RandomUserTest::useProjects()
{
    const auto projects = m_application.projects().projects();
    standin::Project* const one = projects.empty() ? nullptr : projects[m_chance.below(projects.size())].get();
    switch (m_chance.below(6)) {
    case 0:
    case 1:
        m_log << "open";
        if (projects.size() < 4)
            openOne(m_chance.oneIn(3) ? "Empty.stage" : "Filled.stage");
        return;
    case 2:
        m_log << "close";
        if (!one)
            return;
        if (m_chance.oneIn(2))
            undoAll(*one);
        m_first.erase(one);
        m_doneCount.erase(one);
        return m_application.closeProject(*one);
    case 3:
        m_log << "activate none";
        return m_application.activateProject(nullptr);
    default:
        m_log << "activate";
        return m_application.activateProject(one);
    }
}

void RandomUserTest::chooseFiles()
{
    const auto file = [this] {
        return std::array{m_folder / "old.edl", m_folder / "new.edl", m_folder / "list.edl",
                          m_folder / "missing.edl"}[m_chance.below(4)];
    };
    switch (m_chance.below(4)) {
    case 0:
        return takeFiles({});
    case 1:
        return takeFiles({file(), file()});
    default:
        return takeFiles({file()});
    }
}

void RandomUserTest::act()
{
    const std::uint64_t kind = m_chance.below(40);
    if (kind < 2)
        useProjects();
    else if (kind < 4)
        useMenu();
    else if (kind < 5)
        useEditBox();
    else if (kind < 24)
        useMouse();
    else
        useKeys();
    m_log << std::endl;
    if (m_chance.oneIn(3))
        turn();
    else
        work();
}

void RandomUserTest::lookAtEntries(standin::Project& project)
{
    const std::size_t now = project.undoList().doneCount();
    const std::size_t before = std::exchange(m_doneCount[&project], now);
    m_effects.made += now > before ? now - before : 0;
    m_effects.undone += before > now ? before - now : 0;
}

/// What a failure within the window would be told as.
void RandomUserTest::lookAtMessages()
{
    const std::string told = messages();
    m_effects.told += static_cast<std::size_t>(std::count(told.begin(), told.end(), '\n'));
    for (const char* const internal :
         {"This could not be carried out.", "The data is damaged", "There is not enough memory"})
        EXPECT_EQ(told.find(internal), std::string::npos) << told;
}

void RandomUserTest::look()
{
    forEachProject([this](standin::Project& project) { lookAtEntries(project); });
    lookAtMessages();
    const int windows = m_windows.windowCount();
    m_effects.windows += windows > std::exchange(m_windowCount, windows) ? 1 : 0;
}

void RandomUserTest::expectNamedEntries()
{
    forEachProject([](standin::Project& project) {
        for (std::size_t index = 0; index < project.undoList().size(); ++index)
            ASSERT_FALSE(project.undoList().nameAt(index).empty());
    });
}

void RandomUserTest::undoAll(standin::Project& project)
{
    m_application.activateProject(&project);
    turn(2);
    while (project.undoList().canUndo()) {
        const std::size_t before = project.undoList().doneCount();
        m_application.actions().invoke(IActionManager::EditCategory, IActionManager::Undo, 0);
        ASSERT_EQ(project.undoList().doneCount(), before - 1);
        if (m_chance.oneIn(2))
            work();
    }
    turn();
    m_doneCount[&project] = project.undoList().doneCount();
    lookAtMessages();
    // Which picture a track has is said of it like a setting; nobody has said it of the films.
    for (standin::Track* const track : project.allTracks())
        track->removeAttribute(Velmark::AttributeKey::VideoType);
    EXPECT_EQ(contentOf(project), m_first.at(&project));
}

TEST_F(RandomUserTest, LeavesNothingThatCannotBeUndone)
{
    RecordProperty("seed", std::to_string(m_seed));
    std::cout << "CADREL_WINDOW_SEED=" << m_seed << std::endl;
    start(m_folder / "Filled.stage");
    m_first[m_project] = contentOf(*m_project);
    for (int box = 0; box < 2000; ++box)
        chooseFiles();

    using std::chrono::steady_clock;
    const auto end = steady_clock::now() + std::chrono::seconds(setting("CADREL_WINDOW_SECONDS", 10));
    // A short run may have done little by chance.
    const auto latestEnd = end + std::chrono::minutes(1);
    std::uint64_t acts = 0;
    while (!HasFailure() && steady_clock::now() < (m_effects.areEnough() ? end : latestEnd)) {
        act();
        look();
        expectNamedEntries();
        ++acts;
    }
    std::cout << acts << " acts, " << m_effects.made << " entries made, " << m_effects.undone << " undone, "
              << m_effects.windows << " windows opened, " << m_effects.told << " messages" << std::endl;
    EXPECT_GT(acts, 100U);
    EXPECT_TRUE(m_effects.areEnough()) << "the acts don't reach the window";

    forEachProject([this](standin::Project& project) {
        undoAll(project);
        m_application.closeProject(project);
    });
    turn();
}

} // namespace
} // namespace cadrel::tests
