// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ProjectComparison.h"

#include "core/cut/ProgrammeShift.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstddef>
#include <iterator>
#include <limits>
#include <optional>
#include <set>
#include <tuple>
#include <utility>

namespace cadrel::app {

using core::ProgrammeShift;
using core::SoundChangeKind;
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

/// Finds one of many values without a walk over all, by what is known of halves, quarters and so on of their row.
template <class Value>
class Halves {
public:
    /// `valueOf` gives the value at an index, and `join` what is known of two neighbouring stretches of the row together.
    template <class ValueOf, class Join>
    void build(std::size_t count, ValueOf valueOf, Join join)
    {
        m_count = count;
        m_values.resize(2 * std::bit_ceil(count));
        if (count != 0)
            fill({1, 0, count}, valueOf, join);
    }
    /// The first or the last index from `from` to before `to` whose value `fits`. What is joined has to fit just when
    /// one of its values does.
    template <class Fits>
    std::optional<std::size_t> first(std::size_t from, std::size_t to, Fits fits) const
    {
        return from < to ? seek({1, 0, m_count}, from, to, true, fits) : std::nullopt;
    }
    template <class Fits>
    std::optional<std::size_t> last(std::size_t from, std::size_t to, Fits fits) const
    {
        return from < to ? seek({1, 0, m_count}, from, to, false, fits) : std::nullopt;
    }

private:
    struct Node {
        std::size_t number;
        std::size_t begin;
        std::size_t end;

        bool isSingle() const { return end - begin == 1; }
        std::size_t middle() const { return begin + (end - begin) / 2; }
        Node left() const { return {2 * number, begin, middle()}; }
        Node right() const { return {2 * number + 1, middle(), end}; }
    };

    template <class ValueOf, class Join>
    void fill(const Node& node, ValueOf& valueOf, Join& join)
    {
        if (node.isSingle()) {
            m_values[node.number] = valueOf(node.begin);
            return;
        }
        fill(node.left(), valueOf, join);
        fill(node.right(), valueOf, join);
        m_values[node.number] = join(m_values[node.left().number], m_values[node.right().number]);
    }
    template <class Fits>
    std::optional<std::size_t> seek(const Node& node, std::size_t from, std::size_t to, bool fromLeft,
                                    const Fits& fits) const
    {
        if (node.end <= from || to <= node.begin || !fits(m_values[node.number]))
            return std::nullopt;
        if (node.isSingle())
            return node.begin;
        const auto found = seek(fromLeft ? node.left() : node.right(), from, to, fromLeft, fits);
        return found ? found : seek(fromLeft ? node.right() : node.left(), from, to, fromLeft, fits);
    }

    std::size_t m_count = 0;
    std::vector<Value> m_values;
};

/// Stretches of one line, of which those that hold another are found without a walk over all.
class Stretches {
public:
    void add(double start, Fate& fate) { m_stretches.push_back({start, start + fate.before.length(), &fate}); }
    /// Before anything is looked for. Those that start together keep their order.
    void sort()
    {
        std::stable_sort(m_stretches.begin(), m_stretches.end(),
                         [](const Stretch& a, const Stretch& b) { return a.start < b.start; });
        m_ends.build(
            m_stretches.size(), [this](std::size_t index) { return m_stretches[index].end; },
            [](double a, double b) { return std::max(a, b); });
    }
    /// Of those that hold the stretch, the last; null without one.
    Fate* holding(double start, double end) const
    {
        const auto after =
            std::partition_point(m_stretches.begin(), m_stretches.end(),
                                 [start](const Stretch& stretch) { return !isShorterThan(start, stretch.start); });
        const auto found = m_ends.last(0, static_cast<std::size_t>(after - m_stretches.begin()),
                                       [end](double latest) { return !isShorterThan(latest, end); });
        return found ? m_stretches[*found].fate : nullptr;
    }

private:
    friend class Reach;
    struct Stretch {
        double start;
        double end;
        Fate* fate;
    };

    std::vector<Stretch> m_stretches;
    Halves<double> m_ends; ///< the latest ones
};

/// How far those stretches reach that have started by a time, to tell whether one of them holds another.
class Reach {
public:
    Reach() = default;
    /// Of sorted stretches.
    explicit Reach(const Stretches& stretches)
    {
        for (const auto& stretch : stretches.m_stretches)
            add({stretch.start, stretch.end});
    }
    Reach(const Reach& a, const Reach& b)
    {
        std::vector<Step> steps;
        std::merge(a.m_steps.begin(), a.m_steps.end(), b.m_steps.begin(), b.m_steps.end(), std::back_inserter(steps),
                   [](const Step& left, const Step& right) { return left.start < right.start; });
        for (const Step& step : steps)
            add(step);
    }
    bool holds(double start, double end) const
    {
        const auto after = std::partition_point(
            m_steps.begin(), m_steps.end(), [start](const Step& step) { return !isShorterThan(start, step.start); });
        return after != m_steps.begin() && !isShorterThan(std::prev(after)->end, end);
    }

private:
    struct Step {
        double start;
        double end; ///< the latest up to here
    };

    void add(const Step& step)
    {
        if (m_steps.empty() || m_steps.back().end < step.end)
            m_steps.push_back(step);
    }

    std::vector<Step> m_steps; ///< where the reach grows
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
    struct Lines {
        std::vector<Line> sorted;
        Halves<Reach> reaches;
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

    static Lines linesOf(std::vector<Fate*> clips)
    {
        // Of clips that are alike in everything the first is to be found.
        std::reverse(clips.begin(), clips.end());
        std::stable_sort(clips.begin(), clips.end(),
                         [](const Fate* a, const Fate* b) { return syncOf(a->before) < syncOf(b->before); });
        Lines found;
        std::vector<Line>& lines = found.sorted;
        for (Fate* const fate : clips) {
            if (lines.empty() || isShorterThan(lines.back().sync, syncOf(fate->before)))
                lines.push_back({syncOf(fate->before), {}});
            lines.back().clips.add(fate->before.offset, *fate);
        }
        for (Line& line : lines)
            line.clips.sort();
        found.reaches.build(
            lines.size(), [&lines](std::size_t index) { return Reach(lines[index].clips); },
            [](const Reach& a, const Reach& b) { return Reach(a, b); });
        return found;
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
        const std::vector<Line>& lines = group->second.sorted;
        const Halves<Reach>& reaches = group->second.reaches;
        const double expected = syncOf(now) - shift;
        const double end = now.offset + now.length();
        const auto holds = [&](const Reach& reach) { return reach.holds(now.offset, end); };
        const auto middle = static_cast<std::size_t>(
            std::partition_point(lines.begin(), lines.end(),
                                 [expected](const Line& line) { return line.sync < expected; }) -
            lines.begin());
        const auto left = reaches.last(0, middle, holds);
        const auto right = reaches.first(middle, lines.size(), holds);
        if (!left && !right)
            return std::nullopt;
        const bool goesLeft = !right || (left && expected - lines[*left].sync <= lines[*right].sync - expected);
        Fate& fate = *lines[goesLeft ? *left : *right].clips.holding(now.offset, end);
        return Origin{&fate, {now, now.offset - fate.before.offset, syncOf(now) - syncOf(fate.before)}};
    }

    std::map<Key, Lines> m_clips;
    std::map<Key, Stretches> m_markers;
};

/// A run carries nothing to the same place twice, so the second of two equal markers there is new.
class TakenPlaces {
public:
    /// Returns whether the place was free.
    bool take(const Fate& fate, const Piece& piece)
    {
        // Wider than an instant, so that what is nearer than one is in the same band or the next.
        const double band = std::floor(piece.from / (2 * SameInstant));
        for (const double near : {band - 1, band, band + 1}) {
            for (auto place = m_places.lower_bound({&fate, near, piece.shift - 2 * SameInstant, Lowest});
                 place != m_places.end() && place->fate == &fate && place->band == near &&
                 place->shift - piece.shift <= SameInstant;
                 ++place) {
                if (std::abs(piece.from - place->from) <= SameInstant &&
                    std::abs(piece.shift - place->shift) <= SameInstant)
                    return false;
            }
        }
        m_places.insert({&fate, band, piece.shift, piece.from});
        return true;
    }

private:
    static constexpr double Lowest = std::numeric_limits<double>::lowest();
    struct Place {
        const Fate* fate;
        double band;
        double shift;
        double from;

        bool operator<(const Place& other) const
        {
            return std::tie(fate, band, shift, from) < std::tie(other.fate, other.band, other.shift, other.from);
        }
    };

    std::set<Place> m_places;
};

/// Sums up what the pieces say.
void judge(Fate& fate)
{
    for (const Piece& piece : fate.pieces)
        fate.isMoved = fate.isMoved || std::abs(piece.shift) > SameInstant;
    for (const FateChange& change : changesOf(fate)) {
        const double lost = change.to - change.from;
        switch (change.kind) {
        case SoundChangeKind::HeadTrimmed:
            fate.lostAtStart = lost;
            break;
        case SoundChangeKind::TailTrimmed:
            fate.lostAtEnd = lost;
            break;
        case SoundChangeKind::Split:
            fate.isSplit = true;
            fate.lostBetween += lost;
            break;
        case SoundChangeKind::Doubled:
            fate.isDoubled = true;
            break;
        case SoundChangeKind::FellOut:
        case SoundChangeKind::Added:
            break;
        }
    }
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
    TakenPlaces taken;
    for (Placement& now : after) {
        // A stretch begins at its first instant, give or take; a piece of it lies in it with its middle.
        const double place = now.length() > 0.0 ? (now.start + now.end) / 2 : now.start + SameInstant;
        const auto origin = origins.find(now, shift.at(place));
        if (origin && taken.take(*origin->fate, origin->piece))
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

std::vector<FateChange> changesOf(const Fate& fate)
{
    const double length = fate.before.length();
    if (fate.isLost())
        return {{SoundChangeKind::FellOut, 0.0, length}};
    std::vector<const Piece*> pieces;
    for (const Piece& piece : fate.pieces)
        pieces.push_back(&piece);
    std::stable_sort(pieces.begin(), pieces.end(), [](const Piece* a, const Piece* b) { return a->from < b->from; });

    std::vector<FateChange> changes;
    double reached = pieces.front()->from;
    if (orNothing(reached) > 0.0)
        changes.push_back({SoundChangeKind::HeadTrimmed, 0.0, reached});
    for (const Piece* const piece : pieces) {
        if (piece != pieces.front()) {
            if (!isShorterThan(piece->from, reached) && isShorterThan(0.0, length))
                changes.push_back({SoundChangeKind::Split, reached, reached + orNothing(piece->from - reached)});
            else
                changes.push_back({SoundChangeKind::Doubled, piece->from, piece->from, piece});
        }
        reached = std::max(reached, piece->from + piece->now.length());
    }
    if (orNothing(length - reached) > 0.0)
        changes.push_back({SoundChangeKind::TailTrimmed, reached, length});
    return changes;
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
