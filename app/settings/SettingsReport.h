// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/settings/SettingsTable.h"

#include <functional>
#include <nlohmann/json.hpp>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::app {

/// The settings of a run as its report tells them: each with its value, and where that is from.
class SettingsReport {
public:
    enum class Origin { CommandLine, Project, Default };

    /// A time of the settings, which is in seconds, as a report writes it.
    using TimeText = std::function<std::string(double)>;

    struct Line {
        std::string name;
        std::string option; ///< empty for one that the text leaves out
        nlohmann::ordered_json value;
        Origin origin;
    };

    /// `isGenerated` is false for a run of a change EDL that was there, which has no use for how one is made. A value is the
    /// project's where it isn't the default and wasn't given.
    SettingsReport(const core::Settings& settings, const GivenSettings& given, bool isGenerated,
                   const TimeText& timeText);

    /// A choice that isn't one of the settings, after them.
    void add(Line line) { m_lines.push_back(std::move(line)); }

    /// Lines of a title, such as "Settings    ", and the options that give these values, by where they are from.
    std::string text(const std::string& title) const;
    /// {"tracks": {"value": "all", "from": "default"}, ...}.
    nlohmann::ordered_json toJson() const;

private:
    std::vector<Line> m_lines;
};

} // namespace cadrel::app
