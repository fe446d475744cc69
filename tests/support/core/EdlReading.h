// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "core/time/Framerate.h"
#include "tests/support/TempFolder.h"
#include "util/Result.h"

#include <cstdint>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::tests {

/// What a parser made of a text. Needs a TestProject.
struct EdlReading {
    explicit EdlReading(std::string_view text, bool acceptAudio = false)
    {
        const TempFolder folder;
        const std::wstring path = widePath(folder.write("reel.edl", text));
        core::fileio::CmxParser parser;
        result = parser.parse(path, events, framerate, acceptAudio);
    }

    util::Result::Type result;
    core::EventList events;
    core::Framerate framerate;
};

/// A frame rate as the reader detects it.
struct ShownRate {
    std::int32_t framesPerSecond;
    std::int32_t dropFrame;
    bool operator==(const ShownRate&) const = default;
};

inline ShownRate shown(const core::Framerate& framerate)
{
    return {framerate.framesPerSecond, framerate.dropFrame};
}

inline std::ostream& operator<<(std::ostream& stream, const ShownRate& rate)
{
    return stream << rate.framesPerSecond << " fps, drop-frame state " << rate.dropFrame;
}

/// All flaws of an event in ascending order.
inline std::vector<std::int32_t> flawsOf(const core::EventBase& event)
{
    std::vector<std::int32_t> flaws;
    for (std::int32_t flaw = 0; flaw <= core::EventFlaw::Last; ++flaw) {
        if (event.hasFlaw(flaw))
            flaws.push_back(flaw);
    }
    return flaws;
}

} // namespace cadrel::tests
