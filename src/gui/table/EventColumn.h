// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <array>
#include <string>

namespace cadrel::gui {

/// A column of the event tables. All three tables have the same ones, in the order of their ids.
struct EventColumn {
    enum Id : int {
        State = 1,
        Number = 2,
        Roll = 3,
        ClipName = 4,
        EdlFile = 5,
        Transition = 6,
        SrcIn = 7,
        SrcOut = 8,
        DstIn = 9,
        DstOut = 10,
    };
    static constexpr int Count = DstOut;

    int id;
    int width; ///< in pixels, also the least
    int maximumWidth;

    static const std::array<EventColumn, Count>& all();
    static bool exists(int id) { return id >= State && id <= DstOut; }
    /// The text of the header, translated. "Unknown Column" for a number that is no column.
    static std::wstring name(int id);
};

} // namespace cadrel::gui
