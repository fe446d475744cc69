// SPDX-License-Identifier: GPL-3.0-or-later

// What it takes to conform the tracks of a film: a whole run, and its stages one by one.

#include "core/conform/SnippetAlgorithm.h"
#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "core/detect/AutomationWarningDetectAlgorithm.h"
#include "core/detect/InsertDetectAlgorithm.h"
#include "core/detect/OverlapDetectAlgorithm.h"
#include "core/detect/RemainsDetectAlgorithm.h"
#include "core/detect/TransitionDetectAlgorithm.h"
#include "tests/support/core/ConformFilm.h"

#include <benchmark/benchmark.h>

#include <cstdint>
#include <memory>

namespace cadrel::bench {

namespace {

constexpr std::int32_t Programme = 2 * 3600 * 24; ///< two hours, in frames
constexpr std::int32_t Volume = 7;

/// Two hours of so many tracks, with so many clips each and a curve of a tenth as many points, in which so many ranges
/// change places by pairs. Some ranges run into the next and some leave a gap before it; some of the new cuts are
/// dissolves.
struct BenchFilm : tests::ConformFilm {
    explicit BenchFilm(const benchmark::State& state) : ConformFilm(core::Framerate(24, 0))
    {
        model.settings().setIncludeOverhangingAudioEvents(true);
        const auto trackCount = static_cast<std::int32_t>(state.range(0));
        for (std::int32_t track = 0; track < trackCount; ++track)
            fill(engine.addTrack(L"Track"), static_cast<std::int32_t>(state.range(2)), 1.0 * track / trackCount);
        const auto cutCount = static_cast<std::int32_t>(state.range(1));
        for (std::int32_t cut = 0; cut < cutCount; ++cut)
            recut(cut, Programme / cutCount);
    }

    /// `phase` shifts the clips by a part of their distance, so that no two tracks are cut at the same times.
    void fill(tests::MemoryTrack& track, std::int32_t clipCount, double phase)
    {
        const double distance = Programme / 24.0 / clipCount;
        for (std::int32_t clip = 0; clip < clipCount; ++clip) {
            const double start = (clip + phase) * distance;
            track.addClip({"Take", start, start + 0.7 * distance, start});
            if (clip % 10 == 0)
                track.addPoint(Volume, start, clip % 20 == 0 ? 0.25 : 0.75);
        }
    }

    void recut(std::int32_t cut, std::int32_t length)
    {
        const std::int32_t source = cut * length;
        const std::int32_t destination = (cut ^ 1) * length;
        const std::int32_t carriedOver = cut % 10 == 0 ? length + 6 : cut % 16 == 5 ? length - 6 : length;
        model.changeEdl().add(event(source, destination, carriedOver));
        const auto newEvent = event(source, destination, length);
        if (cut % 8 == 3) {
            newEvent->setDst(core::Timecode(destination - length / 2), core::Timecode(destination + length / 2));
            newEvent->setTransitionType(core::TransitionType::Dissolve);
            newEvent->setTransitionDuration(length);
        }
        model.newEdl().add(newEvent);
    }

    static std::shared_ptr<core::EventBase> event(std::int32_t source, std::int32_t destination, std::int32_t length)
    {
        const auto made = std::make_shared<core::EventBase>();
        made->setRollName("A001");
        made->setTimecodes(core::Timecode(source), core::Timecode(source + length), core::Timecode(destination),
                           core::Timecode(destination + length));
        return made;
    }

    core::CutList cuts()
    {
        core::CutList made;
        for (const auto& changeEvent : model.changeEdl().events())
            made.add(engine.makeCutEvents(changeEvent));
        return made;
    }
};

void WholeRun(benchmark::State& state)
{
    for (auto _ : state) {
        state.PauseTiming();
        const auto film = std::make_unique<BenchFilm>(state);
        state.ResumeTiming();
        if (film->conform() != util::Result::Ok) {
            state.SkipWithError("the run failed");
            return;
        }
        state.PauseTiming();
        state.counters["markers"] = static_cast<double>(film->engine.markers().size());
        state.ResumeTiming();
    }
}

void MakingCuts(benchmark::State& state)
{
    BenchFilm film(state);
    for (auto _ : state)
        benchmark::DoNotOptimize(film.cuts());
}

void Snippets(benchmark::State& state)
{
    BenchFilm film(state);
    const core::CadrelPreviewState previewState = film.engine.getPreviewState();
    for (auto _ : state) {
        state.PauseTiming();
        core::CutList cuts = film.cuts();
        state.ResumeTiming();
        core::SnippetAlgorithm().process(cuts, previewState);
    }
}

void ApplyingCuts(benchmark::State& state)
{
    BenchFilm film(state);
    core::CutList cuts = film.cuts();
    for (auto _ : state) {
        film.engine.applyVirginTerritories(cuts);
        state.PauseTiming();
        film.engine.removeVirginTerritoryMarkers();
        state.ResumeTiming();
    }
}

void detect(benchmark::State& state, core::CadrelInformationAlgorithm&& algorithm)
{
    BenchFilm film(state);
    const core::CutList cuts = film.cuts();
    const core::CadrelRunState runState = film.engine.getRunState();
    std::size_t found = 0;
    for (auto _ : state)
        found = algorithm.detect(cuts, runState, nullptr).size();
    state.counters["markers"] = static_cast<double>(found);
}

void Inserts(benchmark::State& state)
{
    detect(state, core::InsertDetectAlgorithm());
}

void Transitions(benchmark::State& state)
{
    detect(state, core::TransitionDetectAlgorithm());
}

void Remains(benchmark::State& state)
{
    detect(state, core::RemainsDetectAlgorithm(5));
}

void AutomationWarnings(benchmark::State& state)
{
    detect(state, core::AutomationWarningDetectAlgorithm());
}

void Overlaps(benchmark::State& state)
{
    detect(state, core::OverlapDetectAlgorithm());
}

/// The film that the speed is measured by, and others that differ from it in one number.
void films(benchmark::internal::Benchmark* bench)
{
    bench->ArgNames({"tracks", "cuts", "clips"})->Unit(benchmark::kMillisecond);
    bench->Args({64, 1000, 2000});
    bench->Args({16, 1000, 2000});
    bench->Args({64, 250, 2000});
    bench->Args({64, 4000, 2000});
    bench->Args({64, 1000, 500});
    bench->Args({64, 1000, 8000});
}

BENCHMARK(WholeRun)->Apply(films);
BENCHMARK(MakingCuts)->Apply(films);
BENCHMARK(Snippets)->Apply(films);
BENCHMARK(ApplyingCuts)->Apply(films);
BENCHMARK(Inserts)->Apply(films);
BENCHMARK(Transitions)->Apply(films);
BENCHMARK(Remains)->Apply(films);
BENCHMARK(AutomationWarnings)->Apply(films);
BENCHMARK(Overlaps)->Apply(films);

} // namespace

} // namespace cadrel::bench
