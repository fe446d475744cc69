// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/RepeatQuestion.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/RunRecord.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::EventList;
using core::PropertyKey;
using core::Variant;
using gui::RepeatQuestion::text;

const wchar_t* const Consequence = L"\nIf you start anyway, sound may come to stand in the wrong place.";

class RepeatQuestionTest : public testing::Test {
protected:
    RepeatQuestionTest() { setCuts("01:00:10:00", "01:00:08:00"); }

    /// One shot from 01:00:00:00 on, which ends elsewhere in the new cut.
    void setCuts(const char* oldEnd, const char* newEnd)
    {
        setShot(m_model.oldEdl(), oldEnd);
        setShot(m_model.newEdl(), newEnd);
        ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    }
    /// The first five seconds come to stand at `dstIn`.
    void setGivenList(const char* dstIn, const char* dstOut)
    {
        m_model.newEdl().clear();
        m_model.changeEdl().clear();
        m_model.changeEdl().add(makeEvent("A001", "01:00:00:00", "01:00:05:00", dstIn, dstOut));
    }
    void run() { core::RunRecord::addRun(m_model, core::PastRuns::AllTime); }

    TestProject m_project;
    core::DataModel m_model;

private:
    static void setShot(EventList& list, const char* end)
    {
        list.clear();
        list.add(makeEvent("A001", "01:00:00:00", end, "01:00:00:00", end));
    }
};

} // namespace

TEST_F(RepeatQuestionTest, AsksNothingWhereNoRunIsNoted)
{
    EXPECT_EQ(text(m_model), L"");
    m_model.setProperty(PropertyKey::DoneRuns, Variant("no bytes of runs"));
    EXPECT_EQ(text(m_model), L"");
}

TEST_F(RepeatQuestionTest, TellsWhereTheSoundStandsInAnotherCut)
{
    run();

    EXPECT_EQ(text(m_model),
              std::wstring(L"The Old EDL isn't the cut of the last run. They differ first at 01:00:08:00.") +
                  Consequence);
}

TEST_F(RepeatQuestionTest, TellsTheSameOfRunsThatAnOlderVersionHasNoted)
{
    run();
    core::Variant note;
    ASSERT_EQ(m_model.getProperty(PropertyKey::DoneRuns, note), util::Result::Ok);
    m_model.removeProperty(PropertyKey::DoneRuns);
    m_model.setProperty(PropertyKey::EarlierRuns, note);

    EXPECT_NE(text(m_model), L"");
}

TEST_F(RepeatQuestionTest, AsksNothingOfTheRunThatGoesOn)
{
    run();
    setCuts("01:00:08:00", "01:00:04:00");

    EXPECT_EQ(text(m_model), L"");
}

TEST_F(RepeatQuestionTest, TellsThatAGivenListHasBeenCarriedOut)
{
    setGivenList("01:00:05:00", "01:00:10:00");
    run();

    EXPECT_EQ(text(m_model),
              std::wstring(L"This Change EDL has been carried out in the project already.") + Consequence);
    setGivenList("01:00:05:01", "01:00:10:01");
    EXPECT_EQ(text(m_model), L"");
}

} // namespace cadrel::tests
