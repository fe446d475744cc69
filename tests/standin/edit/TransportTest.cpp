// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/Transport.h"

#include "tests/support/standin/TestHost.h"
#include "velmark/Transport.h"

#include <gtest/gtest.h>

#include <limits>

using namespace Velmark;

namespace standin::tests {

namespace {

class TransportTest : public testing::Test {
protected:
    TestHost host;
    Counted<ITransportControl> transport = service<ITransportControl>(host.context());
};

} // namespace

TEST_F(TransportTest, HasTheCycleAndThePositionOfTheActiveProject)
{
    IParameter* const left = transport->getParameter(ParameterName::CycleLeftTime);
    IParameter* const right = transport->getParameter(ParameterName::CycleRightTime);
    ASSERT_TRUE(left && right);

    EXPECT_EQ(left->setValue(IParameter::Flag::Notify, 2.5), ResultOk);
    EXPECT_EQ(right->setValue(IParameter::Flag::Notify, 7.25), ResultOk);
    EXPECT_EQ(transport->setPosition(3.0), ResultOk);

    EXPECT_EQ(host.project.cycleLeft().getValue(), 2.5);
    EXPECT_EQ(host.project.cycleRight().getValue(), 7.25);
    EXPECT_EQ(host.project.position().getValue(), 3.0);
    EXPECT_EQ(transport->getParameter(ParameterName::CycleLeftTime)->getValue(), 2.5);
    EXPECT_EQ(transport->getParameter(ParameterName::CycleRightTime)->getValue(), 7.25);
    EXPECT_EQ(transport->getPosition(), 3.0);
}

TEST_F(TransportTest, LeavesTheLocatorsAlone)
{
    transport->getParameter(ParameterName::CycleLeftTime)->setValue(0, 2.5);

    EXPECT_EQ(host.document()->getLocators()->getParameter(ParameterName::LeftTime)->getValue(), 0.0);
}

TEST_F(TransportTest, FollowsTheActiveProject)
{
    transport->setPosition(3.0);
    Project& other = host.application.createProject();
    host.application.activateProject(&other);

    EXPECT_EQ(transport->getPosition(), 0.0);
    transport->setPosition(4.0);
    host.application.activateProject(&host.project);
    EXPECT_EQ(transport->getPosition(), 3.0);
    EXPECT_EQ(other.position().getValue(), 4.0);
}

TEST_F(TransportTest, IsStoppedByAStop)
{
    transport->setPosition(3.0);

    EXPECT_EQ(transport->stop(), ResultOk);

    EXPECT_EQ(transport->getPosition(), 3.0);
}

TEST_F(TransportTest, KnowsNoOtherParameters)
{
    EXPECT_EQ(transport->getParameter("leftTime"), nullptr);
    EXPECT_EQ(transport->getParameter(""), nullptr);
    EXPECT_EQ(transport->getParameter(nullptr), nullptr);
}

TEST_F(TransportTest, RefusesAPositionThatIsNoTime)
{
    transport->setPosition(3.0);

    EXPECT_NE(transport->setPosition(std::numeric_limits<double>::quiet_NaN()), ResultOk);
    EXPECT_NE(transport->setPosition(std::numeric_limits<double>::infinity()), ResultOk);

    EXPECT_EQ(transport->getPosition(), 3.0);
}

TEST_F(TransportTest, RefusesAllWithoutAnActiveProject)
{
    transport->setPosition(3.0);
    host.application.activateProject(nullptr);

    EXPECT_EQ(transport->getParameter(ParameterName::CycleLeftTime), nullptr);
    EXPECT_EQ(transport->getParameter(ParameterName::CycleRightTime), nullptr);
    EXPECT_EQ(transport->getPosition(), 0.0);
    EXPECT_NE(transport->setPosition(4.0), ResultOk);
    EXPECT_NE(transport->stop(), ResultOk);
    EXPECT_EQ(host.project.position().getValue(), 3.0);
}

} // namespace standin::tests
