// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextNotificationBase.h"
#include "core/serialize/Serializable.h"
#include "core/settings/MatchBy.h"
#include "core/settings/Option.h"
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

/// Every option of the system. A new one is a line in the table of options, a setter, and a line in
/// Settings::forEachStored, which gives its place in the stream.
///
/// A setter stores and then sends a plain ChangeContext of type SettingsChanged, as the table says: always, only when
/// the value changes, or never.
class Settings : public serialize::Serializable, public ChangeContextNotificationBase {
public:
    static constexpr std::size_t VfxRowCount = 3;

    Settings();
    /// A copy has no listeners.
    Settings(const Settings&) = default;
    /// Copies the options, keeps the listeners and sends nothing.
    Settings& operator=(const Settings&) = default;
    ~Settings() override = default;

    // The options, each with its value in new settings.
    Option<std::int32_t> matchBy{MatchBy::RollName};
    Option<std::int32_t> healMode{HealMode::Normal};
    Option<std::int32_t> applyTo{ApplyTo::AllTracks};
    Option<bool> createDestinationMarkers{true};
    Option<bool> createDissolveWipeMarkers{true};
    Option<bool> createInsertMarkers{true};
    Option<bool> createAudioSnippetMarkers{true};
    Option<std::int32_t> remainsThreshold{5}; ///< frames
    Option<bool> createAutomationWarningMarkers{true};
    Option<bool> createOverlapMarkers{true};
    Option<std::vector<VfxPatternEntry>> vfxPatterns{std::vector<VfxPatternEntry>(VfxRowCount), Notifies::Never};
    Option<bool> snippetUsesPercentage{true, Notifies::Never};
    Option<double> snippetMaxPercentage{50.0, Notifies::Never}; ///< percent of a clip
    Option<bool> includeOverhangingAudioEvents{false, Notifies::Never};
    Option<std::int32_t> snippetThreshold{5, Notifies::Never}; ///< frames
    Option<bool> bRollRenaming{true};
    Option<bool> createVirginTerritories{false, Notifies::Never};
    Option<bool> restrictRange{false, Notifies::OnChange};
    Option<double> preserveMaterialBefore{0.0}; ///< seconds, signed
    Option<double> preserveMaterialAfter{0.0};  ///< seconds, signed

    void setMatchBy(std::int32_t value) { set(matchBy, value); }
    void setHealMode(std::int32_t value) { set(healMode, value); }
    void setApplyTo(std::int32_t value) { set(applyTo, value); }
    void setCreateDestinationMarkers(bool flag) { set(createDestinationMarkers, flag); }
    void setCreateDissolveWipeMarkers(bool flag) { set(createDissolveWipeMarkers, flag); }
    void setCreateInsertMarkers(bool flag) { set(createInsertMarkers, flag); }
    void setCreateAudioSnippetMarkers(bool flag) { set(createAudioSnippetMarkers, flag); }
    void setRemainsThreshold(std::int32_t frames) { set(remainsThreshold, frames); }
    void setCreateAutomationWarningMarkers(bool flag) { set(createAutomationWarningMarkers, flag); }
    void setCreateOverlapMarkers(bool flag) { set(createOverlapMarkers, flag); }
    void setSnippetUsesPercentage(bool flag) { set(snippetUsesPercentage, flag); }
    void setSnippetMaxPercentage(double percent) { set(snippetMaxPercentage, percent); }
    void setIncludeOverhangingAudioEvents(bool flag) { set(includeOverhangingAudioEvents, flag); }
    void setSnippetThreshold(std::int32_t frames) { set(snippetThreshold, frames); }
    void setBRollRenaming(bool flag) { set(bRollRenaming, flag); }
    void setCreateVirginTerritories(bool flag) { set(createVirginTerritories, flag); }
    void setRestrictRange(bool flag) { set(restrictRange, flag); }
    /// Sets one of the options that have no rule of their own, as its setter does.
    template <typename T>
    void set(Option<T> Settings::*option, const T& value)
    {
        set(this->*option, value);
    }
    /// Stores both only when `after` >= `before`; notifies in any case.
    void setPreserveMaterial(double before, double after);

    /// Throw Result::InvalidArgument for an index at or beyond the number of rows. Setting a row sends nothing.
    const VfxPatternEntry& vfxPattern(std::size_t index) const;
    void setVfxPattern(const VfxPatternEntry& entry, std::size_t index);

    /// Back to the usual values, except that the pattern rows keep their content and are only brought to three. Sends
    /// nothing.
    void reset();

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    class Reader;
    class Writer;

    template <typename T>
    void set(Option<T>& option, const T& value)
    {
        if (option.store(value))
            notifyListeners();
    }
    template <typename Self, typename Visitor>
    static void forEachStored(Self& settings, Visitor visit);
    void notifyListeners();
};

} // namespace cadrel::core
