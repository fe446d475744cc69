// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

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
#include "tests/support/host/AlteredContext.h"
#include "tests/support/standin/Heard.h"
#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/String.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::host::tests {

using core::Timecode;
using standin::tests::Chance;
using util::Result;
using Velmark::AttributeKey;
using Velmark::ConstString;
using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::FVariant;
using Velmark::makeCounted;
using Velmark::ResultOk;

using Tracks = std::vector<standin::Track*>;

/// No random film, and nothing that is carried over in it, reaches as far, in seconds of the host.
inline constexpr double EndOfFilm = 1000.0;

/// A curve that random projects have no points on.
inline constexpr std::int32_t ConstantCurve = 7;

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
        connect();
        compose();
    }

    void connect() { adapter = makeCounted<Host>(static_cast<Velmark::IHostContext*>(&context)); }

    void conform()
    {
        const std::size_t entryCount = project.undoList().doneCount();
        RC_ASSERT(adapter->startCadrel() == Result::Ok);
        application.idle();
        RC_ASSERT(project.undoList().doneCount() == entryCount + 1);
        RC_ASSERT(project.undoList().nameAt(entryCount) == std::u16string(u"Apply Cadrel"));
    }

    /// Lets the clock begin earlier, so that all material stands elsewhere in it.
    void moveOrigin()
    {
        const double by = static_cast<double>(m_chance.below(100));
        if (by > project.timeOrigin())
            return;
        project.setTimeOrigin(project.timeOrigin() - by);
        application.idle();
        for (Carried& carried : changes) {
            carried.source += by;
            carried.destination += by;
        }
    }

    /// Lets clips come along that hang over, also where there is no room for them at the begin of the clock.
    void includeOverhanging()
    {
        core::Settings& settings = model().settings();
        settings.setIncludeOverhangingAudioEvents(true);
        settings.setSnippetThreshold(static_cast<std::int32_t>(m_chance.below(1000)));
        settings.setSnippetUsesPercentage(false);
        const core::Framerate rate = Timecode::framerate();
        const std::int32_t source = firstFrame(rate) + frames(100, rate);
        carryOver(source, m_chance.oneIn(2) ? firstFrame(rate) : 0, frames(40, rate), rate);
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
    /// first one, the start of that; what stands before the range to which the run is restricted. Nothing without
    /// stretches.
    std::optional<Side> heldFrom(double time)
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
        const double range = std::max(model().settings().preserveMaterialBefore() - project.timeOrigin(), 0.0);
        if (isRestricted() && isReplaced(time) && (!end || *end <= range))
            return Side{range, true};
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
            if (track->kind() != standin::Track::Kind::Marker || roleOf(*track) != TrackRole::AutomationWarning)
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
        std::erase_if(tracks, [](standin::Track* track) { return !isUsers(*track); });
        return tracks;
    }
    static bool isUsers(standin::Track& track)
    {
        return !track.isFolder() && track.kind() != standin::Track::Kind::Ruler && !hasRole(track);
    }
    /// What the system uses it for, from its attributes, random ones as well; -1 without such an attribute.
    static std::int64_t roleOf(standin::Track& track)
    {
        const bool isVideo = track.kind() == standin::Track::Kind::Video;
        FVariant role;
        if (track.getAttribute(isVideo ? AttributeKey::VideoType : AttributeKey::MarkerType, role) != ResultOk ||
            !role.isInteger())
            return -1;
        return role.asInteger() & 0xff;
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
        const core::Framerate rate = Timecode::framerate();
        const std::int32_t begin = firstFrame(rate);
        for (std::uint64_t count = 1 + m_chance.below(8); count > 0; --count) {
            const std::int32_t source = begin + frames(100, rate);
            const std::int32_t destination = begin + frames(100, rate);
            carryOver(source, destination, frames(40, rate), rate);
        }
        if (m_chance.oneIn(2)) {
            model().videoList().add(
                core::VideoList::Entry("/picture/reel3_v12.mov", Timecode(begin), Timecode(0, 0, 40, 0)), false);
        }
    }

    /// The frames of a pulled-down clock don't begin with its hours.
    std::int32_t firstFrame(const core::Framerate& rate) const
    {
        return static_cast<std::int32_t>(std::ceil(project.timeOrigin() * rate.rate));
    }
    /// Fewer than those of so many seconds.
    std::int32_t frames(std::uint64_t seconds, const core::Framerate& rate)
    {
        return static_cast<std::int32_t>(m_chance.below(seconds * static_cast<std::uint64_t>(rate.framesPerSecond)));
    }
    void carryOver(std::int32_t source, std::int32_t destination, std::int32_t length, const core::Framerate& rate)
    {
        const auto event = std::make_shared<core::EventBase>();
        event->setRollName("A001");
        event->setTimecodes(Timecode(source), Timecode(source + length), Timecode(destination),
                            Timecode(destination + length));
        model().changeEdl().add(event);
        const auto inHost = [&](std::int32_t frame) { return Timecode(frame).toSeconds(rate) - project.timeOrigin(); };
        changes.push_back({inHost(source), inHost(destination), inHost(source + length) - inHost(source)});
    }

    /// Whether it is one on which the system writes.
    static bool hasRole(standin::Track& track)
    {
        using Kind = standin::Track::Kind;
        const std::int64_t role = roleOf(track);
        if (track.kind() == Kind::Video)
            return role == TrackRole::NewVideo;
        return track.kind() == Kind::Marker && role >= TrackRole::Destination && role <= TrackRole::LastMarker;
    }

    Chance& m_chance;

public:
    standin::Application application;
    standin::Project& project;
    AlteredContext context{application.context()};
    Counted<Host> adapter;
    std::vector<Carried> changes;
};

inline std::uint64_t someSeed()
{
    return *rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>()));
}

/// Nothing to conform is no run; the law says nothing of it.
inline bool canRun(RandomRun& run)
{
    return run.adapter->canStart() == Result::Ok;
}

} // namespace cadrel::host::tests
