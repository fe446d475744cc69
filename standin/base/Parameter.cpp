// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/Parameter.h"

#include "standin/base/Times.h"

#include <cmath>

using namespace Velmark;

namespace standin {

int32 Parameter::setValue(int32 /*flags*/, double value)
{
    if (!(std::abs(value) <= FurthestTime))
        return ResultFalse;
    m_value = value;
    return ResultOk;
}

} // namespace standin
