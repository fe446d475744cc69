// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/AutomationPoint.h"

#include <array>
#include <charconv>
#include <utility>

using namespace Velmark;

namespace standin {

namespace {

/// The number that a value of 32 bits stands for: 0.1, and not 0.100000001490116. It reads as the same value again.
double meantBy(float value)
{
    std::array<char, 32> text{};
    const auto end = std::to_chars(text.data(), text.data() + text.size(), value).ptr;
    double number = 0.0;
    std::from_chars(text.data(), end, number);
    return static_cast<float>(number) == value ? number : static_cast<double>(value);
}

} // namespace

float AutomationPoint::getValue()
{
    return static_cast<float>(m_value);
}

int32 AutomationPoint::setValue(float value)
{
    if (!(value >= 0.0f && value <= 1.0f))
        return ResultFalse;
    setValue(meantBy(value));
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
