#pragma once

#include "core/ChangeContextNotificationBase.h"
#include "core/MatchBy.h"
#include "core/VfxPatternEntry.h"
#include "core/serialize/Serializable.h"

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

    std::int32_t matchBy() const { return matchBy_; }
    std::int32_t healMode() const { return healMode_; }
    std::int32_t applyTo() const { return applyTo_; }
    bool createDestinationMarkers() const { return createDestinationMarkers_; }
    bool createDissolveWipeMarkers() const { return createDissolveWipeMarkers_; }
    bool createInsertMarkers() const { return createInsertMarkers_; }
    bool createAudioSnippetMarkers() const { return createAudioSnippetMarkers_; }
    /// In frames.
    std::int32_t remainsThreshold() const { return remainsThreshold_; }
    bool createAutomationWarningMarkers() const { return createAutomationWarningMarkers_; }
    bool createOverlapMarkers() const { return createOverlapMarkers_; }
    const std::vector<VfxPatternEntry>& vfxPatterns() const { return vfxPatterns_; }
    /// Throws Result::InvalidArgument for an index at or beyond the number of rows.
    const VfxPatternEntry& vfxPattern(std::size_t index) const;
    bool snippetUsesPercentage() const { return snippetUsesPercentage_; }
    /// Percent of a clip.
    double snippetMaxPercentage() const { return snippetMaxPercentage_; }
    bool includeOverhangingAudioEvents() const { return includeOverhangingAudioEvents_; }
    /// In frames.
    std::int32_t snippetThreshold() const { return snippetThreshold_; }
    bool bRollRenaming() const { return bRollRenaming_; }
    bool createVirginTerritories() const { return createVirginTerritories_; }
    bool restrictRange() const { return restrictRange_; }
    /// In seconds, signed.
    double preserveMaterialBefore() const { return preserveMaterialBefore_; }
    double preserveMaterialAfter() const { return preserveMaterialAfter_; }

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

    std::int32_t matchBy_ = MatchBy::RollName;
    std::int32_t healMode_ = HealMode::Normal;
    std::int32_t applyTo_ = ApplyTo::AllTracks;
    bool createDestinationMarkers_ = true;
    bool createDissolveWipeMarkers_ = true;
    bool createInsertMarkers_ = true;
    bool createAudioSnippetMarkers_ = true;
    std::int32_t remainsThreshold_ = 5;
    bool createAutomationWarningMarkers_ = true;
    bool createOverlapMarkers_ = true;
    std::vector<VfxPatternEntry> vfxPatterns_ = std::vector<VfxPatternEntry>(VfxRowCount);
    bool snippetUsesPercentage_ = true;
    double snippetMaxPercentage_ = 50.0;
    bool includeOverhangingAudioEvents_ = false;
    std::int32_t snippetThreshold_ = 5;
    bool bRollRenaming_ = true;
    bool createVirginTerritories_ = false;
    bool restrictRange_ = false;
    double preserveMaterialBefore_ = 0.0;
    double preserveMaterialAfter_ = 0.0;
};

} // namespace cadrel::core
