// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/PlannedRun.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/RunRecord.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

/// A given change EDL of one event, which moves the first ten seconds of the second hour ten seconds on.
class PlannedRunTest : public testing::Test {
protected:
    PlannedRunTest() { addEvent("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00"); }

    void addEvent(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        m_model.changeEdl().add(makeEvent("A001", srcIn, srcOut, dstIn, dstOut));
    }
    std::size_t eventCount() { return m_planned.run(m_model, {}).plan().events.size(); }

    TestProject m_project;
    core::DataModel m_model;
    gui::PlannedRun m_planned;
};

} // namespace

TEST_F(PlannedRunTest, IsWorkedOutAnewWhereTheModelHasChanged)
{
    EXPECT_EQ(eventCount(), 1U);
    m_planned.remember(m_model);
    m_planned.lookAgain(m_model);
    EXPECT_EQ(eventCount(), 1U);

    addEvent("01:00:20:00", "01:00:30:00", "01:00:30:00", "01:00:40:00");
    EXPECT_EQ(eventCount(), 1U); // nobody has looked again
    m_planned.lookAgain(m_model);
    EXPECT_EQ(eventCount(), 2U);
}

TEST_F(PlannedRunTest, RemembersTheModelAnewAfterAChange)
{
    m_planned.remember(m_model);
    addEvent("01:00:20:00", "01:00:30:00", "01:00:30:00", "01:00:40:00");
    m_planned.lookAgain(m_model);
    EXPECT_EQ(eventCount(), 2U);

    m_planned.remember(m_model);
    m_model.changeEdl().clear();
    m_planned.lookAgain(m_model);
    EXPECT_EQ(eventCount(), 0U);
}

TEST_F(PlannedRunTest, IsWorkedOutAnewForOtherMaterial)
{
    EXPECT_TRUE(m_planned.run(m_model, {}).protectedMaterial().empty());
    // Two seconds before the hour, which the list doesn't carry.
    EXPECT_EQ(m_planned.run(m_model, {{3598.0, 3600.0}}).protectedMaterial(), (core::FrameRanges{{89950, 90000}}));
    EXPECT_TRUE(m_planned.run(m_model, {}).protectedMaterial().empty());
}

TEST_F(PlannedRunTest, IsWorkedOutAnewAtAnotherRate)
{
    EXPECT_EQ(m_planned.run(m_model, {}).plan().events.at(0).destination, (core::FrameRange{90250, 90500}));
    m_planned.remember(m_model);
    const TestProject film(core::Framerate(24, 0));

    m_planned.lookAgain(m_model);
    EXPECT_EQ(m_planned.run(m_model, {}).plan().events.at(0).destination, (core::FrameRange{86640, 86880}));
}

TEST_F(PlannedRunTest, AsksOfARunThatWasNotedMeanwhile)
{
    EXPECT_EQ(m_planned.repetition(m_model), L"");
    m_planned.remember(m_model);
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);

    EXPECT_EQ(m_planned.repetition(m_model), L"");
    m_planned.lookAgain(m_model);
    EXPECT_EQ(m_planned.repetition(m_model).substr(0, 36), L"This Change EDL has been carried out");
}

} // namespace cadrel::tests
