// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ProjectComparison.h"

#include "app/apply/ProgrammeShift.h"

#include <algorithm>
#include <cmath>
#include <iterator>
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
        for (Fate& fate : fates)
            m_groups[keyOf(fate.before)].emplace(syncOf(fate.before), &fate);
    }

    /// What stood `shift` earlier and holds the piece; of clips else the one nearest to that. Nothing when there is none.
    /// Without a shift nothing goes to where the piece stands, unless a clip hangs over.
    std::optional<Origin> find(const Placement& now, std::optional<double> shift) const
    {
        const auto group = m_groups.find(keyOf(now));
        if (group == m_groups.end())
            return std::nullopt;
        if (now.kind == Placement::Kind::Clip)
            return nearestClip(group->second, now, shift.value_or(0.0));
        return shift ? markerAt(group->second, now, *shift) : std::nullopt;
    }

private:
    using Key = std::tuple<Placement::Kind, const standin::MediaClip*, std::u16string>;
    using Sources = std::multimap<double, Fate*>;

    static Key keyOf(const Placement& placement) { return {placement.kind, placement.clip, placement.name}; }
    /// Where the clip would begin if all of it were there.
    static double syncOf(const Placement& placement) { return placement.start - placement.offset; }
    static bool holds(const Placement& before, const Piece& piece)
    {
        return !isShorterThan(piece.from, 0.0) && !isShorterThan(before.length(), piece.from + piece.now.length());
    }

    /// A piece of a marker doesn't say how far into the marker it begins, so only the shift is used.
    static std::optional<Origin> markerAt(const Sources& sources, const Placement& now, double shift)
    {
        const double start = now.start - shift;
        for (auto behind = sources.upper_bound(start + SameInstant); behind != sources.begin();) {
            Fate* const fate = (--behind)->second;
            const Piece piece{now, start - fate->before.start, shift};
            if (holds(fate->before, piece))
                return Origin{fate, piece};
        }
        return std::nullopt;
    }

    static std::optional<Origin> nearestClip(const Sources& sources, const Placement& now, double shift)
    {
        const double expected = syncOf(now) - shift;
        auto right = sources.lower_bound(expected);
        auto left = right;
        while (left != sources.begin() || right != sources.end()) {
            const bool goesLeft =
                right == sources.end() ||
                (left != sources.begin() && expected - std::prev(left)->first <= right->first - expected);
            const auto& [sync, fate] = goesLeft ? *--left : *right++;
            const Piece piece{now, now.offset - fate->before.offset, syncOf(now) - sync};
            if (holds(fate->before, piece))
                return Origin{fate, piece};
        }
        return std::nullopt;
    }

    std::map<Key, Sources> m_groups;
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
