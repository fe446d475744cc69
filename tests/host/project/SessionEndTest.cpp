// SPDX-License-Identifier: GPL-3.0-or-later

// The end of a session in a run.

#include "host/Host.h"
#include "tests/support/host/AdaptedHost.h"
#include "velmark/Attributes.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <optional>

using namespace Velmark;

namespace cadrel::host::tests {

using cadrel::tests::makeEvent;

namespace {

constexpr int64 Second = 1'000'000'000;

/// A film of two clips of ten seconds, in a session that ends five seconds after them.
class SessionEndTest : public AtEachOrigin {
protected:
    SessionEndTest()
    {
        host.addSound(track, u"one", 0.0, 10.0);
        host.addSound(track, u"two", 10.0, 20.0);
        host.switchMarkersOff();
        setEnd(FVariant::integer(inHost(25)));
    }

    int64 inHost(int filmSeconds) const { return static_cast<int64>(host.inHost(filmSeconds)) * Second; }
    void setEnd(const FVariant& value)
    {
        ASSERT_EQ(host.root()->setAttribute(AttributeKey::SessionEnd, value, false), ResultOk);
    }
    /// Nothing where it isn't there.
    std::optional<int64> end()
    {
        FVariant value;
        return host.root()->getAttribute(AttributeKey::SessionEnd, value) == ResultOk ? std::optional(value.asInteger())
                                                                                      : std::nullopt;
    }
    /// Both cuts begin with the film.
    void setCuts(const char* oldEnd, const char* newEnd)
    {
        host.model().oldEdl().add(makeEvent("A001", "01:00:00:00", oldEnd, "01:00:00:00", oldEnd, 1));
        host.model().newEdl().add(makeEvent("A001", "01:00:00:00", newEnd, "01:00:00:00", newEnd, 1));
    }

    AdaptedHost host{GetParam()};
    AdaptedHost::Node track = host.addTrack(TypeWord::Audio, u"DX");
};

INSTANTIATE_TEST_SUITE_P(Origins, SessionEndTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(SessionEndTest, IsLaterByWhatTheNewCutIsLonger)
{
    setCuts("01:00:20:00", "01:00:22:00");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");

    host.conform();

    EXPECT_EQ(end(), inHost(27));
}

TEST_P(SessionEndTest, IsEarlierByWhatTheNewCutIsShorter)
{
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");

    host.conform();

    EXPECT_EQ(end(), inHost(17));
}

TEST_P(SessionEndTest, StaysWhereBothCutsAreAsLongEvenIfTheLastClipGoes)
{
    setCuts("01:00:20:00", "01:00:20:00");
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00");

    host.conform();

    EXPECT_EQ(host.contentOf(track), (std::vector<std::string>{"one 0-10"}));
    EXPECT_EQ(end(), inHost(25));
}

TEST_P(SessionEndTest, CountsFramesOfTheCuts)
{
    setCuts("01:00:20:00", "01:00:20:01");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");

    host.conform();

    // 25 frames a second.
    EXPECT_EQ(end(), inHost(25) + Second / 25);
}

TEST_P(SessionEndTest, FollowsTheLastClipWhereThereIsAChangeListAlone)
{
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:03:00", "01:00:23:00");

    host.conform();

    EXPECT_EQ(end(), inHost(28));
}

TEST_P(SessionEndTest, DoesNotTakeAPreviewForTheLastClip)
{
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:03:00", "01:00:23:00");
    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());

    host.conform();
    host.adapter().setPreviewActive(false);

    EXPECT_EQ(end(), inHost(28));
}

TEST_P(SessionEndTest, GoesBackWithTheRunThatIsUndone)
{
    setCuts("01:00:20:00", "01:00:22:00");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");
    host.conform();

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(end(), inHost(25));
    ASSERT_TRUE(host.redo());
    EXPECT_EQ(end(), inHost(27));
}

// DX first, then FX, as people work.
TEST_P(SessionEndTest, MovesOnceWhereTracksAreConformedOneAfterTheOther)
{
    const AdaptedHost::Node other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"three", 0.0, 20.0);
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);
    const auto conformAlone = [&](const AdaptedHost::Node& alone) {
        for (const AdaptedHost::Node& each : {track, other})
            dynamic_cast<standin::Node&>(*each).setSelected(each.get() == alone.get());
        host.conform();
        return end();
    };
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");

    EXPECT_EQ(conformAlone(track), inHost(17));
    EXPECT_EQ(conformAlone(other), inHost(17));
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(end(), inHost(17));
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(conformAlone(other), inHost(17)) << "and once more, as nothing has been conformed any more";
}

TEST_P(SessionEndTest, ComesBackWithTheCut)
{
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");
    host.conform();
    host.model().oldEdl().clear();
    host.model().newEdl().clear();
    setCuts("01:00:12:00", "01:00:20:00");

    host.conform();

    EXPECT_EQ(end(), inHost(25));
}

TEST_P(SessionEndTest, StaysWhereAnotherReelThatStaysComesAfterTheCuts)
{
    host.addSound(track, u"second reel", 90.0, 100.0);
    setEnd(FVariant::integer(inHost(105)));
    host.settings().setRestrictRange(true);
    host.settings().setPreserveMaterial(AdaptedHost::onClock(0.0), AdaptedHost::onClock(50.0));
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");

    host.conform();

    EXPECT_EQ(host.contentOf(track), (std::vector<std::string>{"one 0-10", "two 10-12", "second reel 90-100"}));
    EXPECT_EQ(end(), inHost(105));
}

TEST_P(SessionEndTest, GoesWithWhatIsCarriedAfterTheCuts)
{
    host.addSound(track, u"pop", 22.0, 23.0);
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");
    host.carryOver("01:00:22:00", "01:00:23:00", "01:00:14:00", "01:00:15:00");

    host.conform();

    EXPECT_EQ(end(), inHost(17));
}

TEST_P(SessionEndTest, GoesWithTheCutsWhereWhatCameAfterThemGoes)
{
    host.addSound(track, u"pop", 22.0, 23.0);
    setCuts("01:00:20:00", "01:00:20:00");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");

    host.conform();

    EXPECT_EQ(host.contentOf(track), (std::vector<std::string>{"one 0-10", "two 10-20"}));
    EXPECT_EQ(end(), inHost(25));
}

TEST_P(SessionEndTest, StaysWhereTheUserLetsOnlyWhatIsBeforeItChange)
{
    const auto conformedUpTo = [&](double filmSeconds) {
        host.settings().setRestrictRange(true);
        host.settings().setPreserveMaterial(AdaptedHost::onClock(0.0), AdaptedHost::onClock(filmSeconds));
        host.conform();
        return end();
    };
    setCuts("01:00:20:00", "01:00:22:00");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");

    EXPECT_EQ(conformedUpTo(21.96), inHost(25));
    EXPECT_EQ(conformedUpTo(22.0), inHost(27));
}

TEST_P(SessionEndTest, IsNotBeforeTheProjectBegins)
{
    setEnd(FVariant::integer(Second));
    setCuts("01:00:20:00", "01:00:12:00");
    host.carryOver("01:00:00:00", "01:00:12:00", "01:00:00:00", "01:00:12:00");

    host.conform();

    EXPECT_EQ(end(), 0);
}

TEST_P(SessionEndTest, IsNoneWhereTheProjectHasNoneOrNoneThatIsATime)
{
    setCuts("01:00:20:00", "01:00:22:00");
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");
    for (const int64 absurd : {int64{-1}, std::numeric_limits<int64>::max()}) {
        setEnd(FVariant::integer(absurd));
        host.conform();
        EXPECT_EQ(end(), absurd);
    }
    setEnd(FVariant::string("25"));
    host.conform();
    EXPECT_EQ(end(), 0) << "a text is no integer, and stays";
    ASSERT_EQ(host.root()->removeAttribute(AttributeKey::SessionEnd), ResultOk);
    host.conform();
    EXPECT_FALSE(end());
}

} // namespace cadrel::host::tests
