// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Settings.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <functional>
#include <limits>
#include <string>
#include <vector>

using cadrel::core::ChangeContext;
using cadrel::core::Settings;
using cadrel::core::VfxPatternEntry;
using cadrel::core::serialize::ByteArchive;
using cadrel::tests::archiveOf;
using cadrel::tests::bytesOf;
using cadrel::tests::RecordingListener;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

using Change = std::function<void(Settings&)>;
using Types = std::vector<std::int32_t>;

namespace {

/// Settings of which no option has its default.
Settings unusualSettings()
{
    Settings settings;
    settings.setMatchBy(1);
    settings.setHealMode(3);
    settings.setApplyTo(1);
    settings.setCreateDestinationMarkers(false);
    settings.setCreateDissolveWipeMarkers(false);
    settings.setCreateInsertMarkers(false);
    settings.setCreateAudioSnippetMarkers(false);
    settings.setRemainsThreshold(7);
    settings.setCreateAutomationWarningMarkers(false);
    settings.setCreateOverlapMarkers(false);
    settings.setVfxPattern(VfxPatternEntry("VFX_", "_v", true), 0);
    settings.setVfxPattern(VfxPatternEntry("CG", "", false), 2);
    settings.setSnippetUsesPercentage(false);
    settings.setSnippetMaxPercentage(12.5);
    settings.setIncludeOverhangingAudioEvents(true);
    settings.setSnippetThreshold(9);
    settings.setBRollRenaming(false);
    settings.setCreateVirginTerritories(true);
    settings.setRestrictRange(true);
    settings.setPreserveMaterial(-2.0, 4.0);
    return settings;
}

void expectDefaultOptions(const Settings& settings)
{
    EXPECT_EQ(settings.matchBy(), 0);
    EXPECT_EQ(settings.healMode(), 1);
    EXPECT_EQ(settings.applyTo(), 0);
    EXPECT_TRUE(settings.createDestinationMarkers());
    EXPECT_TRUE(settings.createDissolveWipeMarkers());
    EXPECT_TRUE(settings.createInsertMarkers());
    EXPECT_TRUE(settings.createAudioSnippetMarkers());
    EXPECT_EQ(settings.remainsThreshold(), 5);
    EXPECT_TRUE(settings.createAutomationWarningMarkers());
    EXPECT_TRUE(settings.createOverlapMarkers());
    EXPECT_TRUE(settings.snippetUsesPercentage());
    EXPECT_EQ(settings.snippetMaxPercentage(), 50.0);
    EXPECT_FALSE(settings.includeOverhangingAudioEvents());
    EXPECT_EQ(settings.snippetThreshold(), 5);
    EXPECT_TRUE(settings.bRollRenaming());
    EXPECT_FALSE(settings.createVirginTerritories());
    EXPECT_FALSE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), 0.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 0.0);
}

void expectUnusualOptions(const Settings& settings)
{
    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(settings.healMode(), 3);
    EXPECT_EQ(settings.applyTo(), 1);
    EXPECT_FALSE(settings.createDestinationMarkers());
    EXPECT_FALSE(settings.createDissolveWipeMarkers());
    EXPECT_FALSE(settings.createInsertMarkers());
    EXPECT_FALSE(settings.createAudioSnippetMarkers());
    EXPECT_EQ(settings.remainsThreshold(), 7);
    EXPECT_FALSE(settings.createAutomationWarningMarkers());
    EXPECT_FALSE(settings.createOverlapMarkers());
    EXPECT_FALSE(settings.snippetUsesPercentage());
    EXPECT_EQ(settings.snippetMaxPercentage(), 12.5);
    EXPECT_TRUE(settings.includeOverhangingAudioEvents());
    EXPECT_EQ(settings.snippetThreshold(), 9);
    EXPECT_FALSE(settings.bRollRenaming());
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_TRUE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), -2.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 4.0);
}

const std::vector<VfxPatternEntry> EmptyRows(3);
const std::vector<VfxPatternEntry> UnusualRows = {VfxPatternEntry("VFX_", "_v", true), VfxPatternEntry(),
                                                  VfxPatternEntry("CG", "", false)};

// The pieces of the streams of unusualSettings().
const std::string Choices = "01000000 03000000 01000000 ";        // matchBy, healMode, applyTo
const std::string Markers = "00 00 00 00 00 00 ";                 // four marker bools and two
const std::string RowVfx = "04000000 5646585F 02000000 5F76 01 "; // "VFX_", "_v", enabled
const std::string RowEmpty = "00000000 00000000 00 ";
const std::string RowCg = "02000000 4347 00000000 00 "; // "CG", "", not enabled
const std::string Rows = "03000000 00000000 " + RowVfx + "00000000 " + RowEmpty + "00000000 " + RowCg;
const std::string Snippets = "00 0000000000002940 01 09000000 "; // percentage unused, 12.5, overhanging, 9
const std::string BRollAndRemains = "00 07000000 ";
const std::string Virgin = "01 ";
const std::string Range = "01 00000000000000C0 0000000000001040 "; // restricted, -2.0, 4.0

const std::string Version1 = "01000000 " + Choices + Markers + Rows + Snippets;
const std::string Version2 = "02000000 " + Choices + Markers + Rows + Snippets + BRollAndRemains;
const std::string Version3 = "03000000 " + Choices + Markers + Rows + Snippets + BRollAndRemains + Virgin;
const std::string Version4 = "04000000 " + Choices + Markers + Rows + Snippets + BRollAndRemains + Virgin + Range;

void read(Settings& settings, const std::string& hex)
{
    ByteArchive archive = archiveOf(std::string_view(hex));
    archive >> settings;
    EXPECT_EQ(archive.bytesLeft(), 0U);
}

Settings readFrom(const std::string& hex)
{
    Settings settings;
    read(settings, hex);
    return settings;
}

/// Version 4 with three choices of the test's own.
std::string withChoices(const std::string& matchBy, const std::string& healMode, const std::string& applyTo)
{
    return "04000000 " + matchBy + healMode + applyTo + Markers + Rows + Snippets + BRollAndRemains + Virgin + Range;
}

/// A stream with rows of the test's own, the count in front.
std::string withRows(const std::string& version, const std::string& rows, const std::string& rest)
{
    return version + Choices + Markers + rows + Snippets + rest;
}

std::vector<std::uint8_t> written(const Settings& settings)
{
    ByteArchive archive;
    archive << settings;
    return bytesOf(archive);
}

} // namespace

TEST(Settings, BeginsWithTheDefaultsAndThreeDisabledRows)
{
    const Settings settings;

    expectDefaultOptions(settings);
    EXPECT_EQ(settings.vfxPatterns(), EmptyRows);
    EXPECT_FALSE(settings.vfxPattern(0).enabled);
}

TEST(Settings, StoresWhatTheSettersAreGiven)
{
    const Settings settings = unusualSettings();

    expectUnusualOptions(settings);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
}

TEST(Settings, TakesAnyNumberForAChoice)
{
    Settings settings;

    settings.setMatchBy(-7);
    settings.setHealMode(99);
    settings.setApplyTo(5);
    settings.setRemainsThreshold(-1);

    EXPECT_EQ(settings.matchBy(), -7);
    EXPECT_EQ(settings.healMode(), 99);
    EXPECT_EQ(settings.applyTo(), 5);
    EXPECT_EQ(settings.remainsThreshold(), -1);
}

TEST(Settings, TellsItsListenersOfEachChange)
{
    const std::vector<Change> changes = {
        [](Settings& settings) { settings.setMatchBy(1); },
        [](Settings& settings) { settings.setHealMode(2); },
        [](Settings& settings) { settings.setApplyTo(1); },
        [](Settings& settings) { settings.setCreateDestinationMarkers(false); },
        [](Settings& settings) { settings.setCreateDissolveWipeMarkers(false); },
        [](Settings& settings) { settings.setCreateInsertMarkers(false); },
        [](Settings& settings) { settings.setCreateAudioSnippetMarkers(false); },
        [](Settings& settings) { settings.setRemainsThreshold(1); },
        [](Settings& settings) { settings.setCreateAutomationWarningMarkers(false); },
        [](Settings& settings) { settings.setCreateOverlapMarkers(false); },
        [](Settings& settings) { settings.setBRollRenaming(false); },
        [](Settings& settings) { settings.setRestrictRange(true); },
        [](Settings& settings) { settings.setPreserveMaterial(1.0, 2.0); },
        // A value that is there already is told, too.
        [](Settings& settings) { settings.setMatchBy(0); },
        [](Settings& settings) { settings.setBRollRenaming(true); },
    };
    for (std::size_t index = 0; index < changes.size(); ++index) {
        Settings settings;
        RecordingListener listener;
        settings.addListener(&listener);

        changes[index](settings);

        EXPECT_EQ(listener.types, Types{ChangeContext::SettingsChanged}) << "change " << index;
    }
}

TEST(Settings, KeepsQuietAboutWhatOnlyItsDialogWrites)
{
    Settings settings;
    RecordingListener listener;
    settings.addListener(&listener);

    settings.setSnippetUsesPercentage(false);
    settings.setSnippetMaxPercentage(1.0);
    settings.setIncludeOverhangingAudioEvents(true);
    settings.setSnippetThreshold(1);
    settings.setCreateVirginTerritories(true);
    settings.setVfxPattern(VfxPatternEntry("VFX_", "", true), 0);

    EXPECT_EQ(listener.types, Types());
}

TEST(Settings, TellsOfTheRestrictionOnlyWhenItChanges)
{
    Settings settings;
    RecordingListener listener;
    settings.addListener(&listener);

    settings.setRestrictRange(false);
    EXPECT_EQ(listener.types.size(), 0U);

    settings.setRestrictRange(true);
    EXPECT_EQ(listener.types.size(), 1U);

    settings.setRestrictRange(true);
    EXPECT_EQ(listener.types.size(), 1U);
    EXPECT_TRUE(settings.restrictRange());

    settings.setRestrictRange(false);
    EXPECT_EQ(listener.types.size(), 2U);
}

TEST(Settings, StoresNoPreservedMaterialThatEndsBeforeItBegins)
{
    Settings settings;
    settings.setPreserveMaterial(2.0, 3.0);
    RecordingListener listener;
    settings.addListener(&listener);

    settings.setPreserveMaterial(5.0, 1.0);

    EXPECT_EQ(settings.preserveMaterialBefore(), 2.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 3.0);
    EXPECT_EQ(listener.types, Types{ChangeContext::SettingsChanged});
}

TEST(Settings, StoresPreservedMaterialOfNoLengthAndBeforeZero)
{
    Settings settings;

    settings.setPreserveMaterial(3.0, 3.0);
    EXPECT_EQ(settings.preserveMaterialBefore(), 3.0);

    settings.setPreserveMaterial(-4.0, -3.0);
    EXPECT_EQ(settings.preserveMaterialBefore(), -4.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), -3.0);
}

TEST(Settings, StoresNoPreservedMaterialThatIsNoNumber)
{
    Settings settings;

    settings.setPreserveMaterial(std::numeric_limits<double>::quiet_NaN(), 1.0);

    EXPECT_EQ(settings.preserveMaterialBefore(), 0.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 0.0);
}

TEST(Settings, HasNoFourthRow)
{
    Settings settings;

    EXPECT_EQ(thrownBy([&] { settings.vfxPattern(3); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { settings.setVfxPattern(VfxPatternEntry("A", "", true), 3); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { settings.vfxPattern(static_cast<std::size_t>(-1)); }), Result::InvalidArgument);
    EXPECT_EQ(settings.vfxPatterns(), EmptyRows);
}

TEST(Settings, GivesARowByItsIndex)
{
    Settings settings;

    settings.setVfxPattern(VfxPatternEntry("VFX_", "_v", true), 2);

    EXPECT_EQ(settings.vfxPattern(2).prefix, "VFX_");
    EXPECT_EQ(settings.vfxPattern(2).postfix, "_v");
    EXPECT_TRUE(settings.vfxPattern(2).enabled);
    EXPECT_EQ(settings.vfxPattern(1), VfxPatternEntry());
}

TEST(VfxPatternEntry, EqualsOneWithTheSameTextsAndCheckBox)
{
    const VfxPatternEntry entry("VFX_", "_v", true);

    EXPECT_EQ(entry, VfxPatternEntry("VFX_", "_v", true));
    EXPECT_FALSE(entry == VfxPatternEntry("VFX-", "_v", true));
    EXPECT_FALSE(entry == VfxPatternEntry("VFX_", "-v", true));
    EXPECT_FALSE(entry == VfxPatternEntry("VFX_", "_v", false));
}

TEST(Settings, GoesBackToTheDefaultsButKeepsTheRows)
{
    Settings settings = unusualSettings();
    RecordingListener listener;
    settings.addListener(&listener);

    settings.reset();

    expectDefaultOptions(settings);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
    EXPECT_EQ(listener.types, Types());
}

TEST(Settings, KeepsItsListenersThroughAReset)
{
    Settings settings;
    RecordingListener listener;
    settings.addListener(&listener);

    settings.reset();
    settings.setMatchBy(1);

    EXPECT_EQ(listener.types.size(), 1U);
}

TEST(Settings, BringsTheRowsToThreeInAReset)
{
    const std::string five = "05000000 00000000 " + RowVfx + "00000000 " + RowEmpty + "00000000 " + RowCg +
                             "00000000 " + RowVfx + "00000000 " + RowVfx;
    Settings tooMany = readFrom(withRows("04000000 ", five, BRollAndRemains + Virgin + Range));
    Settings tooFew = readFrom(withRows("04000000 ", "01000000 00000000 " + RowVfx, BRollAndRemains + Virgin + Range));

    tooMany.reset();
    tooFew.reset();

    EXPECT_EQ(tooMany.vfxPatterns(), UnusualRows);
    EXPECT_EQ(tooFew.vfxPatterns(), (std::vector<VfxPatternEntry>{VfxPatternEntry("VFX_", "_v", true),
                                                                  VfxPatternEntry(), VfxPatternEntry()}));
}

TEST(Settings, SetsAnOptionByItsPlaceAsItsSetterDoes)
{
    Settings settings;
    RecordingListener listener;
    settings.addListener(&listener);

    settings.set(&Settings::matchBy, 1);
    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(listener.types, Types{ChangeContext::SettingsChanged});

    settings.set(&Settings::restrictRange, false);
    settings.set(&Settings::createVirginTerritories, true);
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_EQ(listener.types.size(), 1U);

    settings.set(&Settings::restrictRange, true);
    EXPECT_EQ(listener.types.size(), 2U);
}

TEST(Settings, KnowsTheUsualValueOfAnOption)
{
    Settings settings;
    EXPECT_TRUE(settings.snippetThreshold.isUsual());

    settings.setSnippetThreshold(6);
    EXPECT_FALSE(settings.snippetThreshold.isUsual());
    EXPECT_EQ(settings.snippetThreshold.usual(), 5);

    settings.setSnippetThreshold(5);
    EXPECT_TRUE(settings.snippetThreshold.isUsual());
}

TEST(Settings, CopiesWithoutListeners)
{
    Settings settings = unusualSettings();
    RecordingListener listener;
    settings.addListener(&listener);

    Settings copy = settings;
    copy.setMatchBy(0);

    EXPECT_EQ(listener.types, Types());
    EXPECT_EQ(copy.healMode(), 3);
    EXPECT_EQ(copy.vfxPatterns(), UnusualRows);
}

TEST(Settings, IsAssignedAllOptionsInSilence)
{
    Settings settings;
    RecordingListener listener;
    settings.addListener(&listener);

    settings = unusualSettings();

    expectUnusualOptions(settings);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
    EXPECT_EQ(listener.types, Types());

    settings.setMatchBy(0);
    EXPECT_EQ(listener.types.size(), 1U);
}

TEST(Settings, WritesTheDefaults)
{
    const std::string row = "00000000 00000000 00000000 00 ";

    EXPECT_EQ(written(Settings()), bytesOf("04000000"
                                           "00000000 01000000 00000000"
                                           "01 01 01 01 01 01"
                                           "03000000" +
                                           row + row + row +
                                           "01 0000000000004940 00 05000000"
                                           "01 05000000"
                                           "00"
                                           "00 0000000000000000 0000000000000000"));
}

TEST(Settings, WritesEveryOption)
{
    EXPECT_EQ(written(unusualSettings()), bytesOf(std::string_view(Version4)));
}

// One bool turned over at a time shows that none has changed places with another.
TEST(Settings, WritesEachBoolAtItsPlace)
{
    const std::vector<std::pair<Change, std::size_t>> places = {
        {[](Settings& settings) { settings.setCreateDestinationMarkers(true); }, 16},
        {[](Settings& settings) { settings.setCreateDissolveWipeMarkers(true); }, 17},
        {[](Settings& settings) { settings.setCreateInsertMarkers(true); }, 18},
        {[](Settings& settings) { settings.setCreateAudioSnippetMarkers(true); }, 19},
        {[](Settings& settings) { settings.setCreateAutomationWarningMarkers(true); }, 20},
        {[](Settings& settings) { settings.setCreateOverlapMarkers(true); }, 21},
        // The rows take 4 + 19 + 13 + 15 bytes from byte 22.
        {[](Settings& settings) { settings.setSnippetUsesPercentage(true); }, 73},
        {[](Settings& settings) { settings.setIncludeOverhangingAudioEvents(false); }, 82},
        {[](Settings& settings) { settings.setBRollRenaming(true); }, 87},
        {[](Settings& settings) { settings.setCreateVirginTerritories(false); }, 92},
        {[](Settings& settings) { settings.setRestrictRange(false); }, 93},
    };
    for (const auto& [change, place] : places) {
        Settings settings = unusualSettings();
        change(settings);
        std::vector<std::uint8_t> expected = bytesOf(std::string_view(Version4));
        expected[place] = expected[place] == 0 ? 1 : 0;

        EXPECT_EQ(written(settings), expected) << "byte " << place;

        ByteArchive archive = archiveOf(expected);
        Settings readBack;
        archive >> readBack;
        EXPECT_EQ(written(readBack), expected) << "byte " << place;
    }
}

TEST(Settings, ReadsVersion4)
{
    const Settings settings = readFrom(Version4);

    expectUnusualOptions(settings);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
}

TEST(Settings, ReadsVersion4WithAnyNumberOfRows)
{
    const std::string rest = BRollAndRemains + Virgin + Range;
    const std::string row = "00000000 " + RowVfx;

    EXPECT_EQ(readFrom(withRows("04000000 ", "04000000 " + row + row + row + row, rest)).vfxPatterns(),
              std::vector<VfxPatternEntry>(4, VfxPatternEntry("VFX_", "_v", true)));
    EXPECT_EQ(readFrom(withRows("04000000 ", "01000000 " + row, rest)).vfxPatterns().size(), 1U);
    EXPECT_EQ(readFrom(withRows("04000000 ", "00000000 ", rest)).vfxPatterns().size(), 0U);
    EXPECT_EQ(readFrom(withRows("04000000 ", "FFFFFFFF ", rest)).vfxPatterns().size(), 0U);
    EXPECT_EQ(readFrom(withRows("04000000 ", "00000080 ", rest)).vfxPatterns().size(), 0U);
}

TEST(Settings, ReadsVersion3WithoutARestriction)
{
    Settings settings = unusualSettings();

    read(settings, Version3);

    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(settings.snippetThreshold(), 9);
    EXPECT_FALSE(settings.bRollRenaming());
    EXPECT_EQ(settings.remainsThreshold(), 7);
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_FALSE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), 0.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 0.0);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
}

TEST(Settings, ReadsTheVirginTerritoriesOfVersion3)
{
    const Settings settings = readFrom("03000000 " + Choices + Markers + Rows + Snippets + BRollAndRemains + "00");

    EXPECT_FALSE(settings.createVirginTerritories());
}

TEST(Settings, ReadsVersion2WithVirginTerritories)
{
    Settings settings = unusualSettings();
    settings.setCreateVirginTerritories(false);

    read(settings, Version2);

    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(settings.snippetThreshold(), 9);
    EXPECT_FALSE(settings.bRollRenaming());
    EXPECT_EQ(settings.remainsThreshold(), 7);
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_FALSE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), 0.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 0.0);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
}

TEST(Settings, ReadsVersion1WithVirginTerritoriesAndBRollRenaming)
{
    Settings settings = unusualSettings();
    settings.setCreateVirginTerritories(false);

    read(settings, Version1);

    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(settings.healMode(), 3);
    EXPECT_EQ(settings.applyTo(), 1);
    EXPECT_FALSE(settings.createDestinationMarkers());
    EXPECT_FALSE(settings.createOverlapMarkers());
    EXPECT_FALSE(settings.snippetUsesPercentage());
    EXPECT_EQ(settings.snippetMaxPercentage(), 12.5);
    EXPECT_TRUE(settings.includeOverhangingAudioEvents());
    EXPECT_EQ(settings.snippetThreshold(), 9);
    EXPECT_TRUE(settings.bRollRenaming());
    EXPECT_EQ(settings.remainsThreshold(), 5);
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_FALSE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), 0.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 0.0);
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
}

TEST(Settings, ReadsVersions1To3WithExactlyThreeRows)
{
    const std::string row = "00000000 " + RowVfx;
    const VfxPatternEntry vfx("VFX_", "_v", true);
    const std::vector<std::pair<std::string, std::string>> versions = {
        {"01000000 ", ""}, {"02000000 ", BRollAndRemains}, {"03000000 ", BRollAndRemains + Virgin}};
    for (const auto& [version, rest] : versions) {
        const Settings four = readFrom(withRows(version, "04000000 " + row + row + row + row, rest));
        const Settings one = readFrom(withRows(version, "01000000 " + row, rest));
        const Settings none = readFrom(withRows(version, "FFFFFFFF ", rest));

        EXPECT_EQ(four.vfxPatterns(), std::vector<VfxPatternEntry>(3, vfx)) << version;
        EXPECT_EQ(one.vfxPatterns(), (std::vector<VfxPatternEntry>{vfx, VfxPatternEntry(), VfxPatternEntry()}))
            << version;
        EXPECT_EQ(none.vfxPatterns(), EmptyRows) << version;
    }
}

TEST(Settings, ReadsVersion0IntoTheRowsThatAreThere)
{
    Settings settings;

    read(settings, "00000000 01000000 03000000 00 00 00 " + RowVfx + RowEmpty + RowCg + Snippets);

    EXPECT_EQ(settings.matchBy(), 1);
    EXPECT_EQ(settings.healMode(), 3);
    EXPECT_FALSE(settings.createDestinationMarkers());
    EXPECT_FALSE(settings.createDissolveWipeMarkers());
    EXPECT_FALSE(settings.createInsertMarkers());
    EXPECT_EQ(settings.vfxPatterns(), UnusualRows);
    EXPECT_FALSE(settings.snippetUsesPercentage());
    EXPECT_EQ(settings.snippetMaxPercentage(), 12.5);
    EXPECT_TRUE(settings.includeOverhangingAudioEvents());
    EXPECT_EQ(settings.snippetThreshold(), 9);
}

TEST(Settings, KeepsEveryOptionThatVersion0DoesNotHold)
{
    Settings settings = unusualSettings();

    read(settings,
         "00000000 00000000 01000000 01 01 01 " + RowEmpty + RowEmpty + RowEmpty + "01 0000000000004940 00 05000000");

    EXPECT_EQ(settings.applyTo(), 1);
    EXPECT_FALSE(settings.createAudioSnippetMarkers());
    EXPECT_EQ(settings.remainsThreshold(), 7);
    EXPECT_FALSE(settings.createAutomationWarningMarkers());
    EXPECT_FALSE(settings.createOverlapMarkers());
    EXPECT_FALSE(settings.bRollRenaming());
    EXPECT_TRUE(settings.createVirginTerritories());
    EXPECT_TRUE(settings.restrictRange());
    EXPECT_EQ(settings.preserveMaterialBefore(), -2.0);
    EXPECT_EQ(settings.preserveMaterialAfter(), 4.0);

    EXPECT_EQ(settings.matchBy(), 0);
    EXPECT_EQ(settings.healMode(), 1);
    EXPECT_TRUE(settings.createDestinationMarkers());
    EXPECT_TRUE(settings.createDissolveWipeMarkers());
    EXPECT_TRUE(settings.createInsertMarkers());
    EXPECT_EQ(settings.vfxPatterns(), EmptyRows);
    EXPECT_TRUE(settings.snippetUsesPercentage());
    EXPECT_EQ(settings.snippetMaxPercentage(), 50.0);
    EXPECT_FALSE(settings.includeOverhangingAudioEvents());
    EXPECT_EQ(settings.snippetThreshold(), 5);
}

TEST(Settings, KeepsAnOddNumberThatVersion0DoesNotHold)
{
    Settings settings;
    settings.setApplyTo(7);

    read(settings, "00000000 01000000 03000000 00 00 00 " + RowVfx + RowEmpty + RowCg + Snippets);

    EXPECT_EQ(settings.applyTo(), 7);
}

TEST(Settings, ReadsAsManyRowsOfVersion0AsItHasAndThenHasThree)
{
    const std::string rest = BRollAndRemains + Virgin + Range;
    const std::string start = "00000000 01000000 03000000 00 00 00 ";
    Settings one = readFrom(withRows("04000000 ", "01000000 00000000 " + RowEmpty, rest));
    Settings four = readFrom(withRows("04000000 ",
                                      "04000000 00000000 " + RowEmpty + "00000000 " + RowEmpty + "00000000 " +
                                          RowEmpty + "00000000 " + RowEmpty,
                                      rest));

    read(one, start + RowVfx + Snippets);
    read(four, start + RowVfx + RowEmpty + RowCg + RowVfx + Snippets);

    EXPECT_EQ(one.vfxPatterns(), (std::vector<VfxPatternEntry>{VfxPatternEntry("VFX_", "_v", true), VfxPatternEntry(),
                                                               VfxPatternEntry()}));
    EXPECT_EQ(four.vfxPatterns(), UnusualRows);
}

TEST(Settings, ReadsTheChoicesWithinTheirBounds)
{
    const std::vector<std::pair<std::string, std::int32_t>> matchBys = {
        {"00000000", 0}, {"01000000", 1}, {"07000000", 1}, {"FFFFFFFF", 1}};
    for (const auto& [bytes, value] : matchBys)
        EXPECT_EQ(readFrom(withChoices(bytes, "00000000", "00000000")).matchBy(), value) << bytes;

    const std::vector<std::pair<std::string, std::int32_t>> healModes = {
        {"00000000", 0}, {"03000000", 3}, {"04000000", 4}, {"05000000", 0}, {"FFFFFFFF", 0}};
    for (const auto& [bytes, value] : healModes)
        EXPECT_EQ(readFrom(withChoices("00000000", bytes, "00000000")).healMode(), value) << bytes;

    const std::vector<std::pair<std::string, std::int32_t>> applyTos = {
        {"00000000", 0}, {"01000000", 1}, {"02000000", 0}, {"FFFFFFFF", 0}};
    for (const auto& [bytes, value] : applyTos)
        EXPECT_EQ(readFrom(withChoices("00000000", "00000000", bytes)).applyTo(), value) << bytes;
}

TEST(Settings, ReadsTheChoicesOfVersion0WithinTheirBounds)
{
    const std::string rest = "01 01 01 " + RowEmpty + RowEmpty + RowEmpty + Snippets;

    EXPECT_EQ(readFrom("00000000 07000000 05000000 " + rest).matchBy(), 1);
    EXPECT_EQ(readFrom("00000000 07000000 05000000 " + rest).healMode(), 0);
    EXPECT_EQ(readFrom("00000000 00000000 04000000 " + rest).healMode(), 4);
}

TEST(Settings, TellsItsListenersOnceThatItWasRead)
{
    const std::string version0 = "00000000 01000000 03000000 00 00 00 " + RowVfx + RowEmpty + RowCg + Snippets;
    for (const std::string& stream : {version0, Version1, Version2, Version3, Version4}) {
        Settings settings;
        RecordingListener listener;
        settings.addListener(&listener);

        read(settings, stream);

        EXPECT_EQ(listener.types, Types{ChangeContext::SettingsChanged}) << stream;
    }
}

TEST(Settings, FailsWhereverItsBytesEnd)
{
    const std::string version0 = "00000000 01000000 03000000 00 00 00 " + RowVfx + RowEmpty + RowCg + Snippets;
    for (const std::string& stream : {version0, Version1, Version2, Version3, Version4}) {
        std::vector<std::uint8_t> bytes = bytesOf(std::string_view(stream));
        while (!bytes.empty()) {
            bytes.pop_back();
            ByteArchive archive = archiveOf(bytes);
            Settings settings;
            RecordingListener listener;
            settings.addListener(&listener);

            EXPECT_EQ(thrownBy([&] { archive >> settings; }), Result::EndOfData) << bytes.size() << " of " << stream;
            EXPECT_EQ(listener.types, Types());
        }
    }
}

TEST(Settings, TrustsNoCountOfRows)
{
    EXPECT_EQ(thrownBy([&] { readFrom("04000000 " + Choices + Markers + "FFFFFF7F 00000000 " + RowVfx); }),
              Result::EndOfData);
}

TEST(Settings, RefusesANewerVersion)
{
    EXPECT_EQ(thrownBy([] { readFrom("05000000 " + Choices); }), Result::NewerVersion);
}

TEST(Settings, RefusesANewerVersionOfARow)
{
    const std::string newer = "01000000 01000000 " + RowVfx;

    EXPECT_EQ(thrownBy([&] { readFrom(withRows("04000000 ", newer, BRollAndRemains + Virgin + Range)); }),
              Result::NewerVersion);
}

TEST(Settings, KnowsNoOlderVersionThan0To3)
{
    ByteArchive archive = archiveOf(std::string_view(Version4));
    Settings settings;

    EXPECT_EQ(thrownBy([&] { settings.readOlder(archive, 4); }), Result::UnknownVersion);
}

TEST(VfxPatternEntry, WritesItsTextsAndItsCheckBox)
{
    ByteArchive archive;

    archive << VfxPatternEntry("VFX_", "_v", true);

    EXPECT_EQ(bytesOf(archive), bytesOf("00000000 04000000 5646585F 02000000 5F76 01"));
}

TEST(VfxPatternEntry, HasNoOlderVersion)
{
    ByteArchive archive = archiveOf(std::string_view(RowVfx));
    VfxPatternEntry entry;

    EXPECT_EQ(thrownBy([&] { entry.readOlder(archive, 0); }), Result::NotSupported);
}
