// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/Marker.h"

#include "host/track/HostEvent.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/ClassId.h"

#include <gtest/gtest.h>

#include <string>

using namespace Velmark;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using standin::tests::childrenOf;

namespace cadrel::host {

using tests::AlteredContext;
using tests::TrackHost;

namespace {

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. Markers are in times of the clock.
class MarkerTest : public testing::TestWithParam<double> {
protected:
    /// The marker as the host has it; null when it wasn't written.
    TrackHost::Node written(const Marker& marker)
    {
        host.edit(u"Write", [&] {
            thrown = thrownBy([&] { marker.insertInto(host.context(), *host.transaction(), host.handle(cues)); });
        });
        const auto markers = childrenOf(*cues);
        return markers.empty() ? nullptr : markers.back();
    }

    cadrel::tests::TestProject timecodes;
    TrackHost host{GetParam()};
    TrackHost::Node cues = host.addTrack(TypeWord::Marker, u"Cues");
    /// What the writing threw.
    Result::Type thrown = Result::Ok;
};

INSTANTIATE_TEST_SUITE_P(Origins, MarkerTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(MarkerTest, IsWrittenWithAllThatItHas)
{
    const auto node = written({3610.0, 3620.0, L"caf\u00e9", "A012", 7});

    ASSERT_NE(node, nullptr);
    EXPECT_TRUE(node->isType(TypeWord::Range));
    EXPECT_EQ(node->getStart(nullptr), 3610.0 - host.origin);
    EXPECT_EQ(node->getEnd(nullptr), 3620.0 - host.origin);
    EXPECT_EQ(std::u16string(node->getName()), u"caf\u00e9");
    FVariant value;
    ASSERT_EQ(node->getAttribute(AttributeKey::Reel, value), ResultOk);
    EXPECT_STREQ(value.asString(), "A012");
    ASSERT_EQ(node->getAttribute(AttributeKey::EventUserId, value), ResultOk);
    EXPECT_EQ(value.asInteger(), 7);
}

TEST_P(MarkerTest, HasNoUserIdUnlessItIsGivenOne)
{
    EXPECT_NE(written({3610.0, 3620.0, L"cue", "A012"})->hasAttribute(AttributeKey::EventUserId), ResultOk);
}

TEST_P(MarkerTest, IsAPointUpToAHundredthOfASecond)
{
    EXPECT_FALSE(written({3610.0, 3610.0, L"point", {}})->isType(TypeWord::Range));
    // Neither of these is a hundredth to the last bit.
    EXPECT_FALSE(written({3610.5, 3610.51, L"point", {}})->isType(TypeWord::Range));
    EXPECT_FALSE(written({90010.25, 90010.26, L"point", {}})->isType(TypeWord::Range));
    EXPECT_TRUE(written({90020.25, 90020.26 + 1.1 / 384000, L"range", {}})->isType(TypeWord::Range));
}

TEST_P(MarkerTest, BeginsWithTheEarlierOfItsTimes)
{
    const auto range = written({3620.0, 3610.0, L"reversed", {}});
    ASSERT_NE(range, nullptr);
    EXPECT_TRUE(range->isType(TypeWord::Range));
    EXPECT_EQ(range->getStart(nullptr), 3610.0 - host.origin);
    EXPECT_EQ(range->getEnd(nullptr), 3620.0 - host.origin);

    const auto point = written({3630.01, 3630.0, L"reversed", {}});
    ASSERT_NE(point, nullptr);
    EXPECT_FALSE(point->isType(TypeWord::Range));
    EXPECT_EQ(point->getStart(nullptr), 3630.0 - host.origin);
}

TEST_P(MarkerTest, NeedsATrackThatIsThere)
{
    host.edit(u"Write", [&] {
        EXPECT_EQ(thrownBy([&] { Marker().insertInto(host.context(), *host.transaction(), Track()); }),
                  Result::NotAvailable);
    });
}

TEST_P(MarkerTest, NeedsAMarkerOfTheHost)
{
    AlteredContext altered(host.context());
    altered.hide(ClassId::PointMarker);

    EXPECT_EQ(thrownBy([&] { Marker().insertInto(&altered, *host.transaction(), host.handle(cues)); }),
              Result::HostObjectMissing);
}

TEST_P(MarkerTest, FailsWhereTheHostRefuses)
{
    EXPECT_EQ(written({host.origin - 1.0, host.origin - 1.0, L"before the project", {}}), nullptr);
    EXPECT_EQ(thrown, Result::HostCallFailed);

    const Marker marker{3610.0, 3620.0, L"cue", {}};
    EXPECT_EQ(thrownBy([&] { marker.insertInto(host.context(), *host.transaction(), host.handle(cues)); }),
              Result::HostCallFailed)
        << "No transaction is open.";
}

} // namespace cadrel::host
