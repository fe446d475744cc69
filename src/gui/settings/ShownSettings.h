// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/VfxPatternEntry.h"
#include "core/time/Timecode.h"

#include <cstddef>
#include <cstdint>
#include <string>

namespace cadrel::core {
class Settings;
} // namespace cadrel::core

namespace cadrel::gui {

// What the window shows for the values that are stored, and what it stores for what the user enters.

struct FrameRange {
    std::int32_t fewest;
    std::int32_t most;

    bool operator==(const FrameRange&) const = default;
};

/// The frames that the user can choose: those of core::FrameBounds, and on to a stored number that lies outside, which is
/// shown as it is.
FrameRange frameRangeFor(std::int32_t stored);

/// The item of a choice that shows a stored number, counted from 1; 0 for a number that has none.
int itemIdFor(std::int32_t stored, std::size_t itemCount);

/// A time of the project as an input with a sign has it.
struct SignedTimecode {
    core::Timecode amount;
    bool isPositive;

    /// 0 where the amount doesn't exist at the project's rate.
    double seconds() const;
};

/// The nearest time that an input can show: at a whole frame of the project's rate, within a day on either side of zero.
/// Zero without a project, and for what is no number.
SignedTimecode shownTime(double seconds);

/// The two times that limit where a run may change the project.
struct Preserved {
    enum class Edited { Before, After };

    double before;
    double after;

    /// Where they are in the wrong order, the time that wasn't edited becomes the same as the other.
    Preserved inOrder(Edited edited) const;
};

/// A row of VFX names that isn't there is empty.
core::VfxPatternEntry vfxRow(const core::Settings& settings, std::size_t row);
/// Adds the rows that aren't there.
void setVfxRow(core::Settings& settings, const core::VfxPatternEntry& entry, std::size_t row);
/// Whether a prefix or postfix has characters that it can't have.
bool isRefused(const std::string& text);

} // namespace cadrel::gui
