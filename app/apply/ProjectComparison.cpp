// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ProjectComparison.h"

#include "app/apply/ProgrammeShift.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>
#include <optional>
#include <tuple>
#include <utility>

namespace cadrel::app {

using standin::SameInstant;
using standin::Track;

namespace {

void addContent(const standin::Container& container, double start, const std::u16string& part,
                std::vector<Placement>& content)
{
    visitEvents(container, start, 0, [&](const PlacedEvent& placed) {
        if (dynamic_cast<const standin::Part*>(&placed.event)) {
            addContent(placed.event, placed.start, placed.event.name(), content);
            return;
        }
        Placement placement{Placement::Kind::Clip, nullptr, placed.event.name(), part, placed.start, placed.end, 0.0};
        if (const auto* clipEvent = dynamic_cast<const standin::ClipEvent*>(&placed.event)) {
            placement.clip = clipEvent->clip();
            placement.offset = clipEvent->sourceOffset();
        } else {
            const bool isRange = static_cast<const standin::Marker&>(placed.event).isRange();
            placement.kind = isRange ? Placement::Kind::Range : Placement::Kind::Point;
        }
        content.push_back(std::move(placement));
    });
}

std::vector<Placement> contentOf(const Track& track)
{
    std::vector<Placement> content;
    addContent(track, 0.0, {}, content);
    std::stable_sort(content.begin(), content.end(),
                     [](const Placement& a, const Placement& b) { return a.start < b.start; });
    return content;
}

/// The time origin is added to times and subtracted again, which rounds them.
bool isShorterThan(double a, double b)
{
    return b - a > SameInstant;
}

/// Seconds, or 0 for what is no longer than an instant.
double orNothing(double seconds)
{
    return isShorterThan(0.0, seconds) ? seconds : 0.0;
}

/// Stretches of one line, of which those that hold another are found without a walk over all.
class Stretches {
public:
    void add(double start, Fate& fate) { m_stretches.push_back({start, start + fate.before.length(), 0.0, &fate}); }
    /// Before anything is looked for. Those that start together keep their order.
    void sort()
    {
        std::stable_sort(m_stretches.begin(), m_stretches.end(),
                         [](const Stretch& a, const Stretch& b) { return a.start < b.start; });
        double reach = std::numeric_limits<double>::lowest();
        for (Stretch& stretch : m_stretches)
            stretch.reach = reach = std::max(reach, stretch.end);
    }
    /// Of those that hold the stretch, the last; null without one.
    Fate* holding(double start, double end) const
    {
        auto after = std::partition_point(m_stretches.begin(), m_stretches.end(), [start](const Stretch& stretch) {
            return !isShorterThan(start, stretch.start);
        });
        while (after != m_stretches.begin() && !isShorterThan((--after)->reach, end)) {
            if (!isShorterThan(after->end, end))
                return after->fate;
        }
        return nullptr;
    }

private:
    struct Stretch {
        double start;
        double end;
        double reach; ///< the latest end up to here
        Fate* fate;
    };

    std::vector<Stretch> m_stretches;
};

/// Finds the former clip or marker of a track from which a piece has come.
class Origins {
public:
    struct Origin {
        Fate* fate;
        Piece piece;
    };

    /// The fates must not move in memory while this is used.
    explicit Origins(std::vector<Fate>& fates)
    {
        std::map<Key, std::vector<Fate*>> groups;
        for (Fate& fate : fates)
            groups[keyOf(fate.before)].push_back(&fate);
        for (auto& [key, group] : groups) {
            if (std::get<Placement::Kind>(key) == Placement::Kind::Clip)
                m_clips.emplace(key, linesOf(std::move(group)));
            else
                m_markers.emplace(key, byStart(group));
        }
    }

    /// What stood `shift` earlier and holds the piece; of clips else the one nearest to that. Nothing when there is none.
    /// Without a shift nothing goes to where the piece stands, unless a clip hangs over.
    std::optional<Origin> find(const Placement& now, std::optional<double> shift) const
    {
        if (now.kind == Placement::Kind::Clip)
            return nearestClip(now, shift.value_or(0.0));
        return shift ? markerAt(now, *shift) : std::nullopt;
    }

private:
    using Key = std::tuple<Placement::Kind, const standin::MediaClip*, std::u16string>;
    /// The clips that are in sync with one another, by where they begin in their file.
    struct Line {
        double sync;
        Stretches clips;
    };

    static Key keyOf(const Placement& placement) { return {placement.kind, placement.clip, placement.name}; }
    /// Where the clip would begin if all of it were there.
    static double syncOf(const Placement& placement) { return placement.start - placement.offset; }

    static Stretches byStart(const std::vector<Fate*>& markers)
    {
        Stretches stretches;
        for (Fate* const fate : markers)
            stretches.add(fate->before.start, *fate);
        stretches.sort();
        return stretches;
    }

    static std::vector<Line> linesOf(std::vector<Fate*> clips)
    {
        // Of clips that are alike in everything the first is to be found.
        std::reverse(clips.begin(), clips.end());
        std::stable_sort(clips.begin(), clips.end(),
                         [](const Fate* a, const Fate* b) { return syncOf(a->before) < syncOf(b->before); });
        std::vector<Line> lines;
        for (Fate* const fate : clips) {
            if (lines.empty() || isShorterThan(lines.back().sync, syncOf(fate->before)))
                lines.push_back({syncOf(fate->before), {}});
            lines.back().clips.add(fate->before.offset, *fate);
        }
        for (Line& line : lines)
            line.clips.sort();
        return lines;
    }

    /// A piece of a marker doesn't say how far into the marker it begins, so only the shift is used.
    std::optional<Origin> markerAt(const Placement& now, double shift) const
    {
        const auto group = m_markers.find(keyOf(now));
        const double start = now.start - shift;
        Fate* const fate = group == m_markers.end() ? nullptr : group->second.holding(start, start + now.length());
        if (!fate)
            return std::nullopt;
        return Origin{fate, {now, start - fate->before.start, shift}};
    }

    std::optional<Origin> nearestClip(const Placement& now, double shift) const
    {
        const auto group = m_clips.find(keyOf(now));
        if (group == m_clips.end())
            return std::nullopt;
        const std::vector<Line>& lines = group->second;
        const double expected = syncOf(now) - shift;
        auto right = std::partition_point(lines.begin(), lines.end(),
                                          [expected](const Line& line) { return line.sync < expected; });
        auto left = right;
        while (left != lines.begin() || right != lines.end()) {
            const bool goesLeft = right == lines.end() ||
                                  (left != lines.begin() && expected - std::prev(left)->sync <= right->sync - expected);
            const Line& line = goesLeft ? *--left : *right++;
            if (Fate* const fate = line.clips.holding(now.offset, now.offset + now.length()))
                return Origin{fate, {now, now.offset - fate->before.offset, syncOf(now) - syncOf(fate->before)}};
        }
        return std::nullopt;
    }

    std::map<Key, std::vector<Line>> m_clips;
    std::map<Key, Stretches> m_markers;
};

/// A run carries nothing to the same place twice, so the second of two equal markers there is new.
bool isThere(const Piece& piece, const std::vector<Piece>& pieces)
{
    return std::any_of(pieces.begin(), pieces.end(), [&piece](const Piece& other) {
        return std::abs(piece.from - other.from) <= SameInstant && std::abs(piece.shift - other.shift) <= SameInstant;
    });
}

/// Sums up what the pieces say.
void judge(Fate& fate)
{
    if (fate.isLost())
        return;
    std::vector<const Piece*> pieces;
    for (const Piece& piece : fate.pieces)
        pieces.push_back(&piece);
    std::stable_sort(pieces.begin(), pieces.end(), [](const Piece* a, const Piece* b) { return a->from < b->from; });

    fate.lostAtStart = orNothing(pieces.front()->from);
    double reached = pieces.front()->from;
    for (const Piece* const piece : pieces) {
        const bool isFirst = piece == pieces.front();
        const double end = piece->from + piece->now.length();
        fate.isMoved = fate.isMoved || std::abs(piece->shift) > SameInstant;
        if (!isFirst && !isShorterThan(piece->from, reached) && isShorterThan(0.0, fate.before.length()))
            fate.isSplit = true;
        else if (!isFirst)
            fate.isDoubled = true;
        fate.lostBetween += orNothing(piece->from - reached);
        reached = std::max(reached, end);
    }
    fate.lostAtEnd = orNothing(fate.before.length() - reached);
}

TrackComparison compareTrack(const Track& track, const std::vector<Placement>& before, const ProgrammeShift& shift)
{
    TrackComparison comparison{&track, {}, {}};
    for (const Placement& placement : before)
        comparison.fates.push_back({placement, {}});
    std::vector<Placement> after = contentOf(track);
    if (after == before) {
        // A clip that is where it was hasn't come from an equal clip at the place that was carried over to here.
        for (std::size_t index = 0; index < after.size(); ++index)
            comparison.fates[index].pieces.push_back({after[index]});
        return comparison;
    }
    const Origins origins(comparison.fates);
    for (Placement& now : after) {
        // A stretch begins at its first instant, give or take; a piece of it lies in it with its middle.
        const double place = now.length() > 0.0 ? (now.start + now.end) / 2 : now.start + SameInstant;
        const auto origin = origins.find(now, shift.at(place));
        if (origin && !isThere(origin->piece, origin->fate->pieces))
            origin->fate->pieces.push_back(origin->piece);
        else
            comparison.added.push_back(std::move(now));
    }
    for (Fate& fate : comparison.fates)
        judge(fate);
    return comparison;
}

} // namespace

ProjectState stateOf(const standin::Project& project)
{
    ProjectState state;
    for (const Track* const track : tracksOf(project)) {
        if (!track->isFolder())
            state.emplace(track, contentOf(*track));
    }
    return state;
}

std::vector<TrackComparison> compare(const ProjectState& before, const standin::Project& after,
                                     const ProgrammeShift& shift)
{
    std::vector<TrackComparison> comparisons;
    for (const Track* const track : tracksOf(after)) {
        if (track->isFolder())
            continue;
        const auto former = before.find(track);
        comparisons.push_back(
            compareTrack(*track, former == before.end() ? std::vector<Placement>() : former->second, shift));
    }
    return comparisons;
}

} // namespace cadrel::app
