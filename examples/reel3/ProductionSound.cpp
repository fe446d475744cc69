// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/reel3/ProductionSound.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/time/Framerate.h"
#include "core/time/Timecode.h"
#include "examples/reel3/SoundCues.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <string_view>
#include <utility>

namespace reel3 {

using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::core::Framerate;
using cadrel::core::Timecode;

namespace {

/// Who is heard in a shot, and on which track.
struct Voice {
    const char* shot;
    const char* speaker;
    std::size_t track;
};

constexpr std::array<Voice, 26> Voices{{
    {"42", "Maren, Tobias", 2}, {"42A", "Maren", 0},  {"42B", "Tobias", 1},    {"42C", "Tobias", 1},
    {"42D", "both", 2},         {"43A", "Tobias", 1}, {"44", "Maren, Pip", 2}, {"44A", "Maren", 0},
    {"44B", "Pip", 1},          {"44C", "both", 2},   {"45", "Dreyl, all", 2}, {"45A", "Maren", 0},
    {"45B", "Dreyl", 1},        {"45C", "clerk", 2},  {"45D", "Dreyl", 1},     {"45E", "Maren", 0},
    {"46A", "Maren, low", 0},   {"47A", "Maren", 0},  {"47B", "Pip", 1},       {"47D", "men", 2},
    {"48A", "Maren", 0},        {"48B", "Pip", 1},    {"49", "Tobias", 1},     {"50A", "Maren", 0},
    {"50B", "Tobias", 1},       {"50D", "Maren", 0},
}};

/// How far the ends reach over the picture cut, in turns.
constexpr std::array<Quarters, 13> Heads{28, 64, 13, 112, 44, 21, 176, 8, 77, 36, 132, 18, 52};
constexpr std::array<Quarters, 12> Tails{48, 16, 90, 33, 148, 12, 60, 216, 25, 40, 104, 20};
/// How far from the picture cut two pieces meet that would both reach over it.
constexpr std::array<Quarters, 5> Rolls{-20, 24, 9, -36, 14};
/// The hole in a long shot: where it is, in percent of the shot, and how long.
constexpr std::array<Quarters, 4> HolePlaces{46, 57, 38, 51};
constexpr std::array<Quarters, 4> HoleLengths{72, 118, 88, 161};
constexpr Quarters LongShot = frames(9 * 24);

/// The recorder runs this long before the first frame that is used.
constexpr Quarters RunUp = frames(15 * 24);

template <std::size_t Size>
Quarters turn(const std::array<Quarters, Size>& values, std::size_t count)
{
    return values[count % Size];
}

/// A stretch of programme in which production sound is wanted, and the clock of its recording at its start.
struct Stretch {
    Quarters in;
    Quarters out;
    Quarters source;
    std::string name;
    std::string file;
    std::size_t track;
    Quarters head; ///< how far it may reach out at its start
    Quarters tail;
    bool isFixed = false; ///< laid by hand
};

Quarters countOf(const Timecode& timecode)
{
    return frames(timecode.toFrameCount(Framerate(24, 0)));
}

const Voice* voiceOf(std::string_view shot)
{
    const auto voice =
        std::find_if(Voices.begin(), Voices.end(), [shot](const Voice& candidate) { return shot == candidate.shot; });
    return voice == Voices.end() ? nullptr : &*voice;
}

/// "42A-3 MAREN MCU" and a roll of the 14th of March 2025: "250314/42A-T03".
std::string fileOf(const EventBase& event, std::string_view shot, std::string_view take)
{
    const std::string roll = event.rollName();
    return "Production/" + roll.substr(roll.find('_') + 1, 6) + "/" + std::string(shot) + "-T0" + std::string(take);
}

/// The shots in which somebody is heard. Of an add edit both sides are one shot.
std::vector<Stretch> shotsWithVoices(const EventList& picture)
{
    std::vector<Stretch> shots;
    for (const auto& event : picture.events()) {
        const std::string clip = event->clipName();
        const std::string shot = clip.substr(0, clip.find('-'));
        const Voice* voice = voiceOf(shot);
        const Quarters in = countOf(event->dstIn()) - parseQuarters("03:00:00:00");
        const Quarters out = countOf(event->dstOut()) - parseQuarters("03:00:00:00");
        if (!voice || in == out || !event->isNormalSpeed())
            continue;
        const std::string take = clip.substr(shot.size() + 1, 1);
        const Quarters source = countOf(event->srcIn());
        const std::string file = fileOf(*event, shot, take);
        if (!shots.empty()) {
            Stretch& former = shots.back();
            if (former.file == file && former.out == in && former.source + (former.out - former.in) == source) {
                former.out = out;
                continue;
            }
        }
        shots.push_back({in, out, source, shot + "-" + take + " " + voice->speaker, file, voice->track, 0, 0});
    }
    return shots;
}

/// Takes the noise out of the middle of long shots, and says how far the pieces may reach out.
std::vector<Stretch> toPieces(const std::vector<Stretch>& shots)
{
    std::vector<Stretch> pieces;
    for (std::size_t index = 0; index < shots.size(); ++index) {
        Stretch piece = shots[index];
        piece.head = turn(Heads, index);
        piece.tail = turn(Tails, index);
        const Quarters length = piece.out - piece.in;
        if (length < LongShot) {
            pieces.push_back(piece);
            continue;
        }
        Stretch second = piece;
        const Quarters hole = length * turn(HolePlaces, index) / 100;
        piece.out = piece.in + hole;
        piece.tail = 0;
        second.in = piece.out + turn(HoleLengths, index);
        second.source += second.in - piece.in;
        second.head = 0;
        pieces.push_back(piece);
        pieces.push_back(second);
    }
    return pieces;
}

std::vector<Stretch> handLaid()
{
    std::vector<Stretch> pieces;
    for (const Cue& cue : dialogueCues()) {
        const Quarters in = parseTime(cue.in);
        pieces.push_back({in, in + parseQuarters(cue.length), parseQuarters(cue.from), cue.name,
                          std::string("Dialogue/") + cue.file, DialogueTrackCount - 1, 0, 0, true});
    }
    return pieces;
}

/// Where two pieces of one track meet that both reach out to one another.
Quarters meetingOf(const Stretch& left, const Stretch& right, std::size_t count)
{
    if (left.isFixed)
        return left.out;
    if (right.isFixed)
        return right.in;
    return left.out == right.in ? left.out + turn(Rolls, count) : (left.out + right.in) / 2;
}

/// Draws the ends out; the pieces are those of one track in order.
std::vector<DialogueClip> drawOut(const std::vector<Stretch>& pieces, const std::map<std::string, Quarters>& fileStarts)
{
    std::vector<DialogueClip> clips;
    Quarters earliest = 0;
    for (std::size_t index = 0; index < pieces.size(); ++index) {
        const Stretch& piece = pieces[index];
        const Quarters in = std::max(piece.in - piece.head, earliest);
        Quarters out = piece.out + piece.tail;
        earliest = out;
        if (index + 1 < pieces.size() && out > pieces[index + 1].in - pieces[index + 1].head)
            out = earliest = meetingOf(piece, pieces[index + 1], index);
        const Quarters source = piece.source + (in - piece.in);
        const auto fileStart = fileStarts.find(piece.file);
        clips.push_back(
            {in, out, piece.name, piece.file, fileStart == fileStarts.end() ? source : source - fileStart->second});
    }
    return clips;
}

} // namespace

DialogueTracks layDialogue(const EventList& picture)
{
    const std::vector<Stretch> shots = shotsWithVoices(picture);
    std::map<std::string, Quarters> fileStarts;
    for (const Stretch& shot : shots) {
        const Quarters start = (shot.source - RunUp) / frames(24) * frames(24);
        const auto [found, isNew] = fileStarts.emplace(shot.file, start);
        if (!isNew)
            found->second = std::min(found->second, start);
    }
    std::vector<Stretch> pieces = toPieces(shots);
    for (Stretch& piece : handLaid())
        pieces.push_back(std::move(piece));
    std::stable_sort(pieces.begin(), pieces.end(), [](const Stretch& a, const Stretch& b) { return a.in < b.in; });

    DialogueTracks tracks;
    for (std::size_t track = 0; track < DialogueTrackCount; ++track) {
        std::vector<Stretch> own;
        std::copy_if(pieces.begin(), pieces.end(), std::back_inserter(own),
                     [track](const Stretch& piece) { return piece.track == track; });
        tracks[track] = drawOut(own, fileStarts);
    }
    return tracks;
}

} // namespace reel3
