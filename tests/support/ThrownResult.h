// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

namespace cadrel::tests {

/// The result that an action throws; Ok when it throws nothing. Any other exception passes through.
template <typename Action>
util::Result::Type thrownBy(Action action)
{
    try {
        action();
    } catch (util::Result::Type result) {
        return result;
    }
    return util::Result::Ok;
}

} // namespace cadrel::tests
