// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/module/LoadedWindow.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "gui/main/MainLayout.h"
#include "gui/table/StoredTable.h"
#include "standin/project/Track.h"
#include "standin/services/FileSelector.h"

#include <cmath>
#include <sstream>
#include <stdexcept>

namespace cadrel::tests {

using core::DataModel;
using core::ListKind;
using Place = WindowPlaces::Place;

namespace {

std::string narrow(const std::u16string& text)
{
    return {text.begin(), text.end()};
}

} // namespace

void LoadedWindow::start(const std::filesystem::path& project)
{
    load();
    m_project = &open(project);
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
    // The window has no keyboard before a click that it has seen.
    const unsigned long before = m_user.focus();
    clickRow(ListKind::Change, 0);
    expectSoon("the keyboard is in the window", [&] { return m_user.focus() != before; });
}

standin::Project& LoadedWindow::open(const std::filesystem::path& file)
{
    standin::Project& project = m_application.openProject(file);
    m_application.activateProject(&project);
    return project;
}

// ---- What the user does --------------------------------------------------------------------------------------------

void LoadedWindow::moveTo(const Place& place)
{
    m_user.moveTo(Left + place.x + place.width / 2, Top + place.y + place.height / 2);
}

void LoadedWindow::click(const std::string& sheet, const std::string& name, const std::string& text)
{
    moveTo(m_places.at(sheet, name, text));
    m_user.click();
}

void LoadedWindow::clickHours(const Place& input)
{
    constexpr int Hours = 20;
    moveTo({input.x, input.y, 2 * Hours, input.height});
    m_user.click();
}

std::string LoadedWindow::tableName(std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return "Old Table List Box";
    case ListKind::New:
        return "New Table List Box";
    default:
        return "Change Table List Box";
    }
}

Place LoadedWindow::rowPlace(std::int32_t listKind, int row) const
{
    const Place first = m_places.at(Main, tableName(listKind) + " Row");
    return first.movedBy(0, row * first.height);
}

void LoadedWindow::clickRow(std::int32_t listKind, int row, unsigned long held)
{
    moveTo(rowPlace(listKind, row));
    m_user.click(held);
}

void LoadedWindow::doubleClickRow(std::int32_t listKind, int row)
{
    moveTo(rowPlace(listKind, row));
    m_user.doubleClick();
}

void LoadedWindow::clickColumn(std::int32_t listKind, const std::string& title)
{
    click(Main, tableName(listKind) + " Column", title);
}

void LoadedWindow::chooseInMenu(std::int32_t listKind, int row, const std::vector<unsigned long>& keys)
{
    const int windows = m_windows.windowCount();
    moveTo(rowPlace(listKind, row));
    m_user.rightClick();
    expectSoon("the menu is open", [&] { return m_windows.windowCount() > windows; });
    for (const unsigned long key : keys)
        m_user.press(key);
    expectSoon("the menu is closed", [&] { return m_windows.windowCount() == windows; });
}

void LoadedWindow::takeFiles(const std::vector<std::filesystem::path>& files)
{
    std::vector<std::u16string> paths;
    for (const std::filesystem::path& file : files)
        paths.push_back(file.u16string());
    m_application.fileSelector().choose(paths);
}

Place LoadedWindow::inEditDialog(std::int32_t listKind, int row, const std::string& name) const
{
    const Place mouse = rowPlace(listKind, row);
    const Place box = m_places.at(Edit, "");
    using gui::MainLayout;
    return m_places.at(Edit, name)
        .movedBy(MainLayout::besideMouse(mouse.x + mouse.width / 2, box.width, Width),
                 MainLayout::besideMouse(mouse.y + mouse.height / 2, box.height, Height));
}

// ---- What came of it -----------------------------------------------------------------------------------------------

void LoadedWindow::expectSoon(const std::string& what, const std::function<bool()>& condition)
{
    if (!turnUntil(condition))
        throw std::runtime_error("it doesn't come about that " + what);
}

void LoadedWindow::expectEntry(std::size_t count, const std::u16string& name)
{
    const standin::UndoList& list = m_project->undoList();
    expectSoon("there is the entry " + narrow(name), [&] { return list.doneCount() == count; });
    EXPECT_EQ(list.nameAt(count - 1), name);
}

std::unique_ptr<DataModel> LoadedWindow::model(standin::Project& project)
{
    project.announceStoring();
    auto model = std::make_unique<DataModel>();
    auto archive = archiveOf(StoredModel::in(project).value().block);
    archive >> *model;
    return model;
}

std::vector<std::string> LoadedWindow::events(std::int32_t listKind)
{
    const auto current = model();
    const core::EventList& list = core::listOf(*current, listKind);
    std::vector<std::string> texts;
    for (std::size_t index = 0; index < list.size(); ++index)
        texts.push_back(list.at(index).rollName() + " " + timecodesOf(list.at(index)));
    return texts;
}

std::vector<int> LoadedWindow::selection(std::int32_t listKind)
{
    const auto current = model();
    const int count = static_cast<int>(core::listOf(*current, listKind).size());
    std::vector<int> rows;
    gui::StoredTable(*current, listKind).selection(count).forEach([&](int row) { rows.push_back(row); });
    return rows;
}

std::vector<std::string> LoadedWindow::clipsOn(const std::u16string& track)
{
    std::vector<std::string> clips;
    for (standin::Track* const each : m_project->allTracks()) {
        if (track != each->getName())
            continue;
        for (const auto& clip : standin::tests::childrenOf(*each)) {
            std::ostringstream text;
            text << narrow(clip->getName()) << ' ' << clip->getStart(nullptr) << ' ' << clip->getEnd(nullptr);
            clips.push_back(text.str());
        }
    }
    return clips;
}

void LoadedWindow::waitForStillness()
{
    // Longer than from a change to its being drawn, and shorter than the blinking of a caret.
    constexpr int StillTurns = 8;
    std::vector<char> shown;
    int still = 0;
    expectSoon("the window comes to rest", [&] {
        auto now = m_windows.pixelsOf(*window()->native());
        still = now == shown ? still + 1 : 0;
        shown = std::move(now);
        return still > StillTurns;
    });
}

void LoadedWindow::picture(const std::string& name)
{
    waitForStillness();
    const std::filesystem::path folder = std::filesystem::path(programPath("../window")).lexically_normal();
    std::filesystem::create_directories(folder);
    m_windows.writePicture(*window()->native(), folder / (name + ".png"));
}

} // namespace cadrel::tests
