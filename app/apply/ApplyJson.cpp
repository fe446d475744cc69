// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyJson.h"

#include "app/apply/KeptRun.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "standin/base/Utf16.h"

#include <utility>

namespace cadrel::app {

using nlohmann::ordered_json;
using standin::toUtf8;
using standin::Track;

namespace {

ordered_json describe(const Placement& placement)
{
    ordered_json facts{{"kind", placement.isMarker() ? "marker" : "clip"}, {"name", toUtf8(placement.name)}};
    if (placement.clip)
        facts["clip"] = toUtf8(placement.clip->name());
    if (!placement.part.empty())
        facts["part"] = toUtf8(placement.part);
    return facts;
}

} // namespace

ordered_json ApplyJson::toJson() const
{
    const core::EventList& changes = m_facts.model.changeEdl();
    ordered_json passedOver = ordered_json::array();
    for (const PassedOver& passed : m_facts.passedOver)
        passedOver.push_back({{"number", passed.event->eventNumber()},
                              {"dstIn", passed.event->dstIn().toString()},
                              {"dstOut", passed.event->dstOut().toString()},
                              {"roll", passed.event->rollName()},
                              {"reason", passed.reason}});
    ordered_json tracks = ordered_json::array();
    for (const TrackComparison* const track : m_facts.userTracks())
        tracks.push_back(toJson(*track));
    ordered_json markers = ordered_json::array();
    for (const TrackComparison* const track : m_facts.markedTracks()) {
        for (const Placement& marker : track->added) {
            ordered_json facts{{"kind", toUtf8(track->track->name())}, {"name", toUtf8(marker.name)}};
            facts.update(span(marker.start, marker.end));
            markers.push_back(std::move(facts));
        }
    }

    ordered_json json{{"project", m_facts.projectName}, {"rate", m_clock.rateLabel()}};
    if (m_facts.generation)
        json.update(m_facts.generation->toJson());
    else
        json["change"] = {{"files", m_facts.changeNames},
                          {"invalid", changes.countInvalid()},
                          {"unread", app::toJson(m_facts.changeUnread)}};
    if (m_facts.settings)
        json["settings"] = m_facts.settings->toJson();
    json["runNeeded"] = m_facts.isRunNeeded;
    json["applied"] = m_facts.appliedCount;
    json["passedOver"] = std::move(passedOver);
    ordered_json lost = ordered_json::array();
    for (const core::SecondsRange& range : m_facts.lost)
        lost.push_back(span(range.start - m_facts.timeOrigin, range.end - m_facts.timeOrigin));
    json["lost"] = std::move(lost);
    json["seconds"] = m_facts.seconds;
    json["tracks"] = std::move(tracks);
    json["markers"] = std::move(markers);
    json["staying"] = m_facts.staying;
    json["written"] = m_facts.written.empty() ? ordered_json() : ordered_json(m_facts.written);
    const auto firstOf = [](const std::vector<std::string>& names) {
        return names.empty() ? ordered_json() : ordered_json(names.front());
    };
    json["backup"] = firstOf(m_facts.projectBackups);
    json["reportBackup"] = firstOf(m_facts.reportBackups);
    return json;
}

ordered_json ApplyJson::partsOf(std::size_t event) const
{
    ordered_json parts = ordered_json::array();
    const auto add = [&parts](const std::string& srcIn, const std::string& srcOut, const std::string& dstIn,
                              const std::string& dstOut, const char* from) {
        parts.push_back({{"srcIn", srcIn}, {"srcOut", srcOut}, {"dstIn", dstIn}, {"dstOut", dstOut}, {"from", from}});
    };
    if (event < m_facts.kept.size()) {
        const auto timecode = [](std::int32_t frame) { return core::Timecode(frame).toString(); };
        for (const core::CarriedStretch& part : m_facts.kept[event].parts)
            add(timecode(part.source().start), timecode(part.source().end), timecode(part.destination.start),
                timecode(part.destination.end), wordOf(part.from));
    } else {
        const core::EventBase& whole = m_facts.model.changeEdl().at(event);
        add(whole.srcIn().toString(), whole.srcOut().toString(), whole.dstIn().toString(), whole.dstOut().toString(),
            wordOf(core::CarriedFrom::Cut));
    }
    return {{"parts", std::move(parts)}};
}

ordered_json ApplyJson::toJson(const Fate& fate) const
{
    ordered_json pieces = ordered_json::array();
    for (const Piece& piece : fate.pieces) {
        ordered_json now = span(piece.now.start, piece.now.end);
        now["shift"] = length(piece.shift);
        pieces.push_back(std::move(now));
    }
    ordered_json facts = describe(fate.before);
    facts["moved"] = fate.isMoved;
    facts["trimmed"] = {
        {"start", length(fate.lostAtStart)}, {"middle", length(fate.lostBetween)}, {"end", length(fate.lostAtEnd)}};
    facts["split"] = fate.isSplit;
    facts["doubled"] = fate.isDoubled;
    facts["was"] = span(fate.before.start, fate.before.end);
    facts["now"] = std::move(pieces);
    return facts;
}

ordered_json ApplyJson::toJson(const TrackComparison& track) const
{
    const core::SoundCount count = countOf(track);
    ordered_json changes = ordered_json::array();
    for (const Fate& fate : track.fates) {
        if (!fate.stays())
            changes.push_back(toJson(fate));
    }
    for (const Placement& placement : track.added) {
        ordered_json facts = describe(placement);
        facts["was"] = nullptr;
        facts["now"] = ordered_json::array({span(placement.start, placement.end)});
        changes.push_back(std::move(facts));
    }
    ordered_json folders = ordered_json::array();
    for (const Track* const folder : foldersAround(*track.track))
        folders.push_back(toUtf8(folder->name()));
    return {{"name", toUtf8(track.track->name())},
            {"kind", Track::wordOf(track.track->kind())},
            {"folders", std::move(folders)},
            {"locked", track.track->isLocked()},
            {"holds", count.all},
            {"stay", count.stay},
            {"moved", count.moved},
            {"trimmed", count.trimmed},
            {"split", count.split},
            {"doubled", count.doubled},
            {"inNoCut", count.lost},
            {"new", count.added},
            {"changes", std::move(changes)}};
}

ordered_json ApplyJson::span(double start, double end) const
{
    const auto time = [this](double seconds) {
        return ordered_json{{"seconds", seconds}, {"timecode", m_clock.timecode(seconds)}};
    };
    return {{"in", time(start)}, {"out", time(end)}};
}

ordered_json ApplyJson::length(double seconds) const
{
    return {{"seconds", seconds}, {"timecode", m_clock.length(seconds)}};
}

} // namespace cadrel::app
