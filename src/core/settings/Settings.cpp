// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Settings.h"

#include "core/notify/ChangeContext.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 4;

std::int32_t readMatchBy(ByteArchive& archive)
{
    std::int32_t value = 0;
    archive >> value;
    return value == 0 ? MatchBy::RollName : MatchBy::ClipName;
}

std::int32_t readHealMode(ByteArchive& archive)
{
    // A mode after the last one that is offered now is accepted too.
    constexpr std::int32_t LastAccepted = 4;
    std::int32_t value = 0;
    archive >> value;
    return value < HealMode::None || value > LastAccepted ? HealMode::None : value;
}

std::int32_t readApplyTo(ByteArchive& archive)
{
    std::int32_t value = 0;
    archive >> value;
    return value == ApplyTo::SelectedTracks ? ApplyTo::SelectedTracks : ApplyTo::AllTracks;
}

} // namespace

Settings::Settings() : Serializable(PersistenceVersion) {}

const VfxPatternEntry& Settings::vfxPattern(std::size_t index) const
{
    if (index >= m_vfxPatterns.size())
        throw Result::InvalidArgument;
    return m_vfxPatterns[index];
}

void Settings::setMatchBy(std::int32_t value)
{
    m_matchBy = value;
    notifyListeners();
}

void Settings::setHealMode(std::int32_t value)
{
    m_healMode = value;
    notifyListeners();
}

void Settings::setApplyTo(std::int32_t value)
{
    m_applyTo = value;
    notifyListeners();
}

void Settings::setCreateDestinationMarkers(bool flag)
{
    m_createDestinationMarkers = flag;
    notifyListeners();
}

void Settings::setCreateDissolveWipeMarkers(bool flag)
{
    m_createDissolveWipeMarkers = flag;
    notifyListeners();
}

void Settings::setCreateInsertMarkers(bool flag)
{
    m_createInsertMarkers = flag;
    notifyListeners();
}

void Settings::setCreateAudioSnippetMarkers(bool flag)
{
    m_createAudioSnippetMarkers = flag;
    notifyListeners();
}

void Settings::setRemainsThreshold(std::int32_t frames)
{
    m_remainsThreshold = frames;
    notifyListeners();
}

void Settings::setCreateAutomationWarningMarkers(bool flag)
{
    m_createAutomationWarningMarkers = flag;
    notifyListeners();
}

void Settings::setCreateOverlapMarkers(bool flag)
{
    m_createOverlapMarkers = flag;
    notifyListeners();
}

void Settings::setBRollRenaming(bool flag)
{
    m_bRollRenaming = flag;
    notifyListeners();
}

void Settings::setRestrictRange(bool flag)
{
    if (flag == m_restrictRange)
        return;
    m_restrictRange = flag;
    notifyListeners();
}

void Settings::setPreserveMaterial(double before, double after)
{
    if (after >= before) {
        m_preserveMaterialBefore = before;
        m_preserveMaterialAfter = after;
    }
    // Notifies also for refused values, so that a dialog that shows them goes back to the stored ones.
    notifyListeners();
}

void Settings::setVfxPattern(const VfxPatternEntry& entry, std::size_t index)
{
    if (index >= m_vfxPatterns.size())
        throw Result::InvalidArgument;
    m_vfxPatterns[index] = entry;
}

void Settings::setSnippetUsesPercentage(bool flag)
{
    m_snippetUsesPercentage = flag;
}

void Settings::setSnippetMaxPercentage(double percent)
{
    m_snippetMaxPercentage = percent;
}

void Settings::setIncludeOverhangingAudioEvents(bool flag)
{
    m_includeOverhangingAudioEvents = flag;
}

void Settings::setSnippetThreshold(std::int32_t frames)
{
    m_snippetThreshold = frames;
}

void Settings::setCreateVirginTerritories(bool flag)
{
    m_createVirginTerritories = flag;
}

void Settings::reset()
{
    Settings defaults;
    defaults.m_vfxPatterns = m_vfxPatterns;
    defaults.m_vfxPatterns.resize(VfxRowCount);
    *this = defaults;
}

void Settings::readCurrent(ByteArchive& archive)
{
    readOptions(archive, PersistenceVersion);
    notifyListeners();
}

void Settings::write(ByteArchive& archive) const
{
    archive << m_matchBy << m_healMode << m_applyTo;
    archive << m_createDestinationMarkers << m_createDissolveWipeMarkers << m_createInsertMarkers
            << m_createAudioSnippetMarkers;
    archive << m_createAutomationWarningMarkers << m_createOverlapMarkers;
    archive.writeCount(m_vfxPatterns.size());
    for (const VfxPatternEntry& row : m_vfxPatterns)
        archive << row;
    archive << m_snippetUsesPercentage << m_snippetMaxPercentage << m_includeOverhangingAudioEvents
            << m_snippetThreshold;
    archive << m_bRollRenaming << m_remainsThreshold;
    archive << m_createVirginTerritories;
    archive << m_restrictRange << m_preserveMaterialBefore << m_preserveMaterialAfter;
}

void Settings::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version >= PersistenceVersion)
        throw Result::UnknownVersion;
    if (version == 0)
        readFirstVersion(archive);
    else
        readOptions(archive, version);
    m_vfxPatterns.resize(VfxRowCount);
    notifyListeners();
}

void Settings::notifyListeners()
{
    notify(ChangeContext(ChangeContext::SettingsChanged));
}

void Settings::readOptions(ByteArchive& archive, std::uint32_t version)
{
    m_matchBy = readMatchBy(archive);
    m_healMode = readHealMode(archive);
    m_applyTo = readApplyTo(archive);
    archive >> m_createDestinationMarkers >> m_createDissolveWipeMarkers >> m_createInsertMarkers >>
        m_createAudioSnippetMarkers;
    archive >> m_createAutomationWarningMarkers >> m_createOverlapMarkers;
    readVfxPatterns(archive);
    readSnippetOptions(archive);

    // An option that an older version doesn't have gets the value with which its projects were processed: virgin
    // territories were always created then.
    m_bRollRenaming = true;
    m_remainsThreshold = 5;
    m_createVirginTerritories = true;
    m_restrictRange = false;
    m_preserveMaterialBefore = 0.0;
    m_preserveMaterialAfter = 0.0;
    if (version >= 2)
        archive >> m_bRollRenaming >> m_remainsThreshold;
    if (version >= 3)
        archive >> m_createVirginTerritories;
    if (version >= 4)
        archive >> m_restrictRange >> m_preserveMaterialBefore >> m_preserveMaterialAfter;
}

void Settings::readFirstVersion(ByteArchive& archive)
{
    m_matchBy = readMatchBy(archive);
    m_healMode = readHealMode(archive);
    archive >> m_createDestinationMarkers >> m_createDissolveWipeMarkers >> m_createInsertMarkers;
    // The stream has neither a count nor frames: it has as many rows as the object.
    for (VfxPatternEntry& row : m_vfxPatterns)
        row.readCurrent(archive);
    readSnippetOptions(archive);
}

void Settings::readVfxPatterns(ByteArchive& archive)
{
    m_vfxPatterns.clear();
    for (std::size_t left = archive.readCount(); left > 0; --left)
        archive >> m_vfxPatterns.emplace_back();
}

void Settings::readSnippetOptions(ByteArchive& archive)
{
    archive >> m_snippetUsesPercentage >> m_snippetMaxPercentage >> m_includeOverhangingAudioEvents >>
        m_snippetThreshold;
}

} // namespace cadrel::core
