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
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "tests/support/standin/Heard.h"
#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/String.h"

#include <gtest/gtest.h>
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
using core::Timecode;
using standin::tests::Chance;
using standin::tests::Heard;
using util::Result;

using Tracks = std::vector<standin::Track*>;

/// No random film, and nothing that is carried over in it, reaches as far, in seconds of the host.
constexpr double EndOfFilm = 1000.0;

/// A curve that random projects have no points on.
constexpr std::int32_t ConstantCurve = 7;

/// A change event at normal speed, in seconds of the host.
struct Carried {
    double source;
    double destination;
    double length;
};

/// A host with a random project, whose model has a random change list.
class RandomRun {
public:
    explicit RandomRun(Chance& chance)
        : m_chance(chance),
          project(application.projects().add(standin::tests::randomProject(chance, application.edits().log())))
    {
        static constexpr FrameRateInfo Rates[] = {
            {24.0, 0},
            {25.0, 0},
            {24000.0 / 1001.0, FrameRateInfo::Flag::PulledDown},
            {30000.0 / 1001.0, FrameRateInfo::Flag::PulledDown | FrameRateInfo::Flag::DropFrame}};
        project.setFrameRate(m_chance.oneOf(Rates));
        application.activateProject(&project);
        addConstantCurves();
        addStacks();
        adapter = makeCounted<Host>(application.context());
        compose();
    }

    void conform()
    {
        RC_ASSERT(adapter->startCadrel() == Result::Ok);
        application.idle();
        RC_ASSERT(isLastEntry(u"Apply Cadrel"));
    }

    bool isLastEntry(std::u16string_view name) const
    {
        const standin::UndoList& entries = project.undoList();
        return entries.doneCount() == 1 && entries.nameAt(0) == name;
    }

    core::DataModel& model() { return *adapter->getProjectModel(); }

    std::string bytes() const { return standin::ProjectFile::toText(project); }

    /// Where the material of an instant comes from; nothing where no event lies. Of events that overlap the last wins.
    std::optional<double> sourceOf(double time) const
    {
        for (auto carried = changes.rbegin(); carried != changes.rend(); ++carried) {
            if (carried->destination <= time && time < carried->destination + carried->length)
                return time - carried->destination + carried->source;
        }
        return std::nullopt;
    }
    /// What is replaced by nothing between two events that follow on one another in the list.
    std::vector<core::SecondsRange> gaps()
    {
        std::vector<core::SecondsRange> found;
        for (std::size_t index = 1; index < changes.size(); ++index) {
            // No event and no range begins or ends within a piece.
            const double start = changes[index - 1].destination + changes[index - 1].length;
            const double end = changes[index].destination;
            std::vector<double> bounds{start, end};
            for (const Carried& carried : changes) {
                bounds.push_back(carried.destination);
                bounds.push_back(carried.destination + carried.length);
            }
            const core::Settings& settings = model().settings();
            bounds.push_back(settings.preserveMaterialBefore() - project.timeOrigin());
            bounds.push_back(settings.preserveMaterialAfter() - project.timeOrigin());
            std::erase_if(bounds, [&](double time) { return time < start || time > end; });
            std::ranges::sort(bounds);
            for (std::size_t at = 1; at < bounds.size(); ++at) {
                const double middle = (bounds[at - 1] + bounds[at]) / 2.0;
                if (bounds[at] - bounds[at - 1] > 0.02 && !sourceOf(middle) && isReplaced(middle))
                    found.push_back({bounds[at - 1], bounds[at]});
            }
        }
        return found;
    }
    /// An instant of the project, just before or just after which a curve has a value.
    struct Side {
        double time;
        bool isBefore;
    };
    /// Where the automation of an instant comes from that no event covers: the end of the stretch before it or, before the
    /// first one, the start of that. Nothing without stretches.
    std::optional<Side> heldFrom(double time) const
    {
        std::optional<double> end;
        std::optional<double> first;
        for (const Carried& carried : changes) {
            const double out = carried.destination + carried.length;
            if (carried.length <= 0.0)
                continue;
            if (out <= time)
                end = std::max(end.value_or(out), out);
            first = std::min(first.value_or(carried.destination), carried.destination);
        }
        if (!first)
            return std::nullopt;
        constexpr double Hair = 1e-6;
        const double edge = end.value_or(*first);
        const double inside = end ? edge - Hair : edge + Hair;
        const auto source = sourceOf(inside);
        return source ? std::optional(Side{*source + (end ? Hair : -Hair), end.has_value()}) : std::nullopt;
    }
    struct Warning {
        double start;
        double end;
        std::string text;
    };
    /// The automation warnings of the run; nothing where the user has locked their track.
    std::optional<std::vector<Warning>> warnings() const
    {
        for (standin::Track* const track : project.allTracks()) {
            FVariant role;
            if (track->kind() != standin::Track::Kind::Marker ||
                track->getAttribute(AttributeKey::MarkerType, role) != ResultOk || !role.isInteger() ||
                (role.asInteger() & 0xff) != TrackRole::AutomationWarning)
                continue;
            if (track->isLocked())
                return std::nullopt;
            std::vector<Warning> found;
            for (const auto& marker : standin::tests::childrenOf(*track)) {
                const std::string text = ConstString(marker->getName()).text8();
                if (text.starts_with("Automation warning in "))
                    found.push_back({marker->getStart(nullptr), marker->getEnd(nullptr), text.substr(21)});
            }
            return found;
        }
        return std::nullopt;
    }
    bool isRestricted() { return model().settings().restrictRange(); }
    /// Whether the run replaces what stands at the instant.
    bool isReplaced(double time)
    {
        const core::Settings& settings = model().settings();
        const double onClock = time + project.timeOrigin();
        return !isRestricted() ||
               (settings.preserveMaterialBefore() <= onClock && onClock < settings.preserveMaterialAfter());
    }
    /// Whether the run takes part in the track.
    bool isConformed(const standin::Track& track)
    {
        return !track.isLocked() && (model().settings().applyTo() == core::ApplyTo::AllTracks || track.selected());
    }

    /// The tracks that are the user's, and no ruler.
    Tracks usersTracks() const
    {
        Tracks tracks = project.allTracks();
        std::erase_if(tracks, [](standin::Track* track) {
            return track->isFolder() || track->kind() == standin::Track::Kind::Ruler || hasRole(*track);
        });
        return tracks;
    }

    /// Instants of the project at which nothing begins or ends, before the run or after it.
    std::vector<double> instants()
    {
        const std::vector<double> old = standin::tests::timesOf(project.allTracks());
        std::vector<double> times = old;
        for (const Carried& carried : changes) {
            for (const double time : old)
                times.push_back(time - carried.source + carried.destination);
            for (const double time : {carried.destination, carried.destination + carried.length, carried.source,
                                      carried.source + carried.length})
                times.push_back(time);
        }
        const core::Settings& settings = model().settings();
        times.push_back(settings.preserveMaterialBefore() - project.timeOrigin());
        times.push_back(settings.preserveMaterialAfter() - project.timeOrigin());
        std::erase_if(times, [](double time) { return time < 0.0; });
        times.push_back(0.0);
        times.push_back(std::ranges::max(times) + 1.0);
        return standin::tests::instantsBetween(times);
    }

private:
    /// One point each.
    void addConstantCurves()
    {
        for (standin::Track* const track : project.allTracks()) {
            if (!track->hasAutomation() || m_chance.oneIn(3))
                continue;
            const auto point = makeCounted<standin::AutomationPoint>();
            const auto time = static_cast<double>(m_chance.below(100));
            point->setSpan(time, time);
            point->setValue(0.25);
            point->insertInto(track->curve(ConstantCurve));
        }
    }

    /// Ranges and clips that stand on top of one another.
    void addStacks()
    {
        for (standin::Track* const track : project.allTracks()) {
            if (track->isFolder() || track->kind() == standin::Track::Kind::Ruler || m_chance.oneIn(3))
                continue;
            const auto start = static_cast<double>(m_chance.below(60));
            for (std::uint64_t count = m_chance.below(6); count > 0; --count) {
                Counted<standin::Event> event;
                if (track->kind() == standin::Track::Kind::Marker)
                    event = makeCounted<standin::Marker>(true);
                else
                    event = makeCounted<standin::ClipEvent>();
                event->setSpan(start, start + 20.0);
                event->insertInto(*track);
            }
        }
    }

    void compose()
    {
        core::Settings& settings = model().settings();
        settings.setCreateInsertMarkers(false);
        settings.setCreateDissolveWipeMarkers(false);
        settings.setCreateAudioSnippetMarkers(false);
        settings.setCreateAutomationWarningMarkers(false);
        settings.setCreateOverlapMarkers(false);
        settings.setCreateDestinationMarkers(m_chance.oneIn(2));
        settings.setCreateVirginTerritories(m_chance.oneIn(2));
        if (m_chance.oneIn(3))
            settings.setApplyTo(core::ApplyTo::SelectedTracks);
        const double origin = project.timeOrigin();
        if (m_chance.oneIn(3)) {
            const double before = static_cast<double>(m_chance.below(80)) - 20.0;
            settings.setPreserveMaterial(origin + before, origin + before + static_cast<double>(m_chance.below(60)));
            settings.setRestrictRange(true);
        }
        // The frames of a pulled-down clock don't begin with its hours.
        const core::Framerate rate = Timecode::framerate();
        const auto firstFrame = static_cast<std::int32_t>(std::ceil(origin * rate.rate));
        for (std::uint64_t count = 1 + m_chance.below(8); count > 0; --count)
            carryOver(firstFrame, rate);
        if (m_chance.oneIn(2)) {
            model().videoList().add(
                core::VideoList::Entry("/picture/reel3_v12.mov", Timecode(firstFrame), Timecode(0, 0, 40, 0)), false);
        }
    }

    void carryOver(std::int32_t firstFrame, const core::Framerate& rate)
    {
        const auto frames = [&](std::uint64_t seconds) {
            return static_cast<std::int32_t>(
                m_chance.below(seconds * static_cast<std::uint64_t>(rate.framesPerSecond)));
        };
        const std::int32_t source = firstFrame + frames(100);
        const std::int32_t destination = firstFrame + frames(100);
        const std::int32_t length = frames(40);
        const auto event = std::make_shared<core::EventBase>();
        event->setRollName("A001");
        event->setTimecodes(Timecode(source), Timecode(source + length), Timecode(destination),
                            Timecode(destination + length));
        model().changeEdl().add(event);
        const auto inHost = [&](std::int32_t frame) { return Timecode(frame).toSeconds(rate) - project.timeOrigin(); };
        changes.push_back({inHost(source), inHost(destination), inHost(source + length) - inHost(source)});
    }

    /// Whether something in the random attributes makes it one on which the system writes.
    static bool hasRole(standin::Track& track)
    {
        using Kind = standin::Track::Kind;
        const bool isVideo = track.kind() == Kind::Video;
        FVariant role;
        if ((!isVideo && track.kind() != Kind::Marker) ||
            track.getAttribute(isVideo ? AttributeKey::VideoType : AttributeKey::MarkerType, role) != ResultOk ||
            !role.isInteger())
            return false;
        const std::int64_t kind = role.asInteger() & 0xff;
        return isVideo ? kind == TrackRole::NewVideo : kind >= TrackRole::Destination && kind <= TrackRole::LastMarker;
    }

    Chance& m_chance;

public:
    standin::Application application;
    standin::Project& project;
    Counted<Host> adapter;
    std::vector<Carried> changes;
};

std::uint64_t someSeed()
{
    return *rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>()));
}

bool isLevelFrom(const standin::Envelope& curve, double time)
{
    for (const standin::AutomationPoint* point = curve.firstPoint(); point; point = curve.pointBehind(*point)) {
        if (point->start() >= time && std::abs(point->value() - *curve.valueBehind(time)) > 1e-6)
            return false;
    }
    return true;
}

/// What each curve that has points comes to or goes on with at an instant.
std::map<std::int32_t, double> valuesAt(const standin::Track& track, const RandomRun::Side& side)
{
    std::map<std::int32_t, double> values;
    for (const auto& [number, curve] : track.curves()) {
        if (const auto value = side.isBefore ? curve->valueBefore(side.time) : curve->valueBehind(side.time))
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

/// Nothing to conform is no run; the law says nothing of it.
bool canRun(RandomRun& run)
{
    return run.adapter->canStart() == Result::Ok;
}

} // namespace

RC_GTEST_PROP(HostRunLaw, EachInstantHoldsWhatStoodAtItsSource, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomRun run(chance);
    RC_PRE(canRun(run));
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
    const std::string before = run.bytes();

    run.conform();
    const std::string after = run.bytes();

    RC_ASSERT(run.application.edits().undo(run.project));
    RC_ASSERT(run.bytes() == before);
    RC_ASSERT(run.application.edits().redo(run.project));
    RC_ASSERT(run.bytes() == after);
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
