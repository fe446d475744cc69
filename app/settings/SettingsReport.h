// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/settings/SettingsTable.h"

#include <cstddef>
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
    /// The settings of what is made of two cuts without a project. Those that are for a run alone aren't among them.
    static SettingsReport ofCuts(const core::Settings& settings, const GivenSettings& given);

    /// A choice that isn't one of the settings, after them.
    void add(Line line) { m_lines.push_back(std::move(line)); }

    /// The options that give the values from there, as they are typed: {"--match clip", "--vfx A,B"}.
    std::vector<std::string> optionsFrom(Origin origin) const;
    /// Lines of a title, such as "Settings    ", and the options that give these values, by where they are from. A line is
    /// wider only where a single option is.
    std::string text(const std::string& title, std::size_t width = 120) const;
    /// {"tracks": {"value": "all", "from": "default"}, ...}.
    nlohmann::ordered_json toJson() const;

private:
    SettingsReport() = default;
    /// `own` is where a value is from that isn't the default and isn't among those given.
    void add(const SettingEntry& entry, const core::Settings& settings, const GivenSettings& given, Origin own,
             const TimeText& timeText);

    std::vector<Line> m_lines;
};

} // namespace cadrel::app
