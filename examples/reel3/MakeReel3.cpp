// SPDX-License-Identifier: GPL-3.0-or-later

// Makes the sound project of the example reel as it fits the old picture cut. Takes the EDL of that cut and the name of the
// project file. The same EDL always gives the same bytes.

#include "core/edl/EventList.h"
#include "examples/reel3/CutReading.h"
#include "examples/reel3/MixMoves.h"
#include "examples/reel3/ProductionSound.h"
#include "examples/reel3/ProgrammeTime.h"
#include "examples/reel3/SoundCues.h"
#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "util/HostString.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <array>
#include <cmath>
#include <exception>
#include <iostream>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using namespace reel3;
using namespace standin;
using cadrel::core::EventList;
using cadrel::util::StringUtil;
using Velmark::AttributeKey;
using Velmark::Counted;
using Velmark::makeCounted;

constexpr double Hour = 3600.0;
constexpr const char* ProgrammeEnd = "03:15:30:21";

struct Memo {
    const char* at;
    const char* until; ///< null for an instant
    const char* text;
    int userId; ///< 0 for one that has none yet
};

constexpr std::array<Memo, 12> Memos{{
    {"03:01:14:13", "03:01:20:11", "kettle over Tobias, look for another take", 1},
    {"03:02:43:09", "03:02:49:20", "ADR Tobias 42: sync by eye", 2},
    {"03:03:00:22", nullptr, "key too bright?", 3},
    {"03:03:50:21", "03:04:16:21", "cutting room says the stair may go", 4},
    {"03:05:05:02", nullptr, "Pip off mic, lavalier is clean", 5},
    {"03:07:52:05", "03:07:55:16", "stamp: keep the rhythm of three", 6},
    {"03:08:07:14", nullptr, "ADR Maren 45: take 2 or 3?", 7},
    {"03:09:54:23", nullptr, "signal lamp twice, same sound", 8},
    {"03:11:06:22", "03:11:09:15", "0310 is temp, ram will change", 9},
    {"03:11:38:16", nullptr, "0340 is temp", 10},
    {"03:13:29:03", "03:13:32:10", "0430 to come, plate only", 0},
    {"03:14:40:08", nullptr, "3M4 in", 0},
}};

struct Scene {
    const char* in;
    const char* out;
    const char* name;
};

constexpr std::array<Scene, 10> Scenes{{
    {"03:00:07:00", "03:00:50:01", "41 Weir, dawn"},
    {"03:00:50:01", "03:03:50:21", "42 Lock house kitchen"},
    {"03:03:50:21", "03:04:16:21", "43 Stair"},
    {"03:04:16:21", "03:06:42:00", "44 Towpath"},
    {"03:06:42:00", "03:09:22:19", "45 Harbour office"},
    {"03:09:22:19", "03:10:46:14", "46 Quay, night"},
    {"03:10:46:14", "03:12:04:20", "47 River, chase"},
    {"03:12:04:20", "03:13:02:18", "48 Hold"},
    {"03:13:02:18", "03:13:48:05", "49 Weir gives way"},
    {"03:13:48:05", ProgrammeEnd, "50 Kitchen, morning"},
}};

/// The faders of the dialogue, line by line, in turns.
constexpr std::array<double, 7> LineLevels{0.75, 0.72, 0.78, 0.70, 0.76, 0.66, 0.74};
/// How long an atmosphere is drawn in and out, in turns.
constexpr std::array<Quarters, 3> FadesIn{frames(30), frames(54), frames(40)};
constexpr std::array<Quarters, 4> FadesOut{frames(48), frames(36), frames(66), frames(42)};

std::u16string wideName(const std::string& name)
{
    return cadrel::util::HostString(StringUtil::toWide(name)).utf16();
}

/// The project while it is made.
class Reel {
public:
    explicit Reel(ChangeLog& log) : m_project(makeCounted<Project>(log)) {}

    const Project& project() const { return *m_project; }

    void make(const EventList& picture)
    {
        m_project->setTimeOrigin(3 * Hour);
        m_project->setFrameRate({24.0, 0});
        m_project->setProjectEnd(toSeconds(parseTime("03:16:00:00")));
        setTime(m_project->locatorLeft(), "03:02:25:03");
        setTime(m_project->locatorRight(), "03:02:50:10");
        setTime(m_project->cycleLeft(), "03:07:03:07");
        setTime(m_project->cycleRight(), "03:07:24:17");
        setTime(m_project->position(), "03:02:25:03");

        addTrack(Track::Kind::Ruler, "Timecode", *m_project);
        layPicture();
        layScenes();
        layDialogueTracks(picture);
        for (const CueTrack& cueTrack : cueTracks())
            layCues(cueTrack);
        layMemos();
        drawAtmospheres("ATM 1", firstAtmosphereLevels());
        drawAtmospheres("ATM 2", secondAtmosphereLevels());
        for (const Ride& ride : rides()) {
            for (const Move& move : ride.moves)
                addPoint(*m_tracks.at(ride.track), ride.curve, parseTime(move.at), move.value);
        }
    }

private:
    static void setTime(Parameter& parameter, const char* timecode)
    {
        parameter.setValue(0, toSeconds(parseTime(timecode)));
    }

    Track& addTrack(Track::Kind kind, const std::string& name, Container& parent)
    {
        const Counted<Track> track = Track::create(kind);
        track->setName(wideName(name));
        track->insertInto(parent);
        m_tracks[name] = track.get();
        return *track;
    }

    Track& folder(const std::string& name)
    {
        const auto found = m_tracks.find(name);
        return found != m_tracks.end() ? *found->second : addTrack(Track::Kind::Folder, name, *m_project);
    }

    static void setRole(Track& track, const char* key, int role)
    {
        track.setAttribute(key, Attribute{Velmark::int64{role}, true});
    }

    /// The file in the pool. It is made long enough; that of a whole cut is just as long.
    Counted<MediaClip> fileOf(const std::string& path, Quarters length, bool isWholeCut)
    {
        Counted<MediaClip>& clip = m_files[path];
        const auto kind = path.ends_with(".mov") ? MediaClip::Kind::Video : MediaClip::Kind::Audio;
        const double seconds = isWholeCut ? toSeconds(length) : std::ceil(toSeconds(length)) + 2.0;
        if (!clip) {
            clip = makeCounted<MediaClip>(kind, wideName(path), seconds);
            m_project->pool().add(clip);
        } else if (clip->seconds() < seconds) {
            clip->setSpan(0.0, seconds);
        }
        return clip;
    }

    void addClip(Container& parent, const std::string& name, const std::string& path, Quarters in, Quarters out,
                 Quarters from, bool isWholeCut = false)
    {
        if (in < 0 || out <= in || from < 0)
            throw std::logic_error(name + " can't be laid");
        const auto clip = makeCounted<ClipEvent>();
        clip->setName(wideName(name));
        clip->setClip(fileOf(path, from + (out - in), isWholeCut));
        clip->setSourceOffset(toSeconds(from));
        clip->setSpan(toSeconds(in), toSeconds(out));
        clip->insertInto(parent);
    }

    void addCues(Container& parent, const std::string& folderName, Quarters origin, const std::vector<Cue>& cues)
    {
        for (const Cue& cue : cues) {
            const Quarters in = parseQuarters(cue.in) - origin;
            addClip(parent, cue.name, "Audio/" + folderName + "/" + cue.file + ".wav", in,
                    in + parseQuarters(cue.length), parseQuarters(cue.from));
        }
    }

    void addGroups(Container& parent, const std::string& folderName, Quarters origin, const std::vector<Group>& groups)
    {
        for (const Group& group : groups) {
            const Quarters in = parseQuarters(group.in) - origin;
            const auto part = makeCounted<Part>();
            part->setName(wideName(group.name));
            part->setSpan(toSeconds(in), toSeconds(in + parseQuarters(group.length)));
            part->insertInto(parent);
            addCues(*part, folderName, 0, group.cues);
            addGroups(*part, folderName, 0, group.groups);
        }
    }

    /// Clips that follow one another on a track must not overlap.
    static void checkOrder(const Track& track)
    {
        for (const Node* node = track.firstChild(); node; node = track.childBehind(*node)) {
            const Node* const next = track.childBehind(*node);
            if (next && next->start() < node->end())
                throw std::logic_error(StringUtil::toUtf8(cadrel::util::HostString(next->name()).wide()) +
                                       " overlaps what stands before it");
        }
    }

    static void addPoint(Track& track, Envelope::Curve::Number curve, Quarters at, double value)
    {
        const auto point = makeCounted<AutomationPoint>();
        point->setSpan(toSeconds(at), toSeconds(at));
        point->setValue(value);
        point->insertInto(track.curve(curve));
    }

    static void addMarker(Track& track, const std::string& name, Quarters in, Quarters out, bool isRange, int userId)
    {
        const auto marker = makeCounted<Marker>(isRange);
        marker->setName(wideName(name));
        marker->setSpan(toSeconds(in), toSeconds(out));
        if (userId != 0)
            marker->setAttribute(AttributeKey::EventUserId, Attribute{Velmark::int64{userId}, true});
        marker->insertInto(track);
    }

    /// The picture of the old cut and the sound that came with it, both locked: they are what all else was laid to.
    void layPicture()
    {
        const Quarters end = parseTime(ProgrammeEnd);
        Track& video = addTrack(Track::Kind::Video, "Old Video", folder("Picture"));
        setRole(video, AttributeKey::VideoType, 10);
        addClip(video, "Lantern Weir R3 v07", "Video/LW_R3_v07.mov", 0, end, 0, true);
        video.setLocked(true);
        Track& guide = addTrack(Track::Kind::Audio, "Guide", folder("Picture"));
        addClip(guide, "Lantern Weir R3 v07 guide", "Audio/Guide/LW_R3_v07_guide.wav", 0, end, 0, true);
        guide.setLocked(true);
    }

    void layScenes()
    {
        Track& track = addTrack(Track::Kind::Marker, "Scenes", *m_project);
        for (const Scene& scene : Scenes)
            addMarker(track, scene.name, parseTime(scene.in), parseTime(scene.out), true, 0);
    }

    void layDialogueTracks(const EventList& picture)
    {
        const DialogueTracks dialogue = layDialogue(picture);
        for (std::size_t index = 0; index < dialogue.size(); ++index) {
            Track& track = addTrack(Track::Kind::Audio, "DIA " + std::to_string(index + 1), folder("Dialogue"));
            for (std::size_t line = 0; line < dialogue[index].size(); ++line) {
                const DialogueClip& clip = dialogue[index][line];
                addClip(track, clip.name, "Audio/" + clip.file + ".wav", clip.in, clip.out, clip.from);
                const double level = LineLevels.at((line + 3 * index) % LineLevels.size());
                addPoint(track, Envelope::Curve::Volume, clip.in + frames(3), level);
                addPoint(track, Envelope::Curve::Volume, clip.out - frames(3), level);
            }
            checkOrder(track);
        }
        m_tracks.at("DIA 1")->setSelected(true);
    }

    void layCues(const CueTrack& cueTrack)
    {
        Track& track = addTrack(Track::Kind::Audio, cueTrack.name, folder(cueTrack.folder));
        const Quarters origin = parseQuarters("03:00:00:00");
        addCues(track, cueTrack.folder, origin, cueTrack.cues);
        addGroups(track, cueTrack.folder, origin, cueTrack.groups);
        checkOrder(track);
    }

    void layMemos()
    {
        Track& markers = folder("Cadrel Markers");
        setRole(markers, AttributeKey::FolderType, 9);
        Track& track = addTrack(Track::Kind::Marker, "Memos", markers);
        setRole(track, AttributeKey::MarkerType, 7);
        for (const Memo& memo : Memos) {
            const Quarters in = parseTime(memo.at);
            addMarker(track, memo.text, in, memo.until ? parseTime(memo.until) : in, memo.until != nullptr,
                      memo.userId);
        }
    }

    /// Each clip comes from silence, stays at its level and goes.
    void drawAtmospheres(const std::string& trackName, const std::vector<double>& levels)
    {
        Track& track = *m_tracks.at(trackName);
        std::size_t index = 0;
        for (const Node* clip = track.firstChild(); clip; clip = track.childBehind(*clip), ++index) {
            const auto in = std::lround(clip->start() * QuartersOfASecond);
            const auto out = std::lround(clip->end() * QuartersOfASecond);
            const double level = levels.at(index);
            addPoint(track, Envelope::Curve::Volume, in, 0.0);
            addPoint(track, Envelope::Curve::Volume, in + FadesIn.at(index % FadesIn.size()), level);
            addPoint(track, Envelope::Curve::Volume, out - FadesOut.at(index % FadesOut.size()), level);
            addPoint(track, Envelope::Curve::Volume, out, 0.0);
        }
    }

    Counted<Project> m_project;
    std::map<std::string, Track*> m_tracks;
    std::map<std::string, Counted<MediaClip>> m_files;
};

void makeProject(const std::string& edl, const std::string& projectFile)
{
    const EventList picture = readCut(edl);
    ChangeLog log;
    Reel reel(log);
    reel.make(picture);
    ProjectFile::write(reel.project(), projectFile);
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::cerr << "make_reel3: give the EDL of the old cut and the name of the project file\n";
        return 2;
    }
    const EdlSetting setting;
    try {
        makeProject(argv[1], argv[2]);
        return 0;
    } catch (const cadrel::util::Result::Type&) {
        std::cerr << "make_reel3: " << argv[1] << ": can't be read\n";
    } catch (const std::exception& exception) {
        std::cerr << "make_reel3: " << exception.what() << '\n';
    }
    return 1;
}
