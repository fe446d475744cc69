// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/Transport.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Context.h"
#include "velmark/Implements.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

/// A parameter that takes no value.
class FixedParameter : public Implements<FixedParameter, FObject, IParameter> {
public:
    static constexpr const char* ClassName = "FixedParameter";

    int32 setValue(int32, double) override { return ResultFalse; }
    double getValue() override { return 7.0; }
};

/// A transport that can't be moved. What it is asked to do is written down.
class FixedTransport : public Implements<FixedTransport, FObject, ITransportControl> {
public:
    static constexpr const char* ClassName = "FixedTransport";

    bool hasCycle = true;
    std::vector<std::string> calls;

    IParameter* getParameter(const char*) override { return hasCycle ? m_parameter.get() : nullptr; }
    double getPosition() override { return 7.0; }
    int32 setPosition(double) override { return refuse("setPosition"); }
    int32 stop() override { return refuse("stop"); }

private:
    int32 refuse(const char* call)
    {
        calls.emplace_back(call);
        return ResultFalse;
    }

    Counted<FixedParameter> m_parameter = makeCounted<FixedParameter>();
};

} // namespace

TEST(HostTransport, MovesTheCycleAndThePosition)
{
    standin::tests::TestHost host;
    const Transport transport(service<ITransportControl>(host.context()));

    transport.setCycle(2.0, 5.0);
    transport.setPosition(3.0);
    transport.stop();

    double left = 0.0;
    double right = 0.0;
    transport.getCycle(left, right);
    EXPECT_EQ(left, 2.0);
    EXPECT_EQ(right, 5.0);
    EXPECT_EQ(transport.position(), 3.0);
    EXPECT_EQ(host.project.cycleLeft().getValue(), 2.0);
    EXPECT_EQ(host.project.cycleRight().getValue(), 5.0);
    EXPECT_EQ(host.project.position().getValue(), 3.0);
}

TEST(HostTransport, TakesACycleWithoutLengthAndNoneThatIsReversed)
{
    standin::tests::TestHost host;
    const Transport transport(service<ITransportControl>(host.context()));
    transport.setCycle(4.0, 4.0);

    EXPECT_EQ(thrownBy([&] { transport.setCycle(5.0, 2.0); }), Result::InvalidArgument);

    EXPECT_EQ(host.project.cycleLeft().getValue(), 4.0);
    EXPECT_EQ(host.project.cycleRight().getValue(), 4.0);
}

TEST(HostTransport, TellsThatTheHostHasNone)
{
    const Transport transport(nullptr);
    double left = 0.0;
    double right = 0.0;

    EXPECT_EQ(thrownBy([&] { transport.getCycle(left, right); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { transport.setCycle(0.0, 1.0); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { (void)transport.position(); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { transport.setPosition(0.0); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { transport.stop(); }), Result::HostObjectMissing);
}

TEST(HostTransport, TellsThatTheHostRefuses)
{
    const auto fixed = makeCounted<FixedTransport>();
    const Transport transport(Counted<ITransportControl>::share(fixed.get()));

    EXPECT_EQ(thrownBy([&] { transport.setCycle(0.0, 1.0); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([&] { transport.setPosition(0.0); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([&] { transport.stop(); }), Result::HostCallFailed);
    EXPECT_EQ(fixed->calls, (std::vector<std::string>{"setPosition", "stop"}));
}

TEST(HostTransport, TellsThatThereIsNoCycle)
{
    const auto fixed = makeCounted<FixedTransport>();
    fixed->hasCycle = false;
    const Transport transport(Counted<ITransportControl>::share(fixed.get()));
    double left = 0.0;
    double right = 0.0;

    EXPECT_EQ(thrownBy([&] { transport.getCycle(left, right); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { transport.setCycle(0.0, 1.0); }), Result::HostObjectMissing);
}

} // namespace cadrel::host::tests
