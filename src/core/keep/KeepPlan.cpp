// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/KeepPlan.h"

#include <algorithm>

namespace cadrel::core {

bool KeptEvent::holds(CarriedFrom from) const
{
    return std::any_of(parts.begin(), parts.end(), [from](const CarriedStretch& part) { return part.from == from; });
}

} // namespace cadrel::core
