// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/FontTable.h"

#include "util/Result.h"

namespace cadrel::gui {

FontStyle fontStyle(int index)
{
    switch (index) {
    case 0:
    case 10:
    case 12:
        return {false, 14.0F};
    case 1:
    case 3:
    case 11:
    case 13:
        return {true, 14.0F};
    case 2:
    case 6:
        return {true, 12.0F};
    case 4:
    case 5:
    case 7:
        return {false, 12.0F};
    case 9:
        return {true, 16.0F};
    default:
        throw util::Result::InvalidArgument;
    }
}

} // namespace cadrel::gui
