// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/settings/SettingsTable.h"

#include "app/console/Wording.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <string_view>

namespace cadrel::app {

using core::Settings;
using Use = SettingEntry::Use;

namespace {

constexpr std::array<const char*, 2> MatchWords{"roll", "clip"};
constexpr std::array<const char*, 4> HealWords{"none", "normal", "gaps", "inserts"};
constexpr std::array<const char*, 2> TrackWords{"all", "selected"};
static_assert(core::MatchBy::ClipName == 1 && core::HealMode::GapsWithInserts == 3 &&
              core::ApplyTo::SelectedTracks == 1);

const std::array Table{
    SettingEntry{"tracks", Use::Run, ChoiceSetting{&Settings::applyTo, TrackWords, "WHICH"},
                 "Which tracks to change: all (default) or those that are selected", "selected tracks alone"},
    SettingEntry{"match", Use::RunAndGeneration, ChoiceSetting{&Settings::matchBy, MatchWords, "NAME"},
                 "The name that tells the same material: roll (default) or clip", "matched by clip name"},
    SettingEntry{"heal", Use::Generation, ChoiceSetting{&Settings::healMode, HealWords, "MODE"},
                 "How to join neighbours that keep their distance: none, normal (default), gaps or inserts", ""},
    SettingEntry{"vfx", Use::Generation, VfxSetting{},
                 "The texts around the version number of VFX shots, * being any character; up to three times", ""},
    SettingEntry{"overhang", Use::Run,
                 BoundSetting<std::int32_t>{&Settings::includeOverhangingAudioEvents, &Settings::snippetThreshold,
                                            MostFrames, "FRAMES",
                                            "Cut clips exactly where their stretch ends (default)"},
                 "Let clips that hang over the end of a stretch by up to so many frames go along with it whole or not "
                 "at all",
                 "overhangs up to {} go along"},
    SettingEntry{"overhang-percent", Use::Run,
                 BoundSetting<double>{&Settings::snippetUsesPercentage, &Settings::snippetMaxPercentage, 100.0,
                                      "PERCENT", "However much of the clip it is"},
                 "The largest part of a clip that counts as hanging over (default 50)", ""},
    SettingEntry{"remains", Use::Run, FramesSetting{&Settings::remainsThreshold},
                 "The longest sliver that is marked as a snippet (default 5)", "snippets up to {}"},
    SettingEntry{"virgin-territories", Use::Run, SwitchSetting{&Settings::createVirginTerritories},
                 "Lead the automation over the stretches without old sound", "virgin territories"},
    SettingEntry{"preserve", Use::Run, RangeSetting{"Change the whole project (default)"},
                 "Change the project between these two timecodes alone and keep what is before and after",
                 "between {} alone"},
    SettingEntry{"destination-markers", Use::Run, SwitchSetting{&Settings::createDestinationMarkers},
                 "Mark each stretch that was carried over", "no destination markers"},
    SettingEntry{"insert-markers", Use::Run, SwitchSetting{&Settings::createInsertMarkers},
                 "Mark new picture, which needs sound", "no insert markers"},
    SettingEntry{"dissolve-wipe-markers", Use::Run, SwitchSetting{&Settings::createDissolveWipeMarkers},
                 "Mark new dissolves and wipes", "no dissolve and wipe markers"},
    SettingEntry{"automation-markers", Use::Run, SwitchSetting{&Settings::createAutomationWarningMarkers},
                 "Mark jumps of the automation", "no automation markers"},
    SettingEntry{"snippet-markers", Use::Run, SwitchSetting{&Settings::createAudioSnippetMarkers},
                 "Mark slivers of clips at the ends of stretches", "no snippet markers"},
    SettingEntry{"overlap-markers", Use::Run, SwitchSetting{&Settings::createOverlapMarkers},
                 "Mark stretches that want the same place of a track", "no overlap markers"},
    SettingEntry{"b-roll", Use::Run, SwitchSetting{&Settings::bRollRenaming}, "Take A001B for a B-roll of A001",
                 "no B-rolls"},
};

std::string framesText(std::int32_t frames)
{
    return counted(static_cast<std::size_t>(std::max(frames, 0)), "frame");
}

/// Whether a setting is as in new settings, and what takes the place of "{}" in its report.
struct Reading {
    bool isUsual;
    std::string value;
};

/// Reads the settings of every kind.
struct Reader {
    const Settings& settings;
    const TimeText& timeText;

    Reading operator()(const SwitchSetting& kind) const { return {(settings.*kind.option).isUsual(), {}}; }
    Reading operator()(const ChoiceSetting& kind) const { return {(settings.*kind.option).isUsual(), {}}; }

    Reading operator()(const FramesSetting& kind) const
    {
        const auto& option = settings.*kind.option;
        return {option.isUsual(), framesText(option())};
    }

    Reading operator()(const BoundSetting<std::int32_t>& kind) const
    {
        return {isUsual(kind), framesText((settings.*kind.bound)())};
    }

    Reading operator()(const BoundSetting<double>& kind) const { return {isUsual(kind), {}}; }

    Reading operator()(const RangeSetting&) const
    {
        return {settings.restrictRange.isUsual(),
                timeText(settings.preserveMaterialBefore()) + " and " + timeText(settings.preserveMaterialAfter())};
    }

    Reading operator()(const VfxSetting&) const { return {settings.vfxPatterns.isUsual(), {}}; }

    template <typename Number>
    bool isUsual(const BoundSetting<Number>& kind) const
    {
        const auto& isOn = settings.*kind.isOn;
        return isOn.isUsual() && (!isOn() || (settings.*kind.bound).isUsual());
    }
};

} // namespace

std::span<const SettingEntry> settingsTable()
{
    return Table;
}

std::vector<std::string> unusualSettings(const Settings& settings, const TimeText& timeText)
{
    constexpr std::string_view Gap = "{}";
    std::vector<std::string> words;
    for (const SettingEntry& entry : Table) {
        const auto [isUsual, value] = std::visit(Reader{settings, timeText}, entry.kind);
        std::string text = entry.whenUnusual;
        if (isUsual || text.empty())
            continue;
        const std::size_t gap = text.find(Gap);
        if (gap != std::string::npos)
            text.replace(gap, Gap.size(), value);
        words.push_back(text);
    }
    return words;
}

} // namespace cadrel::app
