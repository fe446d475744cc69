// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/settings/SettingsTable.h"

#include "core/settings/FrameBounds.h"

#include <algorithm>
#include <array>

namespace cadrel::app {

using core::FrameBounds;
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
                 "Which tracks to change: all (default) or those that are selected"},
    SettingEntry{"match", Use::RunAndGeneration, ChoiceSetting{&Settings::matchBy, MatchWords, "NAME"},
                 "The name that tells the same material: roll (default) or clip"},
    SettingEntry{"heal", Use::Generation, ChoiceSetting{&Settings::healMode, HealWords, "MODE"},
                 "How to join neighbours that keep their distance: none, normal (default), gaps or inserts"},
    SettingEntry{
        "vfx", Use::Generation, VfxSetting{},
        "The texts around the version number of VFX shots, * being any character; up to three times. none forgets "
        "them"},
    SettingEntry{"overhang", Use::Run,
                 BoundSetting<std::int32_t>{&Settings::includeOverhangingAudioEvents, &Settings::snippetThreshold,
                                            FrameBounds::Fewest, FrameBounds::Most, "FRAMES",
                                            "Cut clips exactly where their stretch ends (default)"},
                 "Let clips that hang over the end of a stretch by up to so many frames go along with it whole or not "
                 "at all"},
    SettingEntry{"overhang-percent", Use::Run,
                 BoundSetting<double>{&Settings::snippetUsesPercentage, &Settings::snippetMaxPercentage, 0.0, 100.0,
                                      "PERCENT", "However much of the clip it is"},
                 "The largest part of a clip that counts as hanging over (default 50)"},
    SettingEntry{"remains", Use::Run, FramesSetting{&Settings::remainsThreshold},
                 "The longest sliver that is marked as a snippet (default 5)"},
    SettingEntry{"virgin-territories", Use::Run, SwitchSetting{&Settings::createVirginTerritories},
                 "Lead the automation over the stretches without old sound"},
    SettingEntry{"preserve", Use::Run, RangeSetting{"Change the whole project (default)"},
                 "Change the project between these two timecodes alone and keep what is before and after"},
    SettingEntry{"destination-markers", Use::Run, SwitchSetting{&Settings::createDestinationMarkers},
                 "Mark each stretch that was carried over"},
    SettingEntry{"insert-markers", Use::Run, SwitchSetting{&Settings::createInsertMarkers},
                 "Mark new picture, which needs sound"},
    SettingEntry{"dissolve-wipe-markers", Use::Run, SwitchSetting{&Settings::createDissolveWipeMarkers},
                 "Mark new dissolves and wipes"},
    SettingEntry{"automation-markers", Use::Run, SwitchSetting{&Settings::createAutomationWarningMarkers},
                 "Mark jumps of the automation"},
    SettingEntry{"snippet-markers", Use::Run, SwitchSetting{&Settings::createAudioSnippetMarkers},
                 "Mark slivers of clips at the ends of stretches"},
    SettingEntry{"overlap-markers", Use::Run, SwitchSetting{&Settings::createOverlapMarkers},
                 "Mark stretches that want the same place of a track"},
    SettingEntry{"b-roll", Use::RunAndGeneration, SwitchSetting{&Settings::bRollRenaming},
                 "Take A001B for a B-roll of A001"},
};

} // namespace

std::span<const SettingEntry> settingsTable()
{
    return Table;
}

bool GivenSettings::has(const SettingEntry& entry) const
{
    const bool isWithTexts = (std::holds_alternative<VfxSetting>(entry.kind) && !vfxPatterns.empty()) ||
                             (std::holds_alternative<RangeSetting>(entry.kind) && !preserve.empty());
    return isWithTexts || std::any_of(changes.begin(), changes.end(),
                                      [&entry](const Change& change) { return change.entry == &entry; });
}

} // namespace cadrel::app
