// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/ProjectEnd.h"

#include "host/border/HostFailure.h"
#include "host/border/NumberList.h"
#include "tests/host/project/AlteredDocument.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <optional>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using cadrel::tests::thrownBy;
using util::Result;
using Numbers = std::vector<double>;

namespace {

/// A project with one clip, which ends at 20 s.
class ProjectEndTest : public testing::Test {
protected:
    ProjectEndTest() { host.addClip(track, u"one", 0.0, 20.0); }

    void set(double seconds) { requireOk(host.document()->setProjectEnd(seconds)); }
    double present() { return host.root()->getEnd(nullptr); }
    std::optional<Numbers> kept() { return readNumbers(*host.root(), AttributeKey::ProjectEnd); }
    ProjectEnd endOf(IProjectDocument* document)
    {
        return {host.context(), document, [this] { return m_contentEnd; }};
    }

    standin::tests::TestHost host;
    const standin::tests::TestHost::Node track = host.addTrack(TypeWord::Audio, u"DX");
    double m_contentEnd = 20.0;
    ProjectEnd end = endOf(host.document());
};

} // namespace

TEST_F(ProjectEndTest, IsPutOffAndPutBackToWhereTheUserHasSetIt)
{
    set(50.0);

    end.putOffTo(1000.0, false);
    EXPECT_EQ(present(), 1000.0);
    EXPECT_EQ(kept(), (Numbers{50.0, 1000.0}));

    end.putBack();
    EXPECT_EQ(present(), 50.0);
    EXPECT_FALSE(kept());
}

TEST_F(ProjectEndTest, FollowsTheContentAgainWhereItWasNeverSet)
{
    end.putOffTo(1000.0, false);
    EXPECT_EQ(kept(), (Numbers{0.0, 1000.0}));

    end.putBack();
    EXPECT_EQ(present(), 20.0);
    host.addClip(track, u"two", 20.0, 30.0);
    EXPECT_EQ(present(), 30.0);
}

TEST_F(ProjectEndTest, IsNeverDrawnIn)
{
    set(1000.0);

    for (const double time : {999.0, 1000.0}) {
        end.putOffTo(time, false);
        EXPECT_EQ(present(), 1000.0);
        EXPECT_FALSE(kept());
    }
    end.putOffTo(1000.1, false);
    EXPECT_EQ(present(), 1000.1);
}

TEST_F(ProjectEndTest, GoesBackToTheFirstPlaceWhenItWasPutOffSeveralTimes)
{
    set(50.0);
    end.putOffTo(1000.0, false);
    end.putOffTo(2000.0, true);
    EXPECT_EQ(kept(), (Numbers{50.0, 2000.0}));

    end.putBack();

    EXPECT_EQ(present(), 50.0);
}

TEST_F(ProjectEndTest, StaysWhereTheUserSetsItSince)
{
    for (const double time : {70.0, 999.0, 1001.0}) {
        SCOPED_TRACE(time);
        set(50.0);
        end.putOffTo(1000.0, false);
        set(time);

        end.putOffTo(3000.0, true);
        EXPECT_EQ(present(), time);
        end.putBack();

        EXPECT_EQ(present(), time);
        EXPECT_FALSE(kept());
    }
}

TEST_F(ProjectEndTest, IsKnownAgainWhereWhatLiesPastItHidesIt)
{
    set(50.0);
    end.putOffTo(1000.0, false);
    host.addClip(track, u"late", 1500.0, 1600.0);
    m_contentEnd = 1600.0;

    end.putBack();

    EXPECT_EQ(host.project.setEndTime(), 50.0);
}

TEST_F(ProjectEndTest, StaysWhereThePreviewIsThereAndTheSetEndCannotBeTold)
{
    m_contentEnd = 20.0;

    end.putOffTo(1000.0, true);

    EXPECT_EQ(present(), 20.0);
    EXPECT_FALSE(kept());
}

TEST_F(ProjectEndTest, ForgetsWhatCannotHaveBeenKept)
{
    for (const Numbers& stored :
         {Numbers{-1.0, 1000.0}, Numbers{1000.1, 1000.0}, Numbers{1e300, 1000.0}, Numbers{-2.0, -1.0}}) {
        SCOPED_TRACE(stored.front());
        set(1000.0);
        writeNumbers(host.context(), *host.root(), AttributeKey::ProjectEnd, stored);

        end.putBack();
        EXPECT_EQ(present(), 1000.0);
        EXPECT_FALSE(kept());

        writeNumbers(host.context(), *host.root(), AttributeKey::ProjectEnd, stored);
        end.putOffTo(2000.0, false);
        EXPECT_EQ(kept(), (Numbers{1000.0, 2000.0}));
        end.putBack();
    }
}

TEST_F(ProjectEndTest, IsNoLongerKeptWhereTheHostRefusesIt)
{
    const auto altered = makeCounted<tests::AlteredDocument>(host.document());
    ProjectEnd refused = endOf(altered.get());
    altered->endResult = ResultFalse;
    EXPECT_EQ(thrownBy([&] { refused.putOffTo(1000.0, false); }), Result::HostCallFailed);
    EXPECT_FALSE(kept());

    altered->endResult = ResultOk;
    set(50.0);
    refused.putOffTo(1000.0, false);
    altered->endResult = ResultFalse;
    EXPECT_EQ(thrownBy([&] { refused.putOffTo(2000.0, false); }), Result::HostCallFailed);
    EXPECT_EQ(kept(), (Numbers{50.0, 1000.0}));
    EXPECT_EQ(thrownBy([&] { refused.putBack(); }), Result::HostCallFailed);
    EXPECT_EQ(kept(), (Numbers{50.0, 1000.0})) << "It can be tried again.";

    altered->endResult = ResultOk;
    refused.putBack();
    EXPECT_EQ(present(), 50.0);
}

TEST_F(ProjectEndTest, StaysWhereWhatIsKeptMakesNoSense)
{
    set(50.0);
    for (const Numbers& numbers : {Numbers{}, Numbers{1.0}, Numbers{1.0, 50.0, 50.0}}) {
        writeNumbers(host.context(), *host.root(), AttributeKey::ProjectEnd, numbers);

        end.putBack();

        EXPECT_EQ(present(), 50.0);
        EXPECT_FALSE(kept());
    }
}

} // namespace cadrel::host
