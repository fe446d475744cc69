// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/MarkerTrack.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

namespace cadrel::core {

using tests::thrownBy;
using util::Result;

TEST(MarkerTrack, HasTheNumberUnderWhichItIsStored)
{
    EXPECT_EQ(MarkerTrack::ofKind(MarkerKind::Insert).role, 3);
    EXPECT_EQ(MarkerTrack::ofKind(MarkerKind::DissolveWipe).role, 2);
    EXPECT_EQ(MarkerTrack::ofKind(MarkerKind::AutomationWarning).role, 4);
    EXPECT_EQ(MarkerTrack::ofKind(MarkerKind::AudioSnippet).role, 5);
    EXPECT_EQ(MarkerTrack::ofKind(MarkerKind::Overlap).role, 6);
    EXPECT_EQ(std::wstring(MarkerTrack::ofRole(1)->name), L"Destination");
    EXPECT_EQ(std::wstring(MarkerTrack::ofRole(7)->name), L"Memos");
}

TEST(MarkerTrack, StandsFromTopToBottomInTheOrderOfTheTable)
{
    std::vector<std::wstring> names;
    for (const MarkerTrack& track : MarkerTracks)
        names.emplace_back(track.name);

    EXPECT_EQ(names, (std::vector<std::wstring>{L"Destination", L"Insert", L"Dissolve/Wipe", L"Automation Warning",
                                                L"Audio Snippet", L"Overlap", L"Memos"}));
}

TEST(MarkerTrack, OfANumberThatIsNoKindThereIsNone)
{
    for (const std::int32_t kind : {-1, 0, 6, 7})
        EXPECT_EQ(thrownBy([&] { MarkerTrack::ofKind(kind); }), Result::InvalidArgument) << kind;
    for (const std::int32_t role : {-1, 0, 8, 0x103})
        EXPECT_EQ(MarkerTrack::ofRole(role), nullptr) << role;
}

TEST(MarkerTrack, IsSwitchedOnByTheSettingOfItsOwn)
{
    const auto switchAll = [](Settings& settings, bool flag) {
        settings.setCreateDestinationMarkers(flag);
        settings.setCreateInsertMarkers(flag);
        settings.setCreateDissolveWipeMarkers(flag);
        settings.setCreateAutomationWarningMarkers(flag);
        settings.setCreateAudioSnippetMarkers(flag);
        settings.setCreateOverlapMarkers(flag);
    };
    const auto on = [](const Settings& settings) {
        std::set<std::wstring> names;
        for (const MarkerTrack& track : MarkerTracks) {
            if (track.isOn(settings))
                names.insert(track.name);
        }
        return names;
    };
    using Names = std::set<std::wstring>;
    Settings settings;

    switchAll(settings, false);
    EXPECT_EQ(on(settings), Names{L"Memos"}) << "They are always on.";
    settings.setCreateDestinationMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Destination"}));
    switchAll(settings, false);
    settings.setCreateInsertMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Insert"}));
    switchAll(settings, false);
    settings.setCreateDissolveWipeMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Dissolve/Wipe"}));
    switchAll(settings, false);
    settings.setCreateAutomationWarningMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Automation Warning"}));
    switchAll(settings, false);
    settings.setCreateAudioSnippetMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Audio Snippet"}));
    switchAll(settings, false);
    settings.setCreateOverlapMarkers(true);
    EXPECT_EQ(on(settings), (Names{L"Memos", L"Overlap"}));
}

} // namespace cadrel::core
