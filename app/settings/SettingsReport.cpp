// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/settings/SettingsReport.h"

#include "app/console/Printable.h"
#include "core/settings/Settings.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <utility>
#include <variant>

namespace cadrel::app {

using core::Settings;
using nlohmann::ordered_json;
using Origin = SettingsReport::Origin;

namespace {

/// In the order of Origin.
constexpr std::array<const char*, 3> OriginWords{"command line", "project", "default"};

/// What a setting is: the option that gives it, its value for other programs, and whether it is that of new settings.
struct Reading {
    std::string option;
    ordered_json value;
    bool isUsual;
};

std::string numberText(double number)
{
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%g", number);
    return text.data();
}

std::string numberText(std::int32_t number)
{
    return std::to_string(number);
}

/// Without the ";" that shows drop-frame to people.
std::string forPrograms(std::string timecode)
{
    std::replace(timecode.begin(), timecode.end(), ';', ':');
    return timecode;
}

/// As a shell takes it.
std::string quotedPattern(const std::string& pattern)
{
    return pattern.find('*') == std::string::npos ? pattern : std::string("'").append(pattern).append("'");
}

/// Reads the settings of every kind.
struct Reader {
    const Settings& settings;
    const SettingsReport::TimeText& timeText;
    const std::string name;

    std::string on() const { return std::string("--").append(name); }
    std::string on(const std::string& value) const { return on().append(" ").append(value); }
    std::string off() const { return std::string("--no-").append(name); }

    Reading operator()(const SwitchSetting& kind) const
    {
        const auto& option = settings.*kind.option;
        return {option() ? on() : off(), option(), option.isUsual()};
    }

    Reading operator()(const ChoiceSetting& kind) const
    {
        const auto& option = settings.*kind.option;
        const auto index = static_cast<std::size_t>(option());
        // A stored number may be one that no option gives.
        const std::string word = index < kind.words.size() ? kind.words[index] : numberText(option());
        return {on(word), word, option.isUsual()};
    }

    Reading operator()(const FramesSetting& kind) const
    {
        const auto& option = settings.*kind.option;
        return {on(numberText(option())), option(), option.isUsual()};
    }

    template <typename Number>
    Reading operator()(const BoundSetting<Number>& kind) const
    {
        const auto& isOn = settings.*kind.isOn;
        const auto& bound = settings.*kind.bound;
        if (!isOn())
            return {off(), nullptr, isOn.isUsual()};
        return {on(numberText(bound())), bound(), isOn.isUsual() && bound.isUsual()};
    }

    Reading operator()(const RangeSetting&) const
    {
        if (!settings.restrictRange())
            return {off(), nullptr, true};
        const std::string before = timeText(settings.preserveMaterialBefore());
        const std::string after = timeText(settings.preserveMaterialAfter());
        return {on(before + " " + after), ordered_json::array({forPrograms(before), forPrograms(after)}), false};
    }

    Reading operator()(const VfxSetting&) const
    {
        Reading reading{{}, ordered_json::array(), true};
        for (const core::VfxPatternEntry& row : settings.vfxPatterns()) {
            if (!row.enabled)
                continue;
            const std::string pattern = row.prefix + "," + row.postfix;
            reading.option.append(reading.isUsual ? "" : " ").append(on(quotedPattern(pattern)));
            reading.value.push_back(pattern);
            reading.isUsual = false;
        }
        if (reading.isUsual)
            reading.option = on(NoVfxPatterns);
        return reading;
    }
};

/// Those of a setting that has several, such as "--vfx A,B --vfx C,D".
std::vector<std::string> singleOptions(const std::string& text)
{
    std::vector<std::string> options;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find(" --", start), text.size());
        options.push_back(text.substr(start, end - start));
        start = end + 1;
    }
    return options;
}

const char* wordOf(Origin origin)
{
    return OriginWords[static_cast<std::size_t>(origin)];
}

} // namespace

SettingsReport::SettingsReport(const Settings& settings, const GivenSettings& given, bool isGenerated,
                               const TimeText& timeText)
{
    for (const SettingEntry& entry : settingsTable()) {
        if (entry.use == SettingEntry::Use::Generation && !isGenerated)
            continue;
        add(entry, settings, given, Origin::Project, timeText);
    }
}

SettingsReport SettingsReport::ofCuts(const Settings& settings, const GivenSettings& given)
{
    SettingsReport report;
    for (const SettingEntry& entry : settingsTable()) {
        if (entry.use != SettingEntry::Use::Run)
            report.add(entry, settings, given, Origin::CommandLine, {});
    }
    return report;
}

void SettingsReport::add(const SettingEntry& entry, const Settings& settings, const GivenSettings& given, Origin own,
                         const TimeText& timeText)
{
    const Reading reading = std::visit(Reader{settings, timeText, entry.name}, entry.kind);
    const Origin found = reading.isUsual ? Origin::Default : own;
    m_lines.push_back({entry.name, reading.option, reading.value, given.has(entry) ? Origin::CommandLine : found});
}

std::vector<std::string> SettingsReport::optionsFrom(Origin origin) const
{
    std::vector<std::string> options;
    for (const Line& setting : m_lines) {
        if (setting.origin != origin || setting.option.empty())
            continue;
        const std::vector<std::string> single = singleOptions(toPrintable(setting.option).text);
        options.insert(options.end(), single.begin(), single.end());
    }
    return options;
}

std::string SettingsReport::text(const std::string& title, std::size_t width) const
{
    constexpr std::size_t WordColumn = 14;
    std::string text;
    for (const Origin origin : {Origin::CommandLine, Origin::Project, Origin::Default}) {
        std::string line;
        for (const std::string& option : optionsFrom(origin)) {
            if (line.empty()) {
                line = text.empty() ? title : std::string(title.size(), ' ');
                line += wordOf(origin);
                line.resize(title.size() + WordColumn, ' ');
            } else if (line.size() + 1 + option.size() > width) {
                text += line + "\n";
                line = std::string(title.size() + WordColumn, ' ');
            } else {
                line += ' ';
            }
            line += option;
        }
        if (!line.empty())
            text += line + "\n";
    }
    return text;
}

ordered_json SettingsReport::toJson() const
{
    ordered_json settings = ordered_json::object();
    for (const Line& setting : m_lines)
        settings[setting.name] = {{"value", setting.value}, {"from", wordOf(setting.origin)}};
    return settings;
}

} // namespace cadrel::app
