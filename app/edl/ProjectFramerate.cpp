// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/ProjectFramerate.h"

#include "core/time/Timecode.h"

#include <algorithm>

namespace cadrel::app {

using core::Framerate;
using core::Timecode;

ProjectFramerate::ProjectFramerate(const Framerate& framerate) : m_framerate(framerate)
{
    Timecode::setFramerateProvider(this);
}

ProjectFramerate::~ProjectFramerate()
{
    Timecode::setFramerateProvider(nullptr);
}

std::optional<Framerate> ProjectFramerate::fromShownRate(const Framerate& shown)
{
    if (shown.framesPerSecond == 0)
        return std::nullopt;
    return Framerate(shown.framesPerSecond, shown.dropFrame == 1 ? 1 : 0);
}

Framerate ProjectFramerate::fromLabel(std::string_view label)
{
    if (label == "47.95 fps")
        return {48, true, 0};
    if (label == "48 fps")
        return {48, false, 0};
    if (label == "50 fps")
        return {50, false, 0};
    return Framerate::fromLabel(label);
}

std::optional<std::string> ProjectFramerate::labelMeant(std::string_view text)
{
    for (const std::string& label : {std::string(text), std::string(text) + " fps"}) {
        if (std::find(Labels.begin(), Labels.end(), label) != Labels.end())
            return label;
    }
    return std::nullopt;
}

std::string ProjectFramerate::labelOf(const Framerate& framerate)
{
    const auto label = std::find_if(Labels.begin(), Labels.end(), [&framerate](std::string_view candidate) {
        const Framerate other = fromLabel(candidate);
        return other.framesPerSecond == framerate.framesPerSecond && other.pulledDown == framerate.pulledDown &&
               other.dropFrame == framerate.dropFrame;
    });
    return label == Labels.end() ? std::to_string(framerate.framesPerSecond) + " fps" : std::string(*label);
}

} // namespace cadrel::app
