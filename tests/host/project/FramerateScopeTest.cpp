// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/FramerateScope.h"

#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace cadrel::host {

using core::Timecode;

namespace {

class FramerateScopeTest : public testing::Test {
protected:
    const cadrel::tests::TestProject former;
    // Their rates are asked for, and nothing else.
    struct Provider : core::FramerateProvider {
        explicit Provider(std::int32_t rate) : framerate(rate, 0) {}
        core::Framerate getFramerate() const override { return framerate; }
        core::Framerate framerate;
    };
    const Provider own{24};
    const Provider other{30};
};

} // namespace

TEST_F(FramerateScopeTest, GivesTimecodesTheRateOfItsProjectWhileItLives)
{
    {
        const FramerateScope scope(own);
        EXPECT_EQ(Timecode::framerate().rate, 24.0);
        {
            const FramerateScope inner(other);
            EXPECT_EQ(Timecode::framerate().rate, 30.0);
        }
        EXPECT_EQ(Timecode::framerate().rate, 24.0);
    }
    EXPECT_EQ(Timecode::framerateProvider(), &former);
}

TEST_F(FramerateScopeTest, LeavesTheProjectThatWasActivatedMeanwhile)
{
    {
        const FramerateScope scope(own);
        Timecode::setFramerateProvider(&other);
    }
    EXPECT_EQ(Timecode::framerateProvider(), &other);
    {
        const FramerateScope scope(own);
        Timecode::setFramerateProvider(nullptr);
    }
    EXPECT_EQ(Timecode::framerateProvider(), nullptr);
}

TEST_F(FramerateScopeTest, LeavesItAlsoWhereItIsItsOwn)
{
    {
        const FramerateScope scope(own);
        Timecode::setFramerateProvider(&own);
    }
    EXPECT_EQ(Timecode::framerateProvider(), &own);
}

} // namespace cadrel::host
