// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EventWords.h"
#include "app/notes/NotesText.h"
#include "app/notes/NotesWording.h"
#include "app/notes/SoundWording.h"
#include "app/settings/SettingsReport.h"
#include "core/edl/EventBase.h"
#include "util/JsonText.h"

#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <string_view>

namespace cadrel::app {

using core::NoteEntry;
using core::NoteStep;
using core::PictureChange;
using nlohmann::ordered_json;

namespace {

constexpr int Schema = 1;

std::string textOf(const ordered_json& value)
{
    return value.dump(-1, ' ', false, ordered_json::error_handler_t::replace);
}

/// The text of an object with one more member, whose value is JSON already.
std::string withMember(const ordered_json& object, std::string_view key, std::string_view value)
{
    std::string text = textOf(object);
    text.pop_back();
    text.append(",\"").append(key).append("\":").append(value);
    return text + "}";
}

class SoundJson {
public:
    explicit SoundJson(const SoundDocument& document) : m_document(document) {}

    std::string whole() const
    {
        ordered_json tracks = ordered_json::array();
        for (const SoundTrack& track : m_document.tracks)
            tracks.push_back({{"name", track.name}, {"kind", track.kind}, {"folders", track.folders}});
        return withMember({{"project", m_document.projectName},
                           {"clips", countJson(m_document.clips)},
                           {"markers", countJson(m_document.markers)},
                           {"sceneTrack", m_document.scenes ? ordered_json(*m_document.scenes) : ordered_json()},
                           {"automationWatched", m_document.isWatchingAutomation},
                           {"remarks", m_document.remarks},
                           {"tracks", std::move(tracks)}},
                          "elsewhere", ofStep(m_document.notes.elsewhere()));
    }

    std::string ofStep(const core::StepSound& sound) const
    {
        ordered_json jumps = ordered_json::array();
        for (const core::AutomationJump& jump : sound.jumps) {
            ordered_json json{{"in", timeJson(jump.place.start)}, {"out", timeJson(jump.place.end)}};
            json["tracks"] = jump.tracks;
            jumps.push_back(std::move(json));
        }
        ordered_json tracks = ordered_json::array();
        for (const std::size_t track : sound.tracks)
            tracks.push_back(track + 1);
        return withMember({{"scenes", sound.scenes},
                           {"tracks", std::move(tracks)},
                           {"movedClips", sound.movedClips},
                           {"automationJumps", std::move(jumps)}},
                          "changes", changesText(sound.changes));
    }

private:
    static ordered_json countJson(const core::SoundCount& count)
    {
        return {{"all", count.all},     {"stay", count.stay},       {"moved", count.moved},  {"trimmed", count.trimmed},
                {"split", count.split}, {"doubled", count.doubled}, {"inNoCut", count.lost}, {"new", count.added}};
    }

    /// A film may have a million of them, for which a tree of values would take minutes.
    std::string changesText(const std::vector<core::SoundChange>& changes) const
    {
        std::string json = "[";
        for (const core::SoundChange& change : changes) {
            json += json.size() == 1 ? "" : ",";
            appendChange(json, change);
        }
        return json + "]";
    }

    void appendChange(std::string& json, const core::SoundChange& change) const
    {
        json.append(R"({"kind":")").append(wordOf(change.kind));
        json.append(R"(","track":)").append(std::to_string(change.track + 1)).append(R"(,"trackName":)");
        util::appendJsonText(json, m_document.tracks.at(change.track).name);
        json.append(R"(,"on":)").append(change.isMarker ? R"("marker")" : R"("clip")").append(R"(,"name":)");
        util::appendJsonText(json, change.name);
        if (!change.part.empty())
            util::appendJsonText(json += R"(,"part":)", change.part);
        if (change.kind != core::SoundChangeKind::Added)
            appendRange(json += R"(,"was":)", change.was);
        if (change.now)
            appendRange(json += R"(,"now":)", *change.now);
        else
            appendRange(json += R"(,"lost":)", change.lost);
        json += '}';
    }

    void appendRange(std::string& json, const core::SecondsRange& range) const
    {
        appendTime(json += R"({"in":)", range.start);
        appendTime(json += R"(,"out":)", range.end);
        json += '}';
    }

    void appendTime(std::string& json, double seconds) const
    {
        const double ofProject = seconds - m_document.clock.origin();
        util::appendJsonNumber(json += R"({"seconds":)", ofProject);
        json.append(R"(,"timecode":")").append(m_document.clock.timecode(ofProject)).append(R"("})");
    }

    ordered_json timeJson(double seconds) const
    {
        const double ofProject = seconds - m_document.clock.origin();
        return {{"seconds", ofProject}, {"timecode", m_document.clock.timecode(ofProject)}};
    }

    const SoundDocument& m_document;
};

class JsonForm {
public:
    explicit JsonForm(const NotesDocument& document) : m_document(document), m_words(document) {}

    void write(const NotesSink& sink) const
    {
        sink("{\n\"schema\": " + std::to_string(Schema));
        const auto add = [&sink](const char* key, const ordered_json& value) {
            sink(std::string(",\n\"") + key + "\": " + textOf(value));
        };
        add("old", cutJson(false));
        add("new", cutJson(true));
        add("rate", m_document.rate);
        add("match", m_document.matchBy == core::MatchBy::ClipName ? "clip" : "roll");
        add("simplifyFrames", m_document.layout.simplify);
        add("settings", m_document.settings.toJson());
        add("totals", totalsJson());
        add("healed", {{"events", m_document.healing.events},
                       {"members", m_document.healing.members},
                       {"bridgedGaps", m_document.healing.bridgedGaps}});
        add("largest", largestJson());
        if (m_document.sound != nullptr)
            sink(",\n\"sound\": " + SoundJson(*m_document.sound).whole());
        sink(",\n\"reels\": [");
        for (std::size_t reel = 0; reel < m_document.notes.reels().size(); ++reel)
            writeReel(reel, sink);
        sink("\n]\n}\n");
    }

private:
    ordered_json cutJson(bool isNew) const
    {
        const core::EventList& events = isNew ? m_document.newEvents : m_document.oldEvents;
        const core::Programme& cut = isNew ? m_document.notes.newCut() : m_document.notes.oldCut();
        ordered_json doubts = ordered_json::array();
        for (const core::DoubtfulEvent& doubtful : cut.doubts()) {
            const core::EventBase& event = events.at(static_cast<std::size_t>(doubtful.event));
            ordered_json doubt = shotJson(&event);
            doubt["doubt"] = wordOf(doubtful.doubt);
            doubt["flaws"] = flawWordsOf(event);
            doubts.push_back(std::move(doubt));
        }
        return {{"files", isNew ? m_document.cuts.newNames : m_document.cuts.oldNames},
                {"titles", isNew ? m_document.cuts.newTitles : m_document.cuts.oldTitles},
                {"events", events.size()},
                {"invalid", events.countInvalid()},
                {"unread", toJson(isNew ? m_document.cuts.newUnread : m_document.cuts.oldUnread)},
                {"overlappingFiles", isNew ? m_document.cuts.newOverlapping : m_document.cuts.oldOverlapping},
                {"doubts", std::move(doubts)}};
    }

    ordered_json totalsJson() const
    {
        const core::NoteTotals& totals = m_document.notes.totals();
        return {{"framesBefore", totals.before},
                {"framesAfter", totals.after},
                {"keptFrames", totals.kept},
                {"liftedFrames", totals.lifted},
                {"insertedFrames", totals.inserted},
                {"doubledFrames", totals.doubled},
                {"movedFrames", totals.moved},
                {"steps", totals.steps},
                {"reels", m_document.notes.reels().size()}};
    }

    ordered_json largestJson() const
    {
        ordered_json numbers = ordered_json::array();
        for (const NoteEntry* const entry : m_document.notes.largestSteps())
            numbers.push_back(entry->number);
        return numbers;
    }

    ordered_json reelJson(const core::Programme& cut, const std::optional<std::size_t>& reel) const
    {
        if (!reel)
            return nullptr;
        return {{"start", m_words.plainTimecode(cut.reels()[*reel].timecodeStart)},
                {"frames", cut.reels()[*reel].length}};
    }

    void writeReel(std::size_t index, const NotesSink& sink) const
    {
        const core::ReelNotes& reel = m_document.notes.reels()[index];
        sink((index == 0 ? "\n" : ",\n") + std::string("{\"reel\": ") + std::to_string(index + 1) +
             ", \"old\": " + textOf(reelJson(m_document.notes.oldCut(), reel.pair.oldReel)) +
             ", \"new\": " + textOf(reelJson(m_document.notes.newCut(), reel.pair.newReel)) + ", \"rows\": [");
        const char* separator = "\n";
        for (const NoteEntry& entry : reel.entries) {
            const core::StepSound* const sound = m_words.soundOf(entry);
            sink(separator);
            sink(sound == nullptr ? textOf(rowJson(entry))
                                  : withMember(rowJson(entry), "sound", SoundJson(*m_document.sound).ofStep(*sound)));
            separator = ",\n";
        }
        sink("\n]}");
    }

    ordered_json rowJson(const NoteEntry& entry) const
    {
        return entry.step() != nullptr ? stepJson(entry) : entry.kept() != nullptr ? keptJson(entry) : movedJson(entry);
    }

    ordered_json movedJson(const NoteEntry& entry) const
    {
        const core::MoveEnd& end = *entry.moveEnd();
        return {{"row", "moved"},
                {"step", end.step},
                {"at", placeJson(end.place)},
                {end.isTarget ? "fromReel" : "toReel", end.otherReel + 1},
                {"frames", end.move.frames},
                {"offsetFrames", entry.runningOffset}};
    }

    ordered_json keptJson(const NoteEntry& entry) const
    {
        const core::KeptStretch& kept = *entry.kept();
        return {{"row", "kept"},
                {"oldIn", m_words.plainTimecode(m_document.notes.oldTimecode(kept.oldStart))},
                {"newIn", m_words.plainTimecode(m_document.notes.newTimecode(kept.newStart))},
                {"frames", kept.length},
                {"offsetFrames",
                 m_document.notes.newTimecode(kept.newStart) - m_document.notes.oldTimecode(kept.oldStart)}};
    }

    ordered_json placeJson(const core::WorkPlace& place) const
    {
        ordered_json json{
            {"reel", place.reel + 1}, {"timecode", m_words.plainTimecode(place.timecode())}, {"frame", place.frame}};
        if (m_document.layout.showsFeet)
            json["feet"] = NotesWording::feet(place.frame);
        return json;
    }

    ordered_json stepJson(const NoteEntry& entry) const
    {
        const NoteStep& step = *entry.step();
        ordered_json json{{"row", "step"},
                          {"number", entry.number},
                          {"action", wordOf(step.action)},
                          {"at", placeJson(step.place)},
                          {"deleteFrames", step.removed},
                          {"insertFrames", step.inserted.length}};
        if (step.inserted.length > 0)
            json["insertFrom"] = m_words.plainTimecode(m_document.notes.newTimecode(step.inserted.start));
        if (step.action == core::StepAction::Move || step.action == core::StepAction::MoveReel)
            json["from"] = placeJson(step.from);
        if (step.action == core::StepAction::Move)
            json["moveFrames"] = step.moved;
        json["lengthChangeFrames"] = entry.lengthChange;
        json["offsetFrames"] = entry.runningOffset;
        json["joinedSteps"] = step.joined;
        ordered_json changes = ordered_json::array();
        std::size_t doubled = 0;
        for (const PictureChange& change : step.changes) {
            changes.push_back(changeJson(change));
            if (change.kind == core::ChangeKind::Doubled && doubled < step.doubledFrom.size())
                changes.back()["standsAt"] = placeJson(step.doubledFrom[doubled++]);
        }
        json["changes"] = std::move(changes);
        return json;
    }

    ordered_json changeJson(const PictureChange& change) const
    {
        ordered_json json{{"kind", wordOf(change.kind)}, {"frames", change.frames}};
        if (change.oldShot != nullptr)
            json["oldShot"] = shotJson(change.oldShot);
        if (change.newShot != nullptr)
            json["newShot"] = shotJson(change.newShot);
        if (change.inOld)
            json["old"] = {{"in", m_words.plainTimecode(m_document.notes.oldTimecode(change.inOld->start))},
                           {"frames", change.inOld->length}};
        if (change.inNew)
            json["new"] = {{"in", m_words.plainTimecode(m_document.notes.newTimecode(change.inNew->start))},
                           {"frames", change.inNew->length}};
        if (const std::optional<core::Timecode> source = m_document.notes.sourceOf(change))
            json["sourceIn"] = source->toString();
        if (change.shots > 1)
            json["shots"] = change.shots;
        if (change.isPart)
            json["part"] = true;
        if (change.hasOldTransition)
            json["oldTransition"] = true;
        if (change.hasNewTransition)
            json["newTransition"] = true;
        if (change.isOutOfTheWay)
            json["outOfTheWay"] = true;
        return json;
    }

    static ordered_json shotJson(const core::EventBase* shot)
    {
        return {{"event", shot->eventNumber()},
                {"roll", shot->rollName()},
                {"clip", shot->clipName()},
                {"srcIn", shot->srcIn().toString()},
                {"srcOut", shot->srcOut().toString()},
                {"speed", shot->signedSpeed()},
                {"transition", transitionWordOf(*shot)},
                {"transitionFrames", shot->transitionDuration()},
                {"edlFile", shot->edlFileName()}};
    }

    const NotesDocument& m_document;
    NotesWording m_words;
};

} // namespace

void writeNotesJson(const NotesDocument& document, const NotesSink& sink)
{
    JsonForm(document).write(sink);
}

} // namespace cadrel::app
