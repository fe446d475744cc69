// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/ProtectedRun.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/RestrictedRange.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <ostream>

namespace cadrel::core {

inline std::ostream& operator<<(std::ostream& stream, const FrameRange& range)
{
    return stream << range.start << ".." << range.end;
}

} // namespace cadrel::core

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::FrameRange;
using core::FrameRanges;
using core::ProtectedRun;
using core::SecondsRange;
using Source = ProtectedRun::Source;

constexpr double Hour = 3600.0;

/// A cut of two shots from 01:00:00:00 on. In the new one the first has lost its last two seconds.
///
///     old    |-- A --|-- B --|       10 s each
///     new    |- A -|-- B --|
class ProtectedRunTest : public testing::Test {
protected:
    ProtectedRunTest()
    {
        addShots(m_model.oldEdl(), "10:00:10:00", "01:00:10:00", "01:00:20:00");
        addShots(m_model.newEdl(), "10:00:08:00", "01:00:08:00", "01:00:18:00");
        EXPECT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    }
    static void addShots(core::EventList& list, const char* endOfA, const char* cut, const char* end)
    {
        list.add(makeEvent("A001", "10:00:00:00", endOfA, "01:00:00:00", cut));
        list.add(makeEvent("B002", "12:00:00:00", "12:00:10:00", cut, end));
    }
    FrameRanges protectedOf(const std::vector<SecondsRange>& material) const
    {
        return ProtectedRun(m_model, material, ProtectedRun::sourceOf(m_model)).protectedMaterial();
    }

    TestProject m_project;
    DataModel m_model;
    const SecondsRange m_pop{Hour - 2, Hour - 1};
    const SecondsRange m_carried{Hour + 2, Hour + 4};
    const SecondsRange m_lifted{Hour + 8, Hour + 10};
    const SecondsRange m_tail{Hour + 25, Hour + 26};
};

TEST_F(ProtectedRunTest, ProtectsWhatAPlainRunWouldTakeAwayAndNoMore)
{
    EXPECT_EQ(protectedOf({m_pop, m_carried, m_lifted, m_tail}), (FrameRanges{{89950, 89975}, {90625, 90650}}));
    EXPECT_EQ(protectedOf({m_carried, m_lifted}), FrameRanges());
    EXPECT_EQ(protectedOf({}), FrameRanges());
}

TEST_F(ProtectedRunTest, ProtectsNothingOutsideOfWhatTheUserLetsChange)
{
    m_model.settings().setRestrictRange(true);
    m_model.settings().setPreserveMaterial(Hour, Hour + 20);

    EXPECT_EQ(protectedOf({m_pop, m_carried, m_tail}), FrameRanges());
}

TEST_F(ProtectedRunTest, PutsTheListThatIsCarriedOutInPlaceOfTheGeneratedOne)
{
    const ProtectedRun run(m_model, {m_pop, m_tail}, Source::Generated);
    ASSERT_TRUE(run.needsRun());
    run.putListInto(m_model);

    // The tail follows the end of its reel.
    const core::EventBase& last = m_model.changeEdl().at(m_model.changeEdl().size() - 1);
    EXPECT_EQ(last.srcOut().toString(), "01:00:26:00");
    EXPECT_EQ(last.dstOut().toString(), "01:00:24:00");
    EXPECT_GT(run.bounds().start, m_pop.end);
    EXPECT_GE(run.bounds().end, m_tail.end);
}

TEST_F(ProtectedRunTest, NeedsNoRunForTheSameCut)
{
    m_model.newEdl().clear();
    addShots(m_model.newEdl(), "10:00:10:00", "01:00:10:00", "01:00:20:00");
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run(m_model, {m_pop, m_lifted}, Source::Generated);

    EXPECT_FALSE(run.needsRun());
    EXPECT_EQ(run.protectedMaterial(), (FrameRanges{{89950, 89975}}));
}

//     old    |-- A --|            |-- B --|      two reels
//     new    |-- A --|
TEST_F(ProtectedRunTest, HasAnEventToStartWithWhereAReelOnlyGoes)
{
    m_model.oldEdl().clear();
    m_model.newEdl().clear();
    m_model.oldEdl().add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "01:00:00:00", "01:00:10:00"));
    m_model.oldEdl().add(makeEvent("B002", "12:00:00:00", "12:00:10:00", "03:00:00:00", "03:00:10:00"));
    m_model.newEdl().add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "01:00:00:00", "01:00:10:00"));
    ASSERT_EQ(m_model.generateChangeEdl(), util::Result::Ok);
    const ProtectedRun run(m_model, {m_pop}, Source::Generated);
    ASSERT_TRUE(run.needsRun());
    EXPECT_GT(run.bounds().start, Hour + 10);
    EXPECT_TRUE(run.isStartable());
    run.putListInto(m_model);
    EXPECT_TRUE(m_model.changeEdl().isEmpty());
    const core::EventList startable = run.startableList(m_model);

    // The pop stays, and so does the reel after it.
    ASSERT_EQ(startable.size(), 2U);
    EXPECT_EQ(startable.at(0).dstOut().toString(), "00:59:59:00");
    EXPECT_EQ(startable.at(1).dstOut().toString(), "01:00:10:00");
    EXPECT_TRUE(m_model.changeEdl().isEmpty());
}

TEST_F(ProtectedRunTest, LeavesAGivenListAsItIs)
{
    m_model.oldEdl().clear();
    EXPECT_EQ(ProtectedRun::sourceOf(m_model), Source::Given);
    const std::size_t size = m_model.changeEdl().size();
    const ProtectedRun run(m_model, {m_carried, {2 * Hour, 2 * Hour + 1}}, Source::Given);
    run.putListInto(m_model);

    EXPECT_EQ(m_model.changeEdl().size(), size);
    EXPECT_EQ(run.protectedMaterial(), (FrameRanges{{180000, 180025}}));
    EXPECT_TRUE(run.carried(m_model).isEmpty());
    EXPECT_TRUE(run.outside(m_model).isEmpty());
}

TEST_F(ProtectedRunTest, TakesAListForAGeneratedOneWhenBothCutsAreThere)
{
    EXPECT_EQ(ProtectedRun::sourceOf(m_model), Source::Generated);
    m_model.newEdl().clear();
    EXPECT_EQ(ProtectedRun::sourceOf(m_model), Source::Given);
}

TEST_F(ProtectedRunTest, PutsTheSettingsBackAfterARestrictedRange)
{
    core::Settings& settings = m_model.settings();
    settings.setPreserveMaterial(5.0, 7.0);
    {
        const core::RestrictedRange restricted(settings, {10.0, 20.0});
        EXPECT_TRUE(settings.restrictRange());
        EXPECT_EQ(settings.preserveMaterialBefore(), 10.0);
        EXPECT_EQ(settings.preserveMaterialAfter(), 20.0);
    }
    EXPECT_FALSE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), 5.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 7.0);
}

} // namespace
} // namespace cadrel::tests
