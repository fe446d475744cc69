// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "util/Result.h"

#include <cstdint>

namespace cadrel::core {

/// The list of a ListKind. Throws Result::InvalidArgument for any other number.
inline EventList& listOf(DataModel& model, std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return model.oldEdl();
    case ListKind::New:
        return model.newEdl();
    case ListKind::Change:
        return model.changeEdl();
    default:
        throw util::Result::InvalidArgument;
    }
}

} // namespace cadrel::core
