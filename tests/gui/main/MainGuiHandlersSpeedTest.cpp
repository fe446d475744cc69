// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/RunRecord.h"
#include "core/serialize/ByteArchive.h"
#include "gui/main/MainGui.h"
#include "gui/table/EventColumn.h"
#include "tests/gui/main/TimedWindow.h"
#include "tests/support/core/TreeEdls.h"

#include <array>
#include <functional>
#include <string>

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::EventListChangeContext;
using core::ListKind;
using core::Timecode;

class MainGuiHandlersSpeedTest : public TimedWindow {
protected:
    /// What the notifier tells a window with a project, and what the user does that leaves the lists as they are. What is done
    /// alike again is undone between.
    void expectEveryHandlerFast(double limit)
    {
        const auto expectStep = [&](const std::string& step, const std::function<void()>& action) {
            expectFast(step, limit, action);
        };
        expectStep("kind 0, the same model", [this] { activate(); });
        expectStep("kind 0, another model", [this] {
            m_notifier.notify(core::DataModelChangeContext(&m_other));
            activate();
        });
        expectStep("kind 0, no model", [this] {
            deactivate();
            activate();
        });
        expectStep("kind 1", [this] { notify(ChangeContext(ChangeContext::SettingsChanged)); });
        for (const std::int32_t kind : {ListKind::Old, ListKind::New, ListKind::Change})
            expectStep("kind 2 of list " + std::to_string(kind),
                       [this, kind] { notify(EventListChangeContext(kind)); });
        expectStep("kind 4", [this] { notify(ChangeContext(ChangeContext::VideoListChanged)); });
        expectStep("kind 5", [this] { notify(ChangeContext(ChangeContext::PreviewStateChanged)); });

        const int rows = static_cast<int>(list(ListKind::Change).size());
        int row = 0;
        expectStep("select one", [&] { table("Change").selectRow(row = (row + 1) % rows); });
        for (const char* const name : {"Old", "New", "Change"})
            expectStep(std::string("select all of ") + name, [&, name] {
                table(name).deselectAllRows();
                tableModel(name).selectAll();
            });
        expectStep("kind 0 with all selected", [this] { activate(); });
        expectStep("kind 2 with all selected", [this] { notify(EventListChangeContext(ListKind::Change)); });
        juce::SparseSet<int> alternating;
        alternating.addRange({0, rows});
        for (int each = 1; each < rows; each += 2)
            alternating.removeRange({each, each + 1});
        expectStep("select every other", [&] { table("Change").setSelectedRows(alternating); });
        EXPECT_EQ(tableModel("Change").getNumSelectedRows(), (rows + 1) / 2);
        expectStep("kind 2 with every other selected", [this] { notify(EventListChangeContext(ListKind::Change)); });
        expectStep("deselect all", [&] { table("Change").deselectAllRows(); });

        bool forwards = false;
        for (const char* const name : {"Old", "New", "Change"})
            expectStep(std::string("sort ") + name, [&, name] {
                forwards = !forwards;
                table(name).getHeader().setSortColumnId(gui::EventColumn::ClipName, forwards);
            });
        expectStep("sort with all selected", [&] {
            tableModel("Change").selectAll();
            forwards = !forwards;
            table("Change").getHeader().setSortColumnId(gui::EventColumn::ClipName, forwards);
        });
        table("Change").selectRow(0);

        const auto openAndClose = [this](const char* name, const juce::Component& sheet) {
            click(name);
            EXPECT_TRUE(sheet.isVisible());
            m_window.press(juce::KeyPress::escapeKey);
            EXPECT_FALSE(sheet.isVisible());
        };
        expectStep("open and close the settings", [&] { openAndClose("Settings Button", settingsDialog()); });
        bool isOtherName = false;
        expectFast(
            "open and close the settings with a new VFX name", limit,
            [&] { openAndClose("Settings Button", settingsDialog()); },
            [&] {
                isOtherName = !isOtherName;
                m_model.settings().setVfxPattern({isOtherName ? "A017C" : "B021C", "_261122_R1AB", true}, 0);
            });
        for (const char* const name : {"Load Old Edl Button", "Load Change Edl Button"})
            expectStep("open and close the box of the files", [&, name] { openAndClose(name, fileDialog()); });
        expectStep("open and close the videos", [&] { openAndClose("m_showNewVideosDialogButton", videosDialog()); });
        expectStep("open and cancel the box of an event", [this] {
            editFirst();
            m_window.press(juce::KeyPress::escapeKey);
        });
        expectStep("edit an event", [this] {
            editFirst();
            const auto event = tableModel("Change").getSelectedEvents().front();
            const Timecode start = event->srcIn() + Timecode(1);
            find<gui::TcInput>(editDialog(), "m_copyInEdit").setValue(start, juce::sendNotification);
            m_window.press(juce::KeyPress::returnKey);
            ASSERT_FALSE(editDialog().isVisible());
            EXPECT_EQ(event->srcIn().toString(), start.toString());
        });
        expectStep("switch the preview on and off", [this] {
            m_engine.calls.clear();
            click("new component");
            click("new component");
            EXPECT_EQ(m_engine.calls.size(), 3U);
        });
        expectStep("resize", [this] {
            m_gui->setSize(1400, 800);
            m_gui->setSize(gui::MainGui::Width, gui::MainGui::Height);
        });
        expectStep("arrow keys", [this] {
            m_window.press(juce::KeyPress::rightKey);
            m_window.press(juce::KeyPress::leftKey);
        });
    }
    void editFirst()
    {
        table("Change").grabKeyboardFocus();
        m_window.press(juce::KeyPress::returnKey);
        ASSERT_TRUE(editDialog().isVisible());
    }

    core::DataModel m_other;
};

/// A hundred thousand events: a third in each list.
class MainGuiManyEventsTest : public MainGuiHandlersSpeedTest {
protected:
    void SetUp() override { showLists({33334, 33334, 33334}); }
    void showLists(const std::array<int, 3>& counts)
    {
        for (const std::int32_t kind : {ListKind::Old, ListKind::New, ListKind::Change})
            list(kind).append(alternatingShots(counts.at(static_cast<std::size_t>(kind))));
        activate();
    }
};

/// Nearly all of them in the change list.
class MainGuiManyChangesTest : public MainGuiManyEventsTest {
protected:
    void SetUp() override { showLists({100, 100, 100000}); }
};

} // namespace

TEST_F(MainGuiManyEventsTest, NoHandlerWithAHundredThousandEventsTakesMoreThanAFifthOfASecond)
{
    expectEveryHandlerFast(Limit);
}

TEST_F(MainGuiManyChangesTest, NoHandlerWithAHundredThousandChangesTakesMoreThanAFifthOfASecond)
{
    expectEveryHandlerFast(Limit);
}

/// As the host's undo list does it: the state that is there is kept, and the other comes back.
TEST_F(MainGuiManyEventsTest, AnUndoWithAHundredThousandEventsTakesAFifthOfASecond)
{
    core::serialize::ByteArchive other;
    other << m_model;
    const auto undo = [&] {
        core::serialize::ByteArchive before;
        before << m_model;
        m_model.restore(other);
        other = std::move(before);
    };

    expectFast("undo", Limit, undo);
    tableModel("Change").selectAll();
    expectFast("undo with all selected", Limit, undo);
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    expectFast("undo after a run", Limit, undo);
}

TEST_F(MainGuiHandlersSpeedTest, TheExampleIsShownInASecondAndNoHandlerTakesMoreThanATwentiethOfOne)
{
    const TreeEdl oldCut("examples/reel3/reel3_v07.edl");
    const TreeEdl newCut("examples/reel3/reel3_v12.edl");
    list(ListKind::Old).append(oldCut.events());
    list(ListKind::New).append(newCut.events());
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);

    expectFast("open", 1.0, [this] {
        gui::MainGui opened;
        opened.setEngine(&m_engine);
        opened.setNotifier(&m_notifier);
        opened.setVideoSource(m_video);
        activate();
        opened.createComponentSnapshot(opened.getLocalBounds());
    });
    activate();
    expectEveryHandlerFast(ExampleLimit);
}

} // namespace cadrel::tests
