// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/KeepQuestion.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/ProtectedRun.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <vector>

namespace cadrel::tests {
namespace {

using core::ProtectedRun;
using core::SecondsRange;
using gui::KeepQuestion;

constexpr double Hour = 3600.0;

class KeepQuestionTest : public testing::Test {
protected:
    ProtectedRun runWith(const std::vector<SecondsRange>& material) const
    {
        return {m_model, material, ProtectedRun::sourceOf(m_model)};
    }
    KeepQuestion questionOf(const ProtectedRun& run) const { return {run, m_project.framerate}; }
    void addChange(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        m_model.changeEdl().add(makeEvent("A001", srcIn, srcOut, dstIn, dstOut));
    }

    TestProject m_project;
    core::DataModel m_model;
};

TEST_F(KeepQuestionTest, AsksNothingWhereTheListCarriesAll)
{
    addChange("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");

    EXPECT_FALSE(questionOf(runWith({})).isNeeded());
    EXPECT_FALSE(questionOf(runWith({{Hour, Hour + 10}})).isNeeded());
}

TEST_F(KeepQuestionTest, TellsHowMuchWouldBeTakenAway)
{
    addChange("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    const ProtectedRun run = runWith({{2 * Hour, 2 * Hour + 61.04}});
    const KeepQuestion question = questionOf(run);

    EXPECT_TRUE(question.isNeeded());
    EXPECT_TRUE(question.canKeep());
    EXPECT_EQ(question.text(),
              L"00:01:01:01 of sound, markers or automation would be taken away, as the Change EDL doesn't "
              L"carry it.\nIt stands outside of the cuts, under black or under picture that is the same.");
}

TEST_F(KeepQuestionTest, TellsThatAGeneratedListIsWrittenAnew)
{
    const auto addShots = [](core::EventList& list, const char* endOfA, const char* between, const char* end) {
        list.add(makeEvent("A001", "10:00:00:00", endOfA, "01:00:00:00", between));
        list.add(makeEvent("B002", "12:00:00:00", "12:00:10:00", between, end));
    };
    addShots(m_model.oldEdl(), "10:00:10:00", "01:00:10:00", "01:00:20:00");
    addShots(m_model.newEdl(), "10:00:08:00", "01:00:08:00", "01:00:18:00");
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run = runWith({{Hour - 2, Hour - 1}});

    EXPECT_TRUE(questionOf(run).text().ends_with(
        L"\nIf you keep it, the Change EDL is written anew: what stays in its place leaves it."));
}

TEST_F(KeepQuestionTest, SaysNothingOfTheListWhereNoRunIsNeeded)
{
    for (core::EventList* const list : {&m_model.oldEdl(), &m_model.newEdl()})
        list->add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "01:00:00:00", "01:00:10:00"));
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run = runWith({{Hour - 2, Hour - 1}});
    ASSERT_TRUE(questionOf(run).isNeeded());

    EXPECT_EQ(questionOf(run).text().find(L"written anew"), std::wstring::npos);
}

TEST_F(KeepQuestionTest, TellsWhatCannotBeKept)
{
    addChange("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    // Two seconds stand in the stretch that changes, after all that is carried.
    const ProtectedRun run = runWith({{2 * Hour, 2 * Hour + 1}, {Hour + 11, Hour + 13}});

    EXPECT_NE(questionOf(run).text().find(L"00:00:02:00 of it stands where picture has grown, and can't be kept."),
              std::wstring::npos);
}

TEST_F(KeepQuestionTest, TellsThatTheReelsDiffer)
{
    const auto addReel = [](core::EventList& list, const char* dstIn, const char* dstOut) {
        list.add(makeEvent("A001", "10:00:00:00", "10:00:10:00", dstIn, dstOut));
    };
    addReel(m_model.oldEdl(), "01:00:00:00", "01:00:10:00");
    addReel(m_model.oldEdl(), "03:00:00:00", "03:00:10:00");
    addReel(m_model.newEdl(), "01:00:00:00", "01:00:10:00");
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run = runWith({{Hour - 2, Hour - 1}});
    ASSERT_EQ(run.plan().questions.size(), 1U);

    EXPECT_NE(questionOf(run).text().find(L"The cuts have different reels."), std::wstring::npos);
}

TEST_F(KeepQuestionTest, TellsWhatFindsNoRoom)
{
    // The black between the two shots has gone, and what stands in it.
    const auto addShots = [](core::EventList& list, const char* dstIn, const char* dstOut) {
        list.add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "01:00:00:00", "01:00:10:00"));
        list.add(makeEvent("B002", "12:00:00:00", "12:00:10:00", dstIn, dstOut));
    };
    addShots(m_model.oldEdl(), "01:00:20:00", "01:00:30:00");
    addShots(m_model.newEdl(), "01:00:10:00", "01:00:20:00");
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run = runWith({{Hour - 2, Hour - 1}, {Hour + 12, Hour + 15}});
    const KeepQuestion question = questionOf(run);

    EXPECT_TRUE(question.canKeep());
    EXPECT_NE(question.text().find(L"00:00:03:00 finds no room in the new cut and goes in any case."),
              std::wstring::npos);
}

TEST_F(KeepQuestionTest, TellsWhatWouldLeaveTheDay)
{
    const auto addShot = [](core::EventList& list, const char* dstIn, const char* dstOut) {
        list.add(makeEvent("A001", "10:00:00:00", "10:00:10:00", dstIn, dstOut));
    };
    addShot(m_model.oldEdl(), "23:59:40:00", "23:59:50:00");
    addShot(m_model.newEdl(), "23:59:48:00", "23:59:58:00");
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const double midnight = 24 * Hour;
    // What follows the reel moves with it, by eight seconds. What stands hours before stays.
    const ProtectedRun run = runWith({{12 * Hour, 12 * Hour + 1}, {midnight - 6, midnight - 4}});
    const KeepQuestion question = questionOf(run);

    EXPECT_TRUE(question.isNeeded());
    EXPECT_FALSE(question.canKeep());
    EXPECT_NE(question.text().find(L"It can't be kept: 00:00:02:00 would have to move out of the day."),
              std::wstring::npos);
}

} // namespace
} // namespace cadrel::tests
