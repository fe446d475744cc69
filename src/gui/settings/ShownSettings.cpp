// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/settings/ShownSettings.h"

#include "core/settings/FrameBounds.h"
#include "core/settings/Settings.h"
#include "core/settings/VfxNameMatcher.h"
#include "core/time/FramerateProvider.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <vector>

namespace cadrel::gui {

using core::FrameBounds;
using core::Settings;
using core::Timecode;
using core::VfxPatternEntry;

FrameRange frameRangeFor(std::int32_t stored)
{
    return {std::min(FrameBounds::Fewest, stored), std::max(FrameBounds::Most, stored)};
}

int itemIdFor(std::int32_t stored, std::size_t itemCount)
{
    return stored >= 0 && static_cast<std::size_t>(stored) < itemCount ? stored + 1 : 0;
}

double SignedTimecode::seconds() const
{
    const core::FramerateProvider* const provider = Timecode::framerateProvider();
    if (!provider || !amount.isValid(provider->getFramerate()))
        return 0.0;
    const double size = amount.toSeconds();
    // There is no -0.
    return isPositive || size == 0.0 ? size : -size;
}

SignedTimecode shownTime(double seconds)
{
    const SignedTimecode zero{Timecode::minTimecode(), !(seconds < 0.0)};
    if (!Timecode::framerateProvider() || std::isnan(seconds))
        return zero;
    try {
        SignedTimecode shown = zero;
        const double size = std::abs(seconds);
        if (Timecode::isValidSeconds(size))
            shown.amount.setSeconds(size);
        else
            shown.amount = Timecode::maxTimecode();
        return shown;
    } catch (util::Result::Type) {
        // The rate is unknown.
        return zero;
    }
}

Preserved Preserved::inOrder(Edited edited) const
{
    if (!(before > after))
        return *this;
    const double kept = edited == Edited::Before ? before : after;
    return {kept, kept};
}

VfxPatternEntry vfxRow(const Settings& settings, std::size_t row)
{
    const std::vector<VfxPatternEntry>& rows = settings.vfxPatterns();
    return row < rows.size() ? rows[row] : VfxPatternEntry();
}

void setVfxRow(Settings& settings, const VfxPatternEntry& entry, std::size_t row)
{
    if (settings.vfxPatterns().size() <= row) {
        std::vector<VfxPatternEntry> rows = settings.vfxPatterns();
        rows.resize(std::max(row + 1, Settings::VfxRowCount));
        settings.set(&Settings::vfxPatterns, rows);
    }
    settings.setVfxPattern(entry, row);
}

bool isRefused(const std::string& text)
{
    return text.find_first_not_of(core::VfxNameMatcher::AllowedCharacters) != std::string::npos;
}

} // namespace cadrel::gui
