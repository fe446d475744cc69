// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/RunRecord.h"
#include "core/serialize/ByteArchive.h"
#include "gui/main/MainGui.h"
#include "gui/table/EventColumn.h"
#include "tests/gui/main/ShownWindow.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/core/TreeEdls.h"

#include <algorithm>
#include <array>
#include <functional>
#include <iostream>
#include <limits>

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::EventListChangeContext;
using core::ListKind;
using core::Timecode;

/// How long the handlers of the window take, with the lists that a test gives it.
class MainGuiHandlersSpeedTest : public ShownWindow {
protected:
    /// The best of some runs counts, as the machine has other work.
    static void expectFast(const char* step, const std::function<void()>& action, double limit)
    {
        double best = std::numeric_limits<double>::max();
        for (int run = 0; run < 3; ++run)
            best = std::min(best, secondsOf([&] {
                                action();
                                FocusedWindow::pump();
                            }));
        std::cout << step << ": " << best * 1000.0 << " ms\n";
        EXPECT_LT(best, CADREL_ADDRESS_SANITIZER ? 20.0 * limit : limit) << step;
    }

    /// All that the user and the notifier ask of a window with a project. What is done alike again is undone between.
    void expectEveryHandlerFast(double limit)
    {
        const auto expectStep = [&](const char* step, const std::function<void()>& action) {
            expectFast(step, action, limit);
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
            expectStep(("kind 2 of list " + std::to_string(kind)).c_str(),
                       [this, kind] { notify(EventListChangeContext(kind)); });
        expectStep("kind 5", [this] { notify(ChangeContext(ChangeContext::PreviewStateChanged)); });

        const int rows = static_cast<int>(list(ListKind::Change).size());
        int row = 0;
        expectStep("select one", [&] { table("Change").selectRow(row = (row + 1) % rows); });
        for (const char* const name : {"Old", "New", "Change"})
            expectStep((std::string("select all of ") + name).c_str(), [&, name] {
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
            expectStep((std::string("sort ") + name).c_str(), [&, name] {
                forwards = !forwards;
                table(name).getHeader().setSortColumnId(gui::EventColumn::ClipName, forwards);
            });
        expectStep("sort with all selected", [&] {
            tableModel("Change").selectAll();
            forwards = !forwards;
            table("Change").getHeader().setSortColumnId(gui::EventColumn::ClipName, forwards);
        });
        table("Change").selectRow(0);

        expectStep("open and close the settings", [this] {
            click("Settings Button");
            m_window.press(juce::KeyPress::escapeKey);
        });
        m_model.settings().setVfxPattern({"A017C", "_261122_R1AB", true}, 0);
        expectStep("open and close the settings with a VFX name", [this] {
            click("Settings Button");
            m_window.press(juce::KeyPress::escapeKey);
        });
        for (const char* const name : {"Load Old Edl Button", "Load Change Edl Button"})
            expectStep("open and close the box of the files", [this, name] {
                click(name);
                m_window.press(juce::KeyPress::escapeKey);
            });
        expectStep("open and close the videos", [this] {
            click("m_showNewVideosDialogButton");
            m_window.press(juce::KeyPress::escapeKey);
        });
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

constexpr double Limit = 0.2;

/// A hundred thousand events, which no one has by hand: a third in each list.
class MainGuiManyEventsTest : public MainGuiHandlersSpeedTest {
protected:
    void SetUp() override { showLists({33334, 33334, 33334}); }
    void showLists(const std::array<int, 3>& counts)
    {
        for (const std::int32_t kind : {ListKind::Old, ListKind::New, ListKind::Change}) {
            std::vector<std::shared_ptr<core::EventBase>> events;
            for (int index = 0; index < counts.at(static_cast<std::size_t>(kind)); ++index) {
                auto event = std::make_shared<core::EventBase>();
                event->setRollName(index % 2 == 0 ? "A017C004_261122_R1AB" : "B021C011_261122_R1AB");
                event->setClipName("42A-" + std::to_string(index % 977));
                event->setEdlFileName("reel3_v07.edl");
                const int at = index * 20;
                event->setTimecodes(Timecode(at), Timecode(at + 20), Timecode(at), Timecode(at + 20));
                event->setEventNumber(static_cast<std::uint32_t>(index + 1));
                events.push_back(std::move(event));
            }
            list(kind).append(std::move(events));
        }
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

TEST_F(MainGuiManyEventsTest, StartAsksItsQuestionsInAFifthOfASecond)
{
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    m_engine.material = {{0.0, 1000.0}};

    expectFast(
        "start",
        [this] {
            click("Cadrel Button");
            notify(core::ActionChangeContext(core::ActionChangeContext::Run, util::Result::Ok));
        },
        Limit);
    EXPECT_EQ(m_engine.calls, (Calls{"run", "run", "run"}));
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

    expectFast("undo", undo, Limit);
    tableModel("Change").selectAll();
    expectFast("undo with all selected", undo, Limit);
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    expectFast("undo after a run", undo, Limit);
}

TEST_F(MainGuiHandlersSpeedTest, TheExampleIsShownInASecondAndNoHandlerTakesMoreThanATwentiethOfOne)
{
    const TreeEdl oldCut("examples/reel3/reel3_v07.edl");
    const TreeEdl newCut("examples/reel3/reel3_v12.edl");
    list(ListKind::Old).append(oldCut.events());
    list(ListKind::New).append(newCut.events());
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);

    expectFast(
        "open",
        [this] {
            gui::MainGui opened;
            opened.setEngine(&m_engine);
            opened.setNotifier(&m_notifier);
            opened.setVideoSource(m_video);
            activate();
            opened.createComponentSnapshot(opened.getLocalBounds());
        },
        1.0);
    activate();
    expectEveryHandlerFast(0.05);
}

} // namespace cadrel::tests
