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

// What a number of a stream counts as.

std::int32_t knownMatchBy(std::int32_t value)
{
    return value == 0 ? MatchBy::RollName : MatchBy::ClipName;
}

std::int32_t knownHealMode(std::int32_t value)
{
    // A mode after the last one that is offered now is accepted too.
    constexpr std::int32_t LastAccepted = 4;
    return value < HealMode::None || value > LastAccepted ? HealMode::None : value;
}

std::int32_t knownApplyTo(std::int32_t value)
{
    return value == ApplyTo::SelectedTracks ? ApplyTo::SelectedTracks : ApplyTo::AllTracks;
}

} // namespace

/// Visits every option in the order of the stream, with the version of the stream that brought it.
template <typename Self, typename Visitor>
void Settings::forEachStored(Self& settings, Visitor visit)
{
    visit(settings.matchBy, 0, knownMatchBy);
    visit(settings.healMode, 0, knownHealMode);
    visit(settings.applyTo, 1, knownApplyTo);
    visit(settings.createDestinationMarkers, 0);
    visit(settings.createDissolveWipeMarkers, 0);
    visit(settings.createInsertMarkers, 0);
    visit(settings.createAudioSnippetMarkers, 1);
    visit(settings.createAutomationWarningMarkers, 1);
    visit(settings.createOverlapMarkers, 1);
    visit(settings.vfxPatterns, 0);
    visit(settings.snippetUsesPercentage, 0);
    visit(settings.snippetMaxPercentage, 0);
    visit(settings.includeOverhangingAudioEvents, 0);
    visit(settings.snippetThreshold, 0);
    visit(settings.bRollRenaming, 2);
    visit(settings.remainsThreshold, 2);
    visit(settings.createVirginTerritories, 3);
    visit(settings.restrictRange, 4);
    visit(settings.preserveMaterialBefore, 4);
    visit(settings.preserveMaterialAfter, 4);
}

/// Reads the options that a version has from a stream of it. The others get their usual values, except that reading
/// version 0 leaves them alone.
class Settings::Reader {
public:
    Reader(ByteArchive& archive, std::uint32_t version) : m_archive(archive), m_version(version) {}

    template <typename T>
    void operator()(Option<T>& option, std::uint32_t sinceVersion) const
    {
        if (m_version >= sinceVersion)
            m_archive >> option.m_value;
        else if (m_version > 0)
            option.m_value = option.m_usual;
    }

    void operator()(Option<std::int32_t>& option, std::uint32_t sinceVersion, std::int32_t (*known)(std::int32_t)) const
    {
        (*this)(option, sinceVersion);
        if (m_version >= sinceVersion)
            option.m_value = known(option.m_value);
    }

    void operator()(Option<std::vector<VfxPatternEntry>>& option, std::uint32_t) const
    {
        std::vector<VfxPatternEntry>& rows = option.m_value;
        if (m_version == 0) {
            // Neither a count nor frames: the stream has as many rows as the object.
            for (VfxPatternEntry& row : rows)
                row.readCurrent(m_archive);
            return;
        }
        rows.clear();
        for (std::size_t left = m_archive.readCount(); left > 0; --left)
            m_archive >> rows.emplace_back();
    }

private:
    ByteArchive& m_archive;
    std::uint32_t m_version;
};

/// Writes the options as the present version has them.
class Settings::Writer {
public:
    explicit Writer(ByteArchive& archive) : m_archive(archive) {}

    template <typename T, typename... Known>
    void operator()(const Option<T>& option, std::uint32_t, Known...) const
    {
        m_archive << option();
    }

    void operator()(const Option<std::vector<VfxPatternEntry>>& option, std::uint32_t) const
    {
        m_archive.writeCount(option().size());
        for (const VfxPatternEntry& row : option())
            m_archive << row;
    }

private:
    ByteArchive& m_archive;
};

Settings::Settings() : Serializable(PersistenceVersion) {}

const VfxPatternEntry& Settings::vfxPattern(std::size_t index) const
{
    if (index >= vfxPatterns().size())
        throw Result::InvalidArgument;
    return vfxPatterns()[index];
}

void Settings::setVfxPattern(const VfxPatternEntry& entry, std::size_t index)
{
    if (index >= vfxPatterns().size())
        throw Result::InvalidArgument;
    vfxPatterns.m_value[index] = entry;
}

void Settings::setPreserveMaterial(double before, double after)
{
    if (after >= before) {
        preserveMaterialBefore.store(before);
        preserveMaterialAfter.store(after);
    }
    // Notifies also for refused values, so that a dialog that shows them goes back to the stored ones.
    notifyListeners();
}

void Settings::reset()
{
    Settings usual;
    usual.vfxPatterns.m_value = vfxPatterns();
    usual.vfxPatterns.m_value.resize(VfxRowCount);
    *this = usual;
}

void Settings::readCurrent(ByteArchive& archive)
{
    forEachStored(*this, Reader(archive, PersistenceVersion));
    notifyListeners();
}

void Settings::write(ByteArchive& archive) const
{
    forEachStored(*this, Writer(archive));
}

void Settings::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version >= PersistenceVersion)
        throw Result::UnknownVersion;
    forEachStored(*this, Reader(archive, version));
    // Projects of these versions were processed with virgin territories.
    if (version == 1 || version == 2)
        createVirginTerritories.m_value = true;
    vfxPatterns.m_value.resize(VfxRowCount);
    notifyListeners();
}

void Settings::notifyListeners()
{
    notify(ChangeContext(ChangeContext::SettingsChanged));
}

} // namespace cadrel::core
