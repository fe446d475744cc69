// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/Plausibility.h"

#include "app/apply/RunMaterial.h"
#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "core/edl/EventBase.h"
#include "core/edl/ProgrammePlace.h"
#include "core/keep/Material.h"
#include "core/model/DataModel.h"
#include "core/picture/PictureLine.h"
#include "core/picture/PictureNames.h"
#include "core/protect/RunRecord.h"
#include "core/settings/MatchBy.h"
#include "core/settings/VfxNameMatcher.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <cstddef>
#include <map>
#include <vector>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::FrameRanges;
using core::Framerate;
using core::MatchBy;
using core::NextRun;
using core::PastRuns;
using core::PictureLine;
using core::PictureNames;
using core::Settings;
using core::Timecode;
using core::VfxNameMatcher;

namespace {

/// With fewer events of both cuts together it says nothing that many of them have one name.
constexpr std::size_t FewestEventsForAName = 8;

FrameRanges intersect(const FrameRanges& a, const FrameRanges& b)
{
    return without(a, without(a, b));
}

bool isLessThanHalf(const FrameRanges& part, const FrameRanges& whole)
{
    return 2 * std::int64_t{lengthOf(part)} < lengthOf(whole);
}

FrameRanges pictureOf(const EventList& events, const Settings& settings, const Framerate& framerate)
{
    PictureNames names(settings.matchBy(), settings.vfxPatterns());
    return PictureLine(events, names, framerate).lit();
}

std::string timecodeOf(std::int32_t frame, const Framerate& framerate)
{
    Timecode timecode;
    timecode.setFrameCount(frame, framerate);
    return timecode.toString();
}

/// How many events of a cut have which name, as they are matched; black and sound have none.
using NameCount = std::map<std::string, std::size_t>;

void countNames(const EventList& events, const Settings& settings, NameCount& count)
{
    VfxNameMatcher versions;
    versions.compileEnabled(settings.vfxPatterns());
    for (const auto& event : events.events()) {
        const std::string& name = settings.matchBy() == MatchBy::ClipName ? event->clipName() : event->rollName();
        if (!isBlack(*event) && !event->hasFlaw(EventFlaw::NotVideoEvent))
            ++count[versions.stripVersion(name)];
    }
}

bool shareAName(const NameCount& a, const NameCount& b)
{
    return std::any_of(a.begin(), a.end(), [&b](const auto& entry) { return b.count(entry.first) > 0; });
}

} // namespace

Plausibility::Plausibility(const DataModel& model, const std::string& projectFile, const std::string& inputs)
    : m_model(model), m_projectFile(projectFile), m_inputs(inputs), m_framerate(Timecode::framerate()),
      m_oldPicture(pictureOf(model.oldEdl(), model.settings(), m_framerate))
{
}

std::optional<Failure> Plausibility::doubtOfLastCut(const NextRun& next, const PastRuns& runs) const
{
    const std::optional<std::int32_t> difference = next.firstDifference(runs);
    if (!difference)
        return std::nullopt;
    return Failure{m_projectFile,
                   "was last carried over to another cut than the old one given; they differ first at " +
                       timecodeOf(*difference, m_framerate),
                   "give that cut with --old, take the project as it was before, or give --force"};
}

std::optional<Failure> Plausibility::doubtOfChanges(const NextRun& next, const PastRuns& runs) const
{
    if (!next.hasBeenDone(runs))
        return std::nullopt;
    return Failure{m_inputs, "this change has been carried out in the project already",
                   "take the project as it was before, or give --force"};
}

std::optional<Failure> Plausibility::doubtOfNames() const
{
    NameCount oldNames;
    NameCount newNames;
    countNames(m_model.oldEdl(), m_model.settings(), oldNames);
    countNames(m_model.newEdl(), m_model.settings(), newNames);
    if (oldNames.empty() || newNames.empty() || shareAName(oldNames, newNames))
        return std::nullopt;
    return Failure{m_inputs, "the old and the new cut have no name in common",
                   "see that both are of one reel, try --match or --vfx, or give --force"};
}

std::optional<Failure> Plausibility::doubtOfSound(const standin::Project& project) const
{
    const RunMaterial material(project, m_model.settings());
    const FrameRanges sound = intersect(m_oldPicture, core::framesOfMaterial(material.sound(), m_framerate));
    // A project without tracks has a message of its own.
    if (!material.hasTracks() || !isLessThanHalf(sound, m_oldPicture))
        return std::nullopt;
    return Failure{m_projectFile,
                   "has sound under " + length(lengthOf(sound)) + " of the " + length(lengthOf(m_oldPicture)) +
                       " of the old cut only",
                   "see that the project and the cut are of one reel, and the time origin of the project, or give "
                   "--force"};
}

std::optional<Failure> Plausibility::doubtOfSurvival(const FrameRanges& sources) const
{
    const FrameRanges surviving = intersect(m_oldPicture, core::united(sources));
    if (!isLessThanHalf(surviving, m_oldPicture))
        return std::nullopt;
    return Failure{m_inputs,
                   "only " + length(lengthOf(surviving)) + " of the " + length(lengthOf(m_oldPicture)) +
                       " of the old cut survive",
                   "see that both cuts are of one reel, try --match or --vfx, or give --force"};
}

std::optional<Plausibility::DullNames> Plausibility::dullNames() const
{
    const bool isByClip = m_model.settings().matchBy() == MatchBy::ClipName;
    NameCount names;
    countNames(m_model.oldEdl(), m_model.settings(), names);
    countNames(m_model.newEdl(), m_model.settings(), names);
    if (names.empty())
        return std::nullopt;
    std::size_t all = 0;
    for (const auto& [name, count] : names)
        all += count;
    const auto most =
        std::max_element(names.begin(), names.end(), [](const auto& a, const auto& b) { return a.second < b.second; });
    const auto& [name, count] = *most;
    const bool isAuxiliary = name == "AX" && count == all;
    // Where each cut is one event, there is nothing to tell apart.
    const bool isOneName = count == all && all > 2;
    if (!isAuxiliary && !isOneName && (all < FewestEventsForAName || 2 * count < all))
        return std::nullopt;
    const std::string kind = isByClip ? "clip name" : "roll name";
    const std::size_t telling = all - count;
    const std::string shown = name.empty() ? "no " + kind : "the " + kind + " " + toPrintable(name, 40).text;
    return DullNames{{m_inputs,
                      std::to_string(count) + " of " + counted(all, "event") + " have " + shown +
                          ", which doesn't tell one material from another",
                      isByClip ? "try --match roll" : "try --match clip"},
                     kind + "s that tell the material: " + std::to_string(telling) + " of " + counted(all, "event") +
                         ", " + std::to_string(100 * telling / all) + " %"};
}

std::string Plausibility::length(std::int32_t frames) const
{
    return timecodeOf(frames, m_framerate);
}

} // namespace cadrel::app
