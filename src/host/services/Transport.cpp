// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/Transport.h"

#include "host/border/HostFailure.h"

namespace cadrel::host {

using Velmark::IParameter;
using Velmark::ITransportControl;
using Velmark::ParameterName;

void Transport::getCycle(double& left, double& right) const
{
    IParameter& leftTime = parameter(ParameterName::CycleLeftTime);
    IParameter& rightTime = parameter(ParameterName::CycleRightTime);
    left = leftTime.getValue();
    right = rightTime.getValue();
}

void Transport::setCycle(double left, double right) const
{
    if (left > right)
        throw util::Result::InvalidArgument;
    IParameter& leftTime = parameter(ParameterName::CycleLeftTime);
    IParameter& rightTime = parameter(ParameterName::CycleRightTime);
    requireOk(leftTime.setValue(IParameter::Flag::Notify, left));
    requireOk(rightTime.setValue(IParameter::Flag::Notify, right));
}

double Transport::position() const
{
    return control().getPosition();
}

void Transport::setPosition(double seconds) const
{
    requireOk(control().setPosition(seconds));
}

void Transport::stop() const
{
    requireOk(control().stop());
}

ITransportControl& Transport::control() const
{
    return *required(m_control.get());
}

IParameter& Transport::parameter(const char* name) const
{
    return *required(control().getParameter(name));
}

} // namespace cadrel::host
