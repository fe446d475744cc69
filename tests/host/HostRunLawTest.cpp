// SPDX-License-Identifier: GPL-3.0-or-later

// The law of a run, for random projects and films: where a change event lies, each track holds what stood at the source of
// the instant, and elsewhere nothing, with the automation of the end of the stretch before it, and each jump that this has
// brought about is marked; what is no part of the run stays as it was.

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/VideoList.h"
#include "core/time/SecondsRange.h"
#include "core/time/Timecode.h"
#include "host/Host.h"
#include "host/track/TrackRole.h"
#include "standin/Application.h"
#include "standin/base/Times.h"
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "tests/host/RandomRun.h"
#include "tests/support/standin/Heard.h"
#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/String.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using nlohmann::json;
using standin::tests::Heard;

bool isLevelFrom(const standin::Envelope& curve, double time)
{
    for (const standin::AutomationPoint* point = curve.firstPoint(); point; point = curve.pointBehind(*point)) {
        if (point->start() >= time && std::abs(point->value() - *curve.valueBehind(time)) > 1e-6)
            return false;
    }
    return true;
}

/// What each curve that has points comes to or goes on with at an instant.
/// The first or the last of the points of a curve that stand at an instant, by its exact time; else the time itself.
double exactTimeOf(const standin::Envelope& curve, const RandomRun::Side& side)
{
    double exact = side.time;
    for (const standin::Node* point = curve.firstChildFrom(side.time - standin::SameInstant);
         point && point->start() < side.time + standin::SameInstant; point = curve.childBehind(*point)) {
        exact = point->start();
        if (side.isBefore)
            break;
    }
    return exact;
}

std::map<std::int32_t, double> valuesAt(const standin::Track& track, const RandomRun::Side& side)
{
    std::map<std::int32_t, double> values;
    for (const auto& [number, curve] : track.curves()) {
        const double time = exactTimeOf(*curve, side);
        if (const auto value = side.isBefore ? curve->valueBefore(time) : curve->valueBehind(time))
            values[number] = *value;
    }
    return values;
}

bool isNear(const std::map<std::int32_t, double>& a, const std::map<std::int32_t, double>& b)
{
    return std::ranges::equal(
        a, b, [](const auto& x, const auto& y) { return x.first == y.first && std::abs(x.second - y.second) < 1e-6; });
}

bool hasConstantPointFrom(const standin::Track& track, double time)
{
    for (const auto& [number, curve] : track.curves()) {
        if (number == ConstantCurve && curve->lastChild() && curve->lastChild()->start() >= time)
            return true;
    }
    return false;
}

/// Whether a curve that has points runs straight from just behind the one time to just before the other.
bool isStraight(const standin::Envelope& curve, double start, double end)
{
    constexpr double Hair = 1e-4;
    const auto at = [&](double part) {
        return curve.valueBehind(std::lerp(start + Hair, end - Hair, part)).value_or(0.0);
    };
    return std::ranges::all_of(std::array{0.25, 0.5, 0.75}, [&](double part) {
        return std::abs(at(part) - std::lerp(at(0.0), at(1.0), part)) < 1e-5;
    });
}

struct Jump {
    double time;
    double from;
    double to;
};

/// The course of a curve, apart from the project, in seconds of the host. Points that are closer than SameInstant stand at
/// one time.
class Course {
public:
    explicit Course(const standin::Envelope& curve)
    {
        for (const standin::AutomationPoint* point = curve.firstPoint(); point; point = curve.pointBehind(*point)) {
            if (m_steps.empty() || point->start() - m_steps.back().time >= core::SameInstant)
                m_steps.push_back({point->start(), point->value(), point->value()});
            m_steps.back().to = point->value();
        }
    }

    /// Where it has points, with what it comes to and goes on with.
    const std::vector<Jump>& steps() const { return m_steps; }
    /// What it comes to and goes on with at any time. Nothing for a curve without points.
    std::optional<Jump> at(double time) const
    {
        if (m_steps.empty())
            return std::nullopt;
        const auto next = std::ranges::partition_point(
            m_steps, [time](const Jump& step) { return time - step.time >= core::SameInstant; });
        if (next != m_steps.end() && next->time - time < core::SameInstant)
            return *next;
        if (next == m_steps.begin())
            return Jump{time, next->from, next->from};
        const Jump& last = *std::prev(next);
        const double value = next == m_steps.end()
                                 ? last.to
                                 : std::lerp(last.to, next->from, (time - last.time) / (next->time - last.time));
        return Jump{time, value, value};
    }

private:
    std::vector<Jump> m_steps;
};

using Courses = std::map<std::int32_t, Course>;

Courses coursesOf(const standin::Track& track)
{
    Courses courses;
    for (const auto& [number, curve] : track.curves())
        courses.emplace(number, Course(*curve));
    return courses;
}

/// A jump as large as this is surely one that can be heard, and as small as that surely none.
constexpr double SurelyHeard = 0.0101;
constexpr double SurelyNotHeard = 0.0099;

bool isNearby(double a, double b)
{
    return std::abs(a - b) < SurelyHeard;
}

/// Whether the old programme has the jump of the new one at a place from which the instant was carried.
bool wasThereBefore(RandomRun& run, const Course& old, const Jump& jump)
{
    constexpr double Hair = 1e-5;
    return std::ranges::any_of(std::array{-Hair, Hair}, [&](double hair) {
        const double beside = jump.time + hair;
        const auto source = run.isReplaced(beside) ? run.sourceOf(beside) : std::optional(beside);
        const auto before = source ? old.at(*source - hair) : std::nullopt;
        return before && isNearby(before->from, jump.from) && isNearby(before->to, jump.to);
    });
}

/// What of a track a run need not change: all of it, or what stands outside of the range to which it is restricted.
struct Kept {
    const standin::Track* track;
    json whole;  ///< null for a track in which the run takes part
    json left;   ///< events before the range
    json beside; ///< those that begin where it ends
    json right;  ///< those that begin later
    json points; ///< of each curve, by its number
};

/// In the order of allTracks().
void flatten(const json& stored, std::vector<json>& found)
{
    for (const json& track : stored) {
        found.push_back(track);
        if (track["kind"] == "folder")
            flatten(track["tracks"], found);
    }
}

double endOf(const json& event)
{
    // A point marker has none.
    return event.value("end", event["start"].get<double>());
}

/// A run gives each memo an id.
void removeIds(json& events)
{
    for (json& event : events) {
        if (!event.contains("attributes"))
            continue;
        event["attributes"].erase(AttributeKey::EventUserId);
        if (event["attributes"].empty())
            event.erase("attributes");
    }
}

void keepOutside(Kept& kept, const json& track, const core::SecondsRange& range)
{
    constexpr double Hair = 1e-4;
    kept.left = kept.beside = kept.right = json::array();
    kept.points = json::object();
    for (const json& event : track.value("events", json::array())) {
        const double start = event["start"];
        if (endOf(event) < range.start - Hair)
            kept.left.push_back(event);
        else if (start > range.end + Hair)
            kept.right.push_back(event);
        else if (start > range.end - core::SameInstant)
            kept.beside.push_back(event);
    }
    if (!track.contains("curves"))
        return;
    for (const json& curve : track["curves"]) {
        json points = json::array();
        for (const json& point : curve["points"]) {
            const double time = point["time"];
            if (time < range.start - Hair || time > range.end + Hair)
                points.push_back(point);
        }
        if (!points.empty())
            kept.points[std::to_string(curve["number"].get<std::int32_t>())] = points;
    }
}

std::vector<Kept> keptBy(RandomRun& run)
{
    const core::Settings& settings = run.model().settings();
    const core::SecondsRange range{std::max(settings.preserveMaterialBefore(), 0.0) - run.project.timeOrigin(),
                                   std::max(settings.preserveMaterialAfter(), 0.0) - run.project.timeOrigin()};
    std::vector<json> stored;
    flatten(json::parse(run.bytes())["tracks"], stored);
    const Tracks live = run.project.allTracks();
    RC_ASSERT(stored.size() == live.size());
    std::vector<Kept> all;
    for (std::size_t index = 0; index < live.size(); ++index) {
        standin::Track& track = *live[index];
        json& content = stored[index];
        const bool isRuler = track.kind() == standin::Track::Kind::Ruler;
        const bool isMemos =
            track.kind() == standin::Track::Kind::Marker && RandomRun::roleOf(track) == TrackRole::Memos;
        const bool isSystems = !isRuler && !track.isFolder() && !RandomRun::isUsers(track);
        // The system frees what it holds locked itself.
        if (track.isFolder() || (isSystems && track.hasAttribute(AttributeKey::LockState) == ResultOk))
            continue;
        if (isMemos)
            removeIds(content["events"]);
        Kept kept{&track, {}, {}, {}, {}, {}};
        if (isRuler || track.isLocked() || (!isSystems && !run.isConformed(track)))
            kept.whole = content;
        else if (run.isRestricted() && (isMemos || !isSystems))
            keepOutside(kept, content, range);
        else
            continue;
        all.push_back(std::move(kept));
    }
    return all;
}

/// What a range has cut off lies below what began where it ends.
bool endsWith(const json& all, const json& last)
{
    return all.size() >= last.size() &&
           std::equal(last.begin(), last.end(), all.end() - static_cast<std::ptrdiff_t>(last.size()));
}

/// Pieces of an earlier run may have become one again.
void expectKept(const std::vector<Kept>& before, const std::vector<Kept>& after, bool isFirstRun)
{
    for (const Kept& kept : before) {
        const auto now = std::ranges::find(after, kept.track, &Kept::track);
        RC_ASSERT(now != after.end());
        RC_ASSERT(now->whole == kept.whole);
        RC_ASSERT(now->left == kept.left);
        RC_ASSERT(!isFirstRun || endsWith(now->beside, kept.beside));
        RC_ASSERT(now->right == kept.right);
        RC_ASSERT(now->points == kept.points);
    }
}

/// Lets a run happen, and looks whether each instant holds what stood at its source.
void expectLawOfARun(RandomRun& run)
{
    const Tracks tracks = run.usersTracks();
    const std::vector<double> instants = run.instants();
    // What is expected of each track at each instant; nothing where nothing is to sound.
    std::vector<std::vector<std::optional<Heard>>> expected;
    std::vector<bool> isConformed;
    std::vector<std::vector<double>> times;
    for (standin::Track* const track : tracks) {
        isConformed.push_back(run.isConformed(*track));
        times.push_back(standin::tests::timesOf({track}));
        auto& ofTrack = expected.emplace_back();
        for (const double instant : instants) {
            const bool stays = !isConformed.back() || !run.isReplaced(instant);
            const std::optional<double> source = stays ? instant : run.sourceOf(instant);
            ofTrack.push_back(source ? std::optional(Heard::at(*track, *source)) : std::nullopt);
        }
    }

    const std::vector<core::SecondsRange> gaps = run.gaps();
    // What the curves are to have where nothing is to sound, unless they are led straight over it.
    std::vector<std::vector<std::optional<std::map<std::int32_t, double>>>> held;
    for (std::size_t index = 0; index < tracks.size(); ++index) {
        auto& ofTrack = held.emplace_back();
        for (std::size_t at = 0; at < instants.size(); ++at) {
            const bool isLed = run.model().settings().createVirginTerritories() &&
                               std::ranges::any_of(gaps, [&](const core::SecondsRange& gap) {
                                   return gap.start < instants[at] && instants[at] < gap.end;
                               });
            const auto from = expected[index][at] || isLed ? std::nullopt : run.heldFrom(instants[at]);
            ofTrack.push_back(from ? std::optional(valuesAt(*tracks[index], *from)) : std::nullopt);
        }
    }

    run.conform();

    for (std::size_t index = 0; index < tracks.size(); ++index) {
        const standin::Track& track = *tracks[index];
        for (std::size_t at = 0; at < instants.size(); ++at) {
            const Heard found = Heard::at(track, instants[at]);
            if (expected[index][at])
                RC_ASSERT(found == *expected[index][at]);
            else
                RC_ASSERT(found.sounding.empty());
            if (held[index][at])
                RC_ASSERT(isNear(found.values, *held[index][at]));
        }
        if (!isConformed[index])
            RC_ASSERT(standin::tests::timesOf({tracks[index]}) == times[index]);
        else if (run.model().settings().createVirginTerritories()) {
            for (const auto& [start, end] : gaps) {
                for (const auto& [number, curve] : track.curves())
                    RC_ASSERT(isStraight(*curve, start, end));
            }
        }
        // Nothing stays behind where the run has worked.
        RC_ASSERT(track.lastEnd() < EndOfFilm);
        for (const auto& [number, curve] : track.curves())
            RC_ASSERT(isLevelFrom(*curve, EndOfFilm));
        RC_ASSERT(!hasConstantPointFrom(track, EndOfFilm));
    }
}

} // namespace

RC_GTEST_PROP(HostRunLaw, EachInstantHoldsWhatStoodAtItsSource, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
    if (chance.oneIn(2))
        run.moveOrigin();

    for (std::uint64_t count = 1 + chance.below(2); count > 0; --count)
        expectLawOfARun(run);
}

//     range            |--------------|
//     stays    |- left -|              |- beside -| |- right -|
RC_GTEST_PROP(HostRunLaw, EachByteThatItNeedNotChangeStays, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
    if (chance.oneIn(2))
        run.includeOverhanging();
    if (chance.oneIn(2))
        run.moveOrigin();

    const std::uint64_t count = 1 + chance.below(3);
    for (std::uint64_t number = 0; number < count; ++number) {
        const std::vector<Kept> before = keptBy(run);
        run.conform();
        expectKept(before, keptBy(run), number == 0);
        for (const standin::Track* const track : run.project.allTracks())
            RC_ASSERT(track->isFolder() || track->lastEnd() < EndOfFilm);
    }
}

RC_GTEST_PROP(HostRunLaw, EachNewJumpOfTheAutomationIsMarkedAndNothingElse, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
    run.model().settings().setCreateAutomationWarningMarkers(true);
    Tracks tracks = run.project.allTracks();
    std::erase_if(tracks, [&](standin::Track* track) { return track->isFolder() || !run.isConformed(*track); });
    std::map<const standin::Track*, Courses> old;
    for (const standin::Track* const track : tracks)
        old[track] = coursesOf(*track);

    run.conform();

    const std::optional<std::vector<RandomRun::Warning>> warnings = run.warnings();
    RC_PRE(warnings.has_value());
    std::vector<bool> isExplained(warnings->size(), false);
    for (standin::Track* const track : tracks) {
        const std::string name = std::string(ConstString(track->getName()).text8()) + " ";
        for (const auto& [number, course] : coursesOf(*track)) {
            for (const Jump& jump : course.steps()) {
                const double size = std::abs(jump.to - jump.from);
                if (size < SurelyNotHeard || jump.time > EndOfFilm)
                    continue;
                bool isMarked = false;
                for (std::size_t index = 0; index < warnings->size(); ++index) {
                    const RandomRun::Warning& warning = (*warnings)[index];
                    if (warning.start - 1e-4 < jump.time && jump.time < warning.end + 1e-4 &&
                        warning.text.find(name) != std::string::npos) {
                        isMarked = true;
                        isExplained[index] = true;
                    }
                }
                const auto course0 = old.at(track).find(number);
                RC_ASSERT(isMarked || size < SurelyHeard ||
                          (course0 != old.at(track).end() && wasThereBefore(run, course0->second, jump)));
            }
        }
    }
    RC_ASSERT(std::ranges::all_of(isExplained, [](bool flag) { return flag; }));
}

RC_GTEST_PROP(HostRunLaw, UndoAndRedoLeadToTheSameBytes, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
    if (chance.oneIn(2))
        run.includeOverhanging();
    // After so many runs as its index.
    std::vector<std::string> states{run.bytes()};
    for (std::uint64_t count = 1 + chance.below(3); count > 0; --count) {
        run.conform();
        states.push_back(run.bytes());
    }

    std::size_t at = states.size() - 1;
    for (std::uint64_t count = 2 + chance.below(6); count > 0; --count) {
        const bool isUndone = at == states.size() - 1 || (at > 0 && chance.oneIn(2));
        const bool isDone =
            isUndone ? run.application.edits().undo(run.project) : run.application.edits().redo(run.project);
        RC_ASSERT(isDone);
        at = isUndone ? at - 1 : at + 1;
        RC_ASSERT(run.bytes() == states[at]);
    }
}

RC_GTEST_PROP(HostRunLaw, APreviewLeavesTheFilmAsItIs, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
    const Tracks tracks = run.usersTracks();
    const std::vector<double> instants = run.instants();
    std::vector<std::vector<Heard>> before;
    for (standin::Track* const track : tracks) {
        auto& ofTrack = before.emplace_back();
        for (const double instant : instants)
            ofTrack.push_back(Heard::at(*track, instant));
    }
    const auto expectFilm = [&] {
        for (std::size_t index = 0; index < tracks.size(); ++index) {
            for (std::size_t at = 0; at < instants.size(); ++at)
                RC_ASSERT(Heard::at(*tracks[index], instants[at]).sounding == before[index][at].sounding);
        }
    };

    // It may have been computed when the film was shorter, or its clock began earlier.
    if (chance.oneIn(2)) {
        const double tooSmall = run.project.timeOrigin() - 10.0 + static_cast<double>(chance.below(100));
        run.model().setProperty(core::PropertyKey::PreviewOffset, core::Variant(tooSmall));
    }
    const double end = run.project.getEnd(nullptr);

    run.adapter->setPreviewActive(true);
    RC_ASSERT(run.adapter->startPreview(run.model().changeEdl(), 0, 0, 1) == Result::Ok);
    run.application.idle();
    RC_ASSERT(run.isLastEntry(u"Preview"));
    expectFilm();
    // All that was added stands in the preview, whole.
    const double preview = run.adapter->getRunState().previewOffset - run.project.timeOrigin();
    for (standin::Track* const track : tracks) {
        for (const double time : standin::tests::timesOf({track}))
            RC_ASSERT(time < EndOfFilm || time >= preview);
    }

    if (chance.oneIn(2)) {
        RC_ASSERT(run.application.edits().undo(run.project));
        expectFilm();
        RC_ASSERT(run.application.edits().redo(run.project));
        RC_ASSERT(run.adapter->isPreviewActive());
        expectFilm();
    }

    run.adapter->setPreviewActive(false);
    RC_ASSERT(run.project.getEnd(nullptr) == end);
    for (std::size_t index = 0; index < tracks.size(); ++index) {
        // The automation too.
        for (std::size_t at = 0; at < instants.size(); ++at)
            RC_ASSERT(Heard::at(*tracks[index], instants[at]) == before[index][at]);
        RC_ASSERT(tracks[index]->lastEnd() < EndOfFilm);
        RC_ASSERT(!hasConstantPointFrom(*tracks[index], EndOfFilm));
    }
}

} // namespace cadrel::host::tests
