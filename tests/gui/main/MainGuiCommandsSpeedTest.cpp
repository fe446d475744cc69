// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/RunRecord.h"
#include "gui/table/EventMenu.h"
#include "tests/gui/main/TimedWindow.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TreeEdls.h"

#include <algorithm>
#include <ctime>
#include <limits>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::HealMode;
using core::ListKind;
using core::Timecode;
using util::Result;

/// How long the user's commands take that change the lists.
class MainGuiCommandsSpeedTest : public TimedWindow {
protected:
    /// Opens the menu of the change table. What the user chooses in it comes later.
    void openMenu()
    {
        tableModel("Change").setMenuPresenter(
            [this](juce::PopupMenu&, juce::Point<int>, std::function<void(int)> chosen) {
                m_choose = std::move(chosen);
            });
        tableModel("Change").openMenu();
    }
    bool allows(int item) const
    {
        return gui::EventMenu::allows(item, m_model.changeEdl(), m_model.newEdl(),
                                      tableModel("Change").getSelectedEvents());
    }
    void expectEntryFast(const std::string& step, double limit, int item, const std::function<void()>& prepare)
    {
        std::size_t expected = m_undo.entries.size();
        expectFast(
            step, limit, [this, item] { m_choose(item); },
            [&] {
                prepare();
                openMenu();
                ++expected;
            });
        EXPECT_EQ(m_undo.entries.size(), expected) << step;
    }
    /// Each of them with the lists as they are now.
    void expectEveryCommandFast(double limit)
    {
        const std::function<void()> restore = comingBack();
        const std::size_t changes = list(ListKind::Change).size();
        const auto selectAll = [&] {
            restore();
            tableModel("Change").selectAll();
        };
        expectFast(
            "generate", limit, [this] { click("Generate Button"); }, restore);
        EXPECT_EQ(m_undo.entries.back(), L"Generate Change EDL");
        EXPECT_EQ(list(ListKind::Change).size(), changes);
        for (const char* const name : {"Old", "New", "Change"}) {
            expectFast(
                std::string("clear ") + name, limit,
                [this, name] { click(std::string("Clear ") + name + " Edl Button"); }, restore);
            EXPECT_EQ(tableModel(name).getNumRows(), 0);
        }
        expectFast(
            "open the menu of all", limit, [this] { openMenu(); }, selectAll);
        expectEntryFast("delete all", limit, gui::EventMenu::Delete, selectAll);
        EXPECT_EQ(tableModel("Change").getNumRows(), 0);
        for (const int item : {gui::EventMenu::HealNone, gui::EventMenu::HealNormal,
                               gui::EventMenu::HealGapsWithoutInserts, gui::EventMenu::HealGapsWithInserts}) {
            selectAll();
            if (allows(item))
                expectEntryFast("heal all, item " + std::to_string(item), limit, item, selectAll);
        }
        int row = static_cast<int>(changes) / 2;
        const auto selectRow = [&] {
            restore();
            table("Change").selectRow(row);
        };
        for (selectRow(); !allows(gui::EventMenu::ExtendNext); table("Change").selectRow(++row))
            ASSERT_LT(row, static_cast<int>(changes));
        expectEntryFast("extend an event", limit, gui::EventMenu::ExtendNext, selectRow);

        m_box.chosen = {(m_folder / "saved.edl").string()};
        expectFast(
            "save", limit, [this] { click("Save Change Edl Button"); }, restore);
        EXPECT_FALSE(std::filesystem::is_empty(m_folder.path()));
        m_box.chosen.clear();
    }
    /// Chooses the file for a list and confirms it.
    void expectAddingFast(const std::filesystem::path& file, const char* buttonName, double readingLimit, double limit)
    {
        const std::function<void()> restore = comingBack();
        m_alerts.answer = 1;
        expectFast(
            std::string("read for ") + buttonName, readingLimit, [this] { openFiles(); },
            [&, buttonName] {
                openSheet(restore, buttonName);
                m_box.chosen = {file.string()};
            });
        expectFast(
            std::string("OK after ") + buttonName, limit, [this] { m_window.press(juce::KeyPress::returnKey); },
            [&, buttonName] {
                openSheet(restore, buttonName);
                m_box.chosen = {file.string()};
                openFiles();
            });
        EXPECT_FALSE(fileDialog().isVisible());
        m_box.chosen.clear();
    }

    TempFolder m_folder;

private:
    std::function<void(int)> m_choose;

    void openSheet(const std::function<void()>& restore, const char* buttonName)
    {
        m_window.press(juce::KeyPress::escapeKey);
        restore();
        click(buttonName);
        ASSERT_TRUE(fileDialog().isVisible());
    }
    void openFiles() { m_window.click(find<juce::Button>(fileDialog(), "Open Files Button")); }
};

/// A film of 33,334 shots and its next cut, in which shots are gone, shortened and new, so that all after them moves. Sound
/// stands under every fifth shot, in black between shots, and before the film.
///
///     old    |- A -|- B -|- C -|- D -|  |- E -|
///     new    |- A -|B|- C -|-- X --|- D -|  |- E -|
class MainGuiManyShotsTest : public MainGuiCommandsSpeedTest {
protected:
    static constexpr int Shots = 33334;
    static constexpr int FilmStart = 90000; ///< one hour, in frames

    void SetUp() override
    {
        std::vector<std::shared_ptr<EventBase>> oldCut;
        std::vector<std::shared_ptr<EventBase>> newCut;
        int oldAt = FilmStart;
        int newAt = FilmStart;
        m_engine.material.push_back({600.0, 610.0});
        for (int shot = 0; shot < Shots; ++shot) {
            const std::string roll = std::string("A").append(std::to_string(shot % 977)).append("_261122_R1AB");
            const int source = 1000 + shot / 977 * 40;
            oldCut.push_back(makeShot(roll, source, oldAt, Length));
            if (shot % 5 == 0)
                addSound(oldAt + 2, oldAt + Length);
            oldAt += Length;
            if (shot % 100 == 11)
                newCut.push_back(placed(makeShot(std::string("N").append(std::to_string(shot)), 0, newAt, 12), newAt));
            if (shot % 50 != 7) {
                const int trim = shot % 10 == 3 ? 2 : 0;
                newCut.push_back(placed(makeShot(roll, source + trim, newAt, Length - trim), newAt));
            }
            if (shot % 40 == 0) {
                addSound(oldAt, oldAt + Black);
                oldAt += Black;
                newAt += Black;
            }
        }
        list(ListKind::Old).append(std::move(oldCut));
        list(ListKind::New).append(std::move(newCut));
    }
    void generate(std::int32_t healMode)
    {
        m_model.settings().setHealMode(healMode);
        ASSERT_EQ(m_model.generateChangeEdl(), Result::Ok);
        activate();
    }

private:
    static constexpr int Length = 20;
    static constexpr int Black = 5;

    static std::shared_ptr<EventBase> makeShot(const std::string& roll, int source, int at, int length)
    {
        auto event = std::make_shared<EventBase>();
        event->setRollName(roll);
        event->setEdlFileName("reel3_v07.edl");
        event->setTimecodes(Timecode(source), Timecode(source + length), Timecode(at), Timecode(at + length));
        return event;
    }
    static std::shared_ptr<EventBase> placed(std::shared_ptr<EventBase> event, int& at)
    {
        at = event->dstOut().toFrameCount(Timecode::framerate());
        return event;
    }
    void addSound(int start, int end) { m_engine.material.push_back({start / 25.0, end / 25.0}); }
};

/// A click on Start, and how long the window works before, between and after its questions.
class TimedStart {
public:
    explicit TimedStart(RecordingAlerts& alerts) : m_alerts(alerts) {}

    /// The second button of a question with two, and else the first: start anyway, and keep.
    std::vector<double> secondsOf(const std::function<void()>& start)
    {
        std::vector<double> parts;
        m_begun = std::clock();
        listen(parts);
        start();
        FocusedWindow::pump();
        parts.push_back(lap());
        m_alerts.meanwhile = nullptr;
        return parts;
    }

private:
    void listen(std::vector<double>& parts)
    {
        m_alerts.meanwhile = [this, &parts] {
            parts.push_back(lap());
            m_alerts.answer = m_alerts.buttons.back().size() == 2 ? 2 : 1;
            listen(parts);
        };
    }
    double lap()
    {
        const std::clock_t now = std::clock();
        return static_cast<double>(now - std::exchange(m_begun, now)) / CLOCKS_PER_SEC;
    }

    RecordingAlerts& m_alerts;
    std::clock_t m_begun = 0;
};

class MainGuiStartSpeedTest : public MainGuiManyShotsTest {
protected:
    /// How long the parts of a start take, with the questions that it asks between them.
    void expectStartFast(const std::vector<std::string>& steps, const std::vector<Texts>& questions)
    {
        const std::function<void()> restore = comingBack();
        std::vector<double> best(steps.size(), std::numeric_limits<double>::max());
        const auto isFast = [](double seconds) { return seconds < boundOf(Limit); };
        for (int run = 0; run < Runs || (run < MostRuns && !std::all_of(best.begin(), best.end(), isFast)); ++run) {
            restore();
            m_alerts.buttons.clear();
            m_engine.calls.clear();
            const std::vector<double> parts = TimedStart(m_alerts).secondsOf([this] { click("Cadrel Button"); });

            ASSERT_EQ(m_alerts.buttons, questions);
            ASSERT_EQ(parts.size(), steps.size());
            for (std::size_t step = 0; step < steps.size(); ++step)
                best[step] = std::min(best[step], parts[step]);
        }
        for (std::size_t step = 0; step < steps.size(); ++step)
            expectBelow(Limit, best[step], steps[step]);
    }
    /// Asks both questions before a run of the cuts that has been done, and keeps what isn't carried.
    void expectAskingStartFast()
    {
        core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
        expectStartFast({"start until the first question", "until the second one", "until the run"}, {Repeat, Keep});
        ASSERT_EQ(m_engine.calls.size(), 1U);
        EXPECT_EQ(m_engine.calls.front().substr(0, 4), "run ");
        EXPECT_NE(m_engine.calls.front().find(" of "), std::string::npos) << "It has a list of its own.";
    }

    const Texts Repeat{L"Start Anyway", L"Cancel"};
    const Texts Keep{L"Keep", L"Don't Keep", L"Cancel"};
};

} // namespace

TEST_F(MainGuiManyShotsTest, NoCommandWithAHundredThousandEventsTakesMoreThanAFifthOfASecond)
{
    generate(HealMode::None);
    EXPECT_GT(list(ListKind::Change).size(), 32000U);
    expectEveryCommandFast(Limit);
}

TEST_F(MainGuiManyShotsTest, NoCommandWithAHealedListOfAsManyTakesMoreThanAFifthOfASecond)
{
    generate(HealMode::Normal);
    EXPECT_GT(list(ListKind::Change).size(), 1000U);
    expectEveryCommandFast(Limit);
}

TEST_F(MainGuiStartSpeedTest, StartAsksItsQuestionsOfAHundredThousandEventsInAFifthOfASecondEach)
{
    generate(HealMode::None);
    expectAskingStartFast();
}

TEST_F(MainGuiStartSpeedTest, StartAsksItsQuestionsOfAHealedListInAFifthOfASecondEach)
{
    generate(HealMode::Normal);
    expectAskingStartFast();
}

TEST_F(MainGuiStartSpeedTest, ARunThatGoesOnAndTakesNothingAwayStartsInAFifthOfASecond)
{
    // The run before has made the old cut of the new one.
    core::EventList cut;
    cut.append(list(ListKind::Old));
    list(ListKind::Old) = list(ListKind::New);
    list(ListKind::New) = cut;
    generate(HealMode::None);
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    list(ListKind::New) = list(ListKind::Old);
    list(ListKind::Old) = cut;
    generate(HealMode::None);
    // Within the first shot, which stays.
    m_engine.material = {{3600.2, 3600.4}};

    expectStartFast({"start without a question"}, {});
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiStartSpeedTest, NothingHasToChangeIsToldOfAHundredThousandEventsInAFifthOfASecond)
{
    list(ListKind::New).clear();
    list(ListKind::New).append(list(ListKind::Old));
    generate(HealMode::None);

    expectStartFast({"start where nothing has to change", "until that is told", "the end of it"}, {Keep, {}});
    EXPECT_EQ(m_alerts.messages.back(), L"Everything stands where the new cut has it. Nothing has to change.");
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiManyShotsTest, AnEdlOfAsManyEventsIsAddedInAFifthOfASecond)
{
    generate(HealMode::None);
    std::string text;
    for (const auto& event : alternatingShots(33334))
        text += "001  A001 V     C        " + timecodesOf(*event) + "\n";
    writeFile(m_folder / "many.edl", text);
    for (const char* const name : {"Load Old Edl Button", "Load New Edl Button", "Load Change Edl Button"})
        expectAddingFast(m_folder / "many.edl", name, Limit, Limit);
}

TEST_F(MainGuiCommandsSpeedTest, NoCommandOnTheExampleTakesMoreThanATwentiethOfASecond)
{
    const TreeEdl oldCut("examples/reel3/reel3_v07.edl");
    const TreeEdl newCut("examples/reel3/reel3_v12.edl");
    list(ListKind::Old).append(oldCut.events());
    list(ListKind::New).append(newCut.events());
    ASSERT_EQ(m_model.generateChangeEdl(), Result::Ok);
    activate();

    expectEveryCommandFast(ExampleLimit);
    expectAddingFast(treePath("examples/reel3/reel3_v12.edl"), "Load New Edl Button", ExampleLimit, ExampleLimit);
}

} // namespace cadrel::tests
