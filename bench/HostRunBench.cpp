// SPDX-License-Identifier: GPL-3.0-or-later

// Measures whole runs on the tracks of a host against the bounds that they have to keep; fails when a bound is missed.

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "host/Host.h"
#include "standin/Application.h"
#include "standin/changes/UndoList.h"
#include "standin/edit/ProjectManager.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/MediaPool.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"

#include <sys/resource.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <memory>
#include <stdexcept>

namespace {

using namespace cadrel;
using Velmark::Counted;
using Velmark::makeCounted;

constexpr std::int32_t FramesPerSecond = 24;
constexpr std::int32_t Programme = 2 * 3600 * FramesPerSecond; ///< two hours, in frames
constexpr std::int32_t FirstFrame = 3600 * FramesPerSecond;    ///< where the clock of the project begins
constexpr int TrackCount = 64;
constexpr int ClipCount = 2000;
constexpr int CurveCount = 8;
constexpr int PointCount = 250;

/// Two hours of 64 tracks, with 2,000 clips and 8 curves each, in which so many ranges change places by pairs. Some ranges
/// run into the next and some leave a gap before it; some of the new cuts are dissolves.
class Film {
public:
    explicit Film(std::int32_t changeCount)
    {
        m_project.setFrameRate({FramesPerSecond, 0});
        m_project.setTimeOrigin(1.0 * FirstFrame / FramesPerSecond);
        const auto media =
            makeCounted<standin::MediaClip>(standin::MediaClip::Kind::Audio, u"/sound/take.wav", 86400.0);
        m_project.pool().add(media);
        for (int track = 0; track < TrackCount; ++track)
            addTrack(media, 1.0 * track / TrackCount);
        m_application.activateProject(&m_project);
        m_host = makeCounted<host::Host>(m_application.context());
        model().settings().setCreateVirginTerritories(true);
        for (std::int32_t change = 0; change < changeCount; ++change)
            recut(change, Programme / changeCount);
    }

    /// The seconds that the run takes.
    double conform()
    {
        if (m_host->startCadrel() != util::Result::Ok)
            throw std::runtime_error("The run can't be started.");
        const auto start = std::chrono::steady_clock::now();
        m_application.idle();
        const std::chrono::duration<double> taken = std::chrono::steady_clock::now() - start;
        const standin::UndoList& entries = m_project.undoList();
        if (entries.size() != 1 || entries.nameAt(0) != u"Apply Cadrel")
            throw std::runtime_error("The run has failed.");
        return taken.count();
    }

private:
    core::DataModel& model() { return *m_host->getProjectModel(); }

    /// `phase` shifts the clips by a part of their distance, so that no two tracks are cut at the same times.
    void addTrack(const Counted<standin::MediaClip>& media, double phase)
    {
        const auto track = standin::Track::create(standin::Track::Kind::Audio);
        track->insertInto(m_project);
        const double distance = 1.0 * Programme / FramesPerSecond / ClipCount;
        for (int index = 0; index < ClipCount; ++index) {
            const auto clip = makeCounted<standin::ClipEvent>();
            const double start = (index + phase) * distance;
            clip->setClip(media);
            clip->setSourceOffset(start);
            clip->setSpan(start, start + 0.7 * distance);
            clip->insertInto(*track);
        }
        for (int number = 1; number <= CurveCount; ++number) {
            standin::Envelope& curve = track->curve(number);
            for (int index = 0; index < PointCount; ++index) {
                const auto point = makeCounted<standin::AutomationPoint>();
                const double time = (index + phase) * distance * ClipCount / PointCount;
                point->setSpan(time, time);
                point->setValue((index + number) % 2 == 0 ? 0.25 : 0.75);
                point->insertInto(curve);
            }
        }
    }

    void recut(std::int32_t change, std::int32_t length)
    {
        const std::int32_t source = change * length;
        const std::int32_t destination = (change ^ 1) * length;
        const std::int32_t carriedOver = change % 10 == 0 ? length + 6 : change % 16 == 5 ? length - 6 : length;
        model().changeEdl().add(event(source, destination, carriedOver));
        model().oldEdl().add(event(source, source, length));
        const auto newEvent = event(source, destination, length);
        if (change % 8 == 3) {
            newEvent->setTransitionType(core::TransitionType::Dissolve);
            newEvent->setTransitionDuration(FramesPerSecond);
        }
        model().newEdl().add(newEvent);
    }

    static std::shared_ptr<core::EventBase> event(std::int32_t source, std::int32_t destination, std::int32_t length)
    {
        const auto at = [](std::int32_t frame) { return core::Timecode(FirstFrame + frame); };
        auto made = std::make_shared<core::EventBase>();
        made->setRollName("A001");
        made->setTimecodes(at(source), at(source + length), at(destination), at(destination + length));
        return made;
    }

    standin::Application m_application;
    standin::Project& m_project = m_application.createProject();
    Counted<host::Host> m_host;
};

constexpr std::size_t Runs = 3;

double medianOfRuns(std::int32_t changeCount)
{
    std::array<double, Runs> seconds{};
    for (double& taken : seconds)
        taken = Film(changeCount).conform();
    std::ranges::sort(seconds);
    return seconds[Runs / 2];
}

/// Prints a row; true when the bound is kept.
bool report(const char* what, double value, double bound, const char* unit)
{
    const bool kept = value <= bound;
    std::printf("%-60s %9.2f %-4s %9.2f %-4s %s\n", what, value, unit, bound, unit, kept ? "kept" : "MISSED");
    return kept;
}

bool run()
{
    const double few = medianOfRuns(50);
    const double many = medianOfRuns(500);
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);

    std::printf("%-60s %14s %14s\n", "64 tracks of 2,000 clips and 8 curves, medians", "measured", "bound");
    std::printf("%-60s %9.3f s\n", "a run of 50 changes", few);
    bool kept = report("a run of 500 changes", many, 10, "s");
    kept &= report("a run of 500 changes against 50", many / few, 12, "x");
    kept &= report("most memory", static_cast<double>(usage.ru_maxrss) * 1024 / 1e6, 2000, "MB");
    return kept;
}

} // namespace

int main()
{
    try {
        return run() ? EXIT_SUCCESS : EXIT_FAILURE;
    } catch (const std::exception& failure) {
        std::fprintf(stderr, "%s\n", failure.what());
        return EXIT_FAILURE;
    }
}
