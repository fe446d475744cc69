// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/CutCommands.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "gui/main/ListCounters.h"
#include "gui/main/ShownFrames.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <vector>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::EventList;
using core::ListKind;
using gui::ListCounters;
using gui::ShownFrames;
using util::Result;
namespace CutCommands = gui::CutCommands;

using Names = std::vector<std::wstring>;

class CutCommandsTest : public testing::Test {
protected:
    static void add(EventList& list, const std::string& roll)
    {
        list.add(makeEvent(roll, "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00", 7));
    }

    TestProject m_project;
    RecordingUndo m_undo;
    DataModel m_model;
};

TEST_F(CutCommandsTest, ClearTheListThatIsMeantAsOneEntry)
{
    for (EventList* const list : {&m_model.oldEdl(), &m_model.newEdl(), &m_model.changeEdl()})
        add(*list, "A001");

    CutCommands::clear(m_model, ListKind::New);
    EXPECT_EQ(m_undo.entries, Names{L"Delete New EDL"});
    EXPECT_EQ(m_model.oldEdl().size(), 1U);
    EXPECT_TRUE(m_model.newEdl().isEmpty());
    EXPECT_EQ(m_model.changeEdl().size(), 1U);

    CutCommands::clear(m_model, ListKind::Old);
    CutCommands::clear(m_model, ListKind::Change);
    EXPECT_EQ(m_undo.entries, (Names{L"Delete New EDL", L"Delete Old EDL", L"Delete Change EDL"}));
    EXPECT_TRUE(m_model.oldEdl().isEmpty());
    EXPECT_TRUE(m_model.changeEdl().isEmpty());
}

TEST_F(CutCommandsTest, ClearNothingWhenThereCanBeNoEntry)
{
    add(m_model.oldEdl(), "A001");
    m_undo.failure = Result::HostCallFailed;

    EXPECT_EQ(thrownBy([this] { CutCommands::clear(m_model, ListKind::Old); }), Result::HostCallFailed);
    EXPECT_EQ(m_model.oldEdl().size(), 1U);
}

TEST_F(CutCommandsTest, KnowNoFourthList)
{
    EXPECT_EQ(thrownBy([this] { CutCommands::clear(m_model, 3); }), Result::InvalidArgument);
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(CutCommandsTest, GenerateTheChangeEdlAsOneEntry)
{
    add(m_model.oldEdl(), "A001");
    add(m_model.newEdl(), "A001");

    EXPECT_EQ(CutCommands::generate(m_model), L"");
    EXPECT_EQ(m_model.changeEdl().size(), 1U);
    EXPECT_EQ(m_undo.begun, Names{L"Generate Change EDL"});
    EXPECT_EQ(m_undo.entries, Names{L"Generate Change EDL"});
}

TEST_F(CutCommandsTest, TellWhenNothingOfTheOldCutSurvives)
{
    add(m_model.oldEdl(), "A001");
    add(m_model.newEdl(), "B002");

    EXPECT_EQ(CutCommands::generate(m_model),
              L"Nothing of the old cut survives in the new one. See that both are of one reel.");
    EXPECT_EQ(m_undo.entries, Names{L"Generate Change EDL"});
}

TEST_F(CutCommandsTest, TellWhyNoChangeEdlCouldBeMade)
{
    add(m_model.oldEdl(), "A001");
    add(m_model.newEdl(), "A001");
    m_model.settings().setVfxPattern({"(", "", true}, 0);

    EXPECT_EQ(CutCommands::generate(m_model),
              L"No Change EDL could be made.\nA VFX name of the settings can't be used. Correct it there.");
    EXPECT_TRUE(m_model.changeEdl().isEmpty());
    EXPECT_EQ(m_undo.entries, Names{L"Generate Change EDL"});
}

TEST_F(CutCommandsTest, TellWhichEventsWerePassedOver)
{
    // 2512 frames of source fill 2500 frames up to the last frame of the day: the speed counts as normal, so that the stretch
    // is taken to be as long as the source and would end after midnight.
    for (core::EventList* const cut : {&m_model.oldEdl(), &m_model.newEdl()}) {
        cut->add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "01:00:00:00", "01:00:10:00", 1));
        cut->add(makeEvent("A009", "01:00:00:00", "01:01:40:12", "23:58:19:24", "23:59:59:24", 7));
        cut->at(1).setEdlFileName("reel3.edl");
    }

    EXPECT_EQ(CutCommands::generate(m_model),
              L"Events that can't be matched, since a timecode would lie outside of the day: 1\n"
              L"The first is event 7, A009 (reel3.edl).");
    EXPECT_EQ(m_model.changeEdl().size(), 1U);
    EXPECT_EQ(m_undo.entries, Names{L"Generate Change EDL"});
}

TEST_F(CutCommandsTest, TellAlsoWhenNothingElseIsLeft)
{
    for (core::EventList* const cut : {&m_model.oldEdl(), &m_model.newEdl()})
        cut->add(makeEvent("A009", "01:00:00:00", "01:01:40:12", "23:58:19:24", "23:59:59:24", 7));

    EXPECT_EQ(CutCommands::generate(m_model),
              L"Nothing of the old cut survives in the new one. See that both are of one reel.\n"
              L"Events that can't be matched, since a timecode would lie outside of the day: 1\n"
              L"The first is event 7, A009.");
}

TEST_F(CutCommandsTest, CountTheEventsOfAList)
{
    add(m_model.oldEdl(), "A001");
    add(m_model.oldEdl(), "A002");
    EXPECT_EQ(ListCounters::of(m_model.oldEdl(), 1), (ListCounters{2, 1, 0}));
    EXPECT_EQ(ListCounters::of(m_model.oldEdl(), 1).invalidColour(), gui::Palette::green);

    m_model.oldEdl().at(1).addFlaw(core::EventFlaw::RollNameInvalid);
    EXPECT_EQ(ListCounters::of(m_model.oldEdl(), 2), (ListCounters{2, 2, 1}));
    EXPECT_EQ(ListCounters::of(m_model.oldEdl(), 2).invalidColour(), gui::Palette::red);
}

TEST_F(CutCommandsTest, ShowTheFramesOfTheOneEventThatIsSelected)
{
    const auto event = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");

    const auto in = ShownFrames::of({event}, false);
    ASSERT_TRUE(in);
    EXPECT_EQ(in->oldTime, core::Timecode("10:00:00:00"));
    EXPECT_EQ(in->newTime, core::Timecode("01:00:00:00"));
    EXPECT_FALSE(in->isLast);
    const auto out = ShownFrames::of({event}, true);
    ASSERT_TRUE(out);
    EXPECT_EQ(out->oldTime, core::Timecode("10:00:05:00"));
    EXPECT_EQ(out->newTime, core::Timecode("01:00:05:00"));
    EXPECT_TRUE(out->isLast);
}

TEST_F(CutCommandsTest, ShowNoFramesOfSeveralEventsOrOfOneWithoutUsableTimes)
{
    const auto event = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");
    const auto flawed = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:99:05:00");
    ASSERT_TRUE(flawed->hasFlaw(core::EventFlaw::TimecodeInvalid));

    EXPECT_FALSE(ShownFrames::of({}, false));
    EXPECT_FALSE(ShownFrames::of({event, event}, false));
    EXPECT_FALSE(ShownFrames::of({flawed}, false));
}

} // namespace
} // namespace cadrel::tests
