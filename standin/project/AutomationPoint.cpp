// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/AutomationPoint.h"

using namespace Velmark;

namespace standin {

float AutomationPoint::getValue()
{
    return static_cast<float>(m_value);
}

int32 AutomationPoint::setValue(float value)
{
    if (!(value >= 0.0f && value <= 1.0f))
        return ResultFalse;
    setValue(static_cast<double>(value));
    return ResultOk;
}

void AutomationPoint::setValue(double value)
{
    if (value != m_value)
        change(*this, &AutomationPoint::exchangeValue, value);
}

double AutomationPoint::exchangeValue(double value)
{
    std::swap(m_value, value);
    markContentChanged();
    return value;
}

} // namespace standin
