// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_core/juce_core.h>

#include <string>
#include <vector>

namespace cadrel::gui {

/// In UTF-8.
inline std::vector<std::string> pathsOf(const juce::StringArray& files)
{
    std::vector<std::string> paths;
    for (const juce::String& file : files)
        paths.push_back(file.toStdString());
    return paths;
}

} // namespace cadrel::gui
