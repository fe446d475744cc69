#include "core/Settings.h"

#include "core/ChangeContext.h"
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
    // A mode behind the last that is offered now passes, too.
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
    if (index >= vfxPatterns_.size())
        throw Result::InvalidArgument;
    return vfxPatterns_[index];
}

void Settings::setMatchBy(std::int32_t value)
{
    matchBy_ = value;
    notifyListeners();
}

void Settings::setHealMode(std::int32_t value)
{
    healMode_ = value;
    notifyListeners();
}

void Settings::setApplyTo(std::int32_t value)
{
    applyTo_ = value;
    notifyListeners();
}

void Settings::setCreateDestinationMarkers(bool flag)
{
    createDestinationMarkers_ = flag;
    notifyListeners();
}

void Settings::setCreateDissolveWipeMarkers(bool flag)
{
    createDissolveWipeMarkers_ = flag;
    notifyListeners();
}

void Settings::setCreateInsertMarkers(bool flag)
{
    createInsertMarkers_ = flag;
    notifyListeners();
}

void Settings::setCreateAudioSnippetMarkers(bool flag)
{
    createAudioSnippetMarkers_ = flag;
    notifyListeners();
}

void Settings::setRemainsThreshold(std::int32_t frames)
{
    remainsThreshold_ = frames;
    notifyListeners();
}

void Settings::setCreateAutomationWarningMarkers(bool flag)
{
    createAutomationWarningMarkers_ = flag;
    notifyListeners();
}

void Settings::setCreateOverlapMarkers(bool flag)
{
    createOverlapMarkers_ = flag;
    notifyListeners();
}

void Settings::setBRollRenaming(bool flag)
{
    bRollRenaming_ = flag;
    notifyListeners();
}

void Settings::setRestrictRange(bool flag)
{
    if (flag == restrictRange_)
        return;
    restrictRange_ = flag;
    notifyListeners();
}

void Settings::setPreserveMaterial(double before, double after)
{
    if (after >= before) {
        preserveMaterialBefore_ = before;
        preserveMaterialAfter_ = after;
    }
    // Also for refused values, so that a dialog which shows them falls back to the stored ones.
    notifyListeners();
}

void Settings::setVfxPattern(const VfxPatternEntry& entry, std::size_t index)
{
    if (index >= vfxPatterns_.size())
        throw Result::InvalidArgument;
    vfxPatterns_[index] = entry;
}

void Settings::setSnippetUsesPercentage(bool flag)
{
    snippetUsesPercentage_ = flag;
}

void Settings::setSnippetMaxPercentage(double percent)
{
    snippetMaxPercentage_ = percent;
}

void Settings::setIncludeOverhangingAudioEvents(bool flag)
{
    includeOverhangingAudioEvents_ = flag;
}

void Settings::setSnippetThreshold(std::int32_t frames)
{
    snippetThreshold_ = frames;
}

void Settings::setCreateVirginTerritories(bool flag)
{
    createVirginTerritories_ = flag;
}

void Settings::reset()
{
    Settings defaults;
    defaults.vfxPatterns_ = vfxPatterns_;
    defaults.vfxPatterns_.resize(VfxRowCount);
    *this = defaults;
}

void Settings::readCurrent(ByteArchive& archive)
{
    readOptions(archive, PersistenceVersion);
    notifyListeners();
}

void Settings::write(ByteArchive& archive) const
{
    archive << matchBy_ << healMode_ << applyTo_;
    archive << createDestinationMarkers_ << createDissolveWipeMarkers_ << createInsertMarkers_
            << createAudioSnippetMarkers_;
    archive << createAutomationWarningMarkers_ << createOverlapMarkers_;
    archive.writeCount(vfxPatterns_.size());
    for (const VfxPatternEntry& row : vfxPatterns_)
        archive << row;
    archive << snippetUsesPercentage_ << snippetMaxPercentage_ << includeOverhangingAudioEvents_ << snippetThreshold_;
    archive << bRollRenaming_ << remainsThreshold_;
    archive << createVirginTerritories_;
    archive << restrictRange_ << preserveMaterialBefore_ << preserveMaterialAfter_;
}

void Settings::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version >= PersistenceVersion)
        throw Result::UnknownVersion;
    if (version == 0)
        readFirstVersion(archive);
    else
        readOptions(archive, version);
    vfxPatterns_.resize(VfxRowCount);
    notifyListeners();
}

void Settings::notifyListeners()
{
    notify(ChangeContext(ChangeContext::SettingsChanged));
}

void Settings::readOptions(ByteArchive& archive, std::uint32_t version)
{
    matchBy_ = readMatchBy(archive);
    healMode_ = readHealMode(archive);
    applyTo_ = readApplyTo(archive);
    archive >> createDestinationMarkers_ >> createDissolveWipeMarkers_ >> createInsertMarkers_ >>
        createAudioSnippetMarkers_;
    archive >> createAutomationWarningMarkers_ >> createOverlapMarkers_;
    readVfxPatterns(archive);
    readSnippetOptions(archive);

    // What an older version doesn't hold gets the value that its projects were processed with: virgin territories were
    // always created then.
    bRollRenaming_ = true;
    remainsThreshold_ = 5;
    createVirginTerritories_ = true;
    restrictRange_ = false;
    preserveMaterialBefore_ = 0.0;
    preserveMaterialAfter_ = 0.0;
    if (version >= 2)
        archive >> bRollRenaming_ >> remainsThreshold_;
    if (version >= 3)
        archive >> createVirginTerritories_;
    if (version >= 4)
        archive >> restrictRange_ >> preserveMaterialBefore_ >> preserveMaterialAfter_;
}

void Settings::readFirstVersion(ByteArchive& archive)
{
    matchBy_ = readMatchBy(archive);
    healMode_ = readHealMode(archive);
    archive >> createDestinationMarkers_ >> createDissolveWipeMarkers_ >> createInsertMarkers_;
    // Neither a count nor frames: the stream has as many rows as the object.
    for (VfxPatternEntry& row : vfxPatterns_)
        row.readCurrent(archive);
    readSnippetOptions(archive);
}

void Settings::readVfxPatterns(ByteArchive& archive)
{
    vfxPatterns_.clear();
    for (std::size_t left = archive.readCount(); left > 0; --left)
        archive >> vfxPatterns_.emplace_back();
}

void Settings::readSnippetOptions(ByteArchive& archive)
{
    archive >> snippetUsesPercentage_ >> snippetMaxPercentage_ >> includeOverhangingAudioEvents_ >> snippetThreshold_;
}

} // namespace cadrel::core
