// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextNotificationBase.h"
#include "core/serialize/Serializable.h"
#include "core/settings/MatchBy.h"
#include "core/settings/VfxPatternEntry.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace cadrel::core {

struct HealMode {
    enum Type : std::int32_t { None = 0, Normal = 1, GapsWithoutInserts = 2, GapsWithInserts = 3 };
};

struct ApplyTo {
    enum Type : std::int32_t { AllTracks = 0, SelectedTracks = 1 };
};

/// Every option of the system. A setter stores and then sends a plain ChangeContext of type SettingsChanged; setters
/// for which this doesn't hold say so.
class Settings : public serialize::Serializable, public ChangeContextNotificationBase {
public:
    static constexpr std::size_t VfxRowCount = 3;

    Settings();
    /// A copy has no listeners.
    Settings(const Settings&) = default;
    /// Copies the options, keeps the listeners and sends nothing.
    Settings& operator=(const Settings&) = default;
    ~Settings() override = default;

    std::int32_t matchBy() const { return m_matchBy; }
    std::int32_t healMode() const { return m_healMode; }
    std::int32_t applyTo() const { return m_applyTo; }
    bool createDestinationMarkers() const { return m_createDestinationMarkers; }
    bool createDissolveWipeMarkers() const { return m_createDissolveWipeMarkers; }
    bool createInsertMarkers() const { return m_createInsertMarkers; }
    bool createAudioSnippetMarkers() const { return m_createAudioSnippetMarkers; }
    /// In frames.
    std::int32_t remainsThreshold() const { return m_remainsThreshold; }
    bool createAutomationWarningMarkers() const { return m_createAutomationWarningMarkers; }
    bool createOverlapMarkers() const { return m_createOverlapMarkers; }
    const std::vector<VfxPatternEntry>& vfxPatterns() const { return m_vfxPatterns; }
    /// Throws Result::InvalidArgument for an index at or beyond the number of rows.
    const VfxPatternEntry& vfxPattern(std::size_t index) const;
    bool snippetUsesPercentage() const { return m_snippetUsesPercentage; }
    /// Percent of a clip.
    double snippetMaxPercentage() const { return m_snippetMaxPercentage; }
    bool includeOverhangingAudioEvents() const { return m_includeOverhangingAudioEvents; }
    /// In frames.
    std::int32_t snippetThreshold() const { return m_snippetThreshold; }
    bool bRollRenaming() const { return m_bRollRenaming; }
    bool createVirginTerritories() const { return m_createVirginTerritories; }
    bool restrictRange() const { return m_restrictRange; }
    /// In seconds, signed.
    double preserveMaterialBefore() const { return m_preserveMaterialBefore; }
    double preserveMaterialAfter() const { return m_preserveMaterialAfter; }

    void setMatchBy(std::int32_t value);
    void setHealMode(std::int32_t value);
    void setApplyTo(std::int32_t value);
    void setCreateDestinationMarkers(bool flag);
    void setCreateDissolveWipeMarkers(bool flag);
    void setCreateInsertMarkers(bool flag);
    void setCreateAudioSnippetMarkers(bool flag);
    void setRemainsThreshold(std::int32_t frames);
    void setCreateAutomationWarningMarkers(bool flag);
    void setCreateOverlapMarkers(bool flag);
    void setBRollRenaming(bool flag);
    /// Notifies only when the value changes.
    void setRestrictRange(bool flag);
    /// Stores both only when `after` >= `before`; notifies in any case.
    void setPreserveMaterial(double before, double after);

    /// These send nothing. setVfxPattern throws Result::InvalidArgument as vfxPattern does.
    void setVfxPattern(const VfxPatternEntry& entry, std::size_t index);
    void setSnippetUsesPercentage(bool flag);
    void setSnippetMaxPercentage(double percent);
    void setIncludeOverhangingAudioEvents(bool flag);
    void setSnippetThreshold(std::int32_t frames);
    void setCreateVirginTerritories(bool flag);

    /// Back to the defaults, except that the pattern rows keep their content and are only brought to three. Sends
    /// nothing.
    void reset();

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    void notifyListeners();
    /// The body of version 1 or later.
    void readOptions(serialize::ByteArchive& archive, std::uint32_t version);
    /// The body of version 0.
    void readFirstVersion(serialize::ByteArchive& archive);
    void readVfxPatterns(serialize::ByteArchive& archive);
    void readSnippetOptions(serialize::ByteArchive& archive);

    std::int32_t m_matchBy = MatchBy::RollName;
    std::int32_t m_healMode = HealMode::Normal;
    std::int32_t m_applyTo = ApplyTo::AllTracks;
    bool m_createDestinationMarkers = true;
    bool m_createDissolveWipeMarkers = true;
    bool m_createInsertMarkers = true;
    bool m_createAudioSnippetMarkers = true;
    std::int32_t m_remainsThreshold = 5;
    bool m_createAutomationWarningMarkers = true;
    bool m_createOverlapMarkers = true;
    std::vector<VfxPatternEntry> m_vfxPatterns = std::vector<VfxPatternEntry>(VfxRowCount);
    bool m_snippetUsesPercentage = true;
    double m_snippetMaxPercentage = 50.0;
    bool m_includeOverhangingAudioEvents = false;
    std::int32_t m_snippetThreshold = 5;
    bool m_bRollRenaming = true;
    bool m_createVirginTerritories = false;
    bool m_restrictRange = false;
    double m_preserveMaterialBefore = 0.0;
    double m_preserveMaterialAfter = 0.0;
};

} // namespace cadrel::core
