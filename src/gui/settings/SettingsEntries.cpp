// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/settings/SettingsEntries.h"

#include <array>

namespace cadrel::gui {

using core::Settings;

namespace {

constexpr std::array<const wchar_t*, 2> MatchItems{L"Roll Name", L"Clip Name"};
constexpr std::array<const wchar_t*, 4> HealItems{L"None", L"Normal", L"Gaps without Inserts", L"Gaps with Inserts"};
constexpr std::array<const wchar_t*, 2> TrackItems{L"All Tracks", L"Selected Tracks"};
static_assert(core::MatchBy::ClipName == 1 && core::HealMode::GapsWithInserts == 3 &&
              core::ApplyTo::SelectedTracks == 1);

constexpr std::array Switches{
    SwitchEntry{"B Roll Renaming", L"B-Roll Renaming", 675, &Settings::bRollRenaming},
    SwitchEntry{"Virgin Territories Select", L"Create Virgin Territories (May Take Some Time)", 359,
                &Settings::createVirginTerritories},
    SwitchEntry{"Preserve Select", L"Restrict Cadrel Range", 332, &Settings::restrictRange},
    SwitchEntry{"m_lengthOfClipSelect", L"Include Overhanging Audio Events", 249,
                &Settings::includeOverhangingAudioEvents},
    SwitchEntry{"Destination Marker Select", L"Create Destination Markers", 222, &Settings::createDestinationMarkers},
    SwitchEntry{"Dissolve Wipe Marker Select", L"Create Dissolve/Wipe Markers", 195,
                &Settings::createDissolveWipeMarkers},
    SwitchEntry{"Insert Marker Select", L"Create Insert Markers", 168, &Settings::createInsertMarkers},
    SwitchEntry{"automationWarningMarkerSelect", L"Create Automation Warning Markers", 141,
                &Settings::createAutomationWarningMarkers},
    SwitchEntry{"Insert Marker Select", L"Create Audio Snippet Markers", 114, &Settings::createAudioSnippetMarkers},
    SwitchEntry{"Overlap Marker Select", L"Create Overlap Markers", 87, &Settings::createOverlapMarkers},
};

constexpr std::array Choices{
    ChoiceEntry{"m_matchNameSelect",
                {25, 602, 188, 20},
                "MatchNameLabel",
                L"Match Name",
                {217, 603, 279, 24},
                &Settings::matchBy,
                MatchItems},
    ChoiceEntry{"m_healProcessingSelect",
                {25, 575, 188, 20},
                "HealingProcessingLabel",
                L"Heal Processing",
                {217, 577, 279, 24},
                &Settings::healMode,
                HealItems},
    ChoiceEntry{"applyToSelect",
                {335, 384, 139, 20},
                "Cadrel Label",
                L"Apply Cadrel to",
                {37, 386, 328, 20},
                &Settings::applyTo,
                TrackItems},
};

constexpr std::array Frames{
    FramesEntry{L"Include Overhanging Audio Events", 249, &Settings::snippetThreshold},
    FramesEntry{L"Create Audio Snippet Markers", 114, &Settings::remainsThreshold},
};

} // namespace

std::span<const SwitchEntry> switchEntries()
{
    return Switches;
}

std::span<const ChoiceEntry> choiceEntries()
{
    return Choices;
}

std::span<const FramesEntry> framesEntries()
{
    return Frames;
}

} // namespace cadrel::gui
