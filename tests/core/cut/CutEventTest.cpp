// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/CutEventBase.h"

#include <gtest/gtest.h>

#include <string>
#include <type_traits>

namespace cadrel::tests {
namespace {

using core::AutomationState;
using core::CutEventBase;
using core::CutEventSpans;
using core::SecondsRange;

class DialogueClip : public CutEventBase {
public:
    CutEventSpans update(double time) override
    {
        CutEventSpans spans;
        spans.across = {time - 1.0, time + 2.0};
        spans.automation[7] = {.leftTime = time - 0.5, .leftValue = 0.25, .rightTime = -1.0, .rightValue = -1.0};
        return spans;
    }
    std::wstring getTrackName() override { return L"Dialogue"; }
    bool isAudio() override { return true; }
};

TEST(CutEvent, StartsWithAllTimesZero)
{
    DialogueClip clip;

    EXPECT_EQ(clip.srcIn(), 0.0);
    EXPECT_EQ(clip.srcOut(), 0.0);
    EXPECT_EQ(clip.dstIn(), 0.0);
    EXPECT_EQ(clip.dstOut(), 0.0);
}

TEST(CutEvent, KeepsEachOfItsFourTimes)
{
    DialogueClip clip;

    clip.setSrcIn(1.5);
    clip.setSrcOut(2.5);
    clip.setDstIn(-3.5);
    clip.setDstOut(4.5);

    EXPECT_EQ(clip.srcIn(), 1.5);
    EXPECT_EQ(clip.srcOut(), 2.5);
    EXPECT_EQ(clip.dstIn(), -3.5);
    EXPECT_EQ(clip.dstOut(), 4.5);
}

TEST(CutEvent, GivesItsTimesByReference)
{
    DialogueClip clip;

    clip.srcIn() = 1.0;
    clip.srcOut() = 2.0;
    clip.dstIn() = 3.0;
    clip.dstOut() += 4.0;

    EXPECT_EQ(clip.srcIn(), 1.0);
    EXPECT_EQ(clip.srcOut(), 2.0);
    EXPECT_EQ(clip.dstIn(), 3.0);
    EXPECT_EQ(clip.dstOut(), 4.0);
}

TEST(CutEvent, IsAskedThroughItsBase)
{
    static_assert(std::is_abstract_v<CutEventBase> && std::has_virtual_destructor_v<CutEventBase>);
    DialogueClip clip;
    CutEventBase& event = clip;

    const CutEventSpans spans = event.update(10.0);

    EXPECT_EQ(spans.across, (SecondsRange{9.0, 12.0}));
    EXPECT_EQ(spans.automation.at(7).leftTime, 9.5);
    EXPECT_EQ(event.getTrackName(), L"Dialogue");
    EXPECT_TRUE(event.isAudio());
}

TEST(CutEventSpans, AreZeroWithoutHostEventsAndAutomation)
{
    const CutEventSpans spans;

    EXPECT_EQ(spans.across, (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(spans.before, (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(spans.after, (SecondsRange{0.0, 0.0}));
    EXPECT_TRUE(spans.automation.empty());
}

TEST(AutomationState, HasNoPointOnEitherSideAtFirst)
{
    const AutomationState state;

    EXPECT_EQ(state.leftTime, -1.0);
    EXPECT_EQ(state.leftValue, -1.0);
    EXPECT_EQ(state.rightTime, -1.0);
    EXPECT_EQ(state.rightValue, -1.0);
}

} // namespace
} // namespace cadrel::tests
