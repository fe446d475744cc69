// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>

namespace cadrel::gui {

/// The buttons of the window, in the order in which they are made.
enum class MainButton : std::size_t {
    AddChange,
    Start,
    AddOld,
    AddNew,
    Generate,
    ClearOld,
    ClearNew,
    ClearChange,
    Settings,
    Save,
    Source,      ///< the preview shows where events come from
    Destination, ///< the preview shows where events go
    Videos,
    In,  ///< the pictures are those of the IN points
    Out, ///< the pictures are those of the OUT points
    Preview,
};

inline constexpr std::size_t MainButtonCount = static_cast<std::size_t>(MainButton::Preview) + 1;

} // namespace cadrel::gui
