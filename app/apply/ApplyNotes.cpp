// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyNotes.h"

#include "app/apply/RunMaterial.h"
#include "app/console/Wording.h"
#include "app/notes/NotesForms.h"
#include "core/detect/AutomationWarningDetectAlgorithm.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "host/track/TrackRole.h"
#include "standin/base/Utf16.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

namespace cadrel::app {

using core::SecondsRange;
using core::SoundChange;
using core::SoundChangeKind;
using core::SoundFacts;
using standin::toUtf8;
using standin::Track;

namespace {

bool isOwnMarkerTrack(const Track& track)
{
    return track.kind() == Track::Kind::Marker && !markerRoleOf(track);
}

/// Of the user's own marker tracks the one whose ranges take the most of the old programme, where that is half of it or more;
/// else null.
const TrackComparison* sceneTrackOf(const ApplyFacts& facts, const core::ChangeNotes& notes)
{
    const TrackComparison* scenes = nullptr;
    double most = notes.oldCut().length() / notes.framerate().rate / 2;
    for (const TrackComparison* const track : facts.userTracks()) {
        if (!isOwnMarkerTrack(*track->track))
            continue;
        double seconds = 0.0;
        for (const Fate& fate : track->fates)
            seconds += fate.before.kind == Placement::Kind::Range ? fate.before.length() : 0.0;
        if (seconds > 0.0 && seconds >= most) {
            scenes = track;
            most = seconds;
        }
    }
    return scenes;
}

/// The names that a text consists of, each with a blank after it. They may have blanks themselves; of two that fit, the longer
/// one is meant if the rest fits then. The whole text where it consists of something else.
std::vector<std::string> namesIn(const std::string& text, const std::vector<std::string>& names)
{
    std::vector<std::string> sorted = names;
    std::sort(sorted.begin(), sorted.end(),
              [](const std::string& a, const std::string& b) { return a.size() > b.size(); });
    // From the end on: which name comes first in the rest of the text, where all of the rest consists of names.
    std::vector<const std::string*> firstName(text.size() + 1, nullptr);
    for (std::size_t at = text.size(); at-- > 0;) {
        for (const std::string& name : sorted) {
            const std::size_t after = at + name.size() + 1;
            const bool fits =
                after <= text.size() && text[after - 1] == ' ' && text.compare(at, name.size(), name) == 0;
            if (fits && (after == text.size() || firstName[after] != nullptr)) {
                firstName[at] = &name;
                break;
            }
        }
    }
    std::vector<std::string> found;
    for (std::size_t at = 0; at < text.size() && firstName[at] != nullptr; at += found.back().size() + 1)
        found.push_back(*firstName[at]);
    if (found.empty())
        found.push_back(text.substr(0, text.find_last_not_of(' ') + 1));
    return found;
}

/// Gathers what the comparison of the project says, in seconds of the project's clock.
class SoundGathering {
public:
    /// The pieces that were carried over are only gathered where picture has moved.
    SoundGathering(const ApplyFacts& facts, const core::ChangeNotes& notes)
        : m_origin(facts.timeOrigin), m_scenes(sceneTrackOf(facts, notes)), m_hasMoves(notes.totals().moved > 0),
          m_tracks(facts.userTracks())
    {
        for (std::size_t track = 0; track < m_tracks.size(); ++track) {
            if (m_tracks[track] == m_scenes)
                addScenes();
            else
                addTrack(track);
        }
        addJumps(facts);
    }

    SoundFacts takeFacts() { return std::move(m_found); }

private:
    SecondsRange onClock(double start, double end) const { return {m_origin + start, m_origin + end}; }
    SecondsRange onClock(const Placement& placement) const { return onClock(placement.start, placement.end); }

    void addScenes()
    {
        for (const Fate& fate : m_scenes->fates) {
            if (fate.before.kind == Placement::Kind::Range)
                m_found.scenes.push_back({toUtf8(fate.before.name), onClock(fate.before)});
        }
    }

    void addTrack(std::size_t track)
    {
        for (const Fate& fate : m_tracks[track]->fates) {
            if (fate.stays())
                continue;
            for (const FateChange& change : changesOf(fate))
                addChange(track, fate.before, change);
            if (m_hasMoves)
                addCarried(track, fate);
        }
        for (const Placement& placement : m_tracks[track]->added) {
            SoundChange change = changeOf(track, placement, SoundChangeKind::Added);
            change.now = onClock(placement);
            m_found.changes.push_back(std::move(change));
        }
    }

    void addCarried(std::size_t track, const Fate& fate)
    {
        for (const Piece& piece : fate.pieces) {
            const double start = fate.before.start + piece.from;
            m_found.carried.push_back({track, m_clip, onClock(start, start + piece.now.length())});
        }
        ++m_clip;
    }

    void addChange(std::size_t track, const Placement& before, const FateChange& what)
    {
        SoundChange change = changeOf(track, before, what.kind);
        change.was = onClock(before);
        change.lost = onClock(before.start + what.from, before.start + what.to);
        if (what.piece != nullptr)
            change.now = onClock(what.piece->now);
        m_found.changes.push_back(std::move(change));
    }

    static SoundChange changeOf(std::size_t track, const Placement& placement, SoundChangeKind kind)
    {
        SoundChange change;
        change.kind = kind;
        change.track = track;
        change.name = toUtf8(placement.name.empty() && placement.clip ? placement.clip->name() : placement.name);
        change.part = toUtf8(placement.part);
        change.isMarker = placement.isMarker();
        return change;
    }

    /// The tracks that the name of an automation warning tells.
    static std::vector<std::string> tracksOf(const Placement& marker, const std::vector<std::string>& tracks)
    {
        const std::string start = util::StringUtil::toUtf8(core::AutomationWarningDetectAlgorithm::NameStart);
        std::string name = toUtf8(marker.name);
        name.erase(0, name.starts_with(start) ? start.size() : 0);
        return namesIn(name, tracks);
    }

    void addJumps(const ApplyFacts& facts)
    {
        std::vector<std::string> tracks;
        for (const TrackComparison& track : facts.tracks)
            tracks.push_back(toUtf8(track.track->name()));
        for (const TrackComparison* const track : facts.markedTracks()) {
            if (markerRoleOf(*track->track) != host::TrackRole::AutomationWarning)
                continue;
            for (const Placement& marker : track->added)
                m_found.jumps.push_back({onClock(marker), tracksOf(marker, tracks)});
        }
    }

    double m_origin;
    const TrackComparison* m_scenes;
    bool m_hasMoves;
    const std::vector<const TrackComparison*> m_tracks;
    SoundFacts m_found;
    std::size_t m_clip = 0;
};

std::vector<std::string> remarksOf(const ApplyFacts& facts, const ProjectClock& clock)
{
    std::vector<std::string> lines;
    if (!facts.isRunNeeded)
        lines.emplace_back("No track had to change, so the sound is as it was");
    const core::Settings& settings = facts.model.settings();
    if (settings.restrictRange()) {
        const auto time = [&](double seconds) { return clock.exactTimecode(seconds - clock.origin()); };
        lines.push_back("Only the sound between " + time(settings.preserveMaterialBefore()) + " and " +
                        time(settings.preserveMaterialAfter()) + " was carried over");
    }
    if (settings.applyTo() == core::ApplyTo::SelectedTracks)
        lines.emplace_back("Only the selected tracks were carried over");
    if (!settings.createAutomationWarningMarkers())
        lines.emplace_back("Nobody has looked for jumps of the automation");
    return lines;
}

SoundDocument soundOf(const ApplyFacts& facts, const ProjectClock& clock, const core::ChangeNotes& notes,
                      const core::SoundNotes& soundNotes)
{
    SoundDocument sound{soundNotes, clock, facts.projectName, {}, {}, {}, {}, false, remarksOf(facts, clock)};
    const TrackComparison* const scenes = sceneTrackOf(facts, notes);
    for (const TrackComparison* const track : facts.userTracks()) {
        std::vector<std::string> folders;
        for (const Track* const folder : foldersAround(*track->track))
            folders.push_back(toUtf8(folder->name()));
        sound.tracks.push_back({toUtf8(track->track->name()), Track::wordOf(track->track->kind()), std::move(folders)});
        if (track == scenes)
            sound.scenes = sound.tracks.back().name;
        else
            (track->track->kind() == Track::Kind::Marker ? sound.markers : sound.clips) += countOf(*track);
    }
    sound.isWatchingAutomation = facts.model.settings().createAutomationWarningMarkers();
    return sound;
}

} // namespace

ApplyNotes::ApplyNotes(const ApplyFacts& facts, const ProjectClock& clock, const NotesLayout& layout)
    : m_settings(settingsOfNotes(*facts.settings, layout)),
      m_notes(facts.model.oldEdl(), facts.model.newEdl(),
              pictureRules(facts.model.settings(), core::Timecode::framerate()), layout.simplify),
      m_soundNotes(m_notes, SoundGathering(facts, m_notes).takeFacts()),
      m_sound(soundOf(facts, clock, m_notes, m_soundNotes)), m_document{m_notes,
                                                                        facts.model.oldEdl(),
                                                                        facts.model.newEdl(),
                                                                        core::notesOfHealing(facts.model.changeEdl()),
                                                                        *facts.cuts,
                                                                        clock.rateLabel(),
                                                                        facts.model.settings().matchBy(),
                                                                        m_settings,
                                                                        layout,
                                                                        &m_sound}
{
}

} // namespace cadrel::app
